// The bodies for the blocks of DV.

#include "dv/DVBlockKernels.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

constexpr int kSide = 8, kBlock = 64;
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

inline I32 Magnitude(I32 x) {
    const I32 sign = ShiftRightSigned<31>(x);
    return (x ^ sign) - sign;
}

inline I32 Scaled(const int16_t* values, const float* factors, F32 roundUp) {
    const I32 x = LoadSignedWords(values), sign = ShiftRightSigned<31>(x);
    const I32 magnitude = Truncate(ToFloat((x ^ sign) - sign) * LoadFloats(factors) + roundUp);
    return (magnitude ^ sign) - sign;
}

[[maybe_unused]] void Scale(const DVBlockFactors& factors, float roundUp, int16_t* block) {
    const F32 add = Floats(roundUp);
    for (int i = 0; i < kBlock; i += 2 * kLanes)
        Store(block + i, PackSignedLanes(Scaled(block + i, factors + i, add),
                                         Scaled(block + i + kLanes, factors + i + kLanes, add)));
}

/// The bits of a float are its logarithm, linear between powers of two.
[[maybe_unused]] uint32_t SumOfLogarithms(const int16_t* block, float factor) {
    const F32 one = Floats(1), by = Floats(factor);
    I32 sum = Ints(0);
    for (int i = 0; i < kBlock; i += kLanes) {
        const F32 x = ToFloat(Magnitude(LoadSignedWords(block + i))) * by + one;
        sum = sum + ShiftRight<8>(Bits(x) - Bits(one));
    }
    uint32_t lanes[kLanes], total = 0;
    Store(lanes, sum);
    for (int i = 0; i < kLanes; ++i) total += lanes[i];
    return total;
}

struct Quantiser {
    F32 roundUp, least;
    I32 greatest;

    I32 Levels(const int16_t* coefficients, const float* factors) {
        const F32 exact = ToFloat(Magnitude(LoadSignedWords(coefficients))) * LoadFloats(factors) + roundUp;
        const I32 levels = Truncate(exact) & NotGreater(least, exact);
        greatest = Max(greatest, levels);
        return levels;
    }
};

[[maybe_unused]] void Quantise(const int16_t* coefficients, const DVQuantisation& quantisation,
                               DVLevels& levels) {
    Quantiser quantiser = {Floats(quantisation.roundUp), Floats(quantisation.least), Ints(0)};
    const float* factors = quantisation.factors;
    constexpr int kBytes = 4 * kLanes;
    uint64_t nonZero = 0;
    for (int i = 0; i < kBlock; i += kBytes) {
        I32 part[4];
        for (int k = 0; k < 4; ++k)
            part[k] = quantiser.Levels(coefficients + i + kLanes * k, factors + i + kLanes * k);
        const I32 bytes = PackLanes(part[0], part[1], part[2], part[3]);
        Store(levels.level + i, bytes);
        nonZero |= NonZeroBytes(bytes) << i;
    }
    levels.nonZero = nonZero;
    levels.areTooLarge = AnyNegative(Ints(255) - quantiser.greatest);
}

/// A row of a block has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const DVBlockKernels& Bodies() {
    if constexpr (kVectorLanes > kLanesOfRow) {
        return DVBlockKernels::For<Target::avx2>();
    } else {
        static constexpr DVBlockKernels kernels = {Load<YUYV>, Load<UYVY>, Scale, SumOfLogarithms, Quantise};
        return kernels;
    }
}

} // namespace
} // namespace PK_TARGET

template <>
const DVBlockKernels& DVBlockKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

} // namespace PK
