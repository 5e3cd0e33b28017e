#include "colour/FloatTargets.h"

#include "colour/CpuFeatures.h"

#include <cstddef>

namespace PK {

const char* FloatTargetName(FloatTarget target) {
    constexpr const char* names[kFloatTargetCount] = {"plain", "SSE2", "SSE4.1", "AVX", "AVX2 and FMA"};
    return names[static_cast<size_t>(target)];
}

bool Runs(const CpuFlags& processor, FloatTarget target) {
    switch (target) {
    case FloatTarget::plain:
        return true;
    case FloatTarget::sse2:
        return processor.sse2 != 0;
    case FloatTarget::sse41:
        return processor.sse41 != 0;
    case FloatTarget::avx:
        return processor.avx != 0;
    case FloatTarget::avx2fma:
        return processor.avx2 != 0 && processor.fma3 != 0;
    }
    return false;
}

FloatTarget BestFloatTarget() {
    int target = kFloatTargetCount - 1;
    while (!Runs(CpuFeatures::Flags(), static_cast<FloatTarget>(target))) --target;
    return static_cast<FloatTarget>(target);
}

} // namespace PK
