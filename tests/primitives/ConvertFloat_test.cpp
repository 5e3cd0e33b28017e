// Floats to integers, scaled by powers of two, beside the exact quotient in long double.

#include "primitives/ConvertFloat.h"

#include "support/FloatEnvironment.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

/// x x 2^-scale is exact in 64 bits of mantissa; the nearest with ties to even is found by hand.
template <class Integer>
Integer Expected(float x, int32_t roundMode, int32_t scale) {
    if (std::isnan(x)) return 0;
    const long double scaled = std::ldexp(static_cast<long double>(x), -scale);
    long double rounded = std::trunc(scaled);
    if (roundMode == 1) {
        const long double low = std::floor(scaled), rest = scaled - low;
        const bool isOdd = std::fmod(low, 2.0L) != 0;
        rounded = rest > 0.5L || (rest == 0.5L && isOdd) ? low + 1 : low;
    }
    if (rounded <= std::numeric_limits<Integer>::min()) return std::numeric_limits<Integer>::min();
    if (rounded >= std::numeric_limits<Integer>::max()) return std::numeric_limits<Integer>::max();
    return static_cast<Integer>(rounded);
}

int32_t Convert(const float* source, int32_t* destination, int32_t count, int32_t roundMode, int32_t scale) {
    return ConvertFloatToInt32(source, destination, count, roundMode, scale);
}
int32_t Convert(const float* source, int16_t* destination, int32_t count, int32_t roundMode, int32_t scale) {
    return ConvertFloatToInt16(source, destination, count, roundMode, scale);
}

template <class Integer>
void CheckAgainstReference(const std::vector<float>& source, int32_t roundMode, int32_t scale) {
    std::vector<Integer> result(source.size());
    ASSERT_EQ(Convert(source.data(), result.data(), static_cast<int32_t>(source.size()), roundMode, scale),
              0);
    for (size_t i = 0; i < source.size(); ++i)
        ASSERT_EQ(result[i], Expected<Integer>(source[i], roundMode, scale))
            << source[i] << ", mode " << roundMode << ", scale " << scale;
}

std::vector<float> AwkwardFloats() {
    std::vector<float> floats = {
        0.0f,          -0.0f,          0.5f,          -0.5f,     1.5f,     -1.5f,          2.5f,
        -2.5f,         0.49999997f,    32766.5f,      32767.49f, 32767.5f, 32768.0f,       -32768.0f,
        -32768.5f,     -32769.0f,      2147483520.0f, 0x1p31f,   -0x1p31f, -2147483904.0f, 1e30f,
        -1e30f,        kInfinity,      -kInfinity,    kNaN,      -kNaN,    1e-45f,         -1e-40f,
        3.4028235e38f, -3.4028235e38f, 1.1754944e-38f};
    for (int i = -2000; i < 2000; ++i) floats.push_back(static_cast<float>(i) * 0.25f);
    return floats;
}

TEST(ConvertFloat, GivesWhatIsWorkedOutByHand) {
    const std::vector<float> source = {2.5f, 3.5f, -2.5f, 2.75f, -2.75f, 7.0f, 40000.0f, kNaN};
    const std::vector<int32_t> nearest = {2, 4, -2, 3, -3, 7, 40000, 0};
    const std::vector<int32_t> truncated = {2, 3, -2, 2, -2, 7, 40000, 0};
    const std::vector<int16_t> halves = {1,  2, -1,    1,
                                         -1, 4, 20000, 0}; // nearest at scale 1: 1.25, 1.75, ... 3.5
    AtEveryTarget([&] {
        std::vector<int32_t> result(source.size());
        Convert(source.data(), result.data(), 8, 1, 0);
        EXPECT_EQ(result, nearest);
        Convert(source.data(), result.data(), 8, 0, 0);
        EXPECT_EQ(result, truncated);
        std::vector<int16_t> words(source.size());
        Convert(source.data(), words.data(), 8, 1, 1);
        EXPECT_EQ(words, halves);
        Convert(source.data(), words.data(), 8, 1, -3);
        EXPECT_EQ(words, (std::vector<int16_t>{20, 28, -20, 22, -22, 56, 32767, 0}));
    });
}

