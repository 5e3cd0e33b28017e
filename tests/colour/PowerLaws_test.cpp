// The spaces that are power laws with a matrix: GammaColorSpace, Rec. 709, Rec. 2020 and P3, value by value, one by one
// and in groups of eight.

#include <PixelKiln/ColorSpace.h>

#include "colour/Pixels.h"
#include "colour/ReferencePixels.h"
#include "support/FloatEnvironment.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <memory>
#include <string>

namespace {

using namespace PKTest;
using namespace PK;

constexpr float kTwoPointFour = 2.4f, kPerTwoPointFour = 0.41666666f;
constexpr float kRec709Luma[3] = {0.2126f, 0.7152f, 0.0722f}, kRec2020Luma[3] = {0.2627f, 0.678f, 0.0593f};
constexpr float kRec709ToRec2020[9] = {0.6274020f, 0.3292920f, 0.0433061f, 0.0690955f, 0.9195440f,
                                       0.0113602f, 0.0163937f, 0.0880281f, 0.8955780f};
constexpr float kRec2020ToRec709[9] = {1.6605000f,  -0.5876570f, -0.0728399f, -0.1245470f, 1.1329000f,
                                       -0.0083480f, -0.0181537f, -0.1005970f, 1.1187500f};

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

/// One direction of a space, and what it should be.
struct Direction {
    std::string name;
    Convert convert;
    ReferenceGamma reference;
    bool gamutClip;
};

struct AllDirections {
    GammaColorSpace camera, strong{3.0f};
    Rec2020ColorSpace rec2020;
    DCIP3ColorSpace p3[6] = {kIlluminantD50, kIlluminantD55, kIlluminantD60,
                             kIlluminantDCI, kIlluminantD65, kIlluminantD75};
    CSMatrix toP3[6], fromP3[6];
    std::vector<Direction> list;

    AllDirections() {
        const Rec709ColorSpace hub;
        for (const bool clip : {false, true}) {
            Add("gamma", camera, clip, 0.45f, 1 / 0.45f, nullptr, nullptr, nullptr);
            Add("gamma 3", strong, clip, 3.0f, 1 / 3.0f, nullptr, nullptr, nullptr);
            AddFixed(clip);
            for (size_t i = 0; i < 6; ++i) {
                toP3[i] = ColorSpace::CalculateConversionMatrix(hub, p3[i]);
                fromP3[i] = ColorSpace::CalculateConversionMatrix(p3[i], hub);
                Add("P3 of illuminant " + std::to_string(i), p3[i], clip, 0.38461539f, 2.6f, toP3[i].m,
                    fromP3[i].m, p3[i].LuminanceCoeffs());
            }
        }
    }
    AllDirections(const AllDirections&) = delete;
    AllDirections& operator=(const AllDirections&) = delete;

private:
    void Add(const std::string& name, const ColorSpace& space, bool clip, float encoding, float decoding,
             const float* from, const float* to, const float* luma) {
        const std::string suffix = clip ? ", clipped" : "";
        list.push_back({"to " + name + suffix,
                        From(space, clip),
                        {kTwoPointFour, encoding, from, clip ? luma : nullptr},
                        clip});
        list.push_back({"from " + name + suffix,
                        To(space, clip),
                        {decoding, kPerTwoPointFour, to, clip ? kRec709Luma : nullptr},
                        clip});
    }
    void AddFixed(bool clip) {
        Add("Rec. 2020", rec2020, clip, kPerTwoPointFour, kTwoPointFour, kRec709ToRec2020, kRec2020ToRec709,
            kRec2020Luma);
    }
};

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
    const Pixels pixels = AnyPixels(random, 19);
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
    const Pixels from = Converted({{1, 1, 1, 0.5f}, {0, 0, 1, 2}, {0, 0, -1, 2}}, From(rec2020, false));
    for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(from[0][k], 1.0f, 1e-6f);
    EXPECT_EQ(from[0][3], 0.5f);
    for (size_t k = 0; k < 3; ++k) {
        EXPECT_NEAR(from[1][2 - k], std::pow(kRec709ToRec2020[3 * k], kPerTwoPointFour), 1e-6f);
        EXPECT_EQ(from[2][k], -from[1][k]) << "signs are carried around the powers";
    }
    // Red of Rec. 2020 is outside: green and blue become negative.
    const Pixels to = Converted({{0, 0, 1, 2}}, To(rec2020, false));
    EXPECT_NEAR(to[0][2], std::pow(1.6605, 1 / 2.4), 1e-6);
    EXPECT_NEAR(to[0][1], -std::pow(0.124547, 1 / 2.4), 1e-6);
    EXPECT_NEAR(to[0][0], -std::pow(0.0181537, 1 / 2.4), 1e-6);

