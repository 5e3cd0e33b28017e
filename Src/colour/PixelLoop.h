#pragma once

// The form of all conversions that go pixel by pixel, and what they share.

#include <cmath>
#include <cstdint>

namespace PK {

/// The pixels of a row that a kernel takes; the rest goes one by one.
inline int32_t BulkPixels(int32_t count) {
    return count > 0 ? count & ~7 : 0;
}

/// The colour of a pixel; the names are right on the RGB side.
struct RGB {
    float r, g, b;
};

/// Runs a function from colour to colour over pixels in memory order B, G, R, A. Alpha is copied. Source and
/// destination may be one.
template <class Convert>
void ForPixels(const float* source, float* destination, int32_t count, Convert convert) {
    for (; count > 0; --count) {
        const RGB result = convert(RGB{source[2], source[1], source[0]});
        destination[0] = result.b;
        destination[1] = result.g;
        destination[2] = result.r;
        destination[3] = source[3];
        source += 4;
        destination += 4;
    }
}

/// The function on each channel.
template <class Function>
RGB ForChannels(RGB c, Function function) {
    return {function(c.r), function(c.g), function(c.b)};
}

/// The function on the magnitude, with the sign of the argument.
template <class Function>
float WithSign(float v, Function function) {
    const float magnitude = function(std::abs(v));
    return v < 0 ? -magnitude : magnitude;
}

inline float SignedPower(float v, float exponent) {
    return WithSign(v, [exponent](float a) { return std::pow(a, exponent); });
}

} // namespace PK
