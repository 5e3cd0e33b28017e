#pragma once

// Bytes scaled by alpha in integers: products by 255ths.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// Each 16-bit half divided by 255, to the nearest: exact for 0 to 65025, the range of a product of bytes.
inline I32 DivideHalvesBy255(I32 halves) {
    return MultiplyHalvesHigh(halves + Ints(0x00800080), Ints(0x01010101));
}

/// Moves the byte in each half towards that half of kZeros by the alpha in that half: nearest((c x a + zero x (255 - a)) /
/// 255). This is nearest((c - zero) x (a x 0.003921569) + zero) for all 65,536 pairs, since a product of two
/// bytes is never near half of 255.
template <int32_t kZeros>
inline I32 ScaleHalves(I32 halves, I32 alpha) {
    const I32 product = MultiplyHalves(halves, alpha);
    if constexpr (kZeros == 0)
        return DivideHalvesBy255(product);
    else
        return DivideHalvesBy255(product + MultiplyHalves(Ints(kZeros), Ints(0x00ff00ff) - alpha));
}

inline I32 InBothHalves(I32 byte) {
    return byte | ShiftLeft<16>(byte);
}

/// Scales the four bytes of each lane by `alpha` towards zeros of their own, given for the two even and the two odd bytes.
template <int32_t kEvenZeros = 0, int32_t kOddZeros = 0>
inline I32 ScaleBytes(I32 pixels, I32 alpha) {
    const I32 low = Ints(0x00ff00ff);
    const I32 alphas = InBothHalves(alpha);
    const I32 even = ScaleHalves<kEvenZeros>(pixels & low, alphas);
    const I32 odd = ScaleHalves<kOddZeros>(ShiftRight<8>(pixels) & low, alphas);
    return even | ShiftLeft<8>(odd);
}

/// nearest(a x b / 255) of two bytes.
inline I32 MultiplyBytes(I32 a, I32 b) {
    return DivideHalvesBy255(MultiplyHalves(a, b));
}

// The zeros of two bytes in halves.
inline constexpr int32_t kChromaZeros = 0x00800080, kLumaZeros = 0x00100010;

} // namespace PK::PK_TARGET
