#pragma once

// The 1-2-1 chroma filter from 4:4:4 to UYVY, for the kernel that does only this and for those that bring the
// pixels into VUY on the way. A stage is a structure with
//
//   static I32 Pixels(const uint8_t* source)      kLanes four-byte source pixels as packed V, U, Y, A
//
// Chroma stands on the even pixel of a pair, so the filter looks back one pixel and never further ahead than
// the pair itself.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// V in the low and U in the high half of each lane.
inline I32 ChromaHalves(I32 vuya) {
    return (vuya & Ints(0xff)) | (ShiftLeft<8>(vuya) & Ints(0x00ff0000));
}

/// UYVY pairs of even and odd pixels and the odd pixels before them: chroma (l + 2 c + r + 2) >> 2.
inline I32 FilterPairs(I32 before, I32 even, I32 odd) {
    const I32 centre = ChromaHalves(even);
    const I32 sum = ChromaHalves(before) + centre + centre + ChromaHalves(odd) + Ints(0x00020002);
    const I32 chroma = ShiftRight<2>(sum) & Ints(0x00ff00ff);
    const I32 luma = (ShiftRight<8>(even) & Ints(0xff00)) | (ShiftLeft<8>(odd) & Ints(int32_t(0xff000000)));
    return luma | ShiftRight<16>(chroma) | ShiftLeft<16>(chroma);
}

/// 2 x kLanes pixels to kLanes pairs; `before` holds the last odd pixel before them in its last lane, and
/// receives their own.
inline I32 DownsampleGroup(I32 first, I32 second, I32& before) {
    I32 even, odd;
    SeparateLanes(first, second, even, odd);
    const I32 pairs = FilterPairs(ShiftInLane(before, odd), even, odd);
    before = odd;
    return pairs;
}

/// The last pixels of a row, fewer than a group. The lone last pixel of an odd width keeps its chroma and
/// stands for both lumas of its pair.
template <class Stage>
void DownsampleTail(const uint8_t* source, uint8_t* destination, int32_t width, I32 before) {
    alignas(32) uint32_t pixels[2 * kLanes] = {};
    std::memcpy(pixels, source, static_cast<size_t>(4 * width));
    Store(pixels, Stage::Pixels(reinterpret_cast<const uint8_t*>(pixels)));
    Store(pixels + kLanes, Stage::Pixels(reinterpret_cast<const uint8_t*>(pixels + kLanes)));

    alignas(32) uint32_t pairs[kLanes];
    Store(pairs, DownsampleGroup(LoadInts(pixels), LoadInts(pixels + kLanes), before));
    if (width % 2 != 0) {
        const I32 lone = Ints(static_cast<int32_t>(pixels[width - 1]));
        Store(pixels, FilterPairs(lone, lone, lone));
        pairs[width / 2] = pixels[0];
    }
    std::memcpy(destination, pairs, static_cast<size_t>((width + 1) / 2 * 4));
}

/// The first pixel of a row, as a stage leaves it: it is its own left neighbour.
template <class Stage>
I32 FirstPixel(const uint8_t* source) {
    alignas(32) uint32_t pixels[kLanes] = {};
    std::memcpy(pixels, source, 4);
    Store(pixels, Stage::Pixels(reinterpret_cast<const uint8_t*>(pixels)));
    return Ints(static_cast<int32_t>(pixels[0]));
}

template <class Stage>
void DownsampleRow(const void* sourceRow, void* destinationRow, int32_t width) {
    if (width <= 0) return;
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    I32 before = FirstPixel<Stage>(source);
    for (; width >= 2 * kLanes; width -= 2 * kLanes) {
        const I32 first = Stage::Pixels(source);
        const I32 second = Stage::Pixels(source + 4 * kLanes);
        Store(destination, DownsampleGroup(first, second, before));
        source += 8 * kLanes;
        destination += 4 * kLanes;
    }
    if (width > 0) DownsampleTail<Stage>(source, destination, width, before);
}

} // namespace PK::PK_TARGET
