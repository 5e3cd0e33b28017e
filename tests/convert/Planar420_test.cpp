// Planar 4:2:0 as its caller sees it: where chroma stands in columns and rows, what sizes are decoded to, what is refused.

#include <PixelKiln/Convert.h>
#include <PixelKiln/Planar.h>

#include "support/FlagScope.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace {

using Bytes = std::vector<uint8_t>;

/// A picture of one luma throughout.
struct Picture {
    PK_PixelFormat format;
    int32_t width, height;
    Bytes y, u, v;

    Picture(PK_PixelFormat format_, int32_t width_, int32_t height_)
        : format(format_), width(width_), height(height_), y(Area(width_, height_), 50),
          u(Area(width_ / 2, height_ / 2), 90), v(Area(width_ / 2, height_ / 2), 110) {}

    static size_t Area(int32_t width, int32_t height) {
        return static_cast<size_t>(width) * static_cast<size_t>(height);
    }

    PK_Result Decode(Bytes& pixels, int32_t toWidth, int32_t toHeight, PK_PixelFormat to, int32_t field,
                     int32_t quality) const {
        const void* const planes[3] = {y.data(), u.data(), v.data()};
        const int32_t rowBytes[3] = {width, width / 2, width / 2};
        return PK::DecompressYUV_420_8u(planes, rowBytes, width, height, format, pixels.data(),
                                        PK_PixelFormatPackedRowBytes(to, toWidth), toWidth, toHeight, to,
                                        field, quality);
    }
};

/// One byte of each unit of the decoded pixels.
Bytes Decoded(const Picture& picture, int32_t width, int32_t height, PK_PixelFormat to, int32_t field,
              size_t unit, size_t place) {
    Bytes pixels(static_cast<size_t>(PK_PixelFormatPackedRowBytes(to, width) * height), 0xcd);
    EXPECT_EQ(picture.Decode(pixels, width, height, to, field, 2), PK_Success);
    Bytes bytes;
    for (size_t i = place; i < pixels.size(); i += unit) bytes.push_back(pixels[i]);
    return bytes;
}

constexpr size_t kPairBytes = 4, kPixelBytes = 4;

TEST(Planar420, ChromaOfMPEG2StandsOnTheEvenColumns) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 4, 2);
    picture.u = {10, 21};
    EXPECT_EQ(Decoded(picture, 4, 1, PK_PixelFormat_VUYX_4444_8u, 0, kPixelBytes, 1),
              (Bytes{10, 16, 21, 21}));
}

TEST(Planar420, ChromaOfMPEG4StandsBetweenTheColumns) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG4_FRAME_709, 4, 2);
    picture.v = {10, 21};
    EXPECT_EQ(Decoded(picture, 4, 1, PK_PixelFormat_VUYX_4444_8u_709, 0, kPixelBytes, 0),
              (Bytes{10, 13, 18, 21}));
}

TEST(Planar420, RowsOfFourTwoTwoHoldTheSamplesOfThePlane) {
    for (const PK_PixelFormat format :
         {PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_YUV_420_MPEG4_FRAME}) {
        Picture picture(format, 4, 2);
        picture.u = {10, 21};
        picture.y = {1, 2, 3, 4, 5, 6, 7, 8};
        Bytes pixels(16);
        ASSERT_EQ(picture.Decode(pixels, 4, 2, PK_PixelFormat_UYVY_422_8u, 0, 2), PK_Success);
        EXPECT_EQ(pixels, (Bytes{10, 1, 110, 2, 21, 3, 110, 4, 10, 5, 110, 6, 21, 7, 110, 8}));
    }
}

TEST(Planar420, ChromaOfAFrameStandsBetweenTwoRows) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 2, 6);
    picture.u = {10, 20, 41};
    EXPECT_EQ(Decoded(picture, 2, 6, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 0),
              (Bytes{10, 13, 18, 25, 36, 41}));
}

TEST(Planar420, ChromaOfFieldsStandsAQuarterAndThreeQuartersOfTheWay) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FIELD, 2, 8);
    picture.v = {0, 100, 80, 20}; // of the first and of the second field in turns
    EXPECT_EQ(Decoded(picture, 2, 8, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 2),
              (Bytes{0, 100, 30, 90, 70, 50, 80, 20}));
}

