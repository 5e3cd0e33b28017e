// PK_CrossDissolve: a mix by a ratio, in the format that the three images ask for.

#include "convert/RasterFormats.h"
#include "reference/ReferenceDissolve.h"
#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/CrossDissolve.h>
#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <limits>
#include <vector>

using namespace PKTest;

namespace {

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kBGRX = PK_PixelFormat_BGRX_4444_8u,
                         kBGRP = PK_PixelFormat_BGRP_4444_8u, kFloats = PK_PixelFormat_BGRA_4444_32f,
                         kV210 = PK_PixelFormat_V210_422_10u;

PK_Result Dissolve(AlignedPicture& first, AlignedPicture& second, AlignedPicture& out, int32_t width,
                   int32_t height, float ratio, int32_t quality = 4) {
    return PK_CrossDissolve(first.Pixels(), first.RowBytes(), first.format, second.Pixels(),
                            second.RowBytes(), second.format, out.Pixels(), out.RowBytes(), out.format, width,
                            height, ratio, quality);
}

void ConvertRow(const void* from, PK_PixelFormat fromFormat, void* to, PK_PixelFormat toFormat, int32_t width,
                int32_t quality) {
    ASSERT_EQ(PK_Convert(from, 0, fromFormat, to, 0, toFormat, width, 1, quality), PK_Success);
}

class CrossDissolve : public testing::Test {
protected:
    CrossDissolve() { PK::SetCapabilities(PK::ReadProcessor()); }

    using Pixel = std::array<uint8_t, 4>;
    static Pixel Mixed(PK_PixelFormat format, Pixel first, Pixel second, float ratio) {
        Pixel out = {};
        EXPECT_EQ(PK_CrossDissolve(first.data(), 4, format, second.data(), 4, format, out.data(), 4, format,
                                   1, 1, ratio, 4),
                  PK_Success);
        return out;
    }

    FlagScope fFlags;
    Random fRandom{4400};
};

} // namespace

// Ties go to even: 0.5 x (1 + 2) is 2 and 0.5 x (2 + 3) is 2.
TEST_F(CrossDissolve, IsTheMeanOfOpaquePixelsAtHalfTheWay) {
    AtEveryTarget([] {
        for (const PK_PixelFormat format : {kBGRA, kBGRP, kBGRX})
            EXPECT_EQ(Mixed(format, {1, 2, 200, 255}, {2, 3, 100, 255}, 0.5f), (Pixel{2, 2, 150, 255}));
        EXPECT_EQ(Mixed(kBGRA, {0, 100, 255, 255}, {255, 200, 0, 255}, 0.25f), (Pixel{64, 125, 191, 255}));
    });
}

TEST_F(CrossDissolve, IsNotDarkenedByTransparentPixels) {
    AtEveryTarget([] {
        for (const PK_PixelFormat format : {kBGRA, kBGRP}) {
            EXPECT_EQ(Mixed(format, {10, 20, 30, 255}, {0, 0, 0, 0}, 0.5f), (Pixel{10, 20, 30, 128}));
            EXPECT_EQ(Mixed(format, {0, 0, 0, 0}, {10, 20, 30, 254}, 0.5f), (Pixel{10, 20, 30, 127}));
            EXPECT_EQ(Mixed(format, {1, 2, 3, 0}, {10, 20, 30, 0}, 0.5f), (Pixel{10, 20, 30, 0}));
        }
    });
}

// 127.5 + 25.5 is 153: (100 x 127.5 + 200 x 25.5) / 153 = 116.67, 150 x 127.5 / 153 = 125, 250 x 25.5 / 153 = 41.67.
TEST_F(CrossDissolve, WeighsStraightColourByAlpha) {
    AtEveryTarget([] {
        EXPECT_EQ(Mixed(kBGRA, {100, 150, 0, 255}, {200, 0, 250, 51}, 0.5f), (Pixel{117, 125, 42, 153}));
        EXPECT_EQ(Mixed(kBGRA, {100, 150, 0, 40}, {200, 0, 250, 40}, 0.5f), (Pixel{150, 75, 125, 40}));
        EXPECT_EQ(Mixed(kBGRP, {100, 150, 0, 255}, {50, 0, 51, 51}, 0.5f), (Pixel{75, 75, 26, 153}));
    });
}

