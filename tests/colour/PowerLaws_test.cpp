// The spaces that are power laws with a matrix: GammaColorSpace, Rec. 709, Rec. 2020 and P3, by hand and value by value.

#include <PixelKiln/ColorSpace.h>

#include "support/ColourPixels.h"
#include "support/FloatEnvironment.h"

#include <algorithm>
#include <cmath>
#include <functional>

namespace {

using namespace PKTest;
using namespace PK;

constexpr float kPerTwoPointFour = 0.41666666f;

using Convert = std::function<void(const float*, float*, int32_t)>;

Convert From(const ColorSpace& space, bool gamutClip) {
    return [&space, gamutClip](const float* source, float* destination, int32_t count) {
        space.ConvertPixelsFromRec709(source, destination, count, gamutClip);
    };
}

Convert To(const ColorSpace& space, bool gamutClip) {
    return [&space, gamutClip](const float* source, float* destination, int32_t count) {
        space.ConvertPixelsToRec709(source, destination, count, gamutClip);
    };
}

TEST(PowerLaws, EncodeAndDecodeSingleValues) {
    const GammaColorSpace root(0.5f);
    EXPECT_EQ(root.LinearToEOTF(0.25f), 0.5f);
    EXPECT_EQ(root.EOTFToLinear(0.5f), 0.25f);
    EXPECT_EQ(root.LinearToEOTF(-0.25f), -0.5f);
    EXPECT_EQ(root.EOTFToLinear(-0.5f), -0.25f);
    EXPECT_NEAR(GammaColorSpace().LinearToEOTF(0.5f), 0.7320428, 1e-6);  // 0.5^0.45
    EXPECT_NEAR(Rec709ColorSpace().LinearToEOTF(0.5f), 0.7491535, 1e-6); // 0.5^(1 / 2.4)
    EXPECT_NEAR(Rec709ColorSpace().EOTFToLinear(0.5f), 0.1894646, 1e-6); // 0.5^2.4
    EXPECT_NEAR(Rec2020ColorSpace().EOTFToLinear(0.5f), 0.1894646, 1e-6);
    EXPECT_NEAR(DCIP3ColorSpace().EOTFToLinear(0.5f), 0.1649385, 1e-6); // 0.5^2.6
    EXPECT_NEAR(DCIP3ColorSpace().LinearToEOTF(0.5f), 0.7659832, 1e-6); // 0.5^(1 / 2.6)
}

TEST(PowerLaws, EdgesOfSingleValues) {
    const Rec709ColorSpace space;
    for (const auto curve : {&ColorSpace::LinearToEOTF, &ColorSpace::EOTFToLinear}) {
        EXPECT_EQ((space.*curve)(0), 0.0f);
        EXPECT_EQ((space.*curve)(1), 1.0f);
        EXPECT_EQ((space.*curve)(-1), -1.0f);
        EXPECT_EQ((space.*curve)(kInfinity), kInfinity);
        EXPECT_EQ((space.*curve)(-kInfinity), -kInfinity);
        EXPECT_TRUE(std::isnan((space.*curve)(kNaN)));
    }
    // A negative zero counts as not negative.
    EXPECT_EQ(Pattern(space.LinearToEOTF(-0.0f)), 0u);
    EXPECT_EQ(Pattern(GammaColorSpace(1).LinearToEOTF(-0.0f)), 0x80000000u) << "the power 1 of it is itself";
    EXPECT_EQ(GammaColorSpace(-1).LinearToEOTF(-0.0f), -kInfinity);
    {
        const FloatEnvironment environment(kDenormalsAreZero);
        EXPECT_EQ(space.LinearToEOTF(-0x1p-140f), 0.0f) << "a zero, not a negative number";
    }
    EXPECT_EQ(GammaColorSpace(0).EOTFToLinear(0.5f), 0.0f) << "0.5 to the infinite power";
}

TEST(PowerLaws, SingleValuesAgreeWithDoublePrecision) {
    const GammaColorSpace camera;
    const Rec709ColorSpace hub;
    const DCIP3ColorSpace p3;
    Random random(15);
    for (int i = 0; i < 20000; ++i) {
        const float v = Uniform(random, -4, 12);
        const auto expect = [v](float actual, double exponent) {
            const double a = static_cast<double>(std::abs(v));
            const double exact = std::copysign(std::pow(a, exponent), static_cast<double>(v));
            ASSERT_NEAR(static_cast<double>(actual), exact, 1e-6 * std::abs(exact)) << v << "^" << exponent;
        };
        expect(camera.LinearToEOTF(v), 0.45);
        expect(camera.EOTFToLinear(v), 1 / 0.45);
        expect(hub.LinearToEOTF(v), 1 / 2.4);
        expect(hub.EOTFToLinear(v), 2.4);
        expect(p3.LinearToEOTF(v), 1 / 2.6);
        expect(p3.EOTFToLinear(v), 2.6);
    }
}

TEST(Rec709ColorSpace, IsTheHubItself) {
    const Rec709ColorSpace hub;
    Random random(16);
    const ColourPixels pixels = MakePixels(Content::kMixed, 19, random);
    for (const bool clip : {false, true}) {
        EXPECT_TRUE(AreSameBits(Converted(pixels, From(hub, clip)), pixels));
        EXPECT_TRUE(AreSameBits(Converted(pixels, To(hub, clip)), pixels));
        for (const int32_t count : kNoCounts) {
            hub.ConvertPixelsFromRec709(pixels.data()->data(), nullptr, count, clip);
            hub.ConvertPixelsToRec709(pixels.data()->data(), nullptr, count, clip);
        }
    }
}

TEST(Rec709ColorSpace, DoesNotTouchMemoryInPlace) {
    GuardedRows memory(16, Guard::kAfter);
    const auto* page = reinterpret_cast<const float*>(memory.Bytes() + 16); // the inaccessible one
    const Rec709ColorSpace hub;
    hub.ConvertPixelsFromRec709(page, const_cast<float*>(page), 100, false);
    hub.ConvertPixelsToRec709(page, const_cast<float*>(page), 100, true);
}

TEST(PowerLaws, PixelsByHand) {
    const Rec2020ColorSpace rec2020;
    // White stays white but for the last digits of the matrix, 1.0000001, 1.0 and 0.9999998; the primary red becomes the
    // first column.
    const ColourPixels from = Converted({{1, 1, 1, 0.5f}, {0, 0, 1, 2}, {0, 0, -1, 2}}, From(rec2020, false));
    for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(from[0][k], 1.0f, 1e-6f);
    EXPECT_EQ(from[0][3], 0.5f);
    for (size_t k = 0; k < 3; ++k) {
        EXPECT_NEAR(from[1][2 - k], std::pow(reference::kTo2020[3 * k], kPerTwoPointFour), 1e-6f);
        EXPECT_EQ(from[2][k], -from[1][k]) << "signs are carried around the powers";
    }
    // Red of Rec. 2020 is outside: green and blue become negative.
    const ColourPixels to = Converted({{0, 0, 1, 2}}, To(rec2020, false));
    EXPECT_NEAR(to[0][2], std::pow(1.6605, 1 / 2.4), 1e-6);
    EXPECT_NEAR(to[0][1], -std::pow(0.124547, 1 / 2.4), 1e-6);
    EXPECT_NEAR(to[0][0], -std::pow(0.0181537, 1 / 2.4), 1e-6);

    const ColourPixels gamma = Converted({{0.5f, -0.5f, 0, 2}}, From(GammaColorSpace(0.5f), false));
    EXPECT_NEAR(gamma[0][0], std::pow(0.5, 1.2), 1e-6);
    EXPECT_EQ(gamma[0][1], -gamma[0][0]);
    EXPECT_EQ(gamma[0][2], 0.0f);
}

TEST(PowerLaws, ClippedPixelsByHand) {
    // The clip is in linear light and takes the weights of the destination.
    const Rec2020ColorSpace rec2020;
    const ColourPixels to = Converted({{0, 0, 1, 2}}, To(rec2020, true));
    const ColourPixel linear =
        reference::SingleClip({-0.0181537f, -0.124547f, 1.6605f, 2}, reference::kLuma709);
    EXPECT_NEAR(to[0][2], 1.0f, 1e-6f);
    EXPECT_NEAR(to[0][1], std::pow(std::max(0.0f, linear[1]), kPerTwoPointFour), 1e-3f);
    EXPECT_NEAR(to[0][0], std::pow(linear[0], kPerTwoPointFour), 1e-5f);
    EXPECT_GT(to[0][0], 0.1f);
}

TEST(PowerLaws, ZeroIsZeroAndSignsStay) {
    const GammaColorSpace camera;
    const ColourPixels eight(8, {0.0f, -0.5f, 0.5f, 1});
    for (const Convert& convert : {From(camera, false), To(camera, false)})
        for (const ColourPixels& pixels : {eight, ColourPixels(eight.begin(), eight.begin() + 7)})
            for (const ColourPixel& pixel : Converted(pixels, convert)) {
                EXPECT_EQ(pixel[0], 0.0f);
                EXPECT_EQ(pixel[1], -pixel[2]);
                EXPECT_LT(pixel[1], 0.0f);
            }
    const Rec2020ColorSpace rec2020;
    for (const size_t count : {size_t{7}, size_t{8}})
        for (const bool clip : {false, true})
            for (const ColourPixel& pixel : Converted(ColourPixels(count, {0, 0, 0, 1}), From(rec2020, clip)))
                for (size_t k = 0; k < 3; ++k) EXPECT_EQ(pixel[k], 0.0f);
}

TEST(PowerLaws, GreysAboveOneAreClippedToOne) {
    const DCIP3ColorSpace p3(kIlluminantD60);
    const Rec2020ColorSpace rec2020;
    for (const ColorSpace* space :
         {static_cast<const ColorSpace*>(&p3), static_cast<const ColorSpace*>(&rec2020)})
        for (const size_t count : {size_t{1}, size_t{8}})
            for (const ColourPixel& pixel :
                 Converted(ColourPixels(count, {1.5f, 1.5f, 1.5f, 1}), From(*space, true)))
                for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(pixel[k], 1.0f, 0.004f);
}

TEST(PowerLaws, ClippedGroupsAreInTheGamut) {
    const Rec2020ColorSpace rec2020;
    const DCIP3ColorSpace p3;
    Random random(23);
    for (const ColorSpace* space :
         {static_cast<const ColorSpace*>(&rec2020), static_cast<const ColorSpace*>(&p3)})
        for (const ColourPixel& pixel : Converted(UniformPixels(random, 4000, 0.05f, 1.3f), To(*space, true)))
            for (size_t k = 0; k < 3; ++k) {
                // In linear light 0.002; the power lifts what is next to black.
                ASSERT_GE(std::copysign(std::pow(std::abs(pixel[k]), 2.4f), pixel[k]), -0.002f);
                ASSERT_LE(pixel[k], 1.002f);
            }
}

TEST(PowerLaws, ExponentsOfPixelsAreThoseOfTheStandardsNotTheField) {
    struct OwnP3 : DCIP3ColorSpace {
        OwnP3() { gamma = 0.7f; }
    };
    struct OwnRec2020 : Rec2020ColorSpace {
        OwnRec2020() { gamma = 0.7f; }
    };
    struct OwnGamma : GammaColorSpace {
        OwnGamma() { gamma = 0.7f; }
    };
    Random random(25);
    const ColourPixels pixels = UniformPixels(random, 15, 0, 1);
    const auto alike = [&pixels](const ColorSpace& a, const ColorSpace& b) {
        return AreSameBits(Converted(pixels, From(a, false)), Converted(pixels, From(b, false))) &&
               AreSameBits(Converted(pixels, To(a, false)), Converted(pixels, To(b, false)));
    };
    EXPECT_TRUE(alike(OwnP3(), DCIP3ColorSpace()));
    EXPECT_TRUE(alike(OwnRec2020(), Rec2020ColorSpace()));
    EXPECT_TRUE(alike(OwnGamma(), GammaColorSpace(0.7f)));
    EXPECT_EQ(OwnP3().LinearToEOTF(0.5f), GammaColorSpace(0.7f).LinearToEOTF(0.5f))
        << "single values use the field";
}

TEST(PowerLaws, ASpaceWithoutWeightsOfLuminanceConverts) {
    struct NoLuma : GammaColorSpace {
        const float* LuminanceCoeffs() const override { return nullptr; }
    };
    Random random(26);
    const ColourPixels pixels = UniformPixels(random, 15, -1, 2);
    for (const bool clip : {false, true})
        EXPECT_TRUE(AreSameBits(Converted(pixels, From(NoLuma(), clip)),
                                Converted(pixels, From(GammaColorSpace(), clip))));
}

} // namespace
