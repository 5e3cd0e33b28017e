// Changes of sample depth: every code, and for floats the borders of every code.

#include "convert/KernelBodies.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <limits>

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr float kHuge = std::numeric_limits<float>::max();
constexpr float kDenormal = std::numeric_limits<float>::denorm_min();

/// How the four samples of a pixel, or of a pair of pixels, are coded in a byte: code = scale x value + zero.
struct ByteCoding {
    Kernel expand, pack;
    int32_t unitPixels;
    std::array<int, 4> scale, zero;
};

constexpr ByteCoding kCodings[] = {
    {Kernel::ExpandTo32fRow_RGB_8u, Kernel::PackFrom32fRow_RGB_8u, 1, {255, 255, 255, 255}, {0, 0, 0, 0}},
    {Kernel::ExpandTo32fRow_VUYA_8u,
     Kernel::PackFrom32fRow_VUYA_8u,
     1,
     {224, 224, 219, 255},
     {128, 128, 16, 0}},
    {Kernel::ExpandTo32fRow_UYVY_8u,
     Kernel::PackFrom32fRow_UYVY_8u,
     2,
     {224, 219, 224, 219},
     {128, 16, 128, 16}},
    {Kernel::ExpandTo32fRow_YUYV_8u,
     Kernel::PackFrom32fRow_YUYV_8u,
     2,
     {219, 224, 219, 224},
     {16, 128, 16, 128}},
};

/// Each value at all four places of a unit.
template <class Sample>
std::vector<Sample> AtEveryPlace(const std::vector<Sample>& values) {
    std::vector<Sample> row;
    for (const Sample value : values) row.insert(row.end(), 4, value);
    return row;
}

int32_t Width(size_t samples, int32_t unitPixels) {
    return static_cast<int32_t>(samples / 4) * unitPixels;
}

template <class Sample>
std::vector<Sample> AllCodes(size_t count) {
    std::vector<Sample> codes(count);
    for (size_t i = 0; i < count; ++i) codes[i] = static_cast<Sample>(i);
    return codes;
}

std::vector<uint32_t> BitsOf(const std::vector<float>& values) {
    std::vector<uint32_t> bits;
    for (const float value : values) bits.push_back(std::bit_cast<uint32_t>(value));
    return bits;
}

TEST(ExpandTo32fRow, MapsTheNamedCodes) {
    ForEachBody(Kernel::ExpandTo32fRow_RGB_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, std::vector<uint8_t>{0, 51, 255, 1}, 1, 4),
                  (std::vector<float>{0.0f, 51 * 0x1.010102p-8f, 255 * 0x1.010102p-8f, 0x1.010102p-8f}));
    });
    ForEachBody(Kernel::ExpandTo32fRow_VUYA_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, std::vector<uint8_t>{240, 16, 235, 255}, 1, 4),
                  (std::vector<float>{0.5f, -0.5f, 219 * 0x1.2b404ap-8f, 255 * 0x1.010102p-8f}));
    });
    ForEachBody(Kernel::ExpandTo32fRow_UYVY_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, std::vector<uint8_t>{240, 16, 128, 235}, 2, 4),
                  (std::vector<float>{0.5f, 0.0f, 0.0f, 219 * 0x1.2b404ap-8f}));
    });
    ForEachBody(Kernel::ExpandTo32fRow_YUYV_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, std::vector<uint8_t>{16, 240, 235, 16}, 2, 4),
                  (std::vector<float>{0.0f, 0.5f, 219 * 0x1.2b404ap-8f, -0.5f}));
    });
    ForEachBody(Kernel::ExpandTo32fRow_RGB_15u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, std::vector<uint16_t>{0, 16384, 32768, 65535}, 1, 4),
                  (std::vector<float>{0.0f, 0.5f, 1.0f, 1.999969482421875f}));
    });
}

