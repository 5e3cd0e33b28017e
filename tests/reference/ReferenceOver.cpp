#include "reference/ReferenceOver.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <xmmintrin.h>

namespace PKTest::reference {
namespace {

using Pixel = std::array<uint8_t, 4>;

constexpr float kSmall = 8e-6f;
constexpr float kPart = 0x1.010102p-8f; // nearest to 1 / 255, whatever the rounding mode

Pixel PixelAt(const uint8_t* row, int64_t x, bool isOpaque) {
    Pixel pixel;
    std::memcpy(pixel.data(), row + 4 * x, 4);
    if (isOpaque) pixel[3] = 255;
    return pixel;
}

uint8_t Sat(float x) {
    const float rounded = std::nearbyint(x);
    return rounded > 255 ? 255 : rounded > 0 ? static_cast<uint8_t>(rounded) : 0;
}

float ZeroOf(const OverRule& rule, int channel) {
    return !rule.isYUV || channel == 3 ? 0.0f : channel == 2 ? 16.0f : 128.0f;
}

Pixel WithAlpha(Pixel pixel, uint8_t alpha) {
    pixel[3] = alpha;
    return pixel;
}

/// The colour channels by a function of their number, and an alpha.
template <class Function>
Pixel Channelwise(Function colour, float alpha) {
    return {Sat(colour(0)), Sat(colour(1)), Sat(colour(2)), Sat(alpha)};
}

Pixel Alone(const OverRule& rule, const Pixel& s, const Pixel& b, float o) {
    const bool both = rule.topIsOpaque && rule.backIsOpaque;
    const float as = static_cast<float>(s[3]) * o, a = rule.topIsOpaque ? o : as / 255, rest = 1 - a;
    if (kSmall > std::abs(a)) return b;
    if (kSmall > std::abs(1 - a)) return WithAlpha(s, 255);
    const float ba = b[3];
    if (rule.isStraight) {
        if (b[3] == 0) return WithAlpha(s, Sat(as));
        const float alpha = both ? (o + (1 - o)) * 255 : as + ba * rest;
        return Channelwise(
            [&](size_t i) {
                const float x = s[i], y = b[i];
                return (x * a + y * rest * (ba / 255)) * (255 / alpha);
            },
            alpha);
    }
    const float alpha = rule.backIsOpaque ? 255
                        : both            ? (o + (1 - o)) * 255
                        : b[3] == 0       ? as
                                          : as + ba * rest;
    return Channelwise(
        [&](size_t i) {
            const float zero = ZeroOf(rule, static_cast<int>(i)), x = s[i], y = b[i];
            const float shown = (x - zero) * o + zero;
            return b[3] == 0 ? shown : shown + (y - zero) * rest;
        },
        alpha);
}

float Inverse(float alpha) {
    if (alpha <= 0x1p-17f) return 0;
    return _mm_cvtss_f32(_mm_rcp_ss(_mm_set_ss(alpha))) * 255;
}

Pixel InMixedFour(const OverRule& rule, Pixel s, Pixel b, float o) {
    const bool both = rule.topIsOpaque && rule.backIsOpaque;
    const Pixel nothing = rule.isYUV ? Pixel{128, 128, 16, 0} : Pixel{};
    if (s[3] == 0) s = nothing;
    if (b[3] == 0) b = nothing;
    const float k = kPart, as = static_cast<float>(s[3]) * o, a = rule.topIsOpaque ? o : as * k, rest = 1 - a;
    const float ba = b[3], alpha = both ? (a + rest) * 255 : as + ba * rest;
    const float shown = rule.backIsOpaque ? 1 : ba * k; // 255 * k is 1 to the nearest only
    return Channelwise(
        [&](size_t i) {
            const float x = s[i], y = b[i], zero = ZeroOf(rule, static_cast<int>(i));
            if (rule.isStraight) return (x * a + y * rest * shown) * Inverse(alpha);
            return (x - zero) * o + zero + (y - zero) * rest;
        },
        rule.backIsOpaque && !rule.isStraight ? 255 : alpha);
}

void Four(const OverRule& rule, const uint8_t* top, const uint8_t* back, uint8_t* destination, int64_t x,
          float o) {
    Pixel s[4], b[4];
    bool allNone = true, allFull = true, allClear = true;
    for (int i = 0; i < 4; ++i) {
        s[i] = PixelAt(top, x + i, rule.topIsOpaque);
        b[i] = PixelAt(back, x + i, rule.backIsOpaque);
        const float a = rule.topIsOpaque ? o : static_cast<float>(s[i][3]) * o * kPart;
        allNone = allNone && a == 0;
        allFull = allFull && a >= 0.99999237f;
        allClear = allClear && b[i][3] == 0;
    }
    for (int i = 0; i < 4; ++i) {
        const Pixel result = allNone   ? b[i]
                             : allFull ? WithAlpha(s[i], 255)
                             : allClear && rule.isStraight
                                 ? WithAlpha(s[i], Sat(static_cast<float>(s[i][3]) * o))
                                 : InMixedFour(rule, s[i], b[i], o);
        std::memcpy(destination + 4 * (x + i), result.data(), 4);
    }
}

} // namespace

void Over8u(const OverRule& rule, bool byFours, const uint8_t* top, const uint8_t* back, uint8_t* destination,
            int32_t width, float opacity) {
    const float o = opacity + kSmall > 1 ? 1 : opacity;
    const auto address = reinterpret_cast<uintptr_t>(destination);
    const bool hasFours = byFours && address % 4 == 0; // else no pixel begins at the boundary
    const int32_t head = hasFours ? std::min(width, static_cast<int32_t>((-address & 15) / 4)) : width;
    const int32_t end = head + (width - head) / 4 * 4;
    const auto alone = [&](int32_t first, int32_t last) {
        for (int64_t x = first; x < last; ++x) {
            const Pixel s = PixelAt(top, x, rule.topIsOpaque), b = PixelAt(back, x, rule.backIsOpaque);
            const Pixel result = Alone(rule, s, b, o);
            std::memcpy(destination + 4 * x, result.data(), 4);
        }
    };
    alone(0, head);
    for (int64_t x = head; x < end; x += 4) Four(rule, top, back, destination, x, o);
    alone(end, width);
}

void Over32f(const OverRule& rule, const float* top, const float* back, float* destination, int32_t width,
             float opacity) {
    const float o = opacity + kSmall > 1 ? 1 : opacity;
    const bool both = rule.topIsOpaque && rule.backIsOpaque;
    for (int64_t x = 0; x < width; ++x) {
        float s[4], b[4];
        std::copy_n(top + 4 * x, 4, s);
        std::copy_n(back + 4 * x, 4, b);
        if (rule.backIsOpaque) b[3] = 1;
        float* const d = destination + 4 * x;
        const float a = rule.topIsOpaque ? o : s[3] * o, rest = 1 - a, ba = b[3];
        if (kSmall > std::abs(a)) {
            std::copy_n(b, 4, d);
            continue;
        }
        const bool isFull = kSmall > std::abs(1 - a), isClear = kSmall > std::abs(ba);
        const float straightAlpha = both ? 1 + o - o : (1 - a) * ba + a;
        for (int i = 0; i < 3; ++i)
            d[i] = isFull             ? s[i]
                   : isClear          ? (rule.isStraight ? s[i] : s[i] * o)
                   : !rule.isStraight ? s[i] * o + b[i] * rest
                                      : (s[i] * a + b[i] * rest * ba) * (1 / straightAlpha);
        d[3] = isFull ? 1 : isClear ? a : rule.isStraight ? straightAlpha : both ? 1 + o - o : a + ba * rest;
    }
}

} // namespace PKTest::reference
