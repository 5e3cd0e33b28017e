// Multiplication of 8-bit pixels by constants: every source code, constant and scale.

#include "primitives/MultiplyConstant.h"

#include "support/Targets.h"

#include <algorithm>
#include <cmath>
#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

/// Ties to even, in exact integers.
uint8_t Expected(int64_t source, int64_t value, int32_t scale) {
    const int64_t product = source * value;
    if (product == 0 || scale > 20) return 0;
    if (scale <= 0) return scale < -8 ? 255 : static_cast<uint8_t>(std::min<int64_t>(product << -scale, 255));
    const int64_t whole = int64_t{1} << scale, quotient = product / whole, twiceRest = product % whole * 2;
    const bool roundsUp = twiceRest > whole || (twiceRest == whole && quotient % 2 == 1);
    return static_cast<uint8_t>(std::min<int64_t>(quotient + roundsUp, 255));
}

constexpr int32_t kScales[] = {INT32_MIN, -2000, -9, -8, -7, -4, -2, -1, 0,  1,  2,  3,  4,  5,        6,
                               7,         8,     9,  10, 11, 12, 13, 14, 15, 16, 17, 31, 32, INT32_MAX};

TEST(MultiplyConstant, GivesWhatIsWorkedOutByHand) {
    const uint8_t source[8] = {0, 1, 3, 255, 128, 2, 5, 254}, value[4] = {255, 128, 128, 2};
    const std::vector<uint8_t> scaled = {0, 0, 2, 2, 128, 1, 2, 2}; // 128 / 256 and 1.5 and 2.5 are ties
    const std::vector<uint8_t> unscaled = {0, 128, 255, 255, 255, 255, 255, 255};
    AtEveryTarget([&] {
        std::vector<uint8_t> result(8);
        const auto multiply = [&](int32_t scale) {
            return MultiplyConstant(source, 8, value, result.data(), 8, 2, 1, scale);
        };
        ASSERT_EQ(multiply(8), 0);
        EXPECT_EQ(result, scaled);
        ASSERT_EQ(multiply(0), 0);
        EXPECT_EQ(result, unscaled);
    });
}

TEST(MultiplyConstant, IsExactForEveryCodeConstantAndScale) {
    AtEveryTarget([&] {
        for (const int32_t scale : kScales) {
            for (int32_t constant = 0; constant < 256; ++constant) {
                uint8_t value[4];
                for (int32_t c = 0; c < 4; ++c) value[c] = static_cast<uint8_t>(constant + 61 * c);
                std::vector<uint8_t> pixels(1024), expected(1024);
                for (int32_t i = 0; i < 1024; ++i) {
                    pixels[static_cast<size_t>(i)] = static_cast<uint8_t>(i / 4);
                    expected[static_cast<size_t>(i)] = Expected(i / 4, value[i % 4], scale);
                }
                MultiplyConstant(pixels.data(), 1024, value, pixels.data(), 1024, 256, 1, scale);
                ASSERT_EQ(pixels, expected) << "constant " << constant << ", scale " << scale;
            }
        }
    });
}

TEST(MultiplyConstant, WalksRowsOfEitherStep) {
    const uint8_t source[24] = {1, 2, 3, 4, 0, 0, 0, 0, 5, 6, 7, 8}, value[4] = {2, 2, 2, 2};
    uint8_t result[12] = {};
    EXPECT_EQ(MultiplyConstant(source, 8, value, result + 8, -8, 1, 2, 0), 0);
    const uint8_t expected[12] = {10, 12, 14, 16, 0, 0, 0, 0, 2, 4, 6, 8};
    EXPECT_TRUE(std::equal(result, result + 12, expected));
}

TEST(MultiplyConstant, RefusesNullPointersAndNegativeSizes) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    EXPECT_EQ(MultiplyConstant(nullptr, 4, pixel, pixel, 4, 1, 1, 0), -8);
    EXPECT_EQ(MultiplyConstant(pixel, 4, nullptr, pixel, 4, 1, 1, 0), -8);
    EXPECT_EQ(MultiplyConstant(pixel, 4, pixel, nullptr, 4, 1, 1, 0), -8);
    EXPECT_EQ(MultiplyConstant(pixel, 4, pixel, pixel, 4, -1, 1, 0), -6);
    EXPECT_EQ(MultiplyConstant(pixel, 4, pixel, pixel, 4, 1, -1, 0), -6);
    EXPECT_EQ(pixel[3], 4);
}

} // namespace
} // namespace PK
