// Lays one row over another.
//
// s and b are the samples of top and back, o is the opacity, a the part of a pixel that the top covers, A the alpha of
// both together. Where a is 0 the back shows alone, where it is 1 the top.

#include "composite/OverKernels.h"
#include "primitives/Thresholds.h"
#include "primitives/lanes/ByteScale.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

#include <type_traits>

namespace PK::PK_TARGET {
namespace {

enum class Colour { straight, premultiplied, premultipliedYUV };

/// Which images are opaque, whatever stands in their alpha.
struct Opaque {
    bool top, back;
    constexpr bool Both() const { return top && back; }
};

inline bool All(I32 mask) {
    return !AnyNegative(Not(mask));
}

inline float Clamped(float opacity) {
    return opacity + kNegligible > 1 ? 1 : opacity;
}

// Codes of 8 bits: two rules for what goes by pixels, and one formula for each kind of colour.

/// Every pixel by itself.
struct ByPixel {
    static F32 Part(F32 alpha) { return alpha / Floats(255); }
    static I32 IsNone(F32 a) { return IsNegligible(a); }
    static I32 IsFull(F32 a) { return IsNegligible(Floats(1) - a); }
    static I32 Agreed(I32 mask) { return mask; }

    /// 255 / A. What is limited belongs to pixels of the back alone: hosts may have unmasked exceptions.
    static F32 Inverse(F32 alpha) { return Floats(255) / Max(alpha, Floats(kLeastAlpha)); }

    static constexpr float kLeastAlpha = 0x1p-17f;
};

/// Four pixels together.
struct ByFours {
    static F32 Part(F32 alpha) { return alpha * Floats(0x1.010102p-8f); } // the float nearest to 1 / 255
    static I32 IsNone(F32 a) { return WhereGroupAgrees(NotGreater(Magnitude(a), Floats(0))); }
    static I32 IsFull(F32 a) { return WhereGroupAgrees(NotGreater(Floats(1 - 0x1p-17f), a)); }
    static I32 Agreed(I32 mask) { return WhereGroupAgrees(mask); }

    /// By the processor's estimate.
    static F32 Inverse(F32 alpha) {
        const F32 least = Floats(ByPixel::kLeastAlpha);
        const F32 inverse = ReciprocalEstimate(Max(alpha, least)) * Floats(255);
        return Select(NotGreater(alpha, least), Floats(0), inverse);
    }
};

inline I32 AlphaOf(I32 pixels) {
    return ShiftRight<24>(pixels);
}

inline I32 WithAlpha(I32 pixels, I32 alpha) {
    return (pixels & Ints(0x00ffffff)) | ShiftLeft<24>(alpha);
}

inline I32 Rounded(F32 c0, F32 c1, F32 c2, F32 alpha) {
    return PackByteChannels(Nearest(c0), Nearest(c1), Nearest(c2), Nearest(alpha));
}

/// What the alphas come to.
struct Cover {
    F32 top;  ///< as: the top's alpha by the opacity.
    F32 part; ///< a
    F32 rest; ///< 1 - a
    F32 back; ///< ba
    F32 both; ///< A
};

template <class Rule, Opaque kOpaque>
inline Cover CoverOf(I32 top, I32 back, F32 opacity) {
    Cover c;
    c.top = ToFloat(AlphaOf(top)) * opacity;
    c.part = kOpaque.top ? opacity : Rule::Part(c.top);
    c.rest = Floats(1) - c.part;
    c.back = ToFloat(AlphaOf(back));
    c.both = kOpaque.Both() ? (c.part + c.rest) * Floats(255) : c.top + c.back * c.rest;
    return c;
}

/// (s x a + b x (1 - a) x ba / 255) x 255 / A. Over a clear back the top keeps its colour.
template <class Rule, Opaque kOpaque>
inline I32 MixStraight(I32 top, I32 back, const Cover& c) {
    const IntChannels s = ByteChannels(top), b = ByteChannels(back);
    const F32 backPart = Rule::Part(c.back), inverse = Rule::Inverse(c.both);
    const auto mix = [&](I32 x, I32 y) {
        const F32 rest = ToFloat(y) * c.rest;
        return (ToFloat(x) * c.part + (kOpaque.back ? rest : rest * backPart)) * inverse;
    };
    const I32 mixed = Rounded(mix(s.c0, b.c0), mix(s.c1, b.c1), mix(s.c2, b.c2), c.both);
    if constexpr (kOpaque.back) return mixed;
    const I32 isClear = Rule::Agreed(Equal(AlphaOf(back), Ints(0)));
    return Select(isClear, WithAlpha(top, Nearest(c.top)), mixed);
}

/// The zeros of the samples, in the order of memory.
template <bool kIsYUV>
inline constexpr int32_t kZeros = kIsYUV ? 0x00108080 : 0;

/// A pixel without alpha has no colour, whatever stands there, but where it shows alone.
template <bool kIsYUV, bool kIsOpaque>
inline I32 WithoutStaleColour(I32 pixels, I32 showsAlone = Ints(0)) {
    if constexpr (kIsOpaque) return pixels;
    const I32 isStale = Equal(AlphaOf(pixels), Ints(0)) & Not(showsAlone);
    return Select(isStale, Ints(kZeros<kIsYUV>), pixels);
}

/// s x o + b x (1 - a), about the zeros of the samples.
template <bool kIsYUV, Opaque kOpaque>
inline I32 MixPremultiplied(I32 top, I32 back, const Cover& c, F32 opacity, I32 isNone) {
    const IntChannels s = ByteChannels(WithoutStaleColour<kIsYUV, kOpaque.top>(top));
    const IntChannels b = ByteChannels(WithoutStaleColour<kIsYUV, kOpaque.back>(back, isNone));
    const auto mix = [&]<int32_t kZero>(I32 x, I32 y) {
        if constexpr (kZero == 0) return ToFloat(x) * opacity + ToFloat(y) * c.rest;
        const F32 zero = Floats(kZero);
        return (ToFloat(x) - zero) * opacity + zero + (ToFloat(y) - zero) * c.rest;
    };
    constexpr int32_t kChroma = kIsYUV ? 128 : 0, kLuma = kIsYUV ? 16 : 0;
    return Rounded(mix.template operator()<kChroma>(s.c0, b.c0), mix.template operator()<kChroma>(s.c1, b.c1),
                   mix.template operator()<kLuma>(s.c2, b.c2), kOpaque.back ? Floats(255) : c.both);
}

template <Colour kColour, Opaque kOpaque, class Rule>
struct OverCodes : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    explicit OverCodes(float amount) : opacity(Floats(amount)) {}

