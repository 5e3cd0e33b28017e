#include "primitives/Dispatch.h"

#include "primitives/CapabilityFlags.h"

#include <cstddef>

namespace PK {

const char* TargetName(Target target) noexcept {
    constexpr const char* names[kTargetCount] = {"plain", "SSE2", "SSSE3", "SSE4.1", "AVX2", "AVX-512"};
    return names[static_cast<std::size_t>(target)];
}

bool IsEnabled(Target target) noexcept {
    const uint8_t flags[kTargetCount] = {1,           sCPUHasSSE2, sCPUHasSSSE3,
                                         sCPUHasSSE4, sCPUHasAVX2, sCPUHasAVX512};
    for (std::size_t i = 0; i <= static_cast<std::size_t>(target); ++i)
        if (!flags[i]) return false;
    return true;
}

Target BestTarget() noexcept {
    int target = kTargetCount - 1;
    while (!IsEnabled(static_cast<Target>(target))) --target;
    return static_cast<Target>(target);
}

} // namespace PK
