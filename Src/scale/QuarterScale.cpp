// Quarter-resolution scaling of planar 4:2:0 images: one field, by dropping samples.

#include <PixelKiln/QuarterScale.h>

#include "convert/Image.h"
#include "frame/Arguments.h"
#include "frame/Planes.h"
#include "primitives/Dispatch.h"
#include "scale/QuarterScaleKernels.h"

namespace PK {
namespace {

constexpr uint32_t kMaximumSize = INT32_MAX;
constexpr int32_t kFirstField = 1, kSecondField = 2;

/// The samples that a row gets of a width. With SSE2 the width counts samples of the destination and goes by
/// whole groups of 32; it counts samples of the source without SSE2, and for the lone part of a group that a
/// width below 32 is. Deliberate: callers rely on both.
int32_t SamplesOfRow(int32_t width) {
    constexpr int32_t kGroup = 32;
    return IsEnabled(Target::sse2) && width >= kGroup ? width / kGroup * kGroup : width / 2;
}

/// Every other sample of every other row.
void Reduce(const Plane<const uint8_t>& source, const Plane<uint8_t>& destination, int32_t samples,
            const QuarterScaleKernels& kernels) {
    for (int32_t row = 0; row < destination.height; ++row)
        kernels.evenBytes(source.Row(row), destination.Row(row), samples);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_QuarterScalePlanar420_8u(const void* const srcPlanes[3], const int32_t srcRowBytes[3],
                                      void* const dstPlanes[3], const int32_t dstRowBytes[3], uint32_t width,
                                      uint32_t height, int32_t field) noexcept {
    if (field != kFirstField && field != kSecondField) return PK_ErrBadFieldType;
    if (width > kMaximumSize || height > kMaximumSize) return PK_ErrFailed;
    if (width < 2 || height < 2) return PK_Success;
    if (HasNull({srcPlanes, srcRowBytes, dstPlanes, dstRowBytes})) return PK_ErrFailed;

    const auto columns = static_cast<int32_t>(width), rows = static_cast<int32_t>(height);
    const auto source = PlanesOf<const uint8_t>(srcPlanes, srcRowBytes, columns, rows, Chroma::k420);
    const auto destination = PlanesOf<uint8_t>(dstPlanes, dstRowBytes, columns / 2, rows / 2, Chroma::k420);
    for (size_t i = 0; i < source.size(); ++i)
        if (!destination[i].IsEmpty() && HasNull({source[i].pixels, destination[i].pixels}))
            return PK_ErrFailed;

    const QuarterScaleKernels& kernels = Best<QuarterScaleKernels>();
    for (size_t i = 0; i < source.size(); ++i) {
        if (destination[i].IsEmpty()) continue;
        // Luma alone follows the field; chroma of either starts at row 0, as callers know it.
        const auto rowsOfField = Field(source[i], i == 0 ? field : kFirstField);
        Reduce(rowsOfField, destination[i], SamplesOfRow(source[i].width), kernels);
    }
    return PK_Success;
}

PK_Result PK_QuarterScalePlanar_8uAndConvertTo422_8u(const void* const srcPlanes[3],
                                                     const int32_t srcRowBytes[3], void* dst,
                                                     int32_t dstRowBytes, uint32_t width, uint32_t height,
                                                     bool yuyvOrder, int32_t field) noexcept {
    if (width > kMaximumSize || height > kMaximumSize) return PK_ErrFailed;
    if (width == 0 || height < 2) return PK_Success;
    if (HasNull({srcPlanes, srcRowBytes, dst})) return PK_ErrFailed;
    if (HasNull({srcPlanes[0], srcPlanes[1], srcPlanes[2]})) return PK_ErrFailed;

    const auto [y, chroma1, chroma2] = PlanesOf<const uint8_t>(
        srcPlanes, srcRowBytes, static_cast<int32_t>(width), static_cast<int32_t>(height), Chroma::k420);
    const auto luma = Field(y, field == kSecondField ? kSecondField : kFirstField);
    const QuarterScaleKernels& kernels = Best<QuarterScaleKernels>();
    const auto interleave = yuyvOrder ? kernels.lumaFirst : kernels.chromaFirst;
    const int32_t pairs = y.width / 2;
    for (int32_t row = 0; row < y.height / 2; ++row) {
        uint8_t* destination = static_cast<uint8_t*>(dst) + ptrdiff_t{row} * dstRowBytes;
        interleave(luma.Row(row), chroma1.Row(row), chroma2.Row(row), destination, pairs);
        if (y.width % 2 == 0) continue;
        const uint8_t lastLuma[2] = {luma.Row(row)[y.width - 1], 0};
        interleave(lastLuma, chroma1.Row(row) + pairs, chroma2.Row(row) + pairs,
                   destination + 4 * ptrdiff_t{pairs}, 1);
    }
    return PK_Success;
}
