#include "scale/ScaleRoute.h"

#include "frame/Fields.h"

#include <algorithm>
#include <iterator>

namespace PK {
namespace {

/// Below this quality rows, pixels and fields may be dropped.
constexpr int32_t kFilteringQuality = 3;

bool IsHalf(int32_t part, int32_t whole) {
    return int64_t{2} * part == whole;
}

bool IsHalfSize(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    return IsHalf(to.width, from.width) && IsHalf(to.height, from.height) && Is422(from.format) &&
           IsPacked4444(to.format) && renderField == 0 && to.field == 0 && quality < kFilteringQuality;
}

bool IsFieldOfPlanes(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    return from.format == to.format && Is420Planar(from.format) && from.width == to.width &&
           from.height / 2 == to.height && from.field == to.field && renderField == 0 &&
           quality < kFilteringQuality;
}

bool IsOneField(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    return quality < kFilteringQuality && renderField == 0 && to.height <= from.height / 2 &&
           from.height % 2 == 0 && IsInterlaced(from.field) && !IsInterlaced(to.field) &&
           !IsStream(from.format);
}

bool IsStraightDecoding(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    if (!IsStream(from.format) || renderField != 0) return false;
    const DecodeTarget target = DecodeTargetOf(call);
    if (target.format != to.format || target.width != to.width || target.height != to.height) return false;
    return from.field == to.field || (!IsInterlaced(to.field) && target.height < from.height);
}

bool IsDecoding(const ScaleCall& call) {
    return IsStream(call.source.format);
}

bool Always(const ScaleCall&) {
    return true;
}

struct Rule {
    ScaleRoute route;
    const char* name;
    bool (*applies)(const ScaleCall& call);
};

constexpr Rule kRules[] = {
    {ScaleRoute::Conversion, "conversion", IsConversionAlone},
    {ScaleRoute::HalfSize, "half size", IsHalfSize},
    {ScaleRoute::FieldOfPlanes, "field of planes", IsFieldOfPlanes},
    {ScaleRoute::OneField, "one field", IsOneField},
    {ScaleRoute::StraightDecoding, "straight decoding", IsStraightDecoding},
    {ScaleRoute::Decoding, "decoding", IsDecoding},
    {ScaleRoute::Motion, "motion", Always},
};

} // namespace

ScaleRoute ChooseScaleRoute(const ScaleCall& call) {
    return std::ranges::find_if(kRules, [&](const Rule& rule) { return rule.applies(call); })->route;
}

bool IsConversionAlone(const ScaleCall& call) {
    const auto& [from, to, renderField, quality] = call;
    return from.width == to.width && from.height == to.height && renderField == 0 &&
           (from.field == to.field || !IsInterlaced(from.field));
}

const char* NameOf(ScaleRoute route) {
    return std::ranges::find(kRules, route, &Rule::route)->name;
}

DecodeTarget DecodeTargetOf(const ScaleCall& call) {
    // A stream without a target of its own keeps what is wanted, and is refused by DecodeStream.
    const DecodeTarget wanted = {call.destination.format, call.destination.width, call.destination.height};
    DecodeTarget target = wanted;
    ChooseDecodeTarget({call.source.format, call.source.width, call.source.height}, wanted, call.quality,
                       target);
    return target;
}

ScaleCall AfterOneField(const ScaleCall& call) {
    ScaleCall rest = call;
    rest.source.height /= 2;
    rest.source.field = 0;
    return rest;
}

ScaleCall AfterDecoding(const ScaleCall& call, const DecodeTarget& target) {
    ScaleCall rest = call;
    const bool hasBothFields = target.height >= call.source.height;
    rest.source = {target.format, target.width, target.height, hasBothFields ? call.source.field : 0};
    return rest;
}

bool FieldBeginsAtSecondRow(PK_PixelFormat format, int32_t field) {
    return field == (PK_IsOriginTopLeft(format) ? 2 : 1);
}

} // namespace PK
