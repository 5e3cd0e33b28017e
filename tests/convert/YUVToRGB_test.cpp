// The matrices from YUV to RGB, against their formulas restated for one pixel.

#include "convert/MatrixKernels.h"

namespace PKTest {
namespace {

using enum PK::Kernel;
using Bytes = Quad<uint8_t>;
using Floats = Quad<float>;

Bytes YUV8ToRGB8_601(Bytes vuya) {
    const float v = vuya[0] - 128.0f, u = vuya[1] - 128.0f, y = vuya[2] - 16.0f;
    return {NearestCode(1.16438f * y + 2.01723f * u),
            NearestCode(1.16438f * y - 0.391762f * u - 0.812969f * v),
            NearestCode(1.16438f * y + 1.59603f * v), vuya[3]};
}

Bytes YUV8ToRGB8_709(Bytes vuya) {
    const float v = vuya[0] - 128.0f, u = vuya[1] - 128.0f, y = vuya[2] - 16.0f;
    return {NearestCode(1.16438f * y + 2.1124f * u),
            NearestCode(1.16438f * y - 0.213249f * u - 0.532909f * v),
            NearestCode(1.16438f * y + 1.79274f * v), vuya[3]};
}

Floats YUV8ToRGB601(Bytes vuya) {
    const float v = vuya[0] - 128.0f, u = vuya[1] - 128.0f, y = vuya[2] - 16.0f;
    return {0.00456621f * y + 0.00791072f * u, 0.00456621f * y - 0.00153632f * u - 0.00318811f * v,
            0.00456621f * y + 0.00625893f * v, vuya[3] * (1.0f / 255)};
}

Floats YUV8ToRGB709(Bytes vuya) {
    const float v = vuya[0] - 128.0f, u = vuya[1] - 128.0f, y = vuya[2] - 16.0f;
    return {0.00456621f * y + 0.00828393f * u, 0.00456621f * y - 0.00083627f * u - 0.00208984f * v,
            0.00456621f * y + 0.00703036f * v, vuya[3] * (1.0f / 255)};
}

Floats YUVToRGB601(Floats vuya) {
    const float v = vuya[0], u = vuya[1], y = vuya[2];
    return {y + 1.772f * u, y - 0.344136f * u - 0.714136f * v, y + 1.402f * v, vuya[3]};
}

Floats YUVToRGB709(Floats vuya) {
    const float v = vuya[0], u = vuya[1], y = vuya[2];
    return {y + 1.8556f * u, y - 0.187324f * u - 0.468124f * v, y + 1.5748f * v, vuya[3]};
}

template <auto kConvert>
auto Opaque(Bytes vuyx) {
    auto pixel = kConvert(vuyx);
    pixel[3] = sizeof pixel[3] == 1 ? 255 : 1;
    return pixel;
}

constexpr MatrixRule<uint8_t, uint8_t> kCodeRules[] = {
    {YUV601ToRGBRow, YUV8ToRGB8_601},
    {YUV709ToRGBRow, YUV8ToRGB8_709},
    {VUYX8uToRGB8uRow_601, Opaque<YUV8ToRGB8_601>},
    {VUYX8uToRGB8uRow_709, Opaque<YUV8ToRGB8_709>},
    {VUYX8uToBGR8uRow_601, Opaque<YUV8ToRGB8_601>},
    {VUYX8uToBGR8uRow_709, Opaque<YUV8ToRGB8_709>},
};
constexpr MatrixRule<uint8_t, float> kCodeToFloatRules[] = {
    {YUV601ToRGB32fRow, YUV8ToRGB601},
    {YUV709ToRGB32fRow, YUV8ToRGB709},
    {VUYX8uToRGB32fRow_601, Opaque<YUV8ToRGB601>},
    {VUYX8uToRGB32fRow_709, Opaque<YUV8ToRGB709>},
};
constexpr MatrixRule<float, float> kFloatRules[] = {{YUV601ToRGBFloat32Row, YUVToRGB601},
                                                    {YUV709ToRGBFloat32Row, YUVToRGB709}};

TEST(YUVToRGB, EndsOfVideoRangeAreBlackAndWhite) {
    for (const PK::Kernel kernel : {YUV601ToRGBRow, YUV709ToRGBRow}) {
        ExpectValue(kernel, Bytes{128, 128, 16, 7}, Bytes{0, 0, 0, 7});
        ExpectValue(kernel, Bytes{128, 128, 235, 0}, Bytes{255, 255, 255, 0});
    }
}

TEST(YUVToRGB, ColoursAsCodes) {
    ExpectValue(YUV601ToRGBRow, Bytes{240, 90, 81, 255}, Bytes{0, 0, 254, 255});   // G -0.48
    ExpectValue(YUV601ToRGBRow, Bytes{100, 150, 126, 9}, Bytes{172, 142, 83, 9});  // 172.46 142.23 83.39
    ExpectValue(YUV709ToRGBRow, Bytes{100, 150, 126, 9}, Bytes{175, 138, 78, 9});  // 174.55 138.31 77.88
    ExpectValue(YUV601ToRGBRow, Bytes{255, 255, 255, 9}, Bytes{255, 125, 255, 9}); // G 125.28
    ExpectValue(YUV601ToRGBRow, Bytes{0, 0, 0, 9}, Bytes{0, 136, 0, 9});           // G 135.58
}

TEST(YUVToRGB, UnusedAlphaBecomesOpaque) {
    for (const uint8_t unused : std::initializer_list<uint8_t>{0, 3, 127, 128, 255}) {
        for (const PK::Kernel kernel : {VUYX8uToRGB8uRow_601, VUYX8uToRGB8uRow_709})
            ExpectValue(kernel, Bytes{128, 128, 16, unused}, Bytes{0, 0, 0, 255});
        for (const PK::Kernel kernel : {VUYX8uToRGB32fRow_601, VUYX8uToRGB32fRow_709})
            ExpectValue(kernel, Bytes{128, 128, 16, unused}, Floats{0, 0, 0, 1});
    }
}

TEST(YUVToRGB, DirectKernelsBeginAtSSE2) {
    for (const PK::Kernel kernel : {VUYX8uToBGR8uRow_601, VUYX8uToBGR8uRow_709}) {
        EXPECT_EQ(PK::Body(kernel, PK::Target::plain), nullptr);
        EXPECT_NE(PK::Body(kernel, PK::Target::sse2), nullptr);
    }
}

constexpr float k51 = 0x1.99999cp-3f; // 51 x (1/255): one step above 0.2

TEST(YUVToRGB, CodesToFloats) {
    ExpectValue(YUV601ToRGB32fRow, Bytes{128, 128, 17, 255},
                Floats{0.00456621f, 0.00456621f, 0.00456621f, 1});
    ExpectValue(YUV601ToRGB32fRow, Bytes{128, 129, 16, 0}, Floats{0.00791072f, -0.00153632f, 0, 0});
    ExpectValue(YUV601ToRGB32fRow, Bytes{129, 128, 16, 51}, Floats{0, -0.00318811f, 0.00625893f, k51});
    ExpectValue(YUV709ToRGB32fRow, Bytes{128, 129, 16, 0}, Floats{0.00828393f, -0.00083627f, 0, 0});
    ExpectValue(YUV709ToRGB32fRow, Bytes{129, 128, 16, 51}, Floats{0, -0.00208984f, 0.00703036f, k51});
}

TEST(YUVToRGB, FloatsAreNotLimited) {
    ExpectValue(YUV601ToRGBFloat32Row, Floats{0, 1, 0, -5}, Floats{1.772f, -0.344136f, 0, -5});
    ExpectValue(YUV601ToRGBFloat32Row, Floats{1, 0, 0, 5}, Floats{0, -0.714136f, 1.402f, 5});
    ExpectValue(YUV709ToRGBFloat32Row, Floats{0, 1, 0, -5}, Floats{1.8556f, -0.187324f, 0, -5});
    ExpectValue(YUV709ToRGBFloat32Row, Floats{1, 0, 0, 5}, Floats{0, -0.468124f, 1.5748f, 5});
    ExpectValue(YUV709ToRGBFloat32Row, Floats{0, 0, 4e9f, 0.5f}, Floats{4e9f, 4e9f, 4e9f, 0.5f});
}

TEST(YUVToRGB, AllCodes) {
    for (const auto& rule : kCodeRules) ASSERT_NO_FATAL_FAILURE(ExpectAllCodes(rule));
}

TEST(YUVToRGB, AllCodesToFloats) {
    for (const auto& rule : kCodeToFloatRules) ASSERT_NO_FATAL_FAILURE(ExpectAllCodes(rule));
}

TEST(YUVToRGB, AllLengths) {
    for (const auto& rule : kCodeRules) ExpectAllLengths(rule);
    for (const auto& rule : kCodeToFloatRules) ExpectAllLengths(rule);
    for (const auto& rule : kFloatRules) ExpectAllLengths(rule);
}

TEST(YUVToRGB, AllRoundingModes) {
    for (const auto& rule : kCodeRules) ExpectAllRoundingModes(rule);
    for (const auto& rule : kCodeToFloatRules) ExpectAllRoundingModes(rule);
    for (const auto& rule : kFloatRules) ExpectAllRoundingModes(rule);
}

TEST(YUVToRGB, InPlace) {
    for (const auto& rule : kCodeRules) ExpectInPlace(rule);
    for (const auto& rule : kFloatRules) ExpectInPlace(rule);
}

} // namespace
} // namespace PKTest
