#pragma once

// The samples of V210 in lanes. A group of six pixels is four words of three samples, in the order of UYVY.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

inline constexpr int32_t kV210Groups = kLanes / 4; // of six pixels in a vector

// Sample s of a group stands in word s / 3 at bit 10 (s % 3), that is in the 16 bits from byte
// 4 (s / 3) + s % 3 on, at bit 0, 2 or 4 of them. A multiplication moves it to bit kBit; what stands around
// it are bits of its neighbours.

/// The even samples of a group, two a lane: the chroma of its three pairs. The fourth lane is meaningless.
template <int kBit>
inline I32 EvenSamplesAt(I32 words) {
    constexpr int32_t from0 = 1 << kBit, from2 = from0 >> 2, from4 = from0 >> 4;
    return MultiplyHalves(HalvesAt<0, 2, 5, 8, 10, 13, 0, 0>(words),
                          PixelInts(from0 | from4 << 16, from2 | from0 << 16, from4 | from2 << 16, 0));
}

/// The odd samples likewise: the lumas of the pairs. Of words that start one word later, they are the chroma
/// of the pairs that follow.
template <int kBit>
inline I32 OddSamplesAt(I32 words) {
    constexpr int32_t from0 = 1 << kBit, from2 = from0 >> 2, from4 = from0 >> 4;
    return MultiplyHalves(HalvesAt<1, 4, 6, 9, 12, 14, 0, 0>(words),
                          PixelInts(from2 | from0 << 16, from4 | from2 << 16, from0 | from4 << 16, 0));
}

/// Samples at bit 4, cut down to their kBits highest bits.
template <int kBits>
inline I32 HighBits(I32 samplesAt4) {
    return ShiftRight<14 - kBits>(samplesAt4) & Ints(((1 << kBits) - 1) * 0x10001);
}

} // namespace PK::PK_TARGET
