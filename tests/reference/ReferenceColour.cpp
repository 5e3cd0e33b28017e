// The pixel conversions of the colour spaces, step by step.
#include "ReferenceColour.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <xmmintrin.h>

namespace reference {
namespace {

constexpr float kHubDecoding = 2.4f, kHubEncoding = 0.41666666f;

uint32_t BitsOf(float x) {
    return std::bit_cast<uint32_t>(x);
}
float FloatOf(uint32_t bits) {
    return std::bit_cast<float>(bits);
}
float Estimate(float x) {
    return _mm_cvtss_f32(_mm_rcp_ss(_mm_set_ss(x)));
}

// The second operand unless the first is on the asked side of it: so for NaN.
float Lesser(float a, float b) {
    return a < b ? a : b;
}
float Greater(float a, float b) {
    return a > b ? a : b;
}

// a b + c
float Sum(float a, float b, float c, Rounding rounding) {
    return rounding == Rounding::kFused ? std::fma(a, b, c) : a * b + c;
}

// 1 / d by the estimate r and one step: 2 r - d r^2.
float Refined(float d, Rounding rounding) {
    const float r = Estimate(d);
    return Sum(0 - d, r * r, 2 * r, rounding); // not -d, which would turn the sign of NaN
}

struct Logarithm {
    float correction, s, exponent; // log x = correction s + s + exponent log 2
};

Logarithm LogarithmOf(float x, Rounding rounding) {
    const float a = static_cast<int32_t>(BitsOf(x)) < 0x00800000 ? 0x1p-126f : x;
    const float exponent = static_cast<float>(static_cast<int>(BitsOf(a) >> 23) - 127);
    const float m = FloatOf((BitsOf(a) & 0x007fffff) | 0x3f800000);
    const float z = (m - 1) * Estimate(m + 1);
    const float s = 2 * z;
    const float w = s * s;
    const float N =
        Sum(Sum(FloatOf(0xBF4A21EF), w, FloatOf(0x418317E4), rounding), w, FloatOf(0xC2804831), rounding);
    const float D =
        Sum(Sum(FloatOf(0xC20EB06A), w, FloatOf(0x439C0C01), rounding), w, FloatOf(0xC4406C49), rounding);
    return {w * N * Estimate(D), s, exponent};
}

float ApproxLog2(float x, Rounding rounding) {
    const float log2E = FloatOf(0x3FB8AA3B);
    const Logarithm log = LogarithmOf(x, rounding);
    return Sum(log.correction * log.s, log2E, Sum(log.s, log2E, log.exponent, rounding), rounding);
}

float ApproxExp2(float y, Rounding rounding) {
    const float t = y + 0.5f;
    const int n = static_cast<int>(t) - (t > 0 ? 0 : 1);
    const float f = y - static_cast<float>(n);
    const float g = f * f;
    const float A =
        Sum(Sum(FloatOf(0x3CBD2E43), g, FloatOf(0x41A19DD5), rounding), g, FloatOf(0x44BD3D05), rounding);
    const float B = Sum(FloatOf(0x43692F28), g, FloatOf(0x458881B1), rounding);
    const float q = f * A;
    const float h = q * Estimate(B - q);
    return (1 + 2 * h) * FloatOf(static_cast<uint32_t>(n + 127) << 23);
}

// The function on the magnitude, with the sign bit of the argument.
template <class Function>
float KeepSignBit(float v, Function function) {
    return FloatOf(BitsOf(function(std::abs(v))) | (BitsOf(v) & 0x80000000));
}
// With the sign of the argument, of which zeros have none.
template <class Function>
float KeepSign(float v, Function function) {
    return v < 0 ? -function(-v) : function(std::abs(v));
}

template <class Function>
ColourPixel ForColour(const ColourPixel& pixel, Function function) {
    return {function(pixel[0]), function(pixel[1]), function(pixel[2]), pixel[3]};
}

// Weights of R, G, B; blue first.
float Weighted(const float* weights, const ColourPixel& c, Rounding rounding) {
    return Sum(weights[0], c[2], Sum(weights[1], c[1], weights[2] * c[0], rounding), rounding);
}

ColourPixel Multiply(const float* matrix, const ColourPixel& c, Rounding rounding) {
    return {Weighted(matrix + 6, c, rounding), Weighted(matrix + 3, c, rounding),
            Weighted(matrix, c, rounding), c[3]};
}

ColourPixel BulkPower(const ColourPixel& pixel, float exponent, Rounding rounding) {
    return ForColour(pixel, [=](float v) {
        return KeepSignBit(v, [=](float a) { return ApproxPow(a, exponent, rounding); });
    });
}

ColourPixel SinglePower(const ColourPixel& pixel, float exponent) {
    return ForColour(pixel,
                     [=](float v) { return KeepSign(v, [=](float a) { return std::pow(a, exponent); }); });
}

float LeastOf(const ColourPixel& c) {
    return Lesser(Lesser(c[2], c[1]), c[0]);
}
float MostOf(const ColourPixel& c) {
    return Greater(Greater(c[2], c[1]), c[0]);
}

ColourPixel BulkClip(ColourPixel c, const float* luma, Rounding rounding) {
    const auto hasSignBit = [](float v) { return std::signbit(v); };
    if (std::any_of(c.begin(), c.begin() + 3, hasSignBit)) {
        const float Y = Weighted(luma, c, rounding);
        float scale = 1;
        for (int i = 0; i < 3; ++i) scale = Lesser(scale, c[i] < 0 ? Y * Refined(Y - c[i], rounding) : 1.0f);
        c = ForColour(c, [=](float v) { return Sum(v - Y, scale, Y, rounding); });
    }
    if (std::any_of(c.begin(), c.begin() + 3, [](float v) { return v >= 1; })) {
        const float least = LeastOf(c), most = MostOf(c);
        const ColourPixel above = ForColour(c, [=](float v) { return v - least; });
        const float mostAbove = MostOf(above);
        if (!(mostAbove > 0)) return {1, 1, 1, c[3]};
        const float weighted =
            Sum(luma[2], above[0], Sum(luma[1], above[1], luma[0] * above[2], rounding), rounding);
        const float L = Lesser(Greater(weighted * Refined(mostAbove, rounding), 0.15f), 0.9f);
        const float k = (1 - L) * Refined(most - L, rounding);
        c = ForColour(c, [=](float v) { return Sum(v - L, k, L, rounding); });
    }
    return c;
}

ColourPixel LookUp(const ColourPixel& pixel, const float* table, int last) {
    return ForColour(pixel, [=](float v) {
        const float signal = v > 0 ? std::min(v, 1.0f) : 0.0f;
        return table[static_cast<int>(signal * static_cast<float>(last))];
    });
}

// PQ: m1, m2, c1, c2, c3 of SMPTE ST 2084.
constexpr float kM1 = 0.1593017578125f, kM2 = 78.84375f, kC1 = 0.8359375f, kC2 = 18.8515625f, kC3 = 18.6875f;
constexpr int kLastOfPQ = 4095;

// HLG: a, b / 12 and a ln 12 + c of ITU-R BT.2100, and its weights of R, G, B.
constexpr float kA = 0.17883277f, kB12 = 0.02372241f, kCShifted = 1.0042934f, kTwelfth = 0.083333336f;
constexpr int kLastOfHLG = 2047;

} // namespace

float ApproxPow(float x, float exponent, Rounding rounding) {
    const float most = FloatOf(0x42FEFFFF);
    const float y = Greater(Lesser(ApproxLog2(x, rounding) * exponent, most), -most);
    const float power = ApproxExp2(y, rounding);
    return x > 0 ? power : 0.0f;
}

float ApproxLn(float x, Rounding rounding) {
    const Logarithm log = LogarithmOf(x, rounding);
    return Sum(log.exponent, 0.69314718f, Sum(log.correction, log.s, log.s, rounding), rounding);
}

ColourPixel BulkPowerLaws(const ColourPixel& pixel, const PowerLaws& laws, Rounding rounding) {
    ColourPixel c = BulkPower(pixel, laws.inExponent, rounding);
    if (laws.matrix != nullptr) c = Multiply(laws.matrix, c, rounding);
    if (laws.matrix != nullptr && laws.gamutClip) c = BulkClip(c, laws.luma, rounding);
    return BulkPower(c, laws.outExponent, rounding);
}

ColourPixel BulkPQToHub(const ColourPixel& pixel, const float* matrix, const float* table,
                        Rounding rounding) {
    return BulkPower(Multiply(matrix, LookUp(pixel, table, kLastOfPQ), rounding), kHubEncoding, rounding);
}

ColourPixel BulkHubToPQ(const ColourPixel& pixel, const float* matrix, float outScale, Rounding rounding) {
    const auto encode = [=](float magnitude) {
        const float p = ApproxPow(magnitude * 0.01f, kM1, rounding);
        const float e = Sum(kC2, p, kC1, rounding) * Refined(Sum(kC3, p, 1, rounding), rounding);
        return static_cast<float>(std::pow(static_cast<double>(e), static_cast<double>(kM2))) * outScale;
    };
    return ForColour(Multiply(matrix, BulkPower(pixel, kHubDecoding, rounding), rounding),
                     [=](float v) { return KeepSignBit(v, encode); });
}

ColourPixel BulkHLGToHub(const ColourPixel& pixel, const float* matrix, const float* table,
                         Rounding rounding) {
    const ColourPixel scene = LookUp(pixel, table, kLastOfHLG);
    const float gain = ApproxPow(Weighted(kLuma2020, scene, rounding), 0.2f, rounding) * 10;
    const ColourPixel displayed = ForColour(scene, [=](float v) { return v * gain; });
    return BulkPower(Multiply(matrix, displayed, rounding), kHubEncoding, rounding);
}

ColourPixel BulkHubToHLG(const ColourPixel& pixel, const float* matrix, Rounding rounding) {
    const ColourPixel linear = Multiply(matrix, BulkPower(pixel, kHubDecoding, rounding), rounding);
    const ColourPixel displayed = ForColour(linear, [](float v) { return std::abs(v) * 0.1f; });
    const float power = ApproxPow(Weighted(kLuma2020, displayed, rounding), 1.0f / 6, rounding);
    const float gain = Refined(Greater(power, 0.0001f), rounding);
    const auto encode = [=](float magnitude) {
        const float E = magnitude * 0.1f * gain;
        if (E < kTwelfth) return std::sqrt(3 * E);
        return Sum(ApproxLn(Greater(E - kB12, 0x1p-126f), rounding), kA, kCShifted, rounding);
    };
    return ForColour(linear, [=](float v) { return KeepSignBit(v, encode); });
}

ColourPixel SingleClip(ColourPixel c, const float* luma) {
    if (c[0] < 0 || c[1] < 0 || c[2] < 0) {
        const float Y = luma[2] * c[0] + luma[1] * c[1] + luma[0] * c[2];
        const float scale = LeastOf(ForColour(c, [=](float v) { return v < 0 ? Y / (Y - v) : 1.0f; }));
        c = ForColour(c, [=](float v) { return (v - Y) * scale + Y; });
    }
    if (c[0] > 1 || c[1] > 1 || c[2] > 1) {
        if (c[0] == c[1] && c[1] == c[2]) return {1, 1, 1, c[3]};
        const float least = LeastOf(c), most = MostOf(c);
        const ColourPixel d = ForColour(c, [=](float v) { return v - least; });
        const float dMost = MostOf(d);
        const float weighted = luma[0] * d[2] + luma[1] * d[1] + luma[2] * d[0];
        const float L = Lesser(Greater(weighted / dMost, 0.15f), 0.9f);
        const float k = (1 - L) / (most - L);
        c = ForColour(c, [=](float v) { return (v - L) * k + L; });
    }
    return c;
}

ColourPixel SinglePowerLaws(const ColourPixel& pixel, const PowerLaws& laws) {
    ColourPixel c = SinglePower(pixel, laws.inExponent);
    if (laws.matrix != nullptr) c = Multiply(laws.matrix, c, Rounding::kEach);
    if (laws.matrix != nullptr && laws.gamutClip) c = SingleClip(c, laws.luma);
    return SinglePower(c, laws.outExponent);
}

ColourPixel SinglePQToHubByTable(const ColourPixel& pixel, const float* matrix, const float* table) {
    return SinglePower(Multiply(matrix, LookUp(pixel, table, kLastOfPQ), Rounding::kEach), kHubEncoding);
}

ColourPixel SinglePQToHub(const ColourPixel& pixel, const float* matrix, float inScale, bool gamutClip,
                          const float* luma) {
    const auto decode = [=](float magnitude) {
        const float p = std::pow(magnitude * inScale, 0.012683313f);
        const float t = Greater((p - kC1) / (kC2 - kC3 * p), 0);
        return std::pow(t, 6.277395f) * 100;
    };
    const ColourPixel linear = ForColour(pixel, [=](float v) { return KeepSign(v, decode); });
    const ColourPixel encoded = SinglePower(Multiply(matrix, linear, Rounding::kEach), kHubEncoding);
    return gamutClip ? SingleClip(encoded, luma) : encoded;
}

ColourPixel SingleHubToPQ(const ColourPixel& pixel, const float* matrix, float outScale) {
    const auto encode = [=](float magnitude) {
        const float p = std::pow(magnitude * 0.01f, kM1);
        return std::pow((kC2 * p + kC1) / (kC3 * p + 1), kM2) * outScale;
    };
    return ForColour(Multiply(matrix, SinglePower(pixel, kHubDecoding), Rounding::kEach),
                     [=](float v) { return KeepSign(v, encode); });
}

ColourPixel SingleHLGToHub(const ColourPixel& pixel, const float* matrix, const float* table) {
    const ColourPixel scene = LookUp(pixel, table, kLastOfHLG);
    const float gain = std::pow(Weighted(kLuma2020, scene, Rounding::kEach), 0.2f) * 10;
    const ColourPixel displayed = ForColour(scene, [=](float v) { return v * gain; });
    return SinglePower(Multiply(matrix, displayed, Rounding::kEach), kHubEncoding);
}

ColourPixel SingleHubToHLG(const ColourPixel& pixel, const float* matrix) {
    const ColourPixel linear = Multiply(matrix, SinglePower(pixel, kHubDecoding), Rounding::kEach);
    const ColourPixel displayed = ForColour(linear, [](float v) { return std::abs(v) * 0.1f; });
    const float power = std::pow(Weighted(kLuma2020, displayed, Rounding::kEach), 1.0f / 6);
    const float gain = 1 / std::max(power, 0.0001f);
    const auto encode = [=](float magnitude) {
        const float E = magnitude * 0.1f * gain;
        return E < kTwelfth ? std::sqrt(3 * E) : std::log(E - kB12) * kA + kCShifted;
    };
    return ForColour(linear, [=](float v) { return KeepSign(v, encode); });
}

ColourPixel SingleHubToSRGB(const ColourPixel& pixel, bool gamutClip) {
    const auto encode = [](float magnitude) {
        const float d = std::pow(magnitude, kHubDecoding);
        return d > 0.0031308f ? std::pow(d, 0.41666666f) * 1.055f - 0.055f : d * 12.92f;
    };
    const ColourPixel encoded = ForColour(pixel, [=](float v) { return KeepSign(v, encode); });
    return gamutClip ? SingleClip(encoded, kLuma709) : encoded;
}

ColourPixel SingleSRGBToHub(const ColourPixel& pixel, bool gamutClip) {
    const auto decode = [](float a) {
        const float d = a > 0.04045f ? std::pow((a + 0.055f) * 0.94786733f, 2.4f) : a * 0.07739938f;
        return std::pow(d, kHubEncoding);
    };
    const ColourPixel hub = ForColour(pixel, [=](float v) { return KeepSign(v, decode); });
    return gamutClip ? SingleClip(hub, kLuma709) : hub;
}

} // namespace reference
