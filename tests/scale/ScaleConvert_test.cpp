// Scale-and-convert: values by hand, and what it refuses.

#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/Targets.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/ScaleConvert.h>

#include <gtest/gtest.h>

#include <limits>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u,
                         kVUYP = PK_PixelFormat_VUYP_4444_8u, kV210 = PK_PixelFormat_V210_422_10u,
                         kPlanes = PK_PixelFormat_YUV_420_MPEG2_FRAME;

/// Of a picture in memory without padding.
PK_Result Scale(const void* source, int32_t width, int32_t height, PK_PixelFormat from, int32_t field,
                void* destination, int32_t toWidth, int32_t toHeight, PK_PixelFormat to, int32_t toField,
                int32_t quality) {
    return PK_ScaleConvert(source, PK_PixelFormatPackedRowBytes(from, width), width, height, from, field,
                           destination, PK_PixelFormatPackedRowBytes(to, toWidth), toWidth, toHeight, to,
                           toField, quality);
}

TEST(ScaleConvert, HalfSizeTakesTheFirstPixelOfEachPairInEverySecondRow) {
    AtEveryTarget([] {
        const uint8_t source[4][8] = {{1, 2, 3, 4, 5, 6, 7, 8},
                                      {11, 12, 13, 14, 15, 16, 17, 18},
                                      {21, 22, 23, 24, 25, 26, 27, 28},
                                      {31, 32, 33, 34, 35, 36, 37, 38}};
        uint8_t pixels[2][8];
        ASSERT_EQ(Scale(source, 4, 4, kUYVY, 0, pixels, 2, 2, kVUYP, 0, 2), PK_Success);
        // The destination's first row is the bottom of the picture.
        const uint8_t expected[2][8] = {{33, 31, 32, 255, 37, 35, 36, 255},
                                        {13, 11, 12, 255, 17, 15, 16, 255}};
        EXPECT_EQ(std::memcmp(pixels, expected, sizeof pixels), 0);

        ASSERT_EQ(Scale(source, 4, 4, kUYVY, 1, pixels, 2, 2, kVUYP, 0, 0), PK_Success);
        const uint8_t ofFirstField[2][8] = {{23, 21, 22, 255, 27, 25, 26, 255}, {3, 1, 2, 255, 7, 5, 6, 255}};
        EXPECT_EQ(std::memcmp(pixels, ofFirstField, sizeof pixels), 0);

        ASSERT_EQ(Scale(source, 4, 4, PK_PixelFormat_YUYV_422_8u_709, 2, pixels, 2, 2,
                        PK_PixelFormat_VUYP_4444_8u_709, 0, 1),
                  PK_Success);
        const uint8_t ofYUYV[2][8] = {{34, 32, 31, 255, 38, 36, 35, 255}, {14, 12, 11, 255, 18, 16, 15, 255}};
        EXPECT_EQ(std::memcmp(pixels, ofYUYV, sizeof pixels), 0);
    });
}

TEST(ScaleConvert, HalfSizeOfV210CutsSamplesToEightBits) {
    AtEveryTarget([] {
        // A group of six and a rest of four; a row is two groups. Samples are 4 x 8-bit code + 3.
        uint32_t source[2][8] = {};
        const auto word = [](uint32_t a, uint32_t b, uint32_t c) {
            return (4 * a + 3) | (4 * b + 3) << 10 | (4 * c + 3) << 20;
        };
        for (uint32_t i = 0; i < 8; ++i) source[1][i] = word(3 * i + 1, 3 * i + 2, 3 * i + 3);
        uint8_t pixels[5][4];
        ASSERT_EQ(Scale(source, 10, 2, kV210, 0, pixels, 5, 1, kVUYP, 0, 2), PK_Success);
        const uint8_t expected[5][4] = {
            {3, 1, 2, 255}, {7, 5, 6, 255}, {11, 9, 10, 255}, {15, 13, 14, 255}, {19, 17, 18, 255}};
        EXPECT_EQ(std::memcmp(pixels, expected, sizeof pixels), 0);
    });
}

