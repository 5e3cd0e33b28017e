#pragma once

// Rows and columns exchanged, in tiles of whole vectors.

#include "primitives/KernelShapes.h"

namespace PK {

/// The pixels of a source, rows first; a kernel writes `columns` destination rows of `rows` pixels each.
struct TransposeArea {
    const uint8_t* source;
    int64_t sourceStep; // bytes from row to row, of either sign
    uint8_t* destination;
    int64_t destinationStep;
    int32_t rows;
    int32_t columns;
};

struct TransposeKernels {
    using Run = void (*)(const TransposeArea& area);

    Run pixels1, pixels2, pixels4, pixels8, pixels16;
    RowKernel reverseRow; ///< four-byte pixels

    /// That of pixels of so many bytes; null where there is none.
    constexpr Run OfPixels(int32_t pixelBytes) const {
        switch (pixelBytes) {
        case 1:
            return pixels1;
        case 2:
            return pixels2;
        case 4:
            return pixels4;
        case 8:
            return pixels8;
        case 16:
            return pixels16;
        default:
            return nullptr;
        }
    }

    static constexpr const char* kFamily = "Transpose";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const TransposeKernels& For(); // Transpose.kernels.cpp
};

} // namespace PK
