#include "colour/FloatKernelTable.h"
#include "colour/GammaPixels.h"
#include "colour/HubExponents.h"
#include "colour/Rec2020Matrices.h"
#include "colour/ToneCurve.h"

namespace PK {

namespace {

constexpr float kPrimaries[6] = {0.708f, 0.292f, 0.170f, 0.797f, 0.131f, 0.046f};
constexpr float kLuma[3] = {0.2627f, 0.678f, 0.0593f};

/// Calls convert(from, to) for each pixel behind the groups of the kernels.
template <class Convert>
void ForLastPixels(const float* source, float* destination, int32_t count, Convert convert) {
    for (int32_t i = BulkPixels(count); i < count; ++i)
        convert(source + 4 * static_cast<ptrdiff_t>(i), destination + 4 * static_cast<ptrdiff_t>(i));
}

} // namespace

Rec2020ColorSpace::Rec2020ColorSpace() = default;
Rec2020ColorSpace::Rec2020ColorSpace(const Rec2020ColorSpace& other) = default;
Rec2020ColorSpace::Rec2020ColorSpace(Rec2020ColorSpace&& other) : Rec2020ColorSpace(other) {}
Rec2020ColorSpace& Rec2020ColorSpace::operator=(const Rec2020ColorSpace& other) = default;
Rec2020ColorSpace& Rec2020ColorSpace::operator=(Rec2020ColorSpace&& other) {
    return *this = other;
}

const float* Rec2020ColorSpace::Primaries() const {
    return kPrimaries;
}

const float* Rec2020ColorSpace::WhitePoint() const {
    return Illuminant(kIlluminantD65);
}

const float* Rec2020ColorSpace::LuminanceCoeffs() const {
    return kLuma;
}

void Rec2020ColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                                bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, kHubDecoding, kHubEncoding, Rec709ToRec2020(), gamutClip,
                       LuminanceCoeffs());
}

void Rec2020ColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                              bool gamutClip) const {
    ConvertGammaPixels(source, destination, count, kHubDecoding, kHubEncoding, Rec2020ToRec709(), gamutClip,
                       WorkingSpace(kWorkingSpaceRec709).LuminanceCoeffs());
}

void Rec2020ColorSpace::CompressPixelsToSDR(const float* source, float* destination, int32_t count,
                                            float exposure, float slope, float knee) const {
    CompressLuminanceToLinear(source, destination, count, ToneCurve(exposure, slope, knee), {*this},
                              kHubDecoding);
}

void Rec2020ColorSpace::ConvertPixelsFromYUVtoRGB(const float* source, float* destination,
                                                  int32_t count) const {
    if (const int32_t bulk = BulkPixels(count))
        FloatKernelTable::YUVToRGBKernel::Call(source, destination, bulk);
    ForLastPixels(source, destination, count, [](const float* from, float* to) {
        const float V = from[0], U = from[1], Y = from[2], A = from[3];
        to[0] = Y + 1.8814f * U;
        to[1] = Y - 0.1645f * U - 0.5713f * V;
        to[2] = Y + 1.4746f * V;
        to[3] = A;
    });
}

void Rec2020ColorSpace::ConvertPixelsFromRGBtoYUV(const float* source, float* destination,
                                                  int32_t count) const {
    if (const int32_t bulk = BulkPixels(count))
        FloatKernelTable::RGBToYUVKernel::Call(source, destination, bulk);
    ForLastPixels(source, destination, count, [](const float* from, float* to) {
        const float B = from[0], G = from[1], R = from[2], A = from[3];
        to[0] = 0.5f * R - 0.4598f * G - 0.0402f * B;
        to[1] = 0.5f * B - 0.3604f * G - 0.1396f * R;
        to[2] = 0.2627f * R + 0.678f * G + 0.0593f * B;
        to[3] = A;
    });
}

} // namespace PK
