// Scales pixels by a gain, through alpha or through all channels.
//
// 8-bit samples become nearest(c x g), by the current rounding mode, and floats c x g.

#include "composite/AlphaGainKernels.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

using enum AlphaPlace;

/// Alpha alone of a pixel a lane.
struct GainOfAlpha8 : PixelGroup<4, 4> {
    explicit GainOfAlpha8(float gain) : fGain(Floats(gain)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 pixels = LoadInts(source);
        const I32 alpha = NearestCode<255>(ToFloat(ShiftRight<24>(pixels)) * fGain);
        Store(destination, (pixels & Ints(0xffffff)) | ShiftLeft<24>(alpha));
    }

    F32 fGain;
};

/// All channels: (c - zero) x g + zero, alpha about 0.
template <int32_t kChromaZero, int32_t kLumaZero>
struct GainOfPixel8 : PixelGroup<4, 4> {
    explicit GainOfPixel8(float gain) : fGain(Floats(gain)) {}

    template <int32_t kZero>
    F32 Scaled(F32 code) const {
        if constexpr (kZero == 0)
            return code * fGain;
        else
            return (code - Floats(kZero)) * fGain + Floats(kZero);
    }

    void Group(const uint8_t* source, uint8_t* destination) const {
        const Channels c = Pixels8<>::Load(source);
        Pixels8<>::Store(destination, {Scaled<kChromaZero>(c.c0), Scaled<kChromaZero>(c.c1),
                                       Scaled<kLumaZero>(c.c2), Scaled<0>(c.c3)});
    }

    F32 fGain;
};

/// Interleaved floats: alpha alone, or every sample.
template <bool kAlphaOnly>
struct GainOfFloats : SampleGroup<4, 4> {
    explicit GainOfFloats(float gain) : fGain(Floats(gain)) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 samples = LoadFloats(source), scaled = samples * fGain;
        if constexpr (kAlphaOnly)
            Store(destination, Select(AlphaLanes<last>(), scaled, samples));
        else
            Store(destination, scaled);
    }

    F32 fGain;
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::AlphaGainKernels& PK::AlphaGainKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr AlphaGainKernels kernels = {
        .straight8u = RowWith<GainOfAlpha8>,
        .straight32f = RowWith<GainOfFloats<true>>,
        .premultipliedRGB8u = RowWith<GainOfPixel8<0, 0>>,
        .premultipliedVUY8u = RowWith<GainOfPixel8<128, 16>>,
        .premultiplied32f = RowWith<GainOfFloats<false>>,
    };
    return kernels;
}