TEST(Planar420, AnOddHeightRepeatsTheLastChroma) {
    Picture frame(PK_PixelFormat_YUV_420_MPEG2_FRAME, 2, 5);
    frame.u = {10, 20};
    EXPECT_EQ(Decoded(frame, 2, 5, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 0),
              (Bytes{10, 13, 18, 20, 20}));
    Picture fields(PK_PixelFormat_YUV_420_MPEG2_FIELD, 2, 5);
    fields.u = {10, 20};
    EXPECT_EQ(Decoded(fields, 2, 5, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 0),
              (Bytes{10, 20, 10, 20, 10}));
}

TEST(Planar420, AFieldWithoutChromaTakesThatOfTheOther) {
    for (const int32_t height : {2, 3}) {
        Picture picture(PK_PixelFormat_YUV_420_MPEG4_FIELD, 2, height);
        picture.u = {77};
        EXPECT_EQ(Decoded(picture, 2, height, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 0),
                  Bytes(static_cast<size_t>(height), 77));
    }
}

TEST(Planar420, APictureTooSmallForChromaIsGrey) {
    for (const auto& [width, height] : {std::pair{1, 5}, std::pair{6, 1}, std::pair{1, 1}}) {
        const Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, width, height);
        const auto chroma = Decoded(picture, width, height, PK_PixelFormat_VUYX_4444_8u, 0, kPixelBytes, 0);
        EXPECT_EQ(chroma, Bytes(Picture::Area(width, height), 128));
    }
}

TEST(Planar420, AHalfHeightHasTheRowsOfAField) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FIELD, 2, 8);
    for (size_t i = 0; i < picture.y.size(); ++i) picture.y[i] = static_cast<uint8_t>(i / 2);
    picture.v = {0, 100, 80, 20};
    const auto luma = [&](int32_t field) {
        return Decoded(picture, 2, 4, PK_PixelFormat_UYVY_422_8u, field, kPairBytes, 1);
    };
    const auto chroma = [&](int32_t field) {
        return Decoded(picture, 2, 4, PK_PixelFormat_UYVY_422_8u, field, kPairBytes, 2);
    };
    EXPECT_EQ(luma(1), (Bytes{0, 2, 4, 6}));
    EXPECT_EQ(luma(2), (Bytes{1, 3, 5, 7}));
    EXPECT_EQ(luma(0), luma(1));
    EXPECT_EQ(chroma(1), (Bytes{0, 30, 70, 80}));
    EXPECT_EQ(chroma(2), (Bytes{100, 90, 50, 20}));
    picture.format = PK_PixelFormat_YUV_420_MPEG2_FRAME;
    EXPECT_EQ(luma(0), (Bytes{0, 2, 4, 6}));
    EXPECT_EQ(luma(2), (Bytes{1, 3, 5, 7}));
    EXPECT_EQ(chroma(2), (Bytes{0, 100, 80, 20})) << "as it stands";
}

TEST(Planar420, AQuarterDropsSamplesAndKeepsChroma) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 4, 4);
    picture.y = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16};
    picture.u = {20, 21, 22, 23};
    picture.v = {30, 31, 32, 33};
    Bytes pixels(16);
    const auto decode = [&] {
        EXPECT_EQ(picture.Decode(pixels, 2, 2, PK_PixelFormat_VUYA_4444_8u, 0, 5), PK_Success);
        return pixels;
    };
    EXPECT_EQ(decode(), (Bytes{30, 20, 1, 255, 31, 21, 3, 255, 32, 22, 9, 255, 33, 23, 11, 255}));
    picture.format = PK_PixelFormat_YUV_420_MPEG2_FIELD; // both rows are of the first field
    EXPECT_EQ(decode(), (Bytes{30, 20, 1, 255, 31, 21, 3, 255, 30, 20, 9, 255, 31, 21, 11, 255}));
}