TEST(ExpandTo32fRow, MapsEveryByteAtEveryPlace) {
    const auto source = AtEveryPlace(AllCodes<uint8_t>(256));
    for (const ByteCoding& coding : kCodings) {
        std::vector<float> expected;
        for (size_t i = 0; i < source.size(); ++i)
            expected.push_back(static_cast<float>(source[i] - coding.zero[i % 4]) *
                               (1.0f / static_cast<float>(coding.scale[i % 4])));
        ForEachBody(coding.expand, [&](Target, RowKernel body) {
            EXPECT_EQ(
                BitsOf(RunRow<float>(body, source, Width(source.size(), coding.unitPixels), source.size())),
                BitsOf(expected));
        });
    }
}

TEST(ExpandTo32fRow, MapsEveryWord) {
    const auto source = AllCodes<uint16_t>(65536);
    std::vector<float> expected;
    for (const uint16_t code : source) expected.push_back(static_cast<float>(code) / 32768.0f);
    ForEachBody(Kernel::ExpandTo32fRow_RGB_15u, [&](Target, RowKernel body) {
        EXPECT_EQ(BitsOf(RunRow<float>(body, source, Width(source.size(), 1), source.size())),
                  BitsOf(expected));
    });
}

TEST(PackFrom32fRow, RoundsTheNamedValues) {
    ForEachBody(Kernel::PackFrom32fRow_RGB_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, std::vector<float>{0.0f, 0.5f, 1.0f, 0.1f}, 1, 4),
                  (std::vector<uint8_t>{0, 128, 255, 26})); // 127.5 and 25.5 go to the even neighbour
    });
    ForEachBody(Kernel::PackFrom32fRow_VUYA_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, std::vector<float>{0.0f, -0.5f, 0.5f, 1.0f}, 1, 4),
                  (std::vector<uint8_t>{128, 16, 126, 255})); // 125.5 to the even neighbour
    });
    ForEachBody(Kernel::PackFrom32fRow_UYVY_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, std::vector<float>{0.5f, 1.0f, -0.5f, 0.0f}, 2, 4),
                  (std::vector<uint8_t>{240, 235, 16, 16}));
    });
    ForEachBody(Kernel::PackFrom32fRow_YUYV_8u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, std::vector<float>{1.0f, 0.5f, 0.0f, -0.5f}, 1, 4),
                  (std::vector<uint8_t>{235, 240, 16, 16}));
    });
    ForEachBody(Kernel::PackFrom32fRow_RGB_15u, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint16_t>(body, std::vector<float>{0.0f, 0.5f, 1.0f, 0x1p-16f}, 1, 4),
                  (std::vector<uint16_t>{0, 16384, 32768, 1}));
    });
}

TEST(PackFrom32fRow, ClampsByValueAndMakesNaNZero) {
    const std::vector<float> values = {kInfinity, -kInfinity, kNaN, kHuge, -kHuge, 3e9f, -3e9f, -kNaN};
    const std::vector<uint8_t> codes = {255, 0, 0, 255, 0, 255, 0, 0};
    for (const ByteCoding& coding : kCodings)
        ForEachBody(coding.pack, [&](Target, RowKernel body) {
            const auto source = AtEveryPlace(values);
            EXPECT_EQ(RunRow<uint8_t>(body, source, Width(source.size(), coding.unitPixels), source.size()),
                      AtEveryPlace(codes));
        });
    ForEachBody(Kernel::PackFrom32fRow_RGB_15u, [&](Target, RowKernel body) {
        const std::vector<uint16_t> words = {32768, 0, 0, 32768, 0, 32768, 0, 0};
        EXPECT_EQ(RunRow<uint16_t>(body, values, 2, 8), words);
    });
}

