// Powers, exponentials and truncating divisions.

#include "primitives/VectorMath.h"

#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cfenv>
#include <cmath>
#include <cstring>
#include <limits>
#include <vector>

namespace PK {
namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr float kLeast = std::numeric_limits<float>::denorm_min();
constexpr float kMost = std::numeric_limits<float>::max();
constexpr uint32_t kNaNBits = 0x7fc00000;

uint32_t BitsOf(float x) {
    return std::bit_cast<uint32_t>(x);
}
float FloatOf(uint32_t bits) {
    return std::bit_cast<float>(bits);
}

/// The distance from the exact value in units of the last place that a float of its size has.
double ErrorInUlps(float result, long double exact) {
    if (std::isinf(result)) // the value that a wider exponent would have
        return static_cast<double>((0x1p128L - exact) / 0x1p104L);
    const int exponent = std::max(std::ilogb(exact), -126);
    return static_cast<double>(std::abs(static_cast<long double>(result) - exact) /
                               std::ldexp(1.0L, exponent - 23));
}

/// A group of every target's pow on one pair.
void ExpectPow(float x, float y, uint32_t expectedBits) {
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        float result;
        KernelsFor<VectorMathKernels>(target).pow(&x, &y, &result, 1);
        EXPECT_EQ(BitsOf(result), expectedBits)
            << x << " ^ " << y << " = " << result << ", " << TargetName(target);
    }
}

TEST(VectorPow, ByHand) {
    const float x[] = {2, 4, 9, 0.5f, 10, 1, 2, 2, 0.25f};
    const float y[] = {10, 0.5f, -0.5f, 3, -2, 1e30f, -149, 127, -63.5f};
    const float expected[] = {1024, 2, 1.0f / 3, 0.125f, 0.01f, 1, kLeast, 0x1p127f, 0x1p127f};
    float result[9];
    ASSERT_EQ(VectorPow(x, y, result, 9), 0);
    for (int i = 0; i < 9; ++i) EXPECT_EQ(result[i], expected[i]) << x[i] << " ^ " << y[i];
}

TEST(VectorPow, SpecialValues) {
    const uint32_t one = BitsOf(1), infinity = BitsOf(kInfinity);
    for (const float any : {0.0f, -0.0f, 1.0f, -2.0f, kLeast, kMost, kInfinity, -kInfinity, kNaN, -kNaN}) {
        ExpectPow(1, any, one);
        ExpectPow(any, 0, one);
        ExpectPow(any, -0.0f, one);
    }
    for (const float positive : {kLeast, 0.01f, 0.5f, 1.0f, 3.0f, kMost, kInfinity}) {
        ExpectPow(0, positive, 0);
        ExpectPow(-0.0f, positive, 0);
        ExpectPow(0, -positive, infinity);
        ExpectPow(kInfinity, positive, infinity);
        ExpectPow(kInfinity, -positive, 0);
        ExpectPow(-1, positive, kNaNBits);
        ExpectPow(-kInfinity, positive, kNaNBits);
        ExpectPow(kNaN, positive, kNaNBits);
        ExpectPow(FloatOf(0xffa00001), positive, kNaNBits); // signalling, negative
        ExpectPow(positive == 1 ? 2 : positive, kNaN, kNaNBits);
    }
    for (const float below : {kLeast, 0.5f, FloatOf(BitsOf(1) - 1)}) {
        ExpectPow(below, kInfinity, 0);
        ExpectPow(below, -kInfinity, infinity);
    }
    for (const float above : {FloatOf(BitsOf(1) + 1), 2.0f, kMost}) {
        ExpectPow(above, kInfinity, infinity);
        ExpectPow(above, -kInfinity, 0);
    }
    ExpectPow(kMost, 2, infinity);
    ExpectPow(kMost, -2, 0);
    ExpectPow(kLeast, 1, 1);
    ExpectPow(kLeast, -1, infinity); // 2^149
    ExpectPow(kMost, 1, BitsOf(kMost));
    ExpectPow(2, 128, infinity);
    ExpectPow(2, -150, 0); // half of the least, to even
}

