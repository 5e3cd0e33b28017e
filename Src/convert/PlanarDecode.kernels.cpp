// Planes of bytes to pixels of 4:2:2 and 4:4:4.

#include "convert/LastRepeated.h"
#include "convert/PlanarKernels.h"
#include "primitives/lanes/ChromaPairs.h"

namespace PK::PK_TARGET {
namespace {

struct BlendChroma : Groups<4 * kLanes, Each<1>, Each<1>, Each<1>> {
    explicit BlendChroma(ChromaWeights weights)
        : fFirst(Ints(weights.first * 0x10001)), fSecond(Ints(weights.second * 0x10001)) {}

    I32 Blend(const uint8_t* first, const uint8_t* second) const {
        const I32 sum = MultiplyHalves(LoadBytesAsHalves(first), fFirst) +
                        MultiplyHalves(LoadBytesAsHalves(second), fSecond) + Ints(0x00040004);
        return ShiftRight<3>(sum) & Ints(0x00ff00ff);
    }

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        Store(destination, PackHalves(Blend(first, second), Blend(first + 2 * kLanes, second + 2 * kLanes)));
    }

    I32 fFirst, fSecond;
};

/// A row of chroma, and the samples beside.
template <int32_t kBefore, int32_t kAfter>
using ChromaNeighbours = Neighbours<Each<1, 2>, kBefore, kAfter>;

/// One pair a lane, as ChromaPairs.h has them.
inline I32 LoadChroma(const uint8_t* u, const uint8_t* v) {
    return LoadBytes(u) | ShiftLeft<16>(LoadBytes(v));
}

struct ToUYVY : Groups<2 * kLanes, Each<4, 2>, LastRepeated<Each<1>>, Each<1, 2>, Each<1, 2>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        Store(destination, LoadChroma(u, v) | ShiftLeft<8>(LoadBytesAsHalves(luma)));
    }
};

/// Pixels of pairs: the even ones with one chroma, the odd ones with another.
inline void StoreVUYX(uint8_t* destination, I32 evenChroma, I32 oddChroma, I32 luma) {
    I32 low, high;
    InterleaveInBlocks(PixelVUYX::Pack(evenChroma, luma & Ints(0xffff)),
                       PixelVUYX::Pack(oddChroma, ShiftRight<16>(luma)), low, high);
    StoreBlocksInTurns(destination, low, high);
}

struct ToVUYXFromEven : Groups<2 * kLanes, Each<4>, Each<1>, ChromaNeighbours<0, 1>, ChromaNeighbours<0, 1>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 chroma = LoadChroma(u, v);
        StoreVUYX(destination, chroma, AverageChroma<true>(chroma, LoadChroma(u + 1, v + 1)),
                  LoadBytesAsHalves(luma));
    }
};

/// A sample stands a quarter of the way from the even pixel's neighbour, and so does the next from the odd pixel's.
struct ToVUYXFromBetween
    : Groups<2 * kLanes, Each<4>, Each<1>, ChromaNeighbours<1, 1>, ChromaNeighbours<1, 1>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 chroma = LoadChroma(u, v);
        const I32 rounded = chroma + chroma + chroma + Ints(0x00020002);
        const I32 even = rounded + LoadChroma(u - 1, v - 1), odd = rounded + LoadChroma(u + 1, v + 1);
        const I32 code = Ints(0x00ff00ff);
        StoreVUYX(destination, ShiftRight<2>(even) & code, ShiftRight<2>(odd) & code,
                  LoadBytesAsHalves(luma));
    }
};

/// One sample a lane, of every kStep bytes the first.
template <int32_t kStep>
inline I32 LoadEvery(const uint8_t* source) {
    if constexpr (kStep == 1) {
        return LoadBytes(source);
    } else if constexpr (kStep == 2) {
        return LoadWords(source) & Ints(0xff);
    } else if constexpr (kStep == 4) {
        return LoadInts(source) & Ints(0xff);
    } else {
        I32 even, odd;
        LoadLanePairs(source, even, odd);
        return even & Ints(0xff);
    }
}

inline I32 OpaquePixels(I32 u, I32 v) {
    return v | ShiftLeft<8>(u) | Ints(-0x1000000);
}

template <int32_t kStep>
struct Every : Groups<kLanes, Each<4>, Each<kStep>, Each<kStep / 2>, Each<kStep / 2>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 chroma = OpaquePixels(LoadEvery<kStep / 2>(u), LoadEvery<kStep / 2>(v));
        Store(destination, chroma | ShiftLeft<16>(LoadEvery<kStep>(luma)));
    }
};

/// Two pixels share their chroma.
template <>
struct Every<1> : Groups<2 * kLanes, Each<4>, Each<1>, Each<1, 2>, Each<1, 2>> {
    static void Group(const uint8_t* luma, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 chroma = LoadChroma(u, v);
        StoreVUYX(destination, chroma, chroma, LoadBytesAsHalves(luma));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PlanarDecodeKernels& PK::PlanarDecodeKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PlanarDecodeKernels kernels = {
        .blendChroma = TwoRowsWith<BlendChroma, ChromaWeights>,
        .toUYVY = ThreePlanes<ToUYVY>,
        .toVUYXFromEven = ThreePlanes<ToVUYXFromEven>,
        .toVUYXFromBetween = ThreePlanes<ToVUYXFromBetween>,
        .every1 = ThreePlanes<Every<1>>,
        .every2 = ThreePlanes<Every<2>>,
        .every4 = ThreePlanes<Every<4>>,
        .every8 = ThreePlanes<Every<8>>,
    };
    return kernels;
}
