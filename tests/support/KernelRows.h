#pragma once

// Row kernels held to rows worked out by hand, and to the slow reference on rows of any content. How a kernel treats
// widths, alignments and the ends of its rows is the sweep's to check.

#include "convert/KernelTable.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace PKTest {

using Bytes = std::vector<uint8_t>;
using Words = std::vector<uint16_t>;
using DoubleWords = std::vector<uint32_t>;
using Floats = std::vector<float>;

/// The name of a kernel and the formats of its row in the register.
std::string Describe(PK::Kernel kernel);

/// The instruction sets of this processor for which the kernel has a body.
std::vector<PK::Target> TargetsWithBody(PK::Kernel kernel);

/// Whether a body follows the rule of the vector members where those differ from the plain one.
bool HasVectorRule(PK::Kernel kernel, PK::Target target);

/// How far a result may be from the reference, in units of the last place: a power may be one off.
int64_t UnitsOff(PK::Kernel kernel);

size_t SourceBytes(PK::Kernel kernel, int32_t width);
size_t DestinationBytes(PK::Kernel kernel, int32_t width);

/// The row that a kernel must give, from the reference: for a fused one, what its parts give one after the other.
void RunExpected(PK::Kernel kernel, bool vectorRule, const void* source, void* destination, int32_t width);

/// Calls check(target, body) for each body of the kernel that the processor can run.
template <class Check>
void ForEachBody(PK::Kernel kernel, Check check) {
    const std::vector<PK::Target> targets = TargetsWithBody(kernel);
    EXPECT_TRUE(!targets.empty() || PK::HighestTarget() == PK::Target::plain)
        << Describe(kernel) << " has no body";
    for (const PK::Target target : targets) {
        SCOPED_TRACE(Describe(kernel) + ", " + PK::TargetName(target));
        check(target, PK::Body(kernel, target));
        if (testing::Test::HasFatalFailure()) return;
    }
}

/// Which bodies a row worked out by hand is for.
enum class Rule { kBoth, kPlain, kVector };

/// Holds all bodies, and the reference, to a row worked out by hand.
/// \param tolerance  of floats; not-a-number is met by any.
template <class To, class From>
void ExpectRow(PK::Kernel kernel, int32_t width, const std::vector<From>& source,
               const std::vector<To>& expected, Rule rule = Rule::kBoth, To tolerance = {}) {
    ASSERT_GE(source.size() * sizeof(From), SourceBytes(kernel, width)) << Describe(kernel);
    ASSERT_EQ(expected.size() * sizeof(To), DestinationBytes(kernel, width)) << Describe(kernel);
    const auto check = [&](const std::vector<To>& actual, const char* by) {
        for (size_t i = 0; i < expected.size(); ++i) {
            const To want = expected[i], have = actual[i];
            const bool isNear = want - have <= tolerance && have - want <= tolerance;
            EXPECT_TRUE(want == have || isNear || (want != want && have != have))
                << Describe(kernel) << ", " << by << ", sample " << i << ": expected " << +want << ", is "
                << +have;
        }
    };
    for (const bool vectorRule : {false, true}) {
        if (rule != Rule::kBoth && vectorRule != (rule == Rule::kVector)) continue;
        std::vector<To> actual(expected.size());
        RunExpected(kernel, vectorRule, source.data(), actual.data(), width);
        check(actual, vectorRule ? "reference of vectors" : "reference");
    }
    for (const PK::Target target : TargetsWithBody(kernel)) {
        if (rule != Rule::kBoth && HasVectorRule(kernel, target) != (rule == Rule::kVector)) continue;
        std::vector<To> actual(expected.size());
        PK::Body(kernel, target)(source.data(), actual.data(), width);
        check(actual, PK::TargetName(target));
    }
}

/// Holds all bodies to the reference on a row of as many pixels as the bytes hold.
void ExpectReference(PK::Kernel kernel, const void* source, size_t bytes);

template <class From>
void ExpectReference(PK::Kernel kernel, const std::vector<From>& source) {
    ExpectReference(kernel, source.data(), source.size() * sizeof(From));
}

/// The same in place, for kernels that keep the size of a pixel, on awkward samples.
void ExpectReferenceInPlace(PK::Kernel kernel);

/// The same on awkward samples in every rounding mode, for kernels that follow it to the bit.
void ExpectReferenceInEveryRoundingMode(PK::Kernel kernel);

/// All 2^24 combinations of the first three of four bytes.
void ExpectReferenceForAllCodes(PK::Kernel kernel);

/// All values from 0 up that a sample has, each at all four places of a pixel or of a pair of pixels.
template <class Sample>
std::vector<Sample> AllCodesAtEveryPlace() {
    std::vector<Sample> row;
    for (uint32_t code = 0; code < 1u << 8 * sizeof(Sample); ++code)
        row.insert(row.end(), 4, static_cast<Sample>(code));
    return row;
}

/// The floats about the borders between codes, where a code is scale x value + zero, each at all four places.
Floats CodeBordersAtEveryPlace(int codes, float scale, float zero = 0);

} // namespace PKTest
