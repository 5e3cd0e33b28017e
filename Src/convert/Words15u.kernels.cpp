// 10- and 16-bit words to words that are white at 32768.

#include "convert/BridgeKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

/// (c x 32768) / 1023, truncated, behind a first word of 65535, which is twice full scale. Both are
/// deliberately not what the vector form gives: hosts compare against each.
struct TruncateRGBToXRGB : Groups<1, Each<8>, Each<6>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        uint16_t rgb[3];
        std::memcpy(rgb, source, sizeof rgb);
        uint16_t xrgb[4] = {65535};
        for (int c = 0; c < 3; ++c) xrgb[c + 1] = static_cast<uint16_t>(rgb[c] * 32768u / 1023u);
        std::memcpy(destination, xrgb, sizeof xrgb);
    }
};

/// nearest(c x 32.03128), limited to 65535.
inline I32 ScaleTo15u(I32 codes) {
    return Min(Nearest(ToFloat(codes) * Floats(32.03128f)), Ints(0xffff));
}

/// Two pixels in each block of four lanes, of which the last is loaded as 16 bytes.
struct RoundRGBToXRGB : Groups<kLanes / 2, Each<8>, LoadedPast<Each<6>, 4>> {
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

constexpr RowKernel XRGBRow() {
    if constexpr (kTarget >= Target::sse41) return Row<RoundRGBToXRGB>;
    return Row<TruncateRGBToXRGB>;
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::Words15uKernels& PK::Words15uKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr Words15uKernels kernels = {XRGBRow(), Row<Halve<false>>, Row<Halve<true>>};
    return kernels;
}
