// The fills: what is written of each format, byte by byte, and what is refused.

#include "support/GuardedImage.h"
#include "support/Random.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

namespace {

using Bytes = std::vector<uint8_t>;
using Fill = PK_Result (*)(void*, int32_t, int32_t, int32_t, PK_PixelFormat) noexcept;

constexpr uint8_t kUntouched = 0x5a;
constexpr PK_PixelFormat kMalformed420 = 0x09000011;
constexpr PK_PixelFormat kUnknownStream = 0x0d000831;

template <class Sample>
Bytes BytesOf(std::initializer_list<Sample> samples) {
    Bytes bytes(samples.size() * sizeof(Sample));
    std::memcpy(bytes.data(), samples.begin(), bytes.size());
    return bytes;
}

/// A raster fill writes `units` of a pattern into row `row`.
using UnitsOfRow = std::function<int32_t(int32_t row)>;

// Fills rows between guard pages, padded or not, in either direction, and compares all bytes.
void CheckRows(const std::function<PK_Result(void*, int32_t, int32_t, int32_t)>& fill, PK_Result result,
               PK_PixelFormat format, const Bytes& unit, int32_t width, const UnitsOfRow& units) {
    constexpr int32_t kHeight = 3;
    const auto rowLength = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
    Random random(19);
    for (const size_t padding : {0, 13}) {
        for (const bool upwards : {false, true}) {
            SCOPED_TRACE(testing::Message() << PK_PixelFormatName(format) << ", width " << width
                                            << ", padding " << padding << ", upwards " << upwards);
            const GuardedImage image({rowLength, kHeight, padding, upwards}, random);
            std::vector<Bytes> expected(kHeight);
            for (int32_t row = 0; row < kHeight; ++row)
                for (int32_t i = 0; i < units(row); ++i) {
                    Bytes& bytes = expected[static_cast<size_t>(row)];
                    bytes.insert(bytes.end(), unit.begin(), unit.end());
                }
            ASSERT_EQ(fill(image.Pixels(), image.RowBytes(), width, kHeight), result);
            ASSERT_NO_FATAL_FAILURE(image.ExpectRows(expected));
        }
    }
}

void CheckNamed(Fill fill, PK_PixelFormat format, const Bytes& unit, int32_t unitPixels) {
    const auto call = [=](void* buffer, int32_t rowBytes, int32_t width, int32_t height) {
        return fill(buffer, rowBytes, width, height, format);
    };
    for (const int32_t width : {1, 2, 3, 6, 7, 12, 65, 258})
        CheckRows(call, PK_Success, format, unit, width,
                  [=](int32_t) { return unitPixels == 6 ? (width + 5) / 6 : width / unitPixels; });
}

/// The four samples of a fill by name, in the order of the format.
template <class Sample>
struct Table {
    Sample full, chroma, black, white;
};
constexpr Table<uint8_t> kTable8 = {255, 128, 16, 235};
constexpr Table<uint16_t> kTable15 = {32768, 0, 0, 0};
constexpr Table<float> kTable32f = {1, 0, 0, 1};

template <class Sample>
Bytes ExpectedUnit(PK_PixelFormat format, bool white, bool opaque, const Table<Sample>& table) {
    const Sample luma = white ? table.white : table.black, light = white ? table.full : Sample{0};
    const Sample alpha = opaque ? table.full : Sample{0};
    const bool otherOrder = (format & 0x1000) != 0;
    if (PK::Is422(format))
        return otherOrder ? BytesOf({luma, table.chroma, luma, table.chroma})
                          : BytesOf({table.chroma, luma, table.chroma, luma});
    if (PK::IsYUV(format)) return BytesOf({table.chroma, table.chroma, luma, alpha});
    return otherOrder ? BytesOf({alpha, light, light, light}) : BytesOf({light, light, light, alpha});
}

Bytes ExpectedUnit(PK_PixelFormat format, bool white, bool opaque) {
    switch (format & PK::kDepthMask) {
    case PK::kDepth8u:
        return ExpectedUnit(format, white, opaque, kTable8);
    case PK::kDepth15u:
        return ExpectedUnit(format, white, opaque, kTable15);
    default:
        return ExpectedUnit(format, white, opaque, kTable32f);
    }
}

Bytes V210Group(uint32_t v, uint32_t u, uint32_t y) {
    return BytesOf<uint32_t>(
        {u | y << 10 | v << 20, y | u << 10 | y << 20, v | y << 10 | u << 20, y | v << 10 | y << 20});
}

bool HasUnit(PK_PixelFormat format) {
    return format != PK_PixelFormat_RGB_444_10u && !PK::IsV210(format);
}

} // namespace