TEST_F(CrossDissolve, IsAConversionAtEitherEnd) {
    const uint8_t first[] = {1, 2, 3, 255}, second[] = {4, 5, 6, 255};
    for (const auto& [ratio, expected] : std::initializer_list<std::pair<float, const uint8_t*>>{
             {0, first}, {0.000007f, first}, {-3, first}, {1, second}, {0.999993f, second}, {7, second}}) {
        AlignedPicture out(kFloats, 1, 1), wanted(kFloats, 1, 1);
        ASSERT_EQ(
            PK_CrossDissolve(first, 4, kBGRA, second, 4, kBGRA, out.Pixels(), 16, kFloats, 1, 1, ratio, 4),
            PK_Success);
        ConvertRow(expected, kBGRA, wanted.Pixels(), kFloats, 1, 4);
        EXPECT_EQ("", FirstDifference(kFloats, 16, wanted.Pixels(), out.Pixels())) << ratio;
    }
    // Not near enough to an end: 255 x 8e-6 is no code yet, but in floats it shows.
    const float black[4] = {0, 0, 0, 1}, white[4] = {1, 1, 1, 1};
    float out[4] = {};
    ASSERT_EQ(PK_CrossDissolve(black, 16, kFloats, white, 16, kFloats, out, 16, kFloats, 1, 1, 9e-6f, 4),
              PK_Success);
    EXPECT_NEAR(out[0], 9e-6f, 1e-7f);
    // At an end a conversion's own formats and refusals hold.
    EXPECT_EQ(PK_CrossDissolve(first, 4, kBGRA, nullptr, 0, 77, out, 4, kBGRA, 1, 1, 0, 4), PK_Success);
    EXPECT_EQ(PK_CrossDissolve(first, 4, kBGRA, second, 4, kBGRA, out, 4, 77, 1, 1, 1, 4),
              PK_ErrBadDstFormat);
}

TEST_F(CrossDissolve, ReadsTheFourthByteOfAnXFormatAsAlphaWithSSE2) {
    PK::sCPUHasSSE2 = 0;
    EXPECT_EQ(Mixed(kBGRX, {10, 20, 30, 0}, {20, 40, 60, 9}, 0.5f), (Pixel{15, 30, 45, 255}));
    EXPECT_EQ(Mixed(PK_PixelFormat_XRGB_4444_8u, {0, 20, 30, 10}, {9, 40, 60, 20}, 0.5f),
              (Pixel{255, 30, 45, 15}));
    PK::SetCapabilities(PK::ReadProcessor());
    if (!PK::sCPUHasSSE2) return; // held to the plain bodies
    EXPECT_EQ(Mixed(kBGRX, {10, 20, 30, 0}, {20, 40, 60, 9}, 0.5f), (Pixel{20, 40, 60, 4}));
}

// A way by floats and back moves odd codes.
TEST_F(CrossDissolve, MixesV210AsItIsWithSSE2) {
    constexpr uint32_t kOdd = 101 | 505 << 10 | 707 << 20, kFull = 0x3fffffff;
    const std::vector<uint32_t> first = {kOdd, 0, kFull, kFull}, second = {kOdd, 0, kFull, 0};
    const std::vector<uint32_t> mean = {kOdd, 0, kFull, 512 | 512 << 10 | 512 << 20}; // 511.5, to even
    std::vector<uint32_t> out(4);
    const auto dissolve = [&] {
        return PK_CrossDissolve(first.data(), 16, kV210, second.data(), 16, kV210, out.data(), 16, kV210, 6,
                                1, 0.5f, 4);
    };
    if (PK::sCPUHasSSE2) {
        ASSERT_EQ(dissolve(), PK_Success);
        EXPECT_EQ(out, mean);
    }
    PK::sCPUHasSSE2 = 0;
    ASSERT_EQ(dissolve(), PK_Success);
    EXPECT_NE(out, mean);
}

