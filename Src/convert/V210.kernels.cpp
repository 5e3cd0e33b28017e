// Ten-bit packed 4:2:2: six pixels in four words, three samples a word, in the order of UYVY.

#include "convert/ColourMatrices.h"
#include "convert/ConversionKernels.h"
#include "primitives/lanes/ChromaPairs.h"
#include "primitives/lanes/V210Samples.h"

namespace PK::PK_TARGET {
namespace {

/// A group of six, and what has other units on the other side.
using V210 = Each<16, 6>;
template <class Source, class Destination>
using GroupsOfSix = Groups<6 * kV210Groups, Destination, Source>;

struct UYVY8ToV210 : GroupsOfSix<Each<4, 2>, V210> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 samples = HalvesAt<0, 2, 3, 5, 6, 8, 9, 11>(LoadThrees(source)); // three bytes a lane
        const I32 outer = MultiplyHalves(samples & Ints(0x00ff00ff), Ints(4 | 64 << 16));
        Store(destination, outer | ShiftLeft<4>(samples & Ints(0xff00)));
    }
};

struct V210ToUYVY8 : GroupsOfSix<V210, Each<4, 2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        StoreThrees(destination,
                    Select(Ints(0x00ff00ff), ShiftRight<6>(EvenSamplesAt<4>(words)), OddSamplesAt<6>(words)));
    }
};

/// Looks at the chroma of the pair behind a group, which stands in one word.
struct V210AndNextPair : V210 {
    static constexpr int32_t kBytesAfter = 4;
    static constexpr int32_t kNeighbour = 2;
    static constexpr int32_t kUnitsBefore = 0, kUnitsAfter = 1;

    static void Complete(uint8_t* window, RowEnd end) { RepeatEnds<V210AndNextPair>(window, end); }

    /// The chroma of one pair over that of another.
    static void Repeat(uint8_t* window, int32_t from, int32_t to) {
        CopySample(window, 4 * from, 4 * to);
        CopySample(window, 4 * from + 2, 4 * to + 2);
    }

    static void CopySample(uint8_t* window, int32_t from, int32_t to) {
        uint32_t source, destination;
        std::memcpy(&source, window + from / 3 * 4, sizeof source);
        std::memcpy(&destination, window + to / 3 * 4, sizeof destination);
        const uint32_t sample = source >> (10 * (from % 3)) & 0x3ff;
        const int32_t shift = 10 * (to % 3);
        destination = (destination & ~(0x3ffu << shift)) | sample << shift;
        std::memcpy(window + to / 3 * 4, &destination, sizeof destination);
    }
};

/// To pixels of four bytes, with the truncated average of chroma at the odd pixel, from samples of kBits
/// bits.
template <int kBits, class Pixel>
struct V210ToPixels : GroupsOfSix<V210AndNextPair, Each<4>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        const I32 nextChroma = HighBits<kBits>(OddSamplesAt<4>(LoadInts(source + 4)));
        I32 low, high;
        UpsampleInBlocks<Pixel, false>(
            {HighBits<kBits>(EvenSamplesAt<4>(words)), HighBits<kBits>(OddSamplesAt<4>(words))}, nextChroma,
            low, high);
        StoreSixes(destination, low, high);
    }
};

template <const YUVToYUVMatrix& kMatrix>
struct PixelOtherVUYX {
    static I32 Pack(I32 chroma, I32 luma) { return YUV8ToYUV8<kMatrix>(OpaqueChannels(chroma, luma)); }
};

/// From 10-bit codes to 8-bit codes.
constexpr YUVToRGBMatrix kYUV10ToRGB8_601 = {0.291096f, 0.504308f, -0.0979404f, -0.203242f, 0.399007f};
constexpr YUVToRGBMatrix kYUV10ToRGB8_709 = {0.291096f, 0.5281f, -0.0533122f, -0.133227f, 0.448185f};

template <const YUVToRGBMatrix& kMatrix>
struct PixelBGRXFrom10 {
    static I32 Pack(I32 chroma, I32 luma) {
        const IntChannels vuyx = OpaqueChannels(chroma, luma);
        const Channels centred =
            ToFloat(IntChannels{vuyx.c0 - Ints(512), vuyx.c1 - Ints(512), vuyx.c2 - Ints(64), vuyx.c3});
        return PackCodes(YUVToRGB<kMatrix>(centred), vuyx.c3);
    }
};

