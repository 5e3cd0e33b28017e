#include "colour/GammaPixels.h"
#include "colour/HubExponents.h"

namespace PK {

namespace {

/// As SignedPower but for -0, which counts as not negative and keeps its sign in odd powers.
float Power(float v, float exponent) {
    return v == 0 ? std::pow(std::copysign(0.0f, v), exponent) : SignedPower(v, exponent);
}

} // namespace

GammaColorSpace::GammaColorSpace(float exponent) : gamma(exponent) {}
GammaColorSpace::GammaColorSpace(const GammaColorSpace& other) = default;
GammaColorSpace::GammaColorSpace(GammaColorSpace&& other) : GammaColorSpace(other) {}
GammaColorSpace& GammaColorSpace::operator=(const GammaColorSpace& other) = default;
GammaColorSpace& GammaColorSpace::operator=(GammaColorSpace&& other) {
    return *this = other;
}

float GammaColorSpace::LinearToEOTF(float v) const {
    return Power(v, gamma);
}

float GammaColorSpace::EOTFToLinear(float v) const {
    return Power(v, 1 / gamma);
}

void GammaColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                              bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, kHubDecoding, gamma, {}, gamutClip, LuminanceCoeffs());
}

void GammaColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                            bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, 1 / gamma, kHubEncoding, {}, gamutClip,
                       WorkingSpace(kWorkingSpaceRec709).LuminanceCoeffs());
}

void GammaColorSpace::CompressPixelsToSDR(const float*, float*, int32_t, float, float, float) const {}

} // namespace PK
