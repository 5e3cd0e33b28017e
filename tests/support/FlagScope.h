#pragma once

// Puts the capability flags, the debug switches and the highest target back as they were at the end of the scope.

#include "frame/CacheSize.h"
#include "frame/Capabilities.h"
#include "frame/DebugSwitches.h"
#include "primitives/Dispatch.h"

#include <array>
#include <cstddef>

namespace PKTest {

/// The flags in the order of their switch numbers, and the one that has no switch; switch 1 has no flag.
inline std::array<PK::Flag*, 11> AllFlags() {
    using namespace PK;
    return {&sMotionBlurLinear, &sCPUHasSSE, &sCPUHasSSE2, &sCPUHasSSE3,        &sCPUHasSSSE3, &sCPUHasSSE4,
            &sCPUHasSSE42,      &sCPUHasAVX, &sCPUHasAVX2, &sAllOriginsTopLeft, &sCPUHasAVX512};
}

class FlagScope {
public:
    FlagScope() : fFlags(AllFlags()) {
        for (std::size_t i = 0; i < fFlags.size(); ++i) fSaved[i] = *fFlags[i];
    }
    ~FlagScope() {
        for (std::size_t i = 0; i < fFlags.size(); ++i) *fFlags[i] = fSaved[i];
        PK::HoldTo(fHighest);
        PK::sLargestCacheLevel = fCacheLevel;
        PK::sLargestCacheBytes = fCacheBytes;
    }
    FlagScope(const FlagScope&) = delete;
    FlagScope& operator=(const FlagScope&) = delete;

    /// Switches everything off, as it stands before the first start.
    static void ClearAll() {
        for (PK::Flag* flag : AllFlags()) *flag = 0;
    }

private:
    std::array<PK::Flag*, 11> fFlags;
    std::array<uint8_t, 11> fSaved{};
    PK::Target fHighest = PK::HighestTarget();
    int32_t fCacheLevel = PK::sLargestCacheLevel;
    uint64_t fCacheBytes = PK::sLargestCacheBytes;
};

} // namespace PKTest
