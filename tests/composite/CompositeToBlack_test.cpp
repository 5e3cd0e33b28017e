// PK_CompositeToBlack and PK_CompositeToBlackAndTestSourceAlpha, by values worked out by hand and against the rules written
// out on converted rows.

#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/Matte.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <vector>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kVUYA = PK_PixelFormat_VUYA_4444_8u,
                         kFloats = PK_PixelFormat_BGRA_4444_32f;
using Codes = std::vector<uint8_t>;
constexpr float kPart = 0x1.010102p-8f; // nearest to 1 / 255, whatever the rounding mode

size_t RowLength(PK_PixelFormat format, int32_t width) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
}

int32_t Div255(int32_t x) {
    return (x + ((x + 128) >> 8) + 128) >> 8;
}
int32_t Div255Signed(int32_t x) {
    int32_t t = x + 128;
    if (t < 0) t += 255;
    int32_t v = x + (t >> 8) + 128;
    if (v < 0) v += 255;
    return v >> 8;
}

uint8_t Limited(int32_t x) {
    return static_cast<uint8_t>(std::min(255, std::max(0, x)));
}
uint8_t Sat(float x) {
    const float rounded = std::nearbyint(x);
    return rounded > 255 ? 255 : rounded > 0 ? static_cast<uint8_t>(rounded) : 0;
}

/// What a pixel of 8 bits becomes, given from its colour to its alpha.
void RGBOverBlack(const uint8_t* c, uint8_t alpha, float opacity, uint8_t* result) {
    const auto o8 = static_cast<int32_t>(std::min(255.0f, std::max(0.0f, opacity * 255 + 0.5f)));
    const int32_t a = Div255(alpha * o8);
    for (int i = 0; i < 3; ++i) result[i] = a == 255 ? c[i] : static_cast<uint8_t>(Div255(c[i] * a));
}

int32_t ZeroOf(int channel) {
    return channel == 2 ? 16 : 128;
}

void YUVByIntegers(const uint8_t* p, float opacity, uint8_t* result) {
    const auto o8 = static_cast<int32_t>(std::min(255.0f, std::max(0.0f, opacity * 255 + 0.5f)));
    const int32_t a = Div255(p[3] * o8);
    for (int i = 0; i < 3; ++i)
        result[i] = a == 255 ? p[i] : Limited(Div255Signed((p[i] - ZeroOf(i)) * a) + ZeroOf(i));
    result[3] = 255;
}

void YUVByFloats(const uint8_t* p, float opacity, bool passes, uint8_t* result) {
    const float w = static_cast<float>(p[3]) * opacity * kPart;
    for (int i = 0; i < 3; ++i) {
        const auto zero = static_cast<float>(ZeroOf(i));
        result[i] = passes ? p[i] : Sat((static_cast<float>(p[i]) - zero) * w + zero);
    }
    result[3] = 255;
}

/// A row of VUYA at a multiple of 16 bytes.
void YUVRow(const uint8_t* row, int32_t width, float opacity, bool byFloats, uint8_t* result) {
    const auto alpha = [&](int32_t x) { return static_cast<float>(row[4 * x + 3]) * opacity; };
    for (int32_t x = 0; x < width; ++x) {
        if (!byFloats) {
            YUVByIntegers(row + 4 * x, opacity, result + 4 * x);
            continue;
        }
        const int32_t four = x / 4 * 4;
        bool passes = alpha(x) - 254.5f >= -8e-6f;
        if (four + 4 <= width)
            passes = alpha(four) >= 254.5f && alpha(four + 1) >= 254.5f && alpha(four + 2) >= 254.5f &&
                     alpha(four + 3) >= 254.5f;
        YUVByFloats(row + 4 * x, opacity, passes, result + 4 * x);
    }
}

/// A row in a working format over black, in place.
void OverBlack(PK_PixelFormat format, uint8_t* row, int32_t width, float opacity) {
    const bool isFirst = (format & 0x1000) != 0;
    if ((format & 0x1c0) != 0) {
        auto* pixel = reinterpret_cast<float*>(row);
        for (int32_t x = 0; x < width; ++x, pixel += 4) {
            float& alpha = pixel[isFirst ? 0 : 3];
            const float a = alpha * opacity;
            for (int i = 0; i < 3; ++i)
                if (!(8e-6f + a > 1)) pixel[isFirst ? i + 1 : i] *= a;
            alpha = 1;
        }
        return;
    }
    if ((format & 1) != 0) return YUVRow(row, width, opacity, PK::sCPUHasSSE2 != 0, row);
    for (int32_t x = 0; x < width; ++x) {
        uint8_t* const pixel = row + 4 * x;
        uint8_t* const colour = isFirst ? pixel + 1 : pixel;
        uint8_t& alpha = pixel[isFirst ? 0 : 3];
        RGBOverBlack(colour, alpha, opacity, colour);
        alpha = 255;
    }
}

