#pragma once

// A scale-and-convert call with its memory, and the routes that it takes.

#include "convert/Image.h"
#include "frame/TransientMemory.h"
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

/// Decodes to a buffer of the target, which then stands for the source and goes its own way.
/// \param decode  takes the DestinationImage of the buffer and returns a PK_Result.
template <class Decode>
PK_Result RunScaleDecoded(const ScaleJob& job, const DecodeTarget& target, const Decode& decode) {
    const TransientPixelBuffer buffer(target.format, target.width, target.height);
    if (buffer.Result() != PK_Success) return buffer.Result();
    const DestinationImage picture = {buffer.Pixels(), buffer.RowBytes(), target.format, target.width,
                                      target.height};
    if (const PK_Result result = decode(picture)) return result;
    ScaleJob rest = job;
    rest.call = AfterDecoding(job.call, target);
    rest.source = buffer.Pixels();
    rest.sourceRowBytes = buffer.RowBytes();
    return RunScale(rest);
}

/// By PK_Motion.
PK_Result RunScaleByMotion(const ScaleJob& job);

/// Every second row of the source, from the first that it has now, stands for it as a progressive image.
/// \return PK_ErrFailed where twice the row bytes cannot be told in 32 bits.
PK_Result TakeField(ScaleJob& job);

} // namespace PK
