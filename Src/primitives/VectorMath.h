#pragma once

// Powers, exponentials and truncating divisions of arrays. Kernels that have their operands in vectors call
// the functions of simd/Elementary.h, which these run along the arrays.
//
// Results are the same in all bodies. Those in float are rounded once, by the current rounding mode: in
// rounding to nearest they are within 0.501 units in the last place of the exact value.

#include "primitives/KernelShapes.h"

namespace PK {

/// The bodies of one target. They check nothing but the count.
struct VectorMathKernels {
    TwoRowKernel pow; ///< x, y and the result.
    RowKernel exp;    ///< The mask, and the values that change.
    TwoRowKernel divide;

    static constexpr const char* kFamily = "VectorMath";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const VectorMathKernels& For();
};

/// result[i] = x[i]^y[i], for x > 0. Further: 1^y and x^0 are 1 for every y and x, NaN included; 0 (of either
/// sign) and infinite operands give the limits; NaN otherwise, and for every x < 0, gives NaN.
/// \param result  x, y or an array that overlaps neither.
/// \param count   elements; below 1 writes nothing.
/// \return 0; -8 for a null pointer.
int32_t VectorPow(const float* x, const float* y, float* result, int32_t count) noexcept;

/// values[i] = e^values[i] where mask[i] has all bits set; the others stay as they are, to the bit. Infinity
/// and negative infinity give infinity and 0, NaN gives NaN.
/// \param mask    -1 or 0 in each element; must not overlap the values.
/// \param count   elements; below 1 writes nothing.
/// \return 0; -8 for a null pointer.
int32_t VectorExp(const int32_t* mask, float* values, int32_t count) noexcept;

/// quotients[i] = dividends[i] / divisors[i], truncated towards zero. Where 32 bits have no such number, which
/// is for a divisor of 0 and for INT32_MIN / -1, INT32_MIN.
/// \param quotients  one of the other arrays, or an array that overlaps neither.
/// \param count      elements; below 1 writes nothing.
/// \return 0; -8 for a null pointer.
int32_t VectorDivide(const int32_t* dividends, const int32_t* divisors, int32_t* quotients,
                     int32_t count) noexcept;

} // namespace PK
