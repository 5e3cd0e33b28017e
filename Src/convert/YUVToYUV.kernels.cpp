// The matrices between BT.601 and BT.709.

#include "convert/ColourMatrices.h"
#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

template <const YUVToYUVMatrix& kMatrix>
struct YUVToYUV8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, YUV8ToYUV8<kMatrix>(LoadByteChannels(source)));
    }
};

template <const YUVToYUVMatrix& kMatrix>
struct YUVToYUVFloat : PixelGroup<16, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreFloatChannels(destination, YUVToYUV<kMatrix>(LoadFloatChannels(source)));
    }
};

/// A pair of pixels is four bytes, so that a lane holds one pair: kLanes pairs make a group.
using PairGroup = Groups<2 * kLanes, Each<4, 2>, Each<4, 2>>;

struct YUVPairs {
    I32 u, v, y0, y1;
};

/// Both lumas go through the matrix with the chroma that they share.
template <const YUVToYUVMatrix& kMatrix>
inline YUVPairs ConvertPairs(YUVPairs pairs) {
    const Channels even = RemoveOffsets({pairs.v, pairs.u, pairs.y0, pairs.y1});
    const Channels odd = {even.c0, even.c1, ToFloat(pairs.y1 - Ints(16)), even.c3};
    const Channels first = AddOffsets(YUVToYUV<kMatrix>(even));
    const Channels second = AddOffsets(YUVToYUV<kMatrix>(odd));
    return {Nearest(first.c1), Nearest(first.c0), Nearest(first.c2), Nearest(second.c2)};
}

template <const YUVToYUVMatrix& kMatrix>
struct UYVYToUYVY : PairGroup {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const IntChannels uyvy = LoadByteChannels(source);
        const YUVPairs pairs = ConvertPairs<kMatrix>({uyvy.c0, uyvy.c2, uyvy.c1, uyvy.c3});
        Store(destination, PackByteChannels(pairs.u, pairs.y0, pairs.v, pairs.y1));
    }
};

template <const YUVToYUVMatrix& kMatrix>
struct YUYVToYUYV : PairGroup {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const IntChannels yuyv = LoadByteChannels(source);
        const YUVPairs pairs = ConvertPairs<kMatrix>({yuyv.c1, yuyv.c3, yuyv.c0, yuyv.c2});
        Store(destination, PackByteChannels(pairs.y0, pairs.u, pairs.y1, pairs.v));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::YUVToYUVKernels& PK::YUVToYUVKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr YUVToYUVKernels kernels = {
        .YUV601To709Row = Row<YUVToYUV8<kYUV601To709>>,
        .YUV709To601Row = Row<YUVToYUV8<kYUV709To601>>,
        .YUV601To709Float32Row = Row<YUVToYUVFloat<kYUV601To709>>,
        .YUV709To601Float32Row = Row<YUVToYUVFloat<kYUV709To601>>,
        .UYVY601To709Row = Row<UYVYToUYVY<kYUV601To709>>,
        .UYVY709To601Row = Row<UYVYToUYVY<kYUV709To601>>,
        .YUYV601To709Row = Row<YUYVToYUYV<kYUV601To709>>,
        .YUYV709To601Row = Row<YUYVToYUYV<kYUV709To601>>,
    };
    return kernels;
}
