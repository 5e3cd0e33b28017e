// Constant fills repeat the pixel over exactly the rectangle, at any address, size and step, whichever way a
// run is written.

#include "primitives/FillPixels.h"

#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

constexpr uint8_t kUntouched = 0xa5;

struct Rectangle {
    int32_t width, height;
    ptrdiff_t padding; // bytes between the pixels of one row and the next
    bool upwards;
};

int32_t Fill(const std::vector<uint8_t>& pixel, uint8_t* destination, ptrdiff_t step, const Rectangle& size) {
    uint16_t words[4];
    float floats[4];
    switch (pixel.size()) {
    case 4:
        return FillPixels4x8u(pixel.data(), destination, step, size.width, size.height);
    case 8:
        std::memcpy(words, pixel.data(), sizeof words);
        return FillPixels4x16u(words, destination, step, size.width, size.height);
    default:
        std::memcpy(floats, pixel.data(), sizeof floats);
        return FillPixels4x32f(floats, destination, step, size.width, size.height);
    }
}

// Fills rows in memory that ends (or begins) at an inaccessible page, with a margin on the other side.
void CheckFill(const std::vector<uint8_t>& pixel, const Rectangle& size, Guard guard, size_t margin) {
    SCOPED_TRACE(testing::Message() << "pixels of " << pixel.size() << " bytes, " << size.width << " x "
                                    << size.height << ", padding " << size.padding << ", upwards "
                                    << size.upwards << ", margin " << margin);
    const size_t rowBytes = pixel.size() * static_cast<size_t>(size.width);
    const size_t step = rowBytes + static_cast<size_t>(size.padding);
    const auto rows = static_cast<size_t>(size.height);
    const GuardedRows memory(margin + step * (rows - 1) + rowBytes, guard);
    std::fill_n(memory.Bytes(), memory.Size(), kUntouched);
    uint8_t* lowest = memory.Bytes() + (guard == Guard::kBefore ? 0 : margin);
    std::vector<uint8_t> expected(memory.Bytes(), memory.Bytes() + memory.Size());
    for (size_t row = 0; row < rows; ++row)
        for (size_t i = 0; i < rowBytes; ++i)
            expected[static_cast<size_t>(lowest - memory.Bytes()) + row * step + i] = pixel[i % pixel.size()];

    const auto signedStep = static_cast<ptrdiff_t>(step);
    uint8_t* first = size.upwards ? lowest + signedStep * (size.height - 1) : lowest;
    ASSERT_EQ(Fill(pixel, first, size.upwards ? -signedStep : signedStep, size), 0);
    const auto [wrong, right] =
        std::mismatch(memory.Bytes(), memory.Bytes() + memory.Size(), expected.begin());
    ASSERT_EQ(wrong, memory.Bytes() + memory.Size()) << "at byte " << wrong - memory.Bytes();
}

TEST(FillPixels, FillsRowsOfEveryWidthAndAlignment) {
    Random random(11);
    AtEveryTarget([&] {
        for (const size_t pixelBytes : {4, 8, 16}) {
            const std::vector<uint8_t> pixel = random.Bytes(pixelBytes);
            for (int32_t width = 1; width <= 80; ++width) {
                const size_t margin = random.Below(70);
                CheckFill(pixel, {width, 2, 0, false}, Guard::kAfter, margin);
                CheckFill(pixel, {width, 3, static_cast<ptrdiff_t>(random.Below(40)), true}, Guard::kBefore,
                          margin);
                CheckFill(pixel, {width, 3, static_cast<ptrdiff_t>(random.Below(40)), false}, Guard::kAfter,
                          margin);
            }
        }
    });
}

TEST(FillPixels, FillsLongRunsByEitherStringInstruction) {
    Random random(12);
    constexpr int32_t kBytes = 1 << 20; // from here on images are large
    std::vector<uint8_t> periodic = random.Bytes(16);
    std::copy_n(periodic.begin(), 8, periodic.begin() + 8);
    AtEveryTarget([&] {
        for (const std::vector<uint8_t>& pixel :
             {random.Bytes(4), random.Bytes(8), random.Bytes(16), periodic}) {
            const auto size = static_cast<int32_t>(pixel.size());
            for (const size_t margin : {0, 1, 4, 63}) {
                CheckFill(pixel, {kBytes / size, 1, 0, false}, Guard::kAfter, margin);
                CheckFill(pixel, {kBytes / size - 1, 1, 0, false}, Guard::kAfter, margin);
                CheckFill(pixel, {100003 / size, 11, 0, false}, Guard::kBefore, margin);
                CheckFill(pixel, {kBytes / size + 5, 2, 20, true}, Guard::kAfter, margin);
            }
        }
    });
}

