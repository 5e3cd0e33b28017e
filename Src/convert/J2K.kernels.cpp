// RGB as a JPEG 2000 codec has it: three 16-bit words a pixel, or four floats of gamma-coded XYZ; and its
// float chroma, which is counted from 0.

#include "convert/BridgeKernels.h"
#include "convert/ColourMatrices.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/SampleTriples.h"
#include "primitives/simd/Power.h"

namespace PK::PK_TARGET {
namespace {

/// The words' 10 highest bits to bits 2-11, 12-21 and 22-31.
struct BGR16ToRGB10 : PixelGroup<kTripleBytes, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const SampleTriples bgr = LoadTriples(source);
        Store(destination, ShiftRight<4>(bgr.outer & Ints(0xffc0)) | ShiftLeft<6>(bgr.middle & Ints(0xffc0)) |
                               (bgr.outer & Ints(-0x400000)));
    }
};

struct RGB10ToBGR16 : PixelGroup<4, kTripleBytes> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreTriples<2>(destination, LoadInts(source));
    }
};

/// U and V minus 0.5. Luma keeps its bits, which adding 0 would not do for -0. A pixel is two samples, so the
/// last of an odd row moves U alone.
struct OffsetUYVY32f : Groups<kLanes / 2, Each<8>, Each<8>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 samples = LoadFloats(source);
        Store(destination, BlendBlocks<0b0101>(samples - Floats(0.5f), samples));
    }
};

/// The weights of X, Y and Z for linear light.
constexpr float kBlueFromXYZ[3] = {0.0556434f, -0.2040259f, 1.0572252f};
constexpr float kGreenFromXYZ[3] = {-0.969266f, 1.8760108f, 0.041556f};
constexpr float kRedFromXYZ[3] = {3.2404542f, -1.5371385f, -0.4985314f};

struct ZYXToBGR32f : PixelGroup<16, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        F32 zyx[3], unused;
        LoadFloatChannels(source, zyx[0], zyx[1], zyx[2], unused);
        SignedPower(zyx, Doubles(2.6));
        // X, Y and Z stand where a weighing looks for R, G and B.
        const Channels linear = {zyx[0], zyx[1], zyx[2], unused};
        F32 bgr[3] = {WeighRGB(kBlueFromXYZ, linear), WeighRGB(kGreenFromXYZ, linear),
                      WeighRGB(kRedFromXYZ, linear)};
        SignedPower(bgr, Doubles(0.41666666));
        StoreFloatChannels(destination, bgr[0], bgr[1], bgr[2], unused);
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::J2KKernels& PK::J2KKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr J2KKernels kernels = {Row<BGR16ToRGB10>, Row<RGB10ToBGR16>, Row<OffsetUYVY32f>,
                                           Row<ZYXToBGR32f>};
    return kernels;
}
