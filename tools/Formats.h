#pragma once

// The catalogue of pixel formats as the command line sees it: names in, names out.

#include <PixelKiln/PixelKiln.h>

#include <string>
#include <vector>

namespace tool {

/// Every format that has a name, formats of like structure, colour model and depth next to each other.
const std::vector<PK_PixelFormat>& Catalogue();

/// The formats of the catalogue that are stored in rows and so can be converted row by row.
std::vector<PK_PixelFormat> RasterFormats();

std::string FormatName(PK_PixelFormat format);

/// Reads a name in any case, or a number such as 0x851. Throws a usage Failure that suggests names that are
/// near.
PK_PixelFormat ParseFormat(const std::string& text);

bool IsRaster(PK_PixelFormat format);
bool IsPlanar(PK_PixelFormat format);

/// Whether a pixel is four samples of 8 bits.
bool IsFourBytesAPixel(PK_PixelFormat format);

} // namespace tool
