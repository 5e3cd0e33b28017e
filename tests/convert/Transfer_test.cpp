// The transfer function in all bodies: powers against extended precision, 8-bit codes against their
// thresholds.

#include "convert/KernelTable.h"
#include "convert/TransferTables.h"
#include "frame/Capabilities.h"
#include "frame/FloatMode.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cfenv>
#include <cmath>
#include <limits>
#include <string>
#include <utility>
#include <vector>

namespace {

using namespace PK;

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

/// Pixels with the sample in all four channels.
template <class Sample>
std::vector<Sample> Grey(const std::vector<Sample>& samples) {
    std::vector<Sample> pixels;
    for (const Sample sample : samples) pixels.insert(pixels.end(), 4, sample);
    return pixels;
}

class Transfer : public testing::TestWithParam<Target> {
protected:
    void SetUp() override {
        DetectProcessor();
        for (const Kernel kernel : {Kernel::GammaToLinearRow, Kernel::LinearToGammaRow,
                                    Kernel::Gamma8uToLinearFloat32Row, Kernel::LinearFloat32ToGamma8uRow})
            ASSERT_NE(nullptr, Body(kernel, target));
    }

    Target target = GetParam();

    float ToLinear(float c) {
        return Convert<float>(Kernel::GammaToLinearRow, target, std::vector<float>(4, c))[0];
    }
    float ToGamma(float c) {
        return Convert<float>(Kernel::LinearToGammaRow, target, std::vector<float>(4, c))[0];
    }
    int ToCode(float c) {
        return Convert<uint8_t>(Kernel::LinearFloat32ToGamma8uRow, target, std::vector<float>(4, c))[0];
    }
};

INSTANTIATE_TEST_SUITE_P(Bodies, Transfer, PKTest::EveryTarget(), PKTest::TargetOf);

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
    const std::vector<uint32_t> alphas = {0,          0x80000000, 0x00000001, 0x3f000000, 0xc1234567,
                                          0x7f800000, 0x7fa12345, 0xffc54321}; // signalling NaN among them
    std::vector<uint32_t> pixels(4 * alphas.size(), std::bit_cast<uint32_t>(0.3f));
    for (size_t i = 0; i < alphas.size(); ++i) pixels[4 * i + 3] = alphas[i];
    for (const Kernel kernel : {Kernel::GammaToLinearRow, Kernel::LinearToGammaRow}) {
        const auto result = Convert<uint32_t>(kernel, target, pixels);
        for (size_t i = 0; i < alphas.size(); ++i) EXPECT_EQ(alphas[i], result[4 * i + 3]);
    }
}

