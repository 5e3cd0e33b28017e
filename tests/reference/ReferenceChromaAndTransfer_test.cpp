// Chroma resampling and transfer functions against values worked out by hand.
#include <limits>

#include "ReferenceFormats.h"
#include "ReferenceTestRow.h"

namespace {

using namespace reference;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

TEST(ReferenceDownsample, EightBit) {
    const char* kernel = "Downsample444To422Row";
    const Bytes vuyp = {10, 0, 1, 9, 20, 255, 2, 9, 30, 128, 3, 9, 41, 3, 4, 9};
    // U: (3 x 0 + 255 + 2) / 4 and (255 + 2 x 128 + 3 + 2) / 4; V: (3 x 10 + 20 + 2) / 4 and (20 + 60 + 41 +
    // 2) / 4
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYP_4444_8u, kUYVY_422_8u, vuyp, 4),
              (Bytes{64, 1, 13, 2, 129, 3, 30, 4}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYX_4444_8u, kUYVY_422_8u, vuyp, 3),
              (Bytes{64, 1, 13, 2, 128, 3, 30, 3}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYP_4444_8u, kUYVY_422_8u, vuyp, 2), (Bytes{64, 1, 13, 2}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kVUYP_4444_8u, kUYVY_422_8u, vuyp, 1), (Bytes{0, 1, 10, 1}));
}

TEST(ReferenceDownsample, FloatLeavesALoneLumaAtZero) {
    const char* kernel = "Downsample444To422Float32Row";
    const Floats vuyp = {0, 4, 1, 9, 1, 8, 2, 9, 0.5f, -4, 3, 9, 0.25f, 0, 4, 9};
    EXPECT_EQ(ConvertRow<float>(kernel, kVUYP_4444_32f, kUYVY_422_32f, vuyp, 4),
              (Floats{5, 1, 0.25f, 2, 0, 3, 0.5625f, 4}));
    EXPECT_EQ(ConvertRow<float>(kernel, kVUYP_4444_32f, kUYVY_422_32f, vuyp, 3),
              (Floats{5, 1, 0.25f, 2, -4, 3, 0.5f, 0}));
    EXPECT_EQ(ConvertRow<float>(kernel, kVUYP_4444_32f, kUYVY_422_32f, vuyp, 1), (Floats{4, 1, 0, 0}));
}

