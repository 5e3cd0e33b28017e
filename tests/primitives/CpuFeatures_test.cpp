// What the colour spaces know of the processor, and how they choose by it.

#include "primitives/CpuFeatures.h"

#include "primitives/Dispatch.h"
#include "support/FlagScope.h"

#include <gtest/gtest.h>

#include <array>
#include <cstring>

namespace {

using namespace PK;
using namespace PKTest;

using FlagBytes = std::array<uint8_t, 20>;

enum Place : size_t {
    kMMX,
    kExtended3DNow,
    kSSE,
    kSSE2,
    kSSE3,
    kSSSE3,
    kSSE4a,
    kSSE41,
    kSSE42,
    kAES,
    kAVX,
    kAVX2,
    kFMA3,
    kFMA4,
    kXOP,
    kF16C,
    kPOPCNT,
    kMisalignedSSE,
    kRDTSCP,
    kRDRAND
};

/// The flags by their places in the record.
FlagBytes BytesOf(const CpuidReport& report) {
    static_assert(sizeof(CpuFlags) == 20 && sizeof(CpuFeatures) == 60);
    return std::bit_cast<FlagBytes>(FlagsOf(report));
}

constexpr uint32_t Bit(int bit) {
    return uint32_t{1} << bit;
}

constexpr uint32_t kAVXAndOSXSAVE = Bit(27) | Bit(28);

struct Source {
    size_t place;
    uint32_t CpuidReport::*reg;
    int bit;
};

constexpr Source kPlain[] = {
    {kMMX, &CpuidReport::leaf1EDX, 23},       {kExtended3DNow, &CpuidReport::extendedEDX, 30},
    {kSSE, &CpuidReport::leaf1EDX, 25},       {kSSE2, &CpuidReport::leaf1EDX, 26},
    {kSSE3, &CpuidReport::leaf1ECX, 0},       {kSSSE3, &CpuidReport::leaf1ECX, 9},
    {kSSE4a, &CpuidReport::extendedECX, 6},   {kSSE41, &CpuidReport::leaf1ECX, 19},
    {kSSE42, &CpuidReport::leaf1ECX, 20},     {kAES, &CpuidReport::leaf1ECX, 25},
    {kPOPCNT, &CpuidReport::leaf1ECX, 23},    {kMisalignedSSE, &CpuidReport::extendedECX, 7},
    {kRDTSCP, &CpuidReport::extendedEDX, 27}, {kRDRAND, &CpuidReport::leaf1ECX, 30},
};

constexpr Source kOnAVX[] = {
    {kAVX2, &CpuidReport::leaf7EBX, 5},     {kFMA3, &CpuidReport::leaf1ECX, 12},
    {kFMA4, &CpuidReport::extendedECX, 16}, {kXOP, &CpuidReport::extendedECX, 11},
    {kF16C, &CpuidReport::leaf1ECX, 29},
};

constexpr uint32_t CpuidReport::*kRegisters[] = {&CpuidReport::leaf1ECX, &CpuidReport::leaf1EDX,
                                                 &CpuidReport::leaf7EBX, &CpuidReport::extendedECX,
                                                 &CpuidReport::extendedEDX};

TEST(CpuFeatures, NothingReportedIsNothingThere) {
    EXPECT_EQ(BytesOf({}), FlagBytes{});
}

TEST(CpuFeatures, EveryBitIsOneFlag) {
    for (const auto reg : kRegisters)
        for (int bit = 0; bit < 32; ++bit) {
            CpuidReport report{};
            report.*reg = Bit(bit);
            report.xcr0 = 7;
            FlagBytes expected{};
            for (const Source& source : kPlain)
                if (source.reg == reg && source.bit == bit) expected[source.place] = 1;
            EXPECT_EQ(BytesOf(report), expected) << "bit " << bit;
        }
}

TEST(CpuFeatures, EveryFlagIsOneByteOfOne) {
    CpuidReport report{};
    for (const auto reg : kRegisters) report.*reg = ~uint32_t{0};
    report.xcr0 = 7;
    FlagBytes all;
    all.fill(1);
    EXPECT_EQ(BytesOf(report), all);
}

TEST(CpuFeatures, AVXNeedsTheSystem) {
    const auto hasAVX = [](uint32_t ecx, uint32_t xcr0) {
        return BytesOf({.leaf1ECX = ecx,
                        .leaf1EDX = 0,
                        .leaf7EBX = 0,
                        .extendedECX = 0,
                        .extendedEDX = 0,
                        .xcr0 = xcr0})[kAVX];
    };
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 6), 1);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 7), 1);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 0xe7), 1);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 0), 0);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 2), 0);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, 4), 0);
    EXPECT_EQ(hasAVX(kAVXAndOSXSAVE, ~uint32_t{6}), 0);
    EXPECT_EQ(hasAVX(Bit(27), 6), 0);
    EXPECT_EQ(hasAVX(Bit(28), 6), 0);
}

