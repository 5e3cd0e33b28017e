#pragma once

// What the operations on whole frames do to one picture, for the demonstration.

#include "Sheet.h"

namespace tool {

/// A tile for each operation, with one picture.
/// \param picture  BGRA_4444_8u.
std::vector<Tile> OperationTiles(const Frame& picture);

} // namespace tool
