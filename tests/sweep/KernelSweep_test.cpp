// Walks the register: every body of every kernel, over all sizes and many alignments, on rows that end at guard pages.
// Row kernels of conversion are held to their restatement, all others to the lowest body of the same rule.

#include "convert/KernelTable.h"
#include "register/KernelRegister.h"
#include "support/BodiesRun.h"
#include "support/KernelRows.h"
#include "support/KernelTrial.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>
#include <xmmintrin.h>

#include <algorithm>
#include <cctype>
#include <deque>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace {

using namespace PK;
using PKTest::Describe;
using PKTest::Placement;
using PKTest::RowBuffer;
using PKTest::Walk;

const std::vector<KernelRow>& Register() {
    static const std::vector<KernelRow> rows = KernelRegister();
    return rows;
}

/// Whether a body follows the rule that a declared kernel has from some target on.
bool HasOtherRule(const KernelRow& row, Target target) {
    return row.agreement.kind == Agreement::Declared && target >= row.agreement.from;
}

std::vector<Target> TargetsWithBody(const KernelRow& row) {
    std::vector<Target> targets = PKTest::TargetsOfThisProcessor(row.offer);
    std::erase_if(targets, [&row](Target target) { return !row.body(target); });
    return targets;
}

/// A conversion has a restatement; its rows stand first in the register.
std::optional<Kernel> ConversionAt(size_t index) {
    if (index >= static_cast<size_t>(kKernelCount)) return std::nullopt;
    return static_cast<Kernel>(index);
}

class KernelSweep : public testing::TestWithParam<size_t> {
protected:
    const KernelRow& row = Register()[GetParam()];
    const std::optional<Kernel> conversion = ConversionAt(GetParam());
    const std::vector<Target> targets = TargetsWithBody(row);
    PKTest::Random random{GetParam()};

    /// The lowest body that follows the rule of a target.
    Target Leader(Target target) const {
        return *std::ranges::find_if(
            targets, [&](Target other) { return HasOtherRule(row, other) == HasOtherRule(row, target); });
    }

    /// One call of a body, held to what it must give, in the bytes and at the borders.
    void Check(Target target, int32_t size, Placement sourcePlace, Placement destinationPlace) {
        SCOPED_TRACE(testing::Message()
                     << Describe(row) << ", " << TargetName(target) << ", size " << size << ", source "
                     << sourcePlace << ", destination " << destinationPlace << ", seed " << random.Seed());
        const PKTest::KernelTrial trial = PKTest::MakeTrial(row, size, random.Next());
        std::deque<RowBuffer> sources; // whose elements stay where they are
        std::vector<const uint8_t*> pointers;
        std::vector<std::vector<uint8_t>> before;
        for (const PKTest::TrialRow& from : trial.sources) {
            RowBuffer& source = sources.emplace_back(from.bytes, sourcePlace);
            PKTest::FillSamples(from.samples, source.Data(), from.bytes, random);
            before.emplace_back(source.Data(), source.Data() + from.bytes);
            pointers.push_back(source.Data());
        }
        const size_t bytes = trial.destination.bytes;
        RowBuffer destination(bytes, destinationPlace);
        PKTest::FillSamples(trial.destination.samples, destination.Data(), bytes, random);
        // The expected row stands at the same distance from a boundary, which some kernels count from.
        const auto offset = static_cast<int>(reinterpret_cast<uintptr_t>(destination.Data()) % 64);
        RowBuffer expected(bytes, {Placement::kAtOffset, offset});
        std::copy_n(destination.Data(), bytes, expected.Data());

        constexpr unsigned kExceptionFlags = 0x3f;
        const unsigned mode = _mm_getcsr() | kExceptionFlags;
        trial.call(row.body(target), pointers, destination.Data());
        ASSERT_EQ(mode, _mm_getcsr() | kExceptionFlags) << "another floating-point mode was left";
        if (conversion)
            PKTest::RunExpected(*conversion, HasOtherRule(row, target), pointers[0], expected.Data(), size);
        else
            trial.call(row.body(Leader(target)), pointers, expected.Data());

        for (size_t i = 0; i < sources.size(); ++i)
            ASSERT_TRUE(std::ranges::equal(before[i], std::span(sources[i].Data(), sources[i].Size())))
                << "source " << i << " was written";
        ASSERT_TRUE(destination.MarginsIntact()) << "bytes outside the row were written";
        ASSERT_EQ("", PKTest::FirstDifference(trial.destination.samples, bytes, expected.Data(),
                                              destination.Data(),
                                              conversion ? PKTest::UnitsOff(*conversion) : 0));
    }
};

