// Blocks of DV as bytes and as pairs of pixels.

#include "primitives/DVMacroblocks.h"

#include "primitives/Dispatch.h"
#include "support/GuardedRows.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace PK {
namespace {

constexpr int32_t kSamples = 64;

uint8_t ByteOf(int sample) {
    return static_cast<uint8_t>(sample >= 128 ? 255 : std::max(sample, -128) + 128);
}

/// Blocks whose samples tell where they were: 40 x the block + 8 x the line + the column, around 0 and beyond.
std::vector<int16_t> NumberedBlocks(int count) {
    std::vector<int16_t> blocks(size_t(count * kSamples));
    for (size_t i = 0; i < blocks.size(); ++i)
        blocks[i] = static_cast<int16_t>(i / kSamples * 40 + i % kSamples) - 180;
    return blocks;
}

int Sample(const std::vector<int16_t>& blocks, int block, int line, int column) {
    return blocks[size_t(kSamples * block + 8 * line + column)];
}

TEST(DVMacroblocks, BytesAreSaturated) {
    constexpr int16_t kValues[] = {-32768, -129, -128, -127, -1, 0, 1, 126, 127, 128, 32767};
    constexpr uint8_t kExpected[] = {0, 0, 0, 1, 127, 128, 129, 254, 255, 255, 255};
    PKTest::AtEveryTarget([&] {
        for (size_t place = 0; place < kSamples; ++place)
            for (size_t i = 0; i < std::size(kValues); ++i) {
                std::vector<int16_t> block(kSamples);
                block[place] = kValues[i];
                uint8_t bytes[kSamples];
                Best<DVMacroblockKernels>().toBytes(block.data(), bytes);
                for (size_t other = 0; other < kSamples; ++other)
                    ASSERT_EQ(other == place ? kExpected[i] : 128, bytes[other]);
            }
    });
}

/// Y on even bytes, from the left block and then from the right one; U and V in turns between them.
void ExpectRow(const std::vector<int16_t>& blocks, const int (&yuyv)[4], int line, const uint8_t* row) {
    const auto& [left, right, u, v] = yuyv;
    for (int x = 0; x < 16; ++x) {
        ASSERT_EQ(ByteOf(Sample(blocks, x < 8 ? left : right, line, x % 8)), row[2 * x]) << "column " << x;
        ASSERT_EQ(ByteOf(Sample(blocks, x % 2 == 0 ? u : v, line, x / 2)), row[2 * x + 1]) << "column " << x;
    }
}

TEST(DVMacroblocks, DV50HasLumaInEverySecondBlock) {
    const std::vector<int16_t> blocks = NumberedBlocks(6 * 5);
    PKTest::AtEveryTarget([&] {
        for (const int32_t lineStep : {1, 2})
            for (const int firstLine : {0, 1}) {
                if (lineStep == 1 && firstLine == 1) continue;
                const int rows = 8 / lineStep;
                constexpr int32_t kRowBytes = 40;
                std::vector<uint8_t> images(size_t(5 * rows * kRowBytes), 7);
                const int16_t* sources[5];
                uint8_t* destinations[5];
                for (int i = 0; i < 5; ++i) {
                    sources[i] = blocks.data() + 6 * kSamples * i + 8 * firstLine;
                    destinations[i] =
                        images.data() + rows * kRowBytes * (4 - i) + (rows - 1) * kRowBytes; // upward
                }
                ASSERT_EQ(0, PackMacroblocksDV50(sources, destinations, -kRowBytes, lineStep));
                for (int i = 0; i < 5; ++i)
                    for (int row = 0; row < rows; ++row) {
                        const uint8_t* const written = destinations[i] - row * kRowBytes;
                        ExpectRow(blocks, {6 * i, 6 * i + 2, 6 * i + 5, 6 * i + 4},
                                  firstLine + lineStep * row, written);
                        ASSERT_EQ(7, written[32]) << "beyond the macroblock";
                    }
            }
    });
}

TEST(DVMacroblocks, DV100HasTwoPieces) {
    const std::vector<int16_t> blocks = NumberedBlocks(8 * 5);
    PKTest::AtEveryTarget([&] {
        constexpr int32_t kRowBytes = 32;
        std::vector<uint8_t> image(size_t(5 * 16 * kRowBytes), 7);
        DVPiece pieces[5][2];
        for (int i = 0; i < 5; ++i) {
            uint8_t* const at = image.data() + 16 * kRowBytes * i;
            pieces[i][0] = {at, 2 * kRowBytes, 0, 1}; // lines in turns
            pieces[i][1] = {at + kRowBytes, 2 * kRowBytes, 0, 1};
        }
        pieces[3][0].destination = nullptr;
        pieces[4][1] = {pieces[4][1].destination, kRowBytes, 1, 2};
        ASSERT_EQ(0, PackMacroblocksDV100(blocks.data(), pieces));
        for (int i = 0; i < 3; ++i)
            for (int line = 0; line < 8; ++line) {
                const uint8_t* const row = image.data() + (16 * i + 2 * line) * kRowBytes;
                ExpectRow(blocks, {8 * i, 8 * i + 1, 8 * i + 6, 8 * i + 4}, line, row);
                ExpectRow(blocks, {8 * i + 2, 8 * i + 3, 8 * i + 7, 8 * i + 5}, line, row + kRowBytes);
            }
        for (int byte = 0; byte < 32; ++byte) ASSERT_EQ(7, image[size_t((16 * 3) * kRowBytes + byte)]);
        for (int row = 0; row < 4; ++row)
            ExpectRow(blocks, {34, 35, 39, 37}, 2 * row + 1, image.data() + (16 * 4 + 1 + row) * kRowBytes);
    });
}

TEST(DVMacroblocks, NothingBesideIsTouched) {
    PKTest::AtEveryTarget([] {
        const PKTest::GuardedRows blocks(4 * kSamples * sizeof(int16_t), PKTest::Guard::kAfter);
        std::fill_n(blocks.Bytes(), blocks.Size(), uint8_t{1});
        const PKTest::GuardedRows rows(8 * 32, PKTest::Guard::kAfter);
        const auto* const first = reinterpret_cast<const int16_t*>(blocks.Bytes());
        Best<DVMacroblockKernels>().toYUYV({first, first + 64, first + 128, first + 192, 1}, rows.Bytes(),
                                           32);
        EXPECT_EQ(255, rows.Bytes()[255]);
        const PKTest::GuardedRows bytes(kSamples, PKTest::Guard::kAfter);
        Best<DVMacroblockKernels>().toBytes(first + 192, bytes.Bytes());
        EXPECT_EQ(255, bytes.Bytes()[63]);
    });
}

TEST(DVMacroblocks, NullPointersAreAnError) {
    std::vector<int16_t> blocks(8 * 5 * kSamples);
    std::vector<uint8_t> row(32 * 8);
    const int16_t* sources[5] = {blocks.data(), blocks.data(), blocks.data(), blocks.data(), nullptr};
    uint8_t* const destinations[5] = {row.data(), row.data(), row.data(), row.data(), row.data()};
    EXPECT_EQ(-8, PackMacroblocksDV50(sources, destinations, 32, 1));
    EXPECT_EQ(-8, PackMacroblocksDV100(nullptr, {}));
}

} // namespace
} // namespace PK
