// PK_ScaleConvertPlanar: planes decoded, straight to the destination or to what is then scaled and converted.

#include <PixelKiln/ScaleConvert.h>

#include "convert/Planar420.h"
#include "frame/FloatMode.h"
#include "frame/TransientMemory.h"
#include "scale/ScaleArguments.h"
#include "scale/ScaleTrace.h"

namespace PK {
namespace {

PK_Result ScalePlanes(const SourcePlanes& planes, const ScaleCall& call,
                      const DestinationImage& destination) {
    const auto& [from, to, renderField, quality] = call;
    const DecodeTarget target =
        ChoosePlanarTarget({from.format, from.width, from.height}, {to.format, to.width, to.height}, quality);
    const bool isStraight =
        target.format == to.format && target.width == to.width && target.height == to.height;
    TraceScale(call, isStraight ? ScaleRoute::StraightDecoding : ScaleRoute::Decoding);
    if (isStraight) return DecodePlanar420(planes, from.format, FromTop(destination), from.field, quality);

    const TransientPixelBuffer buffer(target.format, target.width, target.height);
    if (buffer.Result() != PK_Success) return buffer.Result();
    const DestinationImage picture = {buffer.Pixels(), buffer.RowBytes(), target.format, target.width,
                                      target.height};
    if (const PK_Result result = DecodePlanar420(planes, from.format, FromTop(picture), from.field, quality))
        return result;
    const ScaleImage decoded = AfterDecoding(call, target).source;
    return PK_ScaleConvertOneField(buffer.Pixels(), buffer.RowBytes(), decoded.width, decoded.height,
                                   decoded.format, decoded.field, destination.pixels,
                                   static_cast<int32_t>(destination.rowBytes), to.width, to.height, to.format,
                                   to.field, quality, renderField);
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_ScaleConvertPlanar(const void* const planes[3], const int32_t planeRowBytes[3], int32_t srcWidth,
                                int32_t srcHeight, PK_PixelFormat srcFormat, int32_t srcField, void* dst,
                                int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight,
                                PK_PixelFormat dstFormat, int32_t dstField, int32_t quality) noexcept {
    if (!Is420Planar(srcFormat)) return PK_ErrBadSrcFormat;
    if (Is420Planar(dstFormat) || !IsScalable(dstFormat)) return PK_ErrBadDstFormat;
    if (const auto result = ResultOfSizes(srcWidth, srcHeight, dstWidth, dstHeight)) return *result;
    if (HasNull({planes, planeRowBytes})) return PK_ErrFailed;
    const SourcePlanes source =
        PlanesOf<const uint8_t>(planes, planeRowBytes, srcWidth, srcHeight, Chroma::k420);
    if (std::ranges::any_of(source, IsUnreadable<const uint8_t>)) return PK_ErrFailed;
    if (dst == nullptr) return PK_ErrNullDestination;

    constexpr int32_t kAllRows = 0;
    const FloatMode mode;
    return ScalePlanes(source,
                       {{srcFormat, srcWidth, srcHeight, srcField},
                        {dstFormat, dstWidth, dstHeight, dstField},
                        kAllRows,
                        quality},
                       {static_cast<uint8_t*>(dst), dstRowBytes, dstFormat, dstWidth, dstHeight});
}
