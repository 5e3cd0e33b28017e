// Start and stop nest by count. Whether a call does the work of a start shows in the SSE flag, which every
// x86-64 processor has and nothing takes away but a switch.

#include "support/FlagScope.h"

#include "zebcore/debug.h"

#include <PixelKiln/PixelKiln.h>

#include <gtest/gtest.h>

#include <latch>
#include <thread>
#include <vector>

using PK::sCPUHasSSE;
using PKTest::FlagScope;
using zebcore::debug::DebugDatabase;

namespace {

bool InitialiseStarts() {
    sCPUHasSSE = 0;
    EXPECT_EQ(PK_Initialize(), PK_Success);
    return sCPUHasSSE == 1;
}

} // namespace

TEST(Lifecycle, OnlyTheFirstOfNestedCallsStarts) {
    const FlagScope flags;
    EXPECT_TRUE(InitialiseStarts());
    EXPECT_FALSE(InitialiseStarts());
    EXPECT_FALSE(InitialiseStarts());
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_FALSE(InitialiseStarts()); // one is still open
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_TRUE(InitialiseStarts()); // all were closed
    EXPECT_EQ(PK_Terminate(), PK_Success);
}

TEST(Lifecycle, AStopTooManyIsMadeGoodByAStart) {
    const FlagScope flags;
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_FALSE(InitialiseStarts()); // from -1 to 0
    EXPECT_TRUE(InitialiseStarts());  // from 0 to 1
    EXPECT_EQ(PK_Terminate(), PK_Success);

    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_EQ(PK_Terminate(), PK_Success);
    EXPECT_FALSE(InitialiseStarts());
    EXPECT_FALSE(InitialiseStarts());
    EXPECT_TRUE(InitialiseStarts());
    EXPECT_EQ(PK_Terminate(), PK_Success);
}

TEST(Lifecycle, StopLeavesTheFlags) {
    const FlagScope flags;
    ASSERT_EQ(PK_Initialize(), PK_Success);
    PK_SetDebugFlag(7, 1);
    ASSERT_EQ(PK_Terminate(), PK_Success);
    EXPECT_EQ(sCPUHasSSE, 1);
    EXPECT_EQ(PK::sCPUHasSSE42, 1);
}

TEST(Lifecycle, AStartDetectsASwitchedOffCapabilityAnew) {
    const FlagScope flags;
    ASSERT_EQ(PK_Initialize(), PK_Success);
    PK_SetDebugFlag(2, 0);
    ASSERT_EQ(PK_Initialize(), PK_Success);
    EXPECT_EQ(sCPUHasSSE, 0);
    ASSERT_EQ(PK_Terminate(), PK_Success);
    ASSERT_EQ(PK_Terminate(), PK_Success);
    EXPECT_EQ(sCPUHasSSE, 0);
    ASSERT_EQ(PK_Initialize(), PK_Success);
    EXPECT_EQ(sCPUHasSSE, 1);
    ASSERT_EQ(PK_Terminate(), PK_Success);
}

TEST(Lifecycle, ThreadsThatKnowNothingOfEachOtherStartAndStop) {
    const FlagScope flags;
    std::vector<std::thread> plugIns;
    std::latch begin(4);
    for (int i = 0; i < 4; ++i)
        plugIns.emplace_back([&begin] {
            begin.arrive_and_wait();
            for (int round = 0; round < 200; ++round) {
                PK_Initialize();
                PK_Initialize();
                PK_Terminate();
                PK_Terminate();
            }
        });
    for (std::thread& plugIn : plugIns) plugIn.join();
    EXPECT_TRUE(InitialiseStarts()) << "a start or a stop was lost";
    EXPECT_EQ(PK_Terminate(), PK_Success);
}

TEST(Lifecycle, ReadsTheSettingsAtAStart) {
    const FlagScope flags;
    FlagScope::ClearAll();
    DebugDatabase::Instance().SetEntry("PK.disableAVX", "true");
    PK_SetDebugFlag(8, 1);
    PK_SetDebugFlag(9, 1);
    ASSERT_EQ(PK_Initialize(), PK_Success);
    EXPECT_FALSE(PK_hasAVX());
    EXPECT_TRUE(PK_hasAVX2());
    ASSERT_EQ(PK_Terminate(), PK_Success);

    DebugDatabase::Instance().RemoveEntry("PK.disableAVX");
    DebugDatabase::Instance().SetEntry("PK.disableAVX2", "true");
    PK_SetDebugFlag(8, 1);
    ASSERT_EQ(PK_Initialize(), PK_Success);
    EXPECT_TRUE(PK_hasAVX());
    EXPECT_FALSE(PK_hasAVX2());
    ASSERT_EQ(PK_Terminate(), PK_Success);
    DebugDatabase::Instance().RemoveEntry("PK.disableAVX2");
}
