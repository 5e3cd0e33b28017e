// The bridge from three-word RGB to XRGB_4444_15u, whose members differ.

#include "reference/ReferenceBridges.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>
#include <PixelKiln/Lifecycle.h>

#include <cstring>

using namespace PKTest;

namespace {

/// The member as the flags of SSE4.1 and AVX2 choose it.
bool IsRounded() {
    return PK::sCPUHasAVX2 || PK::sCPUHasSSE4;
}

std::vector<uint16_t> Convert(const std::vector<uint16_t>& source, int width, int height) {
    std::vector<uint16_t> result(source.size() / 3 * 4, 0xa5a5);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source.data(), result.data(), width, height);
    return result;
}

} // namespace

TEST(XRGB15, PlainMemberTruncatesBehindAnOddFirstWord) {
    const FlagScope restore;
    PK::sCPUHasAVX2 = PK::sCPUHasSSE4 = 0;
    // 32768 / 1023 = 32.03, 511 x 32768 / 1023 = 16367.9, 1022 x 32768 / 1023 = 32735.9
    EXPECT_EQ(Convert({0, 1, 511, 512, 1022, 1023}, 2, 1),
              (std::vector<uint16_t>{65535, 0, 32, 16367, 65535, 16400, 32735, 32768}));
}

TEST(XRGB15, VectorMemberRoundsBehindAZero) {
    ASSERT_EQ(PK_Initialize(), PK_Success);
    if (PK_hasSSE4()) {
        EXPECT_EQ(Convert({0, 1, 511, 512, 1022, 1023}, 2, 1),
                  (std::vector<uint16_t>{0, 0, 32, 16368, 0, 16400, 32736, 32768}));
        EXPECT_EQ(Convert({2046, 2047, 65535}, 1, 1), (std::vector<uint16_t>{0, 65535, 65535, 65535}))
            << "2046 x 32.03128 is 65535.9988";
    }
    PK_Terminate();
}

TEST(XRGB15, EachFlagCountsByItself) {
    ASSERT_EQ(PK_Initialize(), PK_Success);
    {
        const FlagScope restore;
        const bool hasAVX2 = PK::sCPUHasAVX2 != 0, hasSSE4 = PK::sCPUHasSSE4 != 0;
        PK::sCPUHasSSE2 = PK::sCPUHasSSSE3 = PK::sCPUHasSSE4 = 0;
        if (hasAVX2) {
            EXPECT_EQ(Convert({511, 511, 511}, 1, 1)[0], 0);
        }
        PK::sCPUHasAVX2 = 0;
        EXPECT_EQ(Convert({511, 511, 511}, 1, 1)[0], 65535);
        PK::sCPUHasSSE4 = hasSSE4;
        if (hasSSE4) {
            EXPECT_EQ(Convert({511, 511, 511}, 1, 1)[0], 0);
        }
    }
    PK_Terminate();
}

TEST(XRGB15, TurnsThePictureUpsideDown) {
    const std::vector<uint16_t> source = {0, 0, 1, 0, 0, 2, 0, 0, 3};
    const std::vector<uint16_t> result = Convert(source, 1, 3);
    EXPECT_EQ(result[3], 96);
    EXPECT_EQ(result[7], 64);
    EXPECT_EQ(result[11], 32);
}

TEST(XRGB15, GivesWhatTheRuleSaysForAnyWords) {
    Random random(46);
    for (int width = 1; width <= 70; ++width) {
        SCOPED_TRACE(testing::Message() << width << ", seed " << random.Seed());
        const int32_t height = 1 + static_cast<int32_t>(random.Below(3));
        const GuardedImage source({6 * static_cast<size_t>(width), height, 0, false}, random);
        const GuardedImage destination({8 * static_cast<size_t>(width), height, 0, false}, random);
        AtEveryTarget([&] {
            destination.Restore();
            std::vector<Bytes> expected;
            for (int32_t row = height; row-- > 0;)
                expected.push_back(ReferenceXRGB15(source.RowContent(row), width, IsRounded()));
            PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source.Pixels(), destination.Pixels(), width, height);
            destination.ExpectRows(expected);
        });
    }
}

TEST(XRGB15, GivesWhatTheRuleSaysForAllCodes) {
    Bytes source(2 * 65538);
    for (uint32_t c = 0; c < 65536; ++c) {
        const auto word = static_cast<uint16_t>(c);
        std::memcpy(&source[2 * c], &word, sizeof word);
    }
    Bytes result(8 * 21846);
    AtEveryTarget([&] {
        PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source.data(), result.data(), 21846, 1);
        ASSERT_EQ(result, ReferenceXRGB15(source, 21846, IsRounded()));
    });
}

TEST(XRGB15, DoesNothingOnBadInput) {
    uint16_t source[3] = {1, 2, 3}, destination[4] = {9, 9, 9, 9};
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(nullptr, destination, 1, 1);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, nullptr, 1, 1);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, -1, 1);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, 0, 1);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, 1, 0);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, 1, INT32_MIN);
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, INT32_MAX, INT32_MAX);
    EXPECT_EQ(std::count(destination, destination + 4, 9), 4);
}
