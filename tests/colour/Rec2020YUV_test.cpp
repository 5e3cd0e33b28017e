// The YCbCr operations of Rec. 2020: V, U, Y, A on the one side and B, G, R, A on the other.

#include <PixelKiln/ColorSpace.h>

#include "colour/ColourKernels.h"
#include "colour/FloatBodies.h"
#include "support/ColourPixels.h"

#include <cmath>

namespace {

using namespace PKTest;
using namespace PK;

const Rec2020ColorSpace sSpace;

void ToRGB(const float* source, float* destination, int32_t count) {
    sSpace.ConvertPixelsFromYUVtoRGB(source, destination, count);
}

void ToYUV(const float* source, float* destination, int32_t count) {
    sSpace.ConvertPixelsFromRGBtoYUV(source, destination, count);
}

/// A sum of three products and a start, in the order of the vector bodies: each product is added to what is there, as two
/// operations or fused.
template <bool kFused>
float Step(float a, float b, float c) {
    if constexpr (kFused) return std::fma(a, b, c);
    const volatile float product = a * b;
    return product + c;
}

constexpr float kOfU[4] = {1.8814f, -0.1645f, 0, 0}, kOfV[4] = {0, -0.5713f, 1.4746f, 0};
constexpr float kOfR[4] = {0.5f, -0.1396f, 0.2627f, 0}, kOfG[4] = {-0.4598f, -0.3604f, 0.678f, 0},
                kOfB[4] = {-0.0402f, 0.5f, 0.0593f, 1};

template <bool kFused>
ColourPixel GroupToRGB(const ColourPixel& p) {
    const auto [V, U, Y, A] = p;
    const float start[4] = {Y, Y, Y, A};
    ColourPixel result;
    for (size_t k = 0; k < 4; ++k) result[k] = Step<kFused>(V, kOfV[k], Step<kFused>(U, kOfU[k], start[k]));
    return result;
}

template <bool kFused>
ColourPixel GroupToYUV(const ColourPixel& p) {
    const auto [B, G, R, A] = p;
    const float start[4] = {R * kOfR[0], R * kOfR[1], R * kOfR[2], A * kOfR[3]};
    ColourPixel result;
    for (size_t k = 0; k < 4; ++k) result[k] = Step<kFused>(B, kOfB[k], Step<kFused>(G, kOfG[k], start[k]));
    return result;
}

ColourPixel SingleToRGB(const ColourPixel& p) {
    const auto [V, U, Y, A] = p;
    return {Y + 1.8814f * U, Y - 0.1645f * U - 0.5713f * V, Y + 1.4746f * V, A};
}

ColourPixel SingleToYUV(const ColourPixel& p) {
    const auto [B, G, R, A] = p;
    return {0.5f * R - 0.4598f * G - 0.0402f * B, 0.5f * B - 0.3604f * G - 0.1396f * R,
            0.2627f * R + 0.678f * G + 0.0593f * B, A};
}

void ExpectSame(const ColourPixels& actual, const ColourPixels& source,
                ColourPixel (*expected)(const ColourPixel&), size_t first, size_t end) {
    for (size_t i = first; i < end; ++i)
        for (size_t k = 0; k < 4; ++k) {
            const float wanted = expected(source[i])[k];
            ASSERT_EQ(UnitsApart(actual[i][k], wanted), 0)
                << "float " << k << " of pixel " << i << ": " << actual[i][k] << ", not " << wanted;
        }
}

TEST(Rec2020YUV, PixelsByHand) {
    for (const size_t count : {size_t{1}, size_t{8}}) {
        const auto run = [count](ColourPixel pixel, auto convert) {
            return Converted(ColourPixels(count, pixel), convert)[0];
        };
        EXPECT_EQ(run({0, 0, 0.5f, 0.7f}, ToRGB), (ColourPixel{0.5f, 0.5f, 0.5f, 0.7f}));
        EXPECT_EQ(run({0, 1, 0, 0.7f}, ToRGB), (ColourPixel{1.8814f, -0.1645f, 0, 0.7f}));
        EXPECT_EQ(run({1, 0, 0, 0.7f}, ToRGB), (ColourPixel{0, -0.5713f, 1.4746f, 0.7f}));
        EXPECT_EQ(run({0, 0, 1, 0.7f}, ToYUV), (ColourPixel{0.5f, -0.1396f, 0.2627f, count == 8 ? 0 : 0.7f}));
        EXPECT_EQ(run({0, 1, 0, 0.7f}, ToYUV),
                  (ColourPixel{-0.4598f, -0.3604f, 0.678f, count == 8 ? 0 : 0.7f}));
        EXPECT_EQ(run({1, 0, 0, 0.7f}, ToYUV), (ColourPixel{-0.0402f, 0.5f, 0.0593f, count == 8 ? 1 : 0.7f}));
    }
}

TEST(Rec2020YUV, NinePixelsHaveBlueForAlphaInEightAndAlphaInTheLast) {
    ColourPixels pixels;
    for (int i = 0; i < 9; ++i)
        pixels.push_back({0.1f * static_cast<float>(i + 1), 0.5f, 0.25f, 100.0f + static_cast<float>(i)});
    const ColourPixels converted = Converted(pixels, ToYUV);
    for (size_t i = 0; i < 8; ++i) EXPECT_EQ(converted[i][3], pixels[i][0]) << "pixel " << i;
    EXPECT_EQ(converted[8][3], 108.0f);
}

TEST(Rec2020YUV, SevenPixelsKeepAlphaAndEightDoNot) {
    Random random(27);
    for (const size_t count : {size_t{7}, size_t{8}}) {
        const ColourPixels pixels = UniformPixels(random, count, 0.1f, 1);
        const ColourPixels converted = Converted(pixels, ToYUV);
        for (size_t i = 0; i < count; ++i) EXPECT_EQ(converted[i][3], pixels[i][count == 7 ? 3 : 0]);
    }
}

TEST(Rec2020YUV, InfiniteChromaReachesAlphaInGroupsOnly) { // infinity times the weight 0
    for (const size_t count : {size_t{1}, size_t{8}}) {
        const ColourPixel pixel = Converted(ColourPixels(count, {kInfinity, 0, 0.5f, 0.7f}), ToRGB)[0];
        EXPECT_EQ(pixel[2], kInfinity);
        EXPECT_EQ(pixel[1], -kInfinity);
        EXPECT_EQ(std::isnan(pixel[0]), count == 8);
        EXPECT_EQ(std::isnan(pixel[3]), count == 8);
    }
}

TEST(Rec2020YUV, PixelsBehindGroupsAgreeWithTheSumsWrittenOut) {
    Random random(28);
    for (size_t count = 1; count <= 40; ++count) {
        const ColourPixels pixels = MakePixels(Content::kMixed, count, random);
        ExpectSame(Converted(pixels, ToRGB), pixels, SingleToRGB, count / 8 * 8, count);
        ExpectSame(Converted(pixels, ToYUV), pixels, SingleToYUV, count / 8 * 8, count);
        if (HasFatalFailure()) return;
    }
}

TEST(Rec2020YUV, EveryBodyAgreesWithTheSumsWrittenOut) {
    Random random(29);
    const ColourPixels pixels = MakePixels(Content::kMixed, 8000, random);
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        SCOPED_TRACE(TargetName(target));
        const YUVKernels& kernels = KernelsFor<YUVKernels>(target);
        const bool isFused = target == Target::avx2fma;
        ExpectSame(Converted(pixels, kernels.toRGB), pixels, isFused ? GroupToRGB<true> : GroupToRGB<false>,
                   0, pixels.size());
        ExpectSame(Converted(pixels, kernels.fromRGB), pixels, isFused ? GroupToYUV<true> : GroupToYUV<false>,
                   0, pixels.size());
    }
}

TEST(Rec2020YUV, ThereAndBackIsNearlyTheSame) {
    Random random(32);
    const ColourPixels pixels = UniformPixels(random, 807, 0, 1);
    const ColourPixels back = Converted(Converted(pixels, ToYUV), ToRGB);
    for (size_t i = 0; i < pixels.size(); ++i)
        for (size_t k = 0; k < 3; ++k)
            EXPECT_NEAR(back[i][k], pixels[i][k], 2e-4f) << "the weights have four digits";
}

TEST(Rec2020YUV, AreThoseOfHLGToo) {
    const HLGColorSpace hlg;
    Random random(33);
    const ColourPixels pixels = UniformPixels(random, 13, -1, 2);
    EXPECT_TRUE(
        AreSameBits(Converted(pixels, ToRGB), Converted(pixels, [&hlg](const float* s, float* d, int32_t n) {
                        hlg.ConvertPixelsFromYUVtoRGB(s, d, n);
                    })));
}

TEST(Rec2020YUV, NoPixelsAreNoWork) {
    for (const int32_t count : kNoCounts) {
        ToRGB(nullptr, nullptr, count);
        ToYUV(nullptr, nullptr, count);
    }
}

} // namespace
