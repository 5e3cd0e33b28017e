// The bridges of four-word pixels, whose rows have no padding at either end.

#include "reference/ReferenceBridges.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>

using namespace PKTest;

namespace {

/// All rows as one, since nothing lies between them.
ImageShape OneRun(int width, int32_t height, size_t pixelBytes) {
    return {pixelBytes * static_cast<size_t>(width) * static_cast<size_t>(height), 1, 0, false};
}

void CheckBothWays(int width, int32_t height, Random& random) {
    SCOPED_TRACE(testing::Message() << width << " x " << height << ", seed " << random.Seed());
    const GuardedImage words(OneRun(width, height, 8), random);
    const GuardedImage packed(OneRun(width, height, 4), random);
    const Bytes wordsBefore = words.RowContent(0), packedBefore = packed.RowContent(0);
    AtEveryTarget([&] {
        ASSERT_EQ(PK_Convert_DNxHD16u_To_RGB_444_10u(words.Pixels(), packed.Pixels(), width, height),
                  PK_Success);
        packed.ExpectRows({ReferenceDNxHDToRGB10(wordsBefore, width * height)});
        packed.Restore();
        ASSERT_EQ(PK_Convert_RGB_444_10u_To_DNxHD16u(packed.Pixels(), words.Pixels(), width, height),
                  PK_Success);
        words.ExpectRows({ReferenceRGB10ToDNxHD(packedBefore, width * height, wordsBefore)});
        words.Restore();
    });
}

} // namespace

TEST(DNxHD, GivesWhatTheRuleSays) {
    Random random(42);
    for (int width = 1; width <= 70; ++width)
        CheckBothWays(width, 1 + static_cast<int32_t>(random.Below(3)), random);
}

TEST(DNxHD, ReadsTheHighestTenBitsOfThreeWords) {
    const uint16_t source[4] = {0x003f, 0xffff, 0x8040, 0xffff};
    uint32_t destination = 0;
    ASSERT_EQ(PK_Convert_DNxHD16u_To_RGB_444_10u(source, &destination, 1, 1), PK_Success);
    EXPECT_EQ(destination, 1023u << 12 | 0x201u << 22);
}

TEST(DNxHD, DoesNotTouchTheFourthWord) {
    const uint32_t source[2] = {0xffffffff, 1u << 2 | 2u << 12 | 3u << 22 | 3};
    // The last word of the last pixel lies on the guard page.
    const GuardedRows memory(14, Guard::kAfter);
    std::fill_n(memory.Bytes(), 14, uint8_t{0xa5});
    ASSERT_EQ(PK_Convert_RGB_444_10u_To_DNxHD16u(source, memory.Bytes(), 2, 1), PK_Success);
    const Bytes expected = {0xc0, 0xff, 0xc0, 0xff, 0xc0, 0xff, 0xa5, 0xa5, 0x40, 0, 0x80, 0, 0xc0, 0};
    EXPECT_EQ(Bytes(memory.Bytes(), memory.Bytes() + 14), expected);
}

TEST(DNxHD, SucceedsWithoutWorkAndRefusesWhatItCannotKnow) {
    uint64_t pixel = 0;
    for (const auto convert : {PK_Convert_DNxHD16u_To_RGB_444_10u, PK_Convert_RGB_444_10u_To_DNxHD16u}) {
        EXPECT_EQ(convert(nullptr, nullptr, 16, 0), PK_Success);
        EXPECT_EQ(convert(nullptr, nullptr, 16, INT32_MIN), PK_Success);
        EXPECT_EQ(convert(nullptr, nullptr, 0, 16), PK_Success);
        EXPECT_EQ(convert(nullptr, &pixel, 1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, nullptr, 1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, &pixel, -1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(&pixel, &pixel, INT32_MAX, INT32_MAX), PK_ErrFailed);
    }
}
