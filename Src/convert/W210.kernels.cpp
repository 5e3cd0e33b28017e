// Three planes of 10-bit words, 4:2:2, to V210 and to 8-bit pixels of half the width.

#include "convert/BridgeKernels.h"
#include "convert/SampleTriples.h"

namespace PK::PK_TARGET {
namespace {

// A formula has
//
//   kPlanes              rows that it reads: Y, U and V of one row, or of two rows
//   kPixels              destination pixels of one group
//   kUnit, kUnitBytes    destination pixels that cannot be parted, and their bytes
//   kLumas               source lumas for each destination pixel, of which every kStep-th counts
//   kReach               chromas from the group's first that it loads; of lumas it loads fewer than twice as
//                        many, or just as many as that where kLumas is 2
//   static void Group(PlaneRows planes, uint8_t* destination)

/// What is left of the planes, filled up with repetitions of the last sample that counts.
template <class Formula>
void FillWindow(const uint8_t* plane, int32_t samples, uint8_t* window, int32_t windowSamples) {
    const int32_t kept = samples < windowSamples ? samples : windowSamples;
    std::memcpy(window, plane, static_cast<size_t>(2 * kept));
    const uint8_t* const last = plane + 2 * ((samples - 1) / Formula::kStep * Formula::kStep);
    for (int32_t i = kept; i < windowSamples; ++i) std::memcpy(window + 2 * i, last, 2);
}

/// A group that loads more than is left of the planes.
template <class Formula>
void EndGroup(PlaneRows planes, uint8_t* destination, int32_t pixelsLeft) {
    constexpr int32_t kWindowBytes = 4 * Formula::kReach;
    uint8_t windows[Formula::kPlanes][kWindowBytes];
    const uint8_t* rows[Formula::kPlanes];
    const int32_t lumas = pixelsLeft * Formula::kLumas;
    for (int32_t i = 0; i < Formula::kPlanes; ++i) {
        const bool isLuma = i % 3 == 0;
        FillWindow<Formula>(planes[i], isLuma ? lumas : (lumas + 1) / 2, windows[i],
                            isLuma ? 2 * Formula::kReach : Formula::kReach);
        rows[i] = windows[i];
    }
    uint8_t to[Formula::kPixels / Formula::kUnit * Formula::kUnitBytes];
    Formula::Group(rows, to);
    const int32_t pixels = pixelsLeft < Formula::kPixels ? pixelsLeft : Formula::kPixels;
    const int32_t units = (pixels + Formula::kUnit - 1) / Formula::kUnit;
    std::memcpy(destination, to, static_cast<size_t>(units * Formula::kUnitBytes));
}

template <class Formula>
void FromPlanesRow(PlaneRows planes, uint8_t* destination, int32_t pixelsLeft) {
    const uint8_t* at[Formula::kPlanes];
    for (int32_t i = 0; i < Formula::kPlanes; ++i) at[i] = planes[i];
    while (pixelsLeft > 0) {
        if ((int64_t{pixelsLeft} * Formula::kLumas + 1) / 2 >= Formula::kReach)
            Formula::Group(at, destination);
        else
            EndGroup<Formula>(at, destination, pixelsLeft);
        for (int32_t i = 0; i < Formula::kPlanes; ++i)
            at[i] += (i % 3 == 0 ? 2 : 1) * Formula::kLumas * Formula::kPixels;
        destination += Formula::kPixels / Formula::kUnit * Formula::kUnitBytes;
        pixelsLeft -= Formula::kPixels;
    }
}

constexpr int32_t kGroups = kLanes / 4; // of six pixels in a vector

/// The samples of six pixels a block, in 16-bit halves: six lumas; three U, any half, three V.
struct GroupSamples {
    I32 luma;
    I32 chroma;
};

inline I32 LoadBlocks(const uint8_t* source, int32_t stride) {
    return Bits(LoadFloatBlocks(source, stride));
}

inline GroupSamples LoadGroups(PlaneRows planes) {
    return {
        LoadBlocks(planes[0], 12),
        BlendBlocks<0b0011>(LoadBlocks(planes[1], 6), ShufflePixel<0, 1, 0, 1>(LoadBlocks(planes[2], 6)))};
}

/// Every second sample.
inline GroupSamples LoadHalvedGroups(PlaneRows planes) {
    return {BlendBlocks<0b0011>(HalvesAt<0, 4, 8, 12, 0, 0, 0, 0>(LoadBlocks(planes[0], 24)),
                                HalvesAt<0, 0, 0, 0, 8, 12, 8, 12>(LoadBlocks(planes[0] + 8, 24))),
            BlendBlocks<0b0011>(HalvesAt<0, 4, 8, 8, 0, 0, 0, 0>(LoadBlocks(planes[1], 12)),
                                HalvesAt<0, 0, 0, 0, 0, 4, 8, 8>(LoadBlocks(planes[2], 12)))};
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

struct ToV210 {
    static constexpr int32_t kPlanes = 3, kPixels = 6 * kGroups, kUnit = 6, kUnitBytes = 16;
    static constexpr int32_t kLumas = 1, kStep = 1;
    static constexpr int32_t kReach = 3 * (kGroups - 1) + 8;

    static void Group(PlaneRows planes, uint8_t* destination) { StoreV210(destination, LoadGroups(planes)); }
};

struct AverageToV210 : ToV210 {
    static constexpr int32_t kPlanes = 6;

    static void Group(PlaneRows planes, uint8_t* destination) {
        const GroupSamples upper = LoadGroups(planes), lower = LoadGroups(planes + 3);
        StoreV210(destination,
                  {AverageDown(upper.luma, lower.luma), AverageDown(upper.chroma, lower.chroma)});
    }
};

struct QuarterToV210 : ToV210 {
    static constexpr int32_t kLumas = 2, kStep = 2;
    static constexpr int32_t kReach = 6 * (kGroups - 1) + 8;

    static void Group(PlaneRows planes, uint8_t* destination) {
        StoreV210(destination, LoadHalvedGroups(planes));
    }
};

/// V >> 2, U >> 2, (Y + Y) >> 3 of the two lumas of a pair, and an opaque alpha.
struct QuarterToVUYX {
    static constexpr int32_t kPlanes = 3, kPixels = kLanes, kUnit = 1, kUnitBytes = 4;
    static constexpr int32_t kLumas = 2, kStep = 1;
    static constexpr int32_t kReach = kLanes;

    static void Group(PlaneRows planes, uint8_t* destination) {
        const I32 lumas = LoadInts(planes[0]);
        const I32 y = ShiftLeft<13>((lumas & Ints(0xffff)) + ShiftRight<16>(lumas)) & Ints(0xff0000);
        const I32 u = ShiftLeft<6>(LoadWords(planes[1])) & Ints(0xff00);
        const I32 v = ShiftRight<2>(LoadWords(planes[2])) & Ints(0xff);
        Store(destination, v | u | y | Ints(-0x1000000));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::W210Kernels& PK::W210Kernels::For<PK::PK_TARGET::kTarget>() {
    using namespace PK_TARGET;
    static constexpr W210Kernels kernels = {FromPlanesRow<ToV210>, FromPlanesRow<AverageToV210>,
                                            FromPlanesRow<QuarterToV210>, FromPlanesRow<QuarterToVUYX>};
    return kernels;
}
