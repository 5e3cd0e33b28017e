// The approximate powers and logarithms of the vector bodies against double precision, over all magnitudes. They are
// measured on the restatement, which FloatKernelSweep holds to the bodies to the bit; here some values go through the
// bodies themselves.

#include "colour/ColourKernels.h"
#include "colour/FloatBodies.h"
#include "colour/WorstError.h"
#include "support/ColourPixels.h"
#include "support/Walk.h"

#include <bit>
#include <cmath>
#include <limits>

namespace PKTest {
namespace {

using namespace PK;
using reference::Rounding;

constexpr Rounding kRoundings[] = {Rounding::kEach, Rounding::kFused};
constexpr double kLeastPower = 0x1p-126, kMostPower = 0x1.6a09cp+127; // 2^127.49999, the largest there is

const char* RoundingName(Rounding rounding) {
    return rounding == Rounding::kFused ? "fused" : "unfused";
}

/// Runs a function on positive normal floats of every exponent, 16384 a binade and not the same in each, and on the
/// last of each binade, where the error is largest.
template <class Function>
void ForAllMagnitudes(Function function) {
    constexpr uint32_t kFirst = 0x00800000, kPastLast = 0x7f800000, kStep = 509;
    Walk walk;
    for (uint32_t bits = kFirst; bits < kPastLast; bits += kStep)
        if (!walk.LeavesOut()) function(std::bit_cast<float>(bits));
    for (uint32_t bits = kFirst; bits < kPastLast; bits += 0x00800000)
        function(std::bit_cast<float>(bits + 0x007fffff));
}

/// A value through the first power of a body; the second, with the exponent 1, is taken along.
float PowerOfBody(Target target, float x, float exponent) {
    const float unused[9] = {};
    const GammaConversion conversion = {unused, exponent, 1, {0, 0, 0}, false, false};
    const ColourPixels source(8, {x, x, x, x});
    ColourPixels result(8);
    KernelsFor<GammaKernels>(target).convert(Floats(source), Floats(result), 8, conversion);
    return result[0][0];
}

TEST(ApproxPower, RelativeErrorOverAllMagnitudes) {
    // The error of the logarithm grows with the exponent: 2.6 is the largest that the spaces of the library use.
    for (const float exponent :
         {2.6f, 2.4f, 1.0f, 0.45f, 0.41666666f, 0.38461539f, 0.2f, 1.0f / 6, 0.15930176f})
        for (const Rounding rounding : kRoundings) {
            WorstError worst("power " + std::to_string(exponent) + ", " + RoundingName(rounding));
            ForAllMagnitudes([&](float x) {
                const double exact = std::pow(static_cast<double>(x), static_cast<double>(exponent));
                if (exact < kLeastPower || exact > kMostPower) return;
                worst.Take(std::abs(double{reference::ApproxPow(x, exponent, rounding)} - exact) / exact,
                           double{x});
            });
            worst.ExpectBelow(0x1p-10);
        }
}

TEST(ApproxPower, LogarithmOverAllMagnitudes) {
    for (const Rounding rounding : kRoundings) {
        WorstError worst(std::string("natural logarithm, absolute, ") + RoundingName(rounding));
        ForAllMagnitudes([&](float x) {
            worst.Take(std::abs(double{reference::ApproxLn(x, rounding)} - std::log(double{x})), double{x});
        });
        worst.ExpectBelow(0x1p-11);
    }
}

TEST(ApproxPower, NothingButPositiveNumbersHasAPower) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const float exponent : {2.4f, 0.41666666f, 0.0f}) {
            EXPECT_EQ(std::bit_cast<uint32_t>(PowerOfBody(target, 0, exponent)), 0u) << TargetName(target);
            EXPECT_EQ(std::bit_cast<uint32_t>(PowerOfBody(target, -0.0f, exponent)), 0x80000000u)
                << TargetName(target);
            EXPECT_EQ(PowerOfBody(target, kNaN, exponent), 0) << TargetName(target);
        }
}

TEST(ApproxPower, DenormalsCountAsTheLeastNormalNumber) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const float x : {0x1p-149f, 0x1.8p-130f, 0x1.fffffcp-127f})
            EXPECT_EQ(PowerOfBody(target, x, 0.5f), PowerOfBody(target, 0x1p-126f, 0.5f))
                << TargetName(target);
}

TEST(ApproxPower, IsHeldBetweenTheEndsOfTheExponent) {
    // Below 2^-126.5 nothing is left, and above 2^127.49999 nothing grows.
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
        for (const float x : {0x1p64f, 0x1p127f, std::numeric_limits<float>::infinity()}) {
            EXPECT_NEAR(static_cast<double>(PowerOfBody(target, x, 2.4f)) / kMostPower, 1, 0x1p-10) << x;
            EXPECT_EQ(PowerOfBody(target, 1 / x, 2.4f), 0) << x;
        }
    }
}

TEST(ApproxPower, OneStaysOne) {
    for (const Target target : TargetsOfThisProcessor(PK::Offer::processor))
        for (const float exponent : {2.4f, 0.41666666f, 30.0f})
            EXPECT_EQ(PowerOfBody(target, 1, exponent), 1) << TargetName(target) << ", " << exponent;
}

} // namespace
} // namespace PKTest
