#pragma once

// The bodies of the colour spaces' kernels that this processor runs, and the rounding that each restates.

#include "colour/CpuFeatures.h"
#include "colour/FloatTargets.h"
#include "reference/ReferenceColour.h"

#include <vector>

namespace PKTest {

inline std::vector<PK::FloatTarget> FloatTargetsOfThisProcessor() {
    std::vector<PK::FloatTarget> targets;
    for (int i = 0; i < PK::kFloatTargetCount; ++i) {
        const auto target = static_cast<PK::FloatTarget>(i);
        if (PK::Runs(PK::CpuFeatures::Flags(), target)) targets.push_back(target);
    }
    return targets;
}

inline reference::Rounding RoundingOf(PK::FloatTarget target) {
    return target == PK::FloatTarget::avx2fma ? reference::Rounding::kFused : reference::Rounding::kEach;
}

} // namespace PKTest
