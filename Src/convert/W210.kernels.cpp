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
//   kReach               chromas from the group's first that it loads; of lumas it loads twice as many at most
//   static void Group(Pointers<kPlanes> planes, uint8_t* destination)

/// Where a group stands in its planes. By value, so that the pointers stay in registers: a store through the
/// destination might change what lies in memory.
template <int32_t kCount>
struct Pointers {
    const uint8_t* at[kCount];

    const uint8_t* operator[](int32_t plane) const { return at[plane]; }
};

/// What is left of a plane, with the last sample that counts repeated to the end of the last unit.
template <class Formula>
void FillWindow(const uint8_t* plane, int32_t samples, int32_t wanted, uint8_t* window) {
    std::memcpy(window, plane, static_cast<size_t>(2 * samples));
    const uint8_t* const last = plane + 2 * ((samples - 1) / Formula::kStep * Formula::kStep);
    for (int32_t i = samples; i < wanted; ++i) std::memcpy(window + 2 * i, last, 2);
}

template <class Formula>
constexpr int32_t kGroupBytes = Formula::kPixels / Formula::kUnit* Formula::kUnitBytes;

template <class Formula>
void Advance(Pointers<Formula::kPlanes>& planes) {
    for (int32_t i = 0; i < Formula::kPlanes; ++i)
        planes.at[i] += (i % 3 == 0 ? 2 : 1) * Formula::kLumas * Formula::kPixels;
}

/// The pixels at the end of a row, whose groups load more than is left of the planes. They have fewer than
/// kReach chromas, which leaves as many for what the last group loads.
template <class Formula>
void EndOfRow(Pointers<Formula::kPlanes> planes, uint8_t* destination, int32_t pixelsLeft) {
    constexpr int32_t kChromas = 2 * Formula::kReach;
    uint8_t windows[Formula::kPlanes][4 * kChromas] = {};
    const int32_t units = (pixelsLeft + Formula::kUnit - 1) / Formula::kUnit;
    const int32_t lumas = pixelsLeft * Formula::kLumas, wanted = units * Formula::kUnit * Formula::kLumas;
    for (int32_t i = 0; i < Formula::kPlanes; ++i) {
        const bool isLuma = i % 3 == 0;
        FillWindow<Formula>(planes[i], isLuma ? lumas : (lumas + 1) / 2, isLuma ? wanted : wanted / 2,
                            windows[i]);
        planes.at[i] = windows[i];
    }
    uint8_t to[(2 * Formula::kReach / Formula::kPixels + 1) * kGroupBytes<Formula>];
    uint8_t* group = to;
    for (int32_t left = pixelsLeft; left > 0; left -= Formula::kPixels, group += kGroupBytes<Formula>) {
        Formula::Group(planes, group);
        Advance<Formula>(planes);
    }
    std::memcpy(destination, to, static_cast<size_t>(units * Formula::kUnitBytes));
}

template <class Formula>
void FromPlanesRow(PlaneRows planes, uint8_t* destination, int32_t pixelsLeft) {
    constexpr int32_t kPixelsOfWholeGroup = (2 * Formula::kReach + Formula::kLumas - 1) / Formula::kLumas;
    Pointers<Formula::kPlanes> pointers;
    for (int32_t i = 0; i < Formula::kPlanes; ++i) pointers.at[i] = planes[i];
    for (; pixelsLeft >= kPixelsOfWholeGroup; pixelsLeft -= Formula::kPixels) {
        Formula::Group(pointers, destination);
        Advance<Formula>(pointers);
        destination += kGroupBytes<Formula>;
    }
    if (pixelsLeft > 0) EndOfRow<Formula>(pointers, destination, pixelsLeft);
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

struct ToV210 {
    static constexpr int32_t kPlanes = 3, kPixels = 6 * kGroups, kUnit = 6, kUnitBytes = 16;
    static constexpr int32_t kLumas = 1, kStep = 1;
    static constexpr int32_t kReach = 3 * (kGroups - 1) + 8;

    static void Group(Pointers<3> planes, uint8_t* destination) {
        StoreV210(destination, LoadGroups(planes[0], planes[1], planes[2]));
    }
};

struct AverageToV210 : ToV210 {
    static constexpr int32_t kPlanes = 6;

    static void Group(Pointers<6> planes, uint8_t* destination) {
        const GroupSamples upper = LoadGroups(planes[0], planes[1], planes[2]);
        const GroupSamples lower = LoadGroups(planes[3], planes[4], planes[5]);
        StoreV210(destination,
                  {AverageDown(upper.luma, lower.luma), AverageDown(upper.chroma, lower.chroma)});
    }
};

struct QuarterToV210 : ToV210 {
    static constexpr int32_t kLumas = 2, kStep = 2;
    static constexpr int32_t kReach = 6 * (kGroups - 1) + 8;

    static void Group(Pointers<3> planes, uint8_t* destination) {
        StoreV210(destination, LoadHalvedGroups(planes[0], planes[1], planes[2]));
    }
};

/// V >> 2, U >> 2, (Y + Y) >> 3 of the two lumas of a pair, and an opaque alpha.
struct QuarterToVUYX {
    static constexpr int32_t kPlanes = 3, kPixels = kLanes, kUnit = 1, kUnitBytes = 4;
    static constexpr int32_t kLumas = 2, kStep = 1;
    static constexpr int32_t kReach = kLanes;

    static void Group(Pointers<3> planes, uint8_t* destination) {
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
const PK::W210Kernels& PK::W210Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr W210Kernels kernels = {FromPlanesRow<ToV210>, FromPlanesRow<AverageToV210>,
                                            FromPlanesRow<QuarterToV210>, FromPlanesRow<QuarterToVUYX>};
    return kernels;
}