constexpr float kChromaFromCode = 0.0011160715f, kLumaFromCode = 0.0011415525f; // 1 / 896, 1 / 876

/// The samples of a vector stand at bit 10 x k0 to 10 x k3 of their lanes. They become floats where they
/// stand, since powers of two are exact, and the factors put them right.
template <int k0, int k1, int k2, int k3>
inline F32 UYVYFromCodes(I32 words) {
    constexpr int32_t mask = 0x3ff;
    constexpr int32_t at0 = 1 << 10 * k0, at1 = 1 << 10 * k1, at2 = 1 << 10 * k2, at3 = 1 << 10 * k3;
    const F32 codes = ToFloat(words & PixelInts(mask * at0, mask * at1, mask * at2, mask * at3));
    return (codes - PixelFloats(512.0f * at0, 64.0f * at1, 512.0f * at2, 64.0f * at3)) *
           PixelFloats(kChromaFromCode / at0, kLumaFromCode / at1, kChromaFromCode / at2,
                       kLumaFromCode / at3);
}

struct V210ToUYVY32f : GroupsOfSix<V210, Each<16, 2>> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 words = LoadInts(source);
        StoreBlocksInTurns(destination, UYVYFromCodes<0, 1, 2, 0>(ShufflePixel<0, 0, 0, 1>(words)),
                           UYVYFromCodes<1, 2, 0, 1>(ShufflePixel<1, 1, 2, 2>(words)),
                           UYVYFromCodes<2, 0, 1, 2>(ShufflePixel<2, 3, 3, 3>(words)));
    }
};

/// nearest(896 c + 512.5) for chroma and nearest(876 y + 64.5) for luma, clamped to 0 to 1023. The half is
/// deliberate, although the conversion rounds by itself.
inline I32 CodesFromUYVY(F32 uyvy) {
    const F32 codes = PixelFloats(896, 876, 896, 876) * uyvy + PixelFloats(512.5f, 64.5f, 512.5f, 64.5f);
    return Max(Nearest(AtMost(Floats(1023), codes)), Ints(0));
}

struct PaddedPairs : Each<16, 2> {
    static constexpr uint8_t kPadding = 0xbf; // floats of about -1.5, which give codes of 0
};

struct UYVY32fToV210 : GroupsOfSix<PaddedPairs, V210> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 a = CodesFromUYVY(LoadFloatBlocks(source, 48));
        const I32 b = CodesFromUYVY(LoadFloatBlocks(source + 16, 48));
        const I32 c = CodesFromUYVY(LoadFloatBlocks(source + 32, 48));
        // Of the samples 0 to 11, those at bit 0 are 0, 3, 6, 9; at bit 10, 1, 4, 7, 10; at bit 20 the rest.
        const I32 low = BlendBlocks<0b0011>(ShufflePixel<0, 3, 3, 3>(a),
                                            BlendBlocks<0b1000>(ShufflePixel<1, 1, 1, 1>(c), b));
        const I32 middle = BlendBlocks<0b0001>(
            ShufflePixel<1, 1, 1, 1>(a),
            BlendBlocks<0b0110>(ShufflePixel<0, 0, 3, 3>(b), ShufflePixel<2, 2, 2, 2>(c)));
        const I32 high = BlendBlocks<0b0001>(ShufflePixel<2, 2, 2, 2>(a),
                                             BlendBlocks<0b0010>(b, ShufflePixel<0, 0, 0, 3>(c)));
        Store(destination, low | ShiftLeft<10>(middle) | ShiftLeft<20>(high));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::V210Kernels& PK::V210Kernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr V210Kernels kernels = {
        .UYVY8uToV210Row = Row<UYVY8ToV210>,
        .V210ToUYVY8uRow = Row<V210ToUYVY8>,
        .V210ToVUY8uRow = Row<V210ToPixels<8, PixelVUYX>>,
        .V210709ToVUY601_8uRow = Row<V210ToPixels<8, PixelOtherVUYX<kYUV709To601>>>,
        .V210ToBGR8uRow_601 = Row<V210ToPixels<10, PixelBGRXFrom10<kYUV10ToRGB8_601>>>,
        .V210ToBGR8uRow_709 = Row<V210ToPixels<10, PixelBGRXFrom10<kYUV10ToRGB8_709>>>,
        .V210ToUYVY32fRow = Row<V210ToUYVY32f>,
        .UYVY32fToV210Row = Row<UYVY32fToV210>,
    };
    return kernels;
}