/// The table of formats to work in, told anew.
PK_PixelFormat WorkingFormat(PK_PixelFormat to, bool isFull, int32_t quality) {
    for (const PK_PixelFormat own : {kBGRA, PK_PixelFormat_ARGB_4444_8u, kVUYA, kFloats,
                                     PK_PixelFormat_ARGB_4444_32f, PK_PixelFormat_VUYA_4444_32f})
        if (to == own) return own;
    const bool isFloat = quality >= 3;
    if ((to & 1) == 0) return isFloat ? kFloats : kBGRA;
    if (isFull && (to & 0x601) == 0x201) {
        if (to == PK_PixelFormat_VUYA_4444_8u_709 || to == PK_PixelFormat_VUYA_4444_32f_709) return to;
        return isFloat ? PK_PixelFormat_VUYA_4444_32f_709 : PK_PixelFormat_VUYA_4444_8u_709;
    }
    return isFloat ? PK_PixelFormat_VUYA_4444_32f : kVUYA;
}

/// A row through the format that is worked in, each step where temporary rows begin: at a multiple of 64 bytes.
Codes ExpectedRow(const uint8_t* row, PK_PixelFormat from, PK_PixelFormat to, int32_t width, float opacity,
                  int32_t quality) {
    const bool isFull = 8e-6f + opacity > 1;
    const PK_PixelFormat working = WorkingFormat(to, isFull, quality);
    const RowBuffer inside(RowLength(working, width), {Placement::kAtOffset, 0}),
        result(RowLength(to, width), {Placement::kAtOffset, 0});
    EXPECT_EQ(PK_Convert(row, 0, from, inside.Data(), 0, working, width, 1, quality), PK_Success);
    OverBlack(working, inside.Data(), width, isFull ? 1 : opacity);
    EXPECT_EQ(PK_Convert(inside.Data(), 0, working, result.Data(), 0, to, width, 1, quality), PK_Success);
    return {result.Data(), result.Data() + result.Size()};
}

class CompositeToBlack : public testing::Test {
protected:
    CompositeToBlack() { PK::SetCapabilities(PK::ReadProcessor()); }

    template <class Sample, size_t kCount>
    static std::vector<Sample> OnePixel(PK_PixelFormat format, const Sample (&pixel)[kCount], float opacity) {
        std::vector<Sample> result(kCount);
        EXPECT_EQ(PK_CompositeToBlack(pixel, 0, format, result.data(), 0, format, 1, 1, opacity, 4),
                  PK_Success);
        return result;
    }

    static uint32_t Tested(const Codes& image, PK_PixelFormat format, Codes& result, int32_t width,
                           int32_t height) {
        uint32_t told = 99;
        const auto rowBytes = static_cast<int32_t>(RowLength(format, width));
        EXPECT_EQ(PK_CompositeToBlackAndTestSourceAlpha(image.data(), rowBytes, format, result.data(),
                                                        rowBytes, format, width, height, &told, 4),
                  PK_Success);
        return told;
    }

    FlagScope fFlags;
    Random fRandom{1006};
};

} // namespace

// o8 = trunc(128.0)
TEST_F(CompositeToBlack, CodesByHand) {
    EXPECT_EQ((OnePixel<uint8_t>(kBGRA, {255, 100, 10, 255}, 0.5f)), (Codes{128, 50, 5, 255}));
    EXPECT_EQ((OnePixel<uint8_t>(kBGRA, {255, 100, 10, 128}, 1)), (Codes{128, 50, 5, 255}));
    EXPECT_EQ((OnePixel<uint8_t>(kBGRA, {255, 100, 10, 255}, 1)), (Codes{255, 100, 10, 255}));
    EXPECT_EQ((OnePixel<uint8_t>(PK_PixelFormat_ARGB_4444_8u, {128, 10, 100, 255}, 1)),
              (Codes{255, 5, 50, 128}));
    // -100 x 128 / 255 = -50.2, which integers shift to -49.
    const uint8_t u = PK::sCPUHasSSE2 != 0 ? 78 : 79;
    EXPECT_EQ((OnePixel<uint8_t>(kVUYA, {228, 28, 216, 128}, 1)), (Codes{178, u, 116, 255}));
    EXPECT_EQ((OnePixel<uint8_t>(kVUYA, {228, 28, 216, 0}, 1)), (Codes{128, 128, 16, 255}));
}

