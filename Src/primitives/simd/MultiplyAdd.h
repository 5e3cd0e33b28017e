#pragma once

// Multiplication and addition in one: rounded once where the target has fused arithmetic, as two operations elsewhere.
// Only kernels whose results may differ between targets use it.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// a b + c
template <class Vector>
inline Vector MultiplyAdd(Vector a, Vector b, Vector c) {
    if constexpr (kTarget == Target::avx2fma)
        return {_mm256_fmadd_ps(a.v, b.v, c.v)};
    else
        return a * b + c;
}

} // namespace PK::PK_TARGET
