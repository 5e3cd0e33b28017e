#pragma once

// Rows that are scaled by a gain. Kernel sources include this header.

#include "primitives/KernelShapes.h"

namespace PK {

/// Pixels of four channels, alpha last.
struct AlphaGainKernels {
    using Gain = RowKernelWith<float>;

    // Alpha alone: the colours keep their bits.
    Gain straight8u;
    Gain straight32f;

    // All channels: bytes about zero, bytes of V, U and Y about their zeros, floats.
    Gain premultipliedRGB8u;
    Gain premultipliedVUY8u;
    Gain premultiplied32f;

    static constexpr const char* kFamily = "AlphaGain";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const AlphaGainKernels& For();
};

} // namespace PK
