#pragma once

// The rows of quarter-resolution scaling.

#include "primitives/KernelShapes.h"

namespace PK {

struct QuarterScaleKernels {
    /// out[i] = in[2 i] for `count` bytes; of the source 2 x count bytes are read.
    RowKernel evenBytes;

    /// Interleaves `pairs` pairs of luma samples with a sample of each chroma, luma first or chroma first.
    using Interleave = void (*)(const uint8_t* luma, const uint8_t* chroma1, const uint8_t* chroma2,
                                uint8_t* destination, int32_t pairs);
    Interleave lumaFirst;
    Interleave chromaFirst;

    static constexpr const char* kFamily = "QuarterScale";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const QuarterScaleKernels& For();
};

} // namespace PK
