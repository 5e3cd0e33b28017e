#pragma once

// The recursive filter of the Gaussian blur along lines of float pixels.

#include "primitives/simd/Targets.h"

namespace PK {

/// Of one sigma. The kernels work by these alone, so that their cost does not depend on it.
struct GaussianCoefficients {
    float c0, c1; ///< what the causal pass takes of a pixel and of the one before
    float c2, c3; ///< what the anticausal pass takes of the next pixel and of the one after that
    float d1, d2; ///< what both passes take away of their last result and of the one before
};

inline constexpr int32_t kGaussianPixelBytes = 16;

/// Lines that are filtered in one call. More bring nothing: the passes of eight keep an AVX2 unit busy, and of wider ones
/// what is beside the arithmetic.
inline constexpr int32_t kGaussianLines = 8;

/// Lines of pixels of four floats, which are filtered into longer ones.
///
/// A destination may begin one pixel behind its source and have the same step: no pixel is overwritten before it has been
/// read. Otherwise they do not overlap.
struct GaussianLines {
    const uint8_t* source;
    int64_t sourceStep; ///< bytes from line to line
    uint8_t* destination;
    int64_t destinationStep;
    uint8_t* scratch; ///< kGaussianLines x kGaussianPixelBytes for each pixel of a destination line
    int32_t count;    ///< 0 to kGaussianLines

    int32_t sourceLength; ///< at least 1
    int32_t length;       ///< of the destination, at least the same
    bool repeatEdge;      ///< the ends of the source go on for ever; else there is transparent black
};

struct GaussianBlurKernels {
    using Filter = void (*)(const GaussianLines& lines, const GaussianCoefficients& coefficients);

    Filter filterLines;

    static constexpr const char* kFamily = "GaussianBlur";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const GaussianBlurKernels& For(); // GaussianBlur.kernels.cpp
};

} // namespace PK
