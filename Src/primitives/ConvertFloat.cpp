#include "primitives/ConvertFloat.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

#include <algorithm>
#include <cmath>
#include <xmmintrin.h>

namespace PK {

namespace {

/// Rounds to nearest with ties to even and masks all exceptions until the end of the scope. Denormal products
/// become 0, which they round to in any case.
class ScalingMode {
public:
    ScalingMode() noexcept : fSaved(_mm_getcsr()) { _mm_setcsr(kMode); }
    ~ScalingMode() { _mm_setcsr(fSaved); }
    ScalingMode(const ScalingMode&) = delete;
    ScalingMode& operator=(const ScalingMode&) = delete;

private:
    static constexpr uint32_t kMode = 0x9f80; // as the processor starts, with flush-to-zero

    uint32_t fSaved;
};

/// 2^-scale. Beyond 2^240 every float but 0 saturates, beyond 2^-240 every float becomes 0.
PowerOfTwo ScaleFactor(int32_t scale) {
    constexpr int32_t kMost = 240;
    const int32_t exponent = -std::clamp(scale, -kMost, kMost);
    const int32_t half = exponent / 2;
    return {std::ldexp(1.0f, half), std::ldexp(1.0f, exponent - half)};
}

int32_t Convert(RowKernelWith<PowerOfTwo> run, const void* source, void* destination, int32_t count,
                int32_t scale) {
    if (source == nullptr || destination == nullptr) return kStatusNullPointer;
    if (count < 0) return kStatusBadSize;
    const PowerOfTwo factor = ScaleFactor(scale);
    const ScalingMode mode;
    run(source, destination, count, factor);
    return kStatusOk;
}

} // namespace

int32_t ConvertFloatToInt32(const float* source, int32_t* destination, int32_t count, int32_t roundMode,
                            int32_t scale) noexcept {
    const ConvertFloatKernels& kernels = Best<ConvertFloatKernels>();
    const auto run = roundMode == kRoundNearest ? kernels.nearestToInt32 : kernels.truncatedToInt32;
    return Convert(run, source, destination, count, scale);
}

int32_t ConvertFloatToInt16(const float* source, int16_t* destination, int32_t count, int32_t roundMode,
                            int32_t scale) noexcept {
    const ConvertFloatKernels& kernels = Best<ConvertFloatKernels>();
    const auto run = roundMode == kRoundNearest ? kernels.nearestToInt16 : kernels.truncatedToInt16;
    return Convert(run, source, destination, count, scale);
}

} // namespace PK
