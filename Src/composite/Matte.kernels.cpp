// Finds the share of a matte colour in a row, and takes it away.

#include "composite/MatteKernels.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

using enum AlphaPlace;

/// Codes of 8 and of 15 bits.
template <class Pixels, int32_t kFullCode>
struct Codes {
    static constexpr int32_t kPixelBytes = Pixels::kPixelBytes;
    using Lanes = IntChannels;

    static IntChannels Load(const void* pixels) { return Pixels::LoadCodes(pixels); }
    static void Store(void* pixels, const IntChannels& c) { Pixels::StoreCodes(pixels, c); }

    /// In the bits of a code, beyond which a word of 15 bits may go.
    static I32 Complement(I32 alpha) {
        return (Ints(kFullCode) - alpha) & Ints(kPixelBytes == 4 ? 0xff : 0xffff);
    }
    static I32 Without(I32 sample, I32 share) { return Max(sample - share, Ints(0)); }
};

template <class Pixels>
struct FloatSamples {
    static constexpr int32_t kPixelBytes = Pixels::kPixelBytes;
    using Lanes = Channels;

    static Channels Load(const void* pixels) { return Pixels::Load(pixels); }
    static void Store(void* pixels, const Channels& c) { Pixels::Store(pixels, c); }
    static F32 Complement(F32 alpha) { return Floats(1) - alpha; }
    static F32 Without(F32 sample, F32 share) {
        return Select(Less(sample, share), Floats(0), sample - share);
    }
};

template <AlphaPlace kAlpha>
using Samples8u = Codes<Pixels8<kAlpha>, 255>;
template <AlphaPlace kAlpha>
using Samples15u = Codes<Pixels15<kAlpha>, 32768>;
template <AlphaPlace kAlpha>
using Samples32f = FloatSamples<Pixels32f<kAlpha>>;

template <class Samples>
struct Complement : PixelGroup<Samples::kPixelBytes, Samples::kPixelBytes> {
    explicit Complement(const MattePixel& pixel) {
        constexpr int32_t kBytes = Samples::kPixelBytes;
        uint8_t pixels[kLanes * kBytes];
        for (int32_t i = 0; i < kLanes; ++i) std::memcpy(pixels + i * kBytes, pixel.bytes, kBytes);
        matte = Samples::Load(pixels);
    }

    void Group(const uint8_t* source, uint8_t* destination) const {
        typename Samples::Lanes result = matte;
        result.c3 = Samples::Complement(Samples::Load(source).c3);
        Samples::Store(destination, result);
    }

    typename Samples::Lanes matte;
};

template <class Samples>
struct Remove
    : Groups<kLanes, Each<Samples::kPixelBytes>, Each<Samples::kPixelBytes>, Each<Samples::kPixelBytes>> {
    static void Group(const uint8_t* source, const uint8_t* share, uint8_t* destination) {
        const auto s = Samples::Load(source), m = Samples::Load(share);
        Samples::Store(destination, {Samples::Without(s.c0, m.c0), Samples::Without(s.c1, m.c1),
                                     Samples::Without(s.c2, m.c2), s.c3});
    }
};

template <class Samples>
constexpr MatteKernels::Complement kComplement = RowWith<Complement<Samples>, MattePixel>;
template <class Samples>
constexpr MatteKernels::Remove kRemove = TwoRows<Remove<Samples>>;

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::MatteKernels& PK::MatteKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr MatteKernels kernels = {
        .complement8u = kComplement<Samples8u<last>>,
        .complement8uAlphaFirst = kComplement<Samples8u<first>>,
        .complement15u = kComplement<Samples15u<last>>,
        .complement15uAlphaFirst = kComplement<Samples15u<first>>,
        .complement32f = kComplement<Samples32f<last>>,
        .complement32fAlphaFirst = kComplement<Samples32f<first>>,
        .remove8u = kRemove<Samples8u<last>>,
        .remove8uAlphaFirst = kRemove<Samples8u<first>>,
        .remove15u = kRemove<Samples15u<last>>,
        .remove15uAlphaFirst = kRemove<Samples15u<first>>,
        .remove32f = kRemove<Samples32f<last>>,
        .remove32fAlphaFirst = kRemove<Samples32f<first>>,
    };
    return kernels;
}
