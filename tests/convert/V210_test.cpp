// Ten-bit packed 4:2:2: the places of its samples, its partial groups, and its conversions.

#include "convert/KernelBodies.h"
#include "support/Random.h"

#include <cmath>
#include <limits>

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

using Bytes = std::vector<uint8_t>;
using Words = std::vector<uint32_t>;
using Floats = std::vector<float>;

constexpr float kInfinity = std::numeric_limits<float>::infinity();

/// Whole groups that hold the samples, in the order of UYVY; what is lacking is 0.
Words Packed(std::vector<uint32_t> samples, uint32_t highBits = 0) {
    samples.resize((samples.size() + 11) / 12 * 12);
    Words words;
    for (size_t i = 0; i < samples.size(); i += 3)
        words.push_back(samples[i] | samples[i + 1] << 10 | samples[i + 2] << 20 | highBits << 30);
    return words;
}

size_t GroupWords(int32_t width) {
    return static_cast<size_t>((width + 5) / 6 * 4);
}

size_t PairSamples(int32_t width) {
    return static_cast<size_t>((width + 1) / 2 * 4);
}

std::vector<uint32_t> RandomSamples(size_t count, uint32_t limit, uint64_t seed) {
    Random random(seed);
    std::vector<uint32_t> samples(count);
    for (uint32_t& sample : samples) sample = random.Below(limit);
    return samples;
}

/// Every 10-bit code in each of the twelve places of a group.
std::vector<uint32_t> EveryCodeEverywhere() {
    std::vector<uint32_t> samples;
    for (uint32_t group = 0; group < 1024; ++group)
        for (uint32_t place = 0; place < 12; ++place) samples.push_back((group + 85 * place) % 1024);
    return samples;
}

TEST(UYVY8uToV210Row, PlacesTheSamples) {
    const Bytes uyvy = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 255};
    ForEachBody(Kernel::UYVY8uToV210Row, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint32_t>(body, uyvy, 6, 4),
                  (Words{4 | 8 << 10 | 12 << 20, 16 | 20 << 10 | 24 << 20, 28 | 32 << 10 | 36 << 20,
                         40 | 44 << 10 | 1020 << 20}));
    });
}

TEST(UYVY8uToV210Row, WritesWholeGroupsWithZerosAfterTheLastPair) {
    for (int32_t width = 0; width <= 40; ++width) {
        const std::vector<uint32_t> codes = RandomSamples(PairSamples(width), 256, 6);
        std::vector<uint32_t> samples;
        for (const uint32_t code : codes) samples.push_back(4 * code);
        ForEachBody(Kernel::UYVY8uToV210Row, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint32_t>(body, Bytes(codes.begin(), codes.end()), width, GroupWords(width)),
                      Packed(samples))
                << "width " << width;
        });
    }
}

TEST(V210ToUYVY8uRow, TruncatesEveryCodeInEveryPlace) {
    const std::vector<uint32_t> samples = EveryCodeEverywhere();
    Bytes expected;
    for (const uint32_t sample : samples) expected.push_back(static_cast<uint8_t>(sample >> 2));
    for (const uint32_t unusedBits : {0u, 3u})
        ForEachBody(Kernel::V210ToUYVY8uRow, [&](Target, RowKernel body) {
            EXPECT_TRUE(RunRow<uint8_t>(body, Packed(samples, unusedBits), 6144, expected.size()) ==
                        expected);
        });
}

TEST(V210ToUYVY8uRow, WritesToTheEndOfTheLastPair) {
    for (int32_t width = 0; width <= 40; ++width) {
        const std::vector<uint32_t> samples = RandomSamples(GroupWords(width) * 3, 1024, 7);
        Bytes expected;
        for (size_t i = 0; i < PairSamples(width); ++i)
            expected.push_back(static_cast<uint8_t>(samples[i] >> 2));
        ForEachBody(Kernel::V210ToUYVY8uRow, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint8_t>(body, Packed(samples), width, expected.size()), expected)
                << "width " << width;
        });
    }
}

/// V, U, Y of one pixel. Samples are cut by `shift` before the odd pixel's average, which is truncated; the
/// row's last pair has no successor, whatever its group holds.
std::vector<uint32_t> Pixel(const std::vector<uint32_t>& samples, int32_t width, int32_t pixel, int shift) {
    const int32_t pair = pixel / 2, next = std::min(pair + 1, (width - 1) / 2);
    const auto chroma = [&](int32_t place) {
        const uint32_t own = samples[static_cast<size_t>(4 * pair + place)] >> shift;
        const uint32_t following = samples[static_cast<size_t>(4 * next + place)] >> shift;
        return pixel % 2 ? (own + following) >> 1 : own;
    };
    return {chroma(2), chroma(0), samples[static_cast<size_t>(4 * pair + (pixel % 2 ? 3 : 1))] >> shift};
}

