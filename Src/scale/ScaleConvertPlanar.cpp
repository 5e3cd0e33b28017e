// PK_ScaleConvertPlanar: planes decoded, straight to the destination or to what is then scaled and converted.

#include <PixelKiln/ScaleConvert.h>

#include "convert/Planar420.h"
#include "frame/FloatMode.h"
#include "scale/ScaleArguments.h"
#include "scale/ScaleRun.h"
#include "scale/ScaleTrace.h"

namespace PK {
namespace {

/// \param job  without memory of a source: the planes lie apart.
PK_Result ScalePlanes(const SourcePlanes& planes, const ScaleJob& job) {
    const ScaleImage &from = job.call.source, &to = job.call.destination;
    const DecodeTarget target = DecodeTargetOf(job.call);
    const auto decode = [&](const DestinationImage& image) {
        return DecodePlanar420(planes, from.format, FromTop(image), from.field, job.call.quality);
    };
    const bool isStraight =
        target.format == to.format && target.width == to.width && target.height == to.height;
    TraceScale(job.call, isStraight ? ScaleRoute::StraightDecoding : ScaleRoute::Decoding);
    return isStraight ? decode(job.Destination()) : RunScaleDecoded(job, target, decode);
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
    if (std::ranges::any_of(source, HasUnreadableSamples<const uint8_t>)) return PK_ErrFailed;
    if (dst == nullptr) return PK_ErrNullDestination;

    constexpr int32_t kAllRows = 0;
    const FloatMode mode;
    const ScaleCall call = {{srcFormat, srcWidth, srcHeight, srcField},
                            {dstFormat, dstWidth, dstHeight, dstField},
                            kAllRows,
                            quality};
    return ScalePlanes(source, {call, nullptr, 0, static_cast<uint8_t*>(dst), dstRowBytes});
}
