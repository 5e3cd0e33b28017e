#pragma once

// The instruction sets that this processor has, the library offers and it is not held below, and the ways to test the bodies of each.

#include "support/FlagScope.h"

#include "frame/Capabilities.h"
#include "primitives/Dispatch.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace PKTest {

inline std::vector<PK::Target> FindTargets(PK::Offer offer) {
    PK::ApplyTargetSetting();
    const FlagScope flags;
    FlagScope::ClearAll();
    PK::SetCapabilities(PK::ReadProcessor());
    std::vector<PK::Target> targets;
    for (const PK::Target target : PK::TargetsOf(offer))
        if (PK::IsEnabled(target, offer)) targets.push_back(target);
    return targets;
}

inline const std::vector<PK::Target>& TargetsOfThisProcessor(PK::Offer offer = PK::Offer::flags) {
    static const std::vector<PK::Target> byFlags = FindTargets(PK::Offer::flags),
                                         byProcessor = FindTargets(PK::Offer::processor);
    return offer == PK::Offer::flags ? byFlags : byProcessor;
}

/// Lets the library choose the bodies of one instruction set until the end of the scope.
class TargetScope {
public:
    /// The processor must have the instruction set.
    explicit TargetScope(PK::Target target) {
        using namespace PK;
        Flag* const flags[] = {&sCPUHasSSE2, &sCPUHasSSSE3, &sCPUHasSSE4, &sCPUHasAVX2, &sCPUHasAVX512};
        static_assert(std::size(flags) + 1 == std::size(kFlagTargets));
        for (size_t i = 0; i < std::size(flags); ++i) *flags[i] = kFlagTargets[i + 1] <= target;
        EXPECT_EQ(BestTarget(), target);
    }

private:
    FlagScope fSaved;
};

/// Runs a check while the library chooses the bodies of one instruction set, for each in turn.
template <class Check>
void AtEveryTarget(Check check) {
    for (const PK::Target target : TargetsOfThisProcessor()) {
        const TargetScope scope(target);
        SCOPED_TRACE(PK::TargetName(target));
        check();
        if (testing::Test::HasFatalFailure()) return;
    }
}

/// Tests that are run at each target: INSTANTIATE_TEST_SUITE_P(Targets, X, EveryTarget(), TargetOf).
class TargetTest : public testing::TestWithParam<PK::Target> {
private:
    const TargetScope fScope{GetParam()};
};

inline auto EveryTarget() {
    return testing::ValuesIn(TargetsOfThisProcessor());
}

inline std::string TargetOf(const testing::TestParamInfo<PK::Target>& test) {
    std::string name = PK::TargetName(test.param);
    std::erase_if(name, [](char c) { return c == '.' || c == '-' || c == ' '; });
    return name;
}

} // namespace PKTest
