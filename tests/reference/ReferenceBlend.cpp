#include "reference/ReferenceBlend.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

namespace PKTest::reference {
namespace {

constexpr float kSmall = 8e-6f;

/// A zero of either sign becomes that of the limit, and not-a-number too.
float Clamp(float x, float least = 0, float most = 1) {
    const float above = x > least ? x : least;
    return above < most ? above : most;
}

/// The second where they are equal, as zeros of two signs are.
float Least(float x, float y) {
    return x < y ? x : y;
}
float Greatest(float x, float y) {
    return x > y ? x : y;
}

float Blend(int32_t mode, float s, float b) {
    const float sc = Clamp(s), bc = Clamp(b), t = sc - 1 + sc;
    const auto hard = [](float chooses, float x, float y) {
        return Clamp(chooses <= 0.5f ? 2 * x * y : 1 - (1 - x) * 2 * (1 - y));
    };
    switch (mode) {
    case 1:
        return Clamp(1 - (1 - bc) / Clamp(s, 1e-7f));
    case 2:
        return Clamp(bc / (1 - Clamp(s, 0, 0.99999f)));
    case 3:
        return Least(s, b);
    case 5:
        return std::abs(s - b);
    case 7:
        return Clamp(sc + bc - (sc + sc) * bc);
    case 8:
        return hard(sc, sc, bc);
    case 9:
        return 1 - b > s ? 0.0f : 1.0f;
    case 11:
        return Greatest(s, b);
    case 13:
        return Clamp(sc - 1 + bc);
    case 14:
        return s + b;
    case 15:
        return sc - 1 + sc + bc;
    case 19:
        return hard(bc, sc, bc);
    case 20:
        return t > bc ? t : Least(sc + sc, bc);
    case 22:
        return Clamp(1 - (1 - Clamp(s, 1e-7f)) * (1 - Clamp(b, 1e-7f)));
    case 23:
        return Clamp(sc <= 0.5f ? t * (bc - bc * bc) + bc : t * (std::sqrt(bc) - bc) + bc);
    case 24: {
        const float v = Clamp(s, 1e-6f, 0.999999f);
        return v <= 0.5f ? Clamp(1 - (1 - bc) / (v + v)) : Clamp(bc / ((1 - v) * 2));
    }
    case 25:
        return b - s;
    case 26:
        return b / (std::abs(s) < 1e-7f ? 1e-7f : s);
    default:
        throw std::logic_error("no separable mode");
    }
}

struct Colour {
    float r, g, b;
};

float Lum(const Colour& c) {
    return 0.3f * c.r + 0.59f * c.g + 0.11f * c.b;
}

float Sat(const Colour& c) {
    return Clamp(std::max({c.r, c.g, c.b}) - std::min({c.r, c.g, c.b}));
}

Colour SetLum(Colour c, float lum) {
    const float d = Clamp(lum) - Clamp(Lum(c));
    for (float* channel : {&c.r, &c.g, &c.b}) *channel += d;
    const float grey = Clamp(Lum(c)), n = std::min({c.r, c.g, c.b}), x = std::max({c.r, c.g, c.b});
    for (float* channel : {&c.r, &c.g, &c.b}) {
        if (n < 0) *channel = (*channel - grey) * grey / (grey - n) + grey;
        if (x > 1) *channel = (*channel - grey) * (1 - grey) / (x - grey) + grey;
    }
    return c;
}

Colour SetSat(Colour c, float saturation) {
    const float least = std::min({c.r, c.g, c.b}), most = std::max({c.r, c.g, c.b});
    float *low, *middle, *high;
    if (least == c.r) {
        low = &c.r;
        middle = most == c.g ? &c.b : &c.g;
        high = most == c.g ? &c.g : &c.b;
    } else if (most != c.r) {
        middle = &c.r;
        high = least != c.g ? &c.g : &c.b;
        low = least != c.g ? &c.b : &c.g;
    } else {
        high = &c.r;
        middle = least != c.g ? &c.g : &c.b;
        low = least != c.g ? &c.b : &c.g;
    }
    if (*high > *low) {
        *middle = (*middle - *low) * saturation / (*high - *low);
        *high = saturation;
    } else {
        *middle = *high = 0;
    }
    *low = 0;
    return c;
}

Colour OfPixel(const float* p) {
    return {p[2], p[1], p[0]};
}

Colour WholeColour(int32_t mode, const Colour& s, const Colour& b) {
    switch (mode) {
    case 0:
        return SetLum(s, Lum(b));
    case 10:
        return SetLum(SetSat(s, Sat(b)), Lum(b));
    case 16:
        return SetLum(b, Lum(s));
    case 18:
        return s;
    default:
        return SetLum(SetSat(b, Sat(s)), Lum(b));
    }
}

void PixelByLuma(bool darker, const float* top, const float* back, float* d, float opacity, int32_t width) {
    const float as = top[3] * opacity, ab = back[3];
    const auto luma = [width](const float* p) {
        return Clamp(width > 720 ? 0.2126f * p[2] + 0.7152f * p[1] + 0.0722f * p[0]
                                 : 0.299f * p[2] + 0.587f * p[1] + 0.114f * p[0]);
    };
    const float ls = luma(top), lb = luma(back), ar = ab + as - ab * as;
    const bool topShows = darker ? lb > ls : ls > lb;
    if (std::abs(as) < kSmall || (std::abs(ab) >= kSmall && !topShows)) {
        std::copy_n(back, 4, d);
        return;
    }
    for (int i = 0; i < 3; ++i) {
        const float s = top[i], b = back[i], inv = 1 / ar;
        d[i] = std::abs(ab) < kSmall   ? s
               : std::abs(ar) < kSmall ? 0
                                       : b * (1 - as * inv) + s * (ab + (1 - ab)) * as * inv;
    }
    d[3] = std::abs(ab) < kSmall ? as : ar;
}

} // namespace

void BlendPixel(int32_t mode, const float* top, const float* back, float* destination, float opacity,
                int32_t width) {
    if (mode == 4 || mode == 12) return PixelByLuma(mode == 4, top, back, destination, opacity, width);
    const float as = top[3] * opacity, ab = back[3], ar = ab + as - ab * as, k = as / ar, w = ab + (1 - ab);
    const bool isWhole = mode == 0 || mode == 10 || mode == 16 || mode == 18 || mode == 21;
    const Colour whole = isWhole ? WholeColour(mode, OfPixel(top), OfPixel(back)) : Colour{};
    const float wholes[3] = {whole.b, whole.g, whole.r};
    for (int i = 0; i < 3; ++i) {
        const float s = top[i], b = back[i];
        const float mixed = isWhole      ? wholes[i] * w
                            : mode == 17 ? (b * ab + (1 - ab)) * s
                                         : s * (1 - ab) + Blend(mode, s, b) * ab;
        destination[i] = std::abs(ar) < kSmall ? 0 : b * (1 - k) + mixed * k;
    }
    destination[3] = ar;
}

} // namespace PKTest::reference