TEST(NamedFills, WriteTheTabledSamplesOfEveryRasterFormat) {
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        if (!HasUnit(format)) continue;
        const int32_t pixels = PK::Is422(format) ? 2 : 1;
        CheckNamed(PK_FillWithOpaqueBlack, format, ExpectedUnit(format, false, true), pixels);
        CheckNamed(PK_FillWithOpaqueWhite, format, ExpectedUnit(format, true, true), pixels);
        if (PK::HasNoAlphaMeaning(format)) continue;
        const bool straight = (format & PK::kAlphaMask) == PK::kAlphaStraight;
        CheckNamed(PK_FillWithTransparentBlack, format, ExpectedUnit(format, false, false), pixels);
        CheckNamed(PK_FillWithTransparentWhite, format, ExpectedUnit(format, straight, false), pixels);
    }
}

TEST(NamedFills, WriteWhatIsWorkedOutByHand) {
    CheckNamed(PK_FillWithTransparentWhite, PK_PixelFormat_BGRP_4444_8u, {0, 0, 0, 0}, 1);
    CheckNamed(PK_FillWithTransparentWhite, PK_PixelFormat_BGRA_4444_8u, {255, 255, 255, 0}, 1);
    CheckNamed(PK_FillWithTransparentWhite, PK_PixelFormat_VUYP_4444_8u, {128, 128, 16, 0}, 1);
    CheckNamed(PK_FillWithOpaqueBlack, PK_PixelFormat_ARGB_4444_15u, {0, 0x80, 0, 0, 0, 0, 0, 0}, 1);
    CheckNamed(PK_FillWithOpaqueWhite, PK_PixelFormat_BGRA_4444_15u, {0, 0x80, 0, 0x80, 0, 0x80, 0, 0x80}, 1);
    CheckNamed(PK_FillWithOpaqueWhite, PK_PixelFormat_YUYV_422_8u, {235, 128, 235, 128}, 2);
    CheckNamed(PK_FillWithOpaqueBlack, PK_PixelFormat_UYVY_422_32f_709, BytesOf<float>({0, 0, 0, 0}), 2);
    CheckNamed(PK_FillWithOpaqueWhite, PK_PixelFormat_UYVY_422_32f, BytesOf<float>({0, 1, 0, 1}), 2);
}

TEST(NamedFills, FillWholeGroupsOfV210) {
    for (const PK_PixelFormat format : {PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u_709}) {
        CheckNamed(PK_FillWithOpaqueBlack, format, V210Group(512, 512, 64), 6);
        CheckNamed(PK_FillWithOpaqueWhite, format, V210Group(512, 512, 940), 6);
    }
}

TEST(NamedFills, RefuseTransparencyThatAFormatLacks) {
    uint8_t pixels[64] = {7};
    for (const Fill fill : {PK_FillWithTransparentBlack, PK_FillWithTransparentWhite}) {
        for (const PK_PixelFormat format :
             {PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u,
              PK_PixelFormat_RGB_444_10u, PK_PixelFormat_NTSCDV25, PK_PixelFormat_NTSCDV50,
              PK_PixelFormat_YUV_420_MPEG2_FRAME, kUnknownStream, PK_PixelFormat_Invalid}) {
            EXPECT_EQ(fill(pixels, 64, 1, 1, format), PK_ErrBadDstFormat) << PK_PixelFormatName(format);
            EXPECT_EQ(fill(nullptr, 64, -1, 1, format), PK_ErrBadDstFormat);
        }
    }
    EXPECT_EQ(pixels[0], 7);
}