    void Group(const uint8_t* top, const uint8_t* back, uint8_t* destination) const {
        const I32 full = Ints(-0x1000000);
        const I32 b = kOpaque.back ? LoadInts(back) | full : LoadInts(back);
        const I32 opaqueTop = LoadInts(top) | full, s = kOpaque.top ? opaqueTop : LoadInts(top);
        const Cover cover = CoverOf<Rule, kOpaque>(s, b, opacity);
        const I32 isNone = Rule::IsNone(cover.part), isFull = Rule::IsFull(cover.part);
        if constexpr (kMixesAll) return Store(destination, Mix(s, b, cover, isNone));
        I32 shown = opaqueTop;
        if (!All(isNone | isFull)) shown = Select(isFull, opaqueTop, Mix(s, b, cover, isNone));
        Store(destination, Select(isNone, b, shown));
    }

    /// Four that a clear top leaves as they are come out so anyway. None is full, a being below 1 - 2^-17 where the opacity is
    /// not 1, and at 1 OverFully does the work.
    static constexpr bool kMixesAll =
        kColour == Colour::premultiplied && !kOpaque.top && std::is_same_v<Rule, ByFours>;

    I32 Mix(I32 top, I32 back, const Cover& cover, I32 isNone) const {
        if constexpr (kColour == Colour::straight)
            return MixStraight<Rule, kOpaque>(top, back, cover);
        else
            return MixPremultiplied<kColour == Colour::premultipliedYUV, kOpaque>(top, back, cover, opacity,
                                                                                  isNone);
    }

    F32 opacity;
};

/// Premultiplied RGB at full opacity: s + b x (255 - alpha of s) / 255, to the nearest in every rounding mode, which is what
/// floats give for all codes.
template <Opaque kOpaque, class Rule>
struct OverFully : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* top, const uint8_t* back, uint8_t* destination) {
        const I32 full = Ints(-0x1000000);
        const I32 b = kOpaque.back ? LoadInts(back) | full : LoadInts(back);
        const I32 s = kOpaque.top ? LoadInts(top) | full : LoadInts(top), alpha = AlphaOf(s);
        const I32 isNone = Rule::Agreed(Equal(alpha, Ints(0)));
        const I32 rest = ScaleBytes(WithoutStaleColour<false, kOpaque.back>(b, isNone), Ints(255) - alpha);
        Store(destination, AddBytes(WithoutStaleColour<false, kOpaque.top>(s), rest));
    }
};

template <Colour kColour, Opaque kOpaque>
void OverCodesRow(const void* top, const void* back, void* destination, int32_t width, const float& opacity) {
    const float amount = Clamped(opacity);
    const auto run = [&](const auto& byPixel, [[maybe_unused]] const auto& byFours) {
        if constexpr (kTarget == Target::plain)
            RunRow(byPixel, width, destination, top, back);
        else
            RunRowWithEnds<16, 4>(byPixel, byFours, width, destination, top, back);
    };
    if constexpr (kColour == Colour::premultiplied)
        if (amount == 1) return run(OverFully<kOpaque, ByPixel>(), OverFully<kOpaque, ByFours>());
    run(OverCodes<kColour, kOpaque, ByPixel>(amount), OverCodes<kColour, kOpaque, ByFours>(amount));
}

