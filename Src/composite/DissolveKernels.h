#pragma once

// Rows that are mixed by a weight.

#include "primitives/KernelShapes.h"

namespace PK {

struct DissolveKernels {
    /// The weight is that of the first row; the second has 1 - weight.
    using Mix = TwoRowKernelWith<float>;

    // Colours alone; the result is opaque. Alpha last and, in the second three, first in memory.
    Mix opaque8u, opaque15u, opaque32f;
    Mix opaqueAlphaFirst8u, opaqueAlphaFirst15u, opaqueAlphaFirst32f;
    // Colours weighted by their alpha.
    Mix straight8u, straight15u, straight32f;
    // Colours that are multiplied by their alpha.
    Mix premultiplied8u, premultiplied15u, premultiplied32f;
    // Groups of six pixels, sample by sample.
    Mix v210;

    static constexpr const char* kFamily = "Dissolve";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DissolveKernels& For();
};

} // namespace PK
