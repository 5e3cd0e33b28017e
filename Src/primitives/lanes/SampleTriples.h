#pragma once

// Three samples of 10 bits in a 32-bit word, as V210 and ten-bit RGB have them, and as one 16-bit word each.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// One triple a lane: the first sample in the lower and the third in the upper half of `outer`, the second in
/// the lower half of `middle`, whose upper half means nothing.
struct SampleTriples {
    I32 outer;
    I32 middle;
};

inline constexpr int32_t kTripleBytes = 6;

/// kLanes triples of 16-bit words.
inline SampleTriples LoadTriples(const void* source) {
    const auto* bytes = static_cast<const uint8_t*>(source);
    const I32 lower = Bits(LoadFloatBlocks(bytes, 4 * kTripleBytes));
    const I32 upper = Bits(LoadFloatBlocks(bytes + 8, 4 * kTripleBytes));
    return {BlendBlocks<0b0011>(HalvesAt<0, 4, 6, 10, 0, 0, 0, 0>(lower),
                                HalvesAt<0, 0, 0, 0, 4, 8, 10, 14>(upper)),
            BlendBlocks<0b0011>(HalvesAt<2, 2, 8, 8, 0, 0, 0, 0>(lower),
                                HalvesAt<0, 0, 0, 0, 6, 6, 12, 12>(upper))};
}

/// s0 | s1 << 10 | s2 << 20, with whatever the samples have above their 10 bits.
inline I32 PackTriples(SampleTriples triples) {
    return MultiplyHalves(triples.outer, Ints(1 | 16 << 16)) | ShiftLeft<10>(triples.middle & Ints(0xffff));
}

/// The samples at bits kFirst, kFirst + 10 and kFirst + 20 of each lane, as 16-bit words. Each lies within the
/// 16 bits from byte 0, 1 or 2 of its lane on; a multiplication moves it to their top, past what stands above.
template <int kFirst>
inline void StoreTriples(void* destination, I32 words) {
    constexpr int32_t first = 64 >> kFirst, second = 16 >> kFirst, third = 4 >> kFirst;
    const I32 low = MultiplyHalves(
        HalvesAt<0, 1, 2, 4, 5, 6, 8, 9>(words),
        PixelInts(first | second << 16, third | first << 16, second | third << 16, first | second << 16));
    const I32 high = MultiplyHalves(HalvesAt<10, 12, 13, 14, 0, 0, 0, 0>(words),
                                    PixelInts(third | first << 16, second | third << 16, 0, 0));
    StoreSixes(destination, ShiftRight<6>(low) & Ints(0x03ff03ff), ShiftRight<6>(high) & Ints(0x03ff03ff));
}

} // namespace PK::PK_TARGET
