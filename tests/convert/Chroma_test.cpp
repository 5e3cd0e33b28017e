// Chroma resampling between 4:4:4 and 4:2:2: the filter and its edges, both roundings of the average.

#include "convert/KernelBodies.h"
#include "support/Random.h"

#include <cmath>
#include <cstring>
#include <limits>

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

using Bytes = std::vector<uint8_t>;
using Floats = std::vector<float>;

size_t PairSamples(int32_t width) {
    return static_cast<size_t>((width + 1) / 2 * 4);
}

size_t PixelSamples(int32_t width) {
    return static_cast<size_t>(width) * 4;
}

/// The vector bodies from SSSE3 up round the average up, the plain and the SSE2 body truncate.
int Average(Target target, int a, int b) {
    return (a + b + (target >= Target::ssse3 ? 1 : 0)) >> 1;
}

uint8_t Byte(int value) {
    return static_cast<uint8_t>(value);
}

TEST(Downsample444To422Row, FiltersChromaAndKeepsLuma) {
    const Bytes vuya = {10, 100, 16, 0, 20, 50, 17, 1, 31, 7, 18, 2, 41, 255, 19, 3};
    ForEachBody(Kernel::Downsample444To422Row, [&](Target, RowKernel body) {
        // U: (300 + 50 + 2) >> 2, (50 + 14 + 255 + 2) >> 2; V: (30 + 20 + 2) >> 2, (20 + 62 + 41 + 2) >> 2
        EXPECT_EQ(RunRow<uint8_t>(body, vuya, 4, 8), (Bytes{88, 16, 13, 17, 80, 18, 31, 19}));
    });
}

TEST(Downsample444To422Row, ALonePixelKeepsItsChromaAndRepeatsItsLuma) {
    const Bytes vuya = {10, 100, 16, 0, 20, 50, 17, 1, 31, 7, 18, 2};
    ForEachBody(Kernel::Downsample444To422Row, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, vuya, 1, 4), (Bytes{100, 16, 10, 16}));
        EXPECT_EQ(RunRow<uint8_t>(body, vuya, 3, 8), (Bytes{88, 16, 13, 17, 7, 18, 31, 18}));
    });
}

TEST(Downsample444To422Row, FiltersAllTriplesOfCodes) {
    // Each triple takes the last three of four pixels, in V from the left and in U from the right.
    constexpr size_t kTriples = 65536;
    ForEachBody(Kernel::Downsample444To422Row, [&](Target, RowKernel body) {
        Bytes source(kTriples * 16), pairs(kTriples * 8);
        for (int centre = 0; centre < 256; ++centre) {
            for (size_t i = 0; i < kTriples; ++i) {
                const uint8_t left = Byte(int(i >> 8)), right = Byte(int(i & 255)), c = Byte(centre);
                const uint8_t pixels[] = {left, right, 3, 9, c, c, 4, 9, right, left, 5, 9};
                std::memcpy(&source[i * 16 + 4], pixels, sizeof pixels);
            }
            body(source.data(), pairs.data(), kTriples * 4);
            for (size_t i = 0; i < kTriples; ++i) {
                const uint8_t expected = Byte((int(i >> 8) + 2 * centre + int(i & 255) + 2) >> 2);
                const uint8_t* pair = &pairs[i * 8 + 4];
                ASSERT_TRUE(pair[0] == expected && pair[1] == 4 && pair[2] == expected && pair[3] == 5)
                    << "triple " << (i >> 8) << " " << centre << " " << (i & 255);
            }
        }
    });
}

TEST(Downsample444To422Float32Row, FiltersInTheOrderOfTheFormula) {
    Random random(3);
    for (int32_t width = 0; width <= 40; ++width) {
        Floats vuya(PixelSamples(width)), expected;
        for (float& sample : vuya) sample = (float(random.Below(4000)) - 1500) * 0.00137f;
        const auto filter = [&](size_t i, size_t channel) {
            const auto c = [&](size_t pixel) { return vuya[4 * pixel + channel]; };
            if (i + 1 == static_cast<size_t>(width)) return c(i);
            if (i == 0) return (3 * c(0) + c(1)) * 0.25f;
            return (c(i - 1) + 2 * c(i) + c(i + 1)) * 0.25f;
        };
        for (size_t i = 0; i < static_cast<size_t>(width); i += 2) {
            const bool alone = i + 1 == static_cast<size_t>(width);
            expected.insert(expected.end(),
                            {filter(i, 1), vuya[4 * i + 2], filter(i, 0), alone ? 0.0f : vuya[4 * i + 6]});
        }
        ForEachBody(Kernel::Downsample444To422Float32Row, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<float>(body, vuya, width, PairSamples(width)), expected) << "width " << width;
        });
    }
}

TEST(Upsample422To444Row, AveragesForTheOddPixel) {
    const Bytes uyvy = {100, 16, 50, 17, 103, 18, 41, 19}, yuyv = {16, 100, 17, 50, 18, 103, 19, 41};
    for (const bool lumaFirst : {false, true}) {
        const Kernel kernel = lumaFirst ? Kernel::Upsample422To444Row_YUYV : Kernel::Upsample422To444Row_UYVY;
        ForEachBody(kernel, [&](Target target, RowKernel body) {
            const bool up = target >= Target::ssse3;
            const Bytes row = {
                50, 100, 16, 255, Byte(up ? 46 : 45), Byte(up ? 102 : 101), 17, 255, 41, 103, 18, 255,
                41, 103, 19, 255};
            const Bytes& source = lumaFirst ? yuyv : uyvy;
            EXPECT_EQ(RunRow<uint8_t>(body, source, 4, 16), row);
            EXPECT_EQ(RunRow<uint8_t>(body, source, 3, 12), Bytes(row.begin(), row.begin() + 12));
            // alone, the first pair repeats its chroma
            EXPECT_EQ(RunRow<uint8_t>(body, source, 2, 8), (Bytes{50, 100, 16, 255, 50, 100, 17, 255}));
            EXPECT_EQ(RunRow<uint8_t>(body, source, 1, 4), (Bytes{50, 100, 16, 255}));
        });
    }
}

