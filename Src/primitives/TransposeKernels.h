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
    void (*pixels1)(const TransposeArea& area);
    void (*pixels2)(const TransposeArea& area);
    void (*pixels4)(const TransposeArea& area);
    void (*pixels8)(const TransposeArea& area);
    void (*pixels16)(const TransposeArea& area);
    RowKernel reverseRow; ///< four-byte pixels

    static constexpr const char* kFamily = "Transpose";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const TransposeKernels& For(); // Transpose.kernels.cpp
};

} // namespace PK
