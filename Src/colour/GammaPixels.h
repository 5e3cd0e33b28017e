#pragma once

// Conversions between two power laws with a matrix in linear light between them.

#include "colour/PixelLoop.h"

#include <PixelKiln/ColorSpace.h>

namespace PK {

/// Decodes each channel with one power, applies the matrix and clips the gamut, and encodes with another power; signs are
/// carried around the powers.
/// \param gamutClip  has no effect with the identity.
/// \param weights    those of R, G and B in luminance for the clip; null, as a host's space may have it, for zeros.
void ConvertGammaPixels(const float* source, float* destination, int32_t count, float inExponent,
                        float outExponent, const CSMatrix& matrix, bool gamutClip, const float* weights);

} // namespace PK
