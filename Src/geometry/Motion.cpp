// PK_Motion and PK_MotionWithBlendMode: what they refuse, and the way of interlaced sources at the highest quality, which
// are made progressive first.

#include <PixelKiln/Deinterlace.h>
#include <PixelKiln/Motion.h>

#include "convert/RasterFormats.h"
#include "frame/Arguments.h"
#include "frame/SharedRandom.h"
#include "frame/TransientMemory.h"
#include "geometry/MotionFields.h"
#include "geometry/MotionJob.h"
#include "primitives/Thresholds.h"

#include <tuple>

namespace PK {
namespace {

constexpr int32_t kHighestQuality = 5, kBilinearQuality = 4;

bool Lies(const PK_Rect& crop, const SourceImage& image) {
    return crop.left >= 0 && crop.top >= 0 && crop.left < crop.right && crop.top < crop.bottom &&
           crop.right <= image.width && crop.bottom <= image.height;
}

/// Scaling at the highest quality is for one format.
bool IsTaken(PK_PixelFormat source, PK_Point scale, int32_t quality) {
    if (quality == kHighestQuality && (scale.x != 1 || scale.y != 1))
        return source == PK_PixelFormat_BGRP_4444_32f_Linear;
    return IsRasterFormat(source) && IsPacked4444(source);
}

bool IsPremultipliedRGBFloat(PK_PixelFormat format) {
    return !IsYUV(format) && AlphaOf(format) == kAlphaPremultiplied && DepthOf(format) == kDepth32f;
}

/// The source made progressive, to be placed by jobs of their own.
class ProgressiveSource {
public:
    explicit ProgressiveSource(const MotionJob& job)
        : fJob(job), fFrame(job.source.format, job.source.width, job.source.height) {}

    PK_Result Result() const { return fFrame.Result(); }

    /// \param rebuildsTop  whether rows 0, 2, 4 and so on are made of the others.
    PK_Result Run(bool rebuildsTop, int32_t renderField) const {
        const auto& [pixels, rowBytes, format, width, height] = fJob.source;
        const int64_t length = PK_PixelFormatPackedRowBytes(format, width);
        for (int32_t row = 0; row < height; ++row)
            PK_CopyMemory(fFrame.Pixels() + int64_t{row} * fFrame.RowBytes(), fJob.source.Row(row),
                          static_cast<uint64_t>(length));
        if (const PK_Result result = PK_Deinterlace(fFrame.Pixels(), fFrame.RowBytes(), format, width, height,
                                                    rebuildsTop ? 1 : 0, fJob.quality))
            return result;
        MotionJob job = fJob;
        job.source.pixels = fFrame.Pixels();
        job.source.rowBytes = fFrame.RowBytes();
        job.sourceField = 0;
        job.renderField = renderField;
        return RunMotion(job);
    }

private:
    const MotionJob& fJob;
    TransientPixelBuffer fFrame;
};

PK_Result RunDeinterlaced(const MotionJob& job) {
    const ProgressiveSource source(job);
    if (source.Result() != PK_Success) return source.Result();
    const bool keepsTop = job.sourceField == 1; // for what comes first
    const int32_t first = job.destinationField == 1 ? 1 : 2, second = 3 - first;
    if (job.renderField != 0 || !IsInterlaced(job.destinationField)) {
        const bool isSecond =
            IsInterlaced(job.renderField) && job.renderField == second && IsInterlaced(job.destinationField);
        return source.Run(isSecond ? keepsTop : !keepsTop, job.renderField);
    }
    if (const PK_Result result = source.Run(!keepsTop, first)) return result;
    return source.Run(keepsTop, second);
}

PK_Result Place(MotionJob job, const PK_Rect* crop) {
    if (crop != nullptr && !Lies(*crop, job.source)) return PK_ErrBadRect;
    job.crop = crop != nullptr ? *crop : PK_Rect{0, 0, job.source.width, job.source.height};
    if (!IsTaken(job.source.format, job.geometry.scale, job.quality)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(job.destination.format)) return PK_ErrBadDstFormat;
    if (job.softness < 0 || job.softness > 1) return PK_ErrBadMotionParameter;
    const PK_Point scale = job.geometry.scale;
    if (job.opacity < kNegligible || scale.x < kNegligible || scale.y < kNegligible) return PK_Success;
    for (const auto& [width, height, pixels] :
         {std::tuple{job.source.width, job.source.height, job.source.pixels},
          {job.destination.width, job.destination.height,
           static_cast<const uint8_t*>(job.destination.pixels)}})
        if (const auto result = ResultWithoutWork(width, height, {pixels}, BelowZero::Refused))
            return *result;

    if (job.quality > kBilinearQuality && !IsPremultipliedRGBFloat(job.source.format))
        job.quality = kBilinearQuality;
    if (job.blendMode == PK_BlendMode_Dissolve) SeedSharedRandom(1);
    if (job.quality == kHighestQuality && IsInterlaced(job.sourceField)) return RunDeinterlaced(job);
    return RunMotion(job);
}

/// A place with y from the top.
PK_Point FromTop(PK_Point place) {
    return {place.x, 1 - place.y};
}

} // namespace
} // namespace PK

