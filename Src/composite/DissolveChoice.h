#pragma once

// How two images are dissolved into a third: by what kernel, in what format.

#include "composite/MixPlan.h"

namespace PK {

struct DissolveChoice {
    MixKernel kernel; ///< Takes the weight of the first image, 1 - ratio.
    PK_PixelFormat working;
};

/// \param given    raster formats.
/// \param quality  2 keeps the destination's depth.
DissolveChoice ChooseDissolve(const MixFormats& given, int32_t quality);

} // namespace PK