    const Pixels gamma = Converted({{0.5f, -0.5f, 0, 2}}, From(GammaColorSpace(0.5f), false));
    EXPECT_NEAR(gamma[0][0], std::pow(0.5, 1.2), 1e-6);
    EXPECT_EQ(gamma[0][1], -gamma[0][0]);
    EXPECT_EQ(gamma[0][2], 0.0f);
}

TEST(PowerLaws, ClippedPixelsByHand) {
    // The clip is in linear light and takes the weights of the destination.
    const Rec2020ColorSpace rec2020;
    const Pixels to = Converted({{0, 0, 1, 2}}, To(rec2020, true));
    const ReferenceColour linear = ReferenceClip({1.6605f, -0.124547f, -0.0181537f}, kRec709Luma);
    EXPECT_NEAR(to[0][2], 1.0f, 1e-6f);
    EXPECT_NEAR(to[0][1], std::pow(std::max(0.0f, linear.G), kPerTwoPointFour), 1e-3f);
    EXPECT_NEAR(to[0][0], std::pow(linear.B, kPerTwoPointFour), 1e-5f);
    EXPECT_GT(to[0][0], 0.1f);
}

TEST(PowerLaws, SevenPixelsOfAnyKindAgreeWithTheConversionWrittenOut) {
    const AllDirections all;
    Random random(17);
    for (const Direction& direction : all.list) {
        SCOPED_TRACE(direction.name);
        ExpectPixelsLike(AnyPixels(random, 1400), direction.convert, direction.reference);
        if (HasFatalFailure()) return;
    }
}

TEST(PowerLaws, TheRestBehindGroupsIsConvertedOneByOne) {
    const AllDirections all;
    Random random(18);
    for (const Direction& direction : all.list)
        for (const size_t count : {size_t{9}, size_t{15}, size_t{16}, size_t{31}}) {
            const Pixels pixels = UniformPixels(random, count, -0.3f, 1.4f);
            const Pixels converted = Converted(pixels, direction.convert);
            for (size_t i = count / 8 * 8; i < count; ++i) {
                const Pixel expected = direction.reference(pixels[i]);
                for (size_t k = 0; k < 4; ++k)
                    EXPECT_TRUE(IsSame(converted[i][k], expected[k])) << direction.name << ", pixel " << i;
            }
        }
}

/// The range of a channel of a power law without clip, in double precision, when each sum in linear light may be off by a
/// share of the magnitudes in it and the power at the end by the same share.
struct Range {
    double least, most;
};

Range ExactRange(const ReferenceGamma& law, const Pixel& pixel, size_t channel, double share) {
    const auto power = [](double v, double exponent) {
        return std::copysign(std::pow(std::abs(v), exponent), v);
    };
    double sum = 0, magnitude = 0;
    for (size_t k = 0; k < 3; ++k) {
        double weight = k == channel ? 1 : 0;
        if (law.matrix != nullptr) weight = static_cast<double>(law.matrix[3 * (2 - channel) + (2 - k)]);
        const double term =
            weight * power(static_cast<double>(pixel[k]), static_cast<double>(law.inExponent));
        sum += term;
        magnitude += std::abs(term);
    }
    const auto exponent = static_cast<double>(law.outExponent);
    const double low = power(sum - share * magnitude, exponent),
                 high = power(sum + share * magnitude, exponent);
    constexpr double kSmallestNormal = 0x1p-126; // below it powers are 0
    return {low - share * std::abs(low) - kSmallestNormal, high + share * std::abs(high) + kSmallestNormal};
}

