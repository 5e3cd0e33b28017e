#pragma once

// The format in which an image is laid over another, and the kernel that does it.

#include "composite/MixPlan.h"

namespace PK {

struct CompositeChoice {
    MixFormats working;
    MixKernel kernel;
};

/// \param images    of raster formats.
/// \param inLinear  whether a destination in linear light is composited in linear light.
CompositeChoice ChooseComposite(const MixImages& images, bool inLinear);

} // namespace PK
