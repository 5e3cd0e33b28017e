#pragma once

// A contact sheet: pictures side by side with words under them.

#include "Frame.h"

#include <string>
#include <vector>

namespace tool {

struct Tile {
    std::vector<Frame> pictures; ///< BGRA_4444_8u, drawn next to each other
    std::string title;
    std::string caption;
};

/// Writes a PNG of all tiles, at least one, each with the same number of pictures.
void WriteSheet(const std::vector<Tile>& tiles, const std::string& heading, const std::string& name);

} // namespace tool
