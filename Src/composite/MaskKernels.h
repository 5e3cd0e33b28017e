#pragma once

// Rows that are picked from two others by the bits of a mask.

#include "primitives/KernelShapes.h"

namespace PK {

/// The bits of a row, counted from the most significant of a byte.
struct MaskRow {
    const uint8_t* bytes;
    int32_t first; ///< The row's first bit, 0 to 7.
};

struct MaskKernels {
    /// Pixel i is that of the first row where bit i of the mask is set, else that of the second. Of the mask exactly the
    /// bytes with bits of the row are read.
    using Select = TwoRowKernelWith<MaskRow>;
    Select pixels4; // bytes of a pixel
    Select pixels8;
    Select pixels16;

    static constexpr const char* kFamily = "Mask";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const MaskKernels& For();
};

} // namespace PK
