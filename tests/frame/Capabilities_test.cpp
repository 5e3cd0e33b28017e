// What the processor's report sets, and what settings take away.

#include "frame/Capabilities.h"

#include "support/FlagScope.h"
#include "support/Targets.h"

#include "zebcore/debug.h"

#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

using namespace PK;
using PKTest::FlagScope;
using zebcore::debug::DebugDatabase;

namespace {

constexpr uint32_t kSignature = 0x000306c3;
constexpr uint32_t kAVXAndOSXSAVE = 0x18000000;

class Capabilities : public testing::Test {
protected:
    Capabilities() { FlagScope::ClearAll(); }
    ~Capabilities() override {
        DebugDatabase::Instance().RemoveEntry("PK.disableAVX");
        DebugDatabase::Instance().RemoveEntry("PK.disableAVX2");
    }

private:
    FlagScope fFlags;
};

} // namespace

TEST_F(Capabilities, EachBitSetsItsFlagAndNoOther) {
    struct {
        ProcessorReport report;
        Flag* flag;
    } const cases[] = {
        {{kSignature, 0, 1u << 25, 0, 0}, &sCPUHasSSE},
        {{kSignature, 0, 1u << 26, 0, 0}, &sCPUHasSSE2},
        {{kSignature, 1u << 0, 0, 0, 0}, &sCPUHasSSE3},
        {{kSignature, 1u << 9, 0, 0, 0}, &sCPUHasSSSE3},
        {{kSignature, 1u << 19, 0, 0, 0}, &sCPUHasSSE4},
        {{kSignature, 1u << 20, 0, 0, 0}, &sCPUHasSSE42},
        {{kSignature, kAVXAndOSXSAVE, 0, 0, 6}, &sCPUHasAVX},
    };
    for (const auto& single : cases) {
        FlagScope::ClearAll();
        SetCapabilities(single.report);
        for (const Flag* flag : PKTest::AllFlags()) EXPECT_EQ(*flag, flag == single.flag ? 1 : 0);
    }
}

TEST_F(Capabilities, AVXNeedsTheProcessorAndTheSystem) {
    const ProcessorReport lacking[] = {
        {kSignature, 0x10000000, 0, 0x20, 6},     // no XGETBV
        {kSignature, 0x08000000, 0, 0x20, 6},     // no AVX
        {kSignature, kAVXAndOSXSAVE, 0, 0x20, 2}, // YMM not saved
        {kSignature, kAVXAndOSXSAVE, 0, 0x20, 4}, // XMM not saved
    };
    for (const ProcessorReport& report : lacking) {
        SetCapabilities(report);
        EXPECT_EQ(sCPUHasAVX, 0);
        EXPECT_EQ(sCPUHasAVX2, 0);
    }
    SetCapabilities({kSignature, kAVXAndOSXSAVE, 0, 0x20, 0xe7});
    EXPECT_EQ(sCPUHasAVX, 1);
    EXPECT_EQ(sCPUHasAVX2, 1);
}

TEST_F(Capabilities, AVX2IsAskedForByTheSignature) {
    SetCapabilities({6, kAVXAndOSXSAVE, 0, 0x20, 6});
    EXPECT_EQ(sCPUHasAVX, 1);
    EXPECT_EQ(sCPUHasAVX2, 0);
    SetCapabilities({7, kAVXAndOSXSAVE, 0, 0x20, 6});
    EXPECT_EQ(sCPUHasAVX2, 1);
}

TEST_F(Capabilities, AVX512NeedsAllItsPartsAndTheSystem) {
    constexpr uint32_t parts[] = {1u << 16, 1u << 17, 1u << 30, 1u << 31}; // F, DQ, BW, VL
    constexpr uint32_t allParts = 0xc0030000, allState = 0xe6;
    SetCapabilities({kSignature, kAVXAndOSXSAVE, 0, allParts, allState});
    EXPECT_EQ(sCPUHasAVX512, 1);
    EXPECT_EQ(sCPUHasAVX2, 0); // a flag of its own

    sCPUHasAVX512 = 0;
    for (const uint32_t part : parts)
        SetCapabilities({kSignature, kAVXAndOSXSAVE, 0, allParts & ~part, allState});
    for (const uint32_t state : {1u << 5, 1u << 6, 1u << 7, 1u << 2, 1u << 1})
        SetCapabilities({kSignature, kAVXAndOSXSAVE, 0, allParts, allState & ~state});
    SetCapabilities({kSignature, 0x10000000, 0, allParts, allState}); // no XGETBV
    SetCapabilities({6, kAVXAndOSXSAVE, 0, allParts, allState});
    EXPECT_EQ(sCPUHasAVX512, 0);
}

TEST_F(Capabilities, DetectionClearsNothing) {
    for (Flag* flag : PKTest::AllFlags()) *flag = 1;
    SetCapabilities({});
    for (const Flag* flag : PKTest::AllFlags()) EXPECT_EQ(*flag, 1);
}

