#include "dv/ReduceBlock.h"

#include <algorithm>
#include <cmath>

namespace PK {
namespace {

constexpr float kFlat = 0.5f; // of DC, for each sample
constexpr float kSlope =
    0.11548494f; // the mean of cos(pi / 8) and cos(3 pi / 8), by 1/2, and 1 / sqrt(8) across
constexpr float kTwist = 0.10669417f; // the square of that mean, by 1/4

int16_t Rounded(float sample) {
    return static_cast<int16_t>(std::lrintf(std::clamp<float>(sample, INT16_MIN, INT16_MAX)));
}

void ReduceToQuarter(int16_t* block, const DVSteps& steps) {
    const auto coefficient = [&](int32_t place) {
        return std::nearbyint(static_cast<float>(block[place]) * (steps.factors[place] * steps.step));
    };
    const float flat = kFlat * static_cast<float>(block[0]);
    const float across = kSlope * coefficient(1), down = kSlope * coefficient(8),
                twist = kTwist * coefficient(9);
    block[0] = Rounded(flat + ((across + down) + twist));
    block[1] = Rounded(flat - ((across - down) + twist));
    block[2] = Rounded(flat + ((across - down) - twist));
    block[3] = Rounded(flat - ((across + down) - twist));
}

} // namespace

DVParseDepth DepthOfReduction(DVSize size) {
    // The places of the scan that have the last of the 2 x 2 coefficients. At half the size most blocks must be parsed
    // to their ends anyway, for others to find what they leave.
    if (size == DVSize::Quarter) return {4, 8};
    return {};
}

void ReduceBlockDV(const DVTransformKernels& transforms, int16_t* block, const DVSteps& steps, DVSize size) {
    if (size == DVSize::Half)
        transforms.half(block, steps, block);
    else
        ReduceToQuarter(block, steps);
}

} // namespace PK
