// PQ against SMPTE ST 2084, and what its pixel conversions do at the borders of the signal.

#include "colour/Conversions.h"
#include "colour/DecodeTables.h"
#include "colour/ExactColour.h"
#include "colour/WorstError.h"

#include <cmath>
#include <limits>

namespace PKTest {
namespace {

using namespace PK;

constexpr float kSignalOf100 = 0.50807786f;
constexpr float kPrimaries709[6] = {0.64f, 0.33f, 0.30f, 0.60f, 0.15f, 0.06f};
/// Red, the channel of the tests on greys.
constexpr size_t kRed = 2;

float HubValue(double linear) {
    return static_cast<float>(std::pow(linear, 1 / 2.4));
}
double HubLinear(float value) {
    return std::copysign(std::pow(std::abs(double{value}), 2.4), double{value});
}

TEST(PQ, PrimariesWhiteAndLuminance) {
    const ColorSpace& rec2020 = ColorSpace::WorkingSpace(kWorkingSpaceRec2020);
    const ColorSpace& p3 = ColorSpace::WorkingSpace(kWorkingSpaceDCIP3D65);
    for (const bool normalised : {false, true}) {
        const PQColorSpace wide(false, normalised), narrow(true, normalised), own(kPrimaries709, normalised);
        for (int i = 0; i < 6; ++i) {
            EXPECT_EQ(wide.Primaries()[i], rec2020.Primaries()[i]);
            EXPECT_EQ(narrow.Primaries()[i], p3.Primaries()[i]);
            EXPECT_EQ(own.Primaries()[i], kPrimaries709[i]);
        }
        for (int i = 0; i < 3; ++i) {
            EXPECT_EQ(wide.LuminanceCoeffs()[i],
                      rec2020.LuminanceCoeffs()[i]); // as published, not calculated
            EXPECT_EQ(narrow.LuminanceCoeffs()[i], p3.LuminanceCoeffs()[i]);
            EXPECT_EQ(own.LuminanceCoeffs()[i], own.RGBtoXYZ().m[3 + i]);
        }
        for (const PQColorSpace* space : {&wide, &narrow, &own})
            EXPECT_EQ(space->WhitePoint(), ColorSpace::Illuminant(kIlluminantD65));
    }
}

TEST(PQ, TransferFunctionsFollowTheStandard) {
    const PQColorSpace space(false, false);
    WorstError signals("PQ signal of a linear value, absolute"),
        values("PQ linear value of a signal, relative");
    for (int code = 1; code < 4096; ++code) {
        const double signal = code / 4095.0, linear = exact::PQLuminance(signal) / 100;
        signals.Take(std::abs(double{space.LinearToEOTF(static_cast<float>(linear))} - signal), signal);
        const auto given = static_cast<float>(signal);
        const double expected = exact::PQLuminance(double{given}) / 100;
        values.Take(std::abs(double{space.EOTFToLinear(given)} - expected) / expected, signal);
    }
    signals.ExpectBelow(2e-5);
    values.ExpectBelow(6e-5); // the denominator of the formula cancels towards 1
}

TEST(PQ, KnownPoints) {
    const PQColorSpace space(false, false);
    EXPECT_NEAR(space.LinearToEOTF(1), 0.5081, 1e-4); // 100 cd/m2
    EXPECT_NEAR(space.LinearToEOTF(100), 1, 2e-5);    // 10000 cd/m2
    EXPECT_NEAR(space.EOTFToLinear(1), 100, 5e-3);
    EXPECT_NEAR(space.LinearToEOTF(0), 7.3e-7, 1e-8); // black is not 0
}

TEST(PQ, NegativeLightAndSignalsBelowBlackAreNotNumbers) {
    for (const bool normalised : {false, true}) {
        const PQColorSpace space(false, normalised);
        EXPECT_TRUE(std::isnan(space.LinearToEOTF(-0.5f)));
        EXPECT_TRUE(std::isnan(space.EOTFToLinear(-0.5f)));
        EXPECT_TRUE(std::isnan(space.EOTFToLinear(0)));
        EXPECT_TRUE(std::isnan(space.EOTFToLinear(5e-7f)));
    }
}

TEST(PQ, NormalisedSignalsAreOneAtAHundred) {
    const PQColorSpace space(false, true), full(false, false);
    EXPECT_NEAR(space.EOTFToLinear(1), 1, 1e-5);
    EXPECT_NEAR(space.LinearToEOTF(1), 1, 1e-5);
    for (const float linear : {0.001f, 0.1f, 1.0f, 10.0f, 100.0f}) {
        EXPECT_EQ(space.LinearToEOTF(linear), full.LinearToEOTF(linear) / kSignalOf100);
        EXPECT_EQ(space.EOTFToLinear(linear / 100), full.EOTFToLinear(linear / 100 * kSignalOf100));
    }
    EXPECT_NEAR(ConvertAlone(space, Way::kToHub, Grey(1))[kRed], 1, 1e-5);
    EXPECT_NEAR(ConvertAlone(space, Way::kFromHub, Grey(1))[kRed], 1, 2e-5);
    EXPECT_NEAR(ConvertInBulk(space, Way::kFromHub, Grey(1))[kRed], 1, 1e-3);
}

TEST(PQ, CopiesAreNormalisedLikeTheirOriginal) {
    const PQColorSpace normalised(true, true);
    PQColorSpace copy(normalised), assigned(false, false);
    assigned = copy;
    const PQColorSpace moved(std::move(copy));
    const ColourPixel pixel = {0.1f, 0.4f, 0.7f, 0.5f};
    for (const Way way : {Way::kFromHub, Way::kToHub}) {
        const ColourPixel expected = ConvertAlone(normalised, way, pixel);
        EXPECT_EQ(ConvertAlone(assigned, way, pixel), expected);
        EXPECT_EQ(ConvertAlone(moved, way, pixel), expected);
    }
    EXPECT_EQ(assigned.LinearToEOTF(1), normalised.LinearToEOTF(1));
}

TEST(PQ, FullSignalIsTenThousandCandelas) {
    const PQColorSpace space(false, false);
    EXPECT_NEAR(ConvertAlone(space, Way::kToHub, Grey(1))[kRed], 6.8129, 1e-3); // 100^(1 / 2.4)
    EXPECT_NEAR(ConvertInBulk(space, Way::kToHub, Grey(1))[kRed], 6.8129, 6e-3);
    for (const float above : {1.5f, 3e38f, std::numeric_limits<float>::infinity()}) {
        EXPECT_EQ(ConvertAlone(space, Way::kToHub, Grey(above)), ConvertAlone(space, Way::kToHub, Grey(1)));
        EXPECT_EQ(ConvertInBulk(space, Way::kToHub, Grey(above)), ConvertInBulk(space, Way::kToHub, Grey(1)));
    }
}

TEST(PQ, BlackKeepsTheSignalOfBlack) {
    for (const bool normalised : {false, true}) {
        const PQColorSpace space(false, normalised);
        const double black = 7.3096e-7 / (normalised ? double{kSignalOf100} : 1); // c1^m2
        for (const ColourPixel& signal :
             {ConvertAlone(space, Way::kFromHub, Grey(0)), ConvertInBulk(space, Way::kFromHub, Grey(0))})
            for (size_t i = 0; i < 3; ++i) EXPECT_NEAR(static_cast<double>(signal[i]) / black, 1, 1e-4);
    }
}

TEST(PQ, NegativeLightKeepsItsSign) {
    const PQColorSpace space(kPrimaries709, false);
    const ColourPixel light = {0.5f, 0.5f, 0.5f, 0.25f}, dark = {-0.5f, -0.5f, -0.5f, 0.25f};
    const auto negated = [](ColourPixel pixel) {
        for (size_t i = 0; i < 3; ++i) pixel[i] = -pixel[i];
        return pixel;
    };
    EXPECT_EQ(ConvertAlone(space, Way::kFromHub, dark), negated(ConvertAlone(space, Way::kFromHub, light)));
    EXPECT_EQ(ConvertInBulk(space, Way::kFromHub, dark), negated(ConvertInBulk(space, Way::kFromHub, light)));
}

TEST(PQ, NegativeSignalsAreBlackByTheTableAndMirroredByTheFormula) {
    const PQColorSpace byTable(false, false), byFormula(false, true);
    for (const float signal : {-1e-9f, -0.3f, -1.0f, -3e38f}) {
        EXPECT_EQ(ConvertAlone(byTable, Way::kToHub, Grey(signal)), Grey(0)) << signal;
        EXPECT_EQ(ConvertInBulk(byTable, Way::kToHub, Grey(signal)), Grey(0)) << signal;
    }
    for (const float signal : {0.3f, 1.0f, 1.9f}) {
        const ColourPixel positive = ConvertAlone(byFormula, Way::kToHub, Grey(signal));
        const ColourPixel negative = ConvertAlone(byFormula, Way::kToHub, Grey(-signal));
        EXPECT_GT(positive[kRed], 0);
        for (size_t i = 0; i < 3; ++i) EXPECT_EQ(negative[i], -positive[i]) << signal;
    }
}

TEST(PQ, WhatIsNoNumberReadsTheFirstEntry) {
    const PQColorSpace space(false, false);
    for (const float signal :
         {kNaN, -kNaN, std::bit_cast<float>(0x7f800001u), std::bit_cast<float>(0xffa00000u)}) {
        EXPECT_EQ(ConvertAlone(space, Way::kToHub, Grey(signal)), Grey(0));
        EXPECT_EQ(ConvertInBulk(space, Way::kToHub, Grey(signal)), Grey(0));
    }
}

TEST(PQ, TheClipLeavesTheTable) {
    const PQColorSpace space(kPrimaries709, false);
    const float between = 1000.5f / 4095;
    const float entry = HubValue(double{PQDecodeTable()[1000]});
    const float formula = HubValue(exact::PQLuminance(double{between}) / 100);
    ASSERT_GT(formula, entry * 1.0005f);
    EXPECT_NEAR(ConvertAlone(space, Way::kToHub, Grey(between))[kRed], entry, 1e-5 * double{entry});
    EXPECT_NEAR(ConvertAlone(space, Way::kToHub, Grey(between), true)[kRed], formula, 1e-5 * double{formula});
    EXPECT_NEAR(ConvertInBulk(space, Way::kToHub, Grey(between), true)[kRed], formula,
                1e-5 * double{formula});
}

TEST(PQ, TheClipEndsAtTheHubsGamut) {
    const float* luma = ColorSpace::WorkingSpace(kWorkingSpaceRec709).LuminanceCoeffs();
    int clippedPixels = 0;
    for (const bool normalised : {false, true}) {
        const PQColorSpace space(false, normalised);
        Random random(1);
        for (const ColourPixel& pixel : MakePixels(Content::kOrdinary, 2000, random)) {
            // The weighted sum of encoded values must be well above 0: there is no way up from a negative one.
            const ColourPixel encoded = ConvertAlone(PQColorSpace(false, normalised), Way::kToHub, pixel);
            if (luma[0] * encoded[2] + luma[1] * encoded[1] + luma[2] * encoded[0] < 0.1f) continue;
            const ColourPixel clipped = ConvertAlone(space, Way::kToHub, pixel, true);
            for (size_t i = 0; i < 3; ++i) {
                ASSERT_GE(clipped[i], -2e-6f) << "seed " << random.Seed();
                ASSERT_LE(clipped[i], 1 + 2e-6f) << "seed " << random.Seed();
            }
            clippedPixels += clipped != encoded;
        }
    }
    EXPECT_GT(clippedPixels, 1000);
}

TEST(PQ, NormalisedSignalsNeverReadTheTable) {
    const auto& space = ColorSpace::WorkingSpace(kWorkingSpacePQRec2020);
    // Below the first step of the table: 0 there.
    const float faint = 0.5f / 4095;
    const double linear = exact::PQLuminance(double{faint * kSignalOf100}) / 100;
    for (const ColourPixel& pixel :
         {ConvertAlone(space, Way::kToHub, Grey(faint)), ConvertInBulk(space, Way::kToHub, Grey(faint))})
        EXPECT_NEAR(HubLinear(pixel[kRed]) / linear, 1, 1e-4);
    EXPECT_EQ(ConvertAlone(PQColorSpace(false, false), Way::kToHub, Grey(faint)), Grey(0));
}

TEST(PQ, ThereAndBack) {
    const PQColorSpace space(true, true);
    Random random(2);
    const ColourPixels source = MakePixels(Content::kHighlights, 400, random);
    const ColourPixels back = Convert(space, Way::kToHub, Convert(space, Way::kFromHub, source));
    for (size_t i = 0; i < source.size(); ++i) {
        const double largest = std::max({source[i][0], source[i][1], source[i][2]});
        for (size_t c = 0; c < 3; ++c)
            ASSERT_NEAR(HubLinear(back[i][c]), HubLinear(source[i][c]), 0.01 * std::pow(largest, 2.4))
                << "seed " << random.Seed();
        ASSERT_EQ(std::bit_cast<uint32_t>(back[i][3]), std::bit_cast<uint32_t>(source[i][3]));
    }
}

TEST(PQ, AllTenBitCodesComeOutWithinOne) {
    const PQColorSpace space(false, false);
    ColourPixels source;
    for (int code = 0; code < 1024; ++code)
        source.push_back(Grey(HubValue(exact::PQLuminance(code / 1023.0) / 100)));
    const ColourPixels signals = Convert(space, Way::kFromHub, source);
    WorstError worst("10-bit PQ code from the bulk, in codes, before rounding");
    int off = 0;
    for (int code = 0; code < 1024; ++code)
        for (size_t i = 0; i < 3; ++i) {
            const double value = static_cast<double>(signals[static_cast<size_t>(code)][i]) * 1023;
            EXPECT_LE(std::abs(std::lround(value) - code), 1) << code;
            off += std::lround(value) != code;
            worst.Take(std::abs(value - code), code);
        }
    worst.ExpectBelow(1);
    RecordProperty("Codes off by one, of 3072", off);
}

} // namespace
} // namespace PKTest
