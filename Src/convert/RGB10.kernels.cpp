// Ten-bit packed RGB: one 32-bit word a pixel, with B at bits 2-11, G at bits 12-21 and R at bits 22-31. Bits
// 0 and 1 are zero on writing and ignored on reading. Where two samples share a vector, one stands in the
// lower and one in the upper 16-bit half of each lane.

#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/Samples.h"

namespace PK::PK_TARGET {
namespace {

inline I32 InBothHalves(int32_t x) {
    return Ints(x << 16 | x);
}

/// The 10-bit sample at kPosition of a word, in the lower half.
template <int kPosition>
inline I32 Sample(I32 words) {
    return ShiftRight<kPosition>(words) & Ints(0x3ff);
}

/// 4 c + ((c x 772) >> 16), which is the quotient (c x 1023) / 255 for all 256 codes.
inline I32 ScaleBytesTo10u(I32 codes) {
    return ShiftLeft<2>(codes) + MultiplyHalvesHigh(codes, InBothHalves(772));
}

/// 4 c + (((c + 42) x 772) >> 16), which is truncated((c / 255) x 1023 + 0.5) for all 256 codes: what a code
/// becomes by way of floats.
inline I32 RoundBytesTo10u(I32 codes) {
    return ShiftLeft<2>(codes) + MultiplyHalvesHigh(codes + InBothHalves(42), InBothHalves(772));
}

template <I32 (*kScale)(I32)>
struct BGR8ToRGB10 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 pixels = LoadInts(source);
        const I32 blueAndRed = kScale(pixels & Ints(0x00ff00ff));
        const I32 green = kScale(ShiftRight<8>(pixels) & Ints(0xff));
        const I32 blue = ShiftLeft<2>(blueAndRed & Ints(0x3ff));
        const I32 red = ShiftLeft<6>(blueAndRed & Ints(0x03ff0000));
        Store(destination, blue | ShiftLeft<12>(green) | red);
    }
};

/// (c x 1023) >> 15, limited to full scale for words above 32768.
inline I32 ScaleWordsTo10u(I32 words) {
    return MinHalves(MultiplyHalvesHigh(words, InBothHalves(2 * 1023)), InBothHalves(1023));
}

struct BGR15ToRGB10 : PixelGroup<8, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        I32 blueAndGreen, redAndAlpha;
        LoadLanePairs(source, blueAndGreen, redAndAlpha);
        blueAndGreen = ScaleWordsTo10u(blueAndGreen);
        const I32 blue = ShiftLeft<2>(blueAndGreen & Ints(0x3ff));
        const I32 green = ShiftRight<4>(blueAndGreen & Ints(0x03ff0000));
        const I32 red = ShiftLeft<22>(ScaleWordsTo10u(redAndAlpha)); // pushes alpha out
        Store(destination, blue | green | red);
    }
};

/// Truncated(c x 1023 + 0.5), c limited to 0 and 1.
inline I32 ScaleFloatsTo10u(F32 values) {
    return Truncate(LimitToUnit(values) * Floats(1023) + Floats(0.5f));
}

inline void StoreFloatsAs10u(uint8_t* destination, F32 blue, F32 green, F32 red) {
    Store(destination, ShiftLeft<2>(ScaleFloatsTo10u(blue)) | ShiftLeft<12>(ScaleFloatsTo10u(green)) |
                           ShiftLeft<22>(ScaleFloatsTo10u(red)));
}

struct BGR32fToRGB10 : PixelGroup<16, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Channels bgra;
        LoadFloatChannels(source, bgra.c0, bgra.c1, bgra.c2, bgra.c3);
        StoreFloatsAs10u(destination, bgra.c0, bgra.c1, bgra.c2);
    }
};

/// Bytes expanded to float and premultiplied on the way. The product of two codes needs the floats'
/// roundings.
struct StraightBGR8ToRGB10 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const IntChannels bgra = LoadByteChannels(source);
        const F32 scale = Floats(kReciprocal255);
        const F32 alpha = ToFloat(bgra.c3) * scale;
        StoreFloatsAs10u(destination, ToFloat(bgra.c0) * scale * alpha, ToFloat(bgra.c1) * scale * alpha,
                         ToFloat(bgra.c2) * scale * alpha);
    }
};

/// ((c + 2) x 16336) >> 16, which is nearest(c x 0.24926686) for all 1024 codes.
inline I32 Scale10uToBytes(I32 codes) {
    return MultiplyHalvesHigh(codes + InBothHalves(2), InBothHalves(16336));
}

struct RGB10ToBGR8 : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        const I32 blueAndRed = Sample<2>(words) | (ShiftRight<6>(words) & Ints(0x03ff0000));
        const I32 green = Scale10uToBytes(Sample<12>(words));
        const I32 alpha = Ints(static_cast<int32_t>(0xff000000));
        Store(destination, Scale10uToBytes(blueAndRed) | ShiftLeft<8>(green) | alpha);
    }
};

/// nearest(c x 32.03128), 32768 at most by itself.
inline I32 Scale10uTo15u(I32 codes) {
    return Nearest(ToFloat(codes) * Floats(32.03128f));
}

struct RGB10ToBGR15 : PixelGroup<4, 8> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        const I32 blue = Scale10uTo15u(Sample<2>(words));
        const I32 green = Scale10uTo15u(Sample<12>(words));
        const I32 red = Scale10uTo15u(Sample<22>(words));
        const I32 alpha = Ints(static_cast<int32_t>(0x80000000)); // 32768 in the upper half
        StoreLanePairs(destination, blue | ShiftLeft<16>(green), red | alpha);
    }
};

inline F32 Scale10uToFloats(I32 codes) {
    return ToFloat(codes) * Floats(0.0009775171f);
}

struct RGB10ToBGR32f : PixelGroup<4, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        StoreFloatChannels(destination, Scale10uToFloats(Sample<2>(words)),
                           Scale10uToFloats(Sample<12>(words)), Scale10uToFloats(Sample<22>(words)),
                           Floats(1));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::RGB10Kernels& PK::RGB10Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr RGB10Kernels kernels = {
        .BGR8uToRGB10uRow = Row<BGR8ToRGB10<ScaleBytesTo10u>>,
        .BGR15uToRGB10uRow = Row<BGR15ToRGB10>,
        .BGR32fToRGB10uRow = Row<BGR32fToRGB10>,
        .RGB10uToBGR8uRow = Row<RGB10ToBGR8>,
        .RGB10uToBGR15uRow = Row<RGB10ToBGR15>,
        .RGB10uToBGR32fRow = Row<RGB10ToBGR32f>,
        .OpaqueBGRToRGB10 = Row<BGR8ToRGB10<RoundBytesTo10u>>,
        .StraightBGRToRGB10 = Row<StraightBGR8ToRGB10>,
    };
    return kernels;
}
