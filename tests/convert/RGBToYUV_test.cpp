// The matrices from RGB to YUV, against their formulas restated for one pixel.

#include "convert/MatrixKernels.h"

namespace PKTest {
namespace {

using enum PK::Kernel;
using Bytes = Quad<uint8_t>;
using Floats = Quad<float>;

Bytes Codes(float v, float u, float y, uint8_t alpha) {
    return {NearestCode(v + 128), NearestCode(u + 128), NearestCode(y + 16), alpha};
}

Bytes RGB8ToYUV601(Bytes bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return Codes(0.43921486f * r - 0.36778906f * g - 0.07142578f * b,
                 -0.14822266f * r - 0.29099220f * g + 0.43921486f * b,
                 0.25678906f * r + 0.50412893f * g + 0.09790625f * b, bgra[3]);
}

Bytes RGB8ToYUV709(Bytes bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return Codes(0.43921569f * r - 0.39894217f * g - 0.04027352f * b,
                 -0.10064373f * r - 0.33857197f * g + 0.43921569f * b,
                 0.18258588f * r + 0.61423057f * g + 0.06200706f * b, bgra[3]);
}

Floats RGBToYUV601(Floats bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return {0.5f * r - 0.418688f * g - 0.081312f * b, -0.168736f * r - 0.331264f * g + 0.5f * b,
            0.299f * r + 0.587f * g + 0.114f * b, bgra[3]};
}

Floats RGBToYUV709(Floats bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return {0.5f * r - 0.454153f * g - 0.045847f * b, -0.114572f * r - 0.385428f * g + 0.5f * b,
            0.2126f * r + 0.7152f * g + 0.0722f * b, bgra[3]};
}

Bytes RGBToYUV8_601(Floats bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return Codes(112.0f * r - 93.78611f * g - 18.21389f * b, -37.79686f * r - 74.20313f * g + 112.0f * b,
                 65.481f * r + 128.553f * g + 24.966f * b, NearestCode(255 * bgra[3]));
}

Bytes RGBToYUV8_709(Floats bgra) {
    const float b = bgra[0], g = bgra[1], r = bgra[2];
    return Codes(112.0f * r - 101.73027f * g - 10.26973f * b, -25.66413f * r - 86.33588f * g + 112.0f * b,
                 46.5594f * r + 156.6288f * g + 15.8118f * b, NearestCode(255 * bgra[3]));
}

constexpr MatrixRule<uint8_t, uint8_t> kCodeRules[] = {{RGBToYUV601Row, RGB8ToYUV601},
                                                       {RGBToYUV709Row, RGB8ToYUV709}};
constexpr MatrixRule<float, float> kFloatRules[] = {{RGBToYUV601Float32Row, RGBToYUV601},
                                                    {RGBToYUV709Float32Row, RGBToYUV709}};
constexpr MatrixRule<float, uint8_t> kFloatToCodeRules[] = {{RGB32fToYUV601_8uRow, RGBToYUV8_601},
                                                            {RGB32fToYUV709_8uRow, RGBToYUV8_709}};

constexpr float kInfinity = std::numeric_limits<float>::infinity();

TEST(RGBToYUV, BlackAndWhiteAreTheEndsOfVideoRange) {
    for (const PK::Kernel kernel : {RGBToYUV601Row, RGBToYUV709Row}) {
        ExpectValue(kernel, Bytes{0, 0, 0, 0}, Bytes{128, 128, 16, 0});
        ExpectValue(kernel, Bytes{255, 255, 255, 255}, Bytes{128, 128, 235, 255});
    }
}

TEST(RGBToYUV, PrimariesAsCodes) {
    ExpectValue(RGBToYUV601Row, Bytes{255, 0, 0, 1}, Bytes{110, 240, 41, 1});
    ExpectValue(RGBToYUV601Row, Bytes{0, 255, 0, 2}, Bytes{34, 54, 145, 2});
    ExpectValue(RGBToYUV601Row, Bytes{0, 0, 255, 3}, Bytes{240, 90, 81, 3});
    ExpectValue(RGBToYUV709Row, Bytes{255, 0, 0, 1}, Bytes{118, 240, 32, 1});
    ExpectValue(RGBToYUV709Row, Bytes{0, 255, 0, 2}, Bytes{26, 42, 173, 2});
    ExpectValue(RGBToYUV709Row, Bytes{0, 0, 255, 3}, Bytes{240, 102, 63, 3});
}

TEST(RGBToYUV, PrimariesAsFloats) {
    ExpectValue(RGBToYUV601Float32Row, Floats{1, 0, 0, 0.25f}, Floats{-0.081312f, 0.5f, 0.114f, 0.25f});
    ExpectValue(RGBToYUV601Float32Row, Floats{0, 1, 0, -3}, Floats{-0.418688f, -0.331264f, 0.587f, -3});
    ExpectValue(RGBToYUV601Float32Row, Floats{0, 0, 2, 9}, Floats{1, -0.337472f, 0.598f, 9});
    ExpectValue(RGBToYUV709Float32Row, Floats{1, 0, 0, 0.25f}, Floats{-0.045847f, 0.5f, 0.0722f, 0.25f});
    ExpectValue(RGBToYUV709Float32Row, Floats{0, 1, 0, -3}, Floats{-0.454153f, -0.385428f, 0.7152f, -3});
    ExpectValue(RGBToYUV709Float32Row, Floats{0, 0, 2, 9}, Floats{1, -0.229144f, 0.4252f, 9});
}

TEST(RGBToYUV, FloatsToCodes) {
    for (const PK::Kernel kernel : {RGB32fToYUV601_8uRow, RGB32fToYUV709_8uRow}) {
        ExpectValue(kernel, Floats{0, 0, 0, 0}, Bytes{128, 128, 16, 0});
        ExpectValue(kernel, Floats{1, 1, 1, 1}, Bytes{128, 128, 235, 255});
    }
    ExpectValue(RGB32fToYUV601_8uRow, Floats{0, 0, 1, 0.2f}, Bytes{240, 90, 81, 51});
    ExpectValue(RGB32fToYUV709_8uRow, Floats{0, 0, 1, 0.2f}, Bytes{240, 102, 63, 51});
}

TEST(RGBToYUV, FloatAlphaRoundsHalvesToEven) {
    ExpectValue(RGB32fToYUV601_8uRow, Floats{0, 0, 0, 0.5f}, Bytes{128, 128, 16, 128});
    ExpectValue(RGB32fToYUV601_8uRow, Floats{0, 0, 0, 0.1f}, Bytes{128, 128, 16, 26}); // 25.5
    ExpectValue(RGB32fToYUV601_8uRow, Floats{0, 0, 0, 0.3f}, Bytes{128, 128, 16, 76}); // 76.5
}

TEST(RGBToYUV, CodesAreLimitedByValue) {
    for (const PK::Kernel kernel : {RGB32fToYUV601_8uRow, RGB32fToYUV709_8uRow}) {
        for (const float huge : {1e3f, 1e9f, 3e38f, kInfinity}) {
            ExpectValue(kernel, Floats{0, 0, huge, huge}, Bytes{255, 0, 255, 255});
            ExpectValue(kernel, Floats{0, 0, -huge, -huge}, Bytes{0, 255, 0, 0});
        }
        ExpectValue(kernel, Floats{0, kInfinity, kInfinity, 0}, Bytes{0, 0, 255, 0});
        ExpectValue(kernel, Floats{NAN, 0, 0, NAN}, Bytes{0, 0, 0, 0});
    }
}

TEST(RGBToYUV, AllCodes) {
    for (const auto& rule : kCodeRules) ASSERT_NO_FATAL_FAILURE(ExpectAllCodes(rule));
}

TEST(RGBToYUV, AllLengths) {
    for (const auto& rule : kCodeRules) ExpectAllLengths(rule);
    for (const auto& rule : kFloatRules) ExpectAllLengths(rule);
    for (const auto& rule : kFloatToCodeRules) ExpectAllLengths(rule);
}

TEST(RGBToYUV, AllRoundingModes) {
    for (const auto& rule : kCodeRules) ExpectAllRoundingModes(rule);
    for (const auto& rule : kFloatRules) ExpectAllRoundingModes(rule);
    for (const auto& rule : kFloatToCodeRules) ExpectAllRoundingModes(rule);
}

TEST(RGBToYUV, InPlace) {
    for (const auto& rule : kCodeRules) ExpectInPlace(rule);
    for (const auto& rule : kFloatRules) ExpectInPlace(rule);
}

} // namespace
} // namespace PKTest
