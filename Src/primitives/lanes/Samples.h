#pragma once

// Sample encodings that several kernel sources share: how 8-bit samples expand to float and pack back.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

inline constexpr float kReciprocal255 = 0x1.010102p-8f; // 0x3b808081, 1 / 255 rounded to nearest
inline constexpr float kReciprocal224 = 0x1.24924ap-8f; // 0x3b924925, 1 / 224
inline constexpr float kReciprocal219 = 0x1.2b404ap-8f; // 0x3b95a025, 1 / 219

/// Interleaved codes of RGB in any order to float: from 0 to 1.
inline F32 ExpandBGRA(F32 codes) {
    return codes * Floats(kReciprocal255);
}

/// Interleaved V, U, Y, A codes to float: chroma about 0, luma and alpha from 0 to 1.
inline F32 ExpandVUYA(F32 codes) {
    // Added, not subtracted: alpha minus 0 would be -0 at code 0 when rounding down.
    return (codes + PixelFloats(-128, -128, -16, 0)) *
           PixelFloats(kReciprocal224, kReciprocal224, kReciprocal219, kReciprocal255);
}

/// Limits x to 0 and 1; NaN becomes 0.
inline F32 LimitToUnit(F32 x) {
    return Min(Max(x, Floats(0)), Floats(1));
}

} // namespace PK::PK_TARGET
