#include <PixelKiln/PixelKiln.h>

#include "support/DVSegmentReader.h"

#include <gtest/gtest.h>
#include <vector>

namespace {

struct Case {
    PK_PixelFormat format;
    size_t bytes;
    uint8_t application;
};

TEST(BlackDVFrame, FillsAreOneWholeFrameWhateverTheSize) {
    for (const Case& c :
         {Case{PK_PixelFormat_NTSCDV25, 120000, 0xf9}, Case{PK_PixelFormat_PALDV25, 144000, 0xf8}}) {
        std::vector<uint8_t> black(c.bytes + 1, 0x5a), other = black;
        ASSERT_EQ(PK_FillWithOpaqueBlack(black.data(), 0, 720, 480, c.format), PK_Success);
        EXPECT_EQ(black.back(), 0x5a);
        EXPECT_EQ(black[4], c.application);
        ASSERT_EQ(PK_FillWithOpaqueWhite(other.data(), 7, 1, 2, c.format), PK_Success);
        EXPECT_EQ(other, black);
        ASSERT_EQ(PK_FillWithTransparentBlack(other.data(), 7, 1, 2, c.format), PK_ErrBadDstFormat);
    }
}

TEST(BlackDVFrame, EverySegmentIsBlack) {
    std::vector<uint8_t> frame(144000);
    ASSERT_EQ(PK_FillWithOpaqueBlack(frame.data(), 0, 720, 576, PK_PixelFormat_PALDV25), PK_Success);
    for (size_t s = 0; s < 12; ++s)
        for (size_t k = 0; k < 27; ++k) {
            const auto read = PKTest::ReadDVSegment(frame.data() + 12000 * s + 80 * (7 + 5 * k + k / 3), 6);
            for (size_t i = 0; i < 30; ++i) {
                ASSERT_EQ(read.blocks[i].dc, i % 6 < 4 ? 2 * (16 - 128) : 0);
                ASSERT_EQ(read.blocks[i].bits, 16u);
            }
        }
}

} // namespace