TEST(NamedFills, RefuseOrLeaveWhatTheyCannotFill) {
    uint8_t pixels[64] = {7};
    for (const Fill fill : {PK_FillWithOpaqueBlack, PK_FillWithOpaqueWhite}) {
        EXPECT_EQ(fill(pixels, 64, 1, 1, PK_PixelFormat_RGB_444_10u), PK_ErrNotSupported);
        EXPECT_EQ(fill(pixels, 64, 1, 1, PK_PixelFormat_Invalid), PK_ErrNotSupported);
        EXPECT_EQ(fill(pixels, 64, 1, 1, 0x1c4), PK_ErrNotSupported);
        EXPECT_EQ(fill(nullptr, 64, 1, 1, PK_PixelFormat_NTSCDV25), PK_ErrFailed);
        EXPECT_EQ(fill(pixels, 64, 1, 1, kMalformed420), PK_ErrBadSrcFormat);
        EXPECT_EQ(fill(pixels, 64, 1, 1, kUnknownStream), PK_ErrBadSrcFormat);
        for (const PK_PixelFormat format :
             {PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_PAL_DV100_720p, PK_PixelFormat_NTSC_DV100_1080i,
              PK_PixelFormat_PAL_DV100_1080i, PK_PixelFormat_NTSCDV50, PK_PixelFormat_PALDV50})
            EXPECT_EQ(fill(pixels, 64, 1, 1, format), PK_Success);
        EXPECT_EQ(fill(nullptr, 64, 1, 1, PK_PixelFormat_BGRA_4444_8u), PK_ErrFailed);
        EXPECT_EQ(fill(pixels, 64, -1, 1, PK_PixelFormat_BGRA_4444_8u), PK_ErrFailed);
        EXPECT_EQ(fill(pixels, 64, 0x08000000, 1, PK_PixelFormat_BGRA_4444_8u), PK_ErrFailed);
        EXPECT_EQ(fill(pixels, 64, INT32_MAX, 1, PK_PixelFormat_V210_422_10u), PK_ErrFailed);
        EXPECT_EQ(fill(pixels, 64, 1, -1, PK_PixelFormat_V210_422_10u), PK_ErrFailed);
        EXPECT_EQ(fill(nullptr, 64, 0, 1, PK_PixelFormat_BGRA_4444_8u), PK_Success);
        EXPECT_EQ(fill(nullptr, 64, 1, 0, PK_PixelFormat_V210_422_10u), PK_Success);
    }
    EXPECT_EQ(pixels[0], 7);
}

namespace {

// Compares a block of planes with planes that are filled row by row.
void CheckPlanes(const std::function<PK_Result(void*, int32_t, int32_t)>& fill, PK_PixelFormat format,
                 int32_t width, int32_t height, const uint8_t (&yuv)[3]) {
    SCOPED_TRACE(testing::Message() << PK_PixelFormatName(format) << ", " << width << " x " << height);
    const GuardedRows block(static_cast<size_t>(PK_PixelFormatSize(format, width, height)), Guard::kAfter);
    Bytes expected(block.Size(), kUntouched);
    std::copy(expected.begin(), expected.end(), block.Bytes());
    void* planes[3];
    int32_t rowBytes[3];
    ASSERT_EQ(PK_GetPlanarBuffers(expected.data(), format, width, height, planes, rowBytes), PK_Success);
    for (int p = 0; p < 3; ++p)
        for (int32_t row = 0; row < (p == 0 ? height : height / 2); ++row)
            std::fill_n(static_cast<uint8_t*>(planes[p]) + row * rowBytes[p], p == 0 ? width : width / 2,
                        yuv[p]);
    ASSERT_EQ(fill(block.Bytes(), width, height), PK_Success);
    ASSERT_TRUE(std::equal(expected.begin(), expected.end(), block.Bytes()));
}

constexpr PK_PixelFormat kPlanar[] = {PK_PixelFormat_YUV_420_MPEG2_FIELD,
                                      PK_PixelFormat_YUV_420_MPEG4_FRAME_709,
                                      PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange};

} // namespace

TEST(NamedFills, FillPlanesWithTheSameCodesInEveryRange) {
    for (const PK_PixelFormat format : kPlanar) {
        for (const auto& [width, height] : {std::pair{1, 1}, {7, 5}, {128, 32}, {130, 66}}) {
            const auto call = [&](Fill fill) {
                return [=](void* block, int32_t w, int32_t h) { return fill(block, 0, w, h, format); };
            };
            CheckPlanes(call(PK_FillWithOpaqueBlack), format, width, height, {16, 128, 128});
            CheckPlanes(call(PK_FillWithOpaqueWhite), format, width, height, {235, 128, 128});
        }
        uint8_t byte = 0;
        EXPECT_EQ(PK_FillWithOpaqueBlack(nullptr, 0, 8, 8, format), PK_ErrFailed);
        EXPECT_EQ(PK_FillWithOpaqueBlack(&byte, 0, -8, 8, format), PK_ErrFailed);
        EXPECT_EQ(PK_FillWithOpaqueBlack(&byte, 0, INT32_MAX, INT32_MAX, format), PK_ErrFailed);
        EXPECT_EQ(PK_FillWithOpaqueBlack(&byte, 0, 65536, 65536, format), PK_ErrFailed);
        EXPECT_EQ(PK_FillWithOpaqueBlack(nullptr, 0, 0, 8, format), PK_Success);
    }
}

