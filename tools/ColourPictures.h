#pragma once

// What colour spaces and tone-range compression do, for the demonstration.

#include "Sheet.h"

#include <string>

namespace tool {

/// The encoded values of a photograph in several spaces, each shown as if it were plain RGB.
/// \param picture  BGRA_4444_8u, taken as sRGB.
std::vector<Tile> ColourTiles(const Frame& picture);

/// Writes a PNG with a ramp of high dynamic range as standard video shows it, before and after compression.
void WriteToneRangePicture(const std::string& name);

} // namespace tool