TEST(ConvertFloat, RoundsAndSaturatesAtEveryScale) {
    const std::vector<float> source = AwkwardFloats();
    AtEveryTarget([&] {
        for (const int32_t roundMode : {0, 1, 2, -1}) {
            for (int32_t scale = -40; scale <= 40; ++scale) {
                CheckAgainstReference<int32_t>(source, roundMode, scale);
                CheckAgainstReference<int16_t>(source, roundMode, scale);
            }
            for (const int32_t scale :
                 {-149, -180, -240, -241, -300, 126, 127, 128, 129, 150, 240, 241, 2000, -2000}) {
                CheckAgainstReference<int32_t>(source, roundMode, scale);
                CheckAgainstReference<int16_t>(source, roundMode, scale);
            }
        }
    });
}

TEST(ConvertFloat, RoundsRandomBitsAtAnyScale) {
    Random random(31);
    AtEveryTarget([&] {
        for (int round = 0; round < 40; ++round) {
            std::vector<float> source(997);
            random.Fill(reinterpret_cast<uint8_t*>(source.data()), source.size() * sizeof(float));
            const auto scale = static_cast<int32_t>(random.Below(300)) - 150;
            CheckAgainstReference<int32_t>(source, round % 2, scale);
            CheckAgainstReference<int16_t>(source, round % 2, scale);
        }
    });
}

TEST(ConvertFloat, IsTheSameUnderEveryFloatingPointMode) {
    const std::vector<float> source = AwkwardFloats();
    for (const uint32_t bits : {kRoundDown, kRoundUp, kRoundToZero, kFlushToZero | kDenormalsAreZero}) {
        AtEveryTarget([&] {
            for (const int32_t scale : {0, -140, 5}) {
                std::vector<int32_t> result(source.size());
                {
                    const FloatEnvironment environment(bits);
                    Convert(source.data(), result.data(), static_cast<int32_t>(source.size()), 1, scale);
                    EXPECT_TRUE(environment.IsAsGiven());
                }
                for (size_t i = 0; i < source.size(); ++i)
                    ASSERT_EQ(result[i], Expected<int32_t>(source[i], 1, scale)) << source[i] << " " << bits;
            }
        });
    }
}

TEST(ConvertFloat, To32BitsWorksInPlace) {
    AtEveryTarget([&] {
        std::vector<float> floats(37);
        for (size_t i = 0; i < floats.size(); ++i) floats[i] = static_cast<float>(i) * 1.5f;
        std::vector<int32_t> expected(floats.size());
        for (size_t i = 0; i < floats.size(); ++i) expected[i] = Expected<int32_t>(floats[i], 1, 0);
        Convert(floats.data(), reinterpret_cast<int32_t*>(floats.data()), 37, 1, 0);
        EXPECT_EQ(std::memcmp(floats.data(), expected.data(), 37 * sizeof(float)), 0);
    });
}

TEST(ConvertFloat, RefusesNullPointersAndNegativeCounts) {
    const float source = 1;
    int32_t integer = 5;
    int16_t word = 5;
    EXPECT_EQ(Convert(nullptr, &integer, 1, 1, 0), -8);
    EXPECT_EQ(Convert(&source, static_cast<int16_t*>(nullptr), 1, 1, 0), -8);
    EXPECT_EQ(Convert(&source, &integer, -1, 1, 0), -6);
    EXPECT_EQ(Convert(&source, &word, -1, 1, 0), -6);
    EXPECT_EQ(Convert(&source, &word, 0, 1, 0), 0);
    EXPECT_EQ(integer, 5);
    EXPECT_EQ(word, 5);
}

} // namespace
} // namespace PK
