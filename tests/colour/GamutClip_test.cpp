// The gamut clip of single pixels, and that of the vector bodies beside it.

#include "colour/GamutClip.h"

#include "colour/ColourKernels.h"
#include "colour/Pixels.h"

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

/// The clip in double precision.
std::array<double, 3> ClipSlowly(std::array<double, 3> c, const float* weights) {
    const double l[3] = {static_cast<double>(weights[0]), static_cast<double>(weights[1]),
                         static_cast<double>(weights[2])};
    if (std::ranges::min(c) < 0) {
        const double Y = l[0] * c[0] + l[1] * c[1] + l[2] * c[2];
        double scale = 1;
        for (const double v : c)
            if (v < 0) scale = std::min(scale, Y / (Y - v));
        for (double& v : c) v = (v - Y) * scale + Y;
    }
    if (std::ranges::max(c) > 1) {
        const double least = std::ranges::min(c), most = std::ranges::max(c);
        double grey = 0;
        for (size_t i = 0; i < 3; ++i) grey += l[i] * (c[i] - least);
        grey = std::clamp(grey / (most - least), 0.15, 0.9);
        for (double& v : c) v = (v - grey) * ((1 - grey) / (most - grey)) + grey;
    }
    return c;
}

constexpr float kUnitMatrix[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};

/// Linear pixels through the clip of one body: both powers are 1.
Pixels ClippedBy(Target target, const Pixels& pixels, const float* luma) {
    const GammaConversion conversion = {kUnitMatrix, 1, 1, {luma[0], luma[1], luma[2]}, true, true};
    Pixels result(pixels.size());
    KernelsFor<GammaKernels>(target).convert(pixels.data()->data(), result.data()->data(),
                                             static_cast<ptrdiff_t>(pixels.size()), conversion);
    return result;
}

/// Colours of positive luminance, well away from black where the clip divides by little.
Pixels Colours(Random& random, size_t count) {
    Pixels pixels;
    while (pixels.size() < count) {
        const Pixel pixel = {Uniform(random, -0.5f, 2.5f), Uniform(random, -0.5f, 2.5f),
                             Uniform(random, -0.5f, 2.5f), 1};
        const float Y = kRec709[2] * pixel[0] + kRec709[1] * pixel[1] + kRec709[0] * pixel[2];
        const auto [least, most] = std::minmax({pixel[0], pixel[1], pixel[2]});
        if (Y > 0.1f && most - least > 0.05f) pixels.push_back(pixel);
    }
    return pixels;
}

TEST(GamutClip, AgreesWithDoublePrecision) {
    Random random(9);
    for (const Pixel& pixel : Colours(random, 20000)) {
        const auto [b, g, r, a] = pixel;
        const RGB clipped = GamutClipPixel({r, g, b}, kRec709);
        const auto exact =
            ClipSlowly({static_cast<double>(r), static_cast<double>(g), static_cast<double>(b)}, kRec709);
        const float channels[3] = {clipped.r, clipped.g, clipped.b};
        for (size_t i = 0; i < 3; ++i) {
            ASSERT_NEAR(static_cast<double>(channels[i]), exact[i], 4e-6) << "seed " << random.Seed();
            ASSERT_GE(channels[i], -2e-6f);
            ASSERT_LE(channels[i], 1 + 2e-6f);
        }
    }
}

TEST(GamutClipLanes, AgreeWithDoublePrecision) {
    Random random(10);
    const Pixels colours = Colours(random, 8000);
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        const Pixels clipped = ClippedBy(target, colours, kRec709);
        double worst = 0;
        for (size_t i = 0; i < colours.size(); ++i) {
            const auto exact =
                ClipSlowly({static_cast<double>(colours[i][2]), static_cast<double>(colours[i][1]),
                            static_cast<double>(colours[i][0])},
                           kRec709);
            for (size_t k = 0; k < 3; ++k)
                worst = std::max(worst, std::abs(static_cast<double>(clipped[i][2 - k]) - exact[k]));
        }
        EXPECT_LT(worst, 0x1p-10) << TargetName(target);
        RecordProperty(TargetName(target), std::to_string(worst));
    }
}

TEST(GamutClipLanes, GreysAboveOneBecomeExactlyOneInEveryBody) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const float grey : {1.5f, 2.0f, 100.0f, 1e30f, kInfinity})
            for (const Pixel& pixel : ClippedBy(target, Pixels(8, {grey, grey, grey, 7}), kRec709))
                EXPECT_EQ(pixel, (Pixel{1, 1, 1, 7})) << TargetName(target) << " " << grey;
}

TEST(GamutClipLanes, AChannelOfExactlyOneComesOutNearIt) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const Pixel& pixel : ClippedBy(target, Pixels(8, {0.25f, 0.5f, 1, 7}), kRec709)) {
            EXPECT_NEAR(pixel[0], 0.25f, 0.25f * 0x1p-9f) << TargetName(target);
            EXPECT_NEAR(pixel[1], 0.5f, 0.5f * 0x1p-9f);
            EXPECT_NEAR(pixel[2], 1.0f, 0x1p-9f);
        }
}

TEST(GamutClipLanes, NeighboursDoNotChangeAPixel) {
    Random random(11);
    const Pixels mixed = UniformPixels(random, 64, -0.5f, 2);
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        const Pixels together = ClippedBy(target, mixed, kRec709);
        for (size_t i = 0; i < mixed.size(); ++i) {
            const Pixels alone = ClippedBy(target, Pixels(8, mixed[i]), kRec709);
            for (const Pixel& pixel : alone)
                ASSERT_EQ(std::memcmp(pixel.data(), together[i].data(), sizeof pixel), 0)
                    << TargetName(target) << ", pixel " << i << ", seed " << random.Seed();
        }
    }
}

} // namespace
