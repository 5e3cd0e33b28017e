// Sums of many equal changes, against adding them one by one.

#include "geometry/RepeatedSum.h"

#include "support/FloatEnvironment.h"
#include "support/Random.h"

#include <bit>
#include <cmath>
#include <gtest/gtest.h>
#include <limits>

using namespace PKTest;

namespace {

float OneByOne(float value, float change, int64_t times) {
    for (int64_t i = 0; i < times; ++i) value += change;
    return value;
}

constexpr uint32_t kModes[] = {
    0, kRoundDown, kRoundUp, kRoundToZero, kFlushToZero, kFlushToZero | kDenormalsAreZero, kDenormalsAreZero};

/// To the bit, but for what a not-a-number is made of.
void ExpectSame(float value, float change, int64_t times) {
    const float expected = OneByOne(value, change, times);
    const float sum = PK::RepeatedSum(value, change, times);
    if (std::isnan(expected))
        EXPECT_TRUE(std::isnan(sum));
    else
        EXPECT_EQ(std::bit_cast<uint32_t>(sum), std::bit_cast<uint32_t>(expected))
            << std::hexfloat << value << " + " << times << " x " << change;
}

} // namespace

TEST(RepeatedSum, IsWhatAddingOneByOneGives) {
    Random random(470);
    const auto draw = [&](uint32_t leastExponent) {
        return std::bit_cast<float>((random.Next() & 0x807fffff) | (leastExponent + random.Below(30)) << 23);
    };
    for (const uint32_t mode : kModes) {
        const FloatEnvironment environment(mode);
        for (int i = 0; i < 20000; ++i) {
            const uint32_t exponent = i % 4 == 0 ? 0 : i % 4 == 1 ? 224 : random.Below(224);
            ExpectSame(draw(exponent), draw(exponent), random.Below(300));
            if (testing::Test::HasFailure()) FAIL() << "mode " << mode << ", seed " << random.Seed();
        }
    }
}

// Half a place is a tie at every step, and 1.5 places another.
TEST(RepeatedSum, FollowsTies) {
    for (const uint32_t mode : kModes) {
        const FloatEnvironment environment(mode);
        for (int32_t place = 0; place < 64; ++place)
            for (int32_t halves = -9; halves <= 9; ++halves)
                for (const float start : {1.0f, 2.0f - 0x30p-23f})
                    for (int64_t times = 0; times < 40; ++times)
                        ExpectSame(start + static_cast<float>(place) * 0x1p-23f,
                                   static_cast<float>(halves) * 0x1p-24f, times);
    }
}

TEST(RepeatedSum, CrossesZeroAndStandsWhereItCanGetNoFurther) {
    EXPECT_EQ(PK::RepeatedSum(-1e6f, 1, 2000000), 1e6f);
    EXPECT_EQ(PK::RepeatedSum(1e6f, -1, 2000000), -1e6f);
    EXPECT_EQ(PK::RepeatedSum(0, 1, int64_t{1} << 40), 0x1p24f);
    EXPECT_EQ(PK::RepeatedSum(0, -1, int64_t{1} << 40), -0x1p24f);
    EXPECT_EQ(PK::RepeatedSum(5, 1e-9f, int64_t{1} << 40), 5);
    ExpectSame(-3, 0x1.fp-20f, 4000000);
    ExpectSame(300, -0x1.23p-12f, 4000000);
}

TEST(RepeatedSum, TakesAnyNumber) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    constexpr float kNumbers[] = {0,
                                  -0.0f,
                                  1,
                                  -1,
                                  1e-45f,
                                  -1e-45f,
                                  3.4e38f,
                                  -3.4e38f,
                                  kInfinity,
                                  -kInfinity,
                                  std::numeric_limits<float>::quiet_NaN()};
    for (const uint32_t mode : kModes) {
        const FloatEnvironment environment(mode);
        for (const float value : kNumbers)
            for (const float change : kNumbers)
                for (int64_t times = 0; times < 9; ++times) ExpectSame(value, change, times);
    }
}
