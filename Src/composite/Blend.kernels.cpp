// Lays one row over another by a blend mode.
//
// s and b are samples of top and back, as the top's alpha by the opacity, ab that of the back.

#include "composite/BlendFormulas.h"
#include "composite/BlendKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

inline Colour ColourOf(const Channels& c) {
    return {c.c0, c.c1, c.c2};
}

inline Channels WithAlpha(const Colour& c, F32 alpha) {
    return {c.b, c.g, c.r, alpha};
}

/// The alphas of a pixel and what follows from them.
struct Shares {
    F32 top, back;  ///< as, ab
    F32 both;       ///< The alpha of the result.
    I32 isClear;    ///< Where that is none.
    F32 part, rest; ///< as / both, and what is left of 1
};

inline Shares SharesOf(F32 topAlpha, F32 backAlpha, F32 opacity) {
    Shares a;
    a.top = topAlpha * opacity;
    a.back = backAlpha;
    a.both = a.back + a.top - a.back * a.top;
    a.isClear = IsNegligible(a.both);
    a.part = QuotientWhere(Not(a.isClear), a.top, a.both);
    a.rest = Floats(1) - a.part;
    return a;
}

inline Channels Shown(const Colour& c, const Shares& a) {
    return WithAlpha(Each3(c, [&](F32 x) { return Select(a.isClear, Floats(0), x); }), a.both);
}

/// b x (1 - part) + mixed(s, b) x part, channel by channel
template <class Mixed>
inline Channels Separately(const Channels& s, const Channels& b, const Shares& a, Mixed mixed) {
    const auto channel = [&](F32 x, F32 y) { return y * a.rest + mixed(x, y) * a.part; };
    return Shown({channel(s.c0, b.c0), channel(s.c1, b.c1), channel(s.c2, b.c2)}, a);
}

/// A mode of single channels: the blend counts as far as the back has alpha, else the top.
template <class Mode>
struct Separable {
    static Channels Of(const Channels& s, const Channels& b, const Shares& a) {
        const F32 uncovered = Floats(1) - a.back;
        return Separately(s, b, a, [&](F32 x, F32 y) { return x * uncovered + Mode::Of(x, y) * a.back; });
    }
};

/// s b, where the back without alpha is white.
struct Multiply {
    static Channels Of(const Channels& s, const Channels& b, const Shares& a) {
        const F32 uncovered = Floats(1) - a.back;
        return Separately(s, b, a, [&](F32 x, F32 y) { return (y * a.back + uncovered) * x; });
    }
};

/// A mode of whole colours: it has its full weight also where the back is partly transparent, as callers know it.
template <class Mode>
struct NonSeparable {
    static Channels Of(const Channels& s, const Channels& b, const Shares& a) {
        const Colour blend = Mode::Of(ColourOf(s), ColourOf(b));
        const F32 weight = a.back + (Floats(1) - a.back);
        const auto channel = [&](F32 x, F32 y) { return y * a.rest + x * weight * a.part; };
        return Shown({channel(blend.b, b.c0), channel(blend.g, b.c1), channel(blend.r, b.c2)}, a);
    }
};

template <class Mode>
struct BlendFormula : Groups<kLanes, Each<16>, Each<16>, Each<16>> {
    explicit BlendFormula(float amount) : opacity(Floats(amount)) {}

    void Group(const uint8_t* top, const uint8_t* back, uint8_t* destination) const {
        const Channels s = LoadFloatChannels(top), b = LoadFloatChannels(back);
        StoreFloatChannels(destination, Mode::Of(s, b, SharesOf(s.c3, b.c3, opacity)));
    }

    F32 opacity;
};

/// The luma by which two pixels are compared.
struct LumaWeights {
    float red, green, blue;
};
constexpr LumaWeights kWeights601 = {0.299f, 0.587f, 0.114f}, kWeights709 = {0.2126f, 0.7152f, 0.0722f};

