// PK_Deinterlace and PK_DeinterlaceCopy: which rows are rebuilt, from what, in which format.

#include "convert/RasterFormats.h"
#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Deinterlace.h>

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

using namespace PKTest;

namespace {

constexpr PK_PixelFormat kBGRP = PK_PixelFormat_BGRP_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u,
                         kFloats = PK_PixelFormat_BGRP_4444_32f;

PK_Result Copy(AlignedPicture& source, AlignedPicture& out, int32_t width, int32_t height, int32_t field,
               int32_t quality) {
    return PK_DeinterlaceCopy(source.Pixels(), source.RowBytes(), source.format, out.Pixels(), out.RowBytes(),
                              out.format, width, height, field, quality);
}

PK_Result InPlace(AlignedPicture& image, int32_t width, int32_t height, int32_t field, int32_t quality) {
    return PK_Deinterlace(image.Pixels(), image.RowBytes(), image.format, width, height, field, quality);
}

bool IsTaken(PK_PixelFormat format) {
    return (format & 0x30) == 0x10 || (format & 0xc) != 0;
}

class Deinterlace : public testing::Test {
protected:
    Deinterlace() { PK::SetCapabilities(PK::ReadProcessor()); }

    /// Rows of one grey pixel each, from the top.
    static std::vector<int> Rebuilt(const std::vector<uint8_t>& rows, int32_t field, int32_t quality) {
        const auto height = static_cast<int32_t>(rows.size());
        AlignedPicture image(kBGRP, 1, height);
        for (int32_t row = 0; row < height; ++row) {
            std::memset(image.RowFromTop(row), rows[static_cast<size_t>(row)], 3);
            image.RowFromTop(row)[3] = 255;
        }
        EXPECT_EQ(InPlace(image, 1, height, field, quality), PK_Success);
        std::vector<int> codes;
        for (int32_t row = 0; row < height; ++row) {
            EXPECT_EQ(image.RowFromTop(row)[0], image.RowFromTop(row)[2]);
            EXPECT_EQ(image.RowFromTop(row)[3], 255);
            codes.push_back(image.RowFromTop(row)[0]);
        }
        return codes;
    }

    using Codes = std::vector<int>;
    FlagScope fFlags;
    Random fRandom{6300};
};

} // namespace

TEST_F(Deinterlace, AveragesTheRowsOfTheKeptField) {
    AtEveryTarget([] {
        EXPECT_EQ(Rebuilt({10, 99, 20, 99}, 0, 3), (Codes{10, 15, 20, 20}));
        EXPECT_EQ(Rebuilt({99, 10, 99, 20}, 1, 3), (Codes{10, 10, 15, 20}));
        EXPECT_EQ(Rebuilt({99, 10, 99, 20}, 2, 3), (Codes{10, 10, 15, 20}));
        EXPECT_EQ(Rebuilt({99, 10, 99, 20}, -1, 0), (Codes{10, 10, 15, 20}));
        EXPECT_EQ(Rebuilt({10, 99, 21, 99, 31, 99}, 0, 3),
                  (Codes{10, 16, 21, 26, 31, 31})); // 15.5 and 26, to even
    });
}

TEST_F(Deinterlace, NamesTheOtherFieldFromQuality4On) {
    AtEveryTarget([] {
        EXPECT_EQ(Rebuilt({10, 99, 21, 99}, 0, 4), (Codes{10, 16, 21, 21}));
        EXPECT_EQ(Rebuilt({10, 99, 21, 99}, 2, 4), (Codes{10, 16, 21, 21}));
        EXPECT_EQ(Rebuilt({10, 99, 21, 99}, -7, 5), (Codes{10, 16, 21, 21}));
        EXPECT_EQ(Rebuilt({99, 10, 99, 21}, 1, 4), (Codes{10, 10, 16, 21}));
    });
}

TEST_F(Deinterlace, RebuildsWhatThereIsOfShortAndOddFrames) {
    for (const int32_t quality : {3, 4}) {
        EXPECT_EQ(Rebuilt({7}, 0, quality), (Codes{7}));
        EXPECT_EQ(Rebuilt({7}, 1, quality), (Codes{7}));
        EXPECT_EQ(Rebuilt({7, 8}, 0, quality), (Codes{7, 7}));
        EXPECT_EQ(Rebuilt({7, 8}, 1, quality), (Codes{8, 8}));
        EXPECT_EQ(Rebuilt({7, 8, 9}, 0, quality), (Codes{7, 7, 9}));
        EXPECT_EQ(Rebuilt({7, 8, 9}, 1, quality), (Codes{8, 8, 9}));
        EXPECT_EQ(Rebuilt({10, 99, 20, 99, 40}, 0, quality), (Codes{10, 15, 20, 20, 40}));
        EXPECT_EQ(Rebuilt({99, 10, 99, 20, 77}, 1, quality), (Codes{10, 10, 15, 20, 77}));
    }
}

