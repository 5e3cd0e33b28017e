#pragma once

// A scale-and-convert call with its memory, and the routes that it takes.

#include "convert/Image.h"
#include "scale/ScaleRoute.h"

namespace PK {

struct ScaleJob {
    ScaleCall call;
    const uint8_t* source;
    int32_t sourceRowBytes;
    uint8_t* destination;
    int32_t destinationRowBytes;

    SourceImage Source() const {
        const auto& [format, width, height, field] = call.source;
        return {source, sourceRowBytes, format, width, height};
    }
    DestinationImage Destination() const {
        const auto& [format, width, height, field] = call.destination;
        return {destination, destinationRowBytes, format, width, height};
    }
};

/// By the first route that takes it. Formats, sizes and pointers were checked.
PK_Result RunScale(const ScaleJob& job);

/// By PK_Motion.
PK_Result RunScaleByMotion(const ScaleJob& job);

/// Every second row of the source, from the first that it has now, stands for it as a progressive image.
/// \return PK_ErrFailed where twice the row bytes cannot be told in 32 bits.
PK_Result TakeField(ScaleJob& job);

} // namespace PK
