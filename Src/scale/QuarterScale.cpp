// Quarter-resolution scaling of planar 4:2:0 images: one field, by dropping samples.

#include <PixelKiln/QuarterScale.h>

#include "primitives/Dispatch.h"
#include "scale/QuarterScaleKernels.h"

#include <cstddef>

namespace PK {
namespace {

constexpr uint32_t kMaximumSize = INT32_MAX;
constexpr int32_t kSecondField = 2;

/// The work on one plane: every other sample of every other row.
struct PlaneReduction {
    const uint8_t* source;
    ptrdiff_t sourceRowBytes;
    uint8_t* destination;
    ptrdiff_t destinationRowBytes;
    int32_t samples; // of a row that is written
    int32_t rows;

    bool IsEmpty() const { return samples == 0 || rows == 0; }
};

/// The samples that a row gets of a width. With SSE2 the width counts samples of the destination and goes by
/// whole groups of 32; it counts samples of the source without SSE2, and for the lone part of a group that a
/// width below 32 is. Deliberate: callers rely on both.
int32_t SamplesOfRow(int32_t width) {
    constexpr int32_t kGroup = 32;
    return IsEnabled(Target::sse2) && width >= kGroup ? width / kGroup * kGroup : width / 2;
}

void Reduce(const PlaneReduction& plane, const QuarterScaleKernels& kernels) {
    for (ptrdiff_t row = 0; row < plane.rows; ++row) {
        kernels.evenBytes(plane.source + 2 * row * plane.sourceRowBytes,
                          plane.destination + row * plane.destinationRowBytes, plane.samples);
    }
}

const uint8_t* RowOf(const void* plane, ptrdiff_t rowBytes, ptrdiff_t row) {
    return static_cast<const uint8_t*>(plane) + row * rowBytes;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_QuarterScalePlanar420_8u(const void* const srcPlanes[3], const int32_t srcRowBytes[3],
                                      void* const dstPlanes[3], const int32_t dstRowBytes[3], uint32_t width,
                                      uint32_t height, int32_t field) noexcept {
    if (field != 1 && field != kSecondField) return PK_ErrBadFieldType;
    if (width > kMaximumSize || height > kMaximumSize) return PK_ErrFailed;
    if (width < 2 || height < 2) return PK_Success;
    if (!srcPlanes || !srcRowBytes || !dstPlanes || !dstRowBytes) return PK_ErrFailed;

    PlaneReduction planes[3];
    for (int i = 0; i < 3; ++i) {
        const bool isLuma = i == 0;
        const auto planeWidth = static_cast<int32_t>(isLuma ? width : width / 2);
        const auto rows = static_cast<int32_t>(isLuma ? height / 2 : height / 4);
        planes[i] = {static_cast<const uint8_t*>(srcPlanes[i]),
                     srcRowBytes[i],
                     static_cast<uint8_t*>(dstPlanes[i]),
                     dstRowBytes[i],
                     SamplesOfRow(planeWidth),
                     rows};
        if (planes[i].IsEmpty()) continue;
        if (!planes[i].source || !planes[i].destination) return PK_ErrFailed;
    }
    // Luma alone follows the field; chroma of either starts at row 0, as callers know it.
    if (field == kSecondField) planes[0].source += planes[0].sourceRowBytes;

    const QuarterScaleKernels& kernels = Best<QuarterScaleKernels>();
    for (const PlaneReduction& plane : planes)
        if (!plane.IsEmpty()) Reduce(plane, kernels);
    return PK_Success;
}

PK_Result PK_QuarterScalePlanar_8uAndConvertTo422_8u(const void* const srcPlanes[3],
                                                     const int32_t srcRowBytes[3], void* dst,
                                                     int32_t dstRowBytes, uint32_t width, uint32_t height,
                                                     bool yuyvOrder, int32_t field) noexcept {
    if (width > kMaximumSize || height > kMaximumSize) return PK_ErrFailed;
    if (width == 0 || height < 2) return PK_Success;
    if (!srcPlanes || !srcRowBytes || !dst) return PK_ErrFailed;
    if (!srcPlanes[0] || !srcPlanes[1] || !srcPlanes[2]) return PK_ErrFailed;

    const QuarterScaleKernels& kernels = Best<QuarterScaleKernels>();
    const auto interleave = yuyvOrder ? kernels.lumaFirst : kernels.chromaFirst;
    const auto pairs = static_cast<int32_t>(width / 2);
    const ptrdiff_t firstLumaRow = field == kSecondField ? 1 : 0;
    for (ptrdiff_t row = 0; row < height / 2; ++row) {
        const uint8_t* luma = RowOf(srcPlanes[0], srcRowBytes[0], 2 * row + firstLumaRow);
        const uint8_t* chroma1 = RowOf(srcPlanes[1], srcRowBytes[1], row);
        const uint8_t* chroma2 = RowOf(srcPlanes[2], srcRowBytes[2], row);
        uint8_t* destination = static_cast<uint8_t*>(dst) + row * dstRowBytes;
        interleave(luma, chroma1, chroma2, destination, pairs);
        if (width % 2 == 0) continue;
        const uint8_t lastLuma[2] = {luma[width - 1], 0};
        interleave(lastLuma, chroma1 + pairs, chroma2 + pairs, destination + 4 * ptrdiff_t{pairs}, 1);
    }
    return PK_Success;
}