/// Samples of every exponent, denormals included, with random fractions and both signs.
std::vector<float> SamplesOfAllExponents(PKTest::Random& random, int perExponent) {
    std::vector<float> samples;
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
double WorstPowerError(Target target, int roundingMode, const std::vector<float>& source) {
    double worst = 0;
    for (const auto& [kernel, power] :
         {std::pair{Kernel::GammaToLinearRow, 2.4L}, std::pair{Kernel::LinearToGammaRow, 0.41666666L}}) {
        std::fesetround(roundingMode);
        const std::vector<float> result = Convert<float>(kernel, target, source);
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
    PKTest::Random random(24);
    const std::vector<float> source = SamplesOfAllExponents(random, 512);
    EXPECT_LT(WorstPowerError(target, FE_TONEAREST, source), 0.501) << "seed " << random.Seed();
}

TEST_P(Transfer, PowersStandEveryRoundingMode) {
    PKTest::Random random(42);
    const std::vector<float> source = SamplesOfAllExponents(random, 64);
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

TEST_P(Transfer, PowersWorkInPlace) {
    PKTest::Random random(7);
    const std::vector<float> source = SamplesOfAllExponents(random, 4);
    for (const Kernel kernel : {Kernel::GammaToLinearRow, Kernel::LinearToGammaRow}) {
        std::vector<float> row = source;
        Body(kernel, target)(row.data(), row.data(), static_cast<int32_t>(row.size() / 4));
        EXPECT_EQ(Convert<float>(kernel, target, source), row);
    }
}

TEST_P(Transfer, EveryCodeHasItsLinearValue) {
    std::vector<uint8_t> codes(256);
    for (int i = 0; i < 256; ++i) codes[static_cast<size_t>(i)] = static_cast<uint8_t>(i);
    const auto linear = Convert<float>(Kernel::Gamma8uToLinearFloat32Row, target, Grey(codes));
    for (size_t i = 0; i < linear.size(); ++i) {
        const auto code = static_cast<float>(i / 4);
        if (IsAlpha(i))
            EXPECT_EQ(code * 0x1.010102p-8f, linear[i]); // times 1 / 255, rounded to float first
        else
            EXPECT_EQ(static_cast<float>(std::pow(code / 255.0, 2.4)), linear[i]);
    }
    EXPECT_EQ(0.0f, linear[0]);
    EXPECT_EQ(1.0f, linear[4 * 255]);
    EXPECT_EQ(1.0f, linear[4 * 255 + 3]);
}

TEST_P(Transfer, EveryCodeComesBack) {
    std::vector<uint8_t> codes(256);
    for (int i = 0; i < 256; ++i) codes[static_cast<size_t>(i)] = static_cast<uint8_t>(255 - i);
    const std::vector<uint8_t> pixels = Grey(codes);
    const auto linear = Convert<float>(Kernel::Gamma8uToLinearFloat32Row, target, pixels);
    EXPECT_EQ(pixels, Convert<uint8_t>(Kernel::LinearFloat32ToGamma8uRow, target, linear));
}

/// The 255 thresholds, ascending, computed apart from the library's tables.
std::vector<float> Thresholds() {
    std::vector<float> thresholds;
    for (int k = 0; k < 255; ++k) thresholds.push_back(static_cast<float>(std::pow((k + 0.5) / 255, 2.4)));
    return thresholds;
}

TEST_P(Transfer, CodesChangeExactlyAtTheThresholds) {
    const std::vector<float> thresholds = Thresholds();
    for (int k = 0; k < 255; ++k) {
        const float threshold = thresholds[static_cast<size_t>(k)];
        const auto codes = Convert<uint8_t>(
            Kernel::LinearFloat32ToGamma8uRow, target,
            Grey<float>({std::nextafter(threshold, 0.0f), threshold, std::nextafter(threshold, 2.0f)}));
        for (size_t i = 0; i < codes.size(); ++i) {
            if (IsAlpha(i)) continue;
            ASSERT_EQ(i < 4 ? k : k + 1, codes[i]) << "threshold " << k;
        }
    }
}

TEST_P(Transfer, CodesCountTheThresholdsNotAboveAnySample) {
    PKTest::Random random(255);
    std::vector<float> source = SamplesOfAllExponents(random, 64);
    for (uint32_t upper = 0; upper < 0x10000; ++upper) // the ends of all look-up cells, of NaN too
        for (const uint32_t lower : {0x0000u, 0xffffu})
            source.push_back(std::bit_cast<float>(upper << 16 | lower));
    for (int i = 0; i < 400000; ++i) // where the thresholds are
        source.push_back(std::bit_cast<float>(0x34000000 + random.Below(0x0c000000)));

    const std::vector<float> thresholds = Thresholds();
    const auto codes = Convert<uint8_t>(Kernel::LinearFloat32ToGamma8uRow, target, source);
    for (size_t i = 0; i < source.size(); ++i) {
        if (IsAlpha(i)) continue;
        const auto count =
            std::isnan(source[i])
                ? 0
                : std::upper_bound(thresholds.begin(), thresholds.end(), source[i]) - thresholds.begin();
        ASSERT_EQ(count, codes[i]) << source[i] << ", seed " << random.Seed();
    }
}

TEST_P(Transfer, CodesOfExtremeSamples) {
    EXPECT_EQ(0, ToCode(0));
    EXPECT_EQ(0, ToCode(-0.0f));
    EXPECT_EQ(0, ToCode(-0.5f));
    EXPECT_EQ(0, ToCode(-kInfinity));
    EXPECT_EQ(0, ToCode(kNaN));
    EXPECT_EQ(0, ToCode(-kNaN));
    EXPECT_EQ(0, ToCode(0x1p-149f));
    EXPECT_EQ(255, ToCode(1));
    EXPECT_EQ(255, ToCode(kLargest));
    EXPECT_EQ(255, ToCode(kInfinity));
}

TEST_P(Transfer, AlphaIsRoundedToTheNearestCodeAndClamped) {
    const std::vector<std::pair<float, int>> cases = {
        {0.0f, 0},       {1.0f, 255},     {0.5f, 128}, // 127.5 goes to the even code
        {0.1f, 26},      {0.498f, 127},   {-0.1f, 0},     {1.1f, 255},      {1e30f, 255},
        {-1e30f, 0},     {kLargest, 255}, {kNaN, 0},      {kInfinity, 255}, {-kInfinity, 0},
        {0.0019607f, 0}, {0.0019609f, 1}, {0.9980f, 254}, {0.99805f, 255},
    };
    for (const auto& [alpha, code] : cases) {
        const auto pixel = Convert<uint8_t>(Kernel::LinearFloat32ToGamma8uRow, target, Grey<float>({alpha}));
        EXPECT_EQ(code, pixel[3]) << alpha;
    }
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
