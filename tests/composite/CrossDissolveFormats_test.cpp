// The format in which PK_CrossDissolve mixes, for every three formats.

#include "convert/RasterFormats.h"
#include "reference/ReferenceDissolve.h"
#include "support/AlignedPicture.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/CrossDissolve.h>

#include <gtest/gtest.h>

#include <cstring>

using namespace PKTest;

namespace {

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kV210 = PK_PixelFormat_V210_422_10u;

PK_Result Dissolve(AlignedPicture& first, AlignedPicture& second, AlignedPicture& out, int32_t width,
                   int32_t height, float ratio, int32_t quality = 4) {
    return PK_CrossDissolve(first.Pixels(), first.RowBytes(), first.format, second.Pixels(),
                            second.RowBytes(), second.format, out.Pixels(), out.RowBytes(), out.format, width,
                            height, ratio, quality);
}

PK_PixelFormat InCatalogue(PK_PixelFormat format) {
    return PK::IsRasterFormat(format) ? format : (format & ~0x1c0u) | 0x100;
}

/// The rules of the working format in the numbers of the format's fields.
struct Expectation {
    PK_PixelFormat working;
    DissolveRule rule;
};

Expectation Expected(PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat destination, int32_t quality,
                     bool hasSSE2) {
    const auto depth = [](PK_PixelFormat format) { return format & 0x1c0; };
    const auto alpha = [](PK_PixelFormat format) { return format & 0xc; };
    const auto isOpaque = [&](PK_PixelFormat format) { return alpha(format) == 0 || alpha(format) == 12; };
    const bool oneDepth = depth(first) == depth(destination) && depth(second) == depth(destination);
    const uint32_t workingDepth = oneDepth || quality == 2 ? depth(destination) : 0x100;
    if (isOpaque(first) && isOpaque(second)) {
        PK_PixelFormat working = (destination & ~0x1fcu) | 12 | workingDepth;
        if (hasSSE2 || (working & 1) != 0) working &= ~0x1000u;
        return {InCatalogue(working), hasSSE2 ? DissolveRule::kStraight : DissolveRule::kOpaque};
    }
    PK_PixelFormat ruling = first;
    if (isOpaque(first) || alpha(second) == 8) ruling = second;
    const PK_PixelFormat working = (ruling & ~0x1c0u & ~0x30u & ~0x1000u) | workingDepth;
    return {InCatalogue(working),
            alpha(ruling) == 8 ? DissolveRule::kPremultiplied : DissolveRule::kStraight};
}

void ConvertRow(const void* from, PK_PixelFormat fromFormat, void* to, PK_PixelFormat toFormat, int32_t width,
                int32_t quality) {
    ASSERT_EQ(PK_Convert(from, 0, fromFormat, to, 0, toFormat, width, 1, quality), PK_Success);
}

class CrossDissolveFormats : public testing::Test {
protected:
    CrossDissolveFormats() { PK::SetCapabilities(PK::ReadProcessor()); }

