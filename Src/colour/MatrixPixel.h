#pragma once

// Matrices on pixels.

#include "colour/PixelLoop.h"

#include <PixelKiln/ColorSpace.h>

namespace PK {

/// The sums run in the memory order of pixels: blue first.
inline RGB Apply(const CSMatrix& matrix, RGB c) {
    const auto row = [&](const float* m) { return m[2] * c.b + m[1] * c.g + m[0] * c.r; };
    return {row(matrix.m), row(matrix.m + 3), row(matrix.m + 6)};
}

/// Whether it is the identity, to the last bit but for the sign of zeros.
inline bool IsIdentity(const CSMatrix& matrix) {
    for (int i = 0; i < 9; ++i)
        if (matrix.m[i] != (i % 4 == 0 ? 1.0f : 0.0f)) return false;
    return true;
}

} // namespace PK
