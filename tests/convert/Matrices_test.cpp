// The matrices between RGB and YUV, and between BT.601 and BT.709.

#include "support/KernelRows.h"

#include <cmath>
#include <limits>

namespace {

using namespace PKTest;
using enum PK::Kernel;
using PK::Kernel;

constexpr float kInfinity = std::numeric_limits<float>::infinity();

constexpr Kernel kFromCodes[] = {
    RGBToYUV601Row,       RGBToYUV709Row,       YUV601ToRGBRow,        YUV709ToRGBRow,
    VUYX8uToRGB8uRow_601, VUYX8uToRGB8uRow_709, VUYX8uToBGR8uRow_601,  VUYX8uToBGR8uRow_709,
    YUV601ToRGB32fRow,    YUV709ToRGB32fRow,    VUYX8uToRGB32fRow_601, VUYX8uToRGB32fRow_709,
    YUV601To709Row,       YUV709To601Row,       UYVY601To709Row,       UYVY709To601Row,
    YUYV601To709Row,      YUYV709To601Row,
};
constexpr Kernel kFromFloats[] = {RGBToYUV601Float32Row, RGBToYUV709Float32Row, RGB32fToYUV601_8uRow,
                                  RGB32fToYUV709_8uRow,  YUV601ToRGBFloat32Row, YUV709ToRGBFloat32Row,
                                  YUV601To709Float32Row, YUV709To601Float32Row};

/// A test each, since all codes through all bodies take some seconds under the sanitizers.
class MatricesFromCodes : public testing::TestWithParam<Kernel> {};

TEST_P(MatricesFromCodes, AllCodes) {
    ExpectReferenceForAllCodes(GetParam());
}

INSTANTIATE_TEST_SUITE_P(Kernels, MatricesFromCodes, testing::ValuesIn(kFromCodes));

// Rounding follows the mode that the caller has set, in the sums as well as in the conversion to codes.
TEST(Matrices, AllRoundingModes) {
    for (const Kernel kernel : kFromCodes) ExpectReferenceInEveryRoundingMode(kernel);
    for (const Kernel kernel : kFromFloats) ExpectReferenceInEveryRoundingMode(kernel);
}

// White, black, blue, green, red.
const Bytes kColours = {255, 255, 255, 255, 0, 0, 0, 0, 255, 0, 0, 1, 0, 255, 0, 2, 0, 0, 255, 3};
const Bytes kColours601 = {128, 128, 235, 255, 128, 128, 16,  0,  110, 240,
                           41,  1,   34,  54,  145, 2,   240, 90, 81,  3};
const Bytes kColours709 = {128, 128, 235, 255, 128, 128, 16,  0,   118, 240,
                           32,  1,   26,  42,  173, 2,   240, 102, 63,  3};

TEST(RGBToYUV, ColoursAsCodes) {
    ExpectRow(RGBToYUV601Row, 5, kColours, kColours601);
    ExpectRow(RGBToYUV709Row, 5, kColours, kColours709);
}

TEST(RGBToYUV, FloatsToCodesGiveTheSameColours) {
    Floats colours;
    for (const uint8_t code : kColours) colours.push_back(static_cast<float>(code) / 255);
    ExpectRow(RGB32fToYUV601_8uRow, 5, colours, kColours601);
    ExpectRow(RGB32fToYUV709_8uRow, 5, colours, kColours709);
}

TEST(RGBToYUV, ColoursAsFloats) {
    const Floats bgra = {1, 0, 0, 0.25f, 0, 1, 0, -3, 0, 0, 2, 9, 0, 0, -1, 7};
    ExpectRow(RGBToYUV601Float32Row, 4, bgra,
              Floats{-0.081312f, 0.5f, 0.114f, 0.25f, -0.418688f, -0.331264f, 0.587f, -3, 1, -0.337472f,
                     0.598f, 9, -0.5f, 0.168736f, -0.299f, 7});
    ExpectRow(RGBToYUV709Float32Row, 4, bgra,
              Floats{-0.045847f, 0.5f, 0.0722f, 0.25f, -0.454153f, -0.385428f, 0.7152f, -3, 1, -0.229144f,
                     0.4252f, 9, -0.5f, 0.114572f, -0.2126f, 7});
}

TEST(RGBToYUV, FloatAlphaRoundsHalvesToEven) {
    ExpectRow(RGB32fToYUV601_8uRow, 3,
              Floats{0, 0, 0, 0.5f, 0, 0, 0, 0.1f, 0, 0, 0, 0.3f}, // 127.5, 25.5 and 76.5
              Bytes{128, 128, 16, 128, 128, 128, 16, 26, 128, 128, 16, 76});
}

TEST(RGBToYUV, CodesAreLimitedByValue) {
    for (const Kernel kernel : {RGB32fToYUV601_8uRow, RGB32fToYUV709_8uRow}) {
        for (const float huge : {1e3f, 1e9f, 3e38f, kInfinity})
            ExpectRow(kernel, 2, Floats{0, 0, huge, huge, 0, 0, -huge, -huge},
                      Bytes{255, 0, 255, 255, 0, 255, 0, 0});
        ExpectRow(kernel, 2, Floats{0, kInfinity, kInfinity, 0, NAN, 0, 0, NAN},
                  Bytes{0, 0, 255, 0, 0, 0, 0, 0});
    }
}

TEST(YUVToRGB, EndsOfVideoRangeAreBlackAndWhite) {
    for (const Kernel kernel : {YUV601ToRGBRow, YUV709ToRGBRow})
        ExpectRow(kernel, 4, Bytes{128, 128, 16, 7, 128, 128, 235, 0, 128, 128, 0, 9, 128, 128, 255, 6},
                  Bytes{0, 0, 0, 7, 255, 255, 255, 0, 0, 0, 0, 9, 255, 255, 255, 6});
}

TEST(YUVToRGB, ColoursAsCodes) {
    // B -0.97, G -0.48, R 254.44; 172.46 142.23 83.39; G 125.28; G 135.58
    ExpectRow(YUV601ToRGBRow, 4, Bytes{240, 90, 81, 5, 100, 150, 126, 9, 255, 255, 255, 9, 0, 0, 0, 9},
              Bytes{0, 0, 254, 5, 172, 142, 83, 9, 255, 125, 255, 9, 0, 136, 0, 9});
    // B -0.20, G 0.58, R 255.5; 174.55 138.31 77.88
    ExpectRow(YUV709ToRGBRow, 2, Bytes{240, 102, 63, 5, 100, 150, 126, 9},
              Bytes{0, 1, 255, 5, 175, 138, 78, 9});
}

TEST(YUVToRGB, UnusedAlphaBecomesOpaque) {
    for (const uint8_t unused : Bytes{0, 3, 127, 128, 255}) {
        const Bytes black = {128, 128, 16, unused};
        for (const Kernel kernel : {VUYX8uToRGB8uRow_601, VUYX8uToRGB8uRow_709})
            ExpectRow(kernel, 1, black, Bytes{0, 0, 0, 255});
        for (const Kernel kernel : {VUYX8uToRGB32fRow_601, VUYX8uToRGB32fRow_709})
            ExpectRow(kernel, 1, black, Floats{0, 0, 0, 1});
    }
    for (const Kernel kernel : {VUYX8uToRGB8uRow_601, VUYX8uToBGR8uRow_601})
        ExpectRow(kernel, 1, Bytes{240, 90, 81, 5}, Bytes{0, 0, 254, 255});
    ExpectRow(VUYX8uToBGR8uRow_709, 1, Bytes{240, 102, 63, 5}, Bytes{0, 1, 255, 255});
    // 0.00456621 x 65 = 0.29680365; U' is -38, V' is 112
    ExpectRow(VUYX8uToRGB32fRow_601, 1, Bytes{240, 90, 81, 5},
              Floats{-0.00380371f, -0.00188451f, 0.99780381f, 1}, Rule::kBoth, 1e-6f);
}

TEST(YUVToRGB, DirectKernelsBeginAtSSE2) {
    for (const Kernel kernel : {VUYX8uToBGR8uRow_601, VUYX8uToBGR8uRow_709}) {
        EXPECT_EQ(PK::Body(kernel, PK::Target::plain), nullptr);
        EXPECT_NE(PK::Body(kernel, PK::Target::sse2), nullptr);
    }
}

TEST(YUVToRGB, CodesToFloats) {
    constexpr float k51 = 0x1.99999cp-3f; // 51 x (1/255): one step above 0.2
    const Bytes vuya = {128, 128, 17, 255, 128, 129, 16, 0, 129, 128, 16, 51};
    ExpectRow(YUV601ToRGB32fRow, 3, vuya,
              Floats{0.00456621f, 0.00456621f, 0.00456621f, 1, 0.00791072f, -0.00153632f, 0, 0, 0,
                     -0.00318811f, 0.00625893f, k51});
    ExpectRow(YUV709ToRGB32fRow, 3, vuya,
              Floats{0.00456621f, 0.00456621f, 0.00456621f, 1, 0.00828393f, -0.00083627f, 0, 0, 0,
                     -0.00208984f, 0.00703036f, k51});
    for (const Kernel kernel : {YUV601ToRGB32fRow, YUV709ToRGB32fRow})
        ExpectRow(kernel, 1, Bytes{128, 128, 235, 51}, Floats{1, 1, 1, 0.2f}, Rule::kBoth, 2e-7f);
}

TEST(YUVToRGB, FloatsAreNotLimited) {
    const Floats vuya = {0, 1, 0, -5, 1, 0, 0, 5, 0, 0, 4e9f, 0.5f, 0, -1, 2, 0.4f};
    ExpectRow(YUV601ToRGBFloat32Row, 4, vuya,
              Floats{1.772f, -0.344136f, 0, -5, 0, -0.714136f, 1.402f, 5, 4e9f, 4e9f, 4e9f, 0.5f, 0.228f,
                     2.344136f, 2, 0.4f},
              Rule::kBoth, 3e-7f);
    ExpectRow(YUV709ToRGBFloat32Row, 4, vuya,
              Floats{1.8556f, -0.187324f, 0, -5, 0, -0.468124f, 1.5748f, 5, 4e9f, 4e9f, 4e9f, 0.5f, 0.1444f,
                     2.187324f, 2, 0.4f},
              Rule::kBoth, 3e-7f);
}

TEST(YUVToYUV, GreysStay) {
    for (const uint8_t luma : Bytes{0, 1, 16, 127, 235, 254, 255})
        for (const Kernel kernel : {YUV601To709Row, YUV709To601Row}) {
            const Bytes grey = {128, 128, luma, 200};
            ExpectRow(kernel, 1, grey, grey);
        }
    const Bytes uyvy = {128, 1, 128, 254}, yuyv = {1, 128, 254, 128};
    for (const Kernel kernel : {UYVY601To709Row, UYVY709To601Row}) ExpectRow(kernel, 2, uyvy, uyvy);
    for (const Kernel kernel : {YUYV601To709Row, YUYV709To601Row}) ExpectRow(kernel, 2, yuyv, yuyv);
}

TEST(YUVToYUV, RedGoesToRedAndCodesAreLimited) {
    ExpectRow(YUV601To709Row, 3, Bytes{240, 90, 81, 5, 0, 0, 255, 5, 255, 255, 0, 5}, // 239.98 102.13 62.10
              Bytes{240, 102, 62, 5, 0, 0, 255, 5, 255, 255, 0, 5});
    ExpectRow(YUV709To601Row, 1, Bytes{240, 102, 63, 5}, Bytes{240, 90, 82, 5});      // 240.02 89.87 81.89
    ExpectRow(UYVY709To601Row, 2, Bytes{255, 255, 255, 0}, Bytes{240, 255, 244, 37}); // 239.66 243.69 36.96
}

TEST(YUVToYUV, LumasGoWithTheChromaOfTheirPair) { // Y1 81.10 and 118.89; an odd width has its whole last pair
    for (const int32_t width : {1, 2}) {
        ExpectRow(UYVY601To709Row, width, Bytes{90, 81, 240, 100}, Bytes{102, 62, 240, 81});
        ExpectRow(YUYV601To709Row, width, Bytes{81, 90, 100, 240}, Bytes{62, 102, 81, 240});
        ExpectRow(UYVY709To601Row, width, Bytes{102, 63, 240, 100}, Bytes{90, 82, 240, 119});
        ExpectRow(YUYV709To601Row, width, Bytes{63, 102, 100, 240}, Bytes{82, 90, 119, 240});
    }
}

TEST(YUVToYUV, FloatsHaveNoOffsets) {
    const Floats vuya = {0, 0, 0.5f, 2, 0, 1, 0, 2, 1, 0, 0, 2};
    ExpectRow(YUV601To709Float32Row, 3, vuya,
              Floats{0, 0, 0.5f, 2, 0.07504945f, 1.01863968f, -0.11554975f, 2, 1.02532709f, 0.11461795f,
                     -0.20793764f, 2});
    ExpectRow(YUV709To601Float32Row, 3, vuya,
              Floats{0, 0, 0.5f, 2, -0.07245296f, 0.98985380f, 0.09931166f, 2, 0.98339784f, -0.11065251f,
                     0.19169955f, 2},
              Rule::kBoth, 1e-9f); // a zero of either sign
}

} // namespace
