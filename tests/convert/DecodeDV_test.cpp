// Frames of DV to images: what is refused, and how pixels lie.

#include <PixelKiln/PixelKiln.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace {

constexpr int32_t kWidth = 720, kHeight = 480;

struct Image {
    PK_PixelFormat format;
    int32_t width, height;
    int32_t rowBytes;
    std::vector<uint8_t> bytes;

    Image(PK_PixelFormat of, int32_t columns, int32_t rows, int32_t pixelBytes)
        : format(of), width(columns), height(rows), rowBytes(columns * pixelBytes),
          bytes(static_cast<size_t>(rowBytes * rows), uint8_t{7}) {}

    bool IsUntouched() const {
        return std::ranges::all_of(bytes, [](uint8_t byte) { return byte == 7; });
    }
    const uint8_t* Row(int32_t row) const { return bytes.data() + rowBytes * row; }
};

PK_Result Decode(const std::vector<uint8_t>& frame, PK_PixelFormat stream, Image& image,
                 int32_t quality = 2) {
    return PK_Convert(frame.data(), 0, stream, image.bytes.data(), image.rowBytes, image.format, image.width,
                      image.height, quality);
}

/// A picture of which no two rows, and no two columns of chroma, are alike.
Image Slopes(int32_t height = kHeight) {
    Image picture(PK_PixelFormat_UYVY_422_8u, kWidth, height, 2);
    for (int32_t row = 0; row < height; ++row)
        for (int32_t x = 0; x < kWidth; ++x) {
            uint8_t* const pixel = picture.bytes.data() + picture.rowBytes * row + 2 * x;
            pixel[0] = static_cast<uint8_t>(x % 2 == 0 ? 60 + x / 8 : 200 - x / 12);
            pixel[1] = static_cast<uint8_t>(40 + row / 4 + x / 16);
        }
    return picture;
}

std::vector<uint8_t> Encoded(const Image& picture, PK_PixelFormat stream) {
    std::vector<uint8_t> frame(static_cast<size_t>(PK_PixelFormatSize(stream, 0, 0)));
    EXPECT_EQ(PK_Success,
              PK_Convert(picture.bytes.data(), picture.rowBytes, picture.format, frame.data(),
                         static_cast<int32_t>(frame.size()), stream, picture.width, picture.height, 3));
    return frame;
}

TEST(DecodeDV, HeadersThatAreNone) {
    const std::vector<uint8_t> good = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    struct Change {
        size_t byte;
        uint8_t number;
    };
    for (const auto& [byte, number] : {Change{4, 2}, {4, 7}, {5, 0}, {6, 0}, {7, 0}, {5, 3}, {7, 7}}) {
        std::vector<uint8_t> frame = good;
        frame[byte] = static_cast<uint8_t>((frame[byte] & 0xf8U) | number);
        Image image(PK_PixelFormat_BGRA_4444_8u, kWidth, kHeight, 4);
        EXPECT_EQ(PK_ErrBadDVFormat, Decode(frame, PK_PixelFormat_NTSCDV25, image))
            << byte << ' ' << int{number};
        EXPECT_TRUE(image.IsUntouched());
    }
    // The areas agree on the other number, and the track has its own.
    for (const int track : {0, 1}) {
        std::vector<uint8_t> frame = good;
        frame[4] = static_cast<uint8_t>((frame[4] & 0xf8) | track);
        for (const size_t byte : {5u, 6u, 7u}) frame[byte] = static_cast<uint8_t>(frame[byte] & 0xf8);
        Image image(PK_PixelFormat_UYVY_422_8u, kWidth, kHeight, 2), expected = image;
        ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, image));
        ASSERT_EQ(PK_Success, Decode(good, PK_PixelFormat_NTSCDV25, expected));
        EXPECT_EQ(expected.bytes, image.bytes);
    }
}