/// A positive float of any magnitude, denormals included.
float AnyPositive(PKTest::Random& random) {
    return FloatOf(1 + random.Below(0x7f7fffff));
}

/// An exponent that takes x somewhere between the least and the largest float.
float ExponentFor(float x, PKTest::Random& random) {
    const double target = -149 + 277 * (random.Next() * 0x1p-32);
    return static_cast<float>(target / std::log2(static_cast<double>(x)));
}

/// Compares all bodies with powl, and one another to the bit, on a batch.
void CheckPowers(const std::vector<float>& x, const std::vector<float>& y, double limit) {
    const auto count = static_cast<int32_t>(x.size());
    std::vector<float> first;
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        std::vector<float> result(x.size());
        KernelsFor<VectorMathKernels>(target).pow(x.data(), y.data(), result.data(), count);
        if (first.empty()) first = result;
        ASSERT_EQ(std::memcmp(first.data(), result.data(), 4 * x.size()), 0) << TargetName(target);
    }
    for (size_t i = 0; i < x.size(); ++i) {
        const long double exact = std::pow(static_cast<long double>(x[i]), static_cast<long double>(y[i]));
        if (exact >= 0x1p128L || exact < 0x1p-151L) continue;
        ASSERT_LE(ErrorInUlps(first[i], exact), limit) << x[i] << " ^ " << y[i] << " = " << first[i];
    }
}

TEST(VectorPow, IsWithinHalfAUnitOfLongDouble) {
    PKTest::Random random(1);
    std::vector<float> x(100000), y(x.size());
    for (size_t i = 0; i < x.size(); ++i) {
        const int32_t nearOne = static_cast<int32_t>(random.Below(2000001)) - 1000000;
        x[i] = i % 3 == 0 ? FloatOf(BitsOf(1) + static_cast<uint32_t>(nearOne)) : AnyPositive(random);
        if (x[i] == 1) x[i] = 2;
        y[i] = ExponentFor(x[i], random);
    }
    CheckPowers(x, y, 0.501);
}

TEST(VectorPow, IsWithinHalfAUnitForTheExponentsOfTransferFunctions) {
    PKTest::Random random(2);
    for (const float exponent : {0.45f, 1 / 2.4f, 2.4f, 2.2f, 0.1593017578125f, 78.84375f, 1 / 78.84375f}) {
        std::vector<float> x(20000);
        for (float& value : x)
            value = FloatOf(BitsOf(0x1p-24f) + random.Below(BitsOf(16) - BitsOf(0x1p-24f)));
        CheckPowers(x, std::vector<float>(x.size(), exponent), 0.501);
    }
}

TEST(VectorPow, WorksInPlace) {
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        float bases[37], exponents[37];
        for (int i = 0; i < 37; ++i) bases[i] = static_cast<float>(i + 1), exponents[i] = 2;
        KernelsFor<VectorMathKernels>(target).pow(bases, exponents, bases, 37);
        for (int i = 0; i < 37; ++i) ASSERT_EQ(bases[i], static_cast<float>((i + 1) * (i + 1)));
    }
}

/// Every body's exponential of one value.
void ExpectExp(float x, uint32_t expectedBits) {
    const int32_t mask = -1;
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        float value = x;
        KernelsFor<VectorMathKernels>(target).exp(&mask, &value, 1);
        EXPECT_EQ(BitsOf(value), expectedBits) << x << ", " << TargetName(target);
    }
}

TEST(VectorExp, SpecialValues) {
    ExpectExp(0, BitsOf(1));
    ExpectExp(-0.0f, BitsOf(1));
    ExpectExp(kLeast, BitsOf(1));
    ExpectExp(1, 0x402df854);  // 2.71828174591064453125
    ExpectExp(-1, 0x3ebc5ab2); // 0.3678794503211975
    ExpectExp(kInfinity, BitsOf(kInfinity));
    ExpectExp(-kInfinity, 0);
    ExpectExp(kNaN, kNaNBits);
    ExpectExp(FloatOf(0xffa00001), kNaNBits);
    ExpectExp(0x1.62e43p+6f, BitsOf(kInfinity)); // the first whose exponential is 2^128 or more
    ExpectExp(-0x1.9fe36ap+6f, 0); // the first whose exponential is half the least float or less
    ExpectExp(kMost, BitsOf(kInfinity));
    ExpectExp(-kMost, 0);
}

