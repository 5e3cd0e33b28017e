// Ten-bit packed RGB: every code of every depth, and the borders of every code for floats.

#include "convert/KernelBodies.h"

#include <cmath>
#include <limits>

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

uint32_t Word(uint32_t blue, uint32_t green, uint32_t red) {
    return blue << 2 | green << 12 | red << 22;
}

/// A pixel for each code, with another code in each of the three samples, so that no place stands for
/// another.
template <class Sample, class Pick>
std::vector<Sample> BGRXRow(size_t count, Sample alpha, Pick pick) {
    std::vector<Sample> row;
    for (size_t i = 0; i < count; ++i)
        row.insert(row.end(), {pick(i), pick((i + count / 3) % count), pick((i * 5 + 7) % count), alpha});
    return row;
}

template <class Sample, class Scale>
void CheckPack(Kernel kernel, const std::vector<Sample>& source, Scale scale) {
    std::vector<uint32_t> expected;
    for (size_t i = 0; i < source.size(); i += 4)
        expected.push_back(Word(scale(source[i]), scale(source[i + 1]), scale(source[i + 2])));
    ForEachBody(kernel, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint32_t>(body, source, static_cast<int32_t>(expected.size()), expected.size()),
                  expected);
    });
}

TEST(BGR8uToRGB10uRow, PlacesTheSamplesAndDropsAlpha) {
    ForEachBody(Kernel::BGR8uToRGB10uRow, [](Target, RowKernel body) {
        const std::vector<uint8_t> source = {255, 0, 0, 9, 0, 255, 0, 255, 0, 0, 255, 0, 1, 2, 254, 255};
        EXPECT_EQ(RunRow<uint32_t>(body, source, 4, 4),
                  (std::vector<uint32_t>{0x00000ffc, 0x003ff000, 0xffc00000, Word(4, 8, 1018)}));
    });
}

TEST(BGR8uToRGB10uRow, TruncatesEveryCode) {
    const auto source = BGRXRow<uint8_t>(256, 255, [](size_t i) { return static_cast<uint8_t>(i); });
    CheckPack(Kernel::BGR8uToRGB10uRow, source, [](uint8_t code) { return code * 1023u / 255u; });
}

TEST(BGR15uToRGB10uRow, TruncatesEveryWordAndLimitsThoseAboveFullScale) {
    const auto source = BGRXRow<uint16_t>(65536, 65535, [](size_t i) { return static_cast<uint16_t>(i); });
    CheckPack(Kernel::BGR15uToRGB10uRow, source,
              [](uint16_t word) { return word >= 32768 ? 1023u : word * 1023u >> 15; });
}

TEST(BGR15uToRGB10uRow, PlacesTheSamplesAndDropsAlpha) {
    ForEachBody(Kernel::BGR15uToRGB10uRow, [](Target, RowKernel body) {
        const std::vector<uint16_t> source = {32768, 0, 16384, 65535, 32, 33, 65535, 0};
        EXPECT_EQ(RunRow<uint32_t>(body, source, 2, 2),
                  (std::vector<uint32_t>{Word(1023, 0, 511), Word(0, 1, 1023)}));
    });
}

TEST(BGR32fToRGB10uRow, RoundsTheNamedValuesAndClampsByValue) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    constexpr float kHuge = std::numeric_limits<float>::max();
    ForEachBody(Kernel::BGR32fToRGB10uRow, [&](Target, RowKernel body) {
        const std::vector<float> source = {1.0f,      0.5f,       -0.0f, kNaN, 0.25f, -1.0f,  2.0f,  kHuge,
                                           kInfinity, -kInfinity, kNaN,  1.0f, kHuge, -kHuge, -kNaN, 0.0f};
        EXPECT_EQ(RunRow<uint32_t>(body, source, 4, 4),
                  (std::vector<uint32_t>{Word(1023, 512, 0), Word(256, 0, 1023), Word(1023, 0, 0),
                                         Word(1023, 0, 0)}));
    });
}

TEST(BGR32fToRGB10uRow, RoundsTheBordersOfEveryCodeUp) {
    std::vector<float> values;
    for (int code = -2; code <= 1024; ++code) {
        const float border = (static_cast<float>(code) + 0.5f) / 1023.0f;
        values.insert(values.end(), {std::nextafter(border, -1.0f), border, std::nextafter(border, 2.0f)});
    }
    const auto source = BGRXRow<float>(values.size(), 0.5f, [&](size_t i) { return values[i]; });
    CheckPack(Kernel::BGR32fToRGB10uRow, source, [](float value) {
        const float product = std::fmin(std::fmax(value, 0.0f), 1.0f) * 1023.0f;
        const float sum = product + 0.5f;
        return static_cast<uint32_t>(sum);
    });
}