using namespace PK;

namespace {

PK_Result Place(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                PK_PixelFormat srcFormat, int32_t srcField, const PK_Rect* srcRect, void* dst,
                int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                int32_t dstField, uint32_t aspectNum, uint32_t aspectDen, PK_Point position, PK_Point anchor,
                PK_Point scale, double rotation, float opacity, bool composite, double softness,
                bool smoothEdges, int32_t renderField, PK_BlendMode blendMode, int32_t quality,
                bool compositeInLinear) {
    return PK::Place({{static_cast<const uint8_t*>(src), srcRowBytes, srcFormat, srcWidth, srcHeight},
                      srcField,
                      {},
                      {static_cast<uint8_t*>(dst), dstRowBytes, dstFormat, dstWidth, dstHeight},
                      dstField,
                      {srcWidth, srcHeight, dstWidth, dstHeight, aspectNum, aspectDen, FromTop(position),
                       FromTop(anchor), scale, rotation},
                      opacity,
                      composite,
                      softness,
                      smoothEdges,
                      renderField,
                      blendMode,
                      quality,
                      compositeInLinear},
                     srcRect);
}

} // namespace

PK_Result PK_Motion(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                    PK_PixelFormat srcFormat, int32_t srcField, const PK_Rect* srcRect, void* dst,
                    int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                    int32_t dstField, uint32_t aspectNum, uint32_t aspectDen, PK_Point position,
                    PK_Point anchor, PK_Point scale, double rotation, float opacity, bool composite,
                    double softness, bool smoothEdges, int32_t renderField, int32_t quality,
                    bool compositeInLinear) noexcept {
    return ::Place(src, srcRowBytes, srcWidth, srcHeight, srcFormat, srcField, srcRect, dst, dstRowBytes,
                   dstWidth, dstHeight, dstFormat, dstField, aspectNum, aspectDen, position, anchor, scale,
                   rotation, opacity, composite, softness, smoothEdges, renderField, PK_BlendMode_Normal,
                   quality, compositeInLinear);
}

PK_Result PK_MotionWithBlendMode(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                                 PK_PixelFormat srcFormat, int32_t srcField, const PK_Rect* srcRect,
                                 void* dst, int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight,
                                 PK_PixelFormat dstFormat, int32_t dstField, uint32_t aspectNum,
                                 uint32_t aspectDen, PK_Point position, PK_Point anchor, PK_Point scale,
                                 double rotation, float opacity, double softness, bool smoothEdges,
                                 int32_t renderField, PK_BlendMode blendMode, int32_t quality,
                                 bool compositeInLinear) noexcept {
    return ::Place(src, srcRowBytes, srcWidth, srcHeight, srcFormat, srcField, srcRect, dst, dstRowBytes,
                   dstWidth, dstHeight, dstFormat, dstField, aspectNum, aspectDen, position, anchor, scale,
                   rotation, opacity, true, softness, smoothEdges, renderField, blendMode, quality,
                   compositeInLinear);
}
