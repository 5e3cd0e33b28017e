#pragma once

// A contact sheet: pictures side by side with words under them.

#include "Frame.h"

#include <string>
#include <utility>
#include <vector>

namespace tool {

struct Tile {
    Tile(std::string words, std::string moreWords, Frame picture)
        : title(std::move(words)), caption(std::move(moreWords)) {
        pictures.push_back(std::move(picture));
    }

    std::string title;
    std::string caption;
    std::vector<Frame> pictures; ///< BGRA_4444_8u, drawn next to each other
};

/// Writes a PNG of all tiles, at least one, each with the same number of pictures.
/// \param columns  of tiles; 0: as near to a square as the words allow, and no wider than a screen.
void WriteSheet(const std::vector<Tile>& tiles, const std::string& heading, const std::string& name,
                int32_t columns = 0);

} // namespace tool
