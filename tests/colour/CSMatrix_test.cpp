// CSMatrix: single precision, three-term sums from left to right, to the bit.

#include <PixelKiln/ColorSpace.h>

#include "support/ColourPixels.h"

#include <algorithm>

namespace {

using namespace PKTest;
using PK::CSMatrix;

CSMatrix Matrix(const std::array<float, 9>& values) {
    CSMatrix matrix;
    std::ranges::copy(values, matrix.m);
    return matrix;
}

CSMatrix Diagonal(float a, float b, float c) {
    return Matrix({a, 0, 0, 0, b, 0, 0, 0, c});
}

void ExpectSame(const CSMatrix& actual, const std::array<float, 9>& expected) {
    for (size_t i = 0; i < 9; ++i) EXPECT_EQ(actual.m[i], expected[i]) << "entry " << i;
}

const CSMatrix kCounting = Matrix({1, 2, 3, 4, 5, 6, 7, 8, 9});

TEST(CSMatrix, IsNineFloatsAndBeginsAsTheIdentity) {
    static_assert(sizeof(CSMatrix) == 36);
    ExpectSame(CSMatrix(), {1, 0, 0, 0, 1, 0, 0, 0, 1});
}

TEST(CSMatrix, MultipliesRowsByColumns) {
    const CSMatrix other = Matrix({1, 0, 2, 0, 1, 1, 3, 1, 0});
    ExpectSame(kCounting * other, {10, 5, 4, 22, 11, 13, 34, 17, 22});
    ExpectSame(kCounting * CSMatrix(), {1, 2, 3, 4, 5, 6, 7, 8, 9});
    ExpectSame(CSMatrix() * kCounting, {1, 2, 3, 4, 5, 6, 7, 8, 9});
}

TEST(CSMatrix, SumsFromLeftToRightWithoutFusing) {
    // From the left 2^24 + 1 is 2^24 again; from the right 1 - 2^24 + 2^24 would be 1.
    const CSMatrix row = Matrix({0x1p24f, 1, -0x1p24f, 0, 0, 0, 0, 0, 0});
    const CSMatrix ones = Matrix({1, 1, 1, 1, 1, 1, 1, 1, 1});
    EXPECT_EQ((row * ones).m[0], 0.0f);
    // The square of 1 + 2^-12 loses its 2^-24 in single precision; a fused sum would keep it.
    const float x = 1 + 0x1p-12f;
    const CSMatrix squares = Matrix({-1, x, 0, 0, 0, 0, 0, 0, 0}) * Matrix({1, 0, 0, x, 0, 0, 0, 0, 0});
    EXPECT_EQ(squares.m[0], 0x1p-11f);
    // Sums begin at +0.
    EXPECT_EQ(Pattern((Diagonal(-0.0f, 1, 1) * Diagonal(1, 1, 1)).m[0]), 0u);
}

TEST(CSMatrix, ProductsAgreeToTheBitWithSumsWrittenOut) {
    Random random(1);
    for (int i = 0; i < 1000; ++i) {
        CSMatrix a, b;
        for (float& x : a.m) x = Uniform(random, -3, 3);
        for (float& x : b.m) x = Uniform(random, -3, 3);
        const CSMatrix product = a * b;
        for (size_t row = 0; row < 3; ++row)
            for (size_t column = 0; column < 3; ++column) {
                volatile float sum = a.m[3 * row] * b.m[column];
                volatile float term = a.m[3 * row + 1] * b.m[3 + column];
                sum = sum + term;
                term = a.m[3 * row + 2] * b.m[6 + column];
                sum = sum + term;
                ASSERT_EQ(Pattern(product.m[3 * row + column]), Pattern(sum)) << "seed " << random.Seed();
            }
    }
}

TEST(CSMatrix, Transposes) {
    ExpectSame(kCounting.Transposed(), {1, 4, 7, 2, 5, 8, 3, 6, 9});
}

TEST(CSMatrix, Inverts) {
    // Worked out by hand: determinant 1 x (5 x 10 - 8 x 6) - 2 x (40 - 42) + 3 x (32 - 35) = -3.
    const float third = 1.0f / -3;
    bool ok = false;
    const CSMatrix inverse = Matrix({1, 2, 3, 4, 5, 6, 7, 8, 10}).Inverted(&ok);
    EXPECT_TRUE(ok);
    ExpectSame(inverse, {2 * third, 4 * third, -3 * third, 2 * third, -11 * third, 6 * third, -3 * third,
                         6 * third, -3 * third});
    ExpectSame(Diagonal(2, 4, -0.5f).Inverted(&ok), {0.5f, 0, 0, 0, 0.25f, 0, 0, 0, -2});
    EXPECT_TRUE(ok);
    ExpectSame(Diagonal(2, 4, 8).Inverted(), {0.5f, 0, 0, 0, 0.25f, 0, 0, 0, 0.125f});
    ExpectSame(Diagonal(2, 4, 8).Inverted(nullptr), {0.5f, 0, 0, 0, 0.25f, 0, 0, 0, 0.125f});
}

TEST(CSMatrix, InversesAgreeToTheBitWithTheCofactorsWrittenOut) {
    Random random(2);
    for (int i = 0; i < 1000; ++i) {
        CSMatrix a;
        for (float& x : a.m) x = Uniform(random, -2, 2);
        const auto minor = [&a](size_t p, size_t q, size_t r, size_t s) { // p q - r s, each rounded
            const volatile float first = a.m[p] * a.m[q], second = a.m[r] * a.m[s];
            return static_cast<float>(first - second);
        };
        const std::array<float, 9> adjugate = {minor(4, 8, 7, 5), minor(7, 2, 8, 1), minor(5, 1, 4, 2), //
                                               minor(5, 6, 8, 3), minor(8, 0, 6, 2), minor(2, 3, 5, 0), //
                                               minor(7, 3, 4, 6), minor(6, 1, 7, 0), minor(0, 4, 1, 3)};
        const volatile float first = a.m[0] * adjugate[0], second = a.m[1] * adjugate[3],
                             third = a.m[2] * adjugate[6];
        const volatile float two = first + second;
        const float determinant = two + third;
        if (std::abs(determinant) < 1e-3f) continue;
        const float r = 1 / determinant;
        const CSMatrix inverse = a.Inverted();
        for (size_t k = 0; k < 9; ++k) {
            const volatile float expected = adjugate[k] * r;
            ASSERT_EQ(Pattern(inverse.m[k]), Pattern(expected))
                << "entry " << k << ", seed " << random.Seed();
        }
    }
}

TEST(CSMatrix, WhatHasNoInverseGivesTheIdentity) {
    const CSMatrix singular[] = {Diagonal(1e-7f, 1, 1), Diagonal(-1e-7f, 1, 1), kCounting, Diagonal(0, 0, 0),
                                 Diagonal(std::nextafter(1e-6f, 0.0f), 1, 1)};
    for (const CSMatrix& matrix : singular) {
        bool ok = true;
        ExpectSame(matrix.Inverted(&ok), {1, 0, 0, 0, 1, 0, 0, 0, 1});
        EXPECT_FALSE(ok);
        ExpectSame(matrix.Inverted(nullptr), {1, 0, 0, 0, 1, 0, 0, 0, 1});
    }
}

TEST(CSMatrix, ADeterminantOfExactlyTheThresholdHasAnInverse) {
    for (const float determinant : {1e-6f, -1e-6f, std::nextafter(1e-6f, 1.0f)}) {
        bool ok = false;
        ExpectSame(Diagonal(determinant, 1, 1).Inverted(&ok), {1 / determinant, 0, 0, 0, 1, 0, 0, 0, 1});
        EXPECT_TRUE(ok) << determinant;
    }
}

TEST(CSMatrix, WhatIsNotANumberHasAnInverseOfTheSameKind) {
    bool ok = false;
    const CSMatrix inverse = Diagonal(kNaN, 1, 1).Inverted(&ok);
    EXPECT_TRUE(ok);
    EXPECT_TRUE(std::isnan(inverse.m[0]));
}

} // namespace
