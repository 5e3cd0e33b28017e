// The bodies of the clamp.

#include "colour/ColourKernels.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

void Clamp(const float* source, float* destination, int32_t count, float minValue, float maxValue) {
    const F32 least = Floats(minValue), most = Floats(maxValue);
    for (int32_t i = 0; i < count; i += kLanes)
        Store(destination + i, Max(Min(LoadFloats(source + i), most), least));
}

constexpr ClampKernels kKernels = {Clamp};

} // namespace
} // namespace PK_TARGET

template <>
const ClampKernels& ClampKernels::For<FloatTarget::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
