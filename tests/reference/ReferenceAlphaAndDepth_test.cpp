// Premultiplication and depth changes against values worked out by hand.
#include <bit>
#include <limits>

#include "ReferenceSamples.h"
#include "ReferenceTestRow.h"

namespace {

using namespace reference;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

TEST(ReferencePremultiplication, RGB8u) {
    const char* kernel = "PremultiplyRow";
    // 200 x 128 / 255 is 100.39, 1 x 128 / 255 is 0.502
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kBGRA_4444_8u, kBGRP_4444_8u, Bytes{200, 255, 1, 128}, 1),
              (Bytes{100, 128, 1, 128}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kARGB_4444_8u, kPRGB_4444_8u, Bytes{128, 200, 255, 1}, 1),
              (Bytes{128, 100, 128, 1}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kARGB_4444_8u, kPRGB_4444_8u, Bytes{0, 9, 8, 7, 255, 9, 8, 7}, 2),
              (Bytes{0, 0, 0, 0, 255, 9, 8, 7}));
}

TEST(ReferencePremultiplication, YUV8uMovesAboutItsZero) {
    // 112 x 0.50196 + 128 = 184.2, -112 x 0.50196 + 128 = 71.8, 219 x 0.50196 + 16 = 125.9
    EXPECT_EQ(ConvertRow<uint8_t>("PremultiplyRow", kVUYA_4444_8u, kVUYP_4444_8u,
                                  Bytes{240, 16, 235, 128, 7, 8, 9, 0}, 2),
              (Bytes{184, 72, 126, 128, 128, 128, 16, 0}));
}

TEST(ReferencePremultiplication, RGB15uRoundsHalvesToEven) {
    EXPECT_EQ(ConvertRow<uint16_t>("PremultiplyRow", kBGRA_4444_15u, kBGRP_4444_15u,
                                   Words{1, 3, 32768, 16384, 65535, 0, 2, 65535}, 2),
              (Words{0, 2, 16384, 16384, 32768, 0, 4, 65535}));
}

TEST(ReferencePremultiplication, Float) {
    EXPECT_EQ(
        ConvertRow<float>("PremultiplyRow", kVUYA_4444_32f, kVUYP_4444_32f, Floats{-0.5f, 0.25f, 3, 0.5f}, 1),
        (Floats{-0.25f, 0.125f, 1.5f, 0.5f}));
    EXPECT_EQ(ConvertRow<float>("PremultiplyRow", kARGB_4444_32f, kPRGB_4444_32f, Floats{0.5f, 1, 2, 3}, 1),
              (Floats{0.5f, 0.5f, 1, 1.5f}));
}

TEST(ReferenceUnpremultiplication, RGB8u) {
    const char* kernel = "UnpremultiplyRow";
    // 255 / 128 x 100 is 199.2; 255 / 170 is 1.5, so that 1 and 3 fall on halves
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kBGRP_4444_8u, kBGRA_4444_8u,
                                  Bytes{100, 200, 128, 128, 1, 3, 170, 170, 9, 8, 7, 0}, 3),
              (Bytes{199, 255, 255, 128, 2, 4, 255, 170, 0, 0, 0, 0}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kPRGB_4444_8u, kARGB_4444_8u, Bytes{170, 1, 3, 4}, 1),
              (Bytes{170, 2, 4, 6}));
}

TEST(ReferenceUnpremultiplication, YUV8u) {
    // 56 x 1.9921875 + 128 = 239.6, -56 x 1.9921875 + 128 = 16.4, 110 x 1.9921875 + 16 = 235.1
    EXPECT_EQ(ConvertRow<uint8_t>("UnpremultiplyRow", kVUYP_4444_8u_709, kVUYA_4444_8u_709,
                                  Bytes{184, 72, 126, 128, 200, 3, 90, 0}, 2),
              (Bytes{240, 16, 235, 128, 0, 0, 0, 0}));
}

TEST(ReferenceUnpremultiplication, RGB15u) {
    // 32768 / 3 is 10922.67
    EXPECT_EQ(ConvertRow<uint16_t>("UnpremultiplyRow", kBGRP_4444_15u, kBGRA_4444_15u,
                                   Words{1, 2, 4, 3, 3, 20000, 8, 16384, 5, 6, 7, 0}, 3),
              (Words{10923, 21845, 32768, 3, 6, 32768, 16, 16384, 0, 0, 0, 0}));
    EXPECT_EQ(
        ConvertRow<uint16_t>("UnpremultiplyRow", kPRGB_4444_15u, kARGB_4444_15u, Words{16384, 3, 4, 5}, 1),
        (Words{16384, 6, 8, 10}));
}