TEST_F(Capabilities, DetectionAgreesWithTheCompiler) {
    DetectProcessor();
    const auto has = [](Target target, bool processorHas) {
        return processorHas && target <= HighestTarget();
    };
    EXPECT_EQ(sCPUHasSSE, 1);
    EXPECT_EQ(sCPUHasSSE2 != 0, has(Target::sse2, true));
    EXPECT_EQ(sCPUHasSSE3 != 0, has(Target::sse2, __builtin_cpu_supports("sse3")));
    EXPECT_EQ(sCPUHasSSSE3 != 0, has(Target::ssse3, __builtin_cpu_supports("ssse3")));
    EXPECT_EQ(sCPUHasSSE4 != 0, has(Target::sse41, __builtin_cpu_supports("sse4.1")));
    EXPECT_EQ(sCPUHasSSE42 != 0, has(Target::sse41, __builtin_cpu_supports("sse4.2")));
    EXPECT_EQ(sCPUHasAVX != 0, has(Target::avx, __builtin_cpu_supports("avx")));
    EXPECT_EQ(sCPUHasAVX2 != 0, has(Target::avx2, __builtin_cpu_supports("avx2")));
    EXPECT_EQ(sCPUHasAVX512 != 0,
              has(Target::avx512, __builtin_cpu_supports("avx512f") && __builtin_cpu_supports("avx512dq") &&
                                      __builtin_cpu_supports("avx512bw") &&
                                      __builtin_cpu_supports("avx512vl")));
}

TEST_F(Capabilities, TheHighestTargetHoldsBothOffersDown) {
    for (const Offer offer : {Offer::flags, Offer::processor}) {
        for (const Target highest : PKTest::TargetsOfThisProcessor(offer)) {
            const FlagScope restore;
            FlagScope::ClearAll();
            HoldTo(highest);
            SetCapabilities(ReadProcessor());
            EXPECT_EQ(BestTarget(offer), highest) << TargetName(highest);
            for (const Target target : TargetsOf(Offer::flags))
                EXPECT_TRUE(target <= highest || !IsEnabled(target)) << TargetName(highest);
        }
    }
}

TEST_F(Capabilities, ASettingNamesTheHighestTarget) {
    DebugDatabase& settings = DebugDatabase::Instance();
    const std::string before = settings.GetEntry("PK.highestTarget", "");
    settings.SetEntry("PK.highestTarget", "plain");
    DetectProcessor();
    EXPECT_EQ(HighestTarget(), Target::plain);
    EXPECT_EQ(BestTarget(), Target::plain);
    EXPECT_FALSE(PK_hasSSE4());
    for (const char* noTarget : {"", "SSE2", "sse4", "avx-512", "plain "}) {
        settings.SetEntry("PK.highestTarget", noTarget);
        ApplyTargetSetting();
        EXPECT_EQ(HighestTarget(), Target::plain) << noTarget;
    }
    settings.SetEntry("PK.highestTarget", "avx2fma");
    ApplyTargetSetting();
    EXPECT_EQ(HighestTarget(), Target::avx2fma);
    settings.RemoveEntry("PK.highestTarget");
    if (!before.empty()) settings.SetEntry("PK.highestTarget", before);
}

TEST_F(Capabilities, EachSettingTakesItsFlagOnly) {
    sCPUHasAVX = sCPUHasAVX2 = 1;
    DebugDatabase::Instance().SetEntry("PK.disableAVX", "true");
    ApplyCapabilitySettings();
    EXPECT_EQ(sCPUHasAVX, 0);
    EXPECT_EQ(sCPUHasAVX2, 1);

    sCPUHasAVX = 1;
    DebugDatabase::Instance().RemoveEntry("PK.disableAVX");
    DebugDatabase::Instance().SetEntry("PK.disableAVX2", "true");
    ApplyCapabilitySettings();
    EXPECT_EQ(sCPUHasAVX, 1);
    EXPECT_EQ(sCPUHasAVX2, 0);
}

TEST_F(Capabilities, OnlyExactlyTrueCounts) {
    sCPUHasAVX = sCPUHasAVX2 = 1;
    for (const char* text : {"", "false", "True", "TRUE", "1", "true ", " true", "yes"}) {
        DebugDatabase::Instance().SetEntry("PK.disableAVX", text);
        DebugDatabase::Instance().SetEntry("PK.disableAVX2", text);
        ApplyCapabilitySettings();
        EXPECT_EQ(sCPUHasAVX, 1) << text;
        EXPECT_EQ(sCPUHasAVX2, 1) << text;
    }
}

TEST_F(Capabilities, TheCacheIsFoundBeforeTheSettingsAreRead) {
    DebugDatabase::Instance().SetEntry("PK.disableAVX", "true");
    DebugDatabase::Instance().SetEntry("PK.disableAVX2", "true");
    sCPUHasAVX = 1; // so that the default of the cache, if it comes to that, is the one of AVX
    sLargestCacheBytes = 0;
    DetectProcessor();
    EXPECT_EQ(sCPUHasAVX, 0);
    EXPECT_EQ(sCPUHasAVX2, 0);
    EXPECT_GE(sLargestCacheLevel, 2);
    EXPECT_GT(LargestCacheBytes(), 0u);
}
