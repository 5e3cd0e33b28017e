// sRGB: the curve, and the conversions to and from the hub, which go pixel by pixel.

#include <PixelKiln/ColorSpace.h>

#include "support/ColourPixels.h"

#include <cmath>

namespace {

using namespace PKTest;
using namespace PK;

const SRGBColorSpace sSpace;

auto From(bool gamutClip) {
    return [gamutClip](const float* source, float* destination, int32_t count) {
        sSpace.ConvertPixelsFromRec709(source, destination, count, gamutClip);
    };
}

auto To(bool gamutClip) {
    return [gamutClip](const float* source, float* destination, int32_t count) {
        sSpace.ConvertPixelsToRec709(source, destination, count, gamutClip);
    };
}

double Encoded(double linear) {
    return linear > 0.0031308 ? 1.055 * std::pow(linear, 1 / 2.4) - 0.055 : 12.92 * linear;
}

double Decoded(double encoded) {
    return encoded > 0.04045 ? std::pow((encoded + 0.055) / 1.055, 2.4) : encoded / 12.92;
}

TEST(SRGBColorSpace, EncodesAndDecodesSingleValues) {
    EXPECT_EQ(sSpace.LinearToEOTF(0), 0.0f);
    EXPECT_NEAR(sSpace.LinearToEOTF(1), 1.0f, 1e-7f);
    EXPECT_NEAR(sSpace.LinearToEOTF(0.5f), 0.735357f, 1e-6f);
    EXPECT_NEAR(sSpace.LinearToEOTF(0.18f), 0.461356f, 1e-6f);
    EXPECT_NEAR(sSpace.EOTFToLinear(1), 1.0f, 1e-7f);
    EXPECT_NEAR(sSpace.EOTFToLinear(0.5f), 0.214041f, 1e-6f);
    EXPECT_EQ(sSpace.LinearToEOTF(kInfinity), kInfinity);
    EXPECT_EQ(sSpace.EOTFToLinear(kInfinity), kInfinity);
    EXPECT_TRUE(std::isnan(sSpace.LinearToEOTF(kNaN)));
    EXPECT_TRUE(std::isnan(sSpace.EOTFToLinear(kNaN)));
}

TEST(SRGBColorSpace, NegativeValuesAreLinearHoweverLarge) {
    EXPECT_EQ(sSpace.LinearToEOTF(-1), -12.92f);
    EXPECT_EQ(sSpace.LinearToEOTF(-100), -1292.0f);
    EXPECT_EQ(sSpace.EOTFToLinear(-1), -(1 / 12.92f));
    EXPECT_EQ(sSpace.EOTFToLinear(-12.92f), -1.0f);
    EXPECT_EQ(sSpace.LinearToEOTF(-kInfinity), -kInfinity);
    EXPECT_EQ(sSpace.EOTFToLinear(-kInfinity), -kInfinity);
}

TEST(SRGBColorSpace, TheThresholdItselfIsLinear) {
    EXPECT_EQ(sSpace.LinearToEOTF(0.0031308f), 0.0031308f * 12.92f);
    EXPECT_EQ(sSpace.EOTFToLinear(0.04045f), 0.04045f / 12.92f);
    const float above = std::nextafter(0.0031308f, 1.0f);
    EXPECT_EQ(sSpace.LinearToEOTF(above), std::pow(above, 0.41666666f) * 1.055f - 0.055f);
    const float aboveEncoded = std::nextafter(0.04045f, 1.0f);
    EXPECT_EQ(sSpace.EOTFToLinear(aboveEncoded), std::pow((0.055f + aboveEncoded) / 1.055f, 2.4f));
}

TEST(SRGBColorSpace, ZeroOfEitherSignIsPositiveZero) {
    for (const float zero : {0.0f, -0.0f}) {
        EXPECT_EQ(Pattern(sSpace.LinearToEOTF(zero)), 0u);
        EXPECT_EQ(Pattern(sSpace.EOTFToLinear(zero)), 0u);
    }
}

TEST(SRGBColorSpace, TheCurveAgreesWithDoublePrecision) {
    for (int i = 0; i <= 20000; ++i) {
        const float v = static_cast<float>(i) * 0.001f;
        const double exact = Encoded(static_cast<double>(v)), linear = Decoded(static_cast<double>(v));
        ASSERT_NEAR(static_cast<double>(sSpace.LinearToEOTF(v)), exact, 1e-6 * exact + 1e-9) << v;
        ASSERT_NEAR(static_cast<double>(sSpace.EOTFToLinear(v)), linear, 1e-6 * linear + 1e-9) << v;
    }
}

TEST(SRGBColorSpace, PixelsByHand) {
    // 0.5 of the hub is 0.5^2.4 = 0.1894646 in linear light; encoded 0.4723.
    const ColourPixels from = Converted({{0.5f, -0.5f, 1, 0.25f}, {0, -0.0f, 0.01f, -3}}, From(false));
    EXPECT_NEAR(from[0][0], Encoded(0.18946457), 1e-6);
    EXPECT_EQ(from[0][1], -from[0][0]);
    EXPECT_NEAR(from[0][2], 1.0f, 1e-7f);
    EXPECT_EQ(from[0][3], 0.25f);
    EXPECT_EQ(from[1][0], 0.0f);
    EXPECT_EQ(from[1][1], 0.0f);
    EXPECT_NEAR(from[1][2], 12.92 * std::pow(0.01, 2.4), 1e-9);
    EXPECT_EQ(from[1][3], -3.0f);

    const ColourPixels to = Converted({{0.5f, -0.5f, 1, 0.25f}, {0, 0.04045f, 0.02f, -3}}, To(false));
    EXPECT_NEAR(to[0][0], std::pow(Decoded(0.5), 1 / 2.4), 1e-6);
    EXPECT_EQ(to[0][1], -to[0][0]);
    EXPECT_NEAR(to[0][2], 1.0f, 2e-7f);
    EXPECT_EQ(to[1][0], 0.0f);
    EXPECT_EQ(to[1][1], std::pow(0.04045f * 0.07739938f, 0.41666666f)) << "the threshold itself is linear";
    EXPECT_NEAR(to[1][2], std::pow(0.02 / 12.92, 1 / 2.4), 1e-6);
}

TEST(SRGBColorSpace, NegativePixelsKeepTheirCurve) { // unlike single values
    const ColourPixels from = Converted({{-1, -1, -1, 1}}, From(false));
    EXPECT_NEAR(from[0][0], -1.0f, 1e-7f);
}

TEST(SRGBColorSpace, GamutIsClippedOnEncodedValues) {
    const ColourPixels source = {{-0.2f, 0.5f, 1.3f, 0.5f}};
    const auto expect = [&](const ColourPixels& plain, const ColourPixels& clipped) {
        EXPECT_EQ(clipped[0], reference::SingleClip(plain[0], reference::kLuma709));
        EXPECT_NEAR(clipped[0][0], 0.0f, 0.2f);
        EXPECT_LE(clipped[0][2], 1.000001f);
        EXPECT_NE(plain, clipped);
    };
    expect(Converted(source, From(false)), Converted(source, From(true)));
    expect(Converted(source, To(false)), Converted(source, To(true)));
    const ColourPixels grey = Converted({{2, 2, 2, 1}}, To(true));
    EXPECT_EQ(grey[0], (ColourPixel{1, 1, 1, 1}));
}

TEST(SRGBColorSpace, ThereAndBackIsTheSame) {
    Random random(14);
    const ColourPixels pixels = UniformPixels(random, 500, -1, 4);
    const ColourPixels back = Converted(Converted(pixels, From(false)), To(false));
    for (size_t i = 0; i < pixels.size(); ++i)
        for (size_t k = 0; k < 4; ++k)
            EXPECT_NEAR(back[i][k], pixels[i][k], 3e-4f * std::abs(pixels[i][k]) + 1e-6f);
}

} // namespace