TEST(VectorExp, IsWithinHalfAUnitOfLongDouble) {
    // Both signs from 2^-30 to beyond overflow and underflow.
    constexpr uint32_t kStep = 1999, kLast = 0x42d00000; // 104
    std::vector<float> x;
    for (uint32_t bits = BitsOf(0x1p-30f); bits < kLast; bits += kStep)
        for (const uint32_t sign : {0u, 0x80000000u}) x.push_back(FloatOf(bits | sign));
    const std::vector<int32_t> mask(x.size(), -1);
    std::vector<float> first;
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        std::vector<float> result = x;
        KernelsFor<VectorMathKernels>(target).exp(mask.data(), result.data(), static_cast<int32_t>(x.size()));
        if (first.empty()) first = result;
        ASSERT_EQ(std::memcmp(first.data(), result.data(), 4 * x.size()), 0) << TargetName(target);
    }
    for (size_t i = 0; i < x.size(); ++i) {
        const long double exact = std::exp(static_cast<long double>(x[i]));
        ASSERT_LE(ErrorInUlps(first[i], std::min(exact, 0x1p128L)), 0.501) << x[i];
    }
}

TEST(VectorExp, LeavesLanesOffTheMask) {
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        int32_t mask[39];
        uint32_t values[39];
        const auto isOn = [](uint32_t i) { return i % 3 == 0; };
        for (uint32_t i = 0; i < 39; ++i) {
            mask[i] = isOn(i) ? -1 : 0;
            values[i] = isOn(i) ? 0 : 0xffa00000 + i; // signalling NaN
        }
        KernelsFor<VectorMathKernels>(target).exp(mask, reinterpret_cast<float*>(values), 39);
        for (uint32_t i = 0; i < 39; ++i) ASSERT_EQ(values[i], isOn(i) ? BitsOf(1) : 0xffa00000 + i);
    }
}

TEST(VectorMath, DirectedRoundingStaysWithinAUnit) {
    PKTest::Random random(3);
    std::vector<float> x(3000), y(x.size());
    for (size_t i = 0; i < x.size(); ++i) {
        x[i] = AnyPositive(random);
        if (x[i] == 1) x[i] = 2;
        y[i] = ExponentFor(x[i], random);
    }
    for (const int mode : {FE_DOWNWARD, FE_UPWARD, FE_TOWARDZERO}) {
        std::vector<float> powers(x.size());
        float limits[] = {kInfinity, -kInfinity};
        const int32_t mask[] = {-1, -1};
        std::fesetround(mode);
        VectorPow(x.data(), y.data(), powers.data(), static_cast<int32_t>(x.size()));
        VectorExp(mask, limits, 2);
        std::fesetround(FE_TONEAREST);
        EXPECT_EQ(limits[0], kInfinity);
        EXPECT_EQ(limits[1], 0);
        for (size_t i = 0; i < x.size(); ++i) {
            const long double exact =
                std::pow(static_cast<long double>(x[i]), static_cast<long double>(y[i]));
            if (exact >= 0x1p127L || exact <= 0x1p-149L) continue;
            ASSERT_LE(ErrorInUlps(powers[i], exact), 1.001) << x[i] << " ^ " << y[i];
        }
    }
}

int32_t ReferenceQuotient(int32_t dividend, int32_t divisor) {
    if (divisor == 0) return INT32_MIN;
    const int64_t quotient = int64_t{dividend} / divisor;
    return quotient > INT32_MAX ? INT32_MIN : static_cast<int32_t>(quotient);
}

