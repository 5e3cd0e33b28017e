#pragma once

// What the scale-and-convert calls answer before they touch memory.

#include "convert/RasterFormats.h"
#include "frame/Arguments.h"

namespace PK {

/// A raster format, DV or planar 4:2:0, by kind and structure. What else a stream is told of, its codec looks at.
constexpr bool IsScalable(PK_PixelFormat format) {
    const bool isDV = StreamKind(format) <= kStreamLastDV && StructureOf(format) == kStructureDV;
    return IsRasterFormat(format) || Is420Planar(format) || (IsStream(format) && isDV);
}

/// The result where one of the images has no pixels or cannot have any.
constexpr std::optional<PK_Result> ResultOfSizes(int32_t sourceWidth, int32_t sourceHeight,
                                                 int32_t destinationWidth, int32_t destinationHeight) {
    const int32_t least = std::min({sourceWidth, sourceHeight, destinationWidth, destinationHeight});
    if (least < 0 || std::max(sourceWidth, destinationWidth) > kMaximumWidth) return PK_ErrFailed;
    if (least == 0) return PK_Success;
    return std::nullopt;
}

} // namespace PK
