#include "primitives/Dispatch.h"

#include "convert/KernelTable.h"
#include "frame/Capabilities.h"
#include "primitives/CapabilityFlags.h"
#include "support/FlagScope.h"

#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

namespace {

using namespace PK;

TEST(Dispatch, AVX512NeedsItsOwnFlagAndThatOfAVX2) {
    const PKTest::FlagScope flags;
    for (Flag* flag : PKTest::AllFlags()) *flag = 1;
    EXPECT_TRUE(IsEnabled(Target::avx512));
    sCPUHasAVX512 = 0;
    EXPECT_FALSE(IsEnabled(Target::avx512));
    EXPECT_TRUE(IsEnabled(Target::avx2));
    sCPUHasAVX512 = 1;
    PK_SetDebugFlag(9, 0); // AVX2
    EXPECT_FALSE(IsEnabled(Target::avx512));
    EXPECT_TRUE(IsEnabled(Target::sse41));
}

TEST(Dispatch, AnOfferEnablesNoTargetThatItHasNot) {
    const PKTest::FlagScope flags;
    for (Flag* flag : PKTest::AllFlags()) *flag = 1;
    EXPECT_FALSE(IsEnabled(Target::avx));
    EXPECT_FALSE(IsEnabled(Target::avx2fma));
    EXPECT_EQ(Target::avx512, BestTarget());
}

TEST(Dispatch, SwitchingACapabilityOffTakesEverythingAboveItAway) {
    const PKTest::FlagScope flags;
    DetectProcessor();
    const Kernel kernel = Kernel::PremultiplyRow_BGRA_8u;
    Target target;
    PK_SetDebugFlag(9, 0); // AVX2
    ASSERT_TRUE(ChooseTarget(kernel, target));
    EXPECT_LT(target, Target::avx2);
    PK_SetDebugFlag(9, 1);
    sCPUHasAVX512 = 0;
    ASSERT_TRUE(ChooseTarget(kernel, target));
    EXPECT_LE(target, Target::avx2);
    PK_SetDebugFlag(3, 0); // SSE2
    ASSERT_TRUE(ChooseTarget(kernel, target));
    EXPECT_EQ(Target::plain, target);
    EXPECT_EQ(nullptr, ChooseBody(Kernel::VUYX8uToBGR8uRow_601));
}

} // namespace
