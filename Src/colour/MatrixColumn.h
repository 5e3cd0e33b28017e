#pragma once

// Matrices and columns of three. Sums run from left to right; pixels have Apply of MatrixPixel.h, which begins with
// blue.

#include <PixelKiln/ColorSpace.h>

#include <cstring>

namespace PK {

struct Column {
    float c[3];
};

inline Column operator*(const CSMatrix& matrix, const Column& v) {
    const auto row = [&](const float* m) { return m[0] * v.c[0] + m[1] * v.c[1] + m[2] * v.c[2]; };
    return {{row(matrix.m), row(matrix.m + 3), row(matrix.m + 6)}};
}

/// Row by row.
inline CSMatrix MatrixOf(const float (&values)[9]) {
    CSMatrix matrix;
    std::memcpy(matrix.m, values, sizeof values);
    return matrix;
}

} // namespace PK