TEST(VectorDivide, ByHand) {
    const int32_t dividends[] = {7, -7, 7, -7, 0, 5, -5, INT32_MIN, INT32_MIN, INT32_MAX, 0};
    const int32_t divisors[] = {2, 2, -2, -2, 3, 0, 0, -1, 1, -1, 0};
    const int32_t expected[] = {3,         -3,        -3,        3,          0,        INT32_MIN,
                                INT32_MIN, INT32_MIN, INT32_MIN, -INT32_MAX, INT32_MIN};
    int32_t quotients[11];
    ASSERT_EQ(VectorDivide(dividends, divisors, quotients, 11), 0);
    for (int i = 0; i < 11; ++i) EXPECT_EQ(quotients[i], expected[i]) << dividends[i] << " / " << divisors[i];
}

TEST(VectorDivide, AllBodiesOnBordersAndRandomNumbers) {
    PKTest::Random random(4);
    std::vector<int32_t> dividends, divisors;
    const auto number = [&] { return static_cast<int32_t>(random.Next()) >> random.Below(32); };
    for (int i = 0; i < 50000; ++i) {
        dividends.push_back(number());
        divisors.push_back(number());
        // The numbers around a multiple, where a quotient steps.
        const int64_t multiple = int64_t{number()} * divisors.back();
        for (const int64_t near : {multiple - 1, multiple, multiple + 1})
            if (near == static_cast<int32_t>(near)) {
                dividends.push_back(static_cast<int32_t>(near));
                divisors.push_back(divisors.back());
            }
    }
    for (const int32_t edge : {INT32_MIN, INT32_MIN + 1, -2, -1, 0, 1, 2, INT32_MAX - 1, INT32_MAX})
        for (const int32_t other : {INT32_MIN, INT32_MIN + 1, -2, -1, 0, 1, 2, INT32_MAX - 1, INT32_MAX}) {
            dividends.push_back(edge);
            divisors.push_back(other);
        }
    for (const Target target : PKTest::TargetsOfThisProcessor())
        for (const int mode : {FE_TONEAREST, FE_DOWNWARD, FE_UPWARD, FE_TOWARDZERO}) {
            std::vector<int32_t> quotients(dividends.size());
            std::fesetround(mode);
            KernelsFor<VectorMathKernels>(target).divide(dividends.data(), divisors.data(), quotients.data(),
                                                         static_cast<int32_t>(quotients.size()));
            std::fesetround(FE_TONEAREST);
            for (size_t i = 0; i < quotients.size(); ++i)
                ASSERT_EQ(quotients[i], ReferenceQuotient(dividends[i], divisors[i]))
                    << dividends[i] << " / " << divisors[i] << ' ' << TargetName(target) << ", seed "
                    << random.Seed();
        }
}

TEST(VectorDivide, WorksInPlace) {
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        int32_t dividends[37], divisors[37];
        for (int32_t i = 0; i < 37; ++i) dividends[i] = -100 * i, divisors[i] = 7;
        KernelsFor<VectorMathKernels>(target).divide(dividends, divisors, divisors, 37);
        for (int32_t i = 0; i < 37; ++i) ASSERT_EQ(divisors[i], -100 * i / 7);
    }
}

TEST(VectorMath, NullPointersAreAnErrorAndNegativeCountsNothing) {
    float x = 2, y = 3;
    int32_t a = 5, b = 6;
    EXPECT_EQ(VectorPow(nullptr, &y, &x, 1), -8);
    EXPECT_EQ(VectorPow(&x, nullptr, &x, 1), -8);
    EXPECT_EQ(VectorPow(&x, &y, nullptr, 1), -8);
    EXPECT_EQ(VectorExp(nullptr, &x, 1), -8);
    EXPECT_EQ(VectorExp(&a, nullptr, 1), -8);
    EXPECT_EQ(VectorDivide(nullptr, &b, &a, 1), -8);
    EXPECT_EQ(VectorDivide(&a, nullptr, &a, 1), -8);
    EXPECT_EQ(VectorDivide(&a, &b, nullptr, 1), -8);
    for (const int32_t count : {0, -1, INT32_MIN}) {
        EXPECT_EQ(VectorPow(&x, &y, &x, count), 0);
        EXPECT_EQ(VectorExp(&a, &x, count), 0);
        EXPECT_EQ(VectorDivide(&a, &b, &a, count), 0);
    }
    EXPECT_EQ(x, 2);
    EXPECT_EQ(a, 5);
}

} // namespace
} // namespace PK
