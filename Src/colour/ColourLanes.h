#pragma once

// What the kernels of the colour spaces share: signs put aside for the powers, matrices, and weights. Channels are arrays
// in memory order: blue, green, red.

#include "primitives/lanes/RowDriver.h"
#include "primitives/simd/MultiplyAdd.h"

namespace PK::PK_TARGET {

/// A function on the three colour channels of kLanes pixels, which changes them in place; alpha is copied.
template <class Convert>
struct ColourGroup : PixelGroup<16, 16> {
    explicit ColourGroup(const Convert& convert) : fConvert(convert) {}

    void Group(const uint8_t* source, uint8_t* destination) const {
        const Channels pixels = LoadFloatChannels(source);
        F32 colour[3] = {pixels.c0, pixels.c1, pixels.c2};
        fConvert(colour);
        StoreFloatChannels(destination, {colour[0], colour[1], colour[2], pixels.c3});
    }

    Convert fConvert;
};

/// \param convert  what it has of constants it holds by value.
template <class Convert>
inline void ForPixelGroups(const void* source, void* destination, ptrdiff_t count, const Convert& convert) {
    RunRow(ColourGroup<Convert>(convert), count, destination, source);
}

struct Signs {
    I32 bits[3];
};

/// Leaves the magnitudes.
inline Signs TakeSigns(F32 (&colour)[3]) {
    Signs signs;
    for (int i = 0; i < 3; ++i) {
        signs.bits[i] = Bits(colour[i]) & Ints(INT32_MIN);
        colour[i] = FromBits(Bits(colour[i]) ^ signs.bits[i]);
    }
    return signs;
}

/// Gives magnitudes their signs.
inline void PutSigns(F32 (&colour)[3], const Signs& signs) {
    for (int i = 0; i < 3; ++i) colour[i] = FromBits(Bits(colour[i]) | signs.bits[i]);
}

/// Weights of red, green and blue.
struct Weights {
    F32 red, green, blue;

    explicit Weights(const float* weights)
        : red(Floats(weights[0])), green(Floats(weights[1])), blue(Floats(weights[2])) {}

    /// The weighted sum, blue first.
    F32 Sum(const F32 (&colour)[3]) const {
        return MultiplyAdd(red, colour[2], MultiplyAdd(green, colour[1], blue * colour[0]));
    }
};

/// A matrix of nine floats, row by row.
struct MatrixLanes {
    Weights red, green, blue;

    explicit MatrixLanes(const float* m) : red(m), green(m + 3), blue(m + 6) {}

    void Apply(F32 (&colour)[3]) const {
        const F32 r = red.Sum(colour), g = green.Sum(colour), b = blue.Sum(colour);
        colour[0] = b;
        colour[1] = g;
        colour[2] = r;
    }
};

/// The nearest lower entries of a table for signals from 0 to 1; others are limited to that, and NaN is 0.
/// \param lastEntry  the index for 1.
inline void LookUpSignals(F32 (&colour)[3], const float* table, float lastEntry) {
    for (F32& c : colour) {
        const F32 signal = Min(Max(c, Floats(0)), Floats(1));
        c = Lookup(table, Truncate(signal * Floats(lastEntry)));
    }
}

} // namespace PK::PK_TARGET
