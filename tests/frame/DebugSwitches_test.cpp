// Each numbered switch writes its flag and no other.

#include "support/FlagScope.h"

#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

using namespace PK;
using PKTest::AllFlags;
using PKTest::FlagScope;

namespace {

struct Switch {
    uint32_t number;
    Flag* flag;
};

constexpr Switch kSwitches[] = {
    {0, &sMotionBlurLinear}, {2, &sCPUHasSSE},          {3, &sCPUHasSSE2},  {4, &sCPUHasSSE3},
    {5, &sCPUHasSSSE3},      {6, &sCPUHasSSE4},         {7, &sCPUHasSSE42}, {8, &sCPUHasAVX},
    {9, &sCPUHasAVX2},       {10, &sAllOriginsTopLeft},
};

} // namespace

TEST(DebugSwitches, WriteTheirFlagOnly) {
    const FlagScope flags;
    for (const Switch& one : kSwitches) {
        for (const int32_t on : {1, 2, -1, 256, INT32_MIN}) {
            FlagScope::ClearAll();
            ASSERT_EQ(PK_SetDebugFlag(one.number, on), PK_Success);
            for (const Flag* flag : AllFlags()) EXPECT_EQ(*flag, flag == one.flag ? 1 : 0) << one.number;
        }
        ASSERT_EQ(PK_SetDebugFlag(one.number, 0), PK_Success);
        EXPECT_EQ(*one.flag, 0);
    }
}

TEST(DebugSwitches, OtherNumbersAreIgnored) {
    const FlagScope flags;
    for (const uint32_t number : {1u, 11u, 12u, 255u, 256u, 0x80000003u, 0xffffffffu}) {
        FlagScope::ClearAll();
        EXPECT_EQ(PK_SetDebugFlag(number, 1), PK_Success);
        for (Flag* flag : AllFlags()) {
            EXPECT_EQ(*flag, 0) << number;
            *flag = 1;
        }
        EXPECT_EQ(PK_SetDebugFlag(number, 0), PK_Success);
        for (const Flag* flag : AllFlags()) EXPECT_EQ(*flag, 1) << number;
    }
}

TEST(DebugSwitches, QueriesTellTheFlagAsItStands) {
    const FlagScope flags;
    FlagScope::ClearAll();
    EXPECT_FALSE(PK_hasSSE4());
    EXPECT_FALSE(PK_hasAVX());
    EXPECT_FALSE(PK_hasAVX2());
    PK_SetDebugFlag(6, 1);
    EXPECT_TRUE(PK_hasSSE4());
    EXPECT_FALSE(PK_hasAVX());
    PK_SetDebugFlag(8, 1);
    EXPECT_TRUE(PK_hasAVX());
    EXPECT_FALSE(PK_hasAVX2());
    PK_SetDebugFlag(9, 1);
    PK_SetDebugFlag(8, 0);
    EXPECT_TRUE(PK_hasAVX2());
    EXPECT_FALSE(PK_hasAVX());
}