TEST(CpuFeatures, WhatStandsOnAVXNeedsIt) {
    for (const Source& source : kOnAVX) {
        CpuidReport report{};
        report.leaf1ECX = kAVXAndOSXSAVE;
        report.*source.reg |= Bit(source.bit);
        report.xcr0 = 6;
        FlagBytes expected{};
        expected[kAVX] = expected[source.place] = 1;
        EXPECT_EQ(BytesOf(report), expected) << source.place;
        report.xcr0 = 3;
        EXPECT_EQ(BytesOf(report), FlagBytes{}) << source.place;
    }
}

TEST(CpuFeatures, TheRecordIsThreeRunsOfWhatThisProcessorHas) {
    const CpuFeatures& features = CpuFeatures::Instance();
    EXPECT_EQ(&features, &CpuFeatures::Instance());
    EXPECT_EQ(&CpuFeatures::Flags(), &features.runs[2]);
    for (const CpuFlags& run : features.runs) EXPECT_EQ(std::memcmp(&run, &features.runs[0], sizeof run), 0);

    const CpuFlags& flags = CpuFeatures::Flags();
    EXPECT_EQ(flags.sse2 != 0, __builtin_cpu_supports("sse2") != 0);
    EXPECT_EQ(flags.sse3 != 0, __builtin_cpu_supports("sse3") != 0);
    EXPECT_EQ(flags.ssse3 != 0, __builtin_cpu_supports("ssse3") != 0);
    EXPECT_EQ(flags.sse41 != 0, __builtin_cpu_supports("sse4.1") != 0);
    EXPECT_EQ(flags.sse42 != 0, __builtin_cpu_supports("sse4.2") != 0);
    EXPECT_EQ(flags.popcnt != 0, __builtin_cpu_supports("popcnt") != 0);
    EXPECT_EQ(flags.avx != 0, __builtin_cpu_supports("avx") != 0);
    EXPECT_EQ(flags.avx2 != 0, __builtin_cpu_supports("avx2") != 0);
    EXPECT_EQ(flags.fma3 != 0, __builtin_cpu_supports("fma") != 0);
    EXPECT_EQ(flags.fma4 != 0, __builtin_cpu_supports("fma4") != 0);
    EXPECT_EQ(flags.xop != 0, __builtin_cpu_supports("xop") != 0);
}

TEST(ProcessorTargets, RunWhereTheirInstructionsAre) {
    EXPECT_TRUE(Runs(CpuFlags{}, Target::plain));
    for (const Target target : {Target::sse2, Target::sse41, Target::avx, Target::avx2fma})
        EXPECT_FALSE(Runs(CpuFlags{}, target)) << TargetName(target);
    CpuFlags flags{};
    flags.sse2 = 1;
    EXPECT_TRUE(Runs(flags, Target::sse2));
    flags.sse41 = 1;
    EXPECT_TRUE(Runs(flags, Target::sse41));
    EXPECT_FALSE(Runs(flags, Target::avx));
    flags.avx = 1;
    EXPECT_TRUE(Runs(flags, Target::avx));
    flags.avx2 = 1;
    EXPECT_FALSE(Runs(flags, Target::avx2fma)) << "its arithmetic is fused";
    flags.fma3 = 1;
    EXPECT_TRUE(Runs(flags, Target::avx2fma));
    flags.avx2 = 0;
    EXPECT_FALSE(Runs(flags, Target::avx2fma));
}

TEST(ProcessorTargets, TheBestIsTheHighestThatRuns) {
    int best = 0;
    for (const Target target : kProcessorTargets)
        if (target <= HighestTarget() && Runs(CpuFeatures::Flags(), target)) best = static_cast<int>(target);
    EXPECT_EQ(static_cast<int>(BestTarget(Offer::processor)), best);
}

TEST(ProcessorTargets, SwitchesOfTheLibraryDoNotReachThem) {
    const FlagScope saved;
    const Target best = BestTarget(Offer::processor);
    FlagScope::ClearAll();
    EXPECT_EQ(BestTarget(Offer::processor), best);
}

} // namespace