TEST_F(CrossDissolve, TouchesNothingButItsRows) {
    const PK_PixelFormat formats[] = {kBGRA,
                                      kBGRX,
                                      kBGRP,
                                      kV210,
                                      PK_PixelFormat_UYVY_422_8u,
                                      PK_PixelFormat_ARGB_4444_15u,
                                      PK_PixelFormat_VUYP_4444_32f};
    for (const PK_PixelFormat format : formats)
        for (const PK_PixelFormat other : {format, PK_PixelFormat_YUYV_422_32f})
            for (int32_t width = 1; width < 40; width += 1 + static_cast<int32_t>(fRandom.Below(5)))
                for (const Guard guard : {Guard::kBefore, Guard::kAfter}) {
                    const auto length = [width](PK_PixelFormat f) {
                        return static_cast<size_t>(PK_PixelFormatPackedRowBytes(f, width));
                    };
                    const auto shape = [&](PK_PixelFormat f) {
                        return ImageShape{length(f), 3, 4 * fRandom.Below(9), fRandom.Below(2) != 0, guard};
                    };
                    const GuardedImage first(shape(format), fRandom), second(shape(other), fRandom),
                        out(shape(format), fRandom);
                    const auto firstRows = first.Rows(), secondRows = second.Rows();
                    ASSERT_EQ(PK_CrossDissolve(first.Pixels(), first.RowBytes(), format, second.Pixels(),
                                               second.RowBytes(), other, out.Pixels(), out.RowBytes(), format,
                                               width, 3, 0.3f, 4),
                              PK_Success);
                    first.ExpectRows(firstRows);
                    second.ExpectRows(secondRows);
                    out.ExpectRows(out.Rows());
                }
}

TEST_F(CrossDissolve, PairsRowsFromTheTopOfThePicture) {
    // Two rows of one pixel pair: the top one is dark, the bottom one bright.
    const uint8_t topDown[2][4] = {{128, 16, 128, 16}, {128, 235, 128, 235}};
    const uint8_t bottomUp[2][8] = {{255, 255, 255, 255, 255, 255, 255, 255}, {0, 0, 0, 255, 0, 0, 0, 255}};
    uint8_t out[2][8] = {};
    ASSERT_EQ(PK_CrossDissolve(topDown, 4, PK_PixelFormat_UYVY_422_8u, bottomUp, 8, kBGRX, out, 8, kBGRX, 2,
                               2, 0.5f, 4),
              PK_Success);
    EXPECT_EQ(out[0][0], 255); // bottom rows
    EXPECT_EQ(out[1][0], 0);
    PK_SetDebugFlag(10, 1);
    ASSERT_EQ(PK_CrossDissolve(topDown, 4, PK_PixelFormat_UYVY_422_8u, bottomUp, 8, kBGRX, out, 8, kBGRX, 2,
                               2, 0.5f, 4),
              PK_Success);
    EXPECT_EQ(out[0][0], 128); // all are walked as they lie
    EXPECT_EQ(out[1][0], 128);
}

TEST_F(CrossDissolve, WorksInPlaceOfEitherImage) {
    constexpr int32_t kWidth = 23, kHeight = 3;
    for (const PK_PixelFormat format : PK::kRasterFormats)
        for (const PK_PixelFormat other : {format, PK_PixelFormat_UYVY_422_8u, kFloats})
            for (const float ratio : {0.0f, 0.3f, 1.0f}) {
                AlignedPicture image(format, kWidth, kHeight), second(other, kWidth, kHeight),
                    out(format, kWidth, kHeight);
                image.FillOrdinary(fRandom);
                second.FillOrdinary(fRandom);
                AlignedPicture first = image;
                ASSERT_EQ(Dissolve(image, second, out, kWidth, kHeight, ratio), PK_Success);
                ASSERT_EQ(Dissolve(first, second, first, kWidth, kHeight, ratio), PK_Success);
                for (int32_t row = 0; row < kHeight; ++row)
                    ASSERT_EQ("", FirstDifference(format, out.rowLength, out.RowFromTop(row),
                                                  first.RowFromTop(row)))
                        << std::hex << format << ' ' << other;
                ASSERT_EQ(Dissolve(second, image, out, kWidth, kHeight, ratio), PK_Success);
                ASSERT_EQ(Dissolve(second, image, image, kWidth, kHeight, ratio), PK_Success);
                for (int32_t row = 0; row < kHeight; ++row)
                    ASSERT_EQ("", FirstDifference(format, out.rowLength, out.RowFromTop(row),
                                                  image.RowFromTop(row)))
                        << std::hex << other << ' ' << format;
            }
}

