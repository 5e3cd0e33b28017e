#include "colour/HubExponents.h"
#include "colour/ToneCurve.h"

#include <cstring>

namespace PK {

namespace {

void CopyPixels(const float* source, float* destination, int32_t count) {
    constexpr size_t kPixelBytes = 16;
    if (source != destination && count > 0)
        std::memcpy(destination, source, static_cast<size_t>(count) * kPixelBytes);
}

} // namespace

Rec709ColorSpace::Rec709ColorSpace() : GammaColorSpace(kHubEncoding) {}
Rec709ColorSpace::Rec709ColorSpace(const Rec709ColorSpace& other) = default;
Rec709ColorSpace::Rec709ColorSpace(Rec709ColorSpace&& other) : Rec709ColorSpace(other) {}
Rec709ColorSpace& Rec709ColorSpace::operator=(const Rec709ColorSpace& other) = default;
Rec709ColorSpace& Rec709ColorSpace::operator=(Rec709ColorSpace&& other) {
    return *this = other;
}

void Rec709ColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                               bool) const {
    CopyPixels(source, destination, count);
}

void Rec709ColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                             bool) const {
    CopyPixels(source, destination, count);
}

void Rec709ColorSpace::CompressPixelsToSDR(const float* source, float* destination, int32_t count,
                                           float exposure, float slope, float knee) const {
    constexpr TransferSegments kDecoding = {0, 1, 0, kHubDecoding, 1};
    constexpr TransferSegments kEncoding = {0, 1, 0, kHubEncoding, 1};
    CompressLuminanceEncoded(source, destination, count, ToneCurve(exposure, slope, knee), {*this}, kDecoding,
                             kEncoding);
}

} // namespace PK