TEST(ReferenceUnpremultiplication, FloatTakesTheReciprocalEstimate) {
    const auto row = ConvertRow<float>(
        "UnpremultiplyRow", kBGRP_4444_32f, kBGRA_4444_32f,
        Floats{0.25f, -0.5f, 1, 0.5f, 1, 2, 3, 7.9e-6f, 8e-6f, 0, 0, 8e-6f, 1, 2, 3, -1}, 4);
    const float bound = 1.5f / 4096.0f; // of the estimate's relative error
    EXPECT_NEAR(row[0], 0.5f, 0.5f * bound);
    EXPECT_NEAR(row[1], -1.0f, bound);
    EXPECT_NEAR(row[2], 2.0f, 2.0f * bound);
    EXPECT_EQ(row[3], 0.5f);
    EXPECT_EQ((Floats{row[4], row[5], row[6], row[7]}), (Floats{0, 0, 0, 0}));
    EXPECT_NEAR(row[8], 1.0f, bound);
    EXPECT_EQ(row[11], 8e-6f);
    EXPECT_EQ((Floats{row[12], row[13], row[14], row[15]}), (Floats{0, 0, 0, 0}));
}

TEST(ReferenceDepthChange, ConstantsAreTheNearestFloats) {
    EXPECT_EQ(std::bit_cast<uint32_t>(kOneBy255), 0x3b808081u);
    EXPECT_EQ(std::bit_cast<uint32_t>(kOneBy224), 0x3b924925u);
    EXPECT_EQ(std::bit_cast<uint32_t>(kOneBy219), 0x3b95a025u);
    EXPECT_EQ(3.0517578e-05f, 1.0f / 32768.0f);
}

TEST(ReferenceDepthChange, ExpandTo32f) {
    const char* kernel = "ExpandTo32fRow";
    const auto vuya =
        ConvertRow<float>(kernel, kVUYA_4444_8u, kVUYA_4444_32f, Bytes{128, 240, 16, 0, 16, 0, 235, 51}, 2);
    const Floats expected = {0, 0.5f, 0, 0, -0.5f, -128.0f / 224.0f, 1, 0.2f};
    for (size_t i = 0; i < expected.size(); ++i) EXPECT_FLOAT_EQ(vuya[i], expected[i]);
    EXPECT_EQ(ConvertRow<float>(kernel, kARGB_4444_8u, kARGB_4444_32f, Bytes{255, 0, 1, 255}, 1),
              (Floats{1, 0, kOneBy255, 1}));
    EXPECT_EQ(ConvertRow<float>(kernel, kBGRX_4444_15u, kBGRX_4444_32f, Words{32768, 1, 16384, 65535}, 1),
              (Floats{1, 1.0f / 32768.0f, 0.5f, 1.999969482421875f}));
}

