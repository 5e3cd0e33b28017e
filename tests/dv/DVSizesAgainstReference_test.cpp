// Fields, reduced sizes and kinds of output of DV frames, held to what the reference's planes say of them.

#include "dv/DVExpected.h"
#include "support/DVFrames.h"

#include <PixelKiln/ScaleConvert.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>

namespace {

using namespace PKTest;
using Bytes = std::vector<uint8_t>;

constexpr PK_PixelFormat kVUYX = PK_PixelFormat_VUYX_4444_8u;

struct Stored {
    DVKind kind;
    const char* name;

    bool IsDV25() const { return kind <= DVKind::k625of420; }
    const DVLayout& Layout() const { return LayoutOf(kind); }
    PK_PixelFormat Native() const {
        if (IsDV25()) return PK_PixelFormat_UYVY_422_8u;
        return Layout().isDV100 ? PK_PixelFormat_YUYV_422_8u_709 : PK_PixelFormat_YUYV_422_8u;
    }
    PK_PixelFormat Reduced() const {
        return Layout().isDV100 ? PK_PixelFormat_VUYA_4444_8u_709 : PK_PixelFormat_VUYA_4444_8u;
    }
};
constexpr Stored kDV25[] = {{DVKind::k525of411, "dv25_525_411_astronaut"},
                            {DVKind::k625of411, "dv25_625_411_chelsea"},
                            {DVKind::k625of420, "dv25_625_420_coffee"},
                            {DVKind::k525of411, "stress_dv25_525_411"}};
constexpr Stored kLarger[] = {
    {DVKind::k525of422, "dv50_525_coffee"},           {DVKind::k625of422, "dv50_625_astronaut"},
    {DVKind::k720p60, "dv100_720p60_chelsea_second"}, {DVKind::k720p50, "dv100_720p50_astronaut"},
    {DVKind::k1080i60, "dv100_1080i60_coffee"},       {DVKind::k1080i50, "dv100_1080i50_astronaut"}};
std::vector<Stored> All() {
    std::vector<Stored> all(std::begin(kDV25), std::end(kDV25));
    all.insert(all.end(), std::begin(kLarger), std::end(kLarger));
    return all;
}

DVPixels ExpectedOf(const Stored& stored, const Bytes& frame) {
    return DVExpectedPixels(stored.kind, ReferenceDVPicture(stored.kind, frame.data()));
}

/// PK_ScaleConvert into packed rows.
DVDecoded Scaled(const Stored& stored, const Bytes& frame, PK_PixelFormat format, int width, int height,
                 int field, int quality) {
    const int32_t rowBytes = PK_PixelFormatPackedRowBytes(format, width);
    DVDecoded decoded{PK_ErrFailed, Bytes(static_cast<size_t>(rowBytes) * static_cast<size_t>(height), 0xa5)};
    decoded.result = PK_ScaleConvert(frame.data(), 0, stored.Layout().width, stored.Layout().height,
                                     stored.Layout().format, field, decoded.rows.data(), rowBytes, width,
                                     height, format, 0, quality);
    return decoded;
}

/// Of one component, in dB.
double PSNR(const DVPixels& a, const DVPixels& b, size_t component) {
    double sum = 0;
    for (size_t i = 0; i < a.pixels.size(); ++i) {
        const double off = a.pixels[i][component] - b.pixels.at(i)[component];
        sum += off * off;
    }
    return 10 * std::log10(255 * 255 * static_cast<double>(a.pixels.size()) / std::max(sum, 1e-9));
}

/// Means of squares of pixels.
DVPixels BoxMeans(const DVPixels& picture, int side) {
    DVPixels small(picture.width / side, picture.height / side);
    for (int y = 0; y < small.height; ++y)
        for (int x = 0; x < small.width; ++x)
            for (size_t i = 0; i < 3; ++i) {
                int sum = 0;
                for (int k = 0; k < side * side; ++k)
                    sum += picture.At(x * side + k % side, y * side + k / side)[i];
                small.At(x, y)[i] = (sum + side * side / 2) / (side * side);
            }
    return small;
}

TEST(DVSizes, AFieldHasItsRows) {
    for (const Stored& stored : All()) {
        SCOPED_TRACE(stored.name);
        const Bytes frame = ReadDVFrame(stored.name);
        const DVPixels whole = ExpectedOf(stored, frame);
        const int width = whole.width, height = whole.height / 2;
        std::vector<PK_PixelFormat> formats = {stored.Native()};
        if (stored.IsDV25()) formats.push_back(kVUYX);
        for (const PK_PixelFormat format : formats)
            for (int field = 0; field <= 2; ++field)
                for (const int quality : {0, 2, 3, 5}) {
                    SCOPED_TRACE(std::string(PK_PixelFormatName(format)) + " field " + std::to_string(field));
                    const auto [result, rows] = Scaled(stored, frame, format, width, height, field, quality);
                    ASSERT_EQ(result, PK_Success);
                    EXPECT_EQ(DVDifference(OneFieldOf(whole, field == 2 ? 1 : 0),
                                           DVPixelsFromMemory(rows, format, width, height), format != kVUYX,
                                           1),
                              "");
                    const auto converted =
                        DecodeDV(stored.Layout().format, frame.data(), format, width, height, quality);
                    ASSERT_EQ(converted.result, PK_Success);
                    EXPECT_EQ(converted.rows == rows, field != 2);
                }
    }
}

/// By the matrix of 601, from the pixels of VUYX; opaque, and stored from the bottom.
TEST(DVSizes, RGBComesFromTheSamePixels) {
    for (const Stored& stored : kDV25) {
        const Bytes frame = ReadDVFrame(stored.name);
        const int width = 720, height = stored.Layout().height;
        for (const int lines : {height, height / 2, height / 4, height / 8}) {
            const int columns = lines < height / 2 ? width * lines / height : width;
            SCOPED_TRACE(std::string(stored.name) + " " + std::to_string(columns));
            const int quality = lines < height / 2 ? 0 : 3;
            const auto yuv = DecodeDV(stored.Layout().format, frame.data(), kVUYX, columns, lines, quality);
            ASSERT_EQ(yuv.result, PK_Success);
            for (const PK_PixelFormat format :
                 {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u}) {
                const auto rgb =
                    DecodeDV(stored.Layout().format, frame.data(), format, columns, lines, quality);
                ASSERT_EQ(rgb.result, PK_Success);
                size_t off = 0;
                for (size_t i = 0; i < rgb.rows.size(); i += 4) {
                    const double y = 1.1643828 * (yuv.rows[i + 2] - 16), u = yuv.rows[i + 1] - 128,
                                 v = yuv.rows[i] - 128;
                    const double expected[4] = {y + 2.0172305 * u, y - 0.39176172 * u - 0.81296873 * v,
                                                y + 1.5960274 * v, 255};
                    for (size_t k = 0; k < 4; ++k)
                        off += std::abs(std::clamp(expected[k], 0.0, 255.0) - rgb.rows[i + k]) > 0.51;
                }
                EXPECT_EQ(off, 0u) << PK_PixelFormatName(format);
            }
            for (const PK_PixelFormat format : {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYP_4444_8u})
                EXPECT_EQ(
                    DecodeDV(stored.Layout().format, frame.data(), format, columns, lines, quality).rows,
                    yuv.rows);
            for (size_t i = 3; i < yuv.rows.size(); i += 4) ASSERT_EQ(yuv.rows[i], 255);
        }
    }
}

TEST(DVSizes, FullSizeDoesNotDependOnQuality) {
    for (const Stored& stored : All()) {
        const Bytes frame = ReadDVFrame(stored.name);
        const DVLayout& layout = stored.Layout();
        const Bytes best =
            DecodeDV(layout.format, frame.data(), stored.Native(), layout.width, layout.height, 5).rows;
        for (int quality = 0; quality < 5; ++quality)
            EXPECT_EQ(
                DecodeDV(layout.format, frame.data(), stored.Native(), layout.width, layout.height, quality)
                    .rows,
                best)
                << stored.name << ", quality " << quality;
    }
}

/// What no decoder makes is converted from what it does make.
TEST(DVSizes, OtherFormatsAreConverted) {
    for (const Stored& stored : All()) {
        const Bytes frame = ReadDVFrame(stored.name);
        const DVLayout& layout = stored.Layout();
        for (const PK_PixelFormat format :
             {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_UYVY_422_8u_709, PK_PixelFormat_V210_422_10u,
              PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_VUYX_4444_32f}) {
            PK_PixelFormat first = stored.Native();
            if (format == PK_PixelFormat_ARGB_4444_8u && stored.IsDV25()) first = PK_PixelFormat_BGRX_4444_8u;
            if (format == PK_PixelFormat_VUYX_4444_32f && stored.IsDV25()) first = kVUYX;
            if (format == first) continue;
            const Bytes made =
                DecodeDV(layout.format, frame.data(), first, layout.width, layout.height, 3).rows;
            const auto rowBytes = PK_PixelFormatPackedRowBytes(format, layout.width);
            Bytes expected(static_cast<size_t>(rowBytes) * static_cast<size_t>(layout.height));
            ASSERT_EQ(PK_Convert(made.data(), PK_PixelFormatPackedRowBytes(first, layout.width), first,
                                 expected.data(), rowBytes, format, layout.width, layout.height, 3),
                      PK_Success);
            EXPECT_EQ(DecodeDV(layout.format, frame.data(), format, layout.width, layout.height, 3).rows ==
                          expected,
                      true)
                << stored.name << " to " << PK_PixelFormatName(format);
        }
    }
}

/// Each pixel is the DC of its block, without its last bit; chroma is repeated.
TEST(DVSizes, AnEighthIsOfDCAlone) {
    for (const Stored& stored : kDV25) {
        SCOPED_TRACE(stored.name);
        const Bytes frame = ReadDVFrame(stored.name);
        const DVLayout& layout = stored.Layout();
        DVPixels expected(90, layout.height / 8);
        for (int i = 0; i < layout.sequences * 27 * 5; ++i) {
            const int sequence = i / 5 / 27, segment = i / 5 % 27;
            const size_t at =
                static_cast<size_t>(PlaceOfSegment(0, sequence, segment, layout) + 80 * (i % 5));
            const auto sample = [&](size_t place) { return (frame[at + place] + 128) % 256; };
            const auto [shape, x, y] = PlaceOf(stored.kind, 0, sequence, segment, i % 5);
            const int across = shape == DVShape::k411 ? 4 : 2;
            for (int block = 0; block < 4; ++block)
                expected.At(x / 8 + block % across, y / 8 + block / across) = {
                    sample(static_cast<size_t>(4 + 14 * block)), sample(70), sample(60)};
        }
        for (const PK_PixelFormat format : {kVUYX, PK_PixelFormat_UYVY_422_8u}) {
            const auto [result, rows] =
                DecodeDV(layout.format, frame.data(), format, 90, layout.height / 8, 2);
            ASSERT_EQ(result, PK_Success);
            EXPECT_EQ(DVDifference(expected, DVPixelsFromMemory(rows, format, 90, layout.height / 8),
                                   format != kVUYX, 0),
                      "");
        }
    }
}

/// \param isRandom has more detail than any photograph
void ExpectClose(const DVPixels& expected, const DVPixels& actual, bool isRandom) {
    EXPECT_GT(PSNR(expected, actual, 0), isRandom ? 35 : 38);
    for (size_t i = 1; i < 3; ++i) EXPECT_GT(PSNR(expected, actual, i), isRandom ? 25 : 33);
}

bool IsRandom(const Stored& stored) {
    return std::string(stored.name).starts_with("stress");
}

TEST(DVSizes, ReducedPicturesAreTheMeans) {
    for (const Stored& stored : kDV25) {
        SCOPED_TRACE(stored.name);
        const Bytes frame = ReadDVFrame(stored.name);
        const DVPixels whole = ExpectedOf(stored, frame);
        const int height = whole.height / 4;
        for (const PK_PixelFormat format : {kVUYX, PK_PixelFormat_UYVY_422_8u}) {
            const auto quarter = DecodeDV(stored.Layout().format, frame.data(), format, 180, height, 2);
            ASSERT_EQ(quarter.result, PK_Success);
            ExpectClose(BoxMeans(whole, 4), DVPixelsFromMemory(quarter.rows, format, 180, height),
                        IsRandom(stored));
        }
    }
    for (const Stored& stored : kLarger) {
        SCOPED_TRACE(stored.name);
        const Bytes frame = ReadDVFrame(stored.name);
        const DVPixels whole = ExpectedOf(stored, frame);
        const int width = whole.width / 2, height = whole.height / 2;
        for (const int quality : {0, 5}) {
            const auto half =
                DecodeDV(stored.Layout().format, frame.data(), stored.Reduced(), width, height, quality);
            ASSERT_EQ(half.result, PK_Success);
            ExpectClose(BoxMeans(whole, 2), DVPixelsFromMemory(half.rows, stored.Reduced(), width, height),
                        IsRandom(stored));
        }
    }
}

/// Half of DV25 is never asked for as it is: it is what smaller pictures are scaled from.
TEST(DVSizes, HalfOfDV25IsScaledOn) {
    for (const Stored& stored : kDV25) {
        SCOPED_TRACE(stored.name);
        const Bytes frame = ReadDVFrame(stored.name);
        const DVPixels means = BoxMeans(ExpectedOf(stored, frame), 2);
        Bytes half;
        for (int y = means.height - 1; y >= 0; --y)
            for (int x = 0; x < 360; ++x) {
                const auto& [luma, u, v] = means.At(x, y);
                for (const int sample : {v, u, luma, 255}) half.push_back(static_cast<uint8_t>(sample));
            }
        const int width = 340, height = means.height - 9;
        Bytes expected(static_cast<size_t>(4 * width * height));
        ASSERT_EQ(PK_ScaleConvert(half.data(), 4 * 360, 360, means.height, kVUYX, 0, expected.data(),
                                  4 * width, width, height, kVUYX, 0, 2),
                  PK_Success);
        const auto [result, rows] = Scaled(stored, frame, kVUYX, width, height, 0, 2);
        ASSERT_EQ(result, PK_Success);
        ExpectClose(DVPixelsFromMemory(expected, kVUYX, width, height),
                    DVPixelsFromMemory(rows, kVUYX, width, height), IsRandom(stored));
    }
}

} // namespace
