#pragma once

// Where an image is laid over black: the format for it, the kernel, and the ways to that format and from it.

#include "composite/BlackKernels.h"
#include "convert/ConversionChain.h"

namespace PK {

struct BlackPlan {
    PK_PixelFormat working = 0;
    BlackKernels::OverBlack overBlack = nullptr;
    ConversionChain in, out;

    /// \param isAtFullOpacity  whether the opacity is 1, for which there are more formats to work in.
    /// \return whether there are ways from the source to the destination.
    bool Build(PK_PixelFormat source, PK_PixelFormat destination, bool isAtFullOpacity, int32_t quality);
};

} // namespace PK