TEST_F(CompositeToBlack, FloatsByHandAreNotLimited) {
    EXPECT_EQ((OnePixel<float>(kFloats, {2, -1, 0.5f, 0.5f}, 0.5f)),
              (std::vector<float>{0.5f, -0.25f, 0.125f, 1}));
    EXPECT_EQ((OnePixel<float>(kFloats, {2, -1, 0.5f, 0.999993f}, 1)), (std::vector<float>{2, -1, 0.5f, 1}));
}

TEST_F(CompositeToBlack, EveryPairOfKindsFollowsTheRules) {
    AtEveryTarget([&] {
        for (const PK_PixelFormat to : PK::kRasterFormats)
            for (const int32_t quality : {2, 4}) {
                const PK_PixelFormat from =
                    fRandom.Below(3) ? PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))] : to;
                constexpr float kOpacities[] = {1, 0.9999925f, 0.5f, 0.999f, 0.00001f};
                const float opacity = kOpacities[fRandom.Below(5)];
                const auto width = static_cast<int32_t>(fRandom.Below(40)),
                           height = static_cast<int32_t>(fRandom.Below(4));
                SCOPED_TRACE(testing::Message()
                             << std::hex << from << " to " << to << std::dec << ", " << width << " x "
                             << height << ", quality " << quality << ", seed " << fRandom.Seed());
                const GuardedImage source(
                    {RowLength(from, width), height, 16 * fRandom.Below(2), fRandom.Below(2) != 0}, fRandom);
                // Rows begin at multiples of 16 bytes, where the rule of runs does.
                const size_t padding = 16 + (16 - RowLength(to, width) % 16) % 16;
                const GuardedImage destination(
                    {RowLength(to, width), height, padding, fRandom.Below(2) != 0, Guard::kBefore}, fRandom);
                std::vector<Codes> expected;
                for (int32_t row = 0; row < height; ++row) {
                    FillOrdinarySamples(from, source.Row(row), RowLength(from, width), fRandom);
                    expected.push_back(ExpectedRow(source.Row(row), from, to, width, opacity, quality));
                }
                ASSERT_EQ(PK_CompositeToBlack(source.Pixels(), source.RowBytes(), from, destination.Pixels(),
                                              destination.RowBytes(), to, width, height, opacity, quality),
                          PK_Success);
                destination.ExpectRows(expected);
                if (HasFatalFailure()) return;
            }
    });
}

// All products of two codes, by which each body may show another rounding.
TEST_F(CompositeToBlack, EveryCodeUnderEveryAlpha) {
    std::vector<uint8_t> source(65536 * 4), result(source.size()), expected(source.size());
    for (const PK_PixelFormat format : {kBGRA, kVUYA})
        for (const float opacity : {1.0f, 0.7f}) {
            for (size_t i = 0; i < 65536; ++i) {
                const auto code = static_cast<uint8_t>(i >> 8);
                const uint8_t pixel[4] = {code, code, code, static_cast<uint8_t>(i)};
                std::memcpy(&source[4 * i], pixel, 4);
            }
            AtEveryTarget([&] {
                expected = source;
                OverBlack(format, expected.data(), 65536, opacity);
                ASSERT_EQ(PK_CompositeToBlack(source.data(), 0, format, result.data(), 0, format, 65536, 1,
                                              opacity, 4),
                          PK_Success);
                ASSERT_EQ(result, expected);
            });
        }
}

TEST_F(CompositeToBlack, BelowTheThresholdTheSourceIsNotRead) {
    uint8_t result[4] = {};
    EXPECT_EQ(PK_CompositeToBlack(nullptr, 0, kBGRA, result, 0, kBGRA, 1, 1, 0.000007f, 4), PK_Success);
    EXPECT_EQ(Codes(result, result + 4), (Codes{0, 0, 0, 255}));
    EXPECT_EQ(PK_CompositeToBlack(nullptr, 0, PK_PixelFormat_NTSCDV25, result, 0, kBGRA, 1, 1, 0, 4),
              PK_ErrBadSrcFormat);
}