// Floats: every pixel by itself, and nothing is limited.

template <Colour kColour, Opaque kOpaque>
struct OverFloats : Groups<kLanes, Each<16>, Each<16>, Each<16>> {
    explicit OverFloats(float amount) : opacity(Floats(Clamped(amount))) {}

    void Group(const uint8_t* top, const uint8_t* back, uint8_t* destination) const {
        const F32 one = Floats(1);
        Channels s = LoadFloatChannels(top), b = LoadFloatChannels(back);
        if constexpr (kOpaque.back) b.c3 = one;
        const F32 part = kOpaque.top ? opacity : s.c3 * opacity, rest = one - part;
        const I32 isNone = IsNegligible(part), isFull = IsNegligible(rest);
        const I32 isClear = kOpaque.back ? Ints(0) : IsNegligible(b.c3), decided = isNone | isFull | isClear;

        Channels shown = Mix(s, b, part, rest, decided);
        if (AnyNegative(decided)) {
            shown = Select(isClear, TopAlone(s, part), shown);
            shown = Select(isFull, {s.c0, s.c1, s.c2, one}, shown);
            shown = Select(isNone, b, shown);
        }
        StoreFloatChannels(destination, shown);
    }

    /// (s x a + b x (1 - a) x ba) / A, or s x o + b x (1 - a). A may be 0 only where something else shows.
    Channels Mix(const Channels& s, const Channels& b, F32 part, F32 rest, I32 decided) const {
        const F32 one = Floats(1);
        if constexpr (kColour == Colour::straight) {
            const F32 alpha = kOpaque.Both() ? one + part - part : rest * b.c3 + part;
            const F32 inverse = one / Select(decided, one, alpha);
            const auto mix = [&](F32 x, F32 y) {
                return (x * part + (kOpaque.back ? y * rest : y * rest * b.c3)) * inverse;
            };
            return {mix(s.c0, b.c0), mix(s.c1, b.c1), mix(s.c2, b.c2), alpha};
        } else {
            const F32 alpha = kOpaque.Both() ? one + part - part : part + b.c3 * rest;
            const auto mix = [&](F32 x, F32 y) { return x * opacity + y * rest; };
            return {mix(s.c0, b.c0), mix(s.c1, b.c1), mix(s.c2, b.c2), alpha};
        }
    }

    /// Over a back without alpha.
    Channels TopAlone(const Channels& s, F32 part) const {
        if constexpr (kColour == Colour::straight) return {s.c0, s.c1, s.c2, part};
        return {s.c0 * opacity, s.c1 * opacity, s.c2 * opacity, part};
    }

    F32 opacity;
};

constexpr Opaque kAA = {false, false}, kAX = {false, true}, kXA = {true, false}, kXX = {true, true};

template <Colour kColour, Opaque kOpaque>
constexpr OverKernels::Over kFloats = TwoRowsWith<OverFloats<kColour, kOpaque>, float>;

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::OverKernels& PK::OverKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    using enum Colour;
    static constexpr OverKernels kernels = {
        .straight8u_AA = OverCodesRow<straight, kAA>,
        .straight8u_AX = OverCodesRow<straight, kAX>,
        .straight8u_XA = OverCodesRow<straight, kXA>,
        .straight8u_XX = OverCodesRow<straight, kXX>,
        .premultiplied8u_AA = OverCodesRow<premultiplied, kAA>,
        .premultiplied8u_AX = OverCodesRow<premultiplied, kAX>,
        .premultiplied8u_XA = OverCodesRow<premultiplied, kXA>,
        .premultiplied8u_XX = OverCodesRow<premultiplied, kXX>,
        .premultipliedYUV8u_AA = OverCodesRow<premultipliedYUV, kAA>,
        .premultipliedYUV8u_AX = OverCodesRow<premultipliedYUV, kAX>,
        .premultipliedYUV8u_XA = OverCodesRow<premultipliedYUV, kXA>,
        .premultipliedYUV8u_XX = OverCodesRow<premultipliedYUV, kXX>,
        .straight32f_AA = kFloats<straight, kAA>,
        .straight32f_AX = kFloats<straight, kAX>,
        .straight32f_XA = kFloats<straight, kXA>,
        .straight32f_XX = kFloats<straight, kXX>,
        .premultiplied32f_AA = kFloats<premultiplied, kAA>,
        .premultiplied32f_AX = kFloats<premultiplied, kAX>,
        .premultiplied32f_XA = kFloats<premultiplied, kXA>,
        .premultiplied32f_XX = kFloats<premultiplied, kXX>,
    };
    return kernels;
}