namespace {

Bytes Converted(const Bytes& source, PK_PixelFormat sourceFormat, PK_PixelFormat format, int32_t width) {
    Bytes result(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)));
    EXPECT_EQ(PK_Convert(source.data(), 0, sourceFormat, result.data(), 0, format, width, 1, 4), PK_Success);
    return result;
}

void CheckColour(PK_PixelFormat format, const Bytes& pixel, PK_PixelFormat pixelFormat, const Bytes& unit) {
    const auto call = [&](void* buffer, int32_t rowBytes, int32_t width, int32_t height) {
        return PK_FillWithColor(buffer, rowBytes, width, height, format, pixel.data(), pixelFormat);
    };
    for (const int32_t width : {1, 2, 3, 6, 7, 12, 35}) {
        if (PK::IsV210(format))
            CheckRows(call, PK_ErrBadDstFormat, format, unit, width,
                      [=](int32_t row) { return row == 0 ? (width + 5) / 6 : width / 6; });
        else
            CheckRows(call, PK_Success, format, unit, width,
                      [=](int32_t) { return PK::Is422(format) ? width / 2 : width; });
    }
}

Bytes PixelOf(PK_PixelFormat format, Random& random) {
    const auto size = static_cast<size_t>(PK::BytesPerPixel(format));
    if ((format & PK::kDepthMask) != PK::kDepth32f) return random.Bytes(size);
    Bytes pixel;
    for (size_t i = 0; i < size / 4; ++i) {
        const Bytes sample = BytesOf({static_cast<float>(random.Below(1000)) * 0.001f});
        pixel.insert(pixel.end(), sample.begin(), sample.end());
    }
    return pixel;
}

} // namespace

TEST(FillWithColor, WritesWhatIsWorkedOutByHand) {
    const Bytes red = {0, 0, 255, 255};
    CheckColour(PK_PixelFormat_BGRA_4444_8u, red, PK_PixelFormat_BGRA_4444_8u, red);
    CheckColour(PK_PixelFormat_ARGB_4444_32f, red, PK_PixelFormat_BGRA_4444_8u, BytesOf<float>({1, 1, 0, 0}));
    CheckColour(PK_PixelFormat_BGRA_4444_15u, red, PK_PixelFormat_BGRA_4444_8u,
                BytesOf<uint16_t>({0, 0, 32768, 32768}));
    // U, Y, V, Y of white over black at half: alpha 0 leaves black
    CheckColour(PK_PixelFormat_UYVY_422_8u, {255, 255, 255, 0}, PK_PixelFormat_BGRA_4444_8u,
                {128, 16, 128, 16});
    CheckColour(PK_PixelFormat_YUYV_422_8u, {100, 90, 50, 255}, PK_PixelFormat_VUYA_4444_8u,
                {50, 90, 50, 100});
    // The chroma sample of a lone pixel of 4:2:2 stands for both.
    CheckColour(PK_PixelFormat_VUYA_4444_8u, {120, 60}, PK_PixelFormat_UYVY_422_8u, {120, 120, 60, 255});
}

TEST(FillWithColor, FillsV210AndStillRefusesIt) {
    // The samples are those of VUYA with matrix 601, straight, for both matrices.
    const Bytes pixel = {100, 90, 50, 40};
    for (const PK_PixelFormat format : {PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u_709})
        CheckColour(format, pixel, PK_PixelFormat_VUYA_4444_8u, V210Group(400, 360, 200));
    uint8_t row[16] = {7};
    EXPECT_EQ(PK_FillWithColor(row, 16, 0, 1, PK_PixelFormat_V210_422_10u, pixel.data(),
                               PK_PixelFormat_VUYA_4444_8u),
              PK_ErrBadDstFormat);
    EXPECT_EQ(row[0], 7);
}