TEST_F(CompositeToBlack, WorksInPlace) {
    for (const PK_PixelFormat format : {kBGRA, kVUYA, PK_PixelFormat_PRGB_4444_15u, kFloats}) {
        const size_t length = RowLength(format, 37);
        Codes image(length * 3), apart(length * 3);
        FillOrdinarySamples(format, image.data(), image.size(), fRandom);
        const auto rowBytes = static_cast<int32_t>(length);
        ASSERT_EQ(PK_CompositeToBlack(image.data(), rowBytes, format, apart.data(), rowBytes, format, 37, 3,
                                      0.6f, 4),
                  PK_Success);
        ASSERT_EQ(PK_CompositeToBlack(image.data(), rowBytes, format, image.data(), rowBytes, format, 37, 3,
                                      0.6f, 4),
                  PK_Success);
        EXPECT_EQ(image, apart) << std::hex << format;
    }
}

TEST_F(CompositeToBlack, RowsOfTheAlphaAreTold) {
    for (const PK_PixelFormat format : {kBGRA, PK_PixelFormat_ARGB_4444_8u, kVUYA}) {
        const size_t place = (format & 0x1000) != 0 ? 0 : 3;
        for (const int32_t width : {1, 3, 4, 17, 64, 101}) {
            const auto image = [&](std::vector<uint8_t> rowAlphas) {
                Codes pixels;
                for (const uint8_t alpha : rowAlphas)
                    for (int32_t x = 0; x < width; ++x)
                        for (size_t i = 0; i < 4; ++i) pixels.push_back(i == place ? alpha : 77);
                return pixels;
            };
            Codes result(image({0, 0}).size());
            EXPECT_EQ(Tested(image({255, 255}), format, result, width, 2), 0u);
            EXPECT_EQ(result, image({255, 255}));
            EXPECT_EQ(Tested(image({0, 0}), format, result, width, 2), 1u);
            EXPECT_EQ(Tested(image({255, 0}), format, result, width, 2), 2u);
            EXPECT_EQ(Tested(image({128, 128}), format, result, width, 2), 2u);
            for (int32_t odd = 0; odd < width; ++odd) {
                Codes one = image({255}), none = image({0});
                one[4 * static_cast<size_t>(odd) + place] = 254;
                none[4 * static_cast<size_t>(odd) + place] = 1;
                EXPECT_EQ(Tested(one, format, result, width, 1), 2u);
                EXPECT_EQ(Tested(none, format, result, width, 1), 2u);
            }
        }
    }
}

TEST_F(CompositeToBlack, AlphaOfFloatsIsFullOrNoneWithinTheThreshold) {
    const auto tested = [](float first, float second) {
        const float image[8] = {0.5f, 0.5f, 0.5f, first, 0.5f, 0.5f, 0.5f, second};
        float result[8];
        uint32_t told = 99;
        EXPECT_EQ(
            PK_CompositeToBlackAndTestSourceAlpha(image, 32, kFloats, result, 32, kFloats, 2, 1, &told, 4),
            PK_Success);
        return told;
    };
    EXPECT_EQ(tested(1, 1.000007f), 0u);
    EXPECT_EQ(tested(0.999993f, 1), 0u);
    EXPECT_EQ(tested(0.99999f, 1), 2u);
    EXPECT_EQ(tested(0, -0.000007f), 1u);
    EXPECT_EQ(tested(0, 0.000009f), 2u);
    EXPECT_EQ(tested(NAN, 1), 2u);
}

TEST_F(CompositeToBlack, ShortcutsOfRowsByFormat) {
    for (const PK_PixelFormat to : PK::kRasterFormats) {
        const PK_PixelFormat from = kBGRA;
        constexpr int32_t kWidth = 13;
        Codes source(4 * kWidth * 3);
        fRandom.Fill(source.data(), source.size());
        for (size_t x = 0; x < kWidth; ++x) {
            source[4 * x + 3] = 255;
            source[4 * (kWidth + x) + 3] = 0;
        }
        const size_t length = RowLength(to, kWidth);
        const RowBuffer first(length, {Placement::kAtOffset, 0}), black(length, {Placement::kAtOffset, 0});
        const PK_PixelFormat working = WorkingFormat(to, true, 4);
        RowBuffer inside(RowLength(working, kWidth), {Placement::kAtOffset, 0});
        ASSERT_EQ(PK_Convert(source.data(), 0, from, inside.Data(), 0, working, kWidth, 1, 4), PK_Success);
        ASSERT_EQ(PK_Convert(inside.Data(), 0, working, first.Data(), 0, to, kWidth, 1, 4), PK_Success);
        const GuardedImage destination({length, 3, 64 + (64 - length % 64) % 64, false, Guard::kBefore},
                                       fRandom);
        std::memcpy(black.Data(), destination.Row(1), length); // a fill leaves what is half of a pair
        const bool hasFill = PK_FillWithOpaqueBlack(black.Data(), 0, kWidth, 1, to) == PK_Success;
        ASSERT_EQ(hasFill, to != PK_PixelFormat_RGB_444_10u);
        const std::vector<Codes> expected = {{first.Data(), first.Data() + length},
                                             hasFill
                                                 ? Codes(black.Data(), black.Data() + length)
                                                 : ExpectedRow(&source[4 * kWidth], from, to, kWidth, 1, 4),
                                             ExpectedRow(&source[4 * kWidth * 2], from, to, kWidth, 1, 4)};
        uint32_t told = 99;
        ASSERT_EQ(PK_CompositeToBlackAndTestSourceAlpha(source.data(), 4 * kWidth, from, destination.Pixels(),
                                                        destination.RowBytes(), to, kWidth, 3, &told, 4),
                  PK_Success)
            << std::hex << to;
        EXPECT_EQ(told, 2u);
        destination.ExpectRows(expected);
    }
}