TEST(PowerLaws, GroupsAgreeWithDoublePrecision) {
    constexpr double kGroupShare = 0x1p-10, kSingleShare = 2e-6;
    const AllDirections all;
    Random random(19);
    for (const Direction& direction : all.list) {
        if (direction.gamutClip && direction.reference.matrix != nullptr) continue;
        for (const float most : {1.2f, 50.0f, 1e-3f}) {
            const Pixels pixels = UniformPixels(random, 4007, -0.3f * most, most);
            const Pixels converted = Converted(pixels, direction.convert);
            for (size_t i = 0; i < pixels.size(); ++i)
                for (size_t k = 0; k < 3; ++k) {
                    const Range range =
                        ExactRange(direction.reference, pixels[i], k, i < 4000 ? kGroupShare : kSingleShare);
                    ASSERT_GE(static_cast<double>(converted[i][k]), range.least)
                        << direction.name << ", pixel " << i;
                    ASSERT_LE(static_cast<double>(converted[i][k]), range.most)
                        << direction.name << ", pixel " << i;
                }
        }
    }
}

TEST(PowerLaws, GroupsAreGoodOverTheWholeRangeOfFloats) {
    // One exponent in, one out, no matrix: from the smallest normal number to where the powers leave the range.
    const GammaColorSpace camera;
    for (const bool isFrom : {true, false}) {
        const double exponent = isFrom ? 2.4 * 0.45 : 1 / 0.45 / 2.4;
        Pixels pixels;
        for (double v = 0x1p-52; v < 0x1p52; v *= 1.003)
            pixels.push_back(
                {static_cast<float>(v), static_cast<float>(-v), static_cast<float>(v * 1.001), 1});
        pixels.resize(pixels.size() / 8 * 8);
        const Pixels converted = Converted(pixels, isFrom ? From(camera, false) : To(camera, false));
        double worst = 0;
        for (size_t i = 0; i < pixels.size(); ++i)
            for (size_t k = 0; k < 3; ++k) {
                const double v = static_cast<double>(pixels[i][k]);
                const double exact = std::copysign(std::pow(std::abs(v), exponent), v);
                worst = std::max(worst, std::abs(static_cast<double>(converted[i][k]) / exact - 1));
            }
        EXPECT_LT(worst, 0x1p-10) << (isFrom ? "from the hub" : "to the hub");
        RecordProperty(isFrom ? "from" : "to", std::to_string(worst));
    }
}

TEST(PowerLaws, GroupsAndTheRestDifferByTheApproximationAlone) {
    const AllDirections all;
    Random random(20);
    for (const Direction& direction : all.list) {
        const Pixels eight = UniformPixels(random, 8, 0.1f, 0.9f);
        const Pixels seven(eight.begin(), eight.end() - 1);
        const Pixels inGroup = Converted(eight, direction.convert),
                     oneByOne = Converted(seven, direction.convert);
        bool differs = false;
        for (size_t i = 0; i < seven.size(); ++i)
            for (size_t k = 0; k < 3; ++k) {
                EXPECT_NEAR(inGroup[i][k], oneByOne[i][k], 0.01f) << direction.name;
                differs |= inGroup[i][k] != oneByOne[i][k];
            }
        EXPECT_TRUE(differs) << direction.name << ": seven pixels go one by one, eight together";
    }
}

TEST(PowerLaws, AlphaOfGroupsIsCopiedBitByBit) {
    const AllDirections all;
    Random random(21);
    for (const Direction& direction : all.list) {
        Pixels pixels = UniformPixels(random, 24, -0.5f, 1.5f);
        for (Pixel& pixel : pixels) pixel[3] = AnyFloat(random);
        const Pixels converted = Converted(pixels, direction.convert);
        for (size_t i = 0; i < pixels.size(); ++i)
            EXPECT_EQ(Pattern(converted[i][3]), Pattern(pixels[i][3])) << direction.name;
    }
}

