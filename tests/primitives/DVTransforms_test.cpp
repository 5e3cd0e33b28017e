// Levels to samples, against the sums in double that define it.

#include "primitives/DVTransforms.h"

#include "primitives/Dispatch.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>

namespace PK {
namespace {

constexpr int kSide = 8, kPlaces = 64;
using Levels = std::array<int16_t, kPlaces>;
using Factors = DVFactorTable;
using Reals = std::array<double, kPlaces>;

double C(int k) {
    return k == 0 ? 1 / std::sqrt(8.0) : 0.5;
}
double Wave(int k, int place, int period) {
    return C(k) * std::cos(std::acos(-1.0) * k * (2 * place + 1) / (2 * period));
}

Reals Coefficients(const Levels& levels, const DVSteps& steps) {
    Reals coefficients;
    for (size_t i = 0; i < kPlaces; ++i)
        coefficients[i] =
            std::nearbyint(static_cast<double>(levels[i]) * steps.factors->raster[i] * steps.step);
    coefficients[0] = 4 * levels[0];
    return coefficients;
}

double Sample88(const Reals& coefficients, int x, int y) {
    double sum = 0;
    for (int v = 0; v < kSide; ++v)
        for (int h = 0; h < kSide; ++h)
            sum += coefficients[size_t(8 * v + h)] * Wave(v, y, 8) * Wave(h, x, 8);
    return sum;
}

/// Of the sums of two lines, and plus or minus their differences.
double Sample248(const Reals& coefficients, int x, int y) {
    double sum = 0;
    for (int u = 0; u < 4; ++u)
        for (int h = 0; h < kSide; ++h) {
            const double ofSums = coefficients[size_t(8 * u + h)],
                         ofDifferences = coefficients[size_t(8 * (u + 4) + h)];
            sum += (y % 2 == 0 ? ofSums + ofDifferences : ofSums - ofDifferences) * Wave(u, y / 2, 4) *
                   Wave(h, x, 8);
        }
    return sum;
}

double SampleOfHalf(const Reals& coefficients, int x, int y) {
    double sum = 0;
    for (int v = 0; v < 4; ++v)
        for (int h = 0; h < 4; ++h) sum += coefficients[size_t(8 * v + h)] * Wave(v, y, 4) * Wave(h, x, 4);
    return sum;
}

/// The mean of four samples of half the size, of the lowest coefficients alone.
double SampleOfQuarter(const Reals& coefficients, int x, int y, bool hasTwist) {
    Reals lowest{};
    for (const size_t place : {0u, 1u, 8u}) lowest[place] = coefficients[place];
    if (hasTwist) lowest[9] = coefficients[9];
    double sum = 0;
    for (int i = 0; i < 4; ++i) sum += SampleOfHalf(lowest, 2 * x + i % 2, 2 * y + i / 2);
    return sum / 4;
}
double SampleOfQuarter88(const Reals& coefficients, int x, int y) {
    return SampleOfQuarter(coefficients, x, y, true);
}
double SampleOfQuarter248(const Reals& coefficients, int x, int y) {
    return SampleOfQuarter(coefficients, x, y, false);
}

struct Case {
    const char* name;
    DVTransformKernels::Transform DVTransformKernels::*body;
    double (*sample)(const Reals&, int x, int y);
    int side;
};
constexpr Case kCases[] = {{"8-8", &DVTransformKernels::inverse88, Sample88, 8},
                           {"2-4-8", &DVTransformKernels::inverse248, Sample248, 8},
                           {"half", &DVTransformKernels::half, SampleOfHalf, 4},
                           {"quarter, 8-8", &DVTransformKernels::quarter88, SampleOfQuarter88, 2},
                           {"quarter, 2-4-8", &DVTransformKernels::quarter248, SampleOfQuarter248, 2}};

void Check(const Levels& levels, const DVSteps& steps) {
    const Reals coefficients = Coefficients(levels, steps);
    for (const Case& one : kCases)
        for (const Target target : PKTest::TargetsOfThisProcessor()) {
            Levels samples = levels;
            (KernelsFor<DVTransformKernels>(target).*one.body)(samples.data(), steps, samples.data());
            for (int y = 0; y < one.side; ++y)
                for (int x = 0; x < one.side; ++x)
                    ASSERT_NEAR(one.sample(coefficients, x, y), samples[size_t(one.side * y + x)], 0.501)
                        << one.name << ' ' << TargetName(target) << ", column " << x << ", line " << y;
        }
}

/// Makes the other order of the factors too.
const Factors& Parted(Factors& factors) {
    for (size_t line = 0; line < kSide; ++line)
        for (size_t i = 0; i < kSide; ++i)
            factors.parted[kSide * line + i] = factors.raster[kSide * line + (i < 4 ? 2 * i : 2 * i - 7)];
    return factors;
}

TEST(DVTransforms, EverySingleLevel) {
    Factors factors;
    for (size_t i = 0; i < kPlaces; ++i) factors.raster[i] = static_cast<float>(95 * i) / 256; // exact
    for (size_t place = 0; place < kPlaces; ++place)
        for (const int level : {-255, -3, 1, 17, 255}) {
            Levels levels{};
            levels[place] = static_cast<int16_t>(level);
            Check(levels, {&factors, 1});
            Check(levels, {&factors, 3});
        }
}

TEST(DVTransforms, RandomLevels) {
    PKTest::Random random(20261125);
    for (int turn = 0; turn < 300; ++turn) {
        Factors factors;
        for (float& factor : factors.raster) factor = static_cast<float>(random.Below(4000)) / 256;
        factors.raster[0] = 0;
        Levels levels;
        for (int16_t& level : levels)
            level = static_cast<int16_t>(static_cast<int32_t>(random.Below(31)) - 15);
        levels[0] = static_cast<int16_t>(static_cast<int32_t>(random.Below(512)) - 256);
        Check(levels, {&factors, static_cast<float>(1 + random.Below(4))});
    }
}

/// Four blocks are transformed as each alone, with steps of their own.
TEST(DVTransforms, FourBlocks) {
    PKTest::Random random(20261126);
    for (int turn = 0; turn < 100; ++turn) {
        Factors factors[kDVBlocksAtOnce];
        DVSteps steps[kDVBlocksAtOnce];
        std::array<int16_t, kDVBlocksAtOnce * kPlaces> levels;
        for (int16_t& level : levels)
            level = static_cast<int16_t>(static_cast<int32_t>(random.Below(41)) - 20);
        for (size_t i = 0; i < kDVBlocksAtOnce; ++i) {
            for (float& factor : factors[i].raster) factor = static_cast<float>(random.Below(4000)) / 256;
            factors[i].raster[0] = 0;
            steps[i] = {&Parted(factors[i]), static_cast<float>(1 + random.Below(9))};
        }
        for (const Target target : PKTest::TargetsOfThisProcessor()) {
            const auto& singly = KernelsFor<DVTransformKernels>(target);
            const auto& together = KernelsFor<DVFourBlocksKernels>(target);
            for (const bool is248 : {false, true}) {
                std::array<int16_t, kDVBlocksAtOnce * kPlaces> expected, samples = levels;
                for (size_t i = 0; i < kDVBlocksAtOnce; ++i)
                    (is248 ? singly.inverse248 : singly.inverse88)(levels.data() + kPlaces * i, steps[i],
                                                                   expected.data() + kPlaces * i);
                (is248 ? together.inverse248 : together.inverse88)(samples.data(), steps, samples.data());
                ASSERT_EQ(expected, samples) << TargetName(target) << (is248 ? ", 2-4-8" : ", 8-8");
            }
        }
    }
}

/// DC is half a sample, whatever the step.
TEST(DVTransforms, AFlatBlock) {
    const Factors factors{};
    for (const int dc : {-256, -7, 0, 10, 255}) {
        Levels levels{};
        levels[0] = static_cast<int16_t>(dc);
        for (const float step : {1.0f, 416.0f}) Check(levels, {&factors, step});
    }
}

TEST(DVTransforms, SamplesSaturate) {
    Factors factors;
    std::ranges::fill(factors.raster, 1000.0f);
    factors.raster[0] = 0;
    Levels levels;
    levels.fill(255);
    PKTest::AtEveryTarget([&] {
        Levels samples;
        Best<DVTransformKernels>().inverse88(levels.data(), {&factors, 416}, samples.data());
        EXPECT_EQ(32767, samples[0]);
    });
}

} // namespace
} // namespace PK
