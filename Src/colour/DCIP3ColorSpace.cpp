#include "colour/Caches.h"
#include "colour/GammaPixels.h"
#include "colour/HubExponents.h"
#include "colour/ToneCurve.h"

#include <algorithm>

namespace PK {

namespace {

constexpr float kPrimaries[6] = {0.68f, 0.32f, 0.265f, 0.69f, 0.15f, 0.06f};
constexpr float kEncodingExponent = 0.38461539f; // 1 / 2.6
constexpr float kDecodingExponent = 2.6f;

} // namespace

DCIP3ColorSpace::DCIP3ColorSpace(PK_Illuminant white)
    : GammaColorSpace(kEncodingExponent), illuminant(white) {}

DCIP3ColorSpace::DCIP3ColorSpace(const DCIP3ColorSpace& other) : DCIP3ColorSpace() {
    *this = other;
}

DCIP3ColorSpace::DCIP3ColorSpace(DCIP3ColorSpace&& other) : DCIP3ColorSpace(other) {}

DCIP3ColorSpace& DCIP3ColorSpace::operator=(const DCIP3ColorSpace& other) {
    if (this == &other) return *this;
    GammaColorSpace::operator=(other);
    const std::scoped_lock lock(FirstUseMutex());
    illuminant = other.illuminant;
    std::ranges::copy(other.lumCoeffs, lumCoeffs);
    fromRec709 = other.fromRec709;
    toRec709 = other.toRec709;
    fromRec709Valid = other.fromRec709Valid;
    toRec709Valid = other.toRec709Valid;
    return *this;
}

DCIP3ColorSpace& DCIP3ColorSpace::operator=(DCIP3ColorSpace&& other) {
    return *this = other;
}

const float* DCIP3ColorSpace::Primaries() const {
    return kPrimaries;
}

const float* DCIP3ColorSpace::WhitePoint() const {
    return Illuminant(illuminant);
}

const float* DCIP3ColorSpace::LuminanceCoeffs() const {
    return CachedCoeffs(lumCoeffs, [this](float* coeffs) { CalculateLumaCoeffs(coeffs); });
}

void DCIP3ColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                              bool gamutClip) const {
    const CSMatrix& matrix = CachedMatrix(fromRec709, fromRec709Valid, [this] {
        return CalculateConversionMatrix(WorkingSpace(kWorkingSpaceRec709), *this);
    });
    ConvertGammaPixels(source, destination, count, kHubDecoding, kEncodingExponent, matrix, gamutClip,
                       LuminanceCoeffs());
}

void DCIP3ColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                            bool gamutClip) const {
    const ColorSpace& hub = WorkingSpace(kWorkingSpaceRec709);
    const CSMatrix& matrix =
        CachedMatrix(toRec709, toRec709Valid, [&] { return CalculateConversionMatrix(*this, hub); });
    ConvertGammaPixels(source, destination, count, kDecodingExponent, kHubEncoding, matrix, gamutClip,
                       hub.LuminanceCoeffs());
}

void DCIP3ColorSpace::CompressPixelsToSDR(const float* source, float* destination, int32_t count,
                                          float exposure, float slope, float knee) const {
    CompressLuminanceToLinear(source, destination, count, ToneCurve(exposure, slope, knee), {*this},
                              kDecodingExponent);
}

} // namespace PK
