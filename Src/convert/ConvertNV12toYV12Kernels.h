#pragma once

// The rows of a surface of interleaved chroma: read past the caches, and parted.

#include "primitives/KernelShapes.h"

namespace PK {

struct NV12Kernels {
    /// Copies `width` bytes. Whole lines of 64 bytes are read as such, once and in order: a surface in write-combining
    /// memory has no cache in front of it.
    RowKernel copySurface;

    /// first[k] = source[2 k] and second[k] = source[2 k + 1] for `pairs` pairs. Neither plane may overlap another row.
    using PartPairs = void (*)(const uint8_t* source, uint8_t* first, uint8_t* second, int32_t pairs);
    PartPairs partPairs;

    static constexpr const char* kFamily = "NV12";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const NV12Kernels& For(); // ConvertNV12toYV12.kernels.cpp
};

} // namespace PK
