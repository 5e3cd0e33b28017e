#pragma once

// Rows that are interpolated between two others along edges.

#include "primitives/KernelShapes.h"

namespace PK {

struct DeinterlaceKernels {
    // From the row above and the row below. The destination is neither.
    TwoRowKernel alphaLast8u, alphaLast15u, alphaLast32f;
    TwoRowKernel alphaFirst8u, alphaFirst15u, alphaFirst32f;

    static constexpr const char* kFamily = "Deinterlace";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DeinterlaceKernels& For();
};

} // namespace PK
