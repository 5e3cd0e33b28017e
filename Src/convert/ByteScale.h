#pragma once

// Bytes scaled by alpha in integers, for every kernel that premultiplies 8-bit pixels.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// Each 16-bit half divided by 255, to the nearest: exact for 0 to 65025, the range of a product of bytes.
inline I32 DivideHalvesBy255(I32 halves) {
    return MultiplyHalvesHigh(halves + Ints(0x00800080), Ints(0x01010101));
}

/// Moves the byte in each half towards `zero` by the alpha in that half: nearest((c x a + zero x (255 - a)) /
/// 255). This is nearest((c - zero) x (a x 0.003921569) + zero) for all 65,536 pairs, since a product of two
/// bytes is never near half of 255.
inline I32 ScaleHalves(I32 halves, I32 alpha, I32 zero) {
    const I32 rest = Ints(0x00ff00ff) - alpha;
    return DivideHalvesBy255(MultiplyHalves(halves, alpha) + MultiplyHalves(zero, rest));
}

inline I32 InBothHalves(I32 byte) {
    return byte | ShiftLeft<16>(byte);
}

/// Scales the four bytes of each lane by `alpha`, towards 0.
inline I32 ScaleBytes(I32 pixels, I32 alpha) {
    const I32 low = Ints(0x00ff00ff);
    const I32 alphas = InBothHalves(alpha);
    const I32 even = DivideHalvesBy255(MultiplyHalves(pixels & low, alphas));
    const I32 odd = DivideHalvesBy255(MultiplyHalves(ShiftRight<8>(pixels) & low, alphas));
    return even | ShiftLeft<8>(odd);
}

inline I32 ChromaZero() {
    return Ints(0x00800080);
}
inline I32 LumaZero() {
    return Ints(0x00100010);
}

} // namespace PK::PK_TARGET