/// The floats about the border between each two codes, and about both ends.
std::vector<float> Borders(int codes, float scale, float zero) {
    std::vector<float> values = {0.0f, -0.0f, kDenormal, -kDenormal};
    for (int code = -2; code <= codes + 1; ++code) {
        const float border = (static_cast<float>(code) + 0.5f - zero) / scale;
        const float below = std::nextafter(border, -kInfinity), above = std::nextafter(border, kInfinity);
        values.insert(values.end(), {std::nextafter(below, -kInfinity), below, border, above,
                                     std::nextafter(above, kInfinity)});
    }
    return values;
}

TEST(PackFrom32fRow, RoundsTheBordersOfEveryByteAtEveryPlace) {
    for (const ByteCoding& coding : kCodings) {
        std::vector<float> source;
        std::vector<uint8_t> expected;
        for (size_t place = 0; place < 4; ++place) {
            const auto scale = static_cast<float>(coding.scale[place]);
            const auto zero = static_cast<float>(coding.zero[place]);
            for (const float value : AtEveryPlace(Borders(256, scale, zero))) {
                const size_t at = source.size() % 4;
                const float product = static_cast<float>(coding.scale[at]) * value;
                const float code = std::nearbyint(product + static_cast<float>(coding.zero[at]));
                source.push_back(value);
                expected.push_back(static_cast<uint8_t>(std::fmin(std::fmax(code, 0.0f), 255.0f)));
            }
        }
        ForEachBody(coding.pack, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint8_t>(body, source, Width(source.size(), coding.unitPixels), source.size()),
                      expected);
        });
    }
}

TEST(PackFrom32fRow, RoundsTheBordersOfEveryWordUp) {
    const auto source = Borders(32768, 32768, 0);
    ASSERT_EQ(source.size() % 4, 0u);
    std::vector<uint16_t> expected;
    for (const float value : source) {
        const float limited = std::fmin(std::fmax(value, 0.0f), 1.0f);
        const float sum = limited * 32768.0f + 0.5f;
        expected.push_back(static_cast<uint16_t>(sum));
    }
    ForEachBody(Kernel::PackFrom32fRow_RGB_15u, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint16_t>(body, source, Width(source.size(), 1), source.size()), expected);
    });
}

TEST(DepthRows, TouchOnlyTheUnitsOfTheirWidth) {
    for (int32_t width = 0; width <= 70; ++width)
        for (const ByteCoding& coding : kCodings) {
            const auto samples = static_cast<size_t>((width + coding.unitPixels - 1) / coding.unitPixels * 4);
            const std::vector<uint8_t> codes = [&] {
                std::vector<uint8_t> row(samples);
                for (size_t i = 0; i < samples; ++i) row[i] = static_cast<uint8_t>(37 * i + 5);
                return row;
            }();
            // Expanding and packing gives every code back.
            ForEachBody(coding.expand, [&](Target target, RowKernel expand) {
                const auto values = RunRow<float>(expand, codes, width, samples);
                ASSERT_EQ(RunRow<uint8_t>(PK::Body(coding.pack, target), values, width, samples), codes)
                    << "width " << width;
            });
        }
}

/// Expands a row of bytes into a destination that starts `offset` bytes behind a 16-byte boundary.
std::vector<uint16_t> ExpandAt(RowKernel body, const std::vector<uint8_t>& codes, size_t offset) {
    alignas(16) static uint8_t buffer[16 + 8 * 1024];
    std::vector<uint16_t> words(codes.size());
    body(codes.data(), buffer + offset, Width(codes.size(), 1));
    if (!words.empty()) std::memcpy(words.data(), buffer + offset, 2 * words.size());
    return words;
}

