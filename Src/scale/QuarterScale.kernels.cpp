// Rows of quarter-resolution scaling: bytes are dropped or change their place, none is computed with.

#include "convert/RowGroups.h"
#include "scale/QuarterScaleKernels.h"

namespace PK::PK_TARGET {
namespace {

/// Every other byte, beginning with the first.
struct EvenBytes {
    static constexpr int32_t kPixels = 4 * kLanes;
    static constexpr int32_t kUnit = 1;
    static constexpr int32_t kSourceBytes = 8 * kLanes;
    static constexpr int32_t kDestinationBytes = 4 * kLanes;

    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 even = Ints(0x00ff00ff); // the low byte of each half
        Store(destination, PackHalves(LoadInts(source) & even, LoadInts(source + 4 * kLanes) & even));
    }
};

enum class First { kLuma, kChroma };

/// One pair a lane: luma in one byte of each half, chroma in the other.
template <First kFirst>
void InterleaveVector(const uint8_t* luma, const uint8_t* chroma1, const uint8_t* chroma2,
                      uint8_t* destination) {
    const I32 y = LoadBytesAsHalves(luma);
    const I32 c = LoadBytes(chroma1) | ShiftLeft<16>(LoadBytes(chroma2));
    Store(destination, kFirst == First::kLuma ? y | ShiftLeft<8>(c) : c | ShiftLeft<8>(y));
}

template <First kFirst>
void InterleaveRow(const uint8_t* luma, const uint8_t* chroma1, const uint8_t* chroma2, uint8_t* destination,
                   int32_t pairs) {
    for (; pairs >= kLanes; pairs -= kLanes) {
        InterleaveVector<kFirst>(luma, chroma1, chroma2, destination);
        luma += 2 * kLanes;
        chroma1 += kLanes;
        chroma2 += kLanes;
        destination += 4 * kLanes;
    }
    if (pairs == 0) return;
    uint8_t y[2 * kLanes] = {}, c1[kLanes] = {}, c2[kLanes] = {}, packed[4 * kLanes];
    const auto count = static_cast<size_t>(pairs);
    std::memcpy(y, luma, 2 * count);
    std::memcpy(c1, chroma1, count);
    std::memcpy(c2, chroma2, count);
    InterleaveVector<kFirst>(y, c1, c2, packed);
    std::memcpy(destination, packed, 4 * count);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::QuarterScaleKernels& PK::QuarterScaleKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr QuarterScaleKernels kernels = {Row<EvenBytes>, InterleaveRow<First::kLuma>,
                                                    InterleaveRow<First::kChroma>};
    return kernels;
}
