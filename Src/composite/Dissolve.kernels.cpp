// Mixes two rows by a weight: plainly, or weighted by alpha as well.

#include "composite/DissolveKernels.h"
#include "primitives/Thresholds.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

// A depth tells what a sample is while nothing is mixed, so that what stays keeps its bits: a code, or a float.

template <class Layout>
struct Codes : Layout {
    using Sample = I32;
    using Pixels = IntChannels;
    static constexpr int32_t kOpaque = static_cast<int32_t>(Layout::kFull);

    static Pixels Get(const uint8_t* source) { return Layout::LoadCodes(source); }
    static void Put(uint8_t* destination, Pixels pixels) { Layout::StoreCodes(destination, pixels); }
    static F32 Value(I32 code) { return ToFloat(code); }
    static I32 FromValue(F32 value) {
        if constexpr (kOpaque == 255)
            return Nearest(value); // which the store limits
        else
            return NearestCode<kOpaque>(value);
    }
    static I32 Opaque() { return Ints(kOpaque); }
    static I32 IsClear(I32 alpha) { return Equal(alpha, Ints(0)); }
    static I32 AreEqual(I32 a, I32 b) { return Equal(a, b); }

    /// Below 0 where two alphas differ or are 0.
    static I32 IsUneven(I32 a, I32 b) { return (Ints(0) - (a ^ b)) | (a - Ints(1)); }
};

template <class Layout>
struct Floating : Layout {
    using Sample = F32;
    using Pixels = Channels;

    static Pixels Get(const uint8_t* source) { return Layout::Load(source); }
    static void Put(uint8_t* destination, Pixels pixels) { Layout::Store(destination, pixels); }
    static F32 Value(F32 sample) { return sample; }
    static F32 FromValue(F32 value) { return value; }
    static F32 Opaque() { return Floats(1); }
    static I32 IsClear(F32 alpha) { return Less(alpha, Floats(kNegligible)); }
    static I32 AreEqual(F32 a, F32 b) { return Less(Max(a - b, b - a), Floats(kNegligible)); }
    static I32 IsUneven(F32 a, F32 b) { return Not(AreEqual(a, b)) | IsClear(a) | IsClear(b); }
};

using Depth8u = Codes<Pixels8<>>;
using Depth15u = Codes<Pixels15<>>;
using Depth32f = Floating<Pixels32f<>>;

template <class Depth>
struct Mixing : Groups<kLanes, Each<Depth::kPixelBytes>, Each<Depth::kPixelBytes>, Each<Depth::kPixelBytes>> {
    using Sample = typename Depth::Sample;
    using Pixels = typename Depth::Pixels;

    F32 w, r;

    explicit Mixing(float weight) : w(Floats(weight)), r(Floats(1 - weight)) {}

    Sample Mixed(Sample a, Sample b) const {
        return Depth::FromValue(Depth::Value(a) * w + Depth::Value(b) * r);
    }

    /// All three colour channels mixed, with an alpha.
    Pixels MixedColours(const Pixels& a, const Pixels& b, Sample alpha) const {
        return {Mixed(a.c0, b.c0), Mixed(a.c1, b.c1), Mixed(a.c2, b.c2), alpha};
    }
};

template <class Depth>
struct Opaque : Mixing<Depth> {
    using Mixing<Depth>::Mixing;

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        Depth::Put(destination, this->MixedColours(Depth::Get(first), Depth::Get(second), Depth::Opaque()));
    }
};

/// The colour of one row alone.
template <class Depth>
struct MadeOpaque : PixelGroup<Depth::kPixelBytes, Depth::kPixelBytes> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        const auto a = Depth::Get(source);
        Depth::Put(destination, {a.c0, a.c1, a.c2, Depth::Opaque()});
    }
};

/// Where one of two pixels is transparent. The first counts as such if both are.
template <class Depth>
struct Transparency {
    using Sample = typename Depth::Sample;

    I32 ofFirst, ofSecond;

