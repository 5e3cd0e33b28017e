// PK_ScaleConvert and PK_ScaleConvertOneField: what they refuse; the routes run in ScaleRun.

#include <PixelKiln/ScaleConvert.h>

#include "frame/FloatMode.h"
#include "frame/Planes.h"
#include "scale/ScaleArguments.h"
#include "scale/ScaleRun.h"

namespace PK {
namespace {

/// A conversion answers for itself.
std::optional<PK_Result> ResultWithoutScaling(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    if (IsConversionAlone(call)) return std::nullopt;
    if (!IsScalable(from.format)) return PK_ErrBadSrcFormat;
    if (!IsScalable(to.format)) return PK_ErrBadDstFormat;
    if (const auto result = ResultOfSizes(from.width, from.height, to.width, to.height)) return result;
    for (const ScaleImage& image : {from, to})
        if (Is420Planar(image.format) && !HavePlanesOffsets(image.width, image.height)) return PK_ErrFailed;
    return std::nullopt;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_ScaleConvert(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                          PK_PixelFormat srcFormat, int32_t srcField, void* dst, int32_t dstRowBytes,
                          int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat, int32_t dstField,
                          int32_t quality) noexcept {
    constexpr int32_t kAllRows = 0;
    return PK_ScaleConvertOneField(src, srcRowBytes, srcWidth, srcHeight, srcFormat, srcField, dst,
                                   dstRowBytes, dstWidth, dstHeight, dstFormat, dstField, quality, kAllRows);
}

PK_Result PK_ScaleConvertOneField(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                                  PK_PixelFormat srcFormat, int32_t srcField, void* dst, int32_t dstRowBytes,
                                  int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                                  int32_t dstField, int32_t quality, int32_t fieldToRender) noexcept {
    if (src == nullptr) return PK_ErrNullSource;
    if (dst == nullptr) return PK_ErrNullDestination;
    const ScaleCall call = {{srcFormat, srcWidth, srcHeight, srcField},
                            {dstFormat, dstWidth, dstHeight, dstField},
                            fieldToRender,
                            quality};
    if (const auto result = ResultWithoutScaling(call)) return *result;
    const FloatMode mode;
    return RunScale(
        {call, static_cast<const uint8_t*>(src), srcRowBytes, static_cast<uint8_t*>(dst), dstRowBytes});
}
