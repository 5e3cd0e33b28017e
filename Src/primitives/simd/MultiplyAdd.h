#pragma once

// Multiplication and addition in one: rounded once where the target has fused arithmetic, as two operations elsewhere.
// Only kernels whose results may differ between targets use it.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// a b + c
inline F32 MultiplyAdd(F32 a, F32 b, F32 c) {
#ifdef __FMA__
    return {_mm256_fmadd_ps(a.v, b.v, c.v)};
#else
    return a * b + c;
#endif
}

} // namespace PK::PK_TARGET
