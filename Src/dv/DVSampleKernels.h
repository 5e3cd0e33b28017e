#pragma once

// How the encoders of DV take samples from pixels. Kernel sources include this header.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// Where the samples of 16 x 8 pixels of 4:2:2 go, as blocks.
struct DVSampleBlocks {
    int16_t *luma, *cb, *cr;
    int32_t lumaStride; ///< Values from the left block of luma to the right one.
    int32_t bits;       ///< Samples less 128 are taken 2^bits times.
};

struct DVSampleKernels {
    using Load = void (*)(const uint8_t* pixels, int64_t rowBytes, const DVSampleBlocks& blocks);
    Load loadYUYV, loadUYVY;

    static constexpr const char* kFamily = "DVSample";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVSampleKernels& For();
};

} // namespace PK
