#pragma once

// The box filter by the sections of a line, slow and plain.

#include <array>
#include <cstdint>
#include <vector>

namespace PKTest {

using BoxPixel = std::array<uint8_t, 4>;
using BoxLine = std::vector<BoxPixel>;

/// A box of 2 x size - 1 whole pixels and an edge pixel of weight/255 on either side.
struct ReferenceBox {
    int64_t size;
    int64_t weight;
};

/// The box of a radius; below 0 and not a number count as 0.
ReferenceBox ReferenceBoxOf(double radius);

/// One pass over a line, with the flags of PK_BoxBlur. The line has at least size + 2 pixels.
BoxLine ReferenceBoxPass(const BoxLine& line, const ReferenceBox& box, int32_t flags);

} // namespace PKTest
