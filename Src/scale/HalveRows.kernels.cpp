// Rows of 4:2:2 at half their width. Samples change their place and lose bits, none is computed with.

#include "primitives/lanes/ChromaPairs.h"
#include "primitives/lanes/V210Samples.h"
#include "scale/HalveKernels.h"

namespace PK::PK_TARGET {
namespace {

struct HalveV210 : Groups<3 * kV210Groups, Each<4>, Each<16, 3>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        const I32 chroma = HighBits<8>(EvenSamplesAt<4>(words)), luma = HighBits<8>(OddSamplesAt<4>(words));
        StoreThrees(destination, PixelVUYX::Pack(chroma, luma & Ints(0xffff)));
    }
};

struct HalveUYVY32f : Groups<kLanes / 4, Each<16>, Each<16>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PixelsOfPairs<1>(LoadFloats(source)));
    }
};

template <bool kLumaFirst>
struct Halve8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const PixelPairs pairs = LoadPairs<kLumaFirst>(source);
        Store(destination, PixelVUYX::Pack(pairs.chroma, pairs.luma & Ints(0xffff)));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::HalveKernels& PK::HalveKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr HalveKernels kernels = {
        .HalveRowV210 = Row<HalveV210>,
        .HalveRowUYVY32f = Row<HalveUYVY32f>,
        .HalveRowUYVY8u = Row<Halve8<false>>,
        .HalveRowYUYV8u = Row<Halve8<true>>,
    };
    return kernels;
}