TEST_F(Deinterlace, LeavesAFlatImageFlat) {
    constexpr float kOpacity = 0.7f;
    constexpr int32_t kWidth = 21, kHeight = 7;
    for (const PK_PixelFormat format :
         {kBGRP, kFloats, PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_VUYP_4444_8u})
        for (const int32_t quality : {3, 4})
            for (const int32_t field : {0, 1}) {
                AlignedPicture image(format, kWidth, kHeight);
                const size_t pixel = image.rowLength / kWidth;
                std::vector<uint8_t> colour(pixel);
                FillOrdinarySamples(format, colour.data(), pixel, fRandom);
                if (format == kFloats) std::memcpy(&colour[12], &kOpacity, sizeof kOpacity); // not below 0
                for (int32_t row = 0; row < kHeight; ++row)
                    for (size_t x = 0; x < kWidth; ++x)
                        std::memcpy(image.RowFromTop(row) + x * pixel, colour.data(), pixel);
                AlignedPicture before = image;
                ASSERT_EQ(InPlace(image, kWidth, kHeight, field, quality), PK_Success);
                for (int32_t row = 0; row < kHeight; ++row)
                    ASSERT_EQ(std::memcmp(before.RowFromTop(row), image.RowFromTop(row), image.rowLength), 0)
                        << std::hex << format << ", quality " << quality;
            }
}

// A bright line, three pixels wide, that moves a pixel to the side from row to row.
TEST_F(Deinterlace, JoinsADiagonalLineAlongItsEdges) {
    constexpr int32_t kSide = 40;
    AtEveryTarget([] {
        for (const bool falls : {false, true}) {
            const auto isLine = [&](int32_t row, int32_t x) {
                const int32_t middle = falls ? row : kSide - 1 - row;
                return x >= middle - 1 && x <= middle + 1;
            };
            AlignedPicture image(kBGRP, kSide, kSide);
            for (int32_t row = 0; row < kSide; row += 2)
                for (int32_t x = 0; x < kSide; ++x)
                    if (isLine(row, x)) std::memset(image.RowFromTop(row) + 4 * x, 255, 4);
            ASSERT_EQ(InPlace(image, kSide, kSide, 0, 4), PK_Success);
            for (int32_t row = 3; row < kSide - 3; ++row)
                for (int32_t x = 0; x < kSide; ++x)
                    ASSERT_EQ(image.RowFromTop(row)[4 * x], isLine(row, x) ? 255 : 0) << row << ' ' << x;
        }
    });
}

// 16440 and 16578 of 32768 are 127.94 and 129.01 of 255, with a mean of 128.47; the codes 128 and 129 would give 129.
TEST_F(Deinterlace, WorksInFloatsBetweenDepths) {
    AlignedPicture source(PK_PixelFormat_BGRP_4444_15u, 1, 4), out(kBGRP, 1, 4);
    for (const int32_t row : {0, 2}) {
        const auto code = static_cast<uint16_t>(row == 0 ? 16440 : 16578);
        const uint16_t pixel[4] = {code, code, code, 32768};
        std::memcpy(source.RowFromTop(row), pixel, sizeof pixel);
    }
    ASSERT_EQ(Copy(source, out, 1, 4, 0, 4), PK_Success);
    EXPECT_EQ(out.RowFromTop(1)[0], 128);
    EXPECT_EQ(out.RowFromTop(0)[3], 0); // kept rows are the caller's
    EXPECT_EQ(out.RowFromTop(2)[3], 0);
    EXPECT_EQ(out.RowFromTop(3)[0], 129);
}

TEST_F(Deinterlace, GivesInPlaceWhatItGivesBeside) {
    constexpr int32_t kWidth = 23;
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        if (!IsTaken(format)) continue;
        for (const int32_t quality : {3, 4})
            for (const int32_t field : {0, 1})
                for (const int32_t height : {6, 7}) {
                    AlignedPicture image(format, kWidth, height);
                    image.FillOrdinary(fRandom);
                    AlignedPicture out = image;
                    ASSERT_EQ(Copy(image, out, kWidth, height, field, quality), PK_Success);
                    ASSERT_EQ(InPlace(image, kWidth, height, field, quality), PK_Success);
                    for (int32_t row = 0; row < height; ++row)
                        ASSERT_EQ(std::memcmp(image.RowFromTop(row), out.RowFromTop(row), out.rowLength), 0)
                            << std::hex << format << ", row " << row;
                }
    }
}