TEST(DecodeDV, SizesThatNobodyDecodesTo) {
    for (const PK_PixelFormat stream :
         {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV50, PK_PixelFormat_NTSC_DV100_1080i}) {
        const std::vector<uint8_t> frame(static_cast<size_t>(PK_PixelFormatSize(stream, 0, 0)));
        for (const auto& [width, height] : {std::pair{721, 480}, {720, 481}, {100, 100}, {1440, 1080}}) {
            Image image(PK_PixelFormat_BGRA_4444_8u, width, height, 4);
            EXPECT_EQ(PK_ErrSizeMismatch, Decode(frame, stream, image)) << width << " x " << height;
            EXPECT_TRUE(image.IsUntouched());
        }
    }
}

TEST(DecodeDV, FourChannelsAreStoredFromTheBottom) {
    const std::vector<uint8_t> frame = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    Image pairs(PK_PixelFormat_UYVY_422_8u, kWidth, kHeight, 2);
    Image pixels(PK_PixelFormat_VUYA_4444_8u, kWidth, kHeight, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, pairs));
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, pixels));
    for (int32_t row = 0; row < kHeight; ++row)
        for (int32_t x = 0; x < kWidth; ++x) {
            const uint8_t* const pixel = pixels.Row(kHeight - 1 - row) + 4 * x;
            ASSERT_EQ(pairs.Row(row)[2 * x + 1], pixel[2]);
            ASSERT_EQ(255, pixel[3]);
            if (x % 2 == 0) {
                ASSERT_EQ(pairs.Row(row)[2 * x], pixel[1]) << "U at " << x << ", row " << row;
                ASSERT_EQ(pairs.Row(row)[2 * x + 2], pixel[0]) << "V at " << x << ", row " << row;
            }
        }
}

/// Between samples of 4:1:1 the chroma of four pixels goes in straight lines, and nothing is rounded.
TEST(DecodeDV, ChromaOf411IsSpread) {
    const std::vector<uint8_t> frame = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    Image pixels(PK_PixelFormat_VUYX_4444_8u, kWidth, kHeight, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, pixels));
    for (int32_t row = 0; row < kHeight; row += 7)
        for (int32_t x = 0; x < kWidth; x += 4)
            for (const int32_t channel : {0, 1}) {
                const auto at = [&](int32_t column) {
                    return int32_t{pixels.Row(row)[4 * column + channel]};
                };
                const int32_t c = at(x), n = x + 4 < kWidth ? at(x + 4) : c;
                for (int32_t i = 1; i < 4; ++i) ASSERT_EQ(((4 - i) * c + i * n) >> 2, at(x + i)) << x + i;
            }
}

/// Each field has chroma of its own: here one is all grey, and the other red.
TEST(DecodeDV, ChromaOf420StaysInItsField) {
    Image picture(PK_PixelFormat_UYVY_422_8u, kWidth, 576, 2);
    for (int32_t row = 0; row < 576; ++row)
        for (int32_t x = 0; x < kWidth; ++x) {
            uint8_t* const pixel = picture.bytes.data() + picture.rowBytes * row + 2 * x;
            pixel[0] = static_cast<uint8_t>(row % 2 == 0 ? 128 : x % 2 == 0 ? 90 : 200);
            pixel[1] = 100;
        }
    const std::vector<uint8_t> frame = Encoded(picture, PK_PixelFormat_PALDV25);
    Image decoded = picture;
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_PALDV25, decoded));
    for (size_t i = 0; i < decoded.bytes.size(); ++i) ASSERT_NEAR(picture.bytes[i], decoded.bytes[i], 3) << i;
}