    Transparency(Sample firstAlpha, Sample secondAlpha)
        : ofFirst(Depth::IsClear(firstAlpha)), ofSecond(Depth::IsClear(secondAlpha)) {}

    /// What is for pixels of which the first, the second or neither is transparent.
    template <class Vector>
    Vector Choose(Vector first, Vector second, Vector neither) const {
        return Select(ofFirst, first, Select(ofSecond, second, neither));
    }
};

template <class Depth>
struct Straight : Mixing<Depth> {
    using Mixing<Depth>::Mixing;

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        const auto a = Depth::Get(first), b = Depth::Get(second);
        if (AnyNegative(Depth::IsUneven(a.c3, b.c3)))
            Depth::Put(destination, Weighted(a, b));
        else
            Depth::Put(destination, this->MixedColours(a, b, a.c3));
    }

private:
    using Sample = typename Depth::Sample;
    using Pixels = typename Depth::Pixels;

    Pixels Weighted(const Pixels& a, const Pixels& b) const {
        const Transparency<Depth> clear(a.c3, b.c3);
        const I32 areEqual = Depth::AreEqual(a.c3, b.c3);
        const F32 firstAlpha = Depth::Value(a.c3) * this->w, secondAlpha = Depth::Value(b.c3) * this->r;
        const F32 sum = firstAlpha + secondAlpha;
        // A host may have unmasked exceptions, and the sum is 0 only where it is not used.
        const F32 scale = Floats(1) / Select(areEqual | clear.ofFirst | clear.ofSecond, Floats(1), sum);
        const auto colour = [&](Sample ofFirst, Sample ofSecond) {
            const F32 x = Depth::Value(ofFirst), y = Depth::Value(ofSecond);
            const F32 weighted = (x * firstAlpha + y * secondAlpha) * scale;
            const F32 mixed = Select(areEqual, x * this->w + y * this->r, weighted);
            return clear.Choose(ofSecond, ofFirst, Depth::FromValue(mixed));
        };
        const Sample summed = Depth::FromValue(clear.Choose(secondAlpha, firstAlpha, sum));
        const Sample alpha = clear.Choose(summed, summed, Select(areEqual, a.c3, summed));
        return {colour(a.c0, b.c0), colour(a.c1, b.c1), colour(a.c2, b.c2), alpha};
    }
};

/// Opaque pixels are most of what is dissolved, and their bytes can be mixed where they stand in their lanes: a code k bytes
/// up is 2^(8 k) times the code, and a weight of 2^(-8 k) times the weight makes up for that, without another rounding.
struct StraightBytes : Straight<Depth8u> {
    F32 weights[3], others[3];

    explicit StraightBytes(float weight) : Straight(weight) {
        constexpr float kUnits[] = {1, 0x1p-8f, 0x1p-16f};
        for (int i = 0; i < 3; ++i) {
            weights[i] = w * Floats(kUnits[i]);
            others[i] = r * Floats(kUnits[i]);
        }
    }

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        const I32 a = LoadInts(first), b = LoadInts(second);
        const I32 transparency = ShiftRight<24>(Not(a & b)); // 0 where both are opaque
        if (AnyNegative(Ints(0) - transparency))
            Straight::Group(first, second, destination);
        else
            Store(destination,
                  PackByteChannels(MixedAt<0>(a, b), MixedAt<1>(a, b), MixedAt<2>(a, b), Ints(255)));
    }

private:
    template <int kByte>
    I32 MixedAt(I32 a, I32 b) const {
        const I32 byte = Ints(0xff << 8 * kByte);
        return Nearest(ToFloat(a & byte) * weights[kByte] + ToFloat(b & byte) * others[kByte]);
    }
};

