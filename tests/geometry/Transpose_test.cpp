// PK_Transpose and PK_RotateImage: every pixel lands where the rule says, and nothing else is touched.

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Rotate.h>

#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <vector>

namespace {

using namespace PKTest;

/// The rows of an image whose pixel `column` of row `row` is what pixelAt(row, column) points to.
template <class PixelAt>
std::vector<std::vector<uint8_t>> RowsOf(int32_t width, int32_t height, int32_t pixelBytes, PixelAt pixelAt) {
    std::vector<std::vector<uint8_t>> rows(static_cast<size_t>(height));
    for (int32_t row = 0; row < height; ++row)
        for (int32_t column = 0; column < width; ++column) {
            const uint8_t* pixel = pixelAt(row, column);
            std::vector<uint8_t>& bytes = rows[static_cast<size_t>(row)];
            bytes.insert(bytes.end(), pixel, pixel + pixelBytes);
        }
    return rows;
}

class TransposeBodies : public TargetTest {
protected:
    /// Rows of either direction.
    GuardedImage MakeImage(int32_t width, int32_t height, int32_t pixelBytes, size_t padding, Guard guard) {
        return {{static_cast<size_t>(width * pixelBytes), height, padding, random.Below(2) != 0, guard},
                random};
    }

    /// Transposes random pixels in rows of random order and distance, which end or begin at a guard page.
    void Check(int32_t width, int32_t height, int32_t pixelBytes) {
        SCOPED_TRACE(testing::Message()
                     << pixelBytes << " bytes, " << width << "x" << height << ", seed " << random.Seed());
        const size_t padding = static_cast<size_t>(pixelBytes) * random.Below(3);
        const Guard guard = random.Below(2) != 0 ? Guard::kAfter : Guard::kBefore;
        const GuardedImage source = MakeImage(width, height, pixelBytes, padding, guard);
        const GuardedImage destination = MakeImage(height, width, pixelBytes, 2 * padding, guard);
        ASSERT_EQ(PK_Success,
                  PK_Transpose(source.Pixels(), source.RowBytes(), destination.Pixels(),
                               destination.RowBytes(), width, height, static_cast<uint8_t>(pixelBytes)));
        destination.ExpectRows(RowsOf(height, width, pixelBytes, [&](int32_t row, int32_t column) {
            return source.Row(column) + row * pixelBytes;
        }));
    }

    Random random{54};
};

TEST_P(TransposeBodies, EveryPixelChangesItsRowForItsColumn) {
    for (const int32_t pixelBytes : {1, 2, 4, 8, 16})
        for (int round = 0; round < 150; ++round) {
            const uint32_t limit = round < 100 ? 40 : 150;
            const auto width = static_cast<int32_t>(random.Below(limit));
            const auto height = static_cast<int32_t>(random.Below(limit));
            ASSERT_NO_FATAL_FAILURE(Check(width, height, pixelBytes));
        }
}

TEST_P(TransposeBodies, QuarterTurnsLandWhereTheRuleSays) {
    for (const int32_t degrees : {90, 180, 270, -90, -180, -270})
        for (int round = 0; round < 100; ++round) {
            const auto width = static_cast<int32_t>(1 + random.Below(70));
            const auto height = static_cast<int32_t>(1 + random.Below(70));
            SCOPED_TRACE(testing::Message()
                         << degrees << " degrees, " << width << "x" << height << ", seed " << random.Seed());
            const bool half = degrees % 180 == 0;
            const int32_t columns = half ? width : height, rows = half ? height : width;
            const GuardedImage source = MakeImage(width, height, 4, 4, Guard::kAfter);
            const GuardedImage destination = MakeImage(columns, rows, 4, 8, Guard::kAfter);
            ASSERT_EQ(PK_Success, PK_RotateImage(source.Pixels(), source.RowBytes(), destination.Pixels(),
                                                 destination.RowBytes(), width, height,
                                                 PK_PixelFormat_BGRA_4444_8u, degrees));
            ASSERT_NO_FATAL_FAILURE(
                destination.ExpectRows(RowsOf(columns, rows, 4, [&](int32_t r, int32_t c) {
                    int32_t row = height - 1 - r, column = width - 1 - c; // 180
                    if (degrees == 90 || degrees == -270) row = height - 1 - c, column = r;
                    if (degrees == 270 || degrees == -90) row = c, column = width - 1 - r;
                    return source.Row(row) + 4 * column;
                })));
        }
}

INSTANTIATE_TEST_SUITE_P(Targets, TransposeBodies, EveryTarget(), TargetOf);

TEST(Transpose, TwiceIsTheImageItself) {
    const FlagScope flags;
    PK::DetectProcessor();
    Random random(7);
    for (const int32_t pixelBytes : {1, 2, 4, 8, 16}) {
        constexpr int32_t width = 63, height = 130;
        const std::vector<uint8_t> image = random.Bytes(static_cast<size_t>(width * height * pixelBytes));
        std::vector<uint8_t> turned(image.size()), back(image.size());
        const auto bytes = static_cast<uint8_t>(pixelBytes);
        PK_Transpose(image.data(), width * pixelBytes, turned.data(), height * pixelBytes, width, height,
                     bytes);
        PK_Transpose(turned.data(), height * pixelBytes, back.data(), width * pixelBytes, height, width,
                     bytes);
        EXPECT_EQ(image, back);
    }
}

TEST(Transpose, OnlyTheVectorFormKeepsStepsThatAreNoWholePixels) {
    const FlagScope flags;
    PK::DetectProcessor();
    PK_SetDebugFlag(3, 1); // every processor has SSE2
    std::array<uint8_t, 64> source{}, destination{};
    for (size_t i = 0; i < source.size(); ++i) source[i] = static_cast<uint8_t>(i);
    // Two rows of one pixel, 7 bytes apart.
    ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 7, destination.data(), 8, 1, 2, 4));
    EXPECT_EQ(7, destination[4]);
    PK_SetDebugFlag(3, 0);
    ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 7, destination.data(), 8, 1, 2, 4));
    EXPECT_EQ(4, destination[4]);
}

