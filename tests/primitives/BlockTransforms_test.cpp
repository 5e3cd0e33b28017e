// The 8-8 and 2-4-8 transforms, against their defining sums in double.

#include "primitives/BlockTransforms.h"

#include "support/Random.h"
#include "support/RowBuffer.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cfenv>
#include <cmath>
#include <cstring>
#include <string>

namespace PK {
namespace {

constexpr int kSide = 8, kValues = 64;
using Block = std::array<int16_t, kValues>;
using Reals = std::array<double, kValues>;
using Basis = std::array<Reals, kValues>; // of each coefficient, over the samples

double C(int k) {
    return k == 0 ? 1 / std::sqrt(8.0) : 0.5;
}
double Wave(int k, int place, int period) {
    return std::cos(std::acos(-1.0) * k * (2 * place + 1) / (2 * period));
}

Basis Basis88() {
    Basis basis;
    for (int v = 0; v < kSide; ++v)
        for (int h = 0; h < kSide; ++h)
            for (int y = 0; y < kSide; ++y)
                for (int x = 0; x < kSide; ++x)
                    basis[size_t(8 * v + h)][size_t(8 * y + x)] = C(h) * C(v) * Wave(v, y, 8) * Wave(h, x, 8);
    return basis;
}

Basis Basis248() {
    Basis basis;
    for (int u = 0; u < 4; ++u)
        for (int h = 0; h < kSide; ++h)
            for (int z = 0; z < 4; ++z)
                for (int x = 0; x < kSide; ++x) {
                    const double wave = C(h) * C(u) * Wave(u, z, 4) * Wave(h, x, 8);
                    basis[size_t(8 * u + h)][size_t(16 * z + x)] = wave;
                    basis[size_t(8 * u + h)][size_t(16 * z + 8 + x)] = wave;
                    basis[size_t(8 * u + 32 + h)][size_t(16 * z + x)] = wave;
                    basis[size_t(8 * u + 32 + h)][size_t(16 * z + 8 + x)] = -wave;
                }
    return basis;
}

Reals Forward(const Basis& basis, const Reals& samples) {
    Reals coefficients{};
    for (size_t k = 0; k < kValues; ++k)
        for (size_t i = 0; i < kValues; ++i) coefficients[k] += basis[k][i] * samples[i];
    return coefficients;
}

Reals Inverse(const Basis& basis, const Reals& coefficients) {
    Reals samples{};
    for (size_t k = 0; k < kValues; ++k)
        for (size_t i = 0; i < kValues; ++i) samples[i] += basis[k][i] * coefficients[k];
    return samples;
}

Reals ToReals(const Block& block) {
    Reals reals;
    for (size_t i = 0; i < kValues; ++i) reals[i] = block[i];
    return reals;
}

/// One of the four transforms with its definition.
struct Case {
    const char* name;
    BlockTransformKernels::Transform BlockTransformKernels::*body;
    Reals (*reference)(const Basis&, const Reals&);
    bool fields;
};
constexpr Case kCases[] = {{"forward 8-8", &BlockTransformKernels::forward8x8, Forward, false},
                           {"inverse 8-8", &BlockTransformKernels::inverse8x8, Inverse, false},
                           {"forward 2-4-8", &BlockTransformKernels::forward248, Forward, true},
                           {"inverse 2-4-8", &BlockTransformKernels::inverse248, Inverse, true}};

const Basis& BasisOf(const Case& one) {
    static const Basis basis88 = Basis88(), basis248 = Basis248();
    return one.fields ? basis248 : basis88;
}

/// Saturation of the exact value, which rounding then may miss by half a unit and what float loses.
double Farthest(const Reals& exact, const Block& block) {
    double farthest = 0;
    for (size_t i = 0; i < kValues; ++i)
        farthest = std::max(farthest, std::abs(block[i] - std::clamp(exact[i], -32768.0, 32767.0)));
    return farthest;
}

double Norm(const Block& block) {
    double squares = 0;
    for (const double value : block) squares += value * value;
    return std::sqrt(squares);
}

/// All bodies on one block: within half a unit and the stated loss of the definition, and equal.
void Check(const Case& one, const Block& block, const std::string& what) {
    const Reals exact = one.reference(BasisOf(one), ToReals(block));
    const double limit = 0.5 + Norm(block) * 0x1p-22;
    Block first{};
    bool isFirst = true;
    for (const Target target : PKTest::TargetsOfThisProcessor()) {
        Block result;
        (KernelsFor<BlockTransformKernels>(target).*one.body)(block.data(), result.data());
        ASSERT_LE(Farthest(exact, result), limit) << one.name << ' ' << TargetName(target) << ' ' << what;
        if (isFirst) first = result;
        isFirst = false;
        ASSERT_EQ(result, first) << one.name << ' ' << TargetName(target) << ' ' << what;
    }
}

void CheckAll(const Block& block, const std::string& what) {
    for (const Case& one : kCases) Check(one, block, what);
}

Block Uniform(int16_t value) {
    Block block;
    block.fill(value);
    return block;
}

template <class Function>
Block Filled(Function valueAt) {
    Block block;
    for (int i = 0; i < kValues; ++i) block[size_t(i)] = static_cast<int16_t>(valueAt(i % kSide, i / kSide));
    return block;
}

int16_t Between(PKTest::Random& random, int low, int high) {
    return static_cast<int16_t>(low + static_cast<int>(random.Below(static_cast<uint32_t>(high - low + 1))));
}

TEST(BlockTransforms, AFlatBlockIsItsEightfoldAtPlaceZero) {
    for (const int v : {1, -1, 100, -128, 127}) {
        Block expected{};
        expected[0] = static_cast<int16_t>(8 * v);
        Block block;
        ASSERT_EQ(ForwardDCT8x8(Uniform(static_cast<int16_t>(v)).data(), block.data()), 0);
        EXPECT_EQ(block, expected);
        ASSERT_EQ(InverseDCT8x8(block.data()), 0);
        EXPECT_EQ(block, Uniform(static_cast<int16_t>(v)));
        ASSERT_EQ(ForwardDCT248(block.data()), 0);
        EXPECT_EQ(block, expected);
        ASSERT_EQ(InverseDCT248(block.data()), 0);
        EXPECT_EQ(block, Uniform(static_cast<int16_t>(v)));
    }
}

TEST(BlockTransforms, LinesThatAlternateAreTheFirstDifferenceOfTheFields) {
    Block block = Filled([](int, int y) { return y % 2 == 0 ? 50 : -50; });
    ASSERT_EQ(ForwardDCT248(block.data()), 0);
    Block expected{};
    expected[32] = 400;
    EXPECT_EQ(block, expected);
    ASSERT_EQ(InverseDCT248(block.data()), 0);
    EXPECT_EQ(block, Filled([](int, int y) { return y % 2 == 0 ? 50 : -50; }));
}

TEST(BlockTransforms, ValuesWorkedOutByHand) {
    // One sample of 1000 at the corner: 1000 C(h) C(v) cos(pi h / 16) cos(pi v / 16).
    Block corner{};
    corner[0] = 1000;
    Block block;
    ForwardDCT8x8(corner.data(), block.data());
    EXPECT_EQ(block[0], 125);         // 1000 / 8
    EXPECT_EQ(block[1], 173);         // 1000 x 0.353553 x 0.490393 = 173.38
    EXPECT_EQ(block[8 * 4 + 4], 125); // 1000 x 0.353553^2
    EXPECT_EQ(block[8 * 7 + 7], 10);  // 1000 x 0.0975452^2 = 9.515
    EXPECT_EQ(block[8 * 7 + 1], 48);  // 1000 x 0.0975452 x 0.490393 = 47.84
    // The first step of the sums, 1000 at (0, 1): 1000 x C(1) cos(pi (2z + 1) / 8) / sqrt(8) on both lines of z.
    Block step{};
    step[8] = 1000;
    InverseDCT248(step.data());
    EXPECT_EQ(step[0], 163); // 1000 x 0.461940 x 0.353553 = 163.32
    EXPECT_EQ(step[8], 163);
    EXPECT_EQ(step[16], 68); // 1000 x 0.191342 x 0.353553 = 67.65
    EXPECT_EQ(step[63], -163);
}

TEST(BlockTransforms, EverySingleCoefficientAndSample) {
    for (int i = 0; i < kValues; ++i)
        for (const int value : {1, -1, 3, 255, -256, 2040, 32767, -32768}) {
            Block block{};
            block[size_t(i)] = static_cast<int16_t>(value);
            CheckAll(block, std::to_string(value) + " at " + std::to_string(i));
        }
}

TEST(BlockTransforms, ExtremeBlocks) {
    for (const int high : {127, 255, 2047, 32767}) {
        const int low = -high - 1;
        const std::string what = std::to_string(high);
        CheckAll(Uniform(static_cast<int16_t>(high)), "all " + what);
        CheckAll(Uniform(static_cast<int16_t>(low)), "all below -" + what);
        const auto pick = [=](int bit) { return bit % 2 == 0 ? high : low; };
        CheckAll(Filled([=](int x, int y) { return pick(x + y); }), "checkerboard " + what);
        CheckAll(Filled([=](int x, int) { return pick(x); }), "columns " + what);
        CheckAll(Filled([=](int, int y) { return pick(y); }), "lines " + what);
        CheckAll(Filled([=](int x, int y) { return pick(x / 4 + y / 4); }), "quarters " + what);
        // The signs of each basis function: the most that a coefficient can be, and saturation at 16 bits.
        for (const Case& one : kCases)
            for (size_t k = 0; k < kValues; ++k) {
                Block block;
                for (size_t i = 0; i < kValues; ++i)
                    block[i] = static_cast<int16_t>(BasisOf(one)[k][i] < 0 ? low : high);
                CheckAll(block, "signs of " + std::to_string(k) + " at " + what);
            }
    }
}

TEST(BlockTransforms, ResultsSaturate) {
    Block block = Uniform(32767);
    ForwardDCT8x8(block.data(), block.data());
    EXPECT_EQ(block[0], 32767);
    block = Uniform(-32768);
    ForwardDCT248(block.data());
    EXPECT_EQ(block[0], -32768);
    block = Uniform(32767);
    InverseDCT8x8(block.data());
    EXPECT_EQ(block[0], 32767);
    block = Uniform(-32768);
    InverseDCT248(block.data());
    EXPECT_EQ(block[0], -32768);
}

TEST(BlockTransforms, RandomBlocksOfEveryMagnitude) {
    PKTest::Random random(1);
    for (int bits = 1; bits <= 15; ++bits)
        for (int i = 0; i < 200; ++i) {
            const int limit = (1 << bits) - 1;
            const bool isSparse = i % 4 == 0;
            const Block block = Filled([&](int, int) {
                return isSparse && random.Below(8) != 0 ? 0 : Between(random, -limit - 1, limit);
            });
            CheckAll(block, "seed " + std::to_string(random.Seed()) + ", block " + std::to_string(i) +
                                " of " + std::to_string(bits) + " bits");
        }
}

/// The definitions are orthonormal and inverse to each other, and so the integers behind one are found again
/// by the other, but for what rounding loses: half a unit a value.
TEST(BlockTransforms, ForwardAndInverseAreAPair) {
    for (const bool fields : {false, true}) {
        const Basis& basis = BasisOf(kCases[fields ? 2 : 0]);
        for (size_t j = 0; j < kValues; ++j)
            for (size_t k = 0; k < kValues; ++k) {
                double product = 0;
                for (size_t i = 0; i < kValues; ++i) product += basis[j][i] * basis[k][i];
                ASSERT_NEAR(product, j == k ? 1 : 0, 1e-12);
            }
    }
    PKTest::Random random(2);
    for (const bool fields : {false, true})
        for (int i = 0; i < 2000; ++i) {
            const Block samples = Filled([&](int, int) { return Between(random, -2048, 2047); });
            Block block = samples;
            if (fields) {
                ForwardDCT248(block.data());
                InverseDCT248(block.data());
            } else {
                ForwardDCT8x8(block.data(), block.data());
                InverseDCT8x8(block.data());
            }
            double squares = 0;
            for (size_t k = 0; k < kValues; ++k) {
                ASSERT_LE(std::abs(block[k] - samples[k]), 2) << fields << ", seed " << random.Seed();
                squares += std::pow(block[k] - samples[k], 2);
            }
            ASSERT_LE(squares, 64 * 0.5) << fields << ", seed " << random.Seed();
        }
}

TEST(BlockTransforms, FormOfTheCallMakesNoDifference) {
    PKTest::Random random(3);
    const Block samples = Filled([&](int, int) { return Between(random, -255, 255); });
    for (const Target target : PKTest::TargetsOfThisProcessor())
        for (const Case& one : kCases) {
            const auto body = KernelsFor<BlockTransformKernels>(target).*one.body;
            Block expected;
            body(samples.data(), expected.data());
            for (const PKTest::Placement place : {PKTest::Placement{PKTest::Placement::kBeforeGuard},
                                                  PKTest::Placement{PKTest::Placement::kAfterGuard},
                                                  PKTest::Placement{PKTest::Placement::kAtOffset, 2}}) {
                PKTest::RowBuffer row(sizeof(Block), place);
                std::memcpy(row.Data(), samples.data(), sizeof(Block));
                auto* block = reinterpret_cast<int16_t*>(row.Data());
                body(block, block);
                EXPECT_EQ(std::memcmp(block, expected.data(), sizeof(Block)), 0) << one.name;
                EXPECT_TRUE(row.MarginsIntact()) << one.name << ' ' << TargetName(target);
            }
        }
}

TEST(BlockTransforms, EveryRoundingModeStaysWithinAUnit) {
    PKTest::Random random(4);
    for (const int mode : {FE_DOWNWARD, FE_UPWARD, FE_TOWARDZERO})
        for (int i = 0; i < 100; ++i) {
            const Block block = Filled([&](int, int) { return Between(random, -1024, 1023); });
            for (const Case& one : kCases) {
                const Reals exact = one.reference(BasisOf(one), ToReals(block));
                for (const Target target : PKTest::TargetsOfThisProcessor()) {
                    Block result;
                    std::fesetround(mode);
                    (KernelsFor<BlockTransformKernels>(target).*one.body)(block.data(), result.data());
                    std::fesetround(FE_TONEAREST);
                    ASSERT_LE(Farthest(exact, result), 1.02) << one.name << ' ' << TargetName(target);
                }
            }
        }
}

TEST(BlockTransforms, NullPointersAreAnError) {
    Block block = Uniform(1);
    EXPECT_EQ(ForwardDCT8x8(nullptr, block.data()), -8);
    EXPECT_EQ(ForwardDCT8x8(block.data(), nullptr), -8);
    EXPECT_EQ(InverseDCT8x8(nullptr), -8);
    EXPECT_EQ(ForwardDCT248(nullptr), -8);
    EXPECT_EQ(InverseDCT248(nullptr), -8);
    EXPECT_EQ(block, Uniform(1));
}

} // namespace
} // namespace PK
