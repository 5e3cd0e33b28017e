#pragma once

// Row kernels between the planes of DV and pixels. Kernel sources include this header, so it holds nothing that the compiler
// could emit once per instruction set.

#include "primitives/KernelShapes.h"

namespace PK {

/// A row of 4:1:1 chroma has a sample c for four pixels, on the first of them, of which n is the next; behind the last it is
/// repeated. Nothing is rounded.
struct DVRowKernels {
    RowKernel spread;  ///< A chroma for each pixel: c, (3 c + n) >> 2, (2 c + 2 n) >> 2, (c + 3 n) >> 2.
    RowKernel spread2; ///< A chroma for each pair: the first and the third of these. The width counts pairs.
    RowKernel repeat;  ///< A chroma for each pair: c, c.

    /// A luma and a chroma of each kind for each pixel; opaque.
    PlanesRow toVUYX;

    /// VUYX to BGRX, opaque, by the decoder's own decimals of BT.601. The rows may be the same one.
    RowKernel toBGRX;

    static constexpr const char* kFamily = "DVRow";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVRowKernels& For(); // DVRows.kernels.cpp
};

} // namespace PK
