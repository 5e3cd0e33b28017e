// PK_Motion held to its restatement: random placements of all formats, fields and qualities, compared to the last byte of
// the destination's memory.

#include "frame/DebugSwitches.h"
#include "frame/Task.h"
#include "support/FlagScope.h"
#include "support/RandomMotion.h"
#include "support/Targets.h"
#include "support/ThreadCount.h"
#include "support/Walk.h"

#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <thread>
#include <vector>

using namespace PK;
using namespace PKTest;
using PKReference::DrawMotion;
using PKReference::MotionArguments;

namespace {

/// Whether nothing is divided by alpha on the way to the destination.
bool KeepsPremultiplied(const MotionArguments& a) {
    const bool isBlurredInLinear = a.blursInLinear && a.quality >= 3;
    return AlphaOf(a.destinationFormat) == kAlphaPremultiplied && !a.composites && a.opacity == 1 &&
           !isBlurredInLinear && IsLinear(a.sourceFormat) == IsLinear(a.destinationFormat);
}

/// Whether a row may be 8 bits deep where it is faded, and becomes more only then.
bool FadesInBytes(const MotionArguments& a) {
    const PK_PixelFormat to = a.destinationFormat;
    const bool isFadedAsItIs = DepthOf(to) == kDepth8u || (IsPacked4444(to) && DepthOf(to) == kDepth32f);
    return !a.composites && a.opacity < 1 && !isFadedAsItIs;
}

/// By how much of full scale a sample may leap where the last bit of a sum changes.
///
/// To divide by a float alpha is to multiply by the processor's estimate of its reciprocal, of which there are 2048 between
/// an alpha and twice as much; in linear light colours leap by up to 2.4 times as much. A composite may divide twice. A byte
/// leaps by one.
double LeapOf(const MotionArguments& a) {
    if (FadesInBytes(a)) return 1.0 / 219;
    if (KeepsPremultiplied(a)) return 0;
    return (a.composites ? 2 : 1) * 2.4 / 2048;
}

struct Counts {
    int64_t codes = 0, otherCodes = 0, samples = 0, leaps = 0;
};

template <class Code>
Code Load(const uint8_t* from) {
    Code code;
    std::memcpy(&code, from, sizeof code);
    return code;
}

/// Codes may be one apart, and floats by 2e-5 of their magnitude, as sums of floats are rounded at each step; and all by a
/// leap more.
class Comparison {
public:
    Comparison(const PaddedPicture& expected, const PaddedPicture& actual, double leap, Counts& counts)
        : fExpected(expected), fActual(actual), fLeap(leap), fCounts(counts) {}

    /// Where they are too far from each other; empty if they are nowhere.
    std::string Difference() const {
        for (int32_t row = 0; row < fExpected.height; ++row)
            for (size_t at = 0; at < fExpected.RowLength(); at += BytesOfWord()) {
                const uint8_t *const expected = fExpected.Row(row) + at, *const actual =
                                                                             fActual.Row(row) + at;
                if (!IsWordNear(expected, actual))
                    return "row " + std::to_string(row) + ", byte " + std::to_string(at) + ": " +
                           FirstDifference(fExpected.format, BytesOfWord(), expected, actual);
            }
        return IsRestAlike() ? "" : "bytes that are no pixels";
    }

private:
    size_t BytesOfWord() const {
        const uint32_t depth = DepthOf(fExpected.format);
        return depth == kDepth8u ? 1 : depth == kDepth15u ? 2 : 4;
    }

    bool IsWordNear(const uint8_t* expected, const uint8_t* actual) const {
        switch (DepthOf(fExpected.format)) {
        case kDepth32f:
            return IsFloatNear(Load<float>(expected), Load<float>(actual));
        case kDepth15u:
            return IsCodeNear(Load<uint16_t>(expected), Load<uint16_t>(actual));
        case kDepth10u:
            return AreThreeNear(Load<uint32_t>(expected), Load<uint32_t>(actual));
        default:
            return IsCodeNear(*expected, *actual);
        }
    }
    bool AreThreeNear(uint32_t expected, uint32_t actual) const {
        for (int bit = IsYUV(fExpected.format) ? 0 : 2; bit < 30; bit += 10)
            if (!IsCodeNear(expected >> bit & 1023, actual >> bit & 1023)) return false;
        return true;
    }
    bool IsFloatNear(double expected, double actual) const {
        return IsNear(expected, actual, std::max({1.0, std::abs(expected), std::abs(actual)}), 2e-5);
    }
    bool IsCodeNear(uint32_t expected, uint32_t actual) const {
        ++fCounts.codes;
        if (expected != actual) ++fCounts.otherCodes;
        const double full = FullScale();
        return IsNear(expected, actual, full, 1 / full);
    }
    bool IsNear(double expected, double actual, double scale, double most) const {
        ++fCounts.samples;
        const double distance = std::abs(expected - actual) / scale;
        if (distance <= most) return true;
        ++fCounts.leaps;
        return distance <= most + fLeap;
    }
    double FullScale() const {
        const uint32_t depth = DepthOf(fExpected.format);
        return depth == kDepth8u ? 255 : depth == kDepth15u ? 32768 : 1023;
    }

    bool IsRestAlike() const {
        PaddedPicture expected = fExpected;
        for (int32_t row = 0; row < expected.height; ++row)
            std::memcpy(expected.Row(row), fActual.Row(row), expected.RowLength());
        return fActual.HasMemoryOf(expected);
    }

