// 10- and 16-bit words to words that are white at 32768.

#include "convert/BridgeKernels.h"
#include "convert/RowGroups.h"
#include "convert/RowWindows.h"

namespace PK::PK_TARGET {
namespace {

/// (c x 32768) / 1023, truncated, behind a first word of 65535, which is twice full scale. Both are
/// deliberately not what the vector form gives: hosts compare against each.
void TruncateRGBToXRGBRow(const void* sourceRow, void* destinationRow, int32_t width) {
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    for (int32_t i = 0; i < width; ++i, source += 6, destination += 8) {
        uint16_t rgb[3];
        std::memcpy(rgb, source, sizeof rgb);
        uint16_t xrgb[4] = {65535};
        for (int c = 0; c < 3; ++c) xrgb[c + 1] = static_cast<uint16_t>(rgb[c] * 32768u / 1023u);
        std::memcpy(destination, xrgb, sizeof xrgb);
    }
}

/// nearest(c x 32.03128), limited to 65535.
inline I32 ScaleTo15u(I32 codes) {
    return Min(Nearest(ToFloat(codes) * Floats(32.03128f)), Ints(0xffff));
}

struct RoundRGBToXRGB : NoNeighbours {
    static constexpr int32_t kPixels = kLanes / 2; // two in each block of four lanes
    static constexpr int32_t kSourceUnit = 1, kDestinationUnit = 1;
    static constexpr int32_t kSourceBytes = 6 * kPixels, kDestinationBytes = 8 * kPixels;
    static constexpr int32_t kBytesAfter = 4; // the last block is loaded as 16 bytes

    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 triples = Bits(LoadFloatBlocks(source, 12));
        const I32 unusedRedGreenBlue = HalvesAt<0, 0, 2, 4, 6, 6, 8, 10>(triples);
        const I32 green = ScaleTo15u(unusedRedGreenBlue & PixelInts(0, 0xffff, 0, 0xffff));
        const I32 redAndBlue = ScaleTo15u(ShiftRight<16>(unusedRedGreenBlue));
        Store(destination, green | ShiftLeft<16>(redAndBlue));
    }
};

/// ((c << 15) | 0x7fff) / 65535, truncated, which is (c + 1) >> 1 and nearest(c x 0.50000304) for all codes.
template <bool kSwap>
struct Halve : SampleGroup<2, 2, 1, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        Store(destination, AverageHalves(kSwap ? SwapBytes(words) : words, Ints(0)));
    }
};

constexpr BridgeRow XRGBRow() {
    if constexpr (Target::PK_TARGET >= Target::sse41) return WindowRow<RoundRGBToXRGB>;
    return TruncateRGBToXRGBRow;
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::Words15uKernels& PK::Words15uKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr Words15uKernels kernels = {XRGBRow(), Row<Halve<false>>, Row<Halve<true>>};
    return kernels;
}