TEST(Transpose, PixelsOfTwoBytesAreAlwaysWholeStepsApart) {
    const FlagScope flags;
    PK::DetectProcessor();
    constexpr int32_t width = 8, height = 64; // whole tiles of any body
    constexpr size_t bytes = height * (2 * width + 1);
    std::array<uint8_t, bytes> source{}, destination{};
    for (size_t i = 0; i < source.size(); ++i) source[i] = static_cast<uint8_t>(i);
    for (const int32_t sse2 : {1, 0}) {
        PK_SetDebugFlag(3, sse2);
        destination.fill(0);
        ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 2 * width + 1, destination.data(), 2 * height + 1,
                                           width, height, 2));
        for (int32_t row = 0; row < height; ++row)
            for (int32_t column = 0; column < width; ++column)
                ASSERT_EQ(source[static_cast<size_t>(2 * (row * width + column))],
                          destination[static_cast<size_t>(2 * (column * height + row))])
                    << "SSE2 " << sse2 << ", row " << row << ", column " << column;
    }
}

TEST(Transpose, RefusesWhatItCannotMove) {
    const FlagScope flags;
    uint8_t pixel[16] = {}, out[16] = {1};
    for (const int32_t sse2 : {0, 1}) {
        PK_SetDebugFlag(3, sse2);
        for (const int bytes : {0, 3, 5, 12, 17, 32, 255})
            EXPECT_EQ(PK_ErrBadSrcFormat,
                      PK_Transpose(pixel, 16, out, 16, 1, 1, static_cast<uint8_t>(bytes)));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, out, 16, -1, 1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, out, 16, 1, -1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(nullptr, 16, out, 16, 1, 1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, nullptr, 16, 1, 1, 4));
        EXPECT_EQ(PK_Success, PK_Transpose(nullptr, 16, nullptr, 16, 0, 5, 4));
    }
    EXPECT_EQ(1, out[0]);
}

TEST(RotateImage, RefusesOtherFormatsAndAngles) {
    uint8_t pixel[16] = {}, out[16] = {1};
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_UYVY_422_8u,
          PK_PixelFormat_RGB_444_10u, PK_PixelFormat(0)})
        EXPECT_EQ(PK_ErrBadSrcFormat, PK_RotateImage(pixel, 16, out, 16, 1, 1, format, 90));
    for (const int32_t degrees : {0, 45, 89, 360, -360, 450, INT32_MIN, INT32_MAX})
        EXPECT_EQ(PK_ErrFailed,
                  PK_RotateImage(pixel, 16, out, 16, 1, 1, PK_PixelFormat_VUYP_4444_8u_709, degrees));
    EXPECT_EQ(PK_Success, PK_RotateImage(nullptr, 0, nullptr, 0, 0, 9, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(PK_Success, PK_RotateImage(nullptr, 0, nullptr, 0, 9, -1, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(PK_ErrFailed, PK_RotateImage(nullptr, 4, out, 4, 1, 1, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(1, out[0]);
}

} // namespace
