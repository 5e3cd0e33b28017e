#pragma once

// What motion samples between: the zeros of colours, pixels side by side, and the cells of four pixels in which places lie.
// Kernel sources include this header.

#include "geometry/MotionWalk.h"
#include "primitives/lanes/PixelLanes.h"

namespace PK::PK_TARGET {

// Where a colour has its zero, which is also what transparent pixels show.

struct NoZero {
    static constexpr bool kIsZero = true;
    static Channels Value() { return {Floats(0), Floats(0), Floats(0), Floats(0)}; }
    static F32 Interleaved() { return Floats(0); }
};
struct VideoZero {
    static constexpr bool kIsZero = false;
    static Channels Value() { return {Floats(128), Floats(128), Floats(16), Floats(0)}; }
    static F32 Interleaved() { return PixelFloats(128, 128, 16, 0); }
};

inline Channels And(I32 mask, const Channels& c) {
    const auto masked = [mask](F32 x) { return FromBits(Bits(x) & mask); };
    return {masked(c.c0), masked(c.c1), masked(c.c2), masked(c.c3)};
}

// Two pixels side by side for each lane, the left ones at the offsets.

template <AlphaPlace kAlpha>
[[gnu::always_inline]] inline void LoadNeighbours(Pixels8<kAlpha>, const uint8_t* base,
                                                  const int64_t* offsets, Channels& left, Channels& right) {
    I32 lefts, rights;
    LoadLanePairsAt(base, offsets, lefts, rights);
    left = ToFloat(InOrder<kAlpha>(ByteChannels(lefts)));
    right = ToFloat(InOrder<kAlpha>(ByteChannels(rights)));
}

template <AlphaPlace kAlpha>
inline Channels LoadPixelsAt(Pixels15<kAlpha>, const uint8_t* base, const int64_t* offsets) {
    I32 first, second;
    LoadLanePairsAt(base, offsets, first, second);
    return ToFloat(InOrder<kAlpha>(WordChannels(first, second)));
}

template <AlphaPlace kAlpha>
inline Channels LoadPixelsAt(Pixels32f<kAlpha>, const uint8_t* base, const int64_t* offsets) {
    Channels c = {LoadFloatBlocksAt(base, offsets), LoadFloatBlocksAt(base, offsets + 1),
                  LoadFloatBlocksAt(base, offsets + 2), LoadFloatBlocksAt(base, offsets + 3)};
    TransposePixels(c.c0, c.c1, c.c2, c.c3);
    return InOrder<kAlpha>(c);
}

template <class Layout>
[[gnu::always_inline]] inline void LoadNeighbours(Layout layout, const uint8_t* base, const int64_t* offsets,
                                                  Channels& left, Channels& right) {
    left = LoadPixelsAt(layout, base, offsets);
    right = LoadPixelsAt(layout, base + Layout::kPixelBytes, offsets);
}

// Cells: the pixels between whose centres a place lies.

inline I32 Limit(I32 x, int32_t low, int32_t high) {
    return Max(Min(x, Ints(high)), Ints(low));
}

/// Not-a-number becomes the upper limit.
inline F32 Limit(F32 x, int32_t low, int32_t high) {
    return Max(Min(x, Floats(static_cast<float>(high))), Floats(static_cast<float>(low)));
}

/// Of pixels that are all in the source.
struct InnerCell {
    InnerCell(const float* places, int32_t low, int32_t high) {
        const F32 place = Limit(LoadFloats(places) - Floats(0.5f), low, high - 1);
        first = Limit(Floor(place), low, high - 2); // limited once more: a float may have rounded the bounds
        fraction = place - ToFloat(first);
    }

    I32 first;
    F32 fraction;
};

/// Of pixels that may lie outside; the nearest in the source stand for those.
struct EdgeCell {
    EdgeCell(const float* places, int32_t low, int32_t high) {
        const F32 place = Limit(LoadFloats(places) - Floats(0.5f), low - 2, high + 1);
        const I32 first = Floor(place), second = first + Ints(1);
        fraction = place - ToFloat(first);
        const I32 nearest[] = {Limit(first, low, high - 1), Limit(second, low, high - 1)};
        Store(index[0], nearest[0]);
        Store(index[1], nearest[1]);
        isInside[0] = Equal(nearest[0], first);
        isInside[1] = Equal(nearest[1], second);
    }

    int32_t index[2][kLanes];
    I32 isInside[2];
    F32 fraction;
};

} // namespace PK::PK_TARGET
