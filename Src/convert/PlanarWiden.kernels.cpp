// Planes that get wider by 3/2 or 4/3 on their way to pixels.

#include "convert/ColourMatrices.h"
#include "convert/LastRepeated.h"
#include "convert/PlanarKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// A byte a lane, from four places in each block.
template <int32_t k0, int32_t k1, int32_t k2, int32_t k3>
inline I32 BytesAt(I32 bytes) {
    return LookUpBytes(bytes, PixelInts(k0, k1, k2, k3)) & Ints(0xff);
}

/// (a + b) >> 1; a sample is the mean of itself and itself.
inline F32 Means(I32 a, I32 b) {
    return ToFloat(ShiftRight<1>(a + b));
}

/// Eight samples a block become twelve.
struct By3To2 : Groups<3 * kLanes, Each<12, 3>, LoadedPast<Each<2, 3>, 8>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 bytes = Bits(LoadFloatBlocks(source, 8));
        StoreBlocksInTurns(destination, Means(BytesAt<0, 0, 1, 2>(bytes), BytesAt<0, 1, 1, 2>(bytes)),
                           Means(BytesAt<2, 3, 4, 4>(bytes), BytesAt<3, 3, 4, 5>(bytes)),
                           Means(BytesAt<5, 6, 6, 7>(bytes), BytesAt<5, 6, 7, 7>(bytes)));
    }
};

/// Twelve samples a block become sixteen.
struct By4To3 : Groups<4 * kLanes, Each<16, 4>, Each<3, 4>> {
    /// The block's samples a, b, c from a place on.
    template <int32_t kA>
    static void Widen(I32 bytes, uint8_t* destination) {
        constexpr int32_t kB = kA + 1, kC = kA + 2, kZero = 12; // LoadThrees leaves the last four bytes 0
        constexpr float kThird = 0.33333334f;
        const I32 middle = BytesAt<kZero, kB, kB, kZero>(bytes);
        const I32 sums = BytesAt<kA, kA, kC, kC>(bytes) + middle + middle;
        StoreFloatBlocks(destination, 64, ToFloat(sums) * PixelFloats(1, kThird, kThird, 1));
    }

    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 bytes = LoadThrees(source);
        Widen<0>(bytes, destination);
        Widen<3>(bytes, destination + 16);
        Widen<6>(bytes, destination + 32);
        Widen<9>(bytes, destination + 48);
    }
};

/// Pairs of pixels, one a lane, in the range of bytes.
struct FloatPairs {
    F32 y0, y1, u, v;
};

inline FloatPairs LoadFloatPairs(const uint8_t* luma, const uint8_t* u, const uint8_t* v) {
    I32 even, odd;
    LoadLanePairs(luma, even, odd);
    return {FromBits(even), FromBits(odd), LoadFloats(u), LoadFloats(v)};
}

/// A luma each pixel and a chroma each pair. A lone last pixel stands for both of its pair.
template <class Destination>
using FromFloatPlanes = Groups<2 * kLanes, Destination, LastRepeated<Each<4>>, Each<4, 2>, Each<4, 2>>;

struct ToUYVY : FromFloatPlanes<Each<4, 2>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const FloatPairs pairs = LoadFloatPairs(luma, u, v);
        Store(destination,
              PackByteChannels(Nearest(pairs.u), Nearest(pairs.y0), Nearest(pairs.v), Nearest(pairs.y1)));
    }
};

/// V, U and Y of BT.601 to those of BT.709.
inline Channels To709(F32 v, F32 u, F32 y) {
    return AddOffsets(YUVToYUV<kYUV601To709>(RemoveOffsets({v, u, y, y})));
}

struct LumaTo709 : Groups<2 * kLanes, Each<4>, Each<4>, Each<4, 2>, Each<4, 2>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const FloatPairs pairs = LoadFloatPairs(luma, u, v);
        StoreLanePairs(destination, Bits(To709(pairs.v, pairs.u, pairs.y0).c2),
                       Bits(To709(pairs.v, pairs.u, pairs.y1).c2));
    }
};

template <bool kIsV>
struct ChromaTo709 : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const F32 cv = LoadFloats(v), cu = LoadFloats(u);
        const Channels chroma = To709(cv, cu, cu);
        Store(destination, kIsV ? chroma.c0 : chroma.c1);
    }
};

/// Codes of 10 bits.
struct ToWords : Groups<2 * kLanes, Each<2>, Each<4>> {
    static I32 Codes(const uint8_t* source) {
        const I32 codes = Nearest(Floats(4) * LoadFloats(source));
        return Max(Min(codes, Ints(1023)), Ints(0));
    }

    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PackLanesToHalves(Codes(source), Codes(source + 4 * kLanes)));
    }
};

struct ToVUYX : FromFloatPlanes<Each<4>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const FloatPairs pairs = LoadFloatPairs(luma, u, v);
        const I32 cv = Nearest(pairs.v), cu = Nearest(pairs.u), opaque = Ints(255);
        StoreLanePairs(destination, PackByteChannels(cv, cu, Nearest(pairs.y0), opaque),
                       PackByteChannels(cv, cu, Nearest(pairs.y1), opaque));
    }
};

template <const YUVToRGBMatrix& kMatrix>
struct ToBGRX : FromFloatPlanes<Each<4>> {
    static I32 Pixels(F32 v, F32 u, F32 y) {
        return PackCodes(YUVToRGB<kMatrix>(RemoveOffsets({v, u, y, y})), Ints(255));
    }

    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const FloatPairs pairs = LoadFloatPairs(luma, u, v);
        StoreLanePairs(destination, Pixels(pairs.v, pairs.u, pairs.y0), Pixels(pairs.v, pairs.u, pairs.y1));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PlanarWidenKernels& PK::PlanarWidenKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PlanarWidenKernels kernels = {
        .by3To2 = Row<By3To2>,
        .by4To3 = Row<By4To3>,
        .lumaTo709 = ThreePlanes<LumaTo709>,
        .uTo709 = TwoRows<ChromaTo709<false>>,
        .vTo709 = TwoRows<ChromaTo709<true>>,
        .toWords = Row<ToWords>,
        .toUYVY = ThreePlanes<ToUYVY>,
        .toVUYX = ThreePlanes<ToVUYX>,
        .toBGRX601 = ThreePlanes<ToBGRX<kYUV8ToRGB8_601>>,
        .toBGRX709 = ThreePlanes<ToBGRX<kYUV8ToRGB8_709>>,
    };
    return kernels;
}