TEST(Expand8uTo15uRow, TakesTheQuotientBeforeTheBoundaryAndRoundsBehindIt) {
    const std::vector<uint8_t> codes = {1, 2, 254, 255, 1, 2, 254, 255, 0, 253, 3, 128};
    const std::vector<uint16_t> quotients = {128,   257,   32639, 32768, 128, 257,
                                             32639, 32768, 0,     32510, 385, 16448};
    const std::vector<uint16_t> rounded = {129,   257,   32640, 32768, 129, 257,
                                           32640, 32768, 0,     32511, 386, 16448};
    ForEachBody(Kernel::Expand8uTo15uRow, [&](Target target, RowKernel body) {
        for (size_t offset = 0; offset < 16; ++offset) {
            size_t headPixels = offset == 0 ? 0 : offset < 8 ? 2 : 1;
            if (target == Target::plain) headPixels = 3;
            std::vector<uint16_t> expected(quotients.begin(), quotients.begin() + 4 * headPixels);
            expected.insert(expected.end(), rounded.begin() + 4 * headPixels, rounded.end());
            EXPECT_EQ(ExpandAt(body, codes, offset), expected) << "offset " << offset;
        }
    });
}

TEST(Expand8uTo15uRow, KeepsAHeadShorterThanTheWayToTheBoundary) {
    ForEachBody(Kernel::Expand8uTo15uRow, [](Target, RowKernel body) {
        EXPECT_EQ(ExpandAt(body, {1, 3, 254, 253}, 2), (std::vector<uint16_t>{128, 385, 32639, 32510}));
        EXPECT_EQ(ExpandAt(body, {}, 2), std::vector<uint16_t>{});
    });
}

TEST(Expand8uTo15uRow, MapsEveryCodeInHeadAndBulk) {
    ForEachBody(Kernel::Expand8uTo15uRow, [](Target target, RowKernel body) {
        for (uint32_t code = 0; code < 256; ++code) {
            const std::vector<uint8_t> codes(4 * 21, static_cast<uint8_t>(code));
            const auto quotient = static_cast<uint16_t>(code * 32768 / 255);
            const float product = static_cast<float>(code) * 128.50196838f;
            const float sum = product + 0.5f;
            const uint16_t bulk = target == Target::plain ? quotient : static_cast<uint16_t>(sum);
            std::vector<uint16_t> expected(4 * 21, bulk);
            std::fill_n(expected.begin(), 4, quotient);
            ASSERT_EQ(ExpandAt(body, codes, 8), expected) << "code " << code;
        }
    });
}

TEST(Expand8uTo15uRow, TouchesOnlyThePixelsOfItsWidth) {
    ForEachBody(Kernel::Expand8uTo15uRow, [](Target, RowKernel body) {
        for (size_t pixels = 0; pixels <= 40; ++pixels) {
            const std::vector<uint8_t> codes(4 * pixels, 255);
            EXPECT_EQ(RunRow<uint16_t>(body, codes, static_cast<int32_t>(pixels), codes.size()),
                      std::vector<uint16_t>(codes.size(), 32768));
        }
    });
}

TEST(Pack15uTo8uRow, RoundsEveryWord) {
    const auto source = AllCodes<uint16_t>(65536);
    std::vector<uint8_t> expected;
    for (const uint16_t word : source) {
        const float code = std::nearbyint(static_cast<float>(word) * 0.0077819824f);
        expected.push_back(static_cast<uint8_t>(std::fmin(code, 255.0f)));
    }
    ForEachBody(Kernel::Pack15uTo8uRow, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, source, Width(source.size(), 1), source.size()), expected);
    });
}

TEST(Pack15uTo8uRow, RoundsTheNamedWordsAtEveryWidth) {
    const std::vector<uint16_t> pixel = {64, 65, 16384, 65535}; // 0.498, 0.506, 127.5
    const std::vector<uint8_t> packed = {0, 1, 128, 255};
    ForEachBody(Kernel::Pack15uTo8uRow, [&](Target, RowKernel body) {
        std::vector<uint16_t> source;
        std::vector<uint8_t> expected;
        for (int32_t width = 0; width <= 40; ++width) {
            ASSERT_EQ(RunRow<uint8_t>(body, source, width, expected.size()), expected) << "width " << width;
            source.insert(source.end(), pixel.begin(), pixel.end());
            expected.insert(expected.end(), packed.begin(), packed.end());
        }
    });
}

} // namespace