TEST(Planar420, EveryFourthAndEighthSampleStandsForAll) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 16, 4);
    for (size_t i = 0; i < picture.y.size(); ++i) picture.y[i] = static_cast<uint8_t>(i);
    for (size_t i = 0; i < picture.u.size(); ++i) picture.u[i] = static_cast<uint8_t>(100 + i);
    const auto samples = [&](int32_t width, size_t place) {
        return Decoded(picture, width, 1, PK_PixelFormat_VUYA_4444_8u, 0, kPixelBytes, place);
    };
    EXPECT_EQ(samples(4, 2), (Bytes{0, 4, 8, 12}));
    EXPECT_EQ(samples(4, 1), (Bytes{100, 102, 104, 106}));
    EXPECT_EQ(samples(2, 2), (Bytes{0, 8}));
    EXPECT_EQ(samples(2, 1), (Bytes{100, 104}));
    EXPECT_EQ(samples(8, 1), (Bytes{100, 101, 102, 103, 104, 105, 106, 107}));
    EXPECT_EQ(samples(16, 1),
              (Bytes{100, 100, 101, 101, 102, 102, 103, 103, 104, 104, 105, 105, 106, 106, 107, 107}));
}

/// The lumas of rows that got wider, at every target that offers it.
void ExpectWider(const Picture& picture, int32_t width, size_t first, const Bytes& expected) {
    PKTest::AtEveryTarget([&] {
        if (!PK::IsEnabled(PK::Target::sse2)) return;
        const Bytes luma = Decoded(picture, width, 2, PK_PixelFormat_VUYX_4444_8u, 0, kPixelBytes, 2);
        const auto begin = luma.begin() + static_cast<ptrdiff_t>(first);
        EXPECT_EQ(Bytes(begin, begin + static_cast<ptrdiff_t>(expected.size())), expected);
    });
}

TEST(Planar420, ThreeSamplesOfTwo) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 16, 2);
    for (size_t i = 0; i < 32; ++i) picture.y[i] = static_cast<uint8_t>(10 * (i % 16) + i % 2);
    ExpectWider(picture, 24, 0, {0, 5, 11, 20, 25, 31});
    ExpectWider(picture, 24, 21, {140, 145, 151, 0, 5, 11});
}

TEST(Planar420, FourSamplesOfThree) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 96, 2);
    for (size_t i = 0; i < 96; ++i) picture.y[i] = static_cast<uint8_t>(i);
    picture.y[1] = 200;
    ExpectWider(picture, 128, 0, {0, 133, 134, 2, 3, 4, 4, 5});
}

TEST(Planar420, WiderRowsOf601KeepTheirFractionsInTenBits) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 96, 2);
    for (size_t i = 0; i < picture.y.size(); ++i) picture.y[i] = i % 3 == 1 ? 101 : 100;
    PKTest::AtEveryTarget([&] {
        if (!PK::IsEnabled(PK::Target::sse2)) return;
        Bytes pixels(static_cast<size_t>(PK_PixelFormatPackedRowBytes(PK_PixelFormat_V210_422_10u, 128)));
        ASSERT_EQ(picture.Decode(pixels, 128, 1, PK_PixelFormat_V210_422_10u, 0, 2), PK_Success);
        uint32_t words[2];
        std::memcpy(words, pixels.data(), sizeof words);
        EXPECT_EQ(words[0], 360u | 400u << 10 | 440u << 20);
        EXPECT_EQ(words[1], 403u | 360u << 10 | 403u << 20);
    });
}

TEST(Planar420, TheLastRowOfAFieldHasTheNearestChromaAsItStands) {
    Picture picture(PK_PixelFormat_YUV_420_MPEG2_FIELD, 2,
                    6); // rows 0, 2 and 4 of luma have rows 0 and 2 of chroma
    picture.u = {0, 9, 80};
    EXPECT_EQ(Decoded(picture, 2, 6, PK_PixelFormat_UYVY_422_8u, 0, kPairBytes, 0),
              (Bytes{0, 9, 30, 9, 80, 9}));
    EXPECT_EQ(Decoded(picture, 2, 3, PK_PixelFormat_UYVY_422_8u, 1, kPairBytes, 0), (Bytes{0, 30, 80}));
}

