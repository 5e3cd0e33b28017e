#pragma once

// Rows of motion that are not turned lie between the same two rows of the source all along. Kernel sources include this
// header.

#include "geometry/MotionCells.h"

namespace PK::PK_TARGET {

// Interleaved pixels, alpha last.

template <AlphaPlace kAlpha>
inline F32 InOrder(F32 pixels) {
    return kAlpha == AlphaPlace::last ? pixels : ShufflePixel<3, 2, 1, 0>(pixels);
}
template <AlphaPlace kAlpha>
inline F32 LoadInterleaved(Pixels8<kAlpha>, const uint8_t* pixels) {
    return InOrder<kAlpha>(ToFloat(LoadBytes(pixels)));
}
template <AlphaPlace kAlpha>
inline F32 LoadInterleaved(Pixels15<kAlpha>, const uint8_t* pixels) {
    return InOrder<kAlpha>(ToFloat(LoadWords(pixels)));
}
template <AlphaPlace kAlpha>
inline F32 LoadInterleaved(Pixels32f<kAlpha>, const uint8_t* pixels) {
    return InOrder<kAlpha>(LoadFloats(pixels));
}

/// Two rows of the source, one after the other, and a row between them.
template <class Layout, class Zero, MotionAlpha kAlpha>
class MixedRows {
public:
    explicit MixedRows(const MotionRow& row)
        : fOpaqueAlpha(row.isOpaque ? AlphaLanes<AlphaPlace::last>() : Ints(0)), fRowBytes(row.rowBytes) {
        float places[kLanes];
        Store(places, Floats(row.y));
        const InnerCell cell(places, row.top, row.bottom);
        int32_t firsts[kLanes];
        float fractions[kLanes];
        Store(firsts, cell.first);
        Store(fractions, cell.fraction);
        upper = row.pixels + firsts[0] * row.rowBytes;
        fraction = fractions[0];
    }

    /// So many pixels from one on. Returns whether all have so much alpha that, of any two, the share of one of the
    /// four in the source is enough to be seen; and none is infinite, of which sums and shares tell different things.
    bool Mix(int32_t first, int32_t width, float* mixed) const {
        const F32 fy = Floats(fraction);
        I32 isMuch = Ints(-1);
        Go(first, width, [&](int32_t at, F32 above, F32 below) {
            const F32 sum = above + (below - above) * fy;
            Store(mixed + at, sum);
            isMuch = isMuch & Less(Floats(0x1p-13f), sum);
            if constexpr (kIsFloat) isMuch = isMuch & Less(sum, Floats(0x1p127f));
        });
        return !AnyNegative(Not(isMuch) & AlphaLanes<AlphaPlace::last>());
    }

    /// The greater of two alphas by the weight of its row.
    void TakeShares(int32_t first, int32_t width, float* shares) const {
        const F32 fy = Floats(fraction), gy = Floats(1 - fraction);
        Go(first, width,
           [&](int32_t at, F32 above, F32 below) { Store(shares + at, Max(above * gy, below * fy)); });
    }

    const uint8_t* upper;
    float fraction;

private:
    static constexpr bool kIsFloat = Layout::kFull == 1;

    /// Interleaved pixels as they are weighed: differences from the zeros, multiplied by alpha.
    F32 Load(const uint8_t* pixels) const {
        F32 c = LoadInterleaved(Layout(), pixels);
        if constexpr (!Zero::kIsZero) c = c - Zero::Interleaved();
        if constexpr (kAlpha == MotionAlpha::straight) {
            const F32 alpha = BroadcastAlpha<AlphaPlace::last>(c);
            return BlendBlocks<8>(alpha, c * (kIsFloat ? alpha : alpha * Floats(1 / Layout::kFull)));
        }
        return Select(fOpaqueAlpha, Floats(Layout::kFull), c);
    }

    template <class Use>
    void Go(int32_t first, int32_t width, Use use) const {
        const uint8_t* const begin = upper + int64_t{first} * Layout::kPixelBytes;
        ByVectors(4 * width, [&](int32_t at) {
            const uint8_t* const pixels = begin + int64_t{at} * Layout::kPixelBytes / 4;
            use(at, Load(pixels), Load(pixels + fRowBytes));
        });
    }

    I32 fOpaqueAlpha; // where there is an alpha to be made full
    int64_t fRowBytes;
};

} // namespace PK::PK_TARGET
