#include "colour/GamutClip.h"
#include "colour/HubExponents.h"
#include "colour/ToneCurve.h"

namespace PK {

namespace {

constexpr float kPrimaries[6] = {0.64f, 0.33f, 0.30f, 0.60f, 0.15f, 0.06f};
constexpr float kLuma[3] = {0.2126f, 0.7152f, 0.0722f};

constexpr TransferSegments kDecoding = {0.04045f, 0.94786733f, 0.055f, 2.4f, 0.07739938f};
constexpr TransferSegments kEncoding = {0.0031308f, 1.055f, -0.055f, 0.41666666f, 12.92f};

} // namespace

SRGBColorSpace::SRGBColorSpace() = default;
SRGBColorSpace::SRGBColorSpace(const SRGBColorSpace& other) = default;
SRGBColorSpace::SRGBColorSpace(SRGBColorSpace&& other) : SRGBColorSpace(other) {}
SRGBColorSpace& SRGBColorSpace::operator=(const SRGBColorSpace& other) = default;
SRGBColorSpace& SRGBColorSpace::operator=(SRGBColorSpace&& other) {
    return *this = other;
}

const float* SRGBColorSpace::Primaries() const {
    return kPrimaries;
}

const float* SRGBColorSpace::WhitePoint() const {
    return Illuminant(kIlluminantD65);
}

const float* SRGBColorSpace::LuminanceCoeffs() const {
    return kLuma;
}

// The thresholds look at the value with its sign: negative values are linear throughout.
float SRGBColorSpace::LinearToEOTF(float v) const {
    return WithSign(
        v, [v](float a) { return v > kEncoding.threshold ? kEncoding.Encode(a) : a * kEncoding.slope; });
}

float SRGBColorSpace::EOTFToLinear(float v) const {
    return WithSign(v, [v](float a) {
        return v > kDecoding.threshold ? std::pow((0.055f + a) / 1.055f, 2.4f) : a / 12.92f;
    });
}

void SRGBColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                             bool gamutClip) const {
    const float* luma = LuminanceCoeffs();
    ForPixels(source, destination, count, [=](RGB c) {
        const RGB encoded = ForChannels(c, [](float v) {
            return WithSign(v, [](float a) { return kEncoding.Encode(std::pow(a, kHubDecoding)); });
        });
        return gamutClip ? GamutClipPixel(encoded, luma) : encoded;
    });
}

void SRGBColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                           bool gamutClip) const {
    const float* luma = WorkingSpace(kWorkingSpaceRec709).LuminanceCoeffs();
    ForPixels(source, destination, count, [=](RGB c) {
        const RGB encoded = ForChannels(c, [](float v) {
            return WithSign(v, [](float a) { return std::pow(kDecoding.Decode(a), kHubEncoding); });
        });
        return gamutClip ? GamutClipPixel(encoded, luma) : encoded;
    });
}

void SRGBColorSpace::CompressPixelsToSDR(const float* source, float* destination, int32_t count,
                                         float exposure, float slope, float knee) const {
    CompressLuminanceEncoded(source, destination, count, ToneCurve(exposure, slope, knee), {*this}, kDecoding,
                             kEncoding);
}

} // namespace PK
