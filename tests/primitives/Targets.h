#pragma once

// Every instruction set that this processor has and the library offers, for tests of all bodies.

#include "primitives/Dispatch.h"
#include "support/FlagScope.h"

#include <PixelKiln/Lifecycle.h>

#include <vector>

namespace PKTest {

inline std::vector<PK::Target> FindTargets() {
    const FlagScope flags;
    PK_Initialize();
    std::vector<PK::Target> targets;
    for (int i = 0; i < PK::kTargetCount; ++i)
        if (PK::IsEnabled(static_cast<PK::Target>(i))) targets.push_back(static_cast<PK::Target>(i));
    PK_Terminate();
    return targets;
}

inline const std::vector<PK::Target>& TargetsOfThisProcessor() {
    static const std::vector<PK::Target> targets = FindTargets();
    return targets;
}

} // namespace PKTest