TEST(V210ToVUY8uRow, AveragesEightBitChromaAndTruncates) {
    // U 10, 13, 21 and V 20, 25, 30 at 8 bits, with lower bits that are dropped before the average
    const Words group = Packed({43, 4, 83, 8, 55, 12, 103, 16, 87, 20, 120, 24});
    ForEachBody(Kernel::V210ToVUY8uRow, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, group, 6, 24),
                  (Bytes{20, 10, 1, 255, 22, 11, 2, 255, 25, 13, 3, 255,
                         27, 17, 4, 255, 30, 21, 5, 255, 30, 21, 6, 255}));
        EXPECT_EQ(RunRow<uint8_t>(body, group, 2, 8), (Bytes{20, 10, 1, 255, 20, 10, 2, 255}));
        EXPECT_EQ(RunRow<uint8_t>(body, group, 1, 4), (Bytes{20, 10, 1, 255}));
    });
}

TEST(V210ToVUY8uRow, LooksAcrossGroupsAndStopsAtTheLastPair) {
    for (int32_t width = 0; width <= 40; ++width) {
        const std::vector<uint32_t> samples = RandomSamples(GroupWords(width) * 3, 1024, 8);
        Bytes expected;
        for (int32_t i = 0; i < width; ++i) {
            for (const uint32_t sample : Pixel(samples, width, i, 2))
                expected.push_back(static_cast<uint8_t>(sample));
            expected.push_back(255);
        }
        ForEachBody(Kernel::V210ToVUY8uRow, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint8_t>(body, Packed(samples, 3), width, expected.size()), expected)
                << "width " << width;
        });
    }
}

TEST(V210709ToVUY601_8uRow, GivesWhatItsPartsGive) {
    for (const int32_t width : {1, 2, 5, 6, 7, 12, 13, 23, 24, 25, 6000}) {
        const Words row = Packed(RandomSamples(GroupWords(width) * 3, 1024, 9));
        const size_t bytes = static_cast<size_t>(width) * 4;
        ForEachBody(Kernel::V210709ToVUY601_8uRow, [&](Target target, RowKernel body) {
            Bytes expected(bytes);
            PK::Body(Kernel::V210ToVUY8uRow, target)(row.data(), expected.data(), width);
            PK::Body(Kernel::YUV709To601Row, target)(expected.data(), expected.data(), width);
            EXPECT_TRUE(RunRow<uint8_t>(body, row, width, bytes) == expected) << "width " << width;
        });
    }
}

TEST(V210709ToVUY601_8uRow, ConvertsAColour) {
    // V -0.07245296 x 100 = -7.25, U 98.99, Y 84 + 9.93, each with its offset
    ForEachBody(Kernel::V210709ToVUY601_8uRow, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, Packed({912, 400, 512, 400}), 1, 4), (Bytes{121, 227, 110, 255}));
    });
}

TEST(V210ToBGR8uRow, ConvertsBlackWhiteAndRed) {
    for (const Kernel kernel : {Kernel::V210ToBGR8uRow_601, Kernel::V210ToBGR8uRow_709})
        ForEachBody(kernel, [](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint8_t>(body, Packed({512, 64, 512, 940}), 2, 8),
                      (Bytes{0, 0, 0, 255, 255, 255, 255, 255}));
        });
    ForEachBody(Kernel::V210ToBGR8uRow_601, [](Target, RowKernel body) {
        // B 75.68 - 76.65, G 75.68 + 14.89 - 91.05, R 75.68 + 178.76
        EXPECT_EQ(RunRow<uint8_t>(body, Packed({360, 324, 960, 324}), 1, 4), (Bytes{0, 0, 254, 255}));
    });
    ForEachBody(Kernel::V210ToBGR8uRow_709, [](Target, RowKernel body) {
        // with Y 100, U 40 and V -60 above their zeros: 29.1096 + 21.124, - 2.132488 + 7.99362, - 26.8911
        EXPECT_EQ(RunRow<uint8_t>(body, Packed({552, 164, 452, 164}), 1, 4), (Bytes{50, 35, 2, 255}));
    });
}

TEST(V210ToBGR8uRow, AveragesTenBitChromaAndTruncates) {
    ForEachBody(Kernel::V210ToBGR8uRow_601, [](Target, RowKernel body) {
        // B is 0.504308 (U - 512): 0 at an average of 512, 1 at 513, which eight bits could not hold
        const Bytes kept = RunRow<uint8_t>(body, Packed({512, 64, 512, 64, 515, 64, 512, 64}), 4, 16);
        EXPECT_EQ(kept[4], 1);
        const Bytes truncated = RunRow<uint8_t>(body, Packed({512, 64, 512, 64, 513, 64, 512, 64}), 4, 16);
        EXPECT_EQ(truncated[4], 0);
    });
}

