// Rows of planes of DV to pixels.

#include "convert/ColourMatrices.h"
#include "convert/DVRowKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// A lane for each sample of chroma.
struct Spread : Groups<4 * kLanes, Each<1>, Neighbours<Each<1, 4>, 0, 1>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 c = LoadBytes(source), n = LoadBytes(source + 1);
        const I32 sum = c + n, twice = sum + sum;
        const I32 second = ShiftRight<2>(twice + c - n), third = ShiftRight<1>(sum);
        const I32 fourth = ShiftRight<2>(twice + n - c);
        Store(destination, c | ShiftLeft<8>(second) | ShiftLeft<16>(third) | ShiftLeft<24>(fourth));
    }
};

struct Spread2 : Groups<2 * kLanes, Each<1>, Neighbours<Each<1, 2>, 0, 1>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 c = LoadBytes(source);
        StoreWords(destination, c | ShiftLeft<8>(ShiftRight<1>(c + LoadBytes(source + 1))));
    }
};

struct Repeat : Groups<2 * kLanes, Each<1>, Each<1, 2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 c = LoadBytes(source);
        StoreWords(destination, c | ShiftLeft<8>(c));
    }
};

struct ToVUYX : Groups<kLanes, Each<4>, Each<1>, Each<1>, Each<1>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 chroma = LoadBytes(v) | ShiftLeft<8>(LoadBytes(u));
        Store(destination, chroma | ShiftLeft<16>(LoadBytes(luma)) | Ints(-0x1000000));
    }
};

struct ToBGRX : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, YUV8ToRGB8<kDVToRGB8>(LoadByteChannels(source)) | Ints(-0x1000000));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DVRowKernels& PK::DVRowKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr DVRowKernels kernels = {.spread = Row<Spread>,
                                             .spread2 = Row<Spread2>,
                                             .repeat = Row<Repeat>,
                                             .toVUYX = ThreePlanes<ToVUYX>,
                                             .toBGRX = Row<ToBGRX>};
    return kernels;
}
