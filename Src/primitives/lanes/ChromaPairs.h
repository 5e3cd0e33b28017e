#pragma once

// Pairs of 4:2:2 pixels in lanes, and their conversion to pixels with chroma of their own.

#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {

/// One pair a lane, at 8 or 10 bits: U in the low and V in the high half of `chroma`, the even pixel's luma
/// in the low and the odd pixel's in the high half of `luma`.
struct PixelPairs {
    I32 chroma;
    I32 luma;
};

template <bool kLumaFirst>
inline PixelPairs LoadPairs(const uint8_t* source) {
    const I32 pairs = LoadInts(source);
    const I32 first = pairs & Ints(0x00ff00ff);
    const I32 second = ShiftRight<8>(pairs) & Ints(0x00ff00ff);
    return kLumaFirst ? PixelPairs{second, first} : PixelPairs{first, second};
}

/// The chroma between two pairs, in halves of at most 15 bits.
template <bool kRoundUp>
inline I32 AverageChroma(I32 a, I32 b) {
    const I32 sum = kRoundUp ? a + b + Ints(0x00010001) : a + b;
    return ShiftRight<1>(sum) & Ints(0x7fff7fff);
}

/// V, U, Y and an opaque alpha.
inline IntChannels OpaqueChannels(I32 chroma, I32 luma) {
    return {ShiftRight<16>(chroma), chroma & Ints(0xffff), luma, Ints(255)};
}

/// The even pixel has the chroma of its pair, the odd one the average with the next pair. Pixel::Pack makes
/// the destination's four bytes from chroma in halves and a pixel's luma.
template <class Pixel, bool kRoundUp>
inline void UpsampleInBlocks(PixelPairs pairs, I32 nextChroma, I32& low, I32& high) {
    const I32 between = AverageChroma<kRoundUp>(pairs.chroma, nextChroma);
    InterleaveInBlocks(Pixel::Pack(pairs.chroma, pairs.luma & Ints(0xffff)),
                       Pixel::Pack(between, ShiftRight<16>(pairs.luma)), low, high);
}

struct PixelVUYX {
    static I32 Pack(I32 chroma, I32 luma) {
        const I32 vu = MultiplyAddHalves(chroma, Ints(0x100 | 1 << 16)); // 256 U + V
        return vu | ShiftLeft<16>(luma) | Ints(-0x1000000);
    }
};

/// U, Y0, V, Y1 with a pair a block, to the even or the odd pixel's V, U, Y and an opaque alpha.
template <int kLuma>
inline F32 PixelsOfPairs(F32 uyvy) {
    return BlendBlocks<0b0111>(ShufflePixel<2, 0, kLuma, 3>(uyvy), Floats(1));
}

/// 8-bit 4:2:2 to pixels of four bytes. The vector form from SSSE3 up rounds the average up, the plain form
/// and SSE2 truncate: this is deliberate, hosts compare against both.
template <bool kLumaFirst, class Pixel>
struct UpsamplePairs : Groups<2 * kLanes, Each<4>, Neighbours<Each<4, 2>, 0, 1>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 nextChroma = LoadPairs<kLumaFirst>(source + 4).chroma;
        I32 low, high;
        UpsampleInBlocks<Pixel, kHasByteShuffle>(LoadPairs<kLumaFirst>(source), nextChroma, low, high);
        StoreBlocksInTurns(destination, low, high);
    }
};

} // namespace PK::PK_TARGET
