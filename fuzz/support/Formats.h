#pragma once

// Pixel formats to draw from.

#include "support/ByteStream.h"

#include <PixelKiln/PixelFormat.h>

#include <string>

namespace PKFuzz {

PK_PixelFormat DrawRasterFormat(ByteStream& stream);
PK_PixelFormat DrawStreamFormat(ByteStream& stream);

/// A raster format of the catalogue most of the time, else a stream, else a named format with one bit
/// changed, else any number.
PK_PixelFormat DrawFormat(ByteStream& stream);

/// Number and name.
std::string Words(PK_PixelFormat format);

} // namespace PKFuzz
