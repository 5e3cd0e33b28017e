#pragma once

// Where a row of motion's destination crosses the source.

#include "geometry/MotionSampleKernels.h"

#include <PixelKiln/Types.h>

namespace PK {

/// The stretch of a straight line that lies in a rectangle: position + t x step for t from \p t0 to \p t1.
/// \return false if there is none; t0 and t1 are then as they were. They may be infinite, or no numbers where a coordinate
///         is none.
bool ClipSpanToRect(const PK_Rect& rectangle, PK_Point position, PK_Point step, double& t0,
                    double& t1) noexcept;

} // namespace PK
