// The transfer function between gamma-coded and linear light.

#include "convert/Kernel.h"
#include "convert/RowGroups.h"
#include "convert/Samples.h"
#include "convert/TransferTables.h"
#include "primitives/simd/Power.h"

namespace PK::PK_TARGET {
namespace {

constexpr double kToLinear = 2.4;
constexpr double kToGamma = 0.41666666;

/// sign(c) |c|^exponent on the colour of BGRA pixels.
struct PowerColour : PixelGroup<16, 16> {
    static void Convert(const uint8_t* source, uint8_t* destination, double exponent) {
        Channels pixel;
        LoadFloatChannels(source, pixel.c0, pixel.c1, pixel.c2, pixel.c3);
        StoreFloatChannels(destination, SignedPower(pixel.c0, Doubles(exponent)),
                           SignedPower(pixel.c1, Doubles(exponent)), SignedPower(pixel.c2, Doubles(exponent)),
                           pixel.c3);
    }
};

struct GammaToLinear : PowerColour {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Convert(source, destination, kToLinear);
    }
};

struct LinearToGamma : PowerColour {
    static void Group(const uint8_t* source, uint8_t* destination) { Convert(source, destination, kToGamma); }
};

struct Gamma8uToLinearFloat32 : SampleGroup<1, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 codes = LoadBytes(source);
        const F32 alpha = ToFloat(codes) * Floats(kReciprocal255);
        Store(destination, Select(PixelInts(0, 0, 0, -1), alpha, Lookup(kTransferTables.linear, codes)));
    }
};

/// The count of thresholds not greater than the sample; 0 for NaN.
inline I32 GammaCode(F32 linear) {
    const F32 first = FromBits(Ints(kFirstGammaCell << 16));
    const F32 last = Floats(0x1.fffffep-1f);
    const I32 bits = Bits(Min(last, Max(linear, first)));
    const I32 cell = ShiftRight<16>(bits) - Ints(kFirstGammaCell);
    return ShiftRight<16>(Lookup(kTransferTables.gammaCells, cell) + (bits & Ints(0xffff)));
}

struct LinearFloat32ToGamma8u : PixelGroup<16, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Channels pixel;
        LoadFloatChannels(source, pixel.c0, pixel.c1, pixel.c2, pixel.c3);
        const I32 alpha = Nearest(AtMost(Floats(255), pixel.c3 * Floats(255)));
        Store(destination,
              PackByteChannels(GammaCode(pixel.c0), GammaCode(pixel.c1), GammaCode(pixel.c2), alpha));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
PK::KernelBodies PK::TransferBodies<PK::PK_TARGET::kTarget>() {
    using namespace PK_TARGET;
    static constexpr KernelBody bodies[] = {
        {Kernel::GammaToLinearRow, Row<GammaToLinear>},
        {Kernel::LinearToGammaRow, Row<LinearToGamma>},
        {Kernel::Gamma8uToLinearFloat32Row, Row<Gamma8uToLinearFloat32>},
        {Kernel::LinearFloat32ToGamma8uRow, Row<LinearFloat32ToGamma8u>},
    };
    return bodies;
}
