#include "colour/ToneCurve.h"

#include "colour/MatrixColumn.h"

namespace PK {

namespace {

/// Keeps chromaticity x, y of a linear colour and bends its luminance; what is black or darker has the chromaticity of
/// white.
RGB BendLuminance(RGB linear, const ToneCurve& curve, const LuminanceSpace& space) {
    constexpr double kLeastSum = 1e-6;
    const Column tristimulus = space.toXYZ * Column{{linear.r, linear.g, linear.b}};
    const auto& [X, Y, Z] = tristimulus.c;
    const float sum = Z + X + Y;
    const bool hasColour = static_cast<double>(sum) > kLeastSum;
    const float x = hasColour ? X / sum : space.white[0];
    const float y = hasColour ? Y / sum : space.white[1];
    const float bent = curve(Y);
    const Column colour = space.toRGB * Column{{x * bent / y, bent, (1 - x - y) * bent / y}};
    return {colour.c[0], colour.c[1], colour.c[2]};
}

} // namespace

ToneCurve::ToneCurve(float exposure, float slope, float knee)
    : fLuminanceScale(99.99f * exposure), fSlope(slope), fKnee(knee), fKneeInput(knee / slope),
      fBendExponent((1 - fKneeInput) / (1 - knee) * slope) {}

float ToneCurve::operator()(float luminance) const {
    const float above = luminance > 0 ? luminance : 0.0f;
    const float t = std::log10(above * fLuminanceScale + 1) * 0.5f - 1; // -1 is black, 1 is 100 / exposure
    const float u = std::abs(t) < 1 ? std::abs(t) : 1.0f;
    const float bent =
        u > fKneeInput
            ? (1 - std::pow(1 - (u - fKneeInput) / (1 - fKneeInput), fBendExponent)) * (1 - fKnee) + fKnee
            : u * fSlope;
    const float v = t < 0 ? -bent : bent;
    return (std::pow(10.0f, v + 1) - 1) * 0.01010101f;
}

void CompressLuminanceEncoded(const float* source, float* destination, int32_t count, const ToneCurve& curve,
                              const LuminanceSpace& space, const TransferSegments& decoding,
                              const TransferSegments& encoding) {
    ForPixels(source, destination, count, [&](RGB c) {
        const RGB linear =
            ForChannels(c, [&](float v) { return WithSign(v, [&](float a) { return decoding.Decode(a); }); });
        return ForChannels(BendLuminance(linear, curve, space),
                           [&](float v) { return WithSign(v, [&](float a) { return encoding.Encode(a); }); });
    });
}

void CompressLuminanceToLinear(const float* source, float* destination, int32_t count, const ToneCurve& curve,
                               const LuminanceSpace& space, float exponent) {
    ForPixels(source, destination, count, [&](RGB c) {
        return BendLuminance(ForChannels(c, [=](float v) { return SignedPower(v, exponent); }), curve, space);
    });
}

} // namespace PK
