// Gamma-coded to linear light and back. The powers are computed in double and rounded once.
#include <cmath>
#include <vector>

#include "ReferenceFamilies.h"
#include "ReferenceSamples.h"

namespace reference {
namespace {

constexpr double kToLinear = 2.4;
constexpr double kToGamma = 0.41666666;

float SignedPower(float c, double power) {
    const double magnitude = std::pow(std::abs(static_cast<double>(c)), power);
    return static_cast<float>(std::copysign(magnitude, static_cast<double>(c)));
}

bool FloatToFloat(const Job& job, double power) {
    const int alpha = AlphaIndex(job.source);
    for (int64_t i = 0; i < 4 * int64_t{job.width}; ++i) {
        const float c = Get<float>(job.src, i);
        Put<float>(job.dst, i, i % 4 == alpha ? c : SignedPower(c, power));
    }
    return true;
}

bool Gamma8uToLinear(const Job& job) {
    for (int64_t i = 0; i < 4 * int64_t{job.width}; ++i) {
        const uint8_t c = Get<uint8_t>(job.src, i);
        const float linear = static_cast<float>(std::pow(c / 255.0, kToLinear));
        Put<float>(job.dst, i, i % 4 == 3 ? static_cast<float>(c) * kOneBy255 : linear);
    }
    return true;
}

// Counting needs no search: a NaN is not less than any threshold, nor is a threshold less than it, and counts
// 0.
uint8_t CountThresholds(const std::vector<float>& thresholds, float c) {
    int count = 0;
    for (const float threshold : thresholds) count += threshold <= c ? 1 : 0;
    return static_cast<uint8_t>(count);
}

bool LinearToGamma8u(const Job& job) {
    std::vector<float> thresholds;
    for (int k = 0; k < 255; ++k) {
        thresholds.push_back(static_cast<float>(std::pow((k + 0.5) / 255.0, kToLinear)));
    }
    for (int64_t i = 0; i < 4 * int64_t{job.width}; ++i) {
        const float c = Get<float>(job.src, i);
        Put<uint8_t>(job.dst, i, i % 4 == 3 ? Nearest8u(255.0f * c) : CountThresholds(thresholds, c));
    }
    return true;
}

} // namespace

bool RunTransferFunction(const Job& job) {
    const bool rgbFloat = IsRGB4444(job.source, k32f);
    if (job.kernel == "GammaToLinearRow") {
        const bool known = rgbFloat && !IsLinear(job.source) && job.destination == (job.source | kLinear);
        return known && FloatToFloat(job, kToLinear);
    }
    if (job.kernel == "LinearToGammaRow") {
        const bool known = rgbFloat && IsLinear(job.source) && job.destination == (job.source & ~kLinear);
        return known && FloatToFloat(job, kToGamma);
    }
    if (job.kernel == "Gamma8uToLinearFloat32Row") {
        return job.source == kBGRA_4444_8u && job.destination == kBGRA_4444_32f_Linear &&
               Gamma8uToLinear(job);
    }
    if (job.kernel == "LinearFloat32ToGamma8uRow") {
        return job.source == kBGRA_4444_32f_Linear && job.destination == kBGRA_4444_8u &&
               LinearToGamma8u(job);
    }
    return false;
}

} // namespace reference