template <class Depth>
struct Premultiplied : Mixing<Depth> {
    using Mixing<Depth>::Mixing;

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        const auto a = Depth::Get(first), b = Depth::Get(second);
        const Transparency<Depth> clear(a.c3, b.c3);
        const auto alpha = Select(Depth::AreEqual(a.c3, b.c3), a.c3, this->Mixed(a.c3, b.c3));
        const auto mixed = this->MixedColours(a, b, alpha);
        if (AnyNegative(clear.ofFirst | clear.ofSecond))
            Depth::Put(destination, BesideClear(a, b, clear, mixed));
        else
            Depth::Put(destination, mixed);
    }

private:
    using Pixels = typename Depth::Pixels;

    /// The colour beside a transparent pixel is deliberately not scaled with its alpha: callers know it so.
    Pixels BesideClear(const Pixels& a, const Pixels& b, const Transparency<Depth>& clear,
                       const Pixels& mixed) const {
        return {clear.Choose(b.c0, a.c0, mixed.c0), clear.Choose(b.c1, a.c1, mixed.c1),
                clear.Choose(b.c2, a.c2, mixed.c2),
                clear.Choose(Depth::FromValue(Depth::Value(b.c3) * this->r),
                             Depth::FromValue(Depth::Value(a.c3) * this->w), mixed.c3)};
    }
};

/// Each of the three samples in a word by itself. Only a rounding upwards needs the limit, which keeps what it carries
/// out of the next sample.
struct V210Samples : Groups<6 * (kLanes / 4), Each<16, 6>, Each<16, 6>, Each<16, 6>> {
    F32 w, r;

    explicit V210Samples(float weight) : w(Floats(weight)), r(Floats(1 - weight)) {}

    void Group(const uint8_t* first, const uint8_t* second, uint8_t* destination) const {
        const I32 a = LoadInts(first), b = LoadInts(second);
        Store(destination, MixedAt<0>(a, b) | MixedAt<10>(a, b) | MixedAt<20>(a, b));
    }

    template <int kBit>
    I32 MixedAt(I32 a, I32 b) const {
        return ShiftLeft<kBit>(NearestCode<1023>(SampleAt<kBit>(a) * w + SampleAt<kBit>(b) * r));
    }

    template <int kBit>
    static F32 SampleAt(I32 words) {
        return ToFloat(ShiftRight<kBit>(words) & Ints(0x3ff));
    }
};

template <class Formula>
void MixRow(const void* first, const void* second, void* destination, int32_t width, const float& weight) {
    RunRow(Formula(weight), width, destination, first, second);
}

template <class Depth>
void MixOpaqueRow(const void* first, const void* second, void* destination, int32_t width,
                  const float& weight) {
    if (kNegligible > weight)
        RunRow(MadeOpaque<Depth>(), width, destination, second);
    else if (kNegligible + weight > 1)
        RunRow(MadeOpaque<Depth>(), width, destination, first);
    else
        MixRow<Opaque<Depth>>(first, second, destination, width, weight);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::DissolveKernels& PK::DissolveKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr DissolveKernels kernels = {
        .opaque8u = MixOpaqueRow<Depth8u>,
        .opaque15u = MixOpaqueRow<Depth15u>,
        .opaque32f = MixOpaqueRow<Depth32f>,
        .opaqueAlphaFirst8u = MixOpaqueRow<Codes<Pixels8<AlphaPlace::first>>>,
        .opaqueAlphaFirst15u = MixOpaqueRow<Codes<Pixels15<AlphaPlace::first>>>,
        .opaqueAlphaFirst32f = MixOpaqueRow<Floating<Pixels32f<AlphaPlace::first>>>,
        .straight8u = MixRow<StraightBytes>,
        .straight15u = MixRow<Straight<Depth15u>>,
        .straight32f = MixRow<Straight<Depth32f>>,
        .premultiplied8u = MixRow<Premultiplied<Depth8u>>,
        .premultiplied15u = MixRow<Premultiplied<Depth15u>>,
        .premultiplied32f = MixRow<Premultiplied<Depth32f>>,
        .v210 = MixRow<V210Samples>,
    };
    return kernels;
}