uint8_t NearestByte(float x) {
    return static_cast<uint8_t>(std::lrintf(std::min(255.0f, std::max(0.0f, x))));
}

TEST(V210ToBGR8uRow, FollowsTheFormulaAtAnyWidth) {
    for (const int32_t width : {1, 2, 3, 6, 7, 11, 12, 13, 18, 24, 25, 26, 35, 60000}) {
        const std::vector<uint32_t> samples = RandomSamples(GroupWords(width) * 3, 1024, 10);
        Bytes expected;
        for (int32_t i = 0; i < width; ++i) {
            const std::vector<uint32_t> vuy = Pixel(samples, width, i, 0);
            const float v = float(vuy[0]) - 512, u = float(vuy[1]) - 512, y = float(vuy[2]) - 64;
            expected.insert(expected.end(), {NearestByte(0.291096f * y + 0.504308f * u),
                                             NearestByte(0.291096f * y - 0.0979404f * u - 0.203242f * v),
                                             NearestByte(0.291096f * y + 0.399007f * v), uint8_t{255}});
        }
        ForEachBody(Kernel::V210ToBGR8uRow_601, [&](Target, RowKernel body) {
            EXPECT_TRUE(RunRow<uint8_t>(body, Packed(samples), width, expected.size()) == expected)
                << "width " << width;
        });
    }
}

TEST(V210ToUYVY32fRow, ScalesEveryCodeInEveryPlace) {
    const std::vector<uint32_t> samples = EveryCodeEverywhere();
    Floats expected;
    for (size_t i = 0; i < samples.size(); ++i) {
        const auto code = static_cast<float>(samples[i]);
        expected.push_back(i % 2 ? (code - 64) * 0.0011415525f : (code - 512) * 0.0011160715f);
    }
    ForEachBody(Kernel::V210ToUYVY32fRow, [&](Target, RowKernel body) {
        EXPECT_TRUE(RunRow<float>(body, Packed(samples, 3), 6144, expected.size()) == expected);
        for (const int32_t width : {0, 1, 2, 5, 7, 9, 14, 23})
            EXPECT_EQ(RunRow<float>(body, Packed(samples), width, PairSamples(width)),
                      Floats(expected.begin(), expected.begin() + static_cast<long>(PairSamples(width))));
    });
}

TEST(UYVY32fToV210Row, RoundsAfterAddingAHalf) {
    // 896 c + 512.5 and 876 y + 64.5: an exact half goes to the even neighbour
    const Floats uyvy = {0, 0, 1 / 896.0f, 1, 0.25f, 0.25f, -0.25f, 0.75f, -0.5f, 0.5f, 0.5f, -0.0625f};
    const Words expected = Packed({512, 64, 514, 940, 736, 284, 288, 722, 64, 502, 960, 10});
    ForEachBody(Kernel::UYVY32fToV210Row,
                [&](Target, RowKernel body) { EXPECT_EQ(RunRow<uint32_t>(body, uyvy, 6, 4), expected); });
}

TEST(UYVY32fToV210Row, ClampsByValue) {
    const Floats uyvy = {1e30f, -1e30f, kInfinity, -kInfinity, NAN, -NAN, 1, 2, -1, -2, 3e9f, -3e9f};
    ForEachBody(Kernel::UYVY32fToV210Row, [&](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint32_t>(body, uyvy, 6, 4),
                  Packed({1023, 0, 1023, 0, 0, 0, 1023, 1023, 0, 0, 1023, 0}));
    });
}

TEST(UYVY32fToV210Row, WritesWholeGroupsWithZerosAfterTheLastPair) {
    for (int32_t width = 0; width <= 40; ++width) {
        Floats uyvy;
        std::vector<uint32_t> samples;
        for (const uint32_t random : RandomSamples(PairSamples(width), 4000, 11)) {
            const float c = (static_cast<float>(random) - 1500) * 0.00077f;
            const float code = uyvy.size() % 2 ? 876 * c + 64.5f : 896 * c + 512.5f;
            samples.push_back(static_cast<uint32_t>(std::lrintf(std::min(1023.0f, std::max(0.0f, code)))));
            uyvy.push_back(c);
        }
        ForEachBody(Kernel::UYVY32fToV210Row, [&](Target, RowKernel body) {
            EXPECT_EQ(RunRow<uint32_t>(body, uyvy, width, GroupWords(width)), Packed(samples))
                << "width " << width;
        });
    }
}

} // namespace
