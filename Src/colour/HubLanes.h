#pragma once

// Between the hub and linear light of another space, on vectors.

#include "colour/ApproxPower.h"
#include "colour/ColourLanes.h"
#include "colour/HubExponents.h"

namespace PK::PK_TARGET {

/// Decodes pixels of the hub and applies the matrix; leaves the magnitudes and returns the signs.
inline Signs DecodeHub(F32 (&colour)[3], const MatrixLanes& matrix) {
    const Signs signs = TakeSigns(colour);
    ApproxPow(colour, Floats(kHubDecoding));
    PutSigns(colour, signs);
    matrix.Apply(colour);
    return TakeSigns(colour);
}

/// Applies the matrix to linear pixels and encodes them for the hub.
inline void EncodeHub(F32 (&colour)[3], const MatrixLanes& matrix) {
    matrix.Apply(colour);
    const Signs signs = TakeSigns(colour);
    ApproxPow(colour, Floats(kHubEncoding));
    PutSigns(colour, signs);
}

} // namespace PK::PK_TARGET
