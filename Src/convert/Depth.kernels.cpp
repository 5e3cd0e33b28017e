// Changes of sample depth between bytes, 15-bit words and floats.

#include "convert/ConversionKernels.h"
#include "primitives/lanes/RowDriver.h"
#include "primitives/lanes/Samples.h"

namespace PK::PK_TARGET {
namespace {

// A structure of samples tells how its codes expand to floats, and scales floats back to codes before
// rounding. The position of a sample decides: four make a pixel, or a pair of pixels for 4:2:2.

struct RGBSamples {
    static constexpr int kUnitPixels = 1;
    static F32 Expand(F32 codes) { return ExpandBGRA(codes); }
    static F32 Scale(F32 values) { return Floats(255) * values; }
};

struct VUYASamples {
    static constexpr int kUnitPixels = 1;
    static F32 Expand(F32 codes) { return ExpandVUYA(codes); }
    static F32 Scale(F32 values) {
        return PixelFloats(224, 224, 219, 255) * values + PixelFloats(128, 128, 16, 0);
    }
};

struct UYVYSamples {
    static constexpr int kUnitPixels = 2;
    static F32 Expand(F32 codes) {
        return (codes - PixelFloats(128, 16, 128, 16)) *
               PixelFloats(kReciprocal224, kReciprocal219, kReciprocal224, kReciprocal219);
    }
    static F32 Scale(F32 values) {
        return PixelFloats(224, 219, 224, 219) * values + PixelFloats(128, 16, 128, 16);
    }
};

struct YUYVSamples {
    static constexpr int kUnitPixels = 2;
    static F32 Expand(F32 codes) {
        return (codes - PixelFloats(16, 128, 16, 128)) *
               PixelFloats(kReciprocal219, kReciprocal224, kReciprocal219, kReciprocal224);
    }
    static F32 Scale(F32 values) {
        return PixelFloats(219, 224, 219, 224) * values + PixelFloats(16, 128, 16, 128);
    }
};

template <class Samples>
struct ExpandBytes : SampleGroup<1, 4, Samples::kUnitPixels> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, Samples::Expand(LoadBytesAsFloats(source)));
    }
};

/// Nearest, clamped: the limit from above comes before the rounding, since the conversion turns what is too
/// great for it into the least integer, as it does NaN.
template <class Samples>
inline I32 NearestCodes(const uint8_t* values) {
    return Nearest(AtMost(Floats(255), Samples::Scale(LoadFloats(values))));
}

template <class Samples>
struct PackBytes : SampleGroup<4, 1, Samples::kUnitPixels, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        constexpr int32_t kStep = sizeof(F32);
        Store(destination, PackLanes(NearestCodes<Samples>(source), NearestCodes<Samples>(source + kStep),
                                     NearestCodes<Samples>(source + 2 * kStep),
                                     NearestCodes<Samples>(source + 3 * kStep)));
    }
};

struct ExpandWords : SampleGroup<2, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, ToFloat(LoadWords(source)) * Floats(0x1p-15f));
    }
};

/// Truncated(c x 32768 + 0.5), c limited to 0 and 1.
inline I32 RoundToWords(const uint8_t* values) {
    return Truncate(LimitToUnit(LoadFloats(values)) * Floats(32768) + Floats(0.5f));
}

struct PackWords : SampleGroup<4, 2, 1, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PackLanesToHalves(RoundToWords(source), RoundToWords(source + sizeof(F32))));
    }
};

/// c x 128 + (((c + kRounding) x 32897) >> 16). For all 256 codes this is the quotient (c x 32768) / 255 with
/// kRounding 0, and truncated(c x 128.50196838 + 0.5) in floats with kRounding 1.
template <int32_t kRounding>
struct ScaleBytesTo15u : SampleGroup<1, 2, 1, 2> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const I32 codes = LoadBytesAsHalves(source);
        const I32 rest = MultiplyHalvesHigh(codes + Ints(kRounding * 0x00010001),
                                            Ints(static_cast<int32_t>(0x80818081))); // 32897 in both halves
        Store(destination, ShiftLeft<7>(codes) + rest);
    }
};

/// The plain body gives the quotient. The vector bodies give it for the pixels that start before the first
/// 16-byte boundary of the destination, and the rounded form after it; hosts compare against both.
void ExpandBytesTo15u(const void* source, void* destination, int32_t width) {
    if constexpr (kTarget == Target::plain)
        RunRow(ScaleBytesTo15u<0>(), width, destination, source);
    else
        RunRowWithHead<16>(ScaleBytesTo15u<0>(), ScaleBytesTo15u<1>(), width, destination, source);
}

/// (c x 510 + 32768) >> 16, which is nearest(c x 0.0077819824) for all 65,536 words: the product is exact in
/// floats, and the one tie in range, at 16384, goes up to the even 128. Words above 32768 saturate.
inline I32 ScaleWordsToBytes(I32 words) {
    return AverageHalves(MultiplyHalvesHigh(words, Ints(1020 * 0x00010001)), Ints(0));
}

struct PackWordsToBytes : SampleGroup<2, 1, 1, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, PackHalves(ScaleWordsToBytes(LoadInts(source)),
                                      ScaleWordsToBytes(LoadInts(source + sizeof(I32)))));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DepthKernels& PK::DepthKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr DepthKernels kernels = {
        .ExpandTo32fRow_RGB_8u = Row<ExpandBytes<RGBSamples>>,
        .ExpandTo32fRow_VUYA_8u = Row<ExpandBytes<VUYASamples>>,
        .ExpandTo32fRow_UYVY_8u = Row<ExpandBytes<UYVYSamples>>,
        .ExpandTo32fRow_YUYV_8u = Row<ExpandBytes<YUYVSamples>>,
        .ExpandTo32fRow_RGB_15u = Row<ExpandWords>,
        .PackFrom32fRow_RGB_8u = Row<PackBytes<RGBSamples>>,
        .PackFrom32fRow_VUYA_8u = Row<PackBytes<VUYASamples>>,
        .PackFrom32fRow_UYVY_8u = Row<PackBytes<UYVYSamples>>,
        .PackFrom32fRow_YUYV_8u = Row<PackBytes<YUYVSamples>>,
        .PackFrom32fRow_RGB_15u = Row<PackWords>,
        .Expand8uTo15uRow = ExpandBytesTo15u,
        .Pack15uTo8uRow = Row<PackWordsToBytes>,
    };
    return kernels;
}
