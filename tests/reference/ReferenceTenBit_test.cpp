// The packed 10-bit formats against values worked out by hand.
#include <limits>

#include "ReferenceFormats.h"
#include "ReferenceTestRow.h"

namespace {

using namespace reference;

constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

constexpr uint32_t V210Word(uint32_t first, uint32_t second, uint32_t third) {
    return first | second << 10 | third << 20;
}

constexpr uint32_t RGB10Word(uint32_t b, uint32_t g, uint32_t r) {
    return b << 2 | g << 12 | r << 22;
}

TEST(ReferenceV210, FromEightBit) {
    const Bytes uyvy = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 255, 12, 13, 14, 15};
    const DoubleWords group = {V210Word(4, 8, 12), V210Word(16, 20, 24), V210Word(28, 32, 36),
                               V210Word(40, 44, 1020)};
    EXPECT_EQ(ConvertRow<uint32_t>("UYVY8uToV210Row", kUYVY_422_8u, kV210_422_10u, uyvy, 6), group);
    DoubleWords twoGroups = group;
    twoGroups.insert(twoGroups.end(), {V210Word(48, 52, 56), V210Word(60, 0, 0), 0, 0});
    EXPECT_EQ(ConvertRow<uint32_t>("UYVY8uToV210Row", kUYVY_422_8u_709, kV210_422_10u_709, uyvy, 7),
              twoGroups);
}

TEST(ReferenceV210, ToEightBitTruncates) {
    const DoubleWords v210 = {V210Word(1023, 3, 4), V210Word(7, 8, 512), V210Word(515, 516, 0),
                              V210Word(0, 0, 0)};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToUYVY8uRow", kV210_422_10u, kUYVY_422_8u, v210, 4),
              (Bytes{255, 0, 1, 1, 2, 128, 128, 129}));
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToUYVY8uRow", kV210_422_10u, kUYVY_422_8u, v210, 1),
              (Bytes{255, 0, 1, 1}));
}

TEST(ReferenceV210, ToVUYAveragesEightBitChroma) {
    // U of the pairs 10, 13, 21; V 20, 25, 30; Y 1 to 6, all with lower bits that are dropped before the
    // average
    const DoubleWords v210 = {V210Word(43, 4, 83), V210Word(8, 55, 12), V210Word(103, 16, 87),
                              V210Word(20, 120, 24)};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToVUY8uRow", kV210_422_10u, kVUYA_4444_8u, v210, 6),
              (Bytes{20, 10, 1, 255, 22, 11, 2, 255, 25, 13, 3, 255,
                     27, 17, 4, 255, 30, 21, 5, 255, 30, 21, 6, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToVUY8uRow", kV210_422_10u_709, kVUYX_4444_8u_709, v210, 2),
              (Bytes{20, 10, 1, 255, 20, 10, 2, 255}));
}

TEST(ReferenceV210, TheOddPixelAtAGroupsEndLooksIntoTheNextGroup) {
    const DoubleWords v210 = {0, 0, V210Word(0, 0, 40), V210Word(0, 80, 0), V210Word(80, 0, 160), 0, 0, 0};
    const auto vuya = ConvertRow<uint8_t>("V210ToVUY8uRow", kV210_422_10u, kVUYA_4444_8u, v210, 7);
    EXPECT_EQ((Bytes{vuya[16], vuya[17], vuya[20], vuya[21], vuya[24], vuya[25]}),
              (Bytes{20, 10, 30, 15, 40, 20}));
}

TEST(ReferenceV210, ToVUYOfTheOtherMatrix) {
    const DoubleWords red = {V210Word(408, 252, 960), V210Word(252, 0, 0), 0, 0};
    EXPECT_EQ(ConvertRow<uint8_t>("V210709ToVUY601_8uRow", kV210_422_10u_709, kVUYP_4444_8u, red, 1),
              (Bytes{240, 90, 82, 255}));
}

TEST(ReferenceV210, ToBGR) {
    const DoubleWords greys = {V210Word(512, 64, 512), V210Word(940, 512, 1023), V210Word(512, 0, 0), 0};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToBGR8uRow", kV210_422_10u, kBGRA_4444_8u, greys, 3),
              (Bytes{0, 0, 0, 255, 255, 255, 255, 255, 255, 255, 255, 255}));
    // 601: B -0.97, G -0.48, R 254.4; 709: B -0.20, G 0.58, R 255.5
    const DoubleWords red601 = {V210Word(360, 324, 960), 0, 0, 0};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToBGR8uRow", kV210_422_10u, kBGRX_4444_8u, red601, 1),
              (Bytes{0, 0, 254, 255}));
    const DoubleWords red709 = {V210Word(408, 252, 960), 0, 0, 0};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToBGR8uRow", kV210_422_10u_709, kBGRP_4444_8u, red709, 1),
              (Bytes{0, 1, 255, 255}));
}

