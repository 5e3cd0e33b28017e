// The bridges that convert row by row between two layouts, each against its restatement, at every width from
// 0 up, with rows of either direction, padded, and ending at a guard page.

#include "reference/ReferenceBridges.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>

using namespace PKTest;

namespace {

struct RowBridge {
    const char* name;
    PK_Result (*convert)(const void*, int32_t, void*, int32_t, int32_t, int32_t) noexcept;
    size_t (*sourceBytes)(int width);
    size_t (*destinationBytes)(int width);
    Bytes (*reference)(const Bytes& source, int width);
};

template <size_t kBytes>
size_t PixelsOf(int width) {
    return kBytes * static_cast<size_t>(width);
}

size_t V210Groups(int width) {
    return static_cast<size_t>((width + 5) / 6) * 16;
}

Bytes WithPartialGroup(const Bytes& source, int width) {
    return ReferenceUYVY10ToV210(source, width, true);
}

constexpr RowBridge kBridges[] = {
    {"RGB8", PK_ConvertRGB_444_8uToBGRA_4444_8u, PixelsOf<3>, PixelsOf<4>, ReferenceRGB8ToBGRA},
    {"UYVY10ToV210", PK_ConvertUYVY_422_10uToV210_422_10u, PixelsOf<4>, V210Groups, WithPartialGroup},
    {"BGR16ToRGB10", PK_Convert_j2k_BGR16u_To_RGB_444_10u, PixelsOf<6>, PixelsOf<4>, ReferenceBGR16ToRGB10},
    {"RGB10ToBGR16", PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, PixelsOf<4>, PixelsOf<6>,
     ReferenceRGB10ToBGR16},
    {"V210ToUYVY10", PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u, V210Groups, PixelsOf<4>,
     ReferenceV210ToUYVY10},
};

class RowBridges : public testing::TestWithParam<RowBridge> {};

void CheckBridge(const RowBridge& bridge, int width, int32_t height, Random& random) {
    const auto shape = [&](size_t rowLength) {
        return ImageShape{rowLength, height, random.Below(2) == 0 ? 0 : random.Below(40),
                          random.Below(2) == 0};
    };
    const GuardedImage source(shape(bridge.sourceBytes(width)), random);
    const GuardedImage destination(shape(bridge.destinationBytes(width)), random);
    std::vector<Bytes> expected;
    for (int32_t row = 0; row < height; ++row)
        expected.push_back(bridge.reference(source.RowContent(row), width));
    SCOPED_TRACE(testing::Message() << bridge.name << ", " << width << " x " << height << ", seed "
                                    << random.Seed());
    AtEveryTarget([&] {
        destination.Restore();
        ASSERT_EQ(bridge.convert(source.Pixels(), source.RowBytes(), destination.Pixels(),
                                 destination.RowBytes(), width, height),
                  PK_Success);
        destination.ExpectRows(expected);
    });
}

} // namespace

TEST_P(RowBridges, GivesWhatTheRuleSays) {
    Random random(41);
    for (int width = 0; width <= 130; ++width) {
        CheckBridge(GetParam(), width, 1 + static_cast<int32_t>(random.Below(3)), random);
        if (HasFatalFailure()) return;
    }
    CheckBridge(GetParam(), 1921, 3, random);
}

TEST_P(RowBridges, SucceedsWithoutWork) {
    const auto convert = GetParam().convert;
    EXPECT_EQ(convert(nullptr, 0, nullptr, 0, 16, 0), PK_Success);
    EXPECT_EQ(convert(nullptr, 0, nullptr, 0, 16, -5), PK_Success);
    EXPECT_EQ(convert(nullptr, 0, nullptr, 0, -1, INT32_MIN), PK_Success);
    EXPECT_EQ(convert(nullptr, 0, nullptr, 0, 0, 16), PK_Success);
}

TEST_P(RowBridges, RefusesWhatItCannotKnow) {
    const auto convert = GetParam().convert;
    uint8_t pixels[64] = {};
    EXPECT_EQ(convert(nullptr, 64, pixels, 64, 1, 1), PK_ErrFailed);
    EXPECT_EQ(convert(pixels, 64, nullptr, 64, 1, 1), PK_ErrFailed);
    EXPECT_EQ(convert(pixels, 64, pixels, 64, -1, 1), PK_ErrFailed);
    EXPECT_EQ(convert(pixels, 64, pixels, 64, INT32_MIN, 1), PK_ErrFailed);
    EXPECT_EQ(convert(pixels, 64, pixels, 64, 134217728, 1), PK_ErrFailed);
    EXPECT_EQ(convert(pixels, 64, pixels, 64, INT32_MAX, INT32_MAX), PK_ErrFailed);
}

