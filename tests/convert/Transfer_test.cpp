// The transfer function in all bodies: powers against extended precision, 8-bit codes against their thresholds.

#include "convert/TransferTables.h"
#include "frame/FloatMode.h"
#include "support/KernelRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <algorithm>
#include <bit>
#include <cfenv>
#include <cmath>
#include <limits>
#include <utility>

namespace {

using namespace PK;
using namespace PKTest;

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr float kLargest = std::numeric_limits<float>::max();

bool IsAlpha(size_t sample) {
    return sample % 4 == 3;
}

/// The result of a kernel's body for a row of whole pixels.
template <class To, class From>
std::vector<To> Convert(Kernel kernel, Target target, const std::vector<From>& source) {
    std::vector<To> destination(source.size());
    Body(kernel, target)(source.data(), destination.data(), static_cast<int32_t>(source.size() / 4));
    return destination;
}

class Transfer : public testing::TestWithParam<Target> {
protected:
    Target target = GetParam();

    float ToLinear(float c) { return Convert<float>(Kernel::GammaToLinearRow, target, Floats(4, c))[0]; }
    float ToGamma(float c) { return Convert<float>(Kernel::LinearToGammaRow, target, Floats(4, c))[0]; }
};

INSTANTIATE_TEST_SUITE_P(Bodies, Transfer, EveryTarget(), TargetOf);

TEST_P(Transfer, KnownPowers) {
    EXPECT_EQ(1.0f, ToLinear(1));
    EXPECT_EQ(-1.0f, ToLinear(-1));
    EXPECT_EQ(1.0f, ToGamma(1));
    EXPECT_EQ(0.18946457f, ToLinear(0.5f));
    EXPECT_EQ(-0.18946457f, ToLinear(-0.5f));
    EXPECT_EQ(5.278032f, ToLinear(2)); // not clamped
    EXPECT_EQ(4096.0f, ToLinear(32));  // 2^12
    EXPECT_EQ(0.74915355f, ToGamma(0.5f));
    EXPECT_EQ(-0.74915355f, ToGamma(-0.5f));
    EXPECT_EQ(0.4894371f, ToGamma(0.18f));
}

TEST_P(Transfer, ZeroKeepsItsSign) {
    for (const float zero : {0.0f, -0.0f}) {
        EXPECT_EQ(std::bit_cast<uint32_t>(zero), std::bit_cast<uint32_t>(ToLinear(zero)));
        EXPECT_EQ(std::bit_cast<uint32_t>(zero), std::bit_cast<uint32_t>(ToGamma(zero)));
    }
}

TEST_P(Transfer, InfinityAndNotANumberStay) {
    for (const float sign : {1.0f, -1.0f}) {
        EXPECT_EQ(sign * kInfinity, ToLinear(sign * kInfinity));
        EXPECT_EQ(sign * kInfinity, ToGamma(sign * kInfinity));
        EXPECT_TRUE(std::isnan(ToLinear(sign * kNaN)));
        EXPECT_TRUE(std::isnan(ToGamma(sign * kNaN)));
    }
}

TEST_P(Transfer, OverflowAndUnderflowKeepTheSign) {
    EXPECT_EQ(kInfinity, ToLinear(kLargest));
    EXPECT_EQ(-kInfinity, ToLinear(-kLargest));
    EXPECT_EQ(0.0f, ToLinear(1e-30f));
    EXPECT_EQ(0x80000000, std::bit_cast<uint32_t>(ToLinear(-1e-30f)));
}

TEST_P(Transfer, AlphaIsCopiedBitForBit) {
    const DoubleWords alphas = {0,          0x80000000, 0x00000001, 0x3f000000,
                                0xc1234567, 0x7f800000, 0x7fa12345, 0xffc54321}; // signalling NaN among them
    DoubleWords pixels(4 * alphas.size(), std::bit_cast<uint32_t>(0.3f));
    for (size_t i = 0; i < alphas.size(); ++i) pixels[4 * i + 3] = alphas[i];
    for (const Kernel kernel : {Kernel::GammaToLinearRow, Kernel::LinearToGammaRow}) {
        const auto result = Convert<uint32_t>(kernel, target, pixels);
        for (size_t i = 0; i < alphas.size(); ++i) EXPECT_EQ(alphas[i], result[4 * i + 3]);
    }
}

/// Samples of every exponent, denormals included, with random fractions and both signs.
Floats SamplesOfAllExponents(Random& random, int perExponent) {
    Floats samples;
    for (uint32_t exponent = 0; exponent < 255; ++exponent)
        for (int i = 0; i < perExponent; ++i)
            samples.push_back(std::bit_cast<float>(exponent << 23 | (random.Next() & 0x807fffff)));
    return samples;
}

/// The distance from the exact value in units in the last place that a float of its size has.
double ErrorInUlps(float actual, long double exact) {
    int exponent;
    std::frexp(exact, &exponent);
    const long double ulp = std::ldexp(1.0L, std::max(exponent, -125) - 24);
    return static_cast<double>(std::fabs(actual - exact) / ulp);
}

/// The worst error of both power kernels over samples of all exponents, computed under a rounding mode.
double WorstPowerError(Target target, int roundingMode, const Floats& source) {
    double worst = 0;
    for (const auto& [kernel, power] :
         {std::pair{Kernel::GammaToLinearRow, 2.4L}, std::pair{Kernel::LinearToGammaRow, 0.41666666L}}) {
        std::fesetround(roundingMode);
        const Floats result = Convert<float>(kernel, target, source);
        std::fesetround(FE_TONEAREST);
        for (size_t i = 0; i < source.size(); ++i) {
            if (IsAlpha(i)) continue;
            const long double c = source[i];
            const long double exact = std::copysign(std::pow(std::fabs(c), power), c);
            if (std::fabs(exact) > kLargest) // which way an overflow goes is up to the mode
                EXPECT_GE(std::fabs(result[i]), kLargest) << source[i];
            else
                worst = std::max(worst, ErrorInUlps(result[i], exact));
        }
    }
    return worst;
}

TEST_P(Transfer, PowersAreAsExactAsAFloatCanBe) {
    Random random(24);
    const Floats source = SamplesOfAllExponents(random, 512);
    EXPECT_LT(WorstPowerError(target, FE_TONEAREST, source), 0.501) << "seed " << random.Seed();
}

TEST_P(Transfer, PowersStandEveryRoundingMode) {
    Random random(42);
    const Floats source = SamplesOfAllExponents(random, 64);
    for (const int mode : {FE_UPWARD, FE_DOWNWARD, FE_TOWARDZERO})
        EXPECT_LT(WorstPowerError(target, mode, source), 1.001)
            << "mode " << mode << ", seed " << random.Seed();
}

TEST_P(Transfer, DenormalSamplesCountWhereDenormalResultsAreFlushed) {
    const FloatMode flush;
    EXPECT_EQ(0x1.e34394p-63f, ToGamma(0x1p-149f));
    EXPECT_EQ(-0x1.e34394p-63f, ToGamma(-0x1p-149f));
    EXPECT_EQ(0.0f, ToLinear(0x1p-55f)); // 2^-132
}

TEST(Transfer, PowersByHand) {
    const Floats gamma = {0.5f, -0.5f, 1, 0.7f, 0, 2, -1, 3};
    const Floats linear = {0.18946457f, -0.18946457f, 1, 0.7f, 0, 5.2780316f, -1, 3};
    ExpectRow(Kernel::GammaToLinearRow, 2, gamma, linear, Rule::kBoth, 1e-6f);
    ExpectRow(Kernel::LinearToGammaRow, 2, linear, gamma, Rule::kBoth, 1e-6f);
}

TEST(Transfer, PowersWorkInPlace) {
    for (const Kernel kernel : {Kernel::GammaToLinearRow, Kernel::LinearToGammaRow})
        ExpectReferenceInPlace(kernel);
}

TEST(Transfer, EveryCodeHasItsLinearValueAndComesBack) {
    ExpectRow(Kernel::Gamma8uToLinearFloat32Row, 1, Bytes{0, 255, 51, 255},
              Floats{0, 1, 0.021012222f, 1}, // 0.2^2.4
              Rule::kBoth, 1e-9f);
    const Bytes codes = AllCodesAtEveryPlace<uint8_t>();
    ExpectReference(Kernel::Gamma8uToLinearFloat32Row, codes);
    ForEachBody(Kernel::Gamma8uToLinearFloat32Row, [&](Target target, RowKernel) {
        const Floats linear = Convert<float>(Kernel::Gamma8uToLinearFloat32Row, target, codes);
        EXPECT_EQ(codes, Convert<uint8_t>(Kernel::LinearFloat32ToGamma8uRow, target, linear));
    });
}

TEST(Transfer, CodesCountTheThresholdsNotAboveAnySample) {
    Random random(255);
    Floats source = SamplesOfAllExponents(random, 64);
    for (uint32_t upper = 0; upper < 0x10000; ++upper) // the ends of all look-up cells, of NaN too
        for (const uint32_t lower : {0x0000u, 0xffffu})
            source.push_back(std::bit_cast<float>(upper << 16 | lower));
    for (int i = 0; i < 400000; ++i) // where the thresholds are
        source.push_back(std::bit_cast<float>(0x34000000 + random.Below(0x0c000000)));
    for (const float threshold : kTransferTables.thresholds)
        for (const float value :
             {std::nextafter(threshold, 0.0f), threshold, std::nextafter(threshold, 2.0f)})
            source.insert(source.end(), 4, value);
    ExpectReference(Kernel::LinearFloat32ToGamma8uRow, source);
}

TEST(Transfer, CodesOfExtremeSamples) {
    ExpectRow(Kernel::LinearFloat32ToGamma8uRow, 4,
              Floats{0, -0.0f, -0.5f, 0, -kInfinity, kNaN, -kNaN, 0, 0x1p-149f, 1, kLargest, 0, kInfinity,
                     0.5f, 2, 0},
              Bytes{0, 0, 0, 0, 0, 0, 0, 0, 0, 255, 255, 0, 255, 191, 255, 0});
}

TEST(Transfer, AlphaIsRoundedToTheNearestCodeAndClamped) {
    const std::vector<std::pair<float, uint8_t>> cases = {
        {0.0f, 0},       {1.0f, 255},     {0.5f, 128}, // 127.5 goes to the even code
        {0.1f, 26},      {0.498f, 127},   {-0.1f, 0},     {1.1f, 255},      {1e30f, 255},
        {-1e30f, 0},     {kLargest, 255}, {kNaN, 0},      {kInfinity, 255}, {-kInfinity, 0},
        {0.0019607f, 0}, {0.0019609f, 1}, {0.9980f, 254}, {0.99805f, 255},
    };
    for (const auto& [alpha, code] : cases)
        ExpectRow(Kernel::LinearFloat32ToGamma8uRow, 1, Floats{0, 0, 0, alpha}, Bytes{0, 0, 0, code});
}

TEST(TransferTables, AreThePowersToTheLastBit) {
    for (int code = 0; code < 256; ++code)
        EXPECT_EQ(kTransferTables.linear[code], static_cast<float>(std::pow(code / 255.0, 2.4))) << code;
    for (int k = 0; k < 255; ++k)
        EXPECT_EQ(kTransferTables.thresholds[k], static_cast<float>(std::pow((k + 0.5) / 255, 2.4))) << k;
}

TEST(TransferTables, ThresholdsAscendWithAtMostOneInACell) {
    for (size_t k = 0; k < 255; ++k) {
        const auto cell = std::bit_cast<uint32_t>(kTransferTables.thresholds[k]) >> 16;
        EXPECT_GE(cell, static_cast<uint32_t>(kFirstGammaCell));
        EXPECT_LT(cell, static_cast<uint32_t>(kFirstGammaCell + kGammaCells));
        const float before = k > 0 ? kTransferTables.thresholds[k - 1] : 0.0f;
        EXPECT_GT(cell, std::bit_cast<uint32_t>(before) >> 16);
    }
}

TEST(TransferTables, CellsHoldTheCountBelowAndTheDistanceToTheirThreshold) {
    EXPECT_EQ(0u, kTransferTables.gammaCells[0]);
    EXPECT_EQ(255u << 16, kTransferTables.gammaCells[kGammaCells - 1]);
    for (uint32_t k = 0; k < 255; ++k) {
        const auto threshold = std::bit_cast<uint32_t>(kTransferTables.thresholds[k]);
        const uint32_t cell = kTransferTables.gammaCells[(threshold >> 16) - kFirstGammaCell];
        EXPECT_EQ((k + 1) << 16, cell + (threshold & 0xffff));
    }
}

} // namespace