TEST(ScaleConvert, HalfSizeOfFloatsKeepsTheirBits) {
    AtEveryTarget([] {
        const float nan = std::numeric_limits<float>::quiet_NaN(), tiny = 1e-42f;
        const float source[2][8] = {{}, {-0.5f, tiny, nan, 9, 0.25f, -0.0f, 2, 8}};
        float pixels[2][4];
        for (const auto& [from, to] : {std::pair{PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_VUYP_4444_32f},
                                       {PK_PixelFormat_UYVY_422_32f_709, PK_PixelFormat_VUYP_4444_32f_709},
                                       {PK_PixelFormat_YUYV_422_32f, PK_PixelFormat_VUYP_4444_32f}}) {
            ASSERT_EQ(Scale(source, 4, 2, from, 0, pixels, 2, 1, to, 0, 2), PK_Success);
            const float expected[2][4] = {{nan, -0.5f, tiny, 1}, {2, 0.25f, -0.0f, 1}};
            EXPECT_EQ(std::memcmp(pixels, expected, sizeof pixels), 0);
        }
    });
}

TEST(ScaleConvert, HalfSizeOfTheFirstFieldBeginsWithRow484) {
    Random random(1);
    AlignedPicture source(kUYVY, 720, 486), destination(kBGRA, 360, 243), expected(kBGRA, 360, 243);
    source.FillOrdinary(random);
    ASSERT_EQ(PK_ScaleConvert(source.Pixels(), source.RowBytes(), 720, 486, kUYVY, 1, destination.Pixels(),
                              destination.RowBytes(), 360, 243, kBGRA, 0, 2),
              PK_Success);
    AlignedPicture halved(kVUYP, 360, 1);
    for (int32_t row = 0; row < 243; ++row) {
        const uint8_t* const from = source.Row(484 - 2 * row);
        for (int32_t x = 0; x < 360; ++x) {
            const uint8_t pixel[4] = {from[4 * x + 2], from[4 * x], from[4 * x + 1], 255};
            std::memcpy(halved.Row(0) + 4 * x, pixel, 4);
        }
        ASSERT_EQ(PK_Convert(halved.Row(0), 0, kVUYP, expected.Row(row), 0, kBGRA, 360, 1, 2), PK_Success);
    }
    EXPECT_EQ(destination.DifferenceFrom(expected), "");
}

TEST(ScaleConvert, FieldsOfPlanesAreCopiedLineByLine) {
    constexpr int32_t kWidth = 131, kHeight = 22;
    Random random(2);
    for (const int32_t height : {kHeight, kHeight + 1, 2, 3})
        for (const int32_t field : {0, 1, 2}) {
            SCOPED_TRACE(testing::Message() << height << " rows, field " << field);
            const auto bytes = [](int32_t rows) {
                return static_cast<size_t>(PK_PixelFormatSize(kPlanes, kWidth, rows));
            };
            std::vector<uint8_t> source = random.Bytes(bytes(height)), destination(bytes(height / 2), 99);
            ASSERT_EQ(PK_ScaleConvert(source.data(), 1, kWidth, height, kPlanes, field, destination.data(),
                                      -7, kWidth, height / 2, kPlanes, field, 2),
                      PK_Success);
            std::vector<uint8_t> expected(destination.size(), 99);
            void *from[3], *to[3];
            int32_t fromRows[3], toRows[3];
            PK_GetPlanarBuffers(source.data(), kPlanes, kWidth, height, from, fromRows);
            PK_GetPlanarBuffers(expected.data(), kPlanes, kWidth, height / 2, to, toRows);
            for (int plane = 0; plane < 3; ++plane) {
                const int32_t lines = plane == 0 ? height / 2 : height / 2 / 2;
                const int32_t first = plane == 0 && field == 2 ? 1 : 0;
                for (int32_t line = 0; line < lines; ++line)
                    std::memcpy(static_cast<uint8_t*>(to[plane]) + line * toRows[plane],
                                static_cast<uint8_t*>(from[plane]) + (first + 2 * line) * fromRows[plane],
                                plane == 0 ? kWidth : kWidth / 2);
            }
            EXPECT_EQ(destination, expected);
        }
}

TEST(ScaleConvert, NullIsToldBeforeAnythingElse) {
    uint8_t pixel[16] = {};
    for (const int32_t size : {0, 1, -1}) {
        EXPECT_EQ(PK_ScaleConvert(nullptr, 0, size, size, 0x1c4, 9, nullptr, 0, 0, size, 0x1c4, 9, 99),
                  PK_ErrNullSource);
        EXPECT_EQ(PK_ScaleConvert(pixel, 0, size, size, 0x1c4, 9, nullptr, 0, 0, size, 0x1c4, 9, 99),
                  PK_ErrNullDestination);
        EXPECT_EQ(PK_ScaleConvertOneField(nullptr, 0, size, 0, kBGRA, 0, pixel, 0, 0, 0, kBGRA, 0, 2, 1),
                  PK_ErrNullSource);
    }
}

