#pragma once

// Colours outside the gamut are moved towards their luminance until no channel is negative, then towards a grey of the
// gamut until none is above 1.

#include "colour/PixelLoop.h"

namespace PK {

/// \param luma  the weights of R, G and B in luminance.
RGB GamutClipPixel(RGB c, const float* luma);

} // namespace PK
