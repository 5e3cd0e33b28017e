// The YCbCr operations of Rec. 2020: V, U, Y, A on the one side and B, G, R, A on the other.

#include <PixelKiln/ColorSpace.h>

#include "colour/ColourKernels.h"
#include "colour/Pixels.h"

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
Pixel GroupToRGB(const Pixel& p) {
    const auto [V, U, Y, A] = p;
    const float start[4] = {Y, Y, Y, A};
    Pixel result;
    for (size_t k = 0; k < 4; ++k) result[k] = Step<kFused>(V, kOfV[k], Step<kFused>(U, kOfU[k], start[k]));
    return result;
}

template <bool kFused>
Pixel GroupToYUV(const Pixel& p) {
    const auto [B, G, R, A] = p;
    const float start[4] = {R * kOfR[0], R * kOfR[1], R * kOfR[2], A * kOfR[3]};
    Pixel result;
    for (size_t k = 0; k < 4; ++k) result[k] = Step<kFused>(B, kOfB[k], Step<kFused>(G, kOfG[k], start[k]));
    return result;
}

Pixel SingleToRGB(const Pixel& p) {
    const auto [V, U, Y, A] = p;
    return {Y + 1.8814f * U, Y - 0.1645f * U - 0.5713f * V, Y + 1.4746f * V, A};
}

Pixel SingleToYUV(const Pixel& p) {
    const auto [B, G, R, A] = p;
    return {0.5f * R - 0.4598f * G - 0.0402f * B, 0.5f * B - 0.3604f * G - 0.1396f * R,
            0.2627f * R + 0.678f * G + 0.0593f * B, A};
}

void ExpectSame(const Pixels& actual, const Pixels& source, Pixel (*expected)(const Pixel&), size_t first,
                size_t end) {
    for (size_t i = first; i < end; ++i)
        for (size_t k = 0; k < 4; ++k)
            ASSERT_TRUE(IsSame(actual[i][k], expected(source[i])[k]))
                << "float " << k << " of pixel " << i << ": " << actual[i][k] << ", not "
                << expected(source[i])[k];
}

TEST(Rec2020YUV, PixelsByHand) {
    for (const size_t count : {size_t{1}, size_t{8}}) {
        const auto run = [count](Pixel pixel, auto convert) {
            return Converted(Pixels(count, pixel), convert)[0];
        };
        EXPECT_EQ(run({0, 0, 0.5f, 0.7f}, ToRGB), (Pixel{0.5f, 0.5f, 0.5f, 0.7f}));
        EXPECT_EQ(run({0, 1, 0, 0.7f}, ToRGB), (Pixel{1.8814f, -0.1645f, 0, 0.7f}));
        EXPECT_EQ(run({1, 0, 0, 0.7f}, ToRGB), (Pixel{0, -0.5713f, 1.4746f, 0.7f}));
        EXPECT_EQ(run({0, 0, 1, 0.7f}, ToYUV), (Pixel{0.5f, -0.1396f, 0.2627f, count == 8 ? 0 : 0.7f}));
        EXPECT_EQ(run({0, 1, 0, 0.7f}, ToYUV), (Pixel{-0.4598f, -0.3604f, 0.678f, count == 8 ? 0 : 0.7f}));
        EXPECT_EQ(run({1, 0, 0, 0.7f}, ToYUV), (Pixel{-0.0402f, 0.5f, 0.0593f, count == 8 ? 1 : 0.7f}));
    }
}

TEST(Rec2020YUV, NinePixelsHaveBlueForAlphaInEightAndAlphaInTheLast) {
    Pixels pixels;
    for (int i = 0; i < 9; ++i)
        pixels.push_back({0.1f * static_cast<float>(i + 1), 0.5f, 0.25f, 100.0f + static_cast<float>(i)});
    const Pixels converted = Converted(pixels, ToYUV);
    for (size_t i = 0; i < 8; ++i) EXPECT_EQ(converted[i][3], pixels[i][0]) << "pixel " << i;
    EXPECT_EQ(converted[8][3], 108.0f);
}

