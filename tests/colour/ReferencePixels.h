#pragma once

// The conversions of single pixels written out, in the order of operations that the pixels behind the last whole group of
// eight have.

#include "colour/Pixels.h"

#include <algorithm>
#include <cmath>

namespace PKTest {

struct ReferenceColour {
    float R, G, B;
};

/// The second where the comparison fails, so for NaN: as the vector instructions have it.
inline float Lesser(float a, float b) {
    return a < b ? a : b;
}
inline float Greater(float a, float b) {
    return a > b ? a : b;
}

inline ReferenceColour ReferenceClip(ReferenceColour c, const float* l) {
    auto [R, G, B] = c;
    if (R < 0 || G < 0 || B < 0) {
        const float Y = l[2] * B + l[1] * G + l[0] * R;
        float s = 1;
        if (R < 0) s = std::min(s, Y / (Y - R));
        if (G < 0) s = std::min(s, Y / (Y - G));
        if (B < 0) s = std::min(s, Y / (Y - B));
        R = (R - Y) * s + Y;
        G = (G - Y) * s + Y;
        B = (B - Y) * s + Y;
    }
    if (R > 1 || G > 1 || B > 1) {
        if (R == G && G == B) return {1, 1, 1};
        const float least = Lesser(Lesser(R, G), B), most = Greater(Greater(R, G), B);
        const float dR = R - least, dG = G - least, dB = B - least;
        float L = (l[0] * dR + l[1] * dG + l[2] * dB) / Greater(Greater(dR, dG), dB);
        L = Lesser(Greater(L, 0.15f), 0.9f);
        const float k = (1 - L) / (most - L);
        R = (R - L) * k + L;
        G = (G - L) * k + L;
        B = (B - L) * k + L;
    }
    return {R, G, B};
}

inline float ReferencePower(float v, float exponent) {
    return v < 0 ? -std::pow(-v, exponent) : std::pow(std::abs(v), exponent);
}

/// A conversion between two power laws.
struct ReferenceGamma {
    float inExponent, outExponent;
    const float* matrix = nullptr; ///< null for none
    const float* luma = nullptr;   ///< null for no clip; needs a matrix

    Pixel operator()(const Pixel& pixel) const {
        ReferenceColour c = {ReferencePower(pixel[2], inExponent), ReferencePower(pixel[1], inExponent),
                             ReferencePower(pixel[0], inExponent)};
        if (matrix != nullptr) {
            const float* m = matrix;
            c = {m[2] * c.B + m[1] * c.G + m[0] * c.R, m[5] * c.B + m[4] * c.G + m[3] * c.R,
                 m[8] * c.B + m[7] * c.G + m[6] * c.R};
            if (luma != nullptr) c = ReferenceClip(c, luma);
        }
        return {ReferencePower(c.B, outExponent), ReferencePower(c.G, outExponent),
                ReferencePower(c.R, outExponent), pixel[3]};
    }
};

/// Runs fewer pixels than a group at a time, so that all go one by one, and compares them with the reference.
template <class Convert, class Reference>
void ExpectPixelsLike(const Pixels& pixels, Convert convert, Reference reference) {
    for (size_t first = 0; first < pixels.size(); first += 7) {
        const auto begin = pixels.begin() + static_cast<ptrdiff_t>(first);
        const Pixels few(begin, begin + static_cast<ptrdiff_t>(std::min<size_t>(7, pixels.size() - first)));
        const Pixels converted = Converted(few, convert);
        for (size_t i = 0; i < few.size(); ++i) {
            const Pixel expected = reference(few[i]);
            for (size_t k = 0; k < 3; ++k)
                ASSERT_TRUE(IsSame(converted[i][k], expected[k]))
                    << "channel " << k << " of " << few[i][0] << ", " << few[i][1] << ", " << few[i][2]
                    << ": " << converted[i][k] << ", not " << expected[k];
            ASSERT_EQ(Pattern(converted[i][3]), Pattern(few[i][3])) << "alpha";
        }
    }
}

} // namespace PKTest
