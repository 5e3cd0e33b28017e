// Draws a placed source: copied where it lies pixel on pixel, else sampled row by row, by passes over the fields.

#include "filters/ResampleKernel.h"
#include "frame/FloatMode.h"
#include "geometry/MotionBlur.h"
#include "geometry/MotionDrawer.h"
#include "geometry/MotionFields.h"
#include "geometry/MotionJob.h"
#include "geometry/MotionRows.h"
#include "geometry/MotionSource.h"
#include "primitives/Thresholds.h"

namespace PK {
namespace {

constexpr int32_t kCubicQuality = 5;
constexpr int32_t kKeysCubic = 2;  // kind of resample kernel
constexpr int32_t kSoftMargin = 4; // pixels around a blurred source, for its edge to fade

bool IsPureCopy(const MotionJob& job, const MotionPlacement& placement, bool needsBlur) {
    return !placement.IsRotated() && placement.IsUnscaled() && placement.IsCentred() && !needsBlur &&
           job.source.width == job.destination.width && job.source.height == job.destination.height &&
           job.sourceField == job.destinationField && static_cast<float>(job.softness) - kNegligible <= 0;
}

/// The crop is not looked at here.
PK_Result CopyWhole(const MotionJob& job) {
    const uint8_t* from = job.source.pixels;
    uint8_t* to = job.destination.pixels;
    int64_t fromStep = job.source.rowBytes, toStep = job.destination.rowBytes;
    int32_t height = job.source.height;
    if (job.renderField != 0) {
        const bool isTopLeft = PK_IsOriginTopLeft(job.destination.format), isFirst = job.renderField == 1;
        if (isFirst) from += fromStep;
        if (isFirst != isTopLeft) to += toStep;
        fromStep *= 2;
        toStep *= 2;
        height /= 2;
    }
    const bool haveSteps =
        fromStep == static_cast<int32_t>(fromStep) && toStep == static_cast<int32_t>(toStep);
    if (height > 1 && !haveSteps) return PK_ErrFailed;
    return MotionDrawer(job).Draw(from, static_cast<int32_t>(fromStep), job.source.format, to,
                                  static_cast<int32_t>(toStep), job.destination.format, job.source.width,
                                  height);
}

PK_Result DrawSharp(const MotionJob& job, const SourceImage& source, const MotionSteps& steps,
                    const MotionRows& rows) {
    const auto draw = [&](int32_t pass) {
        const MotionSourceRows from = ChooseMotionRows(job, source, 0, 0, pass);
        const PK_Point start = {steps.start.x, from.isSameLine ? steps.start.y : steps.start.y - 0.5f};
        return rows.Draw(from, start, pass);
    };
    if (!IsInterlaced(job.destinationField) || job.renderField != 0) return draw(job.renderField);
    if (const PK_Result result = draw(1)) return result;
    return draw(2);
}

PK_Point RowBefore(const MotionSteps& steps) {
    return {steps.start.x - steps.row.x, steps.start.y - steps.row.y};
}

PK_Result DrawBlurred(const MotionJob& job, const BlurredSource& source, const MotionSteps& steps,
                      const MotionRows& rows) {
    const auto draw = [&](int32_t pass, bool isOneOfTwo) {
        MotionSourceRows from;
        if (const PK_Result result = source.Blur(pass, from)) return result;
        return rows.Draw(from, isOneOfTwo && !from.isSameLine ? RowBefore(steps) : steps.start, pass);
    };
    if (!IsInterlaced(job.sourceField) || job.renderField != 0 || !IsInterlaced(job.destinationField))
        return draw(job.renderField, false);
    if (const PK_Result result = draw(1, true)) return result;
    return draw(2, true);
}

void Scale(ResampleKernel& kernel, float scale) {
    if (scale > 1)
        kernel.ScaleForUpSample(scale);
    else
        kernel.ScaleForDownSample(scale, scale);
}

ResampleTable TableOf(const ResampleKernel& kernel) {
    return {kernel.Weights(), kernel.Width()};
}

PK_Result DrawSampled(const MotionJob& job, const MotionPlacement& placement, const MotionBlur& blur,
                      bool needsBlur) {
    const int32_t marginX = job.smoothEdges && blur.x > 0 ? kSoftMargin : 0;
    const int32_t marginY = job.smoothEdges && blur.y > 0 ? kSoftMargin : 0;
    const PK_Rect box = placement.Reach(job.crop, marginX, marginY);
    if (box.left == box.right) return PK_Success; // as of a scale that is no number
    ResampleKernel kernelX(kKeysCubic), ownKernelY(kKeysCubic);
    const auto [scaleX, scaleY] = placement.Scale();
    ResampleKernel& kernelY = scaleX == scaleY ? kernelX : ownKernelY;
    if (job.quality == kCubicQuality) {
        Scale(kernelX, scaleX);
        if (&kernelY != &kernelX) Scale(kernelY, scaleY);
        if (kernelX.Width() < 1 || kernelY.Width() < 1) return PK_ErrOutOfMemory;
    }

    const SourceImage source = Reversed(job.source); // four channels are stored from the bottom
    const MotionSteps steps = ChooseMotionSteps(placement, box, IsInterlaced(job.sourceField));
    const PK_PixelFormat sampled =
        needsBlur ? WithAlpha(job.source.format, kAlphaPremultiplied) : job.source.format;
    MotionRows rows(job, FromTop(job.destination), box, steps, sampled, placement.IsRotated(),
                    TableOf(kernelX), TableOf(kernelY));
    if (const PK_Result result = rows.Build()) return result;
    if (!needsBlur) return DrawSharp(job, source, steps, rows);
    const BlurredSource blurred(job, source, blur, sampled, marginX, marginY);
    if (!blurred.HasMemory()) return PK_ErrOutOfMemory;
    return DrawBlurred(job, blurred, steps, rows);
}

} // namespace

PK_Result RunMotion(const MotionJob& job) {
    const FloatMode mode;
    const MotionPlacement placement(job.geometry);
    const MotionBlur blur =
        ChooseMotionBlur(placement, job.softness, job.sourceField, job.destinationField, job.quality);
    const bool needsBlur = blur.IsAny() && job.quality != kCubicQuality;
    if (IsPureCopy(job, placement, needsBlur)) return CopyWhole(job);
    return DrawSampled(job, placement, blur, needsBlur);
}

} // namespace PK
