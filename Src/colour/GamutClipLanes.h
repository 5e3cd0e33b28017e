#pragma once

// The gamut clip of GamutClip.h on vectors. Divisions are refined reciprocal estimates, and a channel of exactly 1 takes
// part in the second step; pixels that need no step keep their value.

#include "colour/ApproxPower.h"
#include "colour/ColourLanes.h"

namespace PK::PK_TARGET {

inline void RaiseToZero(F32 (&colour)[3], I32 isNegative, const Weights& luma) {
    const F32 Y = luma.Sum(colour);
    F32 scale = Floats(1);
    for (const F32 c : colour)
        scale = Min(scale, Select(Less(c, Floats(0)), Y * Reciprocal(Y - c), Floats(1)));
    for (F32& c : colour) c = Select(isNegative, MultiplyAdd(c - Y, scale, Y), c);
}

inline void LowerToOne(F32 (&colour)[3], I32 isAbove, const Weights& luma) {
    const F32 least = Min(Min(colour[2], colour[1]), colour[0]);
    const F32 most = Max(Max(colour[2], colour[1]), colour[0]);
    const F32 above[3] = {colour[0] - least, colour[1] - least, colour[2] - least};
    const F32 mostAbove = Max(Max(above[2], above[1]), above[0]);
    const F32 weighted =
        MultiplyAdd(luma.blue, above[0], MultiplyAdd(luma.green, above[1], luma.red * above[2]));
    const F32 grey = Min(Max(weighted * Reciprocal(mostAbove), Floats(0.15f)), Floats(0.9f));
    const F32 scale = (Floats(1) - grey) * Reciprocal(most - grey);
    const I32 hasHue = Less(Floats(0), mostAbove);
    for (F32& c : colour)
        c = Select(isAbove, Select(hasHue, MultiplyAdd(c - grey, scale, grey), Floats(1)), c);
}

inline void ClipGamut(F32 (&colour)[3], const Weights& luma) {
    const I32 signs = Bits(colour[0]) | Bits(colour[1]) | Bits(colour[2]);
    if (AnyNegative(signs)) RaiseToZero(colour, ShiftRightSigned<31>(signs), luma);
    const F32 one = Floats(1);
    const I32 isAbove = NotGreater(one, colour[0]) | NotGreater(one, colour[1]) | NotGreater(one, colour[2]);
    if (AnyNegative(isAbove)) LowerToOne(colour, isAbove, luma);
}

} // namespace PK::PK_TARGET