TEST(DecodeDV, BGRAIsMadeByTheDecodersMatrix) {
    const std::vector<uint8_t> frame = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    Image yuv(PK_PixelFormat_VUYX_4444_8u, kWidth, kHeight, 4),
        rgb(PK_PixelFormat_BGRP_4444_8u, kWidth, kHeight, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, yuv));
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, rgb));
    for (size_t i = 0; i < yuv.bytes.size(); i += 4) {
        const double v = yuv.bytes[i] - 128.0, u = yuv.bytes[i + 1] - 128.0,
                     y = 1.1643828 * (yuv.bytes[i + 2] - 16.0);
        const auto code = [](double sample) { return std::clamp(sample, 0.0, 255.0); };
        ASSERT_NEAR(code(y + 2.0172305 * u), rgb.bytes[i], 0.501);
        ASSERT_NEAR(code(y - 0.39176172 * u - 0.81296873 * v), rgb.bytes[i + 1], 0.501);
        ASSERT_NEAR(code(y + 1.5960274 * v), rgb.bytes[i + 2], 0.501);
        ASSERT_EQ(255, rgb.bytes[i + 3]);
    }
}

/// Other formats are those of the decoded picture, converted.
TEST(DecodeDV, FormatsThatNobodyDecodesTo) {
    const std::vector<uint8_t> frame = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    Image pairs(PK_PixelFormat_UYVY_422_8u, kWidth, kHeight, 2),
        floats(PK_PixelFormat_UYVY_422_32f, kWidth, kHeight, 8);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, pairs));
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, floats));
    Image expected = floats;
    ASSERT_EQ(PK_Success, PK_Convert(pairs.bytes.data(), pairs.rowBytes, pairs.format, expected.bytes.data(),
                                     expected.rowBytes, expected.format, kWidth, kHeight, 2));
    EXPECT_EQ(expected.bytes, floats.bytes);
}

TEST(DecodeDV, AnEighthIsTheMeanOfEachBlock) {
    Image picture(PK_PixelFormat_UYVY_422_8u, kWidth, kHeight, 2);
    for (int32_t row = 0; row < kHeight; ++row)
        for (int32_t x = 0; x < kWidth; ++x) {
            uint8_t* const pixel = picture.bytes.data() + picture.rowBytes * row + 2 * x;
            pixel[0] = static_cast<uint8_t>(x % 2 == 0 ? 60 + 2 * (row / 8) : 200 - 2 * (row / 8));
            pixel[1] = static_cast<uint8_t>(30 + x / 8 + row / 8);
        }
    const std::vector<uint8_t> frame = Encoded(picture, PK_PixelFormat_NTSCDV25);
    Image small(PK_PixelFormat_VUYX_4444_8u, 90, 60, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, small));
    for (int32_t row = 0; row < 60; ++row)
        for (int32_t x = 0; x < 90; ++x) {
            const uint8_t* const pixel = small.Row(59 - row) + 4 * x;
            ASSERT_NEAR(30 + x + row, pixel[2], 1) << x << ", row " << row;
            ASSERT_NEAR(60 + 2 * row, pixel[1], x < 88 ? 1 : 2); // the last two columns share it with a row
            ASSERT_NEAR(200 - 2 * row, pixel[0], x < 88 ? 1 : 2);
        }
}

/// Halves and quarters are near the means of the whole picture.
TEST(DecodeDV, ReducedSizesAreMeans) {
    const std::vector<uint8_t> frame = Encoded(Slopes(), PK_PixelFormat_NTSCDV25);
    Image whole(PK_PixelFormat_VUYX_4444_8u, kWidth, kHeight, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, whole));
    Image quarter(PK_PixelFormat_VUYX_4444_8u, kWidth / 4, kHeight / 4, 4);
    ASSERT_EQ(PK_Success, Decode(frame, PK_PixelFormat_NTSCDV25, quarter));
    for (int32_t row = 0; row < quarter.height; ++row)
        for (int32_t x = 0; x < quarter.width; ++x) {
            int32_t sum = 8;
            for (int32_t i = 0; i < 16; ++i) sum += whole.Row(4 * row + i / 4)[4 * (4 * x + i % 4) + 2];
            ASSERT_NEAR(sum / 16, quarter.Row(row)[4 * x + 2], 2) << x << ", row " << row;
        }
}

} // namespace
