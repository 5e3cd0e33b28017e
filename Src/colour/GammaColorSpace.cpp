#include "colour/GammaPixels.h"

namespace PK {

GammaColorSpace::GammaColorSpace(float exponent) : gamma(exponent) {}
GammaColorSpace::GammaColorSpace(const GammaColorSpace& other) = default;
GammaColorSpace::GammaColorSpace(GammaColorSpace&& other) : GammaColorSpace(other) {}
GammaColorSpace& GammaColorSpace::operator=(const GammaColorSpace& other) = default;
GammaColorSpace& GammaColorSpace::operator=(GammaColorSpace&& other) {
    return *this = other;
}

float GammaColorSpace::LinearToEOTF(float v) const {
    return SignedPower(v, gamma);
}

float GammaColorSpace::EOTFToLinear(float v) const {
    return SignedPower(v, 1 / gamma);
}

void GammaColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                              bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, 2.4f, gamma, {}, gamutClip, LuminanceCoeffs());
}

void GammaColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                            bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, 1 / gamma, 0.41666666f, {}, gamutClip,
                       WorkingSpace(kWorkingSpaceRec709).LuminanceCoeffs());
}

void GammaColorSpace::CompressPixelsToSDR(const float*, float*, int32_t, float, float, float) const {}

} // namespace PK
