// The matrices against values worked out by hand.
#include "ReferenceFormats.h"
#include "ReferenceTestRow.h"

namespace {

using namespace reference;

// White, blue, green, red.
const Bytes kColours = {255, 255, 255, 255, 255, 0, 0, 1, 0, 255, 0, 2, 0, 0, 255, 3};
const Bytes kColours601 = {128, 128, 235, 255, 110, 240, 41, 1, 34, 54, 145, 2, 240, 90, 81, 3};
const Bytes kColours709 = {128, 128, 235, 255, 118, 240, 32, 1, 26, 42, 173, 2, 240, 102, 63, 3};

Floats AsFloats(const Bytes& bytes) {
    Floats floats;
    for (const uint8_t byte : bytes) floats.push_back(static_cast<float>(byte) / 255.0f);
    return floats;
}

void ExpectNear(const Floats& actual, const Floats& expected, float tolerance) {
    ASSERT_EQ(actual.size(), expected.size());
    for (size_t i = 0; i < expected.size(); ++i) EXPECT_NEAR(actual[i], expected[i], tolerance) << "at " << i;
}

TEST(ReferenceRGBToYUV, EightBit) {
    EXPECT_EQ(ConvertRow<uint8_t>("RGBToYUV601Row", kBGRA_4444_8u, kVUYA_4444_8u, kColours, 4), kColours601);
    EXPECT_EQ(ConvertRow<uint8_t>("RGBToYUV709Row", kBGRP_4444_8u, kVUYP_4444_8u_709, kColours, 4),
              kColours709);
}

TEST(ReferenceRGBToYUV, FloatToEightBitGivesTheSameColours) {
    EXPECT_EQ(
        ConvertRow<uint8_t>("RGB32fToYUV601_8uRow", kBGRA_4444_32f, kVUYA_4444_8u, AsFloats(kColours), 4),
        kColours601);
    EXPECT_EQ(
        ConvertRow<uint8_t>("RGB32fToYUV709_8uRow", kBGRA_4444_32f, kVUYA_4444_8u_709, AsFloats(kColours), 4),
        kColours709);
}

TEST(ReferenceRGBToYUV, Float) {
    const Floats bgra = {1, 0, 0, 0.3f, 0, 2, 0, 0.4f, 0, 0, -1, 7};
    ExpectNear(
        ConvertRow<float>("RGBToYUV601Float32Row", kBGRA_4444_32f, kVUYA_4444_32f, bgra, 3),
        {-0.081312f, 0.5f, 0.114f, 0.3f, -0.837376f, -0.662528f, 1.174f, 0.4f, -0.5f, 0.168736f, -0.299f, 7},
        1e-7f);
    ExpectNear(ConvertRow<float>("RGBToYUV709Float32Row", kBGRP_4444_32f, kVUYP_4444_32f_709, bgra, 3),
               {-0.045847f, 0.5f, 0.0722f, 0.3f, -0.908306f, -0.770856f, 1.4304f, 0.4f, -0.5f, 0.114572f,
                -0.2126f, 7},
               1e-7f);
}

TEST(ReferenceYUVToRGB, EightBitBlackAndWhite) {
    const Bytes vuya = {128, 128, 16, 9, 128, 128, 235, 8, 128, 128, 0, 7, 128, 128, 255, 6};
    const Bytes bgra = {0, 0, 0, 9, 255, 255, 255, 8, 0, 0, 0, 7, 255, 255, 255, 6};
    EXPECT_EQ(ConvertRow<uint8_t>("YUV601ToRGBRow", kVUYA_4444_8u, kBGRA_4444_8u, vuya, 4), bgra);
    EXPECT_EQ(ConvertRow<uint8_t>("YUV709ToRGBRow", kVUYA_4444_8u_709, kBGRA_4444_8u, vuya, 4), bgra);
}

TEST(ReferenceYUVToRGB, EightBitRed) {
    // 601: B -0.97, G -0.48, R 254.44; 709: B -0.20, G 0.58, R 255.5
    EXPECT_EQ(ConvertRow<uint8_t>("YUV601ToRGBRow", kVUYP_4444_8u, kBGRP_4444_8u, Bytes{240, 90, 81, 5}, 1),
              (Bytes{0, 0, 254, 5}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUV709ToRGBRow", kVUYP_4444_8u_709, kBGRP_4444_8u, Bytes{240, 102, 63, 5}, 1),
        (Bytes{0, 1, 255, 5}));
}

TEST(ReferenceYUVToRGB, OpaqueMembers) {
    const Bytes red601 = {240, 90, 81, 5};
    EXPECT_EQ(ConvertRow<uint8_t>("VUYX8uToRGB8uRow", kVUYX_4444_8u, kBGRX_4444_8u, red601, 1),
              (Bytes{0, 0, 254, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>("VUYX8uToBGR8uRow", kVUYX_4444_8u, kBGRA_4444_8u, red601, 1),
              (Bytes{0, 0, 254, 255}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("VUYX8uToBGR8uRow", kVUYX_4444_8u_709, kBGRX_4444_8u, Bytes{240, 102, 63, 5}, 1),
        (Bytes{0, 1, 255, 255}));
    // 0.00456621 x 65 = 0.29680365; U' is -38, V' is 112
    ExpectNear(ConvertRow<float>("VUYX8uToRGB32fRow", kVUYX_4444_8u, kBGRX_4444_32f, red601, 1),
               {-0.00380371f, -0.00188451f, 0.99780381f, 1}, 1e-6f);
}

TEST(ReferenceYUVToRGB, EightBitToFloat) {
    const Bytes vuya = {128, 128, 235, 51, 129, 127, 16, 255};
    ExpectNear(ConvertRow<float>("YUV601ToRGB32fRow", kVUYA_4444_8u, kBGRA_4444_32f, vuya, 2),
               {1, 1, 1, 0.2f, -0.00791072f, -0.00165179f, 0.00625893f, 1}, 1e-7f);
    ExpectNear(ConvertRow<float>("YUV709ToRGB32fRow", kVUYA_4444_8u_709, kBGRA_4444_32f, vuya, 2),
               {1, 1, 1, 0.2f, -0.00828393f, -0.00125357f, 0.00703036f, 1}, 1e-7f);
}

TEST(ReferenceYUVToRGB, Float) {
    const Floats vuya = {0.5f, 0, 0.25f, 0.3f, 0, -1, 2, 0.4f};
    ExpectNear(ConvertRow<float>("YUV601ToRGBFloat32Row", kVUYA_4444_32f, kBGRA_4444_32f, vuya, 2),
               {0.25f, -0.107068f, 0.951f, 0.3f, 0.228f, 2.344136f, 2, 0.4f}, 3e-7f);
    ExpectNear(ConvertRow<float>("YUV709ToRGBFloat32Row", kVUYA_4444_32f_709, kBGRA_4444_32f, vuya, 2),
               {0.25f, 0.015938f, 1.0374f, 0.3f, 0.1444f, 2.187324f, 2, 0.4f}, 3e-7f);
}

TEST(ReferenceBetweenMatrices, EightBit) {
    // Y 62.1, U 102.1, V 239.98 and back Y 81.9, U 89.9, V 240.02
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUV601To709Row", kVUYA_4444_8u, kVUYA_4444_8u_709, Bytes{240, 90, 81, 7}, 1),
        (Bytes{240, 102, 62, 7}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUV709To601Row", kVUYX_4444_8u_709, kVUYX_4444_8u, Bytes{240, 102, 63, 7}, 1),
        (Bytes{240, 90, 82, 7}));
}

TEST(ReferenceBetweenMatrices, LumasGoWithTheChromaOfTheirPair) {
    // The second luma is 10 above the first
    EXPECT_EQ(
        ConvertRow<uint8_t>("UYVY601To709Row", kUYVY_422_8u, kUYVY_422_8u_709, Bytes{90, 81, 240, 91}, 2),
        (Bytes{102, 62, 240, 72}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUYV601To709Row", kYUYV_422_8u, kYUYV_422_8u_709, Bytes{81, 90, 91, 240}, 1),
        (Bytes{62, 102, 72, 240}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("UYVY709To601Row", kUYVY_422_8u_709, kUYVY_422_8u, Bytes{102, 63, 240, 53}, 2),
        (Bytes{90, 82, 240, 72}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUYV709To601Row", kYUYV_422_8u_709, kYUYV_422_8u, Bytes{63, 102, 53, 240}, 2),
        (Bytes{82, 90, 72, 240}));
}

TEST(ReferenceBetweenMatrices, Float) {
    const Floats vuya = {1, 0, 0.5f, 0.3f, 0, -2, 0, 0.4f};
    ExpectNear(ConvertRow<float>("YUV601To709Float32Row", kVUYA_4444_32f, kVUYA_4444_32f_709, vuya, 2),
               {1.02532709f, 0.11461795f, 0.29206236f, 0.3f, -0.1500989f, -2.03727936f, 0.2310995f, 0.4f},
               3e-7f);
    ExpectNear(ConvertRow<float>("YUV709To601Float32Row", kVUYP_4444_32f_709, kVUYP_4444_32f, vuya, 2),
               {0.98339784f, -0.11065251f, 0.69169955f, 0.3f, 0.14490592f, -1.9797076f, -0.19862332f, 0.4f},
               3e-7f);
}

} // namespace