    /// Every row converted, mixed by the restatement and converted back.
    void CheckTriple(PK_PixelFormat firstFormat, PK_PixelFormat secondFormat, PK_PixelFormat format,
                     int32_t quality, float ratio) {
        constexpr int32_t kWidth = 7, kHeight = 2;
        const bool hasSSE2 = PK::sCPUHasSSE2 != 0;
        AlignedPicture first(firstFormat, kWidth, kHeight), second(secondFormat, kWidth, kHeight),
            out(format, kWidth, kHeight);
        first.FillOrdinary(fRandom);
        second.FillOrdinary(fRandom);
        ASSERT_EQ(Dissolve(first, second, out, kWidth, kHeight, ratio, quality), PK_Success);

        const bool isV210 = (format & ~0x200u) == kV210 && firstFormat == format && secondFormat == format;
        const Expectation expected = Expected(firstFormat, secondFormat, format, quality, hasSSE2);
        AlignedPicture a(expected.working, kWidth, 1), b(expected.working, kWidth, 1),
            mixed(expected.working, kWidth, 1), wanted(format, kWidth, 1);
        const auto depth = static_cast<SampleDepth>(a.rowLength / kWidth / 4);
        for (int32_t row = 0; row < kHeight; ++row) {
            if (isV210 && hasSSE2) {
                for (size_t at = 0; at < out.rowLength; at += 4) {
                    uint32_t one, other;
                    std::memcpy(&one, first.RowFromTop(row) + at, 4);
                    std::memcpy(&other, second.RowFromTop(row) + at, 4);
                    const uint32_t word = ReferenceDissolveV210(one, other, 1 - ratio);
                    std::memcpy(wanted.Pixels() + at, &word, 4);
                }
            } else {
                ConvertRow(first.RowFromTop(row), firstFormat, a.Pixels(), a.format, kWidth, quality);
                ConvertRow(second.RowFromTop(row), secondFormat, b.Pixels(), b.format, kWidth, quality);
                const bool alphaFirst = (expected.working & 0x1000) != 0;
                ReferenceDissolveRow(expected.rule, depth, alphaFirst, a.Pixels(), b.Pixels(), mixed.Pixels(),
                                     kWidth, 1 - ratio);
                ConvertRow(mixed.Pixels(), mixed.format, wanted.Pixels(), format, kWidth, quality);
            }
            ASSERT_EQ("", FirstDifference(format, out.rowLength, wanted.Pixels(), out.RowFromTop(row)))
                << std::hex << "0x" << firstFormat << ", 0x" << secondFormat << " to 0x" << format << " in 0x"
                << expected.working << std::dec << ", row " << row << ", quality " << quality << ", ratio "
                << ratio << ", SSE2 " << hasSSE2 << ", seed " << fRandom.Seed();
        }
    }

    void CheckTriples(uint32_t oneIn) {
        constexpr float kRatios[] = {0.5f, 0.31f, 0.8f};
        constexpr int32_t kQualities[] = {4, 2, 1};
        Walk walk;
        for (const PK_PixelFormat format : PK::kRasterFormats)
            for (const PK_PixelFormat first : PK::kRasterFormats)
                for (const PK_PixelFormat second : PK::kRasterFormats) {
                    if (walk.LeavesOut() || fRandom.Below(oneIn) != 0) continue;
                    ASSERT_NO_FATAL_FAILURE(CheckTriple(first, second, format, kQualities[fRandom.Below(3)],
                                                        kRatios[fRandom.Below(3)]));
                }
    }

    FlagScope fFlags;
    Random fRandom{4402};
};

} // namespace

TEST_F(CrossDissolveFormats, ConvertsAllTriplesOfFormatsToTheirWorkingFormat) {
    CheckTriples(1);
}

TEST_F(CrossDissolveFormats, HasOtherWorkingFormatsWithoutSSE2) {
    const TargetScope scope(PK::Target::plain);
    CheckTriples(4);
}

TEST_F(CrossDissolveFormats, GivesTheSameAtEveryTarget) {
    AtEveryTarget([&] { CheckTriples(60); });
}

// 16500 of 32768 is 128.4 of 255. In bytes that is 128, and its mean with 129 is 128; in floats it is 128.7.
TEST_F(CrossDissolveFormats, KeepsTheDepthOfTheDestinationAtQuality2) {
    const uint16_t words[4] = {16500, 16500, 16500, 32768};
    const uint8_t bytes[4] = {129, 129, 129, 255};
    for (const auto& [quality, expected] : std::initializer_list<std::pair<int32_t, int>>{
             {0, 129}, {1, 129}, {2, 128}, {3, 129}, {4, 129}, {5, 129}}) {
        uint8_t out[4] = {};
        ASSERT_EQ(PK_CrossDissolve(words, 8, PK_PixelFormat_BGRA_4444_15u, bytes, 4, kBGRA, out, 4, kBGRA, 1,
                                   1, 0.5f, quality),
                  PK_Success);
        EXPECT_EQ(out[0], expected) << quality;
    }
}
