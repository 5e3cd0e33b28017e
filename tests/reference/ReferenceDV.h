#pragma once

// A frame of DV decoded slowly: strings of bits, the three passes as the standard tells them, transforms in double
// precision. Damaged bits mean what they say: an escape carries any number of its bits, a code that leads past the last
// place ends its block, and a block whose last code is cut stays as far as it came.

#include "reference/ReferenceDVTables.h"

#include <cstdint>
#include <vector>

namespace PKTest {

struct DVPlane {
    int width, height;
    std::vector<uint8_t> samples;

    uint8_t& At(int x, int y) {
        return samples.at(static_cast<size_t>(y) * static_cast<size_t>(width) + static_cast<size_t>(x));
    }
    uint8_t At(int x, int y) const { return const_cast<DVPlane*>(this)->At(x, y); }
};

/// Y, Cb and Cr as the format stores them.
struct DVPicture {
    DVPlane planes[3];
};

DVPicture ReferenceDVPicture(DVKind kind, const uint8_t* frame);

} // namespace PKTest
