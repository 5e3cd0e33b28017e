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

inline void StoreTriples(void* destination, SampleTriples triples) {
    constexpr int32_t kLowHalf = 0xffff, kHighHalf = -0x10000;
    const I32 low =
        Select(PixelInts(kHighHalf, 0, kLowHalf, kHighHalf), HalvesAt<0, 0, 0, 0, 4, 4, 8, 8>(triples.middle),
               HalvesAt<0, 0, 2, 4, 4, 6, 8, 8>(triples.outer));
    const I32 high = Select(PixelInts(0, kLowHalf, 0, 0), HalvesAt<0, 0, 12, 12, 0, 0, 0, 0>(triples.middle),
                            HalvesAt<10, 12, 14, 14, 0, 0, 0, 0>(triples.outer));
    StoreSixes(destination, low, high);
}

/// s0 | s1 << 10 | s2 << 20, with whatever the samples have above their 10 bits.
inline I32 PackTriples(SampleTriples triples) {
    return (triples.outer & Ints(0xffff)) | ShiftLeft<10>(triples.middle & Ints(0xffff)) |
           ShiftLeft<20>(ShiftRight<16>(triples.outer));
}

/// The samples that stand at bits kFirst, kFirst + 10 and kFirst + 20.
template <int kFirst>
inline SampleTriples UnpackTriples(I32 words) {
    const I32 first = (kFirst == 0 ? words : ShiftRight<kFirst>(words)) & Ints(0x3ff);
    const I32 third = ShiftRight<kFirst + 4>(words) & Ints(0x03ff0000);
    return {first | third, ShiftRight<kFirst + 10>(words) & Ints(0x3ff)};
}

} // namespace PK::PK_TARGET