// Such pixels could be taken for ones of 8 bytes: two float samples of a colour are often the same.
TEST(FillPixels, FillsLargeImagesWithPixelsWhoseHalvesDifferInOneByte) {
    Random random(14);
    for (size_t place = 8; place < 16; ++place) {
        std::vector<uint8_t> pixel = random.Bytes(16);
        std::copy_n(pixel.begin(), 8, pixel.begin() + 8);
        pixel[place] ^= 0x10;
        for (const size_t margin : {0, 4, 9}) CheckFill(pixel, {65536, 1, 0, false}, Guard::kAfter, margin);
        CheckFill(pixel, {300, 250, 20, true}, Guard::kBefore, 0);
    }
}

// Rows that begin at another place of a cache line are filled from the pixel turned round, which may differ from the
// one before in its last bytes alone.
TEST(FillPixels, FillsLargeImagesWithPixelsThatAreTheSameWhenTurnedButForOneByte) {
    std::vector<uint8_t> pixel(16, 7);
    pixel.back() = 9;
    for (const ptrdiff_t padding : {1, 2, 4, 8, 15})
        CheckFill(pixel, {300, 250, padding, false}, Guard::kAfter, 0);
}

TEST(FillPixels, FillsTheRowsOfLargeImagesBetweenTheirGaps) {
    Random random(13);
    constexpr int32_t kRows = 300; // of 4 KiB make an image of more than 1 MiB
    constexpr int32_t kRowBytes = 4096;
    std::vector<uint8_t> periodic = random.Bytes(16);
    std::copy_n(periodic.begin(), 8, periodic.begin() + 8);
    AtEveryTarget([&] {
        for (const std::vector<uint8_t>& pixel :
             {random.Bytes(4), random.Bytes(8), random.Bytes(16), periodic}) {
            const auto size = static_cast<int32_t>(pixel.size());
            const size_t margin = random.Below(70);
            // Gaps with which rows begin at the same place in a cache line, in a vector, and nowhere in particular.
            for (const ptrdiff_t padding : {64, 48, 20, 7}) {
                CheckFill(pixel, {kRowBytes / size, kRows, padding, false}, Guard::kAfter, margin);
                CheckFill(pixel, {kRowBytes / size + 3, kRows, padding, true}, Guard::kBefore, margin);
            }
            CheckFill(pixel, {kRowBytes / size - 1, kRows, 20, false}, Guard::kAfter, margin);
            CheckFill(pixel, {5 * kRowBytes / size, kRows / 4, 20, false}, Guard::kAfter, margin);
        }
    });
}

TEST(FillPixels, OfNothingWritesNothing) {
    uint8_t bytes[4] = {1, 2, 3, 4};
    const std::vector<uint8_t> pixel = {9, 9, 9, 9};
    EXPECT_EQ(Fill(pixel, bytes, 0, {0, 5, 0, false}), 0);
    EXPECT_EQ(Fill(pixel, bytes, 4, {5, 0, 0, false}), 0);
    EXPECT_EQ(Fill(pixel, bytes, 20, {5, 0, 0, false}), 0);
    EXPECT_EQ(bytes[0], 1);
}

TEST(FillPixels, RefusesNullPointersAndNegativeSizes) {
    uint8_t bytes[4] = {1, 2, 3, 4};
    const float floats[4] = {};
    EXPECT_EQ(FillPixels4x8u(bytes, nullptr, 4, 1, 1), -8);
    EXPECT_EQ(FillPixels4x16u(nullptr, bytes, 4, 1, 1), -8);
    EXPECT_EQ(FillPixels4x32f(floats, nullptr, 4, 1, 1), -8);
    EXPECT_EQ(FillPixels4x32f(floats, bytes, 4, -1, 1), -6);
    EXPECT_EQ(FillPixels4x32f(floats, bytes, 4, 1, -1), -6);
    EXPECT_EQ(bytes[0], 1);
}

} // namespace
} // namespace PK
