#include "colour/Caches.h"
#include "colour/DecodeTables.h"
#include "colour/FloatKernelTable.h"
#include "colour/GamutClip.h"
#include "colour/HDRCurves.h"
#include "colour/HubExponents.h"
#include "colour/MatrixPixel.h"
#include "primitives/CpuFeatures.h"

#include <algorithm>

namespace PK {

namespace {

/// The signal of a linear value, before any normalisation.
float EncodePQ(float linear) {
    const float p = std::pow(linear * PQ::kLinearScale, PQ::kM1);
    return std::pow((PQ::kC2 * p + PQ::kC1) / (PQ::kC3 * p + 1), PQ::kM2);
}

} // namespace

PQColorSpace::PQColorSpace(bool useP3, bool normalized)
    : PQColorSpace(WorkingSpace(useP3 ? kWorkingSpaceDCIP3D65 : kWorkingSpaceRec2020).Primaries(),
                   normalized) {
    if (!useP3) std::copy_n(WorkingSpace(kWorkingSpaceRec2020).LuminanceCoeffs(), 3, lumCoeffs);
}

PQColorSpace::PQColorSpace(const float* chromaticities, bool normalized)
    : scale(PQ::kSignalOf100), hasScale(normalized), p3(kIlluminantD65) {
    std::copy_n(chromaticities, 6, primaries);
}

PQColorSpace::PQColorSpace(const PQColorSpace& other) : ColorSpace(other), p3(other.p3) {
    *this = other;
}

PQColorSpace::PQColorSpace(PQColorSpace&& other) : PQColorSpace(other) {}

PQColorSpace& PQColorSpace::operator=(const PQColorSpace& other) {
    if (this == &other) return *this;
    ColorSpace::operator=(other);
    p3 = other.p3;
    const std::scoped_lock lock(FirstUseMutex());
    std::ranges::copy(other.primaries, primaries);
    std::ranges::copy(other.lumCoeffs, lumCoeffs);
    scale = other.scale;
    hasScale = other.hasScale;
    fromRec709 = other.fromRec709;
    toRec709 = other.toRec709;
    fromRec709Valid = other.fromRec709Valid;
    toRec709Valid = other.toRec709Valid;
    return *this;
}

PQColorSpace& PQColorSpace::operator=(PQColorSpace&& other) {
    return *this = other;
}

const float* PQColorSpace::Primaries() const {
    return primaries;
}

const float* PQColorSpace::WhitePoint() const {
    return Illuminant(kIlluminantD65);
}

const float* PQColorSpace::LuminanceCoeffs() const {
    return CachedCoeffs(lumCoeffs, [this](float* coeffs) { CalculateLumaCoeffs(coeffs); });
}

float PQColorSpace::LinearToEOTF(float v) const {
    const float signal = EncodePQ(v);
    return hasScale ? signal / scale : signal;
}

float PQColorSpace::EOTFToLinear(float v) const {
    const float p = std::pow(hasScale ? v * scale : v, PQ::kInverseM2);
    return std::pow((p - PQ::kC1) / (PQ::kC2 - PQ::kC3 * p), PQ::kInverseM1) * 100;
}

void PQColorSpace::ConvertPixelsFromRec709(const float* source, float* destination, int32_t count,
                                           bool) const {
    const CSMatrix& matrix = CachedMatrix(fromRec709, fromRec709Valid, [this] {
        return CalculateConversionMatrix(WorkingSpace(kWorkingSpaceRec709), *this);
    });
    const float outScale = hasScale ? PQ::kPerSignalOf100 : 1.0f;
    const int32_t bulk = BulkPixels(count);
    if (bulk > 0) FloatKernelTable::Rec709ToPQKernel::Call(source, destination, bulk, {matrix.m, outScale});
    const ptrdiff_t done = 4 * static_cast<ptrdiff_t>(bulk);
    ForPixels(source + done, destination + done, count - bulk, [&](RGB c) {
        const RGB linear =
            Apply(matrix, ForChannels(c, [](float v) { return SignedPower(v, kHubDecoding); }));
        return ForChannels(
            linear, [=](float v) { return WithSign(v, [=](float a) { return EncodePQ(a) * outScale; }); });
    });
}

void PQColorSpace::ConvertPixelsToRec709(const float* source, float* destination, int32_t count,
                                         bool gamutClip) const {
    const ColorSpace& hub = WorkingSpace(kWorkingSpaceRec709);
    const CSMatrix& matrix =
        CachedMatrix(toRec709, toRec709Valid, [&] { return CalculateConversionMatrix(*this, hub); });
    const auto encode = [](float v) { return SignedPower(v, kHubEncoding); };

    if (!hasScale && !gamutClip) {
        const float* table = PQDecodeTable();
        const int32_t bulk = CpuFeatures::Flags().sse3 ? BulkPixels(count) : 0;
        if (bulk > 0) FloatKernelTable::PQToRec709Kernel::Call(source, destination, bulk, {matrix.m, table});
        const ptrdiff_t done = 4 * static_cast<ptrdiff_t>(bulk);
        const auto decode = [table](float v) { return table[SignalIndex(v, kPQDecodeEntries)]; };
        ForPixels(source + done, destination + done, count - bulk,
                  [&](RGB c) { return ForChannels(Apply(matrix, ForChannels(c, decode)), encode); });
        return;
    }

    const float* luma = hub.LuminanceCoeffs();
    const bool needMatrix = !IsIdentity(matrix);
    const float inScale = hasScale ? PQ::kSignalOf100 : 1.0f;
    const auto decode = [inScale](float v) {
        return WithSign(v, [inScale](float a) {
            const float p = std::pow(a * inScale, PQ::kInverseM2);
            const float t = std::max(0.0f, (p - PQ::kC1) / (PQ::kC2 - PQ::kC3 * p));
            return std::pow(t, PQ::kInverseM1) * 100;
        });
    };
    ForPixels(source, destination, count, [&](RGB c) {
        RGB linear = ForChannels(c, decode);
        if (needMatrix) linear = Apply(matrix, linear);
        const RGB encoded = ForChannels(linear, encode);
        return gamutClip ? GamutClipPixel(encoded, luma) : encoded;
    });
}

void PQColorSpace::CompressPixelsToSDR(const float*, float*, int32_t, float, float, float) const {}

} // namespace PK
