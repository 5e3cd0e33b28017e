// The general route: to a format that motion takes, through it, and on to a stream.

#include "frame/TransientMemory.h"
#include "scale/MotionPlan.h"
#include "scale/ScaleRun.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/Motion.h>

#include <optional>

namespace PK {
namespace {

PK_Result Place(const ScaleJob& job, PK_Point scale) {
    const auto& [from, to, renderField, quality] = job.call;
    constexpr PK_Point kCentre = {0.5f, 0.5f};
    constexpr double kRotation = 0, kSoftness = 0;
    constexpr float kOpacity = 1;
    constexpr bool kComposites = false, kSmoothEdges = false, kCompositesInLinear = true;
    return PK_Motion(job.source, job.sourceRowBytes, from.width, from.height, from.format, from.field,
                     nullptr, job.destination, job.destinationRowBytes, to.width, to.height, to.format,
                     to.field, 1, 1, kCentre, kCentre, scale, kRotation, kOpacity, kComposites, kSoftness,
                     kSmoothEdges, renderField, quality, kCompositesInLinear);
}

/// The stream gets what the buffer holds, even where motion failed: callers rely on the conversion's result. So the buffer is
/// black wherever motion writes nothing.
PK_Result RenderAndEncode(const ScaleJob& job, const MotionPlan& plan) {
    const auto& [format, width, height, field] = job.call.destination;
    const TransientPixelBuffer buffer(plan.format, width, height);
    if (buffer.Result() != PK_Success) return buffer.Result();
    if (const PK_Result result =
            PK_FillWithTransparentBlack(buffer.Pixels(), buffer.RowBytes(), width, height, plan.format))
        return result;
    ScaleJob rendering = job;
    rendering.call.destination.format = plan.format;
    rendering.destination = buffer.Pixels();
    rendering.destinationRowBytes = buffer.RowBytes();
    Place(rendering, plan.scale);
    return PK_Convert(buffer.Pixels(), buffer.RowBytes(), plan.format, job.destination,
                      job.destinationRowBytes, format, width, height, job.call.quality);
}

} // namespace

PK_Result RunScaleByMotion(const ScaleJob& given) {
    const MotionPlan plan = PlanMotion(given.call);
    ScaleJob job = given;
    std::optional<TransientPixelBuffer> buffer;
    if (plan.convertsSource) {
        const auto& [format, width, height, field] = given.call.source;
        buffer.emplace(plan.format, width, height);
        if (buffer->Result() != PK_Success) return buffer->Result();
        if (const PK_Result result =
                PK_Convert(job.source, job.sourceRowBytes, format, buffer->Pixels(), buffer->RowBytes(),
                           plan.format, width, height, job.call.quality))
            return result;
        job.call.source.format = plan.format;
        job.source = buffer->Pixels();
        job.sourceRowBytes = buffer->RowBytes();
    }
    if (plan.takesField) {
        // Motion's sources lie bottom-up: their last row in memory is row 0.
        if (job.call.source.field == 1) job.source += job.sourceRowBytes;
        if (const PK_Result result = TakeField(job)) return result;
    }
    return plan.rendersToBuffer ? RenderAndEncode(job, plan) : Place(job, plan.scale);
}

} // namespace PK
