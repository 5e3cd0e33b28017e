#include "primitives/MultiplyConstant.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

#include <algorithm>

namespace PK {

namespace {

constexpr int32_t kLargestScale = 16; // 255 x 255 / 2^17 is less than a half

constexpr uint32_t InBothHalves(uint32_t low, uint32_t high) {
    return low | high << 16;
}

/// A negative scale multiplies the constants. A factor of 256 already saturates every source but 0.
ChannelFactors UnscaledFactors(const uint8_t value[4], int32_t scale) {
    const int32_t shift = -std::max(scale, -8);
    const auto factor = [&](int channel) { return std::min(uint32_t{value[channel]} << shift, 256u); };
    return {InBothHalves(factor(0), factor(2)), InBothHalves(factor(1), factor(3)), 0};
}

ChannelFactors ScaledFactors(const uint8_t value[4], int32_t scale) {
    if (scale > kLargestScale) return {0, 0, InBothHalves(1, 1)};
    const uint32_t unit = 1u << (16 - scale);
    return {InBothHalves(value[0], value[2]), InBothHalves(value[1], value[3]), InBothHalves(unit, unit)};
}

} // namespace

int32_t MultiplyConstant(const uint8_t* source, ptrdiff_t sourceStep, const uint8_t value[4],
                         uint8_t* destination, ptrdiff_t destinationStep, int32_t width, int32_t height,
                         int32_t scale) noexcept {
    if (source == nullptr || value == nullptr || destination == nullptr) return kStatusNullPointer;
    if (width < 0 || height < 0) return kStatusBadSize;
    const MultiplyConstantKernels& kernels = Best<MultiplyConstantKernels>();
    const bool isScaled = scale > 0;
    const auto multiplyRow = isScaled ? kernels.scaled : kernels.unscaled;
    const ChannelFactors factors = isScaled ? ScaledFactors(value, scale) : UnscaledFactors(value, scale);
    for (ptrdiff_t row = 0; row < height; ++row) {
        multiplyRow(source + row * sourceStep, destination + row * destinationStep, width, factors);
    }
    return kStatusOk;
}

} // namespace PK
