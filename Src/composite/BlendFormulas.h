#pragma once

// The blend modes: of single channels as formulas of s, the top, and b, the back; of whole pixels as what becomes of a
// colour. Each is stated once.

#include "primitives/lanes/PixelLanes.h"

namespace PK::PK_TARGET {

inline F32 Limited(F32 x, float least, float most) {
    return Min(Max(x, Floats(least)), Floats(most));
}
inline F32 Limited(F32 x) {
    return Limited(x, 0, 1);
}

struct ColorBurn {
    static F32 Of(F32 s, F32 b) {
        return Limited(Floats(1) - (Floats(1) - Limited(b)) / Limited(s, 1e-7f, 1));
    }
};

struct ColorDodge {
    static F32 Of(F32 s, F32 b) { return Limited(Limited(b) / (Floats(1) - Limited(s, 0, 0.99999f))); }
};

struct Darken {
    static F32 Of(F32 s, F32 b) { return Min(s, b); }
};

struct Difference {
    static F32 Of(F32 s, F32 b) { return Magnitude(s - b); }
};

struct Exclusion {
    static F32 Of(F32 s, F32 b) {
        const F32 x = Limited(s), y = Limited(b);
        return Limited(x + y - (x + x) * y);
    }
};

/// Multiply where `chooses` is dark, screen where it is light, of twice the one that chooses.
inline F32 MultiplyOrScreen(F32 chooses, F32 x, F32 y) {
    const F32 dark = Floats(2) * x * y, light = Floats(1) - (Floats(1) - x) * Floats(2) * (Floats(1) - y);
    return Limited(Select(NotGreater(chooses, Floats(0.5f)), dark, light));
}

struct HardLight {
    static F32 Of(F32 s, F32 b) { return MultiplyOrScreen(Limited(s), Limited(s), Limited(b)); }
};

struct Overlay {
    static F32 Of(F32 s, F32 b) { return MultiplyOrScreen(Limited(b), Limited(s), Limited(b)); }
};

struct HardMix {
    static F32 Of(F32 s, F32 b) { return Select(Less(s, Floats(1) - b), Floats(0), Floats(1)); }
};

struct Lighten {
    static F32 Of(F32 s, F32 b) { return Max(s, b); }
};

struct LinearBurn {
    static F32 Of(F32 s, F32 b) { return Limited(Limited(s) - Floats(1) + Limited(b)); }
};

struct LinearDodge {
    static F32 Of(F32 s, F32 b) { return s + b; }
};

/// Not limited as a sum.
struct LinearLight {
    static F32 Of(F32 s, F32 b) { return Limited(s) - Floats(1) + Limited(s) + Limited(b); }
};

struct PinLight {
    static F32 Of(F32 s, F32 b) {
        const F32 x = Limited(s), y = Limited(b), t = x - Floats(1) + x;
        return Select(Less(y, t), t, Min(x + x, y));
    }
};

struct Screen {
    static F32 Of(F32 s, F32 b) {
        return Limited(Floats(1) - (Floats(1) - Limited(s, 1e-7f, 1)) * (Floats(1) - Limited(b, 1e-7f, 1)));
    }
};

struct SoftLight {
    static F32 Of(F32 s, F32 b) {
        const F32 x = Limited(s), y = Limited(b), t = x - Floats(1) + x;
        const F32 dark = t * (y - y * y) + y, light = t * (SquareRoot(y) - y) + y;
        return Limited(Select(NotGreater(x, Floats(0.5f)), dark, light));
    }
};

struct VividLight {
    static F32 Of(F32 s, F32 b) {
        const F32 one = Floats(1), x = Limited(s, 1e-6f, 0.999999f), y = Limited(b);
        const F32 burn = one - (one - y) / (x + x), dodge = y / ((one - x) * Floats(2));
        return Limited(Select(NotGreater(x, Floats(0.5f)), burn, dodge));
    }
};

struct Subtract {
    static F32 Of(F32 s, F32 b) { return b - s; }
};

struct Divide {
    static F32 Of(F32 s, F32 b) {
        const F32 least = Floats(1e-7f);
        return b / Select(Less(Magnitude(s), least), least, s);
    }
};

// Whole pixels, without their alpha.

struct Colour {
    F32 b, g, r;
};

/// The same of each channel.
template <class Function>
inline Colour Each3(const Colour& c, Function function) {
    return {function(c.b), function(c.g), function(c.r)};
}

inline F32 Weighed(const Colour& c, float red, float green, float blue) {
    return Floats(red) * c.r + Floats(green) * c.g + Floats(blue) * c.b;
}

inline F32 Lum(const Colour& c) {
    return Weighed(c, 0.3f, 0.59f, 0.11f);
}

inline F32 Least(const Colour& c) {
    return Min(c.r, Min(c.g, c.b));
}
inline F32 Greatest(const Colour& c) {
    return Max(c.r, Max(c.g, c.b));
}

inline F32 Sat(const Colour& c) {
    return Limited(Greatest(c) - Least(c));
}

/// x / y where `mask` is set; elsewhere nothing is divided by what may be 0.
inline F32 QuotientWhere(I32 mask, F32 x, F32 y) {
    return x / Select(mask, y, Floats(1));
}

/// The colour with another luminance, drawn towards grey as far as it would leave 0 to 1.
inline Colour SetLum(const Colour& colour, F32 lum) {
    const F32 d = Limited(lum) - Limited(Lum(colour));
    Colour c = Each3(colour, [d](F32 x) { return x + d; });
    const F32 grey = Limited(Lum(c)), least = Least(c), greatest = Greatest(c);
    const I32 isBelow = Less(least, Floats(0)), isAbove = Less(Floats(1), greatest);
    c = Each3(c, [&](F32 x) {
        return Select(isBelow, QuotientWhere(isBelow, (x - grey) * grey, grey - least) + grey, x);
    });
    return Each3(c, [&](F32 x) {
        const F32 drawn = QuotientWhere(isAbove, (x - grey) * (Floats(1) - grey), greatest - grey) + grey;
        return Select(isAbove, drawn, x);
    });
}

inline I32 EqualFloats(F32 a, F32 b) {
    return NotGreater(a, b) & NotGreater(b, a);
}

/// The colour with another saturation: its least channel becomes 0, its greatest the saturation. Of equal channels red
/// is the least or green the middle one.
inline Colour SetSat(const Colour& c, F32 saturation) {
    const F32 least = Least(c), greatest = Greatest(c);
    const I32 redIsLeast = EqualFloats(least, c.r),
              redIsGreatest = EqualFloats(greatest, c.r) & Not(redIsLeast);
    const I32 redIsMiddle = Not(redIsLeast | redIsGreatest);
    const I32 greenLeads = EqualFloats(greatest, c.g), greenIsAbove = Not(EqualFloats(least, c.g));
    const I32 greenIsGreatest = (redIsLeast & greenLeads) | (redIsMiddle & greenIsAbove);
    const I32 greenIsMiddle = (redIsLeast & Not(greenLeads)) | (redIsGreatest & greenIsAbove);
    const I32 blueIsGreatest = (redIsLeast & Not(greenLeads)) | (redIsMiddle & Not(greenIsAbove));
    const I32 blueIsMiddle = (redIsLeast & greenLeads) | (redIsGreatest & Not(greenIsAbove));

    const I32 isColour = Less(least, greatest);
    const auto channel = [&](F32 x, I32 isMiddle, I32 isGreatest) {
        const F32 middle = QuotientWhere(isColour, (x - least) * saturation, greatest - least);
        return Select(isColour, Select(isGreatest, saturation, Select(isMiddle, middle, Floats(0))),
                      Floats(0));
    };
    return {channel(c.b, blueIsMiddle, blueIsGreatest), channel(c.g, greenIsMiddle, greenIsGreatest),
            channel(c.r, redIsMiddle, redIsGreatest)};
}

struct Color {
    static Colour Of(const Colour& s, const Colour& b) { return SetLum(s, Lum(b)); }
};
struct Hue {
    static Colour Of(const Colour& s, const Colour& b) { return SetLum(SetSat(s, Sat(b)), Lum(b)); }
};
struct Luminosity {
    static Colour Of(const Colour& s, const Colour& b) { return SetLum(b, Lum(s)); }
};
struct Saturation {
    static Colour Of(const Colour& s, const Colour& b) { return SetLum(SetSat(b, Sat(s)), Lum(b)); }
};
struct Normal {
    static Colour Of(const Colour& s, const Colour&) { return s; }
};

} // namespace PK::PK_TARGET
