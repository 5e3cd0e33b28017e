#pragma once

// The share of a matte colour in a row, and the row without it.

#include "primitives/KernelShapes.h"

namespace PK {

/// A pixel of 4, 8 or 16 bytes.
struct MattePixel {
    alignas(16) uint8_t bytes[16];
};

/// Of pixels at 8u, 15u and 32f with alpha last, and with alpha first.
struct MatteKernels {
    /// The pixel of the matte with the complement of each pixel's alpha.
    using Complement = RowKernelWith<MattePixel>;
    Complement complement8u, complement8uAlphaFirst, complement15u, complement15uAlphaFirst, complement32f,
        complement32fAlphaFirst;

    /// The first row without the second, where that is less, else 0; with the alpha of the first.
    using Remove = TwoRowKernel;
    Remove remove8u, remove8uAlphaFirst, remove15u, remove15uAlphaFirst, remove32f, remove32fAlphaFirst;

    static constexpr const char* kFamily = "Matte";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const MatteKernels& For();
};

} // namespace PK
