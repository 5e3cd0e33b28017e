#include "colour/DecodeTables.h"
#include "colour/FloatKernelTable.h"
#include "colour/HDRCurves.h"
#include "colour/HubExponents.h"
#include "colour/MatrixPixel.h"
#include "colour/Rec2020Matrices.h"
#include "primitives/CpuFeatures.h"

#include <algorithm>

namespace PK {

namespace {

/// Weighted as in MatrixPixel.h, blue first.
float Luminance(RGB c) {
    return HLG::kLuma[2] * c.b + HLG::kLuma[1] * c.g + HLG::kLuma[0] * c.r;
}

/// The signal of scene light E (ITU-R BT.2100).
float Encode(float E) {
    return E < HLG::kSquareRootEnd ? std::sqrt(3 * E) : std::log(E - HLG::kB12) * HLG::kA + HLG::kC;
}

} // namespace

HLGColorSpace::HLGColorSpace() = default;
HLGColorSpace::HLGColorSpace(const HLGColorSpace& other) = default;
HLGColorSpace::HLGColorSpace(HLGColorSpace&& other) : HLGColorSpace(other) {}
HLGColorSpace& HLGColorSpace::operator=(const HLGColorSpace& other) = default;
HLGColorSpace& HLGColorSpace::operator=(HLGColorSpace&& other) {
    return *this = other;
}

float HLGColorSpace::LinearToEOTF(float v) const {
    return v;
}

float HLGColorSpace::EOTFToLinear(float v) const {
    return v;
}

void HLGColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                            bool) const {
    const CSMatrix& matrix = Rec709ToRec2020();
    const int32_t bulk = BulkPixels(count);
    if (bulk > 0) FloatKernelTable::Rec709ToHLGKernel::Call(source, destination, bulk, {matrix.m});
    const ptrdiff_t done = 4 * static_cast<ptrdiff_t>(bulk);
    ForPixels(source + done, destination + done, count - bulk, [&](RGB c) {
        const RGB linear =
            Apply(matrix, ForChannels(c, [](float v) { return SignedPower(v, kHubDecoding); }));
        const RGB displayed = ForChannels(linear, [](float v) { return std::abs(v) * HLG::kLinearScale; });
        // From light of the display to light of the scene: the system gamma undone.
        const float gain = 1 / std::max(std::pow(Luminance(displayed), HLG::kInverseOOTFExponent),
                                        HLG::kLeastLuminancePower);
        return ForChannels(linear, [gain](float v) {
            return WithSign(v, [gain](float a) { return Encode(a * HLG::kLinearScale * gain); });
        });
    });
}

void HLGColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                          bool) const {
    const CSMatrix& matrix = Rec2020ToRec709();
    const float* table = HLGDecodeTable();
    const int32_t bulk = CpuFeatures::Flags().sse3 ? BulkPixels(count) : 0;
    if (bulk > 0) FloatKernelTable::HLGToRec709Kernel::Call(source, destination, bulk, {matrix.m, table});
    const ptrdiff_t done = 4 * static_cast<ptrdiff_t>(bulk);
    ForPixels(source + done, destination + done, count - bulk, [&](RGB c) {
        const RGB scene =
            ForChannels(c, [table](float v) { return table[SignalIndex(v, kHLGDecodeEntries)]; });
        const float gain = std::pow(Luminance(scene), HLG::kOOTFExponent) * HLG::kPeak;
        const RGB displayed = ForChannels(scene, [gain](float v) { return v * gain; });
        return ForChannels(Apply(matrix, displayed), [](float v) { return SignedPower(v, kHubEncoding); });
    });
}

void HLGColorSpace::CompressPixelsToSDR(const float*, float*, int32_t, float, float, float) const {}

} // namespace PK