/// A word for each code, with other codes in the other samples and with the two unused bits set in all ways.
std::vector<uint32_t> AllWords() {
    std::vector<uint32_t> words;
    for (uint32_t code = 0; code < 1024; ++code)
        words.push_back(Word(code, (code + 341) % 1024, (code * 5 + 7) % 1024) | (code & 3));
    return words;
}

template <class Sample, class Scale>
void CheckUnpack(Kernel kernel, Sample opaque, Scale scale) {
    const auto source = AllWords();
    std::vector<Sample> expected;
    for (const uint32_t word : source)
        expected.insert(expected.end(), {scale(static_cast<float>(word >> 2 & 1023)),
                                         scale(static_cast<float>(word >> 12 & 1023)),
                                         scale(static_cast<float>(word >> 22)), opaque});
    ForEachBody(kernel, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<Sample>(body, source, static_cast<int32_t>(source.size()), expected.size()),
                  expected);
    });
}

TEST(RGB10uToBGRRows, ScaleEveryCodeAndIgnoreTheUnusedBits) {
    CheckUnpack<uint8_t>(Kernel::RGB10uToBGR8uRow, 255,
                         [](float code) { return static_cast<uint8_t>(std::nearbyint(code * 0.24926686f)); });
    CheckUnpack<uint16_t>(Kernel::RGB10uToBGR15uRow, 32768,
                          [](float code) { return static_cast<uint16_t>(std::nearbyint(code * 32.03128f)); });
    CheckUnpack<float>(Kernel::RGB10uToBGR32fRow, 1.0f, [](float code) { return code * 0.0009775171f; });
}

TEST(RGB10uToBGRRows, MapTheNamedWords) {
    // 1007 x 32.03128 is 32255.49896, which the float product rounds to the tie 32255.5.
    const std::vector<uint32_t> source = {Word(1023, 0, 512) | 3, Word(2, 3, 1007)};
    ForEachBody(Kernel::RGB10uToBGR8uRow, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, source, 2, 8),
                  (std::vector<uint8_t>{255, 0, 128, 255, 0, 1, 251, 255}));
    });
    ForEachBody(Kernel::RGB10uToBGR15uRow, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint16_t>(body, source, 2, 8),
                  (std::vector<uint16_t>{32768, 0, 16400, 32768, 64, 96, 32256, 32768}));
    });
    ForEachBody(Kernel::RGB10uToBGR32fRow, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, source, 1, 4),
                  (std::vector<float>{1023 * 0.0009775171f, 0.0f, 512 * 0.0009775171f, 1.0f}));
    });
}

template <class To, class From>
void CheckEveryWidth(Kernel kernel, size_t samplesFrom, size_t samplesTo) {
    ForEachBody(kernel, [&](Target, RowKernel body) {
        std::vector<From> source(40 * samplesFrom);
        for (size_t i = 0; i < source.size(); ++i) source[i] = static_cast<From>(i * 3 % 251);
        const auto whole = RunRow<To>(body, source, 40, 40 * samplesTo);
        for (size_t width = 0; width <= 40; ++width)
            ASSERT_EQ(
                RunRow<To>(body, source, static_cast<int32_t>(width), width * samplesTo),
                std::vector<To>(whole.begin(), whole.begin() + static_cast<int64_t>(width * samplesTo)));
    });
}

TEST(RGB10Rows, TouchOnlyThePixelsOfTheirWidth) {
    CheckEveryWidth<uint32_t, uint8_t>(Kernel::BGR8uToRGB10uRow, 4, 1);
    CheckEveryWidth<uint32_t, uint16_t>(Kernel::BGR15uToRGB10uRow, 4, 1);
    CheckEveryWidth<uint32_t, float>(Kernel::BGR32fToRGB10uRow, 4, 1);
    CheckEveryWidth<uint8_t, uint32_t>(Kernel::RGB10uToBGR8uRow, 1, 4);
    CheckEveryWidth<uint16_t, uint32_t>(Kernel::RGB10uToBGR15uRow, 1, 4);
    CheckEveryWidth<float, uint32_t>(Kernel::RGB10uToBGR32fRow, 1, 4);
}

TEST(RGB10Rows, ConvertInPlaceWherePixelsKeepTheirSize) {
    const auto words = AllWords();
    std::vector<uint8_t> bytes(4 * words.size());
    std::memcpy(bytes.data(), words.data(), bytes.size());
    const auto width = static_cast<int32_t>(words.size());
    for (const Kernel kernel : {Kernel::BGR8uToRGB10uRow, Kernel::RGB10uToBGR8uRow})
        ForEachBody(kernel, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRowInPlace(body, bytes, width), RunRow<uint8_t>(body, bytes, width, bytes.size()));
        });
}

} // namespace
