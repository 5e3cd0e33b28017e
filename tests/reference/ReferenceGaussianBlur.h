#pragma once

// The recursive filter of PK_GaussianBlur restated on whole arrays: every preset stands where it is told to be.

#include <array>
#include <vector>

namespace PKTest {

struct ReferenceGaussian {
    float c0, c1, c2, c3, d1, d2;
};

ReferenceGaussian ReferenceGaussianOf(double sigma);

using FloatPixel = std::array<float, 4>;

/// A line filtered into one of so many pixels, in the caller's floating-point mode.
std::vector<FloatPixel> ReferenceGaussianLine(const std::vector<FloatPixel>& source, int length,
                                              const ReferenceGaussian& gaussian, bool repeatEdge);

} // namespace PKTest
