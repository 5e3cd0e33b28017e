// The coefficients of the Gaussian blur, by values worked out apart from it.

#include "filters/GaussianCoefficients.h"
#include "reference/ReferenceGaussianBlur.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

using namespace PK;

void ExpectCoefficients(double sigma, const GaussianCoefficients& expected) {
    const GaussianCoefficients c = GaussianCoefficientsOf(sigma);
    EXPECT_EQ(c.c0, expected.c0);
    EXPECT_EQ(c.c1, expected.c1);
    EXPECT_EQ(c.c2, expected.c2);
    EXPECT_EQ(c.c3, expected.c3);
    EXPECT_EQ(c.d1, expected.d1);
    EXPECT_EQ(c.d2, expected.d2);
}

} // namespace

// sigma 1: e1 = 0.283654029, e2 = 0.080459607, C = 0.663880867, S = 0.747838348, den = 0.703834653, norm = 2.428593159,
// k = 0.411761016, p = 0.799639881; and so on, each rounded to float where it is told.
TEST(GaussianCoefficients, ByHand) {
    ExpectCoefficients(0.5, {.c0 = 0x1.8f0feep-1f,
                             .c1 = 0x1.106cb2p-3f,
                             .c2 = 0x1.e3f58ap-4f,
                             .c3 = -0x1.4aadc8p-8f,
                             .d1 = 0x1.387d56p-6f,
                             .d2 = 0x1.a8437ap-8f});
    ExpectCoefficients(1, {.c0 = 0x1.960014p-2f,
                           .c1 = 0x1.84f762p-4f,
                           .c2 = 0x1.f44d88p-3f,
                           .c3 = -0x1.05554p-5f,
                           .d1 = -0x1.81a9fap-2f,
                           .d2 = 0x1.499004p-4f});
    ExpectCoefficients(10, {.c0 = 0x1.3e2136p-5f,
                            .c1 = -0x1.cf79dap-6f,
                            .c2 = 0x1.473284p-5f,
                            .c3 = -0x1.ee8782p-6f,
                            .d1 = -0x1.c1c6eap+0f,
                            .d2 = 0x1.8df306p-1f});
    ExpectCoefficients(40, {.c0 = 0x1.3e0b56p-7f,
                            .c1 = -0x1.26fcb6p-7f,
                            .c2 = 0x1.413d4ep-7f,
                            .c3 = -0x1.2aa026p-7f,
                            .d1 = -0x1.f00342p+0f,
                            .d2 = 0x1.e0bd32p-1f});
}

TEST(GaussianCoefficients, AreTheRestatedOnesForEverySigma) {
    for (double sigma = 0.01; sigma < 1e9; sigma *= 1.0137) {
        const PKTest::ReferenceGaussian g = PKTest::ReferenceGaussianOf(sigma);
        if (std::isnan(g.c0)) continue;
        SCOPED_TRACE(sigma);
        ExpectCoefficients(sigma, {g.c0, g.c1, g.c2, g.c3, g.d1, g.d2});
    }
}

// A flat line y = x is what a pass leaves it if (c0 + c1) / (1 + d1 + d2) is 1: both together.
TEST(GaussianCoefficients, OfBothPassesKeepTheSumOfALine) {
    for (const double sigma : {0.3, 0.5, 1.0, 2.0, 5.0, 10.0, 40.0}) {
        const GaussianCoefficients c = GaussianCoefficientsOf(sigma);
        const double poles = 1 + double{c.d1} + double{c.d2};
        EXPECT_NEAR((double{c.c0} + c.c1 + c.c2 + c.c3) / poles, 1, 3e-5) << sigma;
    }
}

TEST(GaussianCoefficients, OfTheSmallestSigmasLeaveALineAsItIs) {
    for (const double sigma : {1e-300, 1e-9, 0.003}) {
        const GaussianCoefficients c = GaussianCoefficientsOf(sigma);
        EXPECT_EQ(c.c0, 1) << sigma;
        for (const float other : {c.c1, c.c2, c.c3, c.d1, c.d2}) EXPECT_EQ(other, 0) << sigma;
    }
}
