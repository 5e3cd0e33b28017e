// The gamut clip of single pixels, and that of the vector bodies beside it.

#include "colour/GamutClip.h"

#include "colour/ColourKernels.h"
#include "colour/FloatBodies.h"
#include "colour/WorstError.h"
#include "support/ColourPixels.h"

#include <algorithm>

namespace {

using namespace PK;
using namespace PKTest;

constexpr float kQuarters[3] = {0.25f, 0.5f, 0.25f};
constexpr float kRec709[3] = {0.2126f, 0.7152f, 0.0722f};

void ExpectNear(RGB actual, RGB expected, float tolerance = 1e-6f) {
    EXPECT_NEAR(actual.r, expected.r, tolerance);
    EXPECT_NEAR(actual.g, expected.g, tolerance);
    EXPECT_NEAR(actual.b, expected.b, tolerance);
}

void ExpectKept(RGB colour) {
    const RGB clipped = GamutClipPixel(colour, kRec709);
    EXPECT_EQ(Pattern(clipped.r), Pattern(colour.r));
    EXPECT_EQ(Pattern(clipped.g), Pattern(colour.g));
    EXPECT_EQ(Pattern(clipped.b), Pattern(colour.b));
}

TEST(GamutClip, WhatIsInTheGamutStays) {
    ExpectKept({0, 0, 0});
    ExpectKept({1, 1, 1});
    ExpectKept({1, 0, 0.3f});
    ExpectKept({0.1f, 0.7f, 0.2f});
    ExpectKept({-0.0f, 0.5f, -0.0f});
}

TEST(GamutClip, NegativeChannelsMoveTowardsLuminance) {
    // Y = 0.25, the factor is 0.25 / 0.75.
    ExpectNear(GamutClipPixel({-0.5f, 0.5f, 0.5f}, kQuarters), {0, 1.0f / 3, 1.0f / 3});
    // Y = -0.125 + 0.4 + 0.05, the factor is 0.325 / 0.825.
    ExpectNear(GamutClipPixel({-0.5f, 0.8f, 0.2f}, kQuarters),
               {0, 0.325f + 0.475f * 0.325f / 0.825f, 0.325f - 0.125f * 0.325f / 0.825f});
    // Of two factors the lesser counts.
    ExpectNear(GamutClipPixel({-0.1f, 0.8f, -0.2f}, kQuarters),
               {0.325f - 0.425f * 0.325f / 0.525f, 0.325f + 0.475f * 0.325f / 0.525f, 0});
}

TEST(GamutClip, ChannelsAboveOneMoveTowardsAGrey) {
    // The grey is (0.25 x 2 + 0.5 x 1) / 2, the factor (1 - 0.5) / (2 - 0.5).
    ExpectNear(GamutClipPixel({2, 1, 0}, kQuarters), {1, 2.0f / 3, 1.0f / 3});
    // Blue weighs too little: the grey is at least 0.15.
    ExpectNear(GamutClipPixel({0, 0, 2}, kRec709),
               {0.15f - 0.15f * 0.85f / 1.85f, 0.15f - 0.15f * 0.85f / 1.85f, 1});
    // Yellow weighs too much: at most 0.9.
    ExpectNear(GamutClipPixel({2, 2, 0}, kRec709), {1, 1, 0.9f - 0.9f * 0.1f / 1.1f});
}

TEST(GamutClip, BothStepsFollowEachOther) {
    // Y = 0.75: the factor 0.75 / 1.25 gives (0, 1.5, 0): out of the gamut still. Its grey is 0.5, the factor 0.5.
    ExpectNear(GamutClipPixel({-0.5f, 2, -0.5f}, kQuarters), {0.25f, 1, 0.25f});
}

TEST(GamutClip, GreysAboveOneBecomeExactlyOne) {
    for (const float grey : {std::nextafter(1.0f, 2.0f), 1.5f, 100.0f, 3e38f, kInfinity}) {
        const RGB clipped = GamutClipPixel({grey, grey, grey}, kRec709);
        EXPECT_EQ(clipped.r, 1.0f);
        EXPECT_EQ(clipped.g, 1.0f);
        EXPECT_EQ(clipped.b, 1.0f);
    }
}

TEST(GamutClip, ANegativeGreyIsNoNumber) { // 0 times infinity: nothing guards it
    EXPECT_TRUE(std::isnan(GamutClipPixel({-1, -1, -1}, kQuarters).g));
}

TEST(GamutClip, NaNPasses) {
    const RGB clipped = GamutClipPixel({kNaN, 0.25f, 0.5f}, kRec709);
    EXPECT_TRUE(std::isnan(clipped.r));
    EXPECT_EQ(clipped.g, 0.25f);
    EXPECT_EQ(clipped.b, 0.5f);
}

constexpr float kUnitMatrix[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};

/// Linear pixels through the clip of one body: both powers are 1.
ColourPixels ClippedBy(Target target, const ColourPixels& pixels, const float* luma) {
    const GammaConversion conversion = {kUnitMatrix, 1, 1, {luma[0], luma[1], luma[2]}, true, true};
    ColourPixels result(pixels.size());
    KernelsFor<GammaKernels>(target).convert(pixels.data()->data(), result.data()->data(),
                                             static_cast<ptrdiff_t>(pixels.size()), conversion);
    return result;
}

/// Colours of positive luminance, well away from black where the clip divides by little.
ColourPixels Colours(Random& random, size_t count) {
    ColourPixels pixels;
    while (pixels.size() < count) {
        const ColourPixel pixel = {Uniform(random, -0.5f, 2.5f), Uniform(random, -0.5f, 2.5f),
                                   Uniform(random, -0.5f, 2.5f), 1};
        const float Y = kRec709[2] * pixel[0] + kRec709[1] * pixel[1] + kRec709[0] * pixel[2];
        const auto [least, most] = std::minmax({pixel[0], pixel[1], pixel[2]});
        if (Y > 0.1f && most - least > 0.05f) pixels.push_back(pixel);
    }
    return pixels;
}

TEST(GamutClip, BringsColoursIntoTheGamut) {
    Random random(9);
    for (const ColourPixel& pixel : Colours(random, 20000)) {
        const RGB clipped = GamutClipPixel({pixel[2], pixel[1], pixel[0]}, kRec709);
        ASSERT_EQ((ColourPixel{clipped.b, clipped.g, clipped.r, 1}), reference::SingleClip(pixel, kRec709))
            << "seed " << random.Seed();
        for (const float channel : {clipped.r, clipped.g, clipped.b}) {
            ASSERT_GE(channel, -2e-6f);
            ASSERT_LE(channel, 1 + 2e-6f);
        }
    }
}

TEST(GamutClipLanes, AreNearTheClipOfSinglePixels) {
    Random random(10);
    const ColourPixels colours = Colours(random, 8000);
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        const ColourPixels clipped = ClippedBy(target, colours, kRec709);
        WorstError worst(std::string("gamut clip in bulk, absolute, ") + TargetName(target));
        for (size_t i = 0; i < colours.size(); ++i) {
            const ColourPixel exact = reference::SingleClip(colours[i], kRec709);
            for (size_t k = 0; k < 3; ++k)
                worst.Take(std::abs(double{clipped[i][k]} - double{exact[k]}), double{exact[k]});
        }
        worst.ExpectBelow(0x1p-10);
    }
}

TEST(GamutClipLanes, GreysAboveOneBecomeExactlyOneInEveryBody) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const float grey : {1.5f, 2.0f, 100.0f, 1e30f, kInfinity})
            for (const ColourPixel& pixel :
                 ClippedBy(target, ColourPixels(8, {grey, grey, grey, 7}), kRec709))
                EXPECT_EQ(pixel, (ColourPixel{1, 1, 1, 7})) << TargetName(target) << " " << grey;
}

TEST(GamutClipLanes, AChannelOfExactlyOneComesOutNearIt) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const ColourPixel& pixel : ClippedBy(target, ColourPixels(8, {0.25f, 0.5f, 1, 7}), kRec709)) {
            EXPECT_NEAR(pixel[0], 0.25f, 0.25f * 0x1p-9f) << TargetName(target);
            EXPECT_NEAR(pixel[1], 0.5f, 0.5f * 0x1p-9f);
            EXPECT_NEAR(pixel[2], 1.0f, 0x1p-9f);
        }
}

} // namespace
