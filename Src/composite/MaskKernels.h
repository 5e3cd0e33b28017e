#pragma once

// Rows that are picked from two others by the bits of a mask.

#include "primitives/simd/Targets.h"

namespace PK {

struct MaskKernels {
    /// Pixel i is that of `first` where bit i of the mask is set, else that of `second`. Bits are counted from
    /// the most significant of a byte, beginning with bit `bit`, 0 to 7. The destination may be `first` or
    /// `second`. Of the mask exactly the bytes with bits of the row are read.
    using Select = void (*)(const uint8_t* first, const uint8_t* second, const uint8_t* mask, int32_t bit,
                            uint8_t* destination, int32_t width);
    Select pixels4; // bytes of a pixel
    Select pixels8;
    Select pixels16;

    template <Target>
    static const MaskKernels& For();
};

} // namespace PK