struct DarkerColor {
    static I32 TopShows(F32 topLuma, F32 backLuma) { return Less(topLuma, backLuma); }
};
struct LighterColor {
    static I32 TopShows(F32 topLuma, F32 backLuma) { return Less(backLuma, topLuma); }
};

/// The pixel whose luma wins, the back one where they are equal.
template <class Order>
struct WholePixel : Groups<kLanes, Each<16>, Each<16>, Each<16>> {
    WholePixel(float amount, const LumaWeights& rowWeights) : opacity(Floats(amount)), weights(rowWeights) {}

    void Group(const uint8_t* top, const uint8_t* back, uint8_t* destination) const {
        const Channels s = LoadFloatChannels(top), b = LoadFloatChannels(back);
        const Shares a = SharesOf(s.c3, b.c3, opacity);
        Channels result = Select(Order::TopShows(Luma(s), Luma(b)), TopOver(s, b, a), b);
        result = Select(IsNegligible(a.back), {s.c0, s.c1, s.c2, a.top}, result);
        StoreFloatChannels(destination, Select(IsNegligible(a.top), b, result));
    }

    F32 Luma(const Channels& c) const {
        return Limited(Weighed(ColourOf(c), weights.red, weights.green, weights.blue));
    }

    /// By the inverse of the alpha.
    static Channels TopOver(const Channels& s, const Channels& b, const Shares& a) {
        const F32 inverse = QuotientWhere(Not(a.isClear), Floats(1), a.both);
        const F32 rest = Floats(1) - a.top * inverse, weight = a.back + (Floats(1) - a.back);
        const auto channel = [&](F32 x, F32 y) { return y * rest + x * weight * a.top * inverse; };
        return Shown({channel(s.c0, b.c0), channel(s.c1, b.c1), channel(s.c2, b.c2)}, a);
    }

    F32 opacity;
    LumaWeights weights;
};

template <class Order>
void WholePixelRow(const void* top, const void* back, void* destination, int32_t width,
                   const float& opacity) {
    const WholePixel<Order> formula(opacity, width > kWidestRowOf601 ? kWeights709 : kWeights601);
    RunRow(formula, width, destination, top, back);
}

template <class Mode>
constexpr BlendKernels::Blend kBlend = TwoRowsWith<BlendFormula<Mode>, float>;
template <class Mode>
constexpr BlendKernels::Blend kSeparable = kBlend<Separable<Mode>>;
template <class Mode>
constexpr BlendKernels::Blend kNonSeparable = kBlend<NonSeparable<Mode>>;

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::BlendKernels& PK::BlendKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr BlendKernels kernels = {
        .color = kNonSeparable<Color>,
        .colorBurn = kSeparable<ColorBurn>,
        .colorDodge = kSeparable<ColorDodge>,
        .darken = kSeparable<Darken>,
        .darkerColor = WholePixelRow<DarkerColor>,
        .difference = kSeparable<Difference>,
        .exclusion = kSeparable<Exclusion>,
        .hardLight = kSeparable<HardLight>,
        .hardMix = kSeparable<HardMix>,
        .hue = kNonSeparable<Hue>,
        .lighten = kSeparable<Lighten>,
        .lighterColor = WholePixelRow<LighterColor>,
        .linearBurn = kSeparable<LinearBurn>,
        .linearDodge = kSeparable<LinearDodge>,
        .linearLight = kSeparable<LinearLight>,
        .luminosity = kNonSeparable<Luminosity>,
        .multiply = kBlend<Multiply>,
        .normal = kNonSeparable<Normal>,
        .overlay = kSeparable<Overlay>,
        .pinLight = kSeparable<PinLight>,
        .saturation = kNonSeparable<Saturation>,
        .screen = kSeparable<Screen>,
        .softLight = kSeparable<SoftLight>,
        .vividLight = kSeparable<VividLight>,
        .subtract = kSeparable<Subtract>,
        .divide = kSeparable<Divide>,
    };
    return kernels;
}