TEST(FillWithColor, WritesTheConvertedPixelOfEveryPairOfFormats) {
    Random random(61);
    for (const PK_PixelFormat pixelFormat : PK::kRasterFormats) {
        if (PK::IsV210(pixelFormat)) continue;
        const Bytes pixel = PixelOf(pixelFormat, random);
        Bytes pair = pixel;
        pair.insert(pair.end(), pixel.begin(), pixel.end());
        for (const PK_PixelFormat format : PK::kRasterFormats) {
            if (!HasUnit(format)) continue;
            const Bytes unit = Converted(pair, pixelFormat, format, PK::Is422(format) ? 2 : 1);
            const auto size = static_cast<int32_t>(unit.size());
            const int32_t units = 5, width = PK::Is422(format) ? 2 * units + 1 : units;
            Bytes row(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)), kUntouched);
            Bytes expected = row;
            for (int32_t i = 0; i < units * size; ++i)
                expected[static_cast<size_t>(i)] = unit[static_cast<size_t>(i % size)];
            ASSERT_EQ(PK_FillWithColor(row.data(), 0, width, 1, format, pixel.data(), pixelFormat),
                      PK_Success);
            ASSERT_EQ(row, expected) << PK_PixelFormatName(pixelFormat) << " to "
                                     << PK_PixelFormatName(format) << ", seed " << random.Seed();
        }
    }
}

TEST(FillWithColor, FillsPlanesWithThePixelOverBlack) {
    const Bytes pixel = {40, 200, 90, 128};
    for (const PK_PixelFormat format : kPlanar) {
        const bool is601 = (format & PK::kMatrixMask) == 0;
        const Bytes vuyp =
            Converted(pixel, PK_PixelFormat_BGRA_4444_8u,
                      is601 ? PK_PixelFormat_VUYP_4444_8u : PK_PixelFormat_VUYP_4444_8u_709, 1);
        CheckPlanes(
            [&](void* block, int32_t width, int32_t height) {
                return PK_FillWithColor(block, 0, width, height, format, pixel.data(),
                                        PK_PixelFormat_BGRA_4444_8u);
            },
            format, 131, 35, {vuyp[2], vuyp[1], vuyp[0]});
    }
}

TEST(FillWithColor, TakesAPixelOfTheImageItself) {
    uint8_t image[32] = {1, 2, 3, 4};
    std::fill(image + 4, image + 32, uint8_t{9});
    ASSERT_EQ(
        PK_FillWithColor(image, 16, 4, 2, PK_PixelFormat_BGRA_4444_8u, image, PK_PixelFormat_BGRA_4444_8u),
        PK_Success);
    for (int i = 0; i < 32; ++i) EXPECT_EQ(image[i], i % 4 + 1);
}

TEST(FillWithColor, RefusesWhatItCannotFill) {
    uint8_t pixels[64] = {7};
    const uint8_t colour[16] = {};
    const auto fill = [&](PK_PixelFormat format, PK_PixelFormat pixelFormat) {
        return PK_FillWithColor(pixels, 64, 1, 1, format, colour, pixelFormat);
    };
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
    for (const PK_PixelFormat format :
         {PK_PixelFormat_RGB_444_10u, PK_PixelFormat_NTSCDV25, PK_PixelFormat_NTSCDV50, kMalformed420,
          kUnknownStream, PK_PixelFormat_Invalid, PK_PixelFormat{0x2004}})
        EXPECT_EQ(fill(format, kBGRA), PK_ErrBadDstFormat) << PK_PixelFormatName(format);
    for (const PK_PixelFormat format :
         {PK_PixelFormat_V210_422_10u, PK_PixelFormat_NTSCDV25, PK_PixelFormat_Invalid,
          PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat{0x2004}})
        EXPECT_EQ(fill(kBGRA, format), PK_ErrBadSrcFormat) << PK_PixelFormatName(format);
    EXPECT_EQ(PK_FillWithColor(nullptr, 64, 1, 1, kBGRA, colour, kBGRA), PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(pixels, 64, 1, 1, kBGRA, nullptr, kBGRA), PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(pixels, 64, -1, 1, kBGRA, colour, kBGRA), PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(pixels, 64, INT32_MAX, 1, kBGRA, colour, kBGRA), PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(pixels, 64, INT32_MAX, 1, PK_PixelFormat_V210_422_10u, colour, kBGRA),
              PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(pixels, 64, 1, -1, kBGRA, colour, kBGRA), PK_ErrFailed);
    EXPECT_EQ(PK_FillWithColor(nullptr, 64, 0, 1, kBGRA, nullptr, kBGRA), PK_Success);
    EXPECT_EQ(pixels[0], 7);
}