// An opaque image that is its own destination may be read-only: here floats whose alpha would be written as 1.
TEST_F(CompositeToBlack, AnOpaqueImageInPlaceIsNotWritten) {
    std::vector<float> image = {0.5f, 0.25f, 2, 1.000005f, -1, 0, 1, 0.999995f};
    const std::vector<float> before = image;
    uint32_t told = 99;
    for (const PK_PixelFormat format : {kFloats, PK_PixelFormat_BGRA_4444_32f_Linear}) {
        ASSERT_EQ(PK_CompositeToBlackAndTestSourceAlpha(image.data(), 32, format, image.data(), 32, format, 2,
                                                        1, &told, 4),
                  PK_Success);
        EXPECT_EQ(told, 0u);
        EXPECT_EQ(image, before);
    }
}

TEST_F(CompositeToBlack, NoPixelsAreOpaqueOnes) {
    for (const auto& [width, height] : {std::pair{0, 3}, {3, 0}}) {
        uint32_t told = 99;
        EXPECT_EQ(PK_CompositeToBlackAndTestSourceAlpha(nullptr, 0, kBGRA, nullptr, 0, kBGRA, width, height,
                                                        &told, 4),
                  PK_Success);
        EXPECT_EQ(told, 0u);
        EXPECT_EQ(PK_CompositeToBlack(nullptr, 0, kBGRA, nullptr, 0, kBGRA, width, height, 1, 4), PK_Success);
    }
}

TEST_F(CompositeToBlack, LeavesTheFloatingPointModeOfTheCaller) {
    const FloatEnvironment environment(kRoundDown | kExceptionFlags);
    OnePixel<float>(kFloats, {1e-38f, -1, 0.5f, 0.5f}, 0.5f);
    OnePixel<uint8_t>(kVUYA, {228, 28, 216, 128}, 0.3f);
    EXPECT_TRUE(environment.IsAsGiven());
}

TEST_F(CompositeToBlack, RefusesFormatsSizesAndNullPointers) {
    uint8_t pixels[64] = {};
    uint32_t told = 99;
    const auto both = [&](const void* source, PK_PixelFormat from, void* destination, PK_PixelFormat to,
                          int32_t width, PK_Result expected, int32_t height = 1) {
        EXPECT_EQ(PK_CompositeToBlack(source, 8, from, destination, 8, to, width, height, 1, 4), expected);
        EXPECT_EQ(PK_CompositeToBlackAndTestSourceAlpha(source, 8, from, destination, 8, to, width, height,
                                                        &told, 4),
                  expected);
    };
    for (const PK_PixelFormat bad : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
                                     PK_PixelFormat_Invalid, PK_PixelFormat{0x100}}) {
        both(pixels, bad, pixels, kBGRA, 1, PK_ErrBadSrcFormat);
        both(pixels, kBGRA, pixels, bad, 1, PK_ErrBadDstFormat);
    }
    both(pixels, kBGRA, pixels, kBGRA, -1, PK_ErrFailed);
    both(pixels, kBGRA, pixels, kBGRA, 1, PK_ErrFailed, -1);
    both(pixels, kBGRA, pixels, kBGRA, INT32_MAX / 16 + 1, PK_ErrFailed);
    both(nullptr, kBGRA, pixels, kBGRA, 1, PK_ErrFailed);
    both(pixels, kBGRA, nullptr, kBGRA, 1, PK_ErrFailed);
    EXPECT_EQ(told, 99u);
    EXPECT_EQ(PK_CompositeToBlackAndTestSourceAlpha(pixels, 8, kBGRA, pixels, 8, kBGRA, 1, 1, nullptr, 4),
              PK_ErrFailed);
}