TEST(Rec2020YUV, SevenPixelsKeepAlphaAndEightDoNot) {
    Random random(27);
    for (const size_t count : {size_t{7}, size_t{8}}) {
        const Pixels pixels = UniformPixels(random, count, 0.1f, 1);
        const Pixels converted = Converted(pixels, ToYUV);
        for (size_t i = 0; i < count; ++i) EXPECT_EQ(converted[i][3], pixels[i][count == 7 ? 3 : 0]);
    }
}

TEST(Rec2020YUV, InfiniteChromaReachesAlphaInGroupsOnly) { // infinity times the weight 0
    for (const size_t count : {size_t{1}, size_t{8}}) {
        const Pixel pixel = Converted(Pixels(count, {kInfinity, 0, 0.5f, 0.7f}), ToRGB)[0];
        EXPECT_EQ(pixel[2], kInfinity);
        EXPECT_EQ(pixel[1], -kInfinity);
        EXPECT_EQ(std::isnan(pixel[0]), count == 8);
        EXPECT_EQ(std::isnan(pixel[3]), count == 8);
    }
}

TEST(Rec2020YUV, PixelsBehindGroupsAgreeWithTheSumsWrittenOut) {
    Random random(28);
    for (size_t count = 1; count <= 40; ++count) {
        const Pixels pixels = AnyPixels(random, count);
        ExpectSame(Converted(pixels, ToRGB), pixels, SingleToRGB, count / 8 * 8, count);
        ExpectSame(Converted(pixels, ToYUV), pixels, SingleToYUV, count / 8 * 8, count);
        if (HasFatalFailure()) return;
    }
}

TEST(Rec2020YUV, EveryBodyAgreesWithTheSumsWrittenOut) {
    Random random(29);
    const Pixels pixels = AnyPixels(random, 8000);
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

TEST(Rec2020YUV, EveryBodyWithoutFusingAgreesWithThePlainOneBitByBit) {
    Random random(30);
    const Pixels pixels = UniformPixels(random, 8000, -1, 2);
    const YUVKernels& plain = KernelsFor<YUVKernels>(Target::plain);
    const Pixels toRGB = Converted(pixels, plain.toRGB), fromRGB = Converted(pixels, plain.fromRGB);
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        if (target == Target::avx2fma) continue;
        const YUVKernels& kernels = KernelsFor<YUVKernels>(target);
        EXPECT_TRUE(AreSameBits(Converted(pixels, kernels.toRGB), toRGB)) << TargetName(target);
        EXPECT_TRUE(AreSameBits(Converted(pixels, kernels.fromRGB), fromRGB)) << TargetName(target);
    }
}

TEST(Rec2020YUV, GroupsTakeTheBestBody) {
    Random random(31);
    const Pixels pixels = UniformPixels(random, 64, -1, 2);
    const YUVKernels& kernels = KernelsFor<YUVKernels>(BestTarget(Offer::processor));
    EXPECT_TRUE(AreSameBits(Converted(pixels, ToRGB), Converted(pixels, kernels.toRGB)));
    EXPECT_TRUE(AreSameBits(Converted(pixels, ToYUV), Converted(pixels, kernels.fromRGB)));
}

TEST(Rec2020YUV, ThereAndBackIsNearlyTheSame) {
    Random random(32);
    const Pixels pixels = UniformPixels(random, 807, 0, 1);
    const Pixels back = Converted(Converted(pixels, ToYUV), ToRGB);
    for (size_t i = 0; i < pixels.size(); ++i)
        for (size_t k = 0; k < 3; ++k)
            EXPECT_NEAR(back[i][k], pixels[i][k], 2e-4f) << "the weights have four digits";
}

TEST(Rec2020YUV, AreThoseOfHLGToo) {
    const HLGColorSpace hlg;
    Random random(33);
    const Pixels pixels = UniformPixels(random, 13, -1, 2);
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
