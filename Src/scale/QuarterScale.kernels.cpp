// Rows of quarter-resolution scaling: bytes are dropped or change their place, none is computed with.

#include "primitives/lanes/RowDriver.h"
#include "scale/QuarterScaleKernels.h"

namespace PK::PK_TARGET {
namespace {

/// Every other byte, beginning with the first.
struct EvenBytes : Groups<4 * kLanes, Each<1>, Each<2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 even = Ints(0x00ff00ff); // the low byte of each half
        Store(destination, PackHalves(LoadInts(source) & even, LoadInts(source + 4 * kLanes) & even));
    }
};

enum class First { kLuma, kChroma };

/// One pair a lane: luma in one byte of each half, chroma in the other.
template <First kFirst>
struct Interleave : Groups<kLanes, Each<4>, Each<2>, Each<1>, Each<1>> {
    static void Group(const uint8_t* luma, const uint8_t* chroma1, const uint8_t* chroma2,
                      uint8_t* destination) {
        const I32 y = LoadBytesAsHalves(luma);
        const I32 c = LoadBytes(chroma1) | ShiftLeft<16>(LoadBytes(chroma2));
        Store(destination, kFirst == First::kLuma ? y | ShiftLeft<8>(c) : c | ShiftLeft<8>(y));
    }
};

template <First kFirst>
void InterleaveRow(const uint8_t* luma, const uint8_t* chroma1, const uint8_t* chroma2, uint8_t* destination,
                   int32_t pairs) {
    RunRow(Interleave<kFirst>(), pairs, destination, luma, chroma1, chroma2);
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
