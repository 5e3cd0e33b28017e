// Ten-bit packed 4:2:2: the places of its samples, its partial groups, and its conversions.

#include "support/KernelRows.h"

#include <cmath>
#include <limits>

namespace {

using namespace PKTest;
using enum PK::Kernel;
using PK::Kernel;

constexpr float kInfinity = std::numeric_limits<float>::infinity();

/// Whole groups that hold the samples, in the order of UYVY; what is lacking is 0.
DoubleWords Packed(DoubleWords samples, uint32_t highBits = 0) {
    samples.resize((samples.size() + 11) / 12 * 12);
    DoubleWords words;
    for (size_t i = 0; i < samples.size(); i += 3)
        words.push_back(samples[i] | samples[i + 1] << 10 | samples[i + 2] << 20 | highBits << 30);
    return words;
}

/// Every 10-bit code in each of the twelve places of a group, with both values of the two unused bits.
TEST(V210, EveryCodeInEveryPlace) {
    DoubleWords samples;
    for (uint32_t group = 0; group < 1024; ++group)
        for (uint32_t place = 0; place < 12; ++place) samples.push_back((group + 85 * place) % 1024);
    for (const uint32_t unusedBits : {0u, 3u})
        for (const Kernel kernel : {V210ToUYVY8uRow, V210ToVUY8uRow, V210709ToVUY601_8uRow,
                                    V210ToBGR8uRow_601, V210ToBGR8uRow_709, V210ToUYVY32fRow})
            ExpectReference(kernel, Packed(samples, unusedBits));
}

TEST(UYVY8uToV210Row, PlacesTheSamplesAndLeavesZerosAfterTheLastPair) {
    const Bytes uyvy = {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 255, 12, 13, 14, 15};
    ExpectRow(UYVY8uToV210Row, 6, uyvy, Packed({4, 8, 12, 16, 20, 24, 28, 32, 36, 40, 44, 1020}));
    ExpectRow(UYVY8uToV210Row, 7, uyvy,
              Packed({4, 8, 12, 16, 20, 24, 28, 32, 36, 40, 44, 1020, 48, 52, 56, 60}));
}

TEST(V210ToUYVY8uRow, Truncates) {
    const DoubleWords v210 = Packed({1023, 3, 4, 7, 8, 512, 515, 516});
    ExpectRow(V210ToUYVY8uRow, 4, v210, Bytes{255, 0, 1, 1, 2, 128, 128, 129});
    ExpectRow(V210ToUYVY8uRow, 1, v210, Bytes{255, 0, 1, 1});
}

TEST(V210ToVUY8uRow, AveragesEightBitChromaAndTruncates) {
    // U 10, 13, 21 and V 20, 25, 30 at 8 bits, with lower bits that are dropped before the average
    const DoubleWords group = Packed({43, 4, 83, 8, 55, 12, 103, 16, 87, 20, 120, 24});
    ExpectRow(V210ToVUY8uRow, 6, group, Bytes{20, 10, 1, 255, 22, 11, 2, 255, 25, 13, 3, 255,
                                              27, 17, 4, 255, 30, 21, 5, 255, 30, 21, 6, 255});
    ExpectRow(V210ToVUY8uRow, 2, group, Bytes{20, 10, 1, 255, 20, 10, 2, 255});
    ExpectRow(V210ToVUY8uRow, 1, group, Bytes{20, 10, 1, 255});
}

TEST(V210ToVUY8uRow, TheOddPixelAtAGroupsEndLooksIntoTheNextGroup) {
    ExpectRow(V210ToVUY8uRow, 7, Packed({0, 0, 0, 0, 0, 0, 0, 0, 40, 0, 80, 0, 80, 0, 160}),
              Bytes{0, 0,   0,  255, 0, 0,   0,  255, 0, 0,   0,  255, 10, 5,
                    0, 255, 20, 10,  0, 255, 30, 15,  0, 255, 40, 20,  0,  255});
}

TEST(V210709ToVUY601_8uRow, ConvertsRed) {
    ExpectRow(V210709ToVUY601_8uRow, 1, Packed({408, 252, 960, 252}), Bytes{240, 90, 82, 255});
}

TEST(V210ToBGR8uRow, ConvertsBlackWhiteAndRed) {
    for (const Kernel kernel : {V210ToBGR8uRow_601, V210ToBGR8uRow_709})
        ExpectRow(kernel, 3, Packed({512, 64, 512, 940, 512, 1023, 512}),
                  Bytes{0, 0, 0, 255, 255, 255, 255, 255, 255, 255, 255, 255});
    // B 75.68 - 76.65, G 75.68 + 14.89 - 91.05, R 75.68 + 178.76
    ExpectRow(V210ToBGR8uRow_601, 1, Packed({360, 324, 960, 324}), Bytes{0, 0, 254, 255});
    ExpectRow(V210ToBGR8uRow_709, 1, Packed({408, 252, 960}), Bytes{0, 1, 255, 255}); // -0.20 0.58 255.5
    // with Y 100, U 40 and V -60 above their zeros: 29.1096 + 21.124, - 2.132488 + 7.99362, - 26.8911
    ExpectRow(V210ToBGR8uRow_709, 1, Packed({552, 164, 452, 164}), Bytes{50, 35, 2, 255});
}

TEST(V210ToBGR8uRow, AveragesTenBitChromaAndTruncates) {
    // B is 0.504308 (U - 512) and R 0.4 (V - 512): an average of 512 gives 0, one of 513 1 or 0, which eight bits could
    // not hold
    ExpectRow(V210ToBGR8uRow_601, 3, Packed({512, 64, 512, 64, 515, 64, 515}),
              Bytes{0, 0, 0, 255, 1, 0, 0, 255, 2, 0, 1, 255});
    ExpectRow(V210ToBGR8uRow_601, 3, Packed({512, 64, 512, 64, 513, 64, 512}),
              Bytes{0, 0, 0, 255, 0, 0, 0, 255, 1, 0, 0, 255});
}

TEST(V210ToUYVY32fRow, ScalesCodes) {
    ExpectRow(V210ToUYVY32fRow, 2, Packed({960, 940, 64, 64}), Floats{0.5f, 1, -0.5f, 0}, Rule::kBoth, 1e-7f);
    ExpectRow(V210ToUYVY32fRow, 1, Packed({513, 65, 511, 63}),
              Floats{0.0011160715f, 0.0011415525f, -0.0011160715f, -0.0011415525f});
}

TEST(UYVY32fToV210Row, RoundsAfterAddingAHalf) {
    // 896 c + 512.5 and 876 y + 64.5: an exact half goes to the even neighbour
    ExpectRow(UYVY32fToV210Row, 6,
              Floats{0, 0, 1 / 896.0f, 1, 0.25f, 0.25f, -0.25f, 0.75f, -0.5f, 0.5f, 0.5f, -0.0625f},
              Packed({512, 64, 514, 940, 736, 284, 288, 722, 64, 502, 960, 10}));
    // 896 / 1024 + 512.5 = 513.375; zeros stand after the last pair
    ExpectRow(UYVY32fToV210Row, 4, Floats{0, 0, 0.5f, 1, 1 / 1024.0f, 10, -10, NAN, 9, 9, 9, 9},
              Packed({512, 64, 960, 940, 513, 1023, 0, 0}));
}

TEST(UYVY32fToV210Row, ClampsByValue) {
    ExpectRow(UYVY32fToV210Row, 6,
              Floats{1e30f, -1e30f, kInfinity, -kInfinity, NAN, -NAN, 1, 2, -1, -2, 3e9f, -3e9f},
              Packed({1023, 0, 1023, 0, 0, 0, 1023, 1023, 0, 0, 1023, 0}));
}

TEST(UYVY32fToV210Row, RoundsTheBordersOfEveryCodeAtEveryPlace) {
    ExpectReference(UYVY32fToV210Row, CodeBordersAtEveryPlace(1024, 896, 512.5f));
    ExpectReference(UYVY32fToV210Row, CodeBordersAtEveryPlace(1024, 876, 64.5f));
}

} // namespace
