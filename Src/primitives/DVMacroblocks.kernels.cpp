// Decoded blocks of DV as bytes.

#include "primitives/DVMacroblocks.h"
#include "primitives/simd/Target.h"

namespace PK {
namespace PK_TARGET {
namespace {

constexpr int32_t kSide = 8, kSamples = kSide * kSide;
constexpr int32_t kGrey = 128;

inline I32 LoadSamples(const int16_t* source) {
    return LoadSignedWords(source) + Ints(kGrey);
}

[[maybe_unused]] void ToBytes(const int16_t* block, uint8_t* bytes) {
    for (int32_t i = 0; i < kSamples; i += 4 * kLanes)
        Store(bytes + i, PackLanes(LoadSamples(block + i), LoadSamples(block + i + kLanes),
                                   LoadSamples(block + i + 2 * kLanes), LoadSamples(block + i + 3 * kLanes)));
}

/// Four pairs of pixels a block of lanes: those of the left luma block, then those of the right one.
[[maybe_unused]] void ToYUYV(const DVPairs& pairs, uint8_t* destination, ptrdiff_t rowBytes) {
    const auto toRight = static_cast<int64_t>((pairs.right - pairs.left) * 2);
    for (int32_t line = 0; line < kSide; line += pairs.lineStep, destination += rowBytes) {
        const int32_t first = kSide * line;
        for (int32_t i = 0; i < kSide; i += kLanes) {
            const uint8_t* const left = reinterpret_cast<const uint8_t*>(pairs.left + first);
            const I32 words = Bits(LoadFloatBlocks(left + (i == 0 ? 0 : toRight), toRight));
            const I32 even = ShiftRightSigned<16>(ShiftLeft<16>(words)) + Ints(kGrey);
            const I32 odd = ShiftRightSigned<16>(words) + Ints(kGrey);
            Store(destination + 4 * i, PackByteChannels(even, LoadSamples(pairs.u + first + i), odd,
                                                        LoadSamples(pairs.v + first + i)));
        }
    }
}

/// A line of a macroblock has no use for sixteen lanes: those bodies are the ones of eight.
template <int kVectorLanes>
const DVMacroblockKernels& Bodies() {
    if constexpr (kVectorLanes > kSide) {
        return DVMacroblockKernels::For<Target::avx2>();
    } else {
        static constexpr DVMacroblockKernels kernels = {ToBytes, ToYUYV};
        return kernels;
    }
}

} // namespace
} // namespace PK_TARGET

template <>
const DVMacroblockKernels& DVMacroblockKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::Bodies<PK_TARGET::kLanes>();
}

} // namespace PK
