#include "dv/ReduceBlock.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

constexpr float kFlat = 0.125f; // what DC gives to each sample: 1 / sqrt(8) along lines and along columns
constexpr float kSlope =
    0.11548494f; // the mean of cos(pi / 8) and cos(3 pi / 8), by 1/2, and 1 / sqrt(8) across
constexpr float kTwist = 0.10669417f; // the square of the former

int16_t Rounded(float sample) {
    return static_cast<int16_t>(std::lrintf(std::clamp<float>(sample, INT16_MIN, INT16_MAX)));
}

/// The means of the samples' quarters.
void ReduceToQuarter(int16_t* block) {
    const float flat = kFlat * static_cast<float>(block[0]);
    const float across = kSlope * static_cast<float>(block[1]), down = kSlope * static_cast<float>(block[8]);
    const float twist = kTwist * static_cast<float>(block[9]);
    block[0] = Rounded((flat + across) + (down + twist));
    block[1] = Rounded((flat - across) + (down - twist));
    block[2] = Rounded((flat + across) - (down + twist));
    block[3] = Rounded((flat - across) - (down - twist));
}

} // namespace

DVParseDepth DepthOfReduction(DVSize size) {
    // The last place of the scan that has one of the 4 x 4, or of the 2 x 2, coefficients.
    if (size == DVSize::Half) return {24, 42};
    if (size == DVSize::Quarter) return {4, 8};
    return {};
}

void ReduceBlockDV(const BlockTransformKernels& transforms, int16_t* block, DVSize size) {
    if (size == DVSize::Half)
        transforms.reduced(block, block);
    else
        ReduceToQuarter(block);
}

} // namespace PK