TEST(Planar420, WideningWantsSSE2) {
    const Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 96, 4);
    Bytes pixels(128 * 4 * 4);
    const PKTest::TargetScope plain(PK::Target::plain);
    EXPECT_EQ(picture.Decode(pixels, 128, 4, PK_PixelFormat_VUYX_4444_8u, 0, 2), PK_ErrBadHeight);
}

TEST(Planar420, RefusesWhatItDoesNotOffer) {
    const Picture picture(PK_PixelFormat_YUV_420_MPEG2_FRAME, 48, 24);
    Bytes pixels(64 * 48 * 4, 0xcd);
    const auto decode = [&](int32_t width, int32_t height, int32_t quality = 2) {
        return picture.Decode(pixels, width, height, PK_PixelFormat_VUYX_4444_8u, 0, quality);
    };
    EXPECT_EQ(decode(12, 6, 3), PK_ErrSizeMismatch);
    EXPECT_EQ(decode(12, 8), PK_ErrBadHeight) << "an odd ratio";
    EXPECT_EQ(decode(12, 7), PK_ErrBadHeight) << "no ratio";
    EXPECT_EQ(decode(12, 48), PK_ErrBadHeight) << "higher than the picture";
    EXPECT_EQ(decode(16, 6), PK_ErrBadWidth) << "a third";
    EXPECT_EQ(decode(3, 6), PK_ErrBadWidth) << "a sixteenth";
    EXPECT_EQ(decode(64, 6), PK_ErrBadWidth);
    EXPECT_EQ(decode(-1, 6), PK_ErrFailed);
    EXPECT_EQ(decode(12, -1), PK_ErrFailed);
    EXPECT_EQ(decode(0, 6), PK_Success);
    EXPECT_EQ(decode(12, 0), PK_Success);
    EXPECT_EQ(pixels, Bytes(pixels.size(), 0xcd));
}

TEST(Planar420, RefusesFormatsPointersAndRowBytesInOrder) {
    Bytes bytes(4096, 0xcd);
    const void* planes[3] = {bytes.data(), bytes.data(), bytes.data()};
    int32_t rowBytes[3] = {8, 4, 4};
    const auto decode = [&](PK_PixelFormat from, PK_PixelFormat to, int32_t width, void* pixels,
                            int32_t pixelRowBytes = 32) {
        return PK::DecompressYUV_420_8u(planes, rowBytes, width, 4, from, pixels, pixelRowBytes, width, 4, to,
                                        0, 2);
    };
    const PK_PixelFormat from = PK_PixelFormat_YUV_420_MPEG2_FRAME, to = PK_PixelFormat_VUYX_4444_8u;
    EXPECT_EQ(decode(PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_Invalid, 8, nullptr), PK_ErrBadSrcFormat);
    EXPECT_EQ(decode(PK_PixelFormat_PALDV25, to, 8, nullptr), PK_ErrBadSrcFormat);
    EXPECT_EQ(decode(from, from, 8, nullptr), PK_ErrBadDstFormat);
    EXPECT_EQ(decode(from, PK_PixelFormat_Invalid, 8, nullptr), PK_ErrBadDstFormat);
    EXPECT_EQ(decode(from, to, -8, nullptr), PK_ErrFailed);
    EXPECT_EQ(decode(from, to, 0, nullptr), PK_Success);
    EXPECT_EQ(decode(from, to, 8, nullptr), PK_ErrFailed);
    EXPECT_EQ(decode(from, to, 8, bytes.data() + 64, 31), PK_ErrFailed) << "rows that overlap";
    for (int32_t& own : rowBytes) {
        own -= 1;
        EXPECT_EQ(decode(from, to, 8, bytes.data() + 64), PK_ErrFailed) << "rows that overlap";
        own += 1;
    }
    for (const void*& plane : planes) {
        plane = nullptr;
        EXPECT_EQ(decode(from, to, 8, bytes.data() + 64), PK_ErrFailed);
        plane = bytes.data();
    }
    EXPECT_EQ(bytes, Bytes(bytes.size(), 0xcd));
    EXPECT_EQ(decode(from, to, 8, bytes.data() + 64), PK_Success);
}

} // namespace
