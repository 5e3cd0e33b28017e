#pragma once

// Bytes scaled by alpha in integers, for every kernel that premultiplies 8-bit pixels.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// Each 16-bit half divided by 255, to the nearest: exact for 0 to 65025, the range of a product of bytes.
inline I32 DivideHalvesBy255(I32 halves) {
    const I32 biased = halves + Ints(0x00800080);
    return ShiftRight<8>(biased + (ShiftRight<8>(biased) & Ints(0x00ff00ff))) & Ints(0x00ff00ff);
}

/// Moves each byte of `pixels` towards the byte of `zero` by alpha, a copy of which stands in both halves of
/// `alpha`: nearest((c x a + zero x (255 - a)) / 255). This is nearest((c - zero) x (a x 0.003921569) + zero)
/// for all 65,536 pairs, since a product of two bytes is never near half of 255.
template <int32_t kEvenZero, int32_t kOddZero>
inline I32 ScaleBytes(I32 pixels, I32 alpha) {
    const I32 low = Ints(0x00ff00ff);
    const I32 rest = low - alpha;
    const I32 even = MultiplyHalves(pixels & low, alpha) + MultiplyHalves(Ints(kEvenZero), rest);
    const I32 odd = MultiplyHalves(ShiftRight<8>(pixels) & low, alpha) + MultiplyHalves(Ints(kOddZero), rest);
    return DivideHalvesBy255(even) | ShiftLeft<8>(DivideHalvesBy255(odd));
}

inline I32 InBothHalves(I32 byte) {
    return byte | ShiftLeft<16>(byte);
}

/// Packed V, U, Y, A pixels: chroma is scaled about 128 and luma about 16; alpha stays.
inline I32 PremultiplyVUYA(I32 pixels) {
    const I32 colour = ScaleBytes<0x00100080, 0x00000080>(pixels, InBothHalves(ShiftRight<24>(pixels)));
    return Select(Ints(0x00ffffff), colour, pixels);
}

} // namespace PK::PK_TARGET