TEST(PowerLaws, ZeroIsZeroAndSignsStay) {
    const GammaColorSpace camera;
    const Pixels eight(8, {0.0f, -0.5f, 0.5f, 1});
    for (const Convert& convert : {From(camera, false), To(camera, false)})
        for (const Pixels& pixels : {eight, Pixels(eight.begin(), eight.begin() + 7)})
            for (const Pixel& pixel : Converted(pixels, convert)) {
                EXPECT_EQ(pixel[0], 0.0f);
                EXPECT_EQ(pixel[1], -pixel[2]);
                EXPECT_LT(pixel[1], 0.0f);
            }
    const Rec2020ColorSpace rec2020;
    for (const size_t count : {size_t{7}, size_t{8}})
        for (const bool clip : {false, true})
            for (const Pixel& pixel : Converted(Pixels(count, {0, 0, 0, 1}), From(rec2020, clip)))
                for (size_t k = 0; k < 3; ++k) EXPECT_EQ(pixel[k], 0.0f);
}

TEST(PowerLaws, GroupsOfAnyPixelsDoNotDependOnTheirPlace) {
    const AllDirections all;
    Random random(22);
    for (const Direction& direction : all.list) {
        const Pixels pixels = AnyPixels(random, 64);
        const Pixels together = Converted(pixels, direction.convert);
        for (size_t i = 0; i < pixels.size(); ++i)
            for (const Pixel& pixel : Converted(Pixels(8, pixels[i]), direction.convert))
                ASSERT_EQ(std::memcmp(pixel.data(), together[i].data(), sizeof pixel), 0)
                    << direction.name << ", pixel " << i << ", seed " << random.Seed();
    }
}

TEST(PowerLaws, GreysAboveOneAreClippedToOne) {
    const DCIP3ColorSpace p3(kIlluminantD60);
    const Rec2020ColorSpace rec2020;
    for (const ColorSpace* space :
         {static_cast<const ColorSpace*>(&p3), static_cast<const ColorSpace*>(&rec2020)})
        for (const size_t count : {size_t{1}, size_t{8}})
            for (const Pixel& pixel : Converted(Pixels(count, {1.5f, 1.5f, 1.5f, 1}), From(*space, true)))
                for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(pixel[k], 1.0f, 0.004f);
}

TEST(PowerLaws, ClippedGroupsAreInTheGamut) {
    const AllDirections all;
    Random random(23);
    for (const Direction& direction : all.list) {
        if (!direction.gamutClip || direction.reference.matrix == nullptr) continue;
        const Pixels pixels = UniformPixels(random, 4000, 0.05f, 1.3f);
        for (const Pixel& pixel : Converted(pixels, direction.convert))
            for (size_t k = 0; k < 3; ++k) {
                // In linear light 0.002; the power lifts what is next to black.
                ASSERT_GE(ReferencePower(pixel[k], 2.4f), -0.002f) << direction.name;
                ASSERT_LE(pixel[k], 1.002f) << direction.name;
            }
    }
}

TEST(PowerLaws, GamutClipHasNoEffectWithoutAMatrix) {
    const GammaColorSpace camera;
    Random random(24);
    const Pixels pixels = UniformPixels(random, 31, -1, 3);
    EXPECT_TRUE(AreSameBits(Converted(pixels, From(camera, true)), Converted(pixels, From(camera, false))));
    EXPECT_TRUE(AreSameBits(Converted(pixels, To(camera, true)), Converted(pixels, To(camera, false))));
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
    const Pixels pixels = UniformPixels(random, 15, 0, 1);
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
    const Pixels pixels = UniformPixels(random, 15, -1, 2);
    for (const bool clip : {false, true})
        EXPECT_TRUE(AreSameBits(Converted(pixels, From(NoLuma(), clip)),
                                Converted(pixels, From(GammaColorSpace(), clip))));
}

TEST(PowerLaws, NoPixelsAreNoWork) {
    const AllDirections all;
    for (const Direction& direction : all.list)
        for (const int32_t count : kNoCounts) direction.convert(nullptr, nullptr, count);
}

} // namespace
