// PK_Convert on pixels: which row goes where, and that what runs is what the chain lists.

#include <PixelKiln/Convert.h>

#include "frame/DebugSwitches.h"
#include "support/FlagScope.h"

#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

#include <array>
#include <vector>

namespace {

constexpr int32_t kQuality = 2;
constexpr PK_PixelFormat kBottomUp = PK_PixelFormat_BGRX_4444_8u;
constexpr PK_PixelFormat kTopDown = PK_PixelFormat_RGB_444_10u;

/// One grey pixel a row, three rows: black, white and a fifth of white, which is 204.6 of 1023.
constexpr std::array<uint32_t, 3> kGreys8u = {0xff000000, 0xffffffff, 0xff333333};

uint32_t Grey10u(uint32_t value) {
    return value << 2 | value << 12 | value << 22;
}

const std::array<uint32_t, 3> kGreys10u = {Grey10u(0), Grey10u(1023), Grey10u(205)};

std::array<uint32_t, 3> Reversed(std::array<uint32_t, 3> rows) {
    std::swap(rows.front(), rows.back());
    return rows;
}

/// Converts three rows of one pixel; a negative sign walks the image from its last row in memory.
std::array<uint32_t, 3> ConvertRows(const std::array<uint32_t, 3>& source, PK_PixelFormat sourceFormat,
                                    int32_t sourceSign, PK_PixelFormat destinationFormat,
                                    int32_t destinationSign) {
    std::array<uint32_t, 3> destination{};
    const uint32_t* first = sourceSign < 0 ? &source.back() : &source.front();
    uint32_t* firstWritten = destinationSign < 0 ? &destination.back() : &destination.front();
    EXPECT_EQ(PK_Convert(first, 4 * sourceSign, sourceFormat, firstWritten, 4 * destinationSign,
                         destinationFormat, 1, 3, kQuality),
              PK_Success);
    return destination;
}

TEST(ConvertPixels, PictureKeepsItsSenseBetweenOrigins) {
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, 1, kTopDown, 1), Reversed(kGreys10u));
    EXPECT_EQ(ConvertRows(kGreys10u, kTopDown, 1, kBottomUp, 1), Reversed(kGreys8u));
}

TEST(ConvertPixels, RowsKeepTheirPlaceWithinOneOrigin) {
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, 1, PK_PixelFormat_BGRA_4444_8u, 1), kGreys8u);
    EXPECT_EQ(ConvertRows(kGreys10u, kTopDown, 1, kTopDown, 1), kGreys10u);
}

TEST(ConvertPixels, NegativeRowBytesTurnThePicture) {
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, -1, kTopDown, 1), kGreys10u);
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, 1, kTopDown, -1), kGreys10u);
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, -1, kTopDown, -1), Reversed(kGreys10u));
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, -1, PK_PixelFormat_BGRA_4444_8u, 1), Reversed(kGreys8u));
}

TEST(ConvertPixels, WithAllOriginsAtTheTopNoRowMoves) {
    const PKTest::FlagScope flags;
    PK::sAllOriginsTopLeft = 1;
    EXPECT_EQ(ConvertRows(kGreys8u, kBottomUp, 1, kTopDown, 1), kGreys10u);
}

TEST(ConvertPixels, LongChainsAndLongRowsComeOutWhole) {
    // Three steps, in scratch on the stack and beyond: a half-transparent white over black.
    for (const size_t width : {1, 7, 16384, 16385}) {
        const std::vector<uint32_t> source(2 * width, 0x80ffffff);
        std::vector<uint32_t> destination(2 * width, 0);
        const auto rowBytes = static_cast<int32_t>(4 * width);
        ASSERT_EQ(PK_Convert(source.data(), rowBytes, PK_PixelFormat_BGRA_4444_8u, destination.data(),
                             rowBytes, kTopDown, static_cast<int32_t>(width), 2, kQuality),
                  PK_Success);
        // 1023 x 128 / 255 = 513.5, and the half that is added lifts it.
        for (const uint32_t pixel : destination) ASSERT_EQ(pixel, Grey10u(514)) << width;
    }
}

} // namespace
