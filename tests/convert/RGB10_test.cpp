// Ten-bit packed RGB: every code of every depth, and the borders of every code for floats.

#include "support/KernelRows.h"

#include <cmath>
#include <limits>

namespace {

using namespace PKTest;
using enum PK::Kernel;
using PK::Kernel;

uint32_t Word(uint32_t blue, uint32_t green, uint32_t red) {
    return blue << 2 | green << 12 | red << 22;
}

TEST(BGRToRGB10uRows, PlaceTheSamplesDropAlphaAndTruncate) {
    ExpectRow(BGR8uToRGB10uRow, 5,
              Bytes{255, 0, 0, 9, 0, 255, 0, 255, 0, 0, 255, 0, 1, 2, 254, 255, 255, 1, 128, 9},
              DoubleWords{0x00000ffc, 0x003ff000, 0xffc00000, Word(4, 8, 1018), Word(1023, 4, 513)});
    ExpectRow(BGR15uToRGB10uRow, 2, Words{32768, 0, 16384, 65535, 32, 33, 65535, 0},
              DoubleWords{Word(1023, 0, 511), Word(0, 1, 1023)});
}

TEST(BGR32fToRGB10uRow, RoundsTheNamedValuesAndClampsByValue) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    constexpr float kHuge = std::numeric_limits<float>::max();
    ExpectRow(BGR32fToRGB10uRow, 4,
              Floats{1.0f, 0.5f, -0.0f, NAN, 0.25f, -1.0f, 2.0f, kHuge, kInfinity, -kInfinity, NAN, 1.0f,
                     kHuge, -kHuge, -NAN, 0.0f},
              DoubleWords{Word(1023, 512, 0), Word(256, 0, 1023), Word(1023, 0, 0), Word(1023, 0, 0)});
}

/// A pixel for each of the values, with another one in each of the three samples, so that no place stands for another.
template <class Sample>
std::vector<Sample> Mixed(const std::vector<Sample>& values) {
    const size_t count = values.size();
    std::vector<Sample> row;
    for (size_t i = 0; i < count; ++i)
        row.insert(row.end(), {values[i], values[(i + count / 3) % count], values[(i * 5 + 7) % count],
                               values[count - 1]});
    return row;
}

TEST(BGRToRGB10uRows, ScaleEveryCodeAndTheBordersOfFloats) {
    for (const Kernel kernel : {BGR8uToRGB10uRow, OpaqueBGRToRGB10, StraightBGRToRGB10})
        ExpectReference(kernel, Mixed(AllCodesAtEveryPlace<uint8_t>()));
    ExpectReference(BGR15uToRGB10uRow, Mixed(AllCodesAtEveryPlace<uint16_t>()));
    ExpectReference(BGR32fToRGB10uRow, Mixed(CodeBordersAtEveryPlace(1024, 1023)));
}

TEST(RGB10uToBGRRows, ScaleEveryCodeAndIgnoreTheUnusedBits) {
    DoubleWords words;
    for (uint32_t code = 0; code < 1024; ++code)
        words.push_back(Word(code, (code + 341) % 1024, (code * 5 + 7) % 1024) | (code & 3));
    for (const Kernel kernel : {RGB10uToBGR8uRow, RGB10uToBGR15uRow, RGB10uToBGR32fRow})
        ExpectReference(kernel, words);
}

TEST(RGB10uToBGRRows, MapTheNamedWords) {
    // 1007 x 32.03128 is 32255.49896, which the float product rounds to the tie 32255.5.
    const DoubleWords source = {Word(1023, 0, 512) | 3, Word(2, 3, 1007)};
    ExpectRow(RGB10uToBGR8uRow, 2, source, Bytes{255, 0, 128, 255, 0, 1, 251, 255});
    ExpectRow(RGB10uToBGR15uRow, 2, source, Words{32768, 0, 16400, 32768, 64, 96, 32256, 32768});
    ExpectRow(RGB10uToBGR32fRow, 1, source, Floats{1023 * 0.0009775171f, 0, 512 * 0.0009775171f, 1});
    EXPECT_FLOAT_EQ(1023 * 0.0009775171f, 1.0f);
}

} // namespace
