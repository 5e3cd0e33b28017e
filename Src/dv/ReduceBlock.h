#pragma once

// Blocks of DV at half and a quarter of their size, from the coefficients of lowest frequency alone.

#include "dv/DVSegment.h"

namespace PK {

/// How far a block is to be parsed for it: to the place of the scan that has the last coefficient of a quarter, which its own
/// area reaches. At half the size most blocks must be parsed to their ends anyway, for others to find what they leave.
constexpr DVParseDepth DepthOfReduction(DVSize size) {
    if (size == DVSize::Quarter) return {4, 4};
    return {};
}

/// The transform to four lines of four samples, or to two of two. A block of 2-4-8 mode goes the same way, since its first
/// lines are the sums of neighbours.
inline DVTransformKernels::Transform ReduceBlockDV(const DVTransformKernels& transforms, DVSize size,
                                                   bool is248) {
    if (size == DVSize::Half) return transforms.half;
    return is248 ? transforms.quarter248 : transforms.quarter88;
}

} // namespace PK
