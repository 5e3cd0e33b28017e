#include "reference/ReferenceScaleRoute.h"

namespace PKReference {
namespace {

constexpr uint32_t kLinearBGRP = 0x10A;

bool IsField(int32_t field) {
    return field == 1 || field == 2;
}

bool IsPlanar420(uint32_t format) {
    const uint32_t kind = format >> 24;
    return (format & 1) == 1 && kind >= 9 && kind <= 12 && (format & 0x30) == 0x30;
}

bool IsOriginTopLeft(uint32_t format, bool allOriginsTopLeft) {
    const bool isPacked4444 = (format & 0x30) == 0 && (format & 0xC) != 0;
    return allOriginsTopLeft || !isPacked4444;
}

bool IsMotionReady(uint32_t format, int32_t quality, bool scaling) {
    if (quality == 5 && scaling) return format == kLinearBGRP;
    return (format & 0x30) == 0 && (format & 0xC) != 0 && (format & 0xFF000000) == 0;
}

ScaleTelling TellHalfSize(const ScaleNumbers& call) {
    ScaleTelling told;
    told.route = "half size";
    told.firstRow = call.srcField == 1 ? call.srcHeight - 2 : call.srcHeight - 1;
    told.secondRow = told.firstRow - 2;
    bool isFloat = false;
    if ((call.srcFormat & ~0x200u) == 0x851) {
        told.rowFunction = "HalveRowV210";
    } else if ((call.srcFormat & 0x1C0) == 0x100) {
        told.rowFunction = "HalveRowUYVY32f";
        isFloat = true;
    } else if ((call.srcFormat & 0x1000) == 0) {
        told.rowFunction = "HalveRowUYVY8u";
    } else {
        told.rowFunction = "HalveRowYUYV8u";
    }
    if ((call.srcFormat & 0x601) == 1)
        told.rowFormat = isFloat ? 0x909 : 0x809;
    else
        told.rowFormat = isFloat ? 0xB09 : 0xA09;
    return told;
}

ScaleTelling TellMotion(const ScaleNumbers& call, bool scaling) {
    ScaleTelling told;
    told.route = "motion";
    uint32_t working = call.srcFormat;
    if (!IsMotionReady(call.srcFormat, call.quality, scaling)) {
        if (IsMotionReady(call.dstFormat, call.quality, scaling)) {
            working = call.dstFormat;
        } else if (call.quality == 5 && scaling) {
            working = kLinearBGRP;
        } else {
            const uint32_t alpha = (call.srcFormat & 0xC) == 0 ? 0xC : call.srcFormat & 0xC;
            const uint32_t depth = call.quality < 3 ? 0 : 0x100;
            working = (call.srcFormat & 0xFFFFEE03) | alpha | depth;
        }
        told.sourceBuffer = working;
    }
    if ((call.dstFormat & 0xFF000000) != 0) told.destinationBuffer = working;
    int32_t height = call.srcHeight;
    if (call.srcWidth == call.dstWidth && call.srcHeight == 2 * call.dstHeight && IsField(call.srcField) &&
        !IsField(call.dstField)) {
        told.takesField = true;
        told.rowsSkipped = call.srcField == 1 ? 1 : 0;
        height = call.srcHeight / 2;
    }
    told.scaleX = static_cast<float>(call.dstWidth) / static_cast<float>(call.srcWidth);
    told.scaleY = static_cast<float>(call.dstHeight) / static_cast<float>(height);
    return told;
}

} // namespace

ScaleTelling TellScale(const ScaleNumbers& call, const DecodedPicture& decoded, bool allOriginsTopLeft) {
    ScaleTelling told;

    // 2
    if (call.srcWidth == call.dstWidth && call.srcHeight == call.dstHeight && call.fieldToRender == 0 &&
        (call.srcField == call.dstField || (call.srcField != 1 && call.srcField != 2))) {
        told.route = "conversion";
        return told;
    }

    // 3
    if (call.srcWidth == 2 * call.dstWidth && call.srcHeight == 2 * call.dstHeight &&
        (call.srcFormat & 0x30) == 0x10 && (call.dstFormat & 0x30) == 0 && (call.dstFormat & 0xC) != 0 &&
        call.fieldToRender == 0 && call.dstField == 0 && call.quality < 3)
        return TellHalfSize(call);

    // 4
    bool skipsOneField = false;
    if (call.srcFormat == call.dstFormat && IsPlanar420(call.srcFormat) && call.srcWidth == call.dstWidth &&
        call.srcHeight / 2 == call.dstHeight && call.srcField == call.dstField && call.fieldToRender == 0) {
        if (call.quality < 3) {
            told.route = "field of planes";
            return told;
        }
        skipsOneField = true;
    }

    // 5
    if (!skipsOneField && call.quality < 3 && call.fieldToRender == 0 &&
        call.dstHeight <= call.srcHeight / 2 && call.srcHeight % 2 == 0 && IsField(call.srcField) &&
        !IsField(call.dstField) && (call.srcFormat & 0xFF000000) == 0) {
        told.route = "one field";
        const bool isTopLeft = IsOriginTopLeft(call.srcFormat, allOriginsTopLeft);
        if (call.srcField == 2 && isTopLeft) told.rowsSkipped = 1;
        if (call.srcField == 1 && !isTopLeft) told.rowsSkipped = 1;
        told.next = call;
        told.next->srcHeight = call.srcHeight / 2;
        told.next->srcField = 0;
        return told;
    }

    // 6
    const bool scaling = call.dstWidth != call.srcWidth || call.dstHeight != call.srcHeight;
    if ((call.srcFormat & 0xFF000000) != 0) {
        if (decoded.format == call.dstFormat && decoded.width == call.dstWidth &&
            decoded.height == call.dstHeight && call.fieldToRender == 0 &&
            (call.srcField == call.dstField ||
             (!IsField(call.dstField) && decoded.height < call.srcHeight))) {
            told.route = "straight decoding";
            return told;
        }
        told.route = "decoding";
        told.next = call;
        told.next->srcFormat = decoded.format;
        told.next->srcWidth = decoded.width;
        told.next->srcHeight = decoded.height;
        told.next->srcField = decoded.height >= call.srcHeight ? call.srcField : 0;
        return told;
    }
    return TellMotion(call, scaling);
}

std::string ScaleTelling::Text() const {
    std::string text = route + ", " + rowFunction;
    for (const int64_t number :
         {int64_t{rowFormat}, int64_t{firstRow}, int64_t{secondRow}, int64_t{rowsSkipped},
          int64_t{sourceBuffer}, int64_t{destinationBuffer}, int64_t{takesField}})
        text += " " + std::to_string(number);
    text += " " + std::to_string(scaleX) + " " + std::to_string(scaleY);
    if (next)
        text += ", then " + std::to_string(next->srcWidth) + " x " + std::to_string(next->srcHeight) + " " +
                std::to_string(next->srcFormat) + " field " + std::to_string(next->srcField);
    return text;
}

} // namespace PKReference