TEST(ReferenceUpsample, EightBitPlainTruncatesAndVectorRoundsUp) {
    const char* kernel = "Upsample422To444Row";
    const Bytes uyvy = {10, 1, 20, 2, 13, 3, 21, 4};
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kUYVY_422_8u, kVUYA_4444_8u, uyvy, 4),
              (Bytes{20, 10, 1, 255, 20, 11, 2, 255, 21, 13, 3, 255, 21, 13, 4, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kUYVY_422_8u, kVUYA_4444_8u, uyvy, 4, {.vectorMember = true}),
              (Bytes{20, 10, 1, 255, 21, 12, 2, 255, 21, 13, 3, 255, 21, 13, 4, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kUYVY_422_8u, kVUYX_4444_8u, uyvy, 3),
              (Bytes{20, 10, 1, 255, 20, 11, 2, 255, 21, 13, 3, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kUYVY_422_8u, kVUYP_4444_8u, uyvy, 2),
              (Bytes{20, 10, 1, 255, 20, 10, 2, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kYUYV_422_8u_709, kVUYA_4444_8u_709,
                                  Bytes{1, 10, 2, 20, 3, 13, 4, 21}, 3),
              (Bytes{20, 10, 1, 255, 20, 11, 2, 255, 21, 13, 3, 255}));
}

TEST(ReferenceUpsample, FloatRepeatsOrInterpolates) {
    const char* kernel = "Upsample422To444Float32Row";
    const Floats uyvy = {0, 1, 5, 2, 1, 3, 5, 4, 0.5f, 5, 5, 6};
    const Floats repeated = {5, 0, 1, 1, 5, 0, 2, 1, 5, 1, 3, 1, 5, 1, 4, 1, 5, 0.5f, 5, 1, 5, 0.5f, 6, 1};
    EXPECT_EQ(ConvertRow<float>(kernel, kUYVY_422_32f, kVUYA_4444_32f, uyvy, 6, {.quality = 1}), repeated);
    // (9 x 1 - 0 - 0.5) / 16, (9 x 1.5 - 0 - 0.5) / 16, (9 x 1 - 1 - 0.5) / 16
    Floats interpolated = repeated;
    interpolated[5] = 0.53125f;
    interpolated[13] = 0.8125f;
    interpolated[21] = 0.46875f;
    EXPECT_EQ(ConvertRow<float>(kernel, kUYVY_422_32f, kVUYA_4444_32f, uyvy, 6, {.quality = 2}),
              interpolated);
}

TEST(ReferenceUpsample, CombinedKernelsUpsampleFirst) {
    // R of the odd pixel: the average of V 128 and 131 is 129 (1.6) or 130 (3.2)
    const Bytes uyvy = {128, 16, 128, 16, 128, 16, 131, 16};
    EXPECT_EQ(ConvertRow<uint8_t>("UYVY601ToBGR8uRow", kUYVY_422_8u, kBGRP_4444_8u, uyvy, 3),
              (Bytes{0, 0, 0, 255, 0, 0, 2, 255, 0, 0, 5, 255}));
    EXPECT_EQ(ConvertRow<uint8_t>("UYVY601ToBGR8uRow", kUYVY_422_8u, kBGRX_4444_8u, uyvy, 3,
                                  {.vectorMember = true}),
              (Bytes{0, 0, 0, 255, 0, 0, 3, 255, 0, 0, 5, 255}));
    const Bytes yuyv = {16, 128, 16, 128, 16, 128, 16, 131};
    EXPECT_EQ(ConvertRow<uint8_t>("YUYV601ToBGR8uRow", kYUYV_422_8u, kBGRA_4444_8u, yuyv, 3),
              (Bytes{0, 0, 0, 255, 0, 0, 2, 255, 0, 0, 5, 255}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("UYVY709ToBGR8uRow", kUYVY_422_8u_709, kBGRA_4444_8u, Bytes{102, 63, 240, 63}, 1),
        (Bytes{0, 1, 255, 255}));
    EXPECT_EQ(
        ConvertRow<uint8_t>("YUYV709ToBGR8uRow", kYUYV_422_8u_709, kBGRA_4444_8u, Bytes{63, 102, 63, 240}, 1),
        (Bytes{0, 1, 255, 255}));
}

TEST(ReferenceTransferFunction, Float) {
    const auto linear = ConvertRow<float>("GammaToLinearRow", kBGRA_4444_32f, kBGRA_4444_32f_Linear,
                                          Floats{0.5f, -0.5f, 1, 0.7f, 0, 2, -1, 3}, 2);
    const Floats expected = {0.18946457f, -0.18946457f, 1, 0.7f, 0, 5.2780316f, -1, 3};
    for (size_t i = 0; i < expected.size(); ++i) EXPECT_FLOAT_EQ(linear[i], expected[i]);
    const auto gamma =
        ConvertRow<float>("LinearToGammaRow", kBGRA_4444_32f_Linear, kBGRA_4444_32f, expected, 2);
    const Floats original = {0.5f, -0.5f, 1, 0.7f, 0, 2, -1, 3};
    for (size_t i = 0; i < original.size(); ++i) EXPECT_FLOAT_EQ(gamma[i], original[i]);
}

TEST(ReferenceTransferFunction, EightBitTable) {
    const auto linear = ConvertRow<float>("Gamma8uToLinearFloat32Row", kBGRA_4444_8u, kBGRA_4444_32f_Linear,
                                          Bytes{0, 255, 51, 51}, 1);
    EXPECT_EQ(linear[0], 0.0f);
    EXPECT_EQ(linear[1], 1.0f);
    EXPECT_FLOAT_EQ(linear[2], 0.021012222f); // 0.2 to the power 2.4
    EXPECT_FLOAT_EQ(linear[3], 0.2f);
}

TEST(ReferenceTransferFunction, EightBitThresholds) {
    const char* kernel = "LinearFloat32ToGamma8uRow";
    EXPECT_EQ(ConvertRow<uint8_t>(kernel, kBGRA_4444_32f_Linear, kBGRA_4444_8u,
                                  Floats{-1, 2, kNaN, 0.5f, kInfinity, -kInfinity, 0, -1}, 2),
              (Bytes{0, 255, 0, 128, 255, 0, 0, 0}));
}

TEST(ReferenceTransferFunction, EightBitValuesComeBack) {
    Bytes all;
    for (int c = 0; c < 256; ++c) all.push_back(static_cast<uint8_t>(c));
    const auto linear =
        ConvertRow<float>("Gamma8uToLinearFloat32Row", kBGRA_4444_8u, kBGRA_4444_32f_Linear, all, 64);
    EXPECT_EQ(
        ConvertRow<uint8_t>("LinearFloat32ToGamma8uRow", kBGRA_4444_32f_Linear, kBGRA_4444_8u, linear, 64),
        all);
}

} // namespace
