#include "filters/GaussianCoefficients.h"

#include <cmath>

namespace PK {
namespace {

// Half of a Gaussian is (a0 cos(w x / sigma) + a1 sin(w x / sigma)) exp(-b x / sigma), nearly. What is rounded to float
// before it goes on is part of the result.
constexpr float kA0 = 0.9629f, kA1 = 1.942f;
constexpr double kOmega = 0.8448f, kB = 1.26f; // the floats, in double precision
constexpr double kTwoB = 2.52;

} // namespace

GaussianCoefficients GaussianCoefficientsOf(double sigma) noexcept {
    const double e1 = std::exp(-kB / sigma), e2 = std::exp(-kTwoB / sigma);
    const double cosine = std::cos(kOmega / sigma), sine = std::sin(kOmega / sigma);
    const double a0 = kA0, a1 = kA1;

    const auto den = static_cast<float>(1 - 2 * cosine * e1 + e2);
    const auto norm = static_cast<float>(2 * (a0 * (1 - e1 * cosine) / den + a1 * (e1 * sine) / den) - a0);
    const float k = 1 / norm;
    GaussianCoefficients c = {};
    c.c0 = kA0 * k;
    const float p = kA1 * k;
    c.c1 = static_cast<float>(e1 * (sine * p - cosine * c.c0));
    c.d1 = static_cast<float>(-2 * e1 * cosine);
    c.d2 = static_cast<float>(e2);
    c.c2 = c.c1 - c.c0 * c.d1;
    c.c3 = -(c.c0 * c.d2);
    return c;
}

} // namespace PK
