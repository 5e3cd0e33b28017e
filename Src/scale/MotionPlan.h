#pragma once

// How a call that nothing shorter takes is brought before PK_Motion: what is converted before and after it, and what it is
// given.

#include "scale/ScaleRoute.h"

namespace PK {

struct MotionPlan {
    PK_PixelFormat format; ///< of the source that motion takes
    bool convertsSource;   ///< to a buffer of that format, of the source's size
    bool rendersToBuffer;  ///< of that format, which is encoded to the destination
    bool takesField;       ///< one field of the source is a progressive image for it
    PK_Point scale;
};

/// \param call  of route Motion.
MotionPlan PlanMotion(const ScaleCall& call);

} // namespace PK
