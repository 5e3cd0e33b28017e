// Walks the register: every body of every row kernel, over all widths and many alignments, on rows that end
// at guard pages, against the plain body and against the slow reference.

#include "convert/KernelTable.h"
#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/KernelRows.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>
#include <xmmintrin.h>

#include <algorithm>
#include <string>
#include <vector>

namespace {

using namespace PK;

using PKTest::Describe;

class KernelSweep : public testing::TestWithParam<int> {
protected:
    Kernel kernel = static_cast<Kernel>(GetParam());
    const KernelInfo& info = Info(kernel);
    PKTest::Random random{static_cast<uint64_t>(GetParam())};

    size_t SourceBytes(int32_t width) const { return PKTest::SourceBytes(kernel, width); }
    size_t DestinationBytes(int32_t width) const { return PKTest::DestinationBytes(kernel, width); }

    /// One row through one body, compared with the reference.
    void CheckRow(Target target, int32_t width, PKTest::Placement sourcePlace,
                  PKTest::Placement destinationPlace) {
        PKTest::RowBuffer source(SourceBytes(width), sourcePlace);
        PKTest::RowBuffer destination(DestinationBytes(width), destinationPlace);
        PKTest::FillSamples(info.source, source.Data(), source.Size(), random);
        const std::vector<uint8_t> before(source.Data(), source.Data() + source.Size());

        constexpr unsigned exceptionFlags = 0x3f;
        const unsigned mode = _mm_getcsr() | exceptionFlags;
        Body(kernel, target)(source.Data(), destination.Data(), width);
        ASSERT_EQ(mode, _mm_getcsr() | exceptionFlags) << "another floating-point mode was left";

        // The expected row stands at the same distance from a 16-byte boundary, which one kernel counts from.
        const auto offset = static_cast<int>(reinterpret_cast<uintptr_t>(destination.Data()) % 16);
        PKTest::RowBuffer expected(destination.Size(), {PKTest::Placement::kAtOffset, offset});
        PKTest::RunExpected(kernel, PKTest::HasVectorRule(kernel, target), source.Data(), expected.Data(),
                            width);

        ASSERT_TRUE(std::equal(before.begin(), before.end(), source.Data())) << "the source was written";
        ASSERT_TRUE(destination.MarginsIntact()) << "bytes outside the row were written";
        ASSERT_EQ("", PKTest::FirstDifference(info.destination, destination.Size(), expected.Data(),
                                              destination.Data(), PKTest::UnitsOff(kernel)))
            << Describe(kernel) << ", " << TargetName(target) << ", width " << width << ", source "
            << sourcePlace << ", destination " << destinationPlace << ", seed " << random.Seed();
    }
};

TEST_P(KernelSweep, EveryWidthAgreesWithTheReferenceUpToTheGuardPages) {
    for (const Target target : PKTest::TargetsWithBody(kernel))
        for (int32_t width = 0; width <= 257; ++width)
            for (const auto place : {PKTest::Placement::kBeforeGuard, PKTest::Placement::kAfterGuard})
                ASSERT_NO_FATAL_FAILURE(CheckRow(target, width, {place}, {place}));
}

TEST_P(KernelSweep, EveryAlignmentAgreesWithTheReference) {
    for (const Target target : PKTest::TargetsWithBody(kernel))
        for (int offset = 0; offset < 64; ++offset)
            for (const int32_t width : {1, 2, 7, 33, 64})
                ASSERT_NO_FATAL_FAILURE(CheckRow(target, width, {PKTest::Placement::kAtOffset, offset},
                                                 {PKTest::Placement::kAtOffset, 3 * offset % 64}));
}

TEST_P(KernelSweep, BodiesOfTheSameRuleAgreeToTheBit) {
    constexpr int32_t width = 4099;
    const std::vector<Target> targets = PKTest::TargetsWithBody(kernel);
    ASSERT_FALSE(targets.empty());
    std::vector<uint8_t> source(SourceBytes(width)), first(DestinationBytes(width)), other(first.size());
    for (int round = 0; round < 16; ++round) {
        PKTest::FillSamples(info.source, source.data(), source.size(), random);
        for (const bool vectorRule : {false, true}) {
            const Target* leader = nullptr;
            for (const Target& target : targets) {
                if (PKTest::HasVectorRule(kernel, target) != vectorRule) continue;
                Body(kernel, target)(source.data(), leader ? other.data() : first.data(), width);
                if (!leader) {
                    leader = &target;
                    continue;
                }
                ASSERT_EQ("",
                          PKTest::FirstDifference(info.destination, first.size(), first.data(), other.data()))
                    << Describe(kernel) << ", " << TargetName(target) << " against " << TargetName(*leader)
                    << ", seed " << random.Seed();
            }
        }
    }
}

std::string TestName(const testing::TestParamInfo<int>& param) {
    const KernelInfo& info = Info(static_cast<Kernel>(param.param));
    std::string name = Describe(info.kernel);
    for (char& c : name)
        if (!std::isalnum(static_cast<unsigned char>(c))) c = '_';
    return name + "_" + std::to_string(param.param);
}

INSTANTIATE_TEST_SUITE_P(Register, KernelSweep, testing::Range(0, kKernelCount), TestName);

TEST(KernelRegister, EveryKernelHasABodyForEveryProcessorAndOneForAVX2) {
    for (int i = 0; i < kKernelCount; ++i) {
        const auto kernel = static_cast<Kernel>(i);
        const bool direct = kernel == Kernel::VUYX8uToBGR8uRow_601 || kernel == Kernel::VUYX8uToBGR8uRow_709;
        EXPECT_EQ(!direct, Body(kernel, Target::plain) != nullptr) << Describe(kernel);
        const bool copy = std::string(Info(kernel).name) == "CopyRow";
        EXPECT_EQ(!copy, Body(kernel, Target::avx2) != nullptr) << Describe(kernel);
    }
}

TEST(KernelRegister, AVX512NeedsItsOwnFlagAndThatOfAVX2) {
    PKTest::FlagScope flags;
    for (uint8_t* flag : PKTest::AllFlags()) *flag = 1;
    EXPECT_TRUE(IsEnabled(Target::avx512));
    sCPUHasAVX512 = 0;
    EXPECT_FALSE(IsEnabled(Target::avx512));
    EXPECT_TRUE(IsEnabled(Target::avx2));
    sCPUHasAVX512 = 1;
    PK_SetDebugFlag(9, 0); // AVX2
    EXPECT_FALSE(IsEnabled(Target::avx512));
    EXPECT_TRUE(IsEnabled(Target::sse41));
}

TEST(KernelRegister, SwitchingACapabilityOffTakesEverythingAboveItAway) {
    PKTest::FlagScope flags;
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