    const PaddedPicture &fExpected, &fActual;
    double fLeap;
    Counts& fCounts;
};

class MotionSweep : public testing::Test {
protected:
    MotionSweep() { PK_Initialize(); }
    ~MotionSweep() override { PK_Terminate(); }

private:
    FlagScope fFlags;
};

/// 32 rows of a destination of 128, by where it lies in them: with sizes, places and scales of few binary digits both have
/// the same numbers for the same row.
MotionArguments Piece(const MotionArguments& whole, int32_t piece) {
    constexpr int32_t kRows = 32;
    MotionArguments a = whole;
    const int32_t top = piece * kRows, bottom = whole.destinationHeight - top - kRows;
    const int32_t firstInMemory = PK_IsOriginBottomLeft(a.destinationFormat) ? bottom : top;
    a.destination += int64_t{firstInMemory} * a.destinationRowBytes;
    a.destinationHeight = kRows;
    a.position.y =
        (a.position.y * static_cast<float>(whole.destinationHeight) - static_cast<float>(bottom)) / kRows;
    return a;
}

} // namespace

// The restatement walks in float, too, and so mostly comes to the same pixels, between which it weighs in double precision.
TEST_F(MotionSweep, PlacesAsItIsTold) {
    const std::vector<Target>& targets = TargetsOfThisProcessor();
    Random random(5101);
    Walk walk;
    Counts counts;
    int placements = 0, changes = 0;
    for (size_t round = 0; round < 6000; ++round) {
        const RandomMotion motion(random);
        if (walk.LeavesOut()) continue;
        const TargetScope scope(targets[round % targets.size()]);
        sAllOriginsTopLeft = round % 8 == 0;
        PaddedPicture expected = motion.destination, actual = motion.destination;
        const MotionArguments arguments = motion.With(actual);
        const auto words = [&] {
            return testing::Message() << "round " << round << ", seed " << random.Seed() << ", "
                                      << TargetName(BestTarget()) << ": " << Describe(arguments);
        };
        ASSERT_EQ(DrawMotion(motion.With(expected)), CallMotion(arguments)) << words();
        ASSERT_EQ("", Comparison(expected, actual, LeapOf(arguments), counts).Difference()) << words();
        ++placements;
        changes += !actual.HasMemoryOf(motion.destination);
    }
    constexpr int kFew = 20; // a walk that leaves most of them out has none to speak of
    EXPECT_GT(changes + kFew, placements / 2);
    EXPECT_LT(counts.otherCodes, counts.codes / 5000 + kFew);
    EXPECT_LT(counts.leaps, counts.samples / 5000 + kFew);
}

TEST_F(MotionSweep, IsTheSameOnOneThreadAndOnAllProcessors) {
    Random random(5102);
    std::vector<RandomMotion> motions;
    while (motions.size() < 200)
        if (const RandomMotion motion(random); motion.destination.height > 32) motions.push_back(motion);
    struct Drawn {
        PaddedPicture picture;
        PK_Result result;
    };
    const auto drawAll = [&motions] {
        std::vector<Drawn> all;
        for (const RandomMotion& motion : motions) {
            all.push_back({motion.destination, PK_Success});
            all.back().result = CallMotion(motion.With(all.back().picture));
        }
        return all;
    };
    const std::vector<Drawn> together = drawAll();
    const size_t threads = ThreadCount();
    Threading::ReleaseTaskExecutor();
    const size_t remaining = RestingThreadCount();
    const std::vector<Drawn> alone = drawAll();
    Threading::CreateTaskExecutor();
    EXPECT_EQ(threads > remaining, std::thread::hardware_concurrency() > 1);
    for (size_t i = 0; i < motions.size(); ++i) {
        EXPECT_EQ(alone[i].result, together[i].result) << i << ", seed " << random.Seed();
        EXPECT_TRUE(alone[i].picture.HasMemoryOf(together[i].picture)) << i << ", seed " << random.Seed();
    }
}

TEST_F(MotionSweep, BandsDrawWhatPiecesOfTheDestinationWould) {
    constexpr PK_PixelFormat kFormats[] = {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f_Linear,
                                           PK_PixelFormat_BGRP_4444_15u};
    constexpr float kScales[] = {0.25f, 0.5f, 1, 2, 4};
    Random random(5103);
    const auto below = [&random](uint32_t count) { return static_cast<int32_t>(random.Below(count)); };
    for (int round = 0; round < 200; ++round) {
        const PaddedPicture source(kFormats[random.Below(3)], 20, 2 + below(60), random);
        PaddedPicture inBands(kFormats[random.Below(3)], 24, 128, random), inPieces = inBands;
        const auto eighths = [&] { return static_cast<float>(below(9)) / 8; };
        const auto scale = [&] { return kScales[random.Below(5)]; };
        const MotionArguments call = {source.Row(0),
                                      source.RowBytes(),
                                      source.width,
                                      source.height,
                                      source.format,
                                      below(3),
                                      {0, 0, source.width, source.height},
                                      inBands.Row(0),
                                      inBands.RowBytes(),
                                      inBands.width,
                                      inBands.height,
                                      inBands.format,
                                      below(3),
                                      1,
                                      1,
                                      {eighths(), eighths()},
                                      {eighths(), eighths()},
                                      {scale(), scale()},
                                      0,
                                      1 - eighths() / 2,
                                      below(2) != 0,
                                      static_cast<double>(eighths()),
                                      below(2) != 0,
                                      below(3),
                                      PK_BlendMode_Normal,
                                      source.format == PK_PixelFormat_BGRP_4444_32f_Linear ? below(6)
                                                                                           : below(5),
                                      false,
                                      false};
        MotionArguments parted = call;
        parted.destination = inPieces.Row(0);
        EXPECT_EQ(CallMotion(call), PK_Success) << Describe(call);
        for (int32_t piece = 0; piece < 4; ++piece)
            EXPECT_EQ(CallMotion(Piece(parted, piece)), PK_Success) << Describe(call);
        EXPECT_TRUE(inBands.HasMemoryOf(inPieces)) << Describe(call);
    }
}
