#pragma once

// One image to be placed in another, as the exported calls ask for it once their arguments are good.

#include "convert/Image.h"
#include "geometry/MotionPlacement.h"

#include <PixelKiln/BlendMode.h>

namespace PK {

struct MotionJob {
    SourceImage source; ///< as the caller has it in memory
    int32_t sourceField;
    PK_Rect crop; ///< of the source
    DestinationImage destination;
    int32_t destinationField;
    MotionGeometry geometry;
    float opacity;
    bool composites; ///< over the destination, by the blend mode
    double softness;
    bool smoothEdges;
    int32_t renderField; ///< 0 for all rows
    PK_BlendMode blendMode;
    int32_t quality;
    bool inLinear;
};

/// Draws the source. PK_ErrOutOfMemory where a row or the blurred image finds no memory.
PK_Result RunMotion(const MotionJob& job);

} // namespace PK
