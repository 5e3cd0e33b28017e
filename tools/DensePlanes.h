#pragma once

// Frames of planar 4:2:0 as other programs keep them: rows without padding, and chroma of half the size rounded up,
// where the library's chroma is rounded down.

#include "VideoFormats.h"

#include <vector>

namespace tool {

/// \param packing  Planes or Pairs.
size_t DenseBytes(int32_t width, int32_t height);

/// Takes such a frame to the library's planes. Of an odd size the last column or row of chroma is left out.
void FromDense(const std::vector<uint8_t>& bytes, RowPacking packing, Frame& frame);

/// Of an odd size the last column or row of chroma is repeated; where the library has none, chroma is grey.
std::vector<uint8_t> ToDense(const Frame& frame, RowPacking packing);

} // namespace tool
