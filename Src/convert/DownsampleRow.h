#pragma once

// The 1-2-1 chroma filter from 4:4:4 to UYVY, for the kernel that does only this and for those that bring the
// pixels into YUV on the way. A stage is a structure with
//
//   static void Load(const uint8_t* source, YUVPixels& first, YUVPixels& second)
//
// which brings 2 x kLanes four-byte pixels into YUV. Chroma stands on the even pixel of a pair, so the filter
// looks back one pixel and never further ahead than the pair itself.

#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {

/// kLanes pixels: U in the low and V in the high half of a lane, and Y.
struct YUVPixels {
    I32 chroma, luma;
};

/// A stage for what is YUV already.
struct PackedVUYA {
    static I32 Chroma(I32 vuya) {
        if constexpr (kHasByteShuffle)
            return HalvesAt<1, 0, 5, 4, 9, 8, 13, 12>(vuya) & Ints(0x00ff00ff);
        else
            return (ShiftRight<8>(vuya) & Ints(0xff)) | (ShiftLeft<16>(vuya) & Ints(0xff0000));
    }

    static YUVPixels Pixels(I32 vuya) { return {Chroma(vuya), ShiftRight<16>(vuya) & Ints(0xff)}; }

    static void Load(const uint8_t* source, YUVPixels& first, YUVPixels& second) {
        first = Pixels(LoadInts(source));
        second = Pixels(LoadInts(source + 4 * kLanes));
    }
};

/// UYVY pairs, with chroma (l + 2 c + r + 2) >> 2 over the odd pixel before, the even and the odd pixel.
inline I32 FilterPairs(I32 chromaBefore, YUVPixels even, YUVPixels odd) {
    const I32 sum = chromaBefore + even.chroma + even.chroma + odd.chroma + Ints(0x00020002);
    const I32 chroma = ShiftRight<2>(sum) & Ints(0x00ff00ff);
    return chroma | ShiftLeft<8>(even.luma) | ShiftLeft<24>(odd.luma);
}

/// 2 x kLanes pixels to kLanes pairs; `before` holds the chroma of the pixel before them in its last lane,
/// and receives that of their odd ones.
inline I32 DownsampleGroup(YUVPixels first, YUVPixels second, I32& before) {
    YUVPixels even, odd;
    SeparateLanes(first.chroma, second.chroma, even.chroma, odd.chroma);
    SeparateLanes(first.luma, second.luma, even.luma, odd.luma);
    const I32 pairs = FilterPairs(ShiftInLane(before, odd.chroma), even, odd);
    before = odd.chroma;
    return pairs;
}

/// One pixel in every lane: the neighbour of the first pixel, and the lone last one of an odd width.
template <class Stage>
YUVPixels OnePixel(const uint8_t* source) {
    uint32_t pixel;
    std::memcpy(&pixel, source, sizeof pixel);
    alignas(32) uint32_t pixels[2 * kLanes];
    for (uint32_t& copy : pixels) copy = pixel;
    YUVPixels first, second;
    Stage::Load(reinterpret_cast<const uint8_t*>(pixels), first, second);
    return first;
}

/// Carries the chroma of a group's last pixel to the next group.
template <class Stage>
struct Downsample : Groups<2 * kLanes, Each<4, 2>, Each<4>> {
    explicit Downsample(I32 chromaBefore) : fBefore(chromaBefore) {}

    void Group(const uint8_t* source, uint8_t* destination) {
        YUVPixels first, second;
        Stage::Load(source, first, second);
        Store(destination, DownsampleGroup(first, second, fBefore));
    }

    I32 fBefore; // in the last lane
};

/// The lone last pixel of an odd width keeps its chroma and stands for both lumas of its pair.
template <class Stage>
void DownsampleLonePixel(const uint8_t* source, uint8_t* destination) {
    const YUVPixels pixel = OnePixel<Stage>(source);
    alignas(32) uint32_t pairs[kLanes];
    Store(pairs, FilterPairs(pixel.chroma, pixel, pixel));
    std::memcpy(destination, pairs, sizeof pairs[0]);
}

template <class Stage>
void DownsampleRow(const void* sourceRow, void* destinationRow, int32_t width) {
    if (width <= 0) return;
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    const int32_t paired = width & ~1;
    RunRow(Downsample<Stage>(OnePixel<Stage>(source).chroma), paired, destinationRow, source);
    if (paired < width)
        DownsampleLonePixel<Stage>(source + ptrdiff_t{4} * paired,
                                   static_cast<uint8_t*>(destinationRow) + ptrdiff_t{2} * paired);
}

} // namespace PK::PK_TARGET