TEST(ReferenceDepthChange, Of422FollowsItsOwnOrder) {
    const auto uyvy =
        ConvertRow<float>("ExpandTo32fRow", kUYVY_422_8u, kUYVY_422_32f, Bytes{240, 235, 128, 16}, 1);
    EXPECT_FLOAT_EQ(uyvy[0], 0.5f);
    EXPECT_FLOAT_EQ(uyvy[1], 1.0f);
    EXPECT_EQ(uyvy[2], 0.0f);
    EXPECT_EQ(uyvy[3], 0.0f);
    const auto yuyv =
        ConvertRow<float>("ExpandTo32fRow", kYUYV_422_8u, kYUYV_422_32f, Bytes{235, 240, 16, 128}, 1);
    EXPECT_EQ(yuyv, (Floats{uyvy[1], uyvy[0], 0, 0}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("PackFrom32fRow", kYUYV_422_32f, kYUYV_422_8u, Floats{1, 0.5f, 0, -0.5f}, 1),
        (Bytes{235, 240, 16, 16}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("PackFrom32fRow", kUYVY_422_32f, kUYVY_422_8u, Floats{0.5f, 1, -0.5f, 0}, 1),
        (Bytes{240, 235, 16, 16}));
}

TEST(ReferenceDepthChange, PackTo8u) {
    const char* kernel = "PackFrom32fRow";
    // 219 x 0.5 + 16 = 125.5 and 255 x 0.5 = 127.5: both halves go to the even neighbour
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYA_4444_32f, kVUYA_4444_8u, Floats{0, 0, 0.5f, 0.5f}, 1),
              (Bytes{128, 128, 126, 128}));
    EXPECT_EQ(
        ConvertRow<uint8_t>(kernel, kVUYA_4444_32f, kVUYA_4444_8u, Floats{kNaN, kInfinity, -kInfinity, 2}, 1),
        (Bytes{0, 255, 0, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kBGRA_4444_32f, kBGRA_4444_8u, Floats{-1, 1e30f, 1, kNaN}, 1),
              (Bytes{0, 255, 255, 0}));
}

TEST(ReferenceDepthChange, PackTo15u) {
    EXPECT_EQ(ConvertRow<uint16_t>("PackFrom32fRow", kBGRA_4444_32f, kBGRA_4444_15u,
                                   Floats{0.5f, 1.0f / 65536.0f, 1.5f, -1, kNaN, kInfinity, -kInfinity, 1},
                                   2),
              (Words{16384, 1, 32768, 0, 0, 32768, 0, 32768}));
}

TEST(ReferenceDepthChange, Expand8uTo15uPlainTakesTheQuotient) {
    EXPECT_EQ(ConvertRow<uint16_t>("Expand8uTo15uRow", kBGRA_4444_8u, kBGRA_4444_15u,
                                   Bytes{0, 1, 2, 3, 128, 254, 255, 1}, 2),
              (Words{0, 128, 257, 385, 16448, 32639, 32768, 128}));
}

TEST(ReferenceDepthChange, Expand8uTo15uVectorRoundsFromTheBoundaryOn) {
    // 1 x 128.50197 + 0.5 = 129.002; the quotient of 32768 by 255 is 128
    alignas(16) uint8_t buffer[64];
    const Bytes row(4 * 4, 1);
    const struct {
        int offset;
        int head;
    } cases[] = {{0, 0}, {1, 2}, {2, 2}, {7, 2}, {8, 1}, {9, 1}, {15, 1}};
    for (const auto& [offset, head] : cases) {
        reference::Run("Expand8uTo15uRow", kARGB_4444_8u, kARGB_4444_15u, true, row.data(), buffer + offset,
                       4);
        for (int i = 0; i < 16; ++i) {
            EXPECT_EQ(Get<uint16_t>(buffer + offset, i), i < 4 * head ? 128 : 129)
                << "offset " << offset << " at " << i;
        }
    }
}

TEST(ReferenceDepthChange, Pack15uTo8u) {
    // 255 / 32768 is a float, so that 16384 falls on the half 127.5
    EXPECT_EQ(ConvertRow<uint8_t>("Pack15uTo8uRow", kBGRA_4444_15u, kBGRA_4444_8u,
                                  Words{0, 64, 65, 129, 16384, 32768, 65535, 32767}, 2),
              (Bytes{0, 0, 1, 1, 128, 255, 255, 255}));
}

TEST(ReferenceDepthChange, ExpandAndPremultiply) {
    const auto bgrp =
        ConvertRow<float>("BGRA8uToBGRP32fRow", kBGRA_4444_8u, kBGRP_4444_32f, Bytes{255, 0, 51, 128}, 1);
    EXPECT_FLOAT_EQ(bgrp[0], 0.50196078f);
    EXPECT_EQ(bgrp[1], 0.0f);
    EXPECT_FLOAT_EQ(bgrp[2], 0.10039216f);
    EXPECT_FLOAT_EQ(bgrp[3], 0.50196078f);
    const auto vuyp =
        ConvertRow<float>("VUYA8uToVUYP32fRow", kVUYA_4444_8u, kVUYP_4444_32f, Bytes{240, 128, 235, 51}, 1);
    EXPECT_FLOAT_EQ(vuyp[0], 0.1f);
    EXPECT_EQ(vuyp[1], 0.0f);
    EXPECT_FLOAT_EQ(vuyp[2], 0.2f);
    EXPECT_FLOAT_EQ(vuyp[3], 0.2f);
}

} // namespace
