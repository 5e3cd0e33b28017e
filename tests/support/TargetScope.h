#pragma once

// Lets the library choose the bodies of one instruction set until the end of the scope.

#include "support/FlagScope.h"

#include "frame/Capabilities.h"
#include "primitives/Dispatch.h"

#include <gtest/gtest.h>

namespace PKTest {

class TargetScope {
public:
    /// The processor must have the instruction set.
    explicit TargetScope(PK::Target target) {
        using namespace PK;
        SetCapabilities(ReadProcessor());
        uint8_t* const flags[kTargetCount - 1] = {&sCPUHasSSE2, &sCPUHasSSSE3, &sCPUHasSSE4, &sCPUHasAVX2,
                                                  &sCPUHasAVX512};
        for (int i = static_cast<int>(target); i < kTargetCount - 1; ++i) *flags[i] = 0;
        EXPECT_EQ(BestTarget(), target);
    }

private:
    FlagScope fSaved;
};

} // namespace PKTest
