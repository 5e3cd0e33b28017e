#pragma once

// From the levels of a block of DV to its samples.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// A factor for each level of a block, twice: line after line, and of each line first those of even and then those of odd
/// columns. That of DC is 0, since DC is 8 samples in steps of 4 whatever the others are.
struct DVFactorTable {
    float raster[64];
    float parted[64];
};

/// What the levels of a block are multiplied by: a factor each, and a step for all.
struct DVSteps {
    const DVFactorTable* factors;
    float step;
};

/// The bodies of one target. Levels times factors, rounded to integers, are coefficients of the orthonormal transforms
/// (BlockTransforms.h), whose inverse gives the samples: 64 around 0, rounded too, by the current rounding mode, and
/// saturated to 16 bits. Source and destination may be the same block.
struct DVTransformKernels {
    using Transform = void (*)(const int16_t* levels, const DVSteps& steps, int16_t* samples);
    Transform inverse88, inverse248;

    /// Half the size, of either mode: four lines of four samples, from the first four coefficients of the first four lines
    /// alone; their mean is that of the block. In 2-4-8 mode these are the sums of lines.
    Transform half;

    /// A quarter of the size: two lines of two samples, the means of each 2 x 2 of those that the first two coefficients of
    /// the first two lines give in `half`. In 2-4-8 mode without the last of the four, which comes so late in the scan that it
    /// may lie anywhere in the segment.
    Transform quarter88, quarter248;

    static constexpr const char* kFamily = "DVTransform";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVTransformKernels& For(); // DVTransforms.kernels.cpp
};

inline constexpr int kDVBlocksAtOnce = 4;

/// The inverse transforms of four blocks one behind the other, each with its own steps.
struct DVFourBlocksKernels {
    using Transform = void (*)(const int16_t* levels, const DVSteps (&steps)[kDVBlocksAtOnce],
                               int16_t* samples);
    Transform inverse88, inverse248;

    static constexpr const char* kFamily = "DVFourBlocks";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVFourBlocksKernels& For(); // DVTransforms.kernels.cpp
};

} // namespace PK