TEST(ScaleConvert, RefusesWhatCannotBeAnImage) {
    uint8_t from[64] = {}, to[64] = {};
    const auto scale = [&](int32_t width, int32_t height, PK_PixelFormat source, int32_t toWidth,
                           int32_t toHeight, PK_PixelFormat destination) {
        return PK_ScaleConvert(from, 0, width, height, source, 0, to, 0, toWidth, toHeight, destination, 0,
                               2);
    };
    for (const PK_PixelFormat stranger : {PK_PixelFormat{0}, 0x1805u, 0x1c4u, 0xffffffffu, 0x09000811u}) {
        EXPECT_EQ(scale(4, 2, stranger, 2, 1, kBGRA), PK_ErrBadSrcFormat) << std::hex << stranger;
        EXPECT_EQ(scale(4, 2, kUYVY, 2, 1, stranger), PK_ErrBadDstFormat) << std::hex << stranger;
        EXPECT_EQ(scale(-1, 2, stranger, 2, 1, stranger), PK_ErrBadSrcFormat) << "formats come first";
    }
    EXPECT_EQ(scale(-2, 2, kUYVY, -1, 1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(2, -2, kUYVY, 1, -1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(2, 2, kBGRA, 3, -1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(INT32_MIN, 2, kBGRA, 3, 1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(INT32_MAX, 2, kBGRA, 3, 1, kBGRA), PK_ErrFailed);
    // Planes whose places 32 bits cannot tell.
    EXPECT_EQ(scale(64, 1 << 24, PK_PixelFormat_YUV_420_MPEG2_FRAME, 3, 1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(3, 1, kBGRA, 64, 1 << 24, PK_PixelFormat_YUV_420_MPEG2_FRAME), PK_ErrFailed);
    EXPECT_EQ(scale(3, 1, kBGRA, INT32_MAX, 1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(-1, 1, kPlanes, 3, 1, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(0, 0, kBGRA, 2, 1, kBGRA), PK_Success) << "nothing is drawn";
    EXPECT_EQ(scale(3, 1, kBGRA, 0, 1, kBGRA), PK_Success);
    EXPECT_EQ(scale(3, 1, kUYVY, 3, 0, kPlanes), PK_Success);
    EXPECT_EQ(scale(0, 4, kUYVY, 0, 2, kBGRA), PK_Success);
    EXPECT_EQ(scale(3, 1, kPlanes, 3, 0, kPlanes), PK_Success) << "a field without rows";
    EXPECT_EQ(scale(100000, 100000, kPlanes, 100000, 50000, kPlanes), PK_ErrFailed)
        << "planes without offsets";
    for (const uint8_t byte : to) EXPECT_EQ(byte, 0);
}

TEST(ScaleConvert, AConversionAnswersAsPKConvert) {
    uint8_t from[64] = {1}, to[64] = {};
    for (const auto& [width, height, format] : {std::tuple{-1, 1, kBGRA}, {1, -1, kBGRA}, {1, 1, 0x1c4u}})
        EXPECT_EQ(PK_ScaleConvert(from, 4, width, height, format, 0, to, 4, width, height, kBGRA, 0, 2),
                  PK_Convert(from, 4, format, to, 4, kBGRA, width, height, 2));
}

TEST(ScaleConvert, RowBytesOfFieldsAreTheDouble) {
    uint8_t from[64] = {}, to[64] = {};
    for (const int32_t quality : {2, 3})
        EXPECT_EQ(PK_ScaleConvert(from, 0x40000000, 1, 2, kBGRA, 1, to, 4, 1, 1, kBGRA, 0, quality),
                  PK_ErrFailed);
}

TEST(ScaleConvert, AFieldOfDVHasTheRowsOfItsParity) {
    constexpr int32_t kWidth = 720, kHeight = 480, kRowBytes = 2 * kWidth;
    std::vector<uint8_t> picture(kRowBytes * kHeight), whole(picture.size());
    for (size_t i = 0; i < picture.size(); ++i)
        picture[i] = static_cast<uint8_t>(100 + (i / kRowBytes % 2 == 0 ? 40 : 0) + i % 13);
    for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_NTSCDV50}) {
        const PK_PixelFormat pairs =
            stream == PK_PixelFormat_NTSCDV25 ? PK_PixelFormat_UYVY_422_8u : PK_PixelFormat_YUYV_422_8u;
        std::vector<uint8_t> frame(static_cast<size_t>(PK_PixelFormatSize(stream, 0, 0)));
        ASSERT_EQ(PK_Convert(picture.data(), kRowBytes, pairs, frame.data(),
                             static_cast<int32_t>(frame.size()), stream, kWidth, kHeight, 2),
                  PK_Success);
        ASSERT_EQ(PK_Convert(frame.data(), 0, stream, whole.data(), kRowBytes, pairs, kWidth, kHeight, 2),
                  PK_Success);
        for (const int32_t field : {0, 1, 2})
            for (const int32_t quality : {2, 3}) {
                std::vector<uint8_t> rows(whole.size() / 2);
                ASSERT_EQ(PK_ScaleConvert(frame.data(), 0, kWidth, kHeight, stream, field, rows.data(),
                                          kRowBytes, kWidth, kHeight / 2, pairs, 0, quality),
                          PK_Success);
                for (int32_t row = 0; row < kHeight / 2; ++row) {
                    const auto expected = whole.begin() + kRowBytes * (2 * row + (field == 2 ? 1 : 0));
                    ASSERT_TRUE(std::equal(expected, expected + kRowBytes, rows.begin() + kRowBytes * row))
                        << "field " << field << ", row " << row;
                }
            }
    }
}

TEST(ScaleConvert, OfPlanesChecksItsArgumentsInOrder) {
    uint8_t bytes[64] = {};
    const void* const planes[3] = {bytes, bytes, bytes};
    const void* const without[3] = {bytes, nullptr, bytes};
    const int32_t rowBytes[3] = {8, 8, 8};
    const auto scale = [&](const void* const from[3], const int32_t steps[3], PK_PixelFormat source,
                           int32_t width, void* to, PK_PixelFormat destination) {
        return PK_ScaleConvertPlanar(from, steps, width, 2, source, 0, to, 8, 1, 1, destination, 0, 2);
    };
    EXPECT_EQ(scale(nullptr, nullptr, kUYVY, -1, nullptr, kPlanes), PK_ErrBadSrcFormat);
    EXPECT_EQ(scale(nullptr, nullptr, kPlanes, -1, nullptr, kPlanes), PK_ErrBadDstFormat);
    EXPECT_EQ(scale(planes, rowBytes, kPlanes, 2, bytes, kPlanes), PK_ErrBadDstFormat);
    EXPECT_EQ(scale(planes, rowBytes, kPlanes, 2, bytes, 0x1c4), PK_ErrBadDstFormat);
    EXPECT_EQ(scale(nullptr, nullptr, kPlanes, -1, nullptr, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(nullptr, nullptr, kPlanes, 0, nullptr, kBGRA), PK_Success);
    EXPECT_EQ(scale(nullptr, rowBytes, kPlanes, 2, bytes, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(planes, nullptr, kPlanes, 2, bytes, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(without, rowBytes, kPlanes, 2, bytes, kBGRA), PK_ErrFailed);
    EXPECT_EQ(scale(planes, rowBytes, kPlanes, 2, nullptr, kBGRA), PK_ErrNullDestination);
    for (const int32_t step : {9, -9}) {
        const int32_t tooFew[3] = {step, 8, 8};
        EXPECT_EQ(scale(planes, tooFew, kPlanes, 10, bytes, kBGRA), PK_ErrFailed) << "rows within each other";
    }
}

TEST(ScaleConvert, LeavesTheFloatingPointModeAndFlushesDenormals) {
    const FloatEnvironment environment(kRoundDown);
    const float source[2][8] = {{}, {0, 1e-40f, 0, 0, 0, 1e-40f, 0, 0}};
    float pixels[2][4];
    ASSERT_EQ(
        Scale(source, 4, 2, PK_PixelFormat_UYVY_422_32f, 0, pixels, 2, 1, PK_PixelFormat_BGRP_4444_32f, 0, 2),
        PK_Success);
    EXPECT_EQ(pixels[0][1], 0) << "as PK_Convert gives it";
    EXPECT_TRUE(environment.IsAsGiven());
    const uint8_t picture[3][8] = {};
    uint8_t scaled[5][8];
    ASSERT_EQ(Scale(picture, 4, 3, kUYVY, 0, scaled, 2, 5, kBGRA, 0, 4), PK_Success);
    EXPECT_TRUE(environment.IsAsGiven());
}

} // namespace
