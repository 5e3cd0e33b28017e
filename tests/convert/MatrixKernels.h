#pragma once

// Runs every body of a matrix kernel that this processor has over a row and compares it with a rule for one
// unit of four samples: a pixel, or a pair of 4:2:2.

#include "convert/KernelBodies.h"

#include <gtest/gtest.h>

#include <array>
#include <cfenv>
#include <cmath>
#include <cstring>
#include <limits>
#include <random>
#include <string>
#include <vector>

namespace PKTest {

template <class Sample>
using Quad = std::array<Sample, 4>;

/// What a kernel does to one unit.
template <class From, class To>
struct MatrixRule {
    PK::Kernel kernel;
    Quad<To> (*convert)(Quad<From>);
    int32_t pixelsInUnit = 1;
};

/// A code by the current rounding mode, limited by value: NaN gives 0.
inline uint8_t NearestCode(float x) {
    if (!(x > 0)) return 0;
    return static_cast<uint8_t>(std::nearbyint(x < 255 ? x : 255));
}

inline bool IsSame(uint8_t a, uint8_t b) {
    return a == b;
}
/// The same bits, or NaN on both sides.
inline bool IsSame(float a, float b) {
    return std::memcmp(&a, &b, sizeof a) == 0 || (std::isnan(a) && std::isnan(b));
}

template <class Sample>
bool IsSame(const Quad<Sample>& a, const Quad<Sample>& b) {
    return IsSame(a[0], b[0]) && IsSame(a[1], b[1]) && IsSame(a[2], b[2]) && IsSame(a[3], b[3]);
}

template <class Sample>
std::string Show(const Quad<Sample>& unit) {
    return testing::PrintToString(Quad<float>{static_cast<float>(unit[0]), static_cast<float>(unit[1]),
                                              static_cast<float>(unit[2]), static_cast<float>(unit[3])});
}

template <class From, class To>
void ExpectUnits(const std::vector<Quad<From>>& source, const std::vector<Quad<To>>& expected,
                 const Quad<To>* actual) {
    for (size_t i = 0; i < source.size(); ++i) {
        if (IsSame(expected[i], actual[i])) continue;
        FAIL() << "unit " << i << " of " << source.size() << ": source " << Show(source[i]) << ", expected "
               << Show(expected[i]) << ", actual " << Show(actual[i]);
    }
}

/// Converts the row by all bodies. The destination has one unit more, which must stay untouched.
template <class From, class To>
void ExpectRow(const MatrixRule<From, To>& rule, const std::vector<Quad<From>>& source) {
    const Quad<To> canary = {To{77}, To{78}, To{79}, To{80}};
    std::vector<Quad<To>> expected;
    for (const Quad<From>& unit : source) expected.push_back(rule.convert(unit));
    ForEachBody(rule.kernel, [&](PK::Target, PK::RowKernel body) {
        std::vector<Quad<To>> actual(source.size() + 1, canary);
        body(source.data(), actual.data(), static_cast<int32_t>(source.size()) * rule.pixelsInUnit);
        ASSERT_NO_FATAL_FAILURE(ExpectUnits(source, expected, actual.data()));
        ASSERT_EQ(actual.back(), canary);
    });
}

/// All 2^24 combinations of the first three samples.
template <class To>
void ExpectAllCodes(const MatrixRule<uint8_t, To>& rule) {
    std::vector<Quad<uint8_t>> source(65536);
    for (unsigned third = 0; third < 256; ++third) {
        for (unsigned i = 0; i < source.size(); ++i)
            source[i] = {static_cast<uint8_t>(i), static_cast<uint8_t>(i >> 8), static_cast<uint8_t>(third),
                         static_cast<uint8_t>(7 * i + (i >> 8) + third)};
        ASSERT_NO_FATAL_FAILURE(ExpectRow(rule, source));
    }
}

inline uint8_t RandomSample(std::mt19937& random, uint8_t) {
    return static_cast<uint8_t>(random());
}
/// Mostly between -1 and 2, at times a value of the edge.
inline float RandomSample(std::mt19937& random, float) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    constexpr float kEdges[] = {0.0f,   -0.0f, 1.0f,   1e-40f,    0.5f / 255, -1e9f,
                                4.0e9f, 3e38f, -3e38f, kInfinity, -kInfinity, NAN};
    if (random() % 8 == 0) return kEdges[random() % std::size(kEdges)];
    return std::uniform_real_distribution<float>(-1, 2)(random);
}

template <class Sample>
std::vector<Quad<Sample>> RandomUnits(size_t count, uint32_t seed) {
    std::mt19937 random(seed);
    std::vector<Quad<Sample>> units(count);
    for (Quad<Sample>& unit : units)
        for (Sample& sample : unit) sample = RandomSample(random, Sample{});
    return units;
}

/// Rows of every length up to 40 units, so that groups and tails of all bodies meet all positions.
template <class From, class To>
void ExpectAllLengths(const MatrixRule<From, To>& rule) {
    for (uint32_t length = 0; length <= 40; ++length)
        ASSERT_NO_FATAL_FAILURE(ExpectRow(rule, RandomUnits<From>(length, 100 + length)));
}

/// Rounding follows the mode that the caller has set, in the sums as well as in the conversion to codes.
template <class From, class To>
void ExpectAllRoundingModes(const MatrixRule<From, To>& rule) {
    for (const int mode : {FE_UPWARD, FE_DOWNWARD, FE_TOWARDZERO, FE_TONEAREST}) {
        const auto source = RandomUnits<From>(20000, 31);
        std::fesetround(mode);
        ExpectRow(rule, source);
        std::fesetround(FE_TONEAREST);
        ASSERT_FALSE(testing::Test::HasFatalFailure()) << "rounding mode " << mode;
    }
}

template <class Sample>
void ExpectInPlace(const MatrixRule<Sample, Sample>& rule) {
    const auto source = RandomUnits<Sample>(101, 7);
    std::vector<Quad<Sample>> expected;
    for (const Quad<Sample>& unit : source) expected.push_back(rule.convert(unit));
    ForEachBody(rule.kernel, [&](PK::Target, PK::RowKernel body) {
        auto row = source;
        body(row.data(), row.data(), static_cast<int32_t>(row.size()) * rule.pixelsInUnit);
        ASSERT_NO_FATAL_FAILURE(ExpectUnits(source, expected, row.data()));
    });
}

/// One unit through all bodies, against a value worked out by hand.
template <class From, class To>
void ExpectValue(PK::Kernel kernel, Quad<From> source, Quad<To> expected) {
    ForEachBody(kernel, [&](PK::Target, PK::RowKernel body) {
        Quad<To> actual;
        body(&source, &actual, 1);
        EXPECT_TRUE(IsSame(expected, actual))
            << "source " << Show(source) << ", expected " << Show(expected) << ", actual " << Show(actual);
    });
}

} // namespace PKTest
