#pragma once

// Counting and scaling of the coefficients of blocks, around the transforms and the quantisation of DV.

#include "primitives/KernelShapes.h"

namespace PK {

/// The bodies of one target. They check nothing but the count; a caller with many blocks takes
/// Best<CoefficientKernels>() once and calls these.
struct CoefficientKernels {
    uint32_t (*countZeros8x8)(const int16_t* block);
    RowKernelWith<int32_t> multiplyScaled16s; ///< Factors, the data that they multiply, and the scale.

    static constexpr const char* kFamily = "Coefficient";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const CoefficientKernels& For();
};

/// Counts the zeros among the 64 values of a block.
/// \param count  set to a number from 0 to 64.
/// \return 0; -8 for a null pointer.
int32_t CountZeros8x8(const int16_t* block, uint32_t* count) noexcept;

/// data[i] = data[i] x factors[i] / 2^scale, rounded to the nearest integer, ties to the even one, whatever
/// the rounding mode, and saturated to 16 bits. The arrays must be the same one or not overlap.
/// \param count  elements; below 1 changes nothing.
/// \param scale  any number; a negative one multiplies by a power of 2.
/// \return 0; -8 for a null pointer.
int32_t MultiplyScaled16s(const int16_t* factors, int16_t* data, int32_t count, int32_t scale) noexcept;

} // namespace PK
