// A-law codes to linear samples. With every other bit of a code inverted (0x55), bit 7 is set for positive
// samples, bits 4 to 6 are the segment s and bits 0 to 3 the step m:
//
//   |sample| = 8 (2 m + 1)             for s = 0
//   |sample| = 8 (2 m + 33) 2^(s - 1)  for s > 0

#include "primitives/ALaw.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

// By sign and segment: 4 times what is added to 2 m, and the multiplier; twice their product is the sample.
inline I32 Addends() {
    return PixelInts(static_cast<int32_t>(0x84848404), static_cast<int32_t>(0x84848484), // 4 x 33, 4 x 1
                     static_cast<int32_t>(0x84848404), static_cast<int32_t>(0x84848484));
}
inline I32 Multipliers() {
    return PixelInts(static_cast<int32_t>(0xfcfeffff), static_cast<int32_t>(0xc0e0f0f8), // -1 -1 -2 -4 ...
                     0x04020101, 0x40201008);
}

struct ALawToLinear : Groups<4 * kLanes, Each<2>, Each<1>> {

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 codes = LoadInts(source) ^ Ints(0x55555555);
        const I32 signAndSegment = ShiftRight<4>(codes) & Ints(0x0f0f0f0f);
        const I32 steps = ShiftLeft<3>(codes) & Ints(0x78787878); // 8 m, which shares no bit with an addend
        I32 first, second;
        DoubleByteProducts(steps | LookUpBytes(Addends(), signAndSegment),
                           LookUpBytes(Multipliers(), signAndSegment), first, second);
        Store(destination, first);
        Store(destination + 4 * kLanes, second);
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ALawKernels& PK::ALawKernels::For<PK::Target::PK_TARGET>() {
    static constexpr ALawKernels kernels = {PK_TARGET::Row<PK_TARGET::ALawToLinear>};
    return kernels;
}
