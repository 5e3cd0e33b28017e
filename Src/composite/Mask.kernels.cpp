// Picks pixels from two rows by the bits of a mask.

#include "composite/MaskKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

constexpr int32_t kGroup = 16; // pixels: two bytes of the mask, and whole vectors of every target

/// The bit of the pixel that each lane belongs to, in a word of 16 mask bits.
template <int kPixelLanes>
struct LaneBits {
    int32_t bit[kGroup * kPixelLanes];

    constexpr LaneBits() : bit() {
        for (int i = 0; i < kGroup * kPixelLanes; ++i) bit[i] = 0x8000 >> i / kPixelLanes;
    }
};

template <int kPixelLanes>
constexpr LaneBits<kPixelLanes> kLaneBits;

/// A byte of the mask for eight pixels, the first in its highest bit.
template <int kPixelBytes>
struct SelectByBits : Groups<kGroup, Each<kPixelBytes>, Each<kPixelBytes>, Each<kPixelBytes>, Each<1, 8>> {
    static void Group(const uint8_t* first, const uint8_t* second, const uint8_t* mask,
                      uint8_t* destination) {
        constexpr int kPixelLanes = kPixelBytes / 4;
        const I32 bits = Ints(mask[0] << 8 | mask[1]);
        for (int lane = 0; lane < kGroup * kPixelLanes; lane += kLanes) {
            const I32 bit = LoadInts(kLaneBits<kPixelLanes>.bit + lane);
            const I32 chosen = Equal(bits & bit, bit);
            Store(destination + 4 * lane,
                  Select(chosen, LoadInts(first + 4 * lane), LoadInts(second + 4 * lane)));
        }
    }
};

/// The part of the first byte, moved to its highest bits, then whole bytes.
template <int kPixelBytes>
void SelectRow(const void* firstRow, const void* secondRow, void* destination, int32_t width,
               const MaskRow& mask) {
    const auto* first = static_cast<const uint8_t*>(firstRow);
    const auto* second = static_cast<const uint8_t*>(secondRow);
    const uint8_t* bytes = mask.bytes;
    const int32_t toBoundary = -mask.first & 7;
    const int32_t head = toBoundary < width ? toBoundary : width;
    if (head > 0) {
        const auto firstBits = static_cast<uint8_t>(*bytes++ << mask.first);
        RunRow(SelectByBits<kPixelBytes>(), head, destination, first, second, &firstBits);
    }
    const ptrdiff_t at = ptrdiff_t{head} * kPixelBytes;
    RunRow(SelectByBits<kPixelBytes>(), width - head, static_cast<uint8_t*>(destination) + at, first + at,
           second + at, bytes);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::MaskKernels& PK::MaskKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr MaskKernels kernels = {SelectRow<4>, SelectRow<8>, SelectRow<16>};
    return kernels;
}
