// Counting the zeros of a block, and the scaled product.

#include "primitives/Coefficients.h"

#include "support/Random.h"
#include "support/RowBuffer.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

namespace PK {
namespace {

using Words = std::vector<int16_t>;

TEST(CountZeros8x8, ByHand) {
    Words block(64, 0);
    uint32_t count = 7;
    EXPECT_EQ(CountZeros8x8(block.data(), &count), 0);
    EXPECT_EQ(count, 64u);
    for (size_t i = 0; i < 64; ++i) {
        block[i] = i % 2 == 0 ? 1 : -32768;
        EXPECT_EQ(CountZeros8x8(block.data(), &count), 0);
        EXPECT_EQ(count, 63 - i);
    }
}

TEST(CountZeros8x8, AllBodiesOnRandomBlocks) {
    PKTest::Random random(1);
    for (int i = 0; i < 500; ++i) {
        const bool isLast = i % 2 == 0;
        PKTest::RowBuffer row(128,
                              {isLast ? PKTest::Placement::kBeforeGuard : PKTest::Placement::kAfterGuard});
        auto* block = reinterpret_cast<int16_t*>(row.Data());
        const uint32_t share = 1 + random.Below(6);
        for (int k = 0; k < 64; ++k)
            block[k] = static_cast<int16_t>(random.Below(share) == 0 ? 0 : 1 << random.Below(16));
        const auto expected = static_cast<uint32_t>(std::count(block, block + 64, 0));
        for (const Target target : PKTest::TargetsOfThisProcessor())
            ASSERT_EQ(KernelsFor<CoefficientKernels>(target).countZeros8x8(block), expected)
                << TargetName(target) << ", seed " << random.Seed() << ", block " << i;
    }
}

TEST(CountZeros8x8, NullPointersAreAnError) {
    const Words block(64, 0);
    uint32_t count = 7;
    EXPECT_EQ(CountZeros8x8(nullptr, &count), -8);
    EXPECT_EQ(count, 7u);
    EXPECT_EQ(CountZeros8x8(block.data(), nullptr), -8);
}

/// The rule in exact arithmetic: a long double holds the quotient, and nearbyint takes ties to even.
int16_t Reference(int16_t value, int16_t factor, int32_t scale) {
    const long double product = static_cast<long double>(value) * factor;
    const int bounded = std::clamp(scale, -100, 100);
    return static_cast<int16_t>(
        std::clamp(std::nearbyint(std::ldexp(product, -bounded)), -32768.0L, 32767.0L));
}

int16_t Scaled(int16_t value, int16_t factor, int32_t scale) {
    EXPECT_EQ(MultiplyScaled16s(&factor, &value, 1, scale), 0);
    return value;
}

TEST(MultiplyScaled16s, ByHand) {
    EXPECT_EQ(Scaled(128, 512, 14), 4);
    EXPECT_EQ(Scaled(-128, 522, 14), -4); // -4.08
    EXPECT_EQ(Scaled(1000, 16384, 16), 250);
    EXPECT_EQ(Scaled(3, 1, 1), 2);         // 1.5, to even
    EXPECT_EQ(Scaled(1, 1, 1), 0);         // 0.5
    EXPECT_EQ(Scaled(5, 1, 1), 2);         // 2.5
    EXPECT_EQ(Scaled(-1, 1, 1), 0);        // -0.5
    EXPECT_EQ(Scaled(-3, 1, 1), -2);       // -1.5
    EXPECT_EQ(Scaled(-5, 1, 1), -2);       // -2.5
    EXPECT_EQ(Scaled(-7, 1, 1), -4);       // -3.5
    EXPECT_EQ(Scaled(200, 200, 0), 32767); // 40000
    EXPECT_EQ(Scaled(200, -200, 0), -32768);
    EXPECT_EQ(Scaled(3, 5, -2), 60);
    EXPECT_EQ(Scaled(1, 1, -15), 32767);
    EXPECT_EQ(Scaled(-1, 1, -15), -32768);
    EXPECT_EQ(Scaled(0, 1, -100), 0);
    EXPECT_EQ(Scaled(-32768, -32768, 30), 1);
    EXPECT_EQ(Scaled(-32768, -32768, 31), 0); // 0.5
    EXPECT_EQ(Scaled(-32768, 32767, 15), -32767);
    EXPECT_EQ(Scaled(-32768, -32768, 15), 32767); // 32768
}

TEST(MultiplyScaled16s, AllBodiesByTheRule) {
    constexpr int16_t kEdges[] = {-32768, -32767, -129, -128, -2, -1, 0, 1, 2, 127, 255, 16384, 31520, 32767};
    PKTest::Random random(2);
    const auto word = [&] {
        return random.Below(4) == 0 ? kEdges[random.Below(std::size(kEdges))]
                                    : static_cast<int16_t>(random.Next());
    };
    for (int32_t scale = -34; scale <= 34; ++scale)
        for (const size_t count : {0u, 1u, 7u, 8u, 15u, 16u, 17u, 31u, 33u, 64u, 100u}) {
            Words factors(count), data(count), expected(count);
            for (size_t i = 0; i < count; ++i) {
                factors[i] = word();
                data[i] = word();
                expected[i] = Reference(data[i], factors[i], scale);
            }
            for (const Target target : PKTest::TargetsOfThisProcessor()) {
                Words result = data;
                KernelsFor<CoefficientKernels>(target).multiplyScaled16s(factors.data(), result.data(),
                                                                         static_cast<int32_t>(count), scale);
                ASSERT_EQ(result, expected)
                    << TargetName(target) << ", scale " << scale << ", seed " << random.Seed();
            }
        }
}

TEST(MultiplyScaled16s, EveryProductOfTwoFactorsOfTheDequantisation) {
    Words values(65536), results(65536);
    for (size_t i = 0; i < values.size(); ++i) values[i] = static_cast<int16_t>(i);
    for (const int16_t factor : {int16_t{512}, int16_t{31520}, int16_t{-32768}})
        for (const int32_t scale : {14, 16}) {
            const Words factors(values.size(), factor);
            results = values;
            ASSERT_EQ(MultiplyScaled16s(factors.data(), results.data(), 65536, scale), 0);
            for (size_t i = 0; i < values.size(); ++i)
                ASSERT_EQ(results[i], Reference(values[i], factor, scale)) << values[i] << " x " << factor;
        }
}

TEST(MultiplyScaled16s, ExtremeScalesAndCounts) {
    EXPECT_EQ(Scaled(-32768, -32768, INT32_MAX), 0);
    EXPECT_EQ(Scaled(1, -1, INT32_MIN), -32768);
    int16_t value = 3;
    const int16_t factor = 5;
    EXPECT_EQ(MultiplyScaled16s(&factor, &value, -1, 0), 0);
    EXPECT_EQ(MultiplyScaled16s(&factor, &value, INT32_MIN, 0), 0);
    EXPECT_EQ(value, 3);
}

TEST(MultiplyScaled16s, SquaresAnArrayInPlace) {
    Words data = {-3, 0, 7, 181, 182, -182, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15};
    EXPECT_EQ(MultiplyScaled16s(data.data(), data.data(), 17, 0), 0);
    EXPECT_EQ(data, (Words{9, 0, 49, 32761, 32767, 32767, 25, 36, 49, 64, 81, 100, 121, 144, 169, 196, 225}));
}

TEST(MultiplyScaled16s, NullPointersAreAnError) {
    int16_t value = 3;
    EXPECT_EQ(MultiplyScaled16s(nullptr, &value, 1, 0), -8);
    EXPECT_EQ(MultiplyScaled16s(&value, nullptr, 1, 0), -8);
    EXPECT_EQ(value, 3);
}

} // namespace
} // namespace PK
