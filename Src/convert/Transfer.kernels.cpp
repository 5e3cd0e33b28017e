// The transfer function between gamma-coded and linear light.

#include "convert/ConversionKernels.h"
#include "convert/TransferTables.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/Samples.h"
#include "primitives/simd/Power.h"

namespace PK::PK_TARGET {
namespace {

constexpr double kToLinear = 2.4, kToGamma = 0.41666666;

/// sign(c) |c|^exponent on the colour of BGRA pixels.
template <const double& kExponent>
struct PowerColour : PixelGroup<16, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        F32 colour[3], alpha;
        LoadFloatChannels(source, colour[0], colour[1], colour[2], alpha);
        SignedPower(colour, Doubles(kExponent));
        StoreFloatChannels(destination, colour[0], colour[1], colour[2], alpha);
    }
};
using GammaToLinear = PowerColour<kToLinear>;
using LinearToGamma = PowerColour<kToGamma>;

/// Four table look-ups a pixel, which no vector instruction speeds up: a gather is slower than single loads.
struct Gamma8uToLinearFloat32 : Groups<1, Each<16>, Each<4>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const float* const linear = kTransferTables.linear;
        const float pixel[4] = {linear[source[0]], linear[source[1]], linear[source[2]],
                                static_cast<float>(source[3]) * kReciprocal255};
        std::memcpy(destination, pixel, sizeof pixel);
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
const PK::TransferKernels& PK::TransferKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr TransferKernels kernels = {
        .GammaToLinearRow = Row<GammaToLinear>,
        .LinearToGammaRow = Row<LinearToGamma>,
        .Gamma8uToLinearFloat32Row = Row<Gamma8uToLinearFloat32>,
        .LinearFloat32ToGamma8uRow = Row<LinearFloat32ToGamma8u>,
    };
    return kernels;
}