TEST_F(Deinterlace, TouchesNothingButTheRowsThatItRebuilds) {
    for (const PK_PixelFormat format :
         {kBGRP, kUYVY, PK_PixelFormat_V210_422_10u, PK_PixelFormat_ARGB_4444_15u, kFloats})
        for (const int32_t quality : {3, 4})
            for (const int32_t field : {0, 1})
                for (int32_t width = 1; width < 40; width += 1 + static_cast<int32_t>(fRandom.Below(5)))
                    for (const Guard guard : {Guard::kBefore, Guard::kAfter}) {
                        constexpr int32_t kHeight = 5;
                        const auto length = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
                        const GuardedImage image(
                            {length, kHeight, 4 * fRandom.Below(9), fRandom.Below(2) != 0, guard}, fRandom);
                        std::vector<std::vector<uint8_t>> rows = image.Rows();
                        ASSERT_EQ(PK_Deinterlace(image.Pixels(), image.RowBytes(), format, width, kHeight,
                                                 field, quality),
                                  PK_Success);
                        // An odd height has the same fields from both ends; its last row is kept, or not reached.
                        const bool isTurned = PK_IsOriginBottomLeft(format);
                        for (int32_t row = 0; row < kHeight; ++row) {
                            const int32_t fromTop = isTurned ? kHeight - 1 - row : row;
                            const bool isRebuilt =
                                (fromTop % 2 == 0) == (field == 1) && fromTop != kHeight - 1;
                            if (isRebuilt) rows[static_cast<size_t>(row)] = image.RowContent(row);
                        }
                        image.ExpectRows(rows);
                    }
}

// Half of 1e-38 is denormal, and so is the mean with 0.
TEST_F(Deinterlace, FlushesDenormalsAlongEdgesAndFollowsTheCallerForMeans) {
    for (const int32_t quality : {3, 4})
        for (const uint32_t mode : {0u, kFlushToZero}) {
            AlignedPicture image(kFloats, 1, 4);
            const float tiny[4] = {1e-38f, 0.25f, 0.5f, 1}, black[4] = {0, 0, 0, 1};
            std::memcpy(image.RowFromTop(0), tiny, sizeof tiny);
            std::memcpy(image.RowFromTop(2), black, sizeof black);
            const FloatEnvironment environment(mode | kExceptionFlags);
            ASSERT_EQ(InPlace(image, 1, 4, 0, quality), PK_Success);
            EXPECT_TRUE(environment.IsAsGiven());
            float rebuilt[4];
            std::memcpy(rebuilt, image.RowFromTop(1), sizeof rebuilt);
            EXPECT_EQ(rebuilt[0], mode == 0 && quality == 3 ? 0.5e-38f : 0.0f);
            EXPECT_EQ(rebuilt[1], 0.125f);
        }
}

TEST_F(Deinterlace, RefusesFormats) {
    uint8_t pixels[256] = {};
    const auto copy = [&](PK_PixelFormat source, PK_PixelFormat destination) {
        return PK_DeinterlaceCopy(pixels, 16, source, pixels + 128, 16, destination, 1, 1, 0, 4);
    };
    int32_t taken = 0;
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        const bool isTaken = format != PK_PixelFormat_RGB_444_10u;
        EXPECT_EQ(PK_Deinterlace(pixels, 16, format, 1, 1, 0, 4), isTaken ? PK_Success : PK_ErrBadSrcFormat);
        EXPECT_EQ(copy(format, kBGRP), isTaken ? PK_Success : PK_ErrBadSrcFormat);
        EXPECT_EQ(copy(kBGRP, format), isTaken ? PK_Success : PK_ErrBadDstFormat);
        taken += isTaken;
    }
    EXPECT_EQ(taken, 46);
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0xffffffff}, PK_PixelFormat{0x09000811}, PK_PixelFormat{0x100}}) {
        EXPECT_EQ(PK_Deinterlace(pixels, 16, format, 1, 1, 0, 4), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(copy(format, format), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(copy(kBGRP, format), PK_ErrBadDstFormat) << std::hex << format;
    }
}

TEST_F(Deinterlace, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    void *source = pixels, *destination = pixels;
    for (const int32_t quality : {3, 4}) {
        const auto copy = [&](int32_t width, int32_t height) {
            return PK_DeinterlaceCopy(source, 8, kBGRP, destination, 8, kBGRP, width, height, 0, quality);
        };
        EXPECT_EQ(copy(-1, 2), PK_ErrFailed);
        EXPECT_EQ(copy(INT32_MAX / 16 + 1, 2), PK_ErrFailed);
        EXPECT_EQ(copy(1, INT32_MIN), PK_ErrFailed);
        for (void** pointer : {&source, &destination}) {
            *pointer = nullptr;
            EXPECT_EQ(copy(1, 2), PK_ErrFailed);
            EXPECT_EQ(copy(0, 2), PK_Success);
            EXPECT_EQ(copy(1, 0), PK_Success);
            *pointer = pixels;
        }
        EXPECT_EQ(PK_Deinterlace(nullptr, 8, kBGRP, 1, 2, 0, quality), PK_ErrFailed);
    }
}
