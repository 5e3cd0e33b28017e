// Premultiplication by alpha and its inverse, and the two kernels that expand to float on the way.

#include "convert/ConversionKernels.h"
#include "primitives/Thresholds.h"
#include "primitives/lanes/ByteScale.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/Samples.h"

namespace PK::PK_TARGET {
namespace {

using enum AlphaPlace;

// A depth tells how its pixels are loaded and stored as vectors, and what they become by their alpha: Scaled times it,
// Unscaled divided by it. A host may have unmasked floating-point exceptions, and alpha 0 is ordinary: so nothing here
// divides by it.

/// The zeros of chroma and luma, which are scaled about.
struct Zeros {
    int32_t chroma, luma;
};
constexpr Zeros kRGB = {0, 0}, kVUY = {128, 16};

template <AlphaPlace kAlpha, Zeros kZeros>
struct Pixels8u : PixelGroup<4, 4> {
    static I32 Load(const uint8_t* source) { return LoadInts(source); }
    static void Put(uint8_t* destination, I32 pixels) { Store(destination, pixels); }

    static I32 Scaled(I32 pixels) {
        const I32 alpha = kAlpha == last ? ShiftRight<24>(pixels) : pixels & Ints(0xff);
        const I32 colour = ScaleBytes<kZeros.chroma | kZeros.luma << 16, kZeros.chroma>(pixels, alpha);
        return Select(Ints(kAlpha == last ? -0x1000000 : 0xff), pixels, colour);
    }

    /// nearest((c - zero) x (255 / a) + zero), clamped by the pack; a pixel of alpha 0 becomes all zeros.
    static I32 Unscaled(I32 pixels) {
        const IntChannels c = InOrder<kAlpha>(ByteChannels(pixels));
        const F32 factor = Floats(255) / Max(ToFloat(c.c3), Floats(1));
        const I32 result =
            PackByteChannels(Moved<kZeros.chroma>(c.c0, factor), Moved<kZeros.chroma>(c.c1, factor),
                             Moved<kZeros.luma>(c.c2, factor), c.c3);
        return (kAlpha == last ? result : ReverseBytes(result)) & Not(Equal(c.c3, Ints(0)));
    }

    template <int32_t kZero>
    static I32 Moved(I32 code, F32 factor) {
        return Nearest((ToFloat(code) - Floats(kZero)) * factor + Floats(kZero));
    }
};

template <AlphaPlace kAlpha>
struct Pixels15u : SampleGroup<2, 2> {
    static I32 Load(const uint8_t* source) { return LoadWords(source); }
    static void Put(uint8_t* destination, I32 samples) { StoreWords(destination, samples); }

    static I32 Times(I32 samples, F32 factor) { return Min(Nearest(ToFloat(samples) * factor), Ints(32768)); }

    static I32 Scaled(I32 samples) {
        const F32 alpha = BroadcastAlpha<kAlpha>(ToFloat(samples));
        return Select(AlphaLanes<kAlpha>(), samples, Times(samples, alpha * Floats(0x1p-15f)));
    }

    /// Alpha 0 clears the colour; otherwise nearest(c x (32768 / a)), limited to full scale.
    static I32 Unscaled(I32 samples) {
        const F32 alpha = BroadcastAlpha<kAlpha>(ToFloat(samples));
        const I32 colour = Times(samples, Floats(32768) / Max(alpha, Floats(1)));
        return Select(AlphaLanes<kAlpha>(), samples, colour & Less(Floats(0), alpha));
    }
};

template <AlphaPlace kAlpha>
struct Pixels32 : SampleGroup<4, 4> {
    static F32 Load(const uint8_t* source) { return LoadFloats(source); }
    static void Put(uint8_t* destination, F32 samples) { Store(destination, samples); }

    static F32 Scaled(F32 samples) {
        return Select(AlphaLanes<kAlpha>(), samples, samples * BroadcastAlpha<kAlpha>(samples));
    }

    /// c x the processor's reciprocal estimate of alpha, unrefined; below 8e-6 alpha counts as 0.
    static F32 Unscaled(F32 samples) {
        const F32 alpha = BroadcastAlpha<kAlpha>(samples);
        const F32 least = Floats(kNegligible);
        const F32 factor = ReciprocalEstimate(Max(least, alpha)); // NaN stays
        const F32 result = Select(AlphaLanes<kAlpha>(), samples, samples * factor);
        return Select(Less(alpha, least), Floats(0), result);
    }
};

/// Bytes that become floats before they are scaled.
template <F32 (*kExpand)(F32)>
struct BytesTo32f : SampleGroup<1, 4> {
    static F32 Load(const uint8_t* source) { return kExpand(LoadBytesAsFloats(source)); }
    static void Put(uint8_t* destination, F32 samples) { Store(destination, samples); }
    static F32 Scaled(F32 samples) { return Pixels32<last>::Scaled(samples); }
};

template <class Pixels>
struct Premultiply : Pixels {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Pixels::Put(destination, Pixels::Scaled(Pixels::Load(source)));
    }
};

template <class Pixels>
struct Unpremultiply : Pixels {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Pixels::Put(destination, Pixels::Unscaled(Pixels::Load(source)));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PremultiplyKernels& PK::PremultiplyKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PremultiplyKernels kernels = {
        .PremultiplyRow_BGRA_8u = Row<Premultiply<Pixels8u<last, kRGB>>>,
        .PremultiplyRow_ARGB_8u = Row<Premultiply<Pixels8u<first, kRGB>>>,
        .PremultiplyRow_VUYA_8u = Row<Premultiply<Pixels8u<last, kVUY>>>,
        .PremultiplyRow_BGRA_15u = Row<Premultiply<Pixels15u<last>>>,
        .PremultiplyRow_ARGB_15u = Row<Premultiply<Pixels15u<first>>>,
        .PremultiplyRow_BGRA_32f = Row<Premultiply<Pixels32<last>>>,
        .PremultiplyRow_ARGB_32f = Row<Premultiply<Pixels32<first>>>,
        .UnpremultiplyRow_BGRA_8u = Row<Unpremultiply<Pixels8u<last, kRGB>>>,
        .UnpremultiplyRow_ARGB_8u = Row<Unpremultiply<Pixels8u<first, kRGB>>>,
        .UnpremultiplyRow_VUYA_8u = Row<Unpremultiply<Pixels8u<last, kVUY>>>,
        .UnpremultiplyRow_BGRA_15u = Row<Unpremultiply<Pixels15u<last>>>,
        .UnpremultiplyRow_ARGB_15u = Row<Unpremultiply<Pixels15u<first>>>,
        .UnpremultiplyRow_BGRA_32f = Row<Unpremultiply<Pixels32<last>>>,
        .UnpremultiplyRow_ARGB_32f = Row<Unpremultiply<Pixels32<first>>>,
        .BGRA8uToBGRP32fRow = Row<Premultiply<BytesTo32f<ExpandBGRA>>>,
        .VUYA8uToVUYP32fRow = Row<Premultiply<BytesTo32f<ExpandVUYA>>>,
    };
    return kernels;
}
