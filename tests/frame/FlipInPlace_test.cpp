// PK_FlipInPlace swaps the pixels of rows and nothing else.

#include "support/GuardedImage.h"

#include <PixelKiln/Buffers.h>

#include <algorithm>
#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

namespace {

struct Image {
    PK_PixelFormat format;
    int32_t width;
    int32_t height;
    int32_t padding; // bytes between the pixels of one row and the next
    int32_t pixelBytes;
};

// Flips with rows in either direction and compares with the rows in reverse.
void CheckFlip(const Image& image, bool upwards) {
    SCOPED_TRACE(testing::Message() << PK_PixelFormatName(image.format) << " " << image.width << "x"
                                    << image.height << " padding " << image.padding << " upwards "
                                    << upwards);
    Random random(3);
    const GuardedImage memory(
        {static_cast<size_t>(image.pixelBytes), image.height, static_cast<size_t>(image.padding), upwards},
        random);
    std::vector<std::vector<uint8_t>> rows = memory.Rows();
    std::reverse(rows.begin(), rows.end());
    ASSERT_EQ(PK_FlipInPlace(memory.Pixels(), memory.RowBytes(), image.width, image.height, image.format),
              PK_Success);
    memory.ExpectRows(rows);
}

} // namespace

TEST(FlipInPlace, SwapsRowsOfEvenAndOddHeights) {
    for (const bool upwards : {false, true}) {
        for (int32_t height = 1; height <= 9; ++height) {
            CheckFlip({PK_PixelFormat_BGRA_4444_8u, 5, height, 0, 20}, upwards);
            CheckFlip({PK_PixelFormat_BGRA_4444_8u, 5, height, 44, 20}, upwards);
            CheckFlip({PK_PixelFormat_UYVY_422_8u, 5, height, 3, 12}, upwards);
            CheckFlip({PK_PixelFormat_V210_422_10u, 7, height, 96, 32}, upwards);
        }
    }
}

TEST(FlipInPlace, SwapsRowsTooLongForTheStackAndLongEnoughToStream) {
    CheckFlip({PK_PixelFormat_BGRA_4444_32f, 16385, 3, 7, 262160}, false);
    CheckFlip({PK_PixelFormat_BGRA_4444_32f, 32771, 4, 16, 524336}, true);
}

TEST(FlipInPlace, LeavesTheMiddleRowOfThree) {
    uint8_t rows[3][4] = {{1, 2, 3, 4}, {5, 6, 7, 8}, {9, 10, 11, 12}};
    ASSERT_EQ(PK_FlipInPlace(rows, 4, 1, 3, PK_PixelFormat_BGRA_4444_8u), PK_Success);
    const uint8_t expected[3][4] = {{9, 10, 11, 12}, {5, 6, 7, 8}, {1, 2, 3, 4}};
    EXPECT_TRUE(std::equal(&rows[0][0], &rows[0][0] + 12, &expected[0][0]));
}

TEST(FlipInPlace, DoesNothingToHeightsBelowTwoAndToEmptyRows) {
    for (const int32_t height : {1, 0, -1, -2, INT32_MIN})
        for (const int32_t width : {16, 0, -1, 0x08000000, INT32_MIN})
            EXPECT_EQ(PK_FlipInPlace(nullptr, 64, width, height, PK_PixelFormat_BGRA_4444_32f), PK_Success)
                << width << "x" << height;
    EXPECT_EQ(PK_FlipInPlace(nullptr, 64, 0, 8, PK_PixelFormat_BGRA_4444_8u), PK_Success);
}

TEST(FlipInPlace, RefusesImpossibleArguments) {
    uint8_t pixel[8] = {};
    EXPECT_EQ(PK_FlipInPlace(nullptr, 64, 16, 2, PK_PixelFormat_BGRA_4444_8u), PK_ErrFailed);
    EXPECT_EQ(PK_FlipInPlace(pixel, 4, -1, 2, PK_PixelFormat_BGRA_4444_8u), PK_ErrFailed);
    // 16 bytes x 0x08000000 pixels is 2^31, which 32 bits hold as a negative length
    EXPECT_EQ(PK_FlipInPlace(pixel, 4, 0x08000000, 2, PK_PixelFormat_BGRA_4444_32f), PK_ErrFailed);
}