TEST(ReferenceV210, ToBGRAveragesTenBitChromaTruncated) {
    // V 512 and 515: the average 513 gives R 0.4, rounding up would give 0.8; the even pixel 515 gives 1.2
    const DoubleWords v210 = {V210Word(512, 64, 512), V210Word(64, 512, 64), V210Word(515, 64, 0), 0};
    EXPECT_EQ(ConvertRow<uint8_t>("V210ToBGR8uRow", kV210_422_10u, kBGRA_4444_8u, v210, 3),
              (Bytes{0, 0, 0, 255, 0, 0, 0, 255, 0, 0, 1, 255}));
}

TEST(ReferenceV210, ToFloat) {
    const DoubleWords v210 = {V210Word(960, 940, 64), V210Word(64, 0, 0), 0, 0};
    const auto uyvy = ConvertRow<float>("V210ToUYVY32fRow", kV210_422_10u, kUYVY_422_32f, v210, 2);
    EXPECT_FLOAT_EQ(uyvy[0], 0.5f);
    EXPECT_FLOAT_EQ(uyvy[1], 1.0f);
    EXPECT_FLOAT_EQ(uyvy[2], -0.5f);
    EXPECT_EQ(uyvy[3], 0.0f);
}

TEST(ReferenceV210, FromFloatRoundsHalvesToEven) {
    // 512.5 -> 512, 64.5 -> 64, 960.5 -> 960, 940.5 -> 940, 896 / 1024 + 512.5 = 513.375 -> 513
    const Floats uyvy = {0, 0, 0.5f, 1, 1.0f / 1024.0f, 10, -10, kNaN, 9, 9, 9, 9};
    EXPECT_EQ(ConvertRow<uint32_t>("UYVY32fToV210Row", kUYVY_422_32f_709, kV210_422_10u_709, uyvy, 4),
              (DoubleWords{V210Word(512, 64, 960), V210Word(940, 513, 1023), V210Word(0, 0, 0), 0}));
}

TEST(ReferenceRGB10, Packing) {
    EXPECT_EQ(ConvertRow<uint32_t>("BGR8uToRGB10uRow", kBGRP_4444_8u, kRGB_444_10u, Bytes{255, 1, 128, 9}, 1),
              DoubleWords{RGB10Word(1023, 4, 513)});
    EXPECT_EQ(ConvertRow<uint32_t>("BGR15uToRGB10uRow", kBGRX_4444_15u, kRGB_444_10u,
                                   Words{32768, 16384, 33, 9}, 1),
              DoubleWords{RGB10Word(1023, 511, 1)});
    EXPECT_EQ(ConvertRow<uint32_t>("BGR32fToRGB10uRow", kBGRP_4444_32f, kRGB_444_10u,
                                   Floats{0.5f, 2, -1, 9, kNaN, 1, 0.25f, 9}, 2),
              (DoubleWords{RGB10Word(512, 1023, 0), RGB10Word(0, 1023, 256)}));
}

TEST(ReferenceRGB10, Unpacking) {
    const DoubleWords words = {RGB10Word(1023, 512, 2) | 3, RGB10Word(0, 1, 3)};
    EXPECT_EQ(ConvertRow<uint8_t>("RGB10uToBGR8uRow", kRGB_444_10u, kBGRX_4444_8u, words, 2),
              (Bytes{255, 128, 0, 255, 0, 0, 1, 255}));
    EXPECT_EQ(ConvertRow<uint16_t>("RGB10uToBGR15uRow", kRGB_444_10u, kBGRA_4444_15u, words, 2),
              (Words{32768, 16400, 64, 32768, 0, 32, 96, 32768}));
    const auto floats = ConvertRow<float>("RGB10uToBGR32fRow", kRGB_444_10u, kBGRX_4444_32f, words, 1);
    EXPECT_FLOAT_EQ(floats[0], 1.0f);
    EXPECT_FLOAT_EQ(floats[1], 512.0f / 1023.0f);
    EXPECT_EQ(floats[3], 1.0f);
}

} // namespace
