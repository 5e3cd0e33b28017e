// Premultiplication by alpha and its inverse, and the two kernels that expand to float on the way.

#include "convert/ByteScale.h"
#include "convert/ConversionKernels.h"
#include "convert/Samples.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

struct PremultiplyBGRA8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 pixels = LoadInts(source);
        const I32 colour = ScaleBytes(pixels, ShiftRight<24>(pixels));
        Store(destination, Select(Ints(0x00ffffff), colour, pixels));
    }
};

struct PremultiplyARGB8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 pixels = LoadInts(source);
        const I32 colour = ScaleBytes(pixels, pixels & Ints(0xff));
        Store(destination, Select(Ints(0xff), pixels, colour));
    }
};

/// Chroma is scaled about 128 and luma about 16.
struct PremultiplyVUYA8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 pixels = LoadInts(source);
        const I32 low = Ints(0x00ff00ff);
        const I32 alpha = InBothHalves(ShiftRight<24>(pixels));
        const I32 vAndY = ScaleHalves(pixels & low, alpha, Ints(0x00100080));
        const I32 u = ScaleHalves(ShiftRight<8>(pixels) & low, alpha, ChromaZero());
        Store(destination, Select(Ints(0x00ffffff), vAndY | ShiftLeft<8>(u), pixels));
    }
};

/// The alpha of each interleaved pixel in all four of its lanes.
template <bool kAlphaFirst>
inline F32 BroadcastAlpha(F32 pixels) {
    if constexpr (kAlphaFirst)
        return ShufflePixel<0, 0, 0, 0>(pixels);
    else
        return ShufflePixel<3, 3, 3, 3>(pixels);
}

template <bool kAlphaFirst>
inline I32 AlphaMask() {
    return kAlphaFirst ? PixelInts(-1, 0, 0, 0) : PixelInts(0, 0, 0, -1);
}

template <bool kAlphaFirst>
struct Premultiply15u : SampleGroup<2, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 samples = LoadWords(source);
        const F32 values = ToFloat(samples);
        const F32 factor = BroadcastAlpha<kAlphaFirst>(values) * Floats(3.0517578e-05f); // 1 / 32768
        const I32 scaled = Min(Nearest(values * factor), Ints(32768));
        StoreWords(destination, Select(AlphaMask<kAlphaFirst>(), samples, scaled));
    }
};

template <bool kAlphaFirst>
struct Premultiply32f : SampleGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pixels = LoadFloats(source);
        const F32 scaled = pixels * BroadcastAlpha<kAlphaFirst>(pixels);
        Store(destination, Select(AlphaMask<kAlphaFirst>(), pixels, scaled));
    }
};

// A host may have unmasked floating-point exceptions, and alpha 0 is ordinary: so nothing here divides by it.

/// nearest((c - zero) x (255 / a) + zero), clamped by the pack; a pixel of alpha 0 becomes all zeros.
inline I32 UnpremultiplyChannel(I32 channel, F32 factor, float zero) {
    return Nearest((ToFloat(channel) - Floats(zero)) * factor + Floats(zero));
}

inline I32 Unpremultiply(IntChannels pixel, float chromaZero, float lumaZero) {
    const F32 factor = Floats(255) / Max(ToFloat(pixel.c3), Floats(1));
    const I32 result = PackByteChannels(UnpremultiplyChannel(pixel.c0, factor, chromaZero),
                                        UnpremultiplyChannel(pixel.c1, factor, chromaZero),
                                        UnpremultiplyChannel(pixel.c2, factor, lumaZero), pixel.c3);
    return result & Not(Equal(pixel.c3, Ints(0)));
}

struct UnpremultiplyBGRA8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, Unpremultiply(LoadByteChannels(source), 0, 0));
    }
};

struct UnpremultiplyARGB8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const IntChannels argb = LoadByteChannels(source);
        Store(destination, ReverseBytes(Unpremultiply({argb.c3, argb.c2, argb.c1, argb.c0}, 0, 0)));
    }
};

struct UnpremultiplyVUYA8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, Unpremultiply(LoadByteChannels(source), 128, 16));
    }
};

/// Alpha 0 clears the colour; otherwise nearest(c x (32768 / a)), limited to full scale.
template <bool kAlphaFirst>
struct Unpremultiply15u : SampleGroup<2, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 samples = LoadWords(source);
        const F32 values = ToFloat(samples);
        const F32 alpha = BroadcastAlpha<kAlphaFirst>(values);
        const F32 factor = Floats(32768) / Max(alpha, Floats(1));
        const I32 scaled = Min(Nearest(values * factor), Ints(32768));
        const I32 colour = scaled & Less(Floats(0), alpha);
        StoreWords(destination, Select(AlphaMask<kAlphaFirst>(), samples, colour));
    }
};

/// c x the processor's reciprocal estimate of alpha, unrefined; below 8e-6 alpha counts as 0.
template <bool kAlphaFirst>
struct Unpremultiply32f : SampleGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pixels = LoadFloats(source);
        const F32 alpha = BroadcastAlpha<kAlphaFirst>(pixels);
        const F32 least = Floats(8e-6f);
        const F32 factor = ReciprocalEstimate(Max(least, alpha)); // NaN stays
        const F32 scaled = Select(AlphaMask<kAlphaFirst>(), pixels, pixels * factor);
        Store(destination, Select(Less(alpha, least), Floats(0), scaled));
    }
};

struct ExpandPremultipliedBGRA8 : SampleGroup<1, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pixels = LoadBytesAsFloats(source) * Floats(kReciprocal255);
        const F32 scaled = pixels * BroadcastAlpha<false>(pixels);
        Store(destination, Select(AlphaMask<false>(), pixels, scaled));
    }
};

struct ExpandPremultipliedVUYA8 : SampleGroup<1, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const F32 pixels = ExpandVUYA(LoadBytesAsFloats(source));
        const F32 scaled = pixels * BroadcastAlpha<false>(pixels);
        Store(destination, Select(AlphaMask<false>(), pixels, scaled));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::PremultiplyKernels& PK::PremultiplyKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr PremultiplyKernels kernels = {
        .PremultiplyRow_BGRA_8u = Row<PremultiplyBGRA8>,
        .PremultiplyRow_ARGB_8u = Row<PremultiplyARGB8>,
        .PremultiplyRow_VUYA_8u = Row<PremultiplyVUYA8>,
        .PremultiplyRow_BGRA_15u = Row<Premultiply15u<false>>,
        .PremultiplyRow_ARGB_15u = Row<Premultiply15u<true>>,
        .PremultiplyRow_BGRA_32f = Row<Premultiply32f<false>>,
        .PremultiplyRow_ARGB_32f = Row<Premultiply32f<true>>,
        .UnpremultiplyRow_BGRA_8u = Row<UnpremultiplyBGRA8>,
        .UnpremultiplyRow_ARGB_8u = Row<UnpremultiplyARGB8>,
        .UnpremultiplyRow_VUYA_8u = Row<UnpremultiplyVUYA8>,
        .UnpremultiplyRow_BGRA_15u = Row<Unpremultiply15u<false>>,
        .UnpremultiplyRow_ARGB_15u = Row<Unpremultiply15u<true>>,
        .UnpremultiplyRow_BGRA_32f = Row<Unpremultiply32f<false>>,
        .UnpremultiplyRow_ARGB_32f = Row<Unpremultiply32f<true>>,
        .BGRA8uToBGRP32fRow = Row<ExpandPremultipliedBGRA8>,
        .VUYA8uToVUYP32fRow = Row<ExpandPremultipliedVUYA8>,
    };
    return kernels;
}
