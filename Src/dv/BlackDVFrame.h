#pragma once

// Frames of DV25 without light or sound.

#include <PixelKiln/Types.h>

#include <cstdint>
#include <span>

namespace PK {

/// An encoded picture of black, made at the first need.
/// \param stream  NTSCDV25 or PALDV25.
std::span<const uint8_t> BlackDVFrame(PK_PixelFormat stream);

} // namespace PK
