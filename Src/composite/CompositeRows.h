#pragma once

// What the composites share: what they refuse, and how their rows run.

#include "composite/MixPlan.h"
#include "convert/RasterFormats.h"
#include "frame/Arguments.h"
#include "frame/Bands.h"

namespace PK {

inline std::optional<PK_Result> ResultOfStreams(const MixFormats& formats) {
    if (IsStream(formats.first) || IsStream(formats.second)) return PK_ErrBadSrcFormat;
    if (IsStream(formats.destination)) return PK_ErrBadDstFormat;
    return std::nullopt;
}

/// The result where the formats are outside the catalogue, or there is nothing to do.
inline std::optional<PK_Result> ResultWithoutWork(const MixImages& images) {
    const auto& [first, second, destination] = images;
    if (!IsRasterFormat(first.format) || !IsRasterFormat(second.format)) return PK_ErrBadSrcFormat;
    if (!IsRasterFormat(destination.format)) return PK_ErrBadDstFormat;
    return ResultWithoutWork(destination.width, destination.height,
                             {first.pixels, second.pixels, destination.pixels});
}

/// Above 64 rows four bands as a task.
inline bool IsTask(const MixImages& images) {
    return images.destination.height > 64;
}

inline PK_Result RunInFourBands(const MixPlan& plan, const MixImages& images) {
    return RunInBands(images.destination.height, Bands::Count(4).AsTaskIf(IsTask(images)),
                      [&](int32_t firstRow, int32_t endRow) { return plan.Run(images, firstRow, endRow); });
}

} // namespace PK
