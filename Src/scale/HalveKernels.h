#pragma once

// Rows of 4:2:2 at half their width: a pixel of four channels for each pair.

#include "primitives/KernelShapes.h"

namespace PK {

/// V, U, the luma of the even pixel, and an opaque alpha; nothing is filtered. The width is that of the destination: so
/// many pairs are taken, in V210 three of each group of six pixels.
struct HalveKernels {
    RowKernel HalveRowV210; ///< The samples' high 8 bits.
    RowKernel HalveRowUYVY32f;
    RowKernel HalveRowUYVY8u;
    RowKernel HalveRowYUYV8u;

    static constexpr const char* kFamily = "Halve";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const HalveKernels& For();
};

} // namespace PK
