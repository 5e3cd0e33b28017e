// Order of components and forced alpha: samples change their place or become opaque, none is computed with.

#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// One vector of units of four samples of the same size, a pixel or a pair of pixels.
template <int kSample, int kUnitPixels = 1>
using VectorGroup = SampleGroup<kSample, kSample, kUnitPixels, 4 / kSample>;

/// Four lanes of bits, the least that holds whole pixels of every depth.
struct Pattern {
    uint32_t lane[4];
};

inline I32 Lanes(Pattern pattern) {
    return PixelInts(static_cast<int32_t>(pattern.lane[0]), static_cast<int32_t>(pattern.lane[1]),
                     static_cast<int32_t>(pattern.lane[2]), static_cast<int32_t>(pattern.lane[3]));
}

/// Replaces the bits of kAlphaBits with those of kOpaque.
template <int kSample, Pattern kAlphaBits, Pattern kOpaque>
struct ForceOpaque : VectorGroup<kSample> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, (LoadInts(source) & Not(Lanes(kAlphaBits))) | Lanes(kOpaque));
    }
};

/// The same pattern for the one lane of an 8-bit pixel, the two of a 15-bit one or the four of a float one.
constexpr Pattern EveryLane(uint32_t lane) {
    return {{lane, lane, lane, lane}};
}
constexpr Pattern EveryTwo(uint32_t even, uint32_t odd) {
    return {{even, odd, even, odd}};
}
constexpr Pattern EveryFour(uint32_t first, uint32_t last) {
    return {{first, 0, 0, last}};
}

using ForceOpaqueBGRA8 = ForceOpaque<1, EveryLane(0xff000000), EveryLane(0xff000000)>;
using ForceOpaqueARGB8 = ForceOpaque<1, EveryLane(0x000000ff), EveryLane(0x000000ff)>;
using ForceOpaqueBGRA15 = ForceOpaque<2, EveryTwo(0, 0xffff0000), EveryTwo(0, 0x80000000)>; // 32768
using ForceOpaqueARGB15 = ForceOpaque<2, EveryTwo(0x0000ffff, 0), EveryTwo(0x00008000, 0)>;
using ForceOpaqueBGRA32f = ForceOpaque<4, EveryFour(0, 0xffffffff), EveryFour(0, 0x3f800000)>; // 1.0
using ForceOpaqueARGB32f = ForceOpaque<4, EveryFour(0xffffffff, 0), EveryFour(0x3f800000, 0)>;

struct ReversePixels8 : VectorGroup<1> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, ReverseBytes(LoadInts(source)));
    }
};

struct ReversePixels15 : VectorGroup<2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, ReverseHalves(LoadInts(source)));
    }
};

struct ReversePixels32f : VectorGroup<4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, ShufflePixel<3, 2, 1, 0>(LoadInts(source)));
    }
};

/// Luma and chroma of each pair change places.
struct SwapPairs8 : VectorGroup<1, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, SwapBytes(LoadInts(source)));
    }
};

struct SwapPairs32f : VectorGroup<4, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, ShufflePixel<1, 0, 3, 2>(LoadInts(source)));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::OrderKernels& PK::OrderKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr OrderKernels kernels = {
        .ForceOpaqueRow_BGRA_8u = Row<ForceOpaqueBGRA8>,
        .ForceOpaqueRow_ARGB_8u = Row<ForceOpaqueARGB8>,
        .ForceOpaqueRow_BGRA_15u = Row<ForceOpaqueBGRA15>,
        .ForceOpaqueRow_ARGB_15u = Row<ForceOpaqueARGB15>,
        .ForceOpaqueRow_BGRA_32f = Row<ForceOpaqueBGRA32f>,
        .ForceOpaqueRow_ARGB_32f = Row<ForceOpaqueARGB32f>,
        .SwapOrderRow_4444_8u = Row<ReversePixels8>,
        .SwapOrderRow_4444_15u = Row<ReversePixels15>,
        .SwapOrderRow_4444_32f = Row<ReversePixels32f>,
        .SwapOrderRow_422_8u = Row<SwapPairs8>,
        .SwapOrderRow_422_32f = Row<SwapPairs32f>,
    };
    return kernels;
}