INSTANTIATE_TEST_SUITE_P(All, RowBridges, testing::ValuesIn(kBridges),
                         [](const auto& instance) { return std::string(instance.param.name); });

TEST(RGB8Bridge, TurnsTheOrderAndAddsAlpha) {
    const uint8_t source[6] = {1, 2, 3, 250, 251, 252};
    uint8_t destination[8] = {};
    ASSERT_EQ(PK_ConvertRGB_444_8uToBGRA_4444_8u(source, 6, destination, 8, 2, 1), PK_Success);
    const uint8_t expected[8] = {3, 2, 1, 255, 252, 251, 250, 255};
    EXPECT_TRUE(std::equal(expected, expected + 8, destination));
}

TEST(UYVY10Bridge, PacksSixPixels) {
    const uint16_t source[12] = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 1023};
    uint32_t destination[4] = {};
    ASSERT_EQ(PK_ConvertUYVY_422_10uToV210_422_10u(source, 24, destination, 16, 6, 1), PK_Success);
    const uint32_t expected[4] = {0x00300801, 0x00601404, 0x00902007, 0x3ff02c0a};
    EXPECT_TRUE(std::equal(expected, expected + 4, destination));
}

TEST(UYVY10Bridge, TakesSamplesAsTheyAre) {
    const uint16_t source[12] = {0xffff, 0, 0xffff, 0, 0x0400, 0};
    uint32_t destination[4] = {};
    ASSERT_EQ(PK_ConvertUYVY_422_10uToV210_422_10u(source, 24, destination, 16, 6, 1), PK_Success);
    EXPECT_EQ(destination[0], 0xfff0ffffu);
    EXPECT_EQ(destination[1], 0x00100000u);
}

TEST(UYVY10Bridge, FillsTheLastGroupWithBlack) {
    const uint16_t source[14] = {0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 700, 800};
    uint32_t destination[8] = {};
    ASSERT_EQ(PK_ConvertUYVY_422_10uToV210_422_10u(source, 28, destination, 32, 7, 1), PK_Success);
    EXPECT_EQ(destination[4], 700u | 800u << 10 | 512u << 20);
    EXPECT_EQ(destination[5], 64u | 512u << 10 | 64u << 20);
    EXPECT_EQ(destination[6], 512u | 64u << 10 | 512u << 20);
    EXPECT_EQ(destination[7], 64u | 512u << 10 | 64u << 20);
}

TEST(UYVY10Bridge, DropsTheLastGroupWhereTheRowHasNoRoomForIt) {
    const uint16_t source[28] = {};
    uint32_t destination[12];
    for (const int32_t rowBytes : {16, 31, -16, -31}) {
        std::fill(destination, destination + 12, 0xdeadbeef);
        ASSERT_EQ(PK_ConvertUYVY_422_10uToV210_422_10u(source, 28, destination, rowBytes, 7, 1), PK_Success);
        EXPECT_EQ(destination[3], 0u) << rowBytes;
        EXPECT_EQ(destination[4], 0xdeadbeef) << rowBytes;
    }
    for (const int32_t rowBytes : {32, -32}) {
        ASSERT_EQ(PK_ConvertUYVY_422_10uToV210_422_10u(source, 28, destination, rowBytes, 7, 1), PK_Success);
        EXPECT_EQ(destination[5], 64u | 512u << 10 | 64u << 20) << rowBytes;
    }
}

TEST(J2KBridge, KeepsTheHighestTenBits) {
    const uint16_t source[3] = {0xffff, 0x0040, 0x003f};
    uint32_t destination = 0;
    ASSERT_EQ(PK_Convert_j2k_BGR16u_To_RGB_444_10u(source, 6, &destination, 4, 1, 1), PK_Success);
    EXPECT_EQ(destination, 1023u << 2 | 1u << 12);
}

TEST(J2KBridge, PutsSamplesIntoTheLowestTenBits) {
    const uint32_t source = 1023u << 2 | 5u << 12 | 600u << 22 | 3;
    uint16_t destination[3] = {};
    ASSERT_EQ(PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u(&source, 4, destination, 6, 1, 1),
              PK_Success);
    EXPECT_EQ(destination[0], 1023);
    EXPECT_EQ(destination[1], 5);
    EXPECT_EQ(destination[2], 600);
}
