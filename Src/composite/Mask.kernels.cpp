// Picks pixels from two rows by the bits of a mask.

#include "composite/MaskKernels.h"
#include "primitives/simd/Target.h"

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

template <int kPixelLanes>
void SelectGroup(const uint8_t* first, const uint8_t* second, int32_t maskBits, uint8_t* destination) {
    const I32 bits = Ints(maskBits);
    for (int lane = 0; lane < kGroup * kPixelLanes; lane += kLanes) {
        const I32 bit = LoadInts(kLaneBits<kPixelLanes>.bit + lane);
        const I32 chosen = Equal(bits & bit, bit);
        Store(destination + 4 * lane,
              Select(chosen, LoadInts(first + 4 * lane), LoadInts(second + 4 * lane)));
    }
}

template <int kPixelBytes>
void SelectSingly(const uint8_t* first, const uint8_t* second, const uint8_t* mask, int32_t bit,
                  uint8_t* destination, int32_t width) {
    for (int32_t i = 0; i < width; ++i, ++bit) {
        const bool isSet = (mask[bit / 8] << bit % 8 & 0x80) != 0;
        std::memmove(destination, isSet ? first : second, kPixelBytes); // may be the place itself
        first += kPixelBytes;
        second += kPixelBytes;
        destination += kPixelBytes;
    }
}

/// The part of the first byte, then whole bytes by twos, then what is left.
template <int kPixelBytes>
void SelectRow(const uint8_t* first, const uint8_t* second, const uint8_t* mask, int32_t bit,
               uint8_t* destination, int32_t width) {
    constexpr int kPixelLanes = kPixelBytes / 4;
    const int32_t toBoundary = -bit & 7;
    const int32_t head = toBoundary < width ? toBoundary : width;
    SelectSingly<kPixelBytes>(first, second, mask, bit, destination, head);
    mask += (bit + head) / 8;
    ptrdiff_t at = ptrdiff_t{head} * kPixelBytes;
    for (width -= head; width >= kGroup; width -= kGroup) {
        SelectGroup<kPixelLanes>(first + at, second + at, mask[0] << 8 | mask[1], destination + at);
        mask += 2;
        at += kGroup * kPixelBytes;
    }
    SelectSingly<kPixelBytes>(first + at, second + at, mask, 0, destination + at, width);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::MaskKernels& PK::MaskKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr MaskKernels kernels = {SelectRow<4>, SelectRow<8>, SelectRow<16>};
    return kernels;
}
