// Three planes of 10-bit words, 4:2:2, to V210 and to 8-bit pixels of half the width.

#include "convert/BridgeKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/SampleTriples.h"

namespace PK::PK_TARGET {
namespace {

/// A plane of kSamples samples for every kPixels pixels of the destination. At the end of a row the last sample that
/// counts, which is one of every kStep, is repeated.
template <int32_t kSamples, int32_t kPixels, int32_t kStep, int32_t kLoaded>
struct Plane : Each<2 * kSamples, kPixels> {
    static constexpr int32_t kBytesAfter = kLoaded;

    static void Complete(uint8_t* window, RowEnd end) {
        const int64_t samples = Plane::BytesOf(end.elementsLeft) / 2;
        const int64_t wanted = Plane::BytesOf(end.groupElements) / 2 + kLoaded / 2;
        const int64_t last = (samples - 1) / kStep * kStep;
        for (int64_t i = samples; i < wanted; ++i) std::memcpy(window + 2 * i, window + 2 * last, 2);
    }
};

constexpr int32_t kGroups = kLanes / 4; // of six pixels in a vector

/// The samples of six pixels a block, in 16-bit halves: six lumas; three U, any half, three V.
struct GroupSamples {
    I32 luma;
    I32 chroma;
};

inline I32 LoadBlocks(const uint8_t* source, int32_t stride) {
    return Bits(LoadFloatBlocks(source, stride));
}

inline GroupSamples LoadGroups(const uint8_t* y, const uint8_t* u, const uint8_t* v) {
    return {LoadBlocks(y, 12),
            BlendBlocks<0b0011>(LoadBlocks(u, 6), ShufflePixel<0, 1, 0, 1>(LoadBlocks(v, 6)))};
}

/// Every second sample.
inline GroupSamples LoadHalvedGroups(const uint8_t* y, const uint8_t* u, const uint8_t* v) {
    return {BlendBlocks<0b0011>(HalvesAt<0, 4, 8, 12, 0, 0, 0, 0>(LoadBlocks(y, 24)),
                                HalvesAt<0, 0, 0, 0, 8, 12, 8, 12>(LoadBlocks(y + 8, 24))),
            BlendBlocks<0b0011>(HalvesAt<0, 4, 8, 8, 0, 0, 0, 0>(LoadBlocks(u, 12)),
                                HalvesAt<0, 0, 0, 0, 0, 4, 8, 8>(LoadBlocks(v, 12)))};
}

/// (a + b) >> 1 in each half.
inline I32 AverageDown(I32 a, I32 b) {
    return (a & b) + (ShiftRight<1>(a ^ b) & Ints(0x7fff7fff));
}

/// The words U0 Y0 V0, Y1 U1 Y2, V1 Y3 U2 and Y4 V2 Y5.
inline void StoreV210(uint8_t* destination, GroupSamples samples) {
    const I32 chroma = HalvesAt<0, 8, 2, 2, 10, 4, 12, 12>(samples.chroma);
    const I32 luma = HalvesAt<0, 0, 2, 4, 6, 6, 8, 10>(samples.luma);
    Store(destination, PackTriples({BlendBlocks<0b0101>(chroma, luma), BlendBlocks<0b0101>(luma, chroma)}));
}

/// The last block of a group is loaded as 16 bytes, of which lumas use 12 and chromas 6.
using Luma = Plane<1, 1, 1, 4>;
using Chroma = Plane<1, 2, 1, 10>;
template <class... Planes>
using PlanesToV210 = Groups<6 * kGroups, Each<16, 6>, Planes...>;

struct ToV210 : PlanesToV210<Luma, Chroma, Chroma> {
    static void Group(const uint8_t* y, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        StoreV210(destination, LoadGroups(y, u, v));
    }
};

/// The average of two rows.
struct AverageToV210 : PlanesToV210<Luma, Chroma, Chroma, Luma, Chroma, Chroma> {
    static void Group(const uint8_t* upperY, const uint8_t* upperU, const uint8_t* upperV,
                      const uint8_t* lowerY, const uint8_t* lowerU, const uint8_t* lowerV,
                      uint8_t* destination) {
        const GroupSamples upper = LoadGroups(upperY, upperU, upperV);
        const GroupSamples lower = LoadGroups(lowerY, lowerU, lowerV);
        StoreV210(destination,
                  {AverageDown(upper.luma, lower.luma), AverageDown(upper.chroma, lower.chroma)});
    }
};

/// Of two lumas the first, of two chromas the first. Chroma is loaded as 16 bytes for 12.
using HalvedLuma = Plane<2, 1, 2, 0>;
using HalvedChroma = Plane<1, 1, 2, 4>;
struct QuarterToV210 : PlanesToV210<HalvedLuma, HalvedChroma, HalvedChroma> {
    static void Group(const uint8_t* y, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        StoreV210(destination, LoadHalvedGroups(y, u, v));
    }
};

/// V >> 2, U >> 2, (Y + Y) >> 3 of the two lumas of a pair, and an opaque alpha.
struct QuarterToVUYX : Groups<kLanes, Each<4>, Each<4>, Each<2>, Each<2>> {
    static void Group(const uint8_t* lumaPairs, const uint8_t* u, const uint8_t* v, uint8_t* destination) {
        const I32 lumas = LoadInts(lumaPairs);
        const I32 y = ShiftLeft<13>((lumas & Ints(0xffff)) + ShiftRight<16>(lumas)) & Ints(0xff0000);
        const I32 cb = ShiftLeft<6>(LoadWords(u)) & Ints(0xff00);
        const I32 cr = ShiftRight<2>(LoadWords(v)) & Ints(0xff);
        Store(destination, cr | cb | y | Ints(-0x1000000));
    }
};

void AverageFromPlanes(PlaneRows planes, uint8_t* destination, int32_t width) {
    RunRow(AverageToV210(), width, destination, planes[0], planes[1], planes[2], planes[3], planes[4],
           planes[5]);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::W210Kernels& PK::W210Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr W210Kernels kernels = {ThreePlanes<ToV210>, AverageFromPlanes,
                                            ThreePlanes<QuarterToV210>, ThreePlanes<QuarterToVUYX>};
    return kernels;
}
