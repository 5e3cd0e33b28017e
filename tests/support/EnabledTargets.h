#pragma once

// The instruction sets whose bodies this processor can run.

#include "frame/Capabilities.h"
#include "frame/Dispatch.h"

#include <vector>

namespace PKTest {

inline std::vector<PK::Target> EnabledTargets() {
    PK::SetCapabilities(PK::ReadProcessor());
    std::vector<PK::Target> targets;
    for (int i = 0; i < PK::kTargetCount; ++i)
        if (PK::IsEnabled(static_cast<PK::Target>(i))) targets.push_back(static_cast<PK::Target>(i));
    return targets;
}

} // namespace PKTest