TEST_F(CrossDissolve, ConvertsRowsTooLongForTheStack) {
    constexpr int32_t kWidth = 17001;
    AlignedPicture first(PK_PixelFormat_UYVY_422_8u, kWidth, 1), second(kBGRA, kWidth, 1),
        out(kFloats, kWidth, 1);
    first.FillOrdinary(fRandom);
    second.FillOrdinary(fRandom);
    ASSERT_EQ(Dissolve(first, second, out, kWidth, 1, 0.3f), PK_Success);
    AlignedPicture a(kFloats, kWidth, 1), b(kFloats, kWidth, 1), mixed(kFloats, kWidth, 1);
    ConvertRow(first.RowFromTop(0), first.format, a.Pixels(), kFloats, kWidth, 4);
    ConvertRow(second.RowFromTop(0), second.format, b.Pixels(), kFloats, kWidth, 4);
    ReferenceDissolveRow(DissolveRule::kStraight, SampleDepth::k32f, false, a.Pixels(), b.Pixels(),
                         mixed.Pixels(), kWidth, 1 - 0.3f);
    EXPECT_EQ("", FirstDifference(kFloats, out.rowLength, mixed.Pixels(), out.Pixels()));
}

// 0.5 x 1e-38 is denormal; 0.25 x 1 + 0.75 x 2 is 1.75, which is 1 downward.
TEST_F(CrossDissolve, WorksInTheFloatingPointModeOfTheCaller) {
    const float first[4] = {1e-38f, 0.25f, 0.3f, 1}, second[4] = {0, 0, 0, 1};
    for (const uint32_t mode : {0u, kFlushToZero}) {
        float out[4] = {};
        const FloatEnvironment environment(mode | kExceptionFlags);
        ASSERT_EQ(PK_CrossDissolve(first, 16, kFloats, second, 16, kFloats, out, 16, kFloats, 1, 1, 0.5f, 4),
                  PK_Success);
        EXPECT_TRUE(environment.IsAsGiven());
        EXPECT_EQ(out[0], mode == 0 ? 0.5e-38f : 0.0f);
        EXPECT_EQ(out[1], 0.125f);
    }
    for (const uint32_t mode : {0u, kRoundDown}) {
        const FloatEnvironment environment(mode | kExceptionFlags);
        EXPECT_EQ(Mixed(kBGRA, {1, 1, 1, 255}, {2, 2, 2, 255}, 0.75f)[0], mode == 0 ? 2 : 1);
        EXPECT_TRUE(environment.IsAsGiven());
    }
}

TEST_F(CrossDissolve, GivesNothingForARatioThatIsNoNumber) {
    const float nan = std::numeric_limits<float>::quiet_NaN();
    EXPECT_EQ(Mixed(kBGRA, {1, 2, 3, 255}, {1, 2, 3, 255}, nan), (Pixel{0, 0, 0, 255}));
}

TEST_F(CrossDissolve, RefusesFormats) {
    uint8_t pixels[64] = {};
    const auto dissolve = [&](PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat destination) {
        return PK_CrossDissolve(pixels, 16, first, pixels, 16, second, pixels, 16, destination, 1, 1, 0.5f,
                                4);
    };
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0xffffffff}, PK_PixelFormat{0x100}}) {
        EXPECT_EQ(dissolve(format, kBGRA, kBGRA), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(dissolve(kBGRA, format, kBGRA), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(dissolve(kBGRA, kBGRA, format), PK_ErrBadDstFormat) << std::hex << format;
        EXPECT_EQ(dissolve(format, format, format), PK_ErrBadSrcFormat) << std::hex << format;
    }
}

TEST_F(CrossDissolve, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    void *first = pixels, *second = pixels, *destination = pixels;
    const auto dissolve = [&](int32_t width, int32_t height) {
        return PK_CrossDissolve(first, 8, kBGRA, second, 8, kBGRA, destination, 8, kBGRA, width, height, 0.5f,
                                4);
    };
    EXPECT_EQ(dissolve(-1, 1), PK_ErrFailed);
    EXPECT_EQ(dissolve(INT32_MAX / 16 + 1, 1), PK_ErrFailed);
    EXPECT_EQ(dissolve(1, INT32_MIN), PK_ErrFailed);
    for (void** pointer : {&first, &second, &destination}) {
        *pointer = nullptr;
        EXPECT_EQ(dissolve(1, 1), PK_ErrFailed);
        EXPECT_EQ(dissolve(0, 1), PK_Success);
        EXPECT_EQ(dissolve(1, 0), PK_Success);
        *pointer = pixels;
    }
}
