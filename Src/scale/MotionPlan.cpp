#include "scale/MotionPlan.h"

#include "frame/Fields.h"

#include <initializer_list>

namespace PK {
namespace {

constexpr int32_t kHighestQuality = 5, kFloatQuality = 3;

/// At the highest quality motion scales one format alone.
bool ScalesLight(const ScaleCall& call) {
    return call.quality == kHighestQuality &&
           (call.source.width != call.destination.width || call.source.height != call.destination.height);
}

bool IsReadyForMotion(PK_PixelFormat format, bool scalesLight) {
    if (scalesLight) return format == PK_PixelFormat_BGRP_4444_32f_Linear;
    return IsPacked4444(format) && !IsStream(format);
}

PK_PixelFormat FormatForMotion(const ScaleCall& call) {
    const bool scalesLight = ScalesLight(call);
    for (const PK_PixelFormat format : {call.source.format, call.destination.format})
        if (IsReadyForMotion(format, scalesLight)) return format;
    if (scalesLight) return PK_PixelFormat_BGRP_4444_32f_Linear;
    const PK_PixelFormat source = call.source.format;
    const uint32_t alpha = AlphaOf(source) == kAlphaNone ? kAlphaMeaningless : AlphaOf(source);
    const uint32_t depth = call.quality < kFloatQuality ? kDepth8u : kDepth32f;
    return With(source, kStructureMask | kAlphaMask | kDepthMask | kOrderMask,
                kStructure444 | alpha | depth | kOrderBGRA);
}

} // namespace

MotionPlan PlanMotion(const ScaleCall& call) {
    const auto& [source, destination, renderField, quality] = call;
    MotionPlan plan = {};
    plan.format = FormatForMotion(call);
    plan.convertsSource = plan.format != source.format;
    plan.rendersToBuffer = IsStream(destination.format);
    plan.takesField = source.width == destination.width && source.height == int64_t{2} * destination.height &&
                      IsInterlaced(source.field) && !IsInterlaced(destination.field);
    const int32_t height = plan.takesField ? destination.height : source.height;
    plan.scale = {static_cast<float>(destination.width) / static_cast<float>(source.width),
                  static_cast<float>(destination.height) / static_cast<float>(height)};
    return plan;
}

} // namespace PK