TEST(Upsample422To444Row, AveragesAllPairsOfCodes) {
    // Pairs of pairs: the first has every chroma, the second too, and luma of its own in every place.
    constexpr size_t kCases = 65536;
    Bytes uyvy(kCases * 8), yuyv(kCases * 8);
    for (size_t i = 0; i < kCases; ++i) {
        const uint8_t a = Byte(int(i >> 8)), b = Byte(int(i & 255));
        const uint8_t pairs[] = {a, Byte(int(i % 251)), b, Byte(int(i % 241)), b, 7, a, 8};
        for (size_t j = 0; j < 8; ++j) {
            uyvy[i * 8 + j] = pairs[j];
            yuyv[i * 8 + (j ^ 1)] = pairs[j];
        }
    }
    for (const bool lumaFirst : {false, true}) {
        const Kernel kernel = lumaFirst ? Kernel::Upsample422To444Row_YUYV : Kernel::Upsample422To444Row_UYVY;
        ForEachBody(kernel, [&](Target target, RowKernel body) {
            const Bytes row = RunRow<uint8_t>(body, lumaFirst ? yuyv : uyvy, kCases * 4, kCases * 16);
            for (size_t i = 0; i < kCases; ++i) {
                const int a = int(i >> 8), b = int(i & 255), between = Average(target, a, b);
                const Bytes expected = {Byte(b),       Byte(a),       Byte(int(i % 251)), 255,
                                        Byte(between), Byte(between), Byte(int(i % 241)), 255};
                ASSERT_TRUE(std::memcmp(expected.data(), &row[i * 16], 8) == 0) << a << " and " << b;
            }
        });
    }
}

TEST(Upsample422To444Float32Row, RepeatsChromaAtLowQuality) {
    const Floats uyvy = {0.25f, 0.5f, -0.125f, 0.75f, -0.5f, -0.0f, 0.375f, 2};
    ForEachBody(Kernel::Upsample422To444Float32Row_Repeat, [&](Target, RowKernel body) {
        const Floats row = {-0.125f, 0.25f, 0.5f,  1, -0.125f, 0.25f, 0.75f, 1,
                            0.375f,  -0.5f, -0.0f, 1, 0.375f,  -0.5f, 2,     1};
        EXPECT_EQ(RunRow<float>(body, uyvy, 4, 16), row);
        EXPECT_EQ(RunRow<float>(body, uyvy, 3, 12), Floats(row.begin(), row.begin() + 12));
        EXPECT_EQ(RunRow<float>(body, uyvy, 1, 4), Floats(row.begin(), row.begin() + 4));
    });
}

TEST(Upsample422To444Float32Row, InterpolatesOverFourPairs) {
    // U is 0, 16, 32, 96; V is its negative
    const Floats uyvy = {0, 1, 0, 2, 16, 3, -16, 4, 32, 5, -32, 6, 96, 7, -96, 8};
    const Floats odd = {(9 * 16.0f - 0 - 32) / 16, (9 * 48.0f - 0 - 96) / 16, (9 * 128.0f - 16 - 96) / 16,
                        (9 * 192.0f - 32 - 96) / 16};
    ForEachBody(Kernel::Upsample422To444Float32Row_Interpolate, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<float>(body, uyvy, 8, 32),
                  (Floats{-0.0f, 0,  1, 1, -odd[0], odd[0], 2, 1, -16, 16, 3, 1, -odd[1], odd[1], 4, 1,
                          -32,   32, 5, 1, -odd[2], odd[2], 6, 1, -96, 96, 7, 1, -odd[3], odd[3], 8, 1}));
        EXPECT_EQ(RunRow<float>(body, Floats{3, 1, -5, 2}, 2, 8), (Floats{-5, 3, 1, 1, -5, 3, 2, 1}));
        EXPECT_EQ(RunRow<float>(body, Floats{3, 1, -5, 2}, 1, 4), (Floats{-5, 3, 1, 1}));
    });
}

TEST(Upsample422To444Float32Row, InterpolatesInTheOrderOfTheFormula) {
    Random random(4);
    for (int32_t width = 0; width <= 40; ++width) {
        const int64_t pairs = (width + 1) / 2;
        Floats uyvy(PairSamples(width)), expected;
        for (float& sample : uyvy) sample = (float(random.Below(4000)) - 1500) * 0.00137f;
        const auto at = [&](int64_t k, int64_t channel) {
            return uyvy[static_cast<size_t>(4 * std::clamp<int64_t>(k, 0, pairs - 1) + channel)];
        };
        for (int64_t i = 0; i < width; ++i) {
            const int64_t k = i / 2;
            for (const int64_t channel : {2, 0}) {
                const float between =
                    (9 * (at(k, channel) + at(k + 1, channel)) - at(k - 1, channel) - at(k + 2, channel)) *
                    0.0625f;
                expected.push_back(i % 2 ? between : at(k, channel));
            }
            expected.insert(expected.end(), {at(k, i % 2 ? 3 : 1), 1});
        }
        ForEachBody(Kernel::Upsample422To444Float32Row_Interpolate, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<float>(body, uyvy, width, PixelSamples(width)), expected) << "width " << width;
        });
    }
}

} // namespace
