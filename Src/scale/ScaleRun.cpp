#include "scale/ScaleRun.h"

#include "scale/CopyPlanarField.h"
#include "scale/HalfSize.h"
#include "scale/ScaleTrace.h"

#include <PixelKiln/Convert.h>

namespace PK {
namespace {

PK_Result Convert(const ScaleJob& job) {
    const auto& [from, to, renderField, quality] = job.call;
    return PK_Convert(job.source, job.sourceRowBytes, from.format, job.destination, job.destinationRowBytes,
                      to.format, to.width, to.height, quality);
}

PK_Result RunOneField(const ScaleJob& job) {
    ScaleJob rest = job;
    const auto& [format, width, height, field] = job.call.source;
    if (FieldBeginsAtSecondRow(format, field)) rest.source += rest.sourceRowBytes;
    if (const PK_Result result = TakeField(rest)) return result;
    return RunScale(rest);
}

PK_Result RunDecoding(const ScaleJob& job) {
    return RunScaleDecoded(job, DecodeTargetOf(job.call), [&](const DestinationImage& picture) {
        return DecodeStream(job.Source(), job.call.source.field, picture, job.call.quality);
    });
}

} // namespace

PK_Result TakeField(ScaleJob& job) {
    const int64_t rowBytes = int64_t{2} * job.sourceRowBytes;
    if (rowBytes < INT32_MIN || rowBytes > INT32_MAX) return PK_ErrFailed;
    job.sourceRowBytes = static_cast<int32_t>(rowBytes);
    job.call = AfterOneField(job.call);
    return PK_Success;
}

PK_Result RunScale(const ScaleJob& job) {
    const auto& [from, to, renderField, quality] = job.call;
    const ScaleRoute route = ChooseScaleRoute(job.call);
    TraceScale(job.call, route);
    switch (route) {
    case ScaleRoute::Conversion:
        return Convert(job);
    case ScaleRoute::HalfSize:
        return HalveImage(job.Source(), from.field, job.Destination(), quality);
    case ScaleRoute::FieldOfPlanes:
        return CopyPlanarField(job.source, job.destination, from.format, from.width, from.height, from.field);
    case ScaleRoute::OneField:
        return RunOneField(job);
    case ScaleRoute::StraightDecoding:
        return DecodeStream(job.Source(), from.field, job.Destination(), quality);
    case ScaleRoute::Decoding:
        return RunDecoding(job);
    case ScaleRoute::Motion:
        break;
    }
    return RunScaleByMotion(job);
}

} // namespace PK
