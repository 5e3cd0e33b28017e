#pragma once

// Pixels of four channels as lanes, whatever their depth and order in memory, so that one formula serves all layouts. The
// channels come in the order of BGRA and VUYA, alpha last; what stands in a lane is the code of an integer layout or the
// value of a float one, as a float.
//
//   kPixelBytes              of a pixel in memory
//   kFull                    what opaque alpha is
//   Load(source)             kLanes pixels
//   Store(destination, c)    rounded by the current mode, limited to the codes of the layout; NaN becomes 0. Floats are
//                            stored as they are.
//
// The integer layouts also load and store IntChannels.

#include "primitives/Thresholds.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

enum class AlphaPlace { last, first };

/// The channels of a pixel whose alpha stands first in memory, in the order of BGRA, and back.
template <AlphaPlace kAlpha, class FourChannels>
inline FourChannels InOrder(FourChannels c) {
    if constexpr (kAlpha == AlphaPlace::last)
        return c;
    else
        return {c.c3, c.c2, c.c1, c.c0};
}

template <int32_t kLimit>
inline I32 NearestCode(F32 x) {
    return Max(Nearest(AtMost(Floats(kLimit), x)), Ints(0));
}

/// How the codes of an integer layout become floats and come back.
template <class Layout, int32_t kFullCode>
struct CodesAsFloats {
    static constexpr float kFull = kFullCode;

    static Channels Load(const void* source) { return ToFloat(Layout::LoadCodes(source)); }

    static void Store(void* destination, Channels c) {
        Layout::StoreCodes(destination, {NearestCode<kFullCode>(c.c0), NearestCode<kFullCode>(c.c1),
                                         NearestCode<kFullCode>(c.c2), NearestCode<kFullCode>(c.c3)});
    }

private:
    CodesAsFloats() = default;
    friend Layout;
};

template <AlphaPlace kAlpha = AlphaPlace::last>
struct Pixels8 : CodesAsFloats<Pixels8<kAlpha>, 255> {
    static constexpr int32_t kPixelBytes = 4;

    static IntChannels LoadCodes(const void* source) { return InOrder<kAlpha>(LoadByteChannels(source)); }

    /// Saturates.
    static void StoreCodes(void* destination, IntChannels channels) {
        const IntChannels c = InOrder<kAlpha>(channels);
        PK_TARGET::Store(destination, PackByteChannels(c.c0, c.c1, c.c2, c.c3));
    }
};

/// The four words of pixels whose first two are in one lane and whose last two in another.
inline IntChannels WordChannels(I32 first, I32 second) {
    const I32 low = Ints(0xffff);
    return {first & low, ShiftRight<16>(first), second & low, ShiftRight<16>(second)};
}

/// White is 32768.
template <AlphaPlace kAlpha = AlphaPlace::last>
struct Pixels15 : CodesAsFloats<Pixels15<kAlpha>, 32768> {
    static constexpr int32_t kPixelBytes = 8;

    static IntChannels LoadCodes(const void* source) {
        I32 first, second;
        LoadLanePairs(source, first, second);
        return InOrder<kAlpha>(WordChannels(first, second));
    }

    /// The codes are from 0 to 65535.
    static void StoreCodes(void* destination, IntChannels channels) {
        const IntChannels c = InOrder<kAlpha>(channels);
        StoreLanePairs(destination, c.c0 | ShiftLeft<16>(c.c1), c.c2 | ShiftLeft<16>(c.c3));
    }
};

template <AlphaPlace kAlpha = AlphaPlace::last>
struct Pixels32f {
    static constexpr int32_t kPixelBytes = 16;
    static constexpr float kFull = 1;

    static Channels Load(const void* source) { return InOrder<kAlpha>(LoadFloatChannels(source)); }
    static void Store(void* destination, Channels channels) {
        StoreFloatChannels(destination, InOrder<kAlpha>(channels));
    }
};

/// Of Channels or IntChannels.
template <class Four>
requires requires(Four four) {
    four.c3;
}
inline Four Select(I32 mask, const Four& a, const Four& b) {
    return {Select(mask, a.c0, b.c0), Select(mask, a.c1, b.c1), Select(mask, a.c2, b.c2),
            Select(mask, a.c3, b.c3)};
}

inline F32 Magnitude(F32 x) {
    return FromBits(Bits(x) & Ints(INT32_MAX));
}

/// Where a value counts as 0. Not-a-number never does.
inline I32 IsNegligible(F32 x) {
    return Less(Magnitude(x), Floats(kNegligible));
}

/// All bits of a group of four lanes set where they are in each of the four, else none: a vote of the four pixels that a
/// shortcut is taken for together, however wide the vector.
inline I32 WhereGroupAgrees(I32 mask) {
    const I32 pairs = mask & ShufflePixel<1, 0, 3, 2>(mask);
    return pairs & ShufflePixel<2, 3, 0, 1>(pairs);
}

// Interleaved samples: a pixel is a block of four lanes.

/// The alpha of each pixel in all four of its lanes.
template <AlphaPlace kAlpha>
inline F32 BroadcastAlpha(F32 pixels) {
    if constexpr (kAlpha == AlphaPlace::first)
        return ShufflePixel<0, 0, 0, 0>(pixels);
    else
        return ShufflePixel<3, 3, 3, 3>(pixels);
}

/// All bits set in the lanes of alpha.
template <AlphaPlace kAlpha>
inline I32 AlphaLanes() {
    return kAlpha == AlphaPlace::first ? PixelInts(-1, 0, 0, 0) : PixelInts(0, 0, 0, -1);
}

} // namespace PK::PK_TARGET