TEST_P(KernelSweep, EverySizeUpToTheGuardPages) {
    constexpr int32_t kGroups = 66; // below, each size is another way through the groups of some body
    Walk beyond;
    for (const Target target : targets)
        for (int32_t size = 0; size <= 257; ++size) {
            if (size > kGroups && beyond.LeavesOut()) continue;
            for (const auto place : {Placement::kBeforeGuard, Placement::kAfterGuard})
                ASSERT_NO_FATAL_FAILURE(Check(target, size, {place}, {place}));
        }
}

TEST_P(KernelSweep, EveryAlignment) {
    Walk walk;
    for (const Target target : targets)
        for (int offset = 0; offset < 64; ++offset) {
            if (walk.LeavesOut()) continue;
            for (const int32_t size : {1, 2, 7, 33, 64})
                ASSERT_NO_FATAL_FAILURE(Check(target, size, {Placement::kAtOffset, offset},
                                              {Placement::kAtOffset, 3 * offset % 64}));
        }
}

/// Bodies of one rule share no restatement here, so that not even a unit in the last place is allowed.
TEST_P(KernelSweep, BodiesOfOneRuleAgreeToTheBit) {
    constexpr int32_t kSize = 4096;
    if (HighestTarget() > Target::plain) {
        ASSERT_FALSE(targets.empty());
    }
    Walk walk;
    for (int round = 0; round < 8; ++round) {
        if (walk.LeavesOut()) continue;
        const PKTest::KernelTrial trial = PKTest::MakeTrial(row, kSize, random.Next());
        std::vector<std::vector<uint8_t>> sources;
        std::vector<const uint8_t*> pointers;
        for (const PKTest::TrialRow& from : trial.sources) {
            std::vector<uint8_t>& source = sources.emplace_back(from.bytes);
            PKTest::FillSamples(from.samples, source.data(), from.bytes, random);
            pointers.push_back(source.data());
        }
        std::vector<uint8_t> first(trial.destination.bytes);
        PKTest::FillSamples(trial.destination.samples, first.data(), first.size(), random);
        std::vector<uint8_t> other = first;
        const std::vector<uint8_t> before = first;
        for (const Target target : targets) {
            PKTest::NoteBodyRun(row, target);
            first = other = before;
            trial.call(row.body(Leader(target)), pointers, first.data());
            trial.call(row.body(target), pointers, other.data());
            ASSERT_EQ("", PKTest::FirstDifference(trial.destination.samples, first.size(), first.data(),
                                                  other.data()))
                << Describe(row) << ", " << TargetName(target) << " against " << TargetName(Leader(target))
                << ", seed " << random.Seed();
        }
    }
}

std::string TestName(const testing::TestParamInfo<size_t>& param) {
    std::string name = Describe(Register()[param.param]);
    for (char& c : name)
        if (!std::isalnum(static_cast<unsigned char>(c))) c = '_';
    return name + "_" + std::to_string(param.param);
}

INSTANTIATE_TEST_SUITE_P(Register, KernelSweep, testing::Range(size_t{0}, Register().size()), TestName);

TEST(KernelRegister, EveryKernelHasABodyForEveryProcessorAndOneForEachTarget) {
    for (const KernelRow& row : Register()) {
        const std::string_view name = row.name;
        const bool isDirect = name == "VUYX8uToBGR8uRow", isCopy = name == "CopyRow";
        for (const Target target : TargetsOf(row.offer)) {
            const bool isPlain = target == Target::plain;
            const bool isOffered = isPlain ? !isDirect : !isCopy;
            EXPECT_EQ(isOffered, row.body(target) != nullptr) << Describe(row) << ", " << TargetName(target);
        }
    }
}

TEST(KernelRegister, TellsTheOperandsOfRows) {
    for (const KernelRow& row : Register()) {
        EXPECT_GT(row.operands.destination.bytes, 0) << Describe(row);
        const bool hasSecond = row.operands.second.bytes > 0;
        if (row.shape == Shape::TwoRows || row.shape == Shape::TwoRowsWithConstants) {
            EXPECT_TRUE(hasSecond) << Describe(row);
        }
        if (row.shape == Shape::Row || row.shape == Shape::RowWithConstants) {
            EXPECT_GT(row.operands.source.bytes, 0) << Describe(row);
            EXPECT_FALSE(hasSecond) << Describe(row);
        }
    }
}

} // namespace
