// The bodies that take the samples of DV.

#include "dv/DVSampleKernels.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

constexpr int kSide = 8;
constexpr int kLanesOfRow = 8; // sixteen pixels are eight pairs, of four bytes

struct YUYV {
    static I32 Luma(I32 pairs) { return pairs & Ints(0x00ff00ff); }
    static I32 Cb(I32 pairs) { return ShiftRight<8>(pairs) & Ints(0xff); }
    static I32 Cr(I32 pairs) { return ShiftRight<24>(pairs); }
};

struct UYVY {
    static I32 Luma(I32 pairs) { return ShiftRight<8>(pairs) & Ints(0x00ff00ff); }
    static I32 Cb(I32 pairs) { return pairs & Ints(0xff); }
    static I32 Cr(I32 pairs) { return ShiftRight<16>(pairs) & Ints(0xff); }
};

template <class Order>
void Load(const uint8_t* pixels, int64_t rowBytes, const DVSampleBlocks& blocks) {
    constexpr int kPairs = kLanes < kLanesOfRow ? kLanes : kLanesOfRow;
    const int32_t middle = 128 << blocks.bits;
    // Two halves in a lane: the offset keeps them from borrowing of each other.
    const int32_t lifted = 0x8000 - middle;
    const I32 lift = Ints(lifted << 16 | lifted), sign = Ints(static_cast<int32_t>(0x80008000u));
    for (int row = 0; row < kSide; ++row) {
        for (int pair = 0; pair < kLanesOfRow; pair += kPairs) {
            const I32 pairs = LoadInts(pixels + 4 * pair);
            const I32 luma = (ShiftLeft(Order::Luma(pairs), blocks.bits) + lift) ^ sign;
            // Four pairs are a row of a block.
            StoreFloatBlocks(blocks.luma + kSide * row + blocks.lumaStride * (pair / 4),
                             2 * blocks.lumaStride, FromBits(luma));
            StoreWords(blocks.cb + kSide * row + pair,
                       ShiftLeft(Order::Cb(pairs), blocks.bits) - Ints(middle));
            StoreWords(blocks.cr + kSide * row + pair,
                       ShiftLeft(Order::Cr(pairs), blocks.bits) - Ints(middle));
        }
        pixels += rowBytes;
    }
}

/// A row of pixels has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const DVSampleKernels& Bodies() {
    if constexpr (kVectorLanes > kLanesOfRow) {
        return DVSampleKernels::For<Target::avx2>();
    } else {
        static constexpr DVSampleKernels kernels = {Load<YUYV>, Load<UYVY>};
        return kernels;
    }
}

} // namespace
} // namespace PK_TARGET

template <>
const DVSampleKernels& DVSampleKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

} // namespace PK
