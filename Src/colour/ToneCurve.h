#pragma once

// Tone-range compression: the luminance of pixels is bent into the range of standard video, by a curve in its
// logarithm, and the chromaticity is kept. All of it runs pixel by pixel.

#include "colour/PixelLoop.h"
#include "colour/TransferSegments.h"

#include <PixelKiln/ColorSpace.h>

namespace PK {

/// The curve of luminance: straight around its centre with the gain `slope`, and bent from the output level `knee` on so
/// as to end at 1.
class ToneCurve {
public:
    ToneCurve(float exposure, float slope, float knee);

    float operator()(float luminance) const;

private:
    float fLuminanceScale, fSlope, fKnee;
    float fKneeInput;    ///< where the curve leaves the straight line
    float fBendExponent; ///< makes the gradient continuous there
};

/// What a space says of its XYZ.
struct LuminanceSpace {
    CSMatrix toXYZ, toRGB;
    const float* white;

    LuminanceSpace(const ColorSpace& space)
        : toXYZ(space.RGBtoXYZ()), toRGB(space.XYZtoRGB()), white(space.WhitePoint()) {}
};

/// From encoded pixels to encoded pixels.
void CompressLuminanceEncoded(const float* source, float* destination, int32_t count, const ToneCurve& curve,
                              const LuminanceSpace& space, const TransferSegments& decoding,
                              const TransferSegments& encoding);

/// From pixels encoded with a power law to linear pixels.
void CompressLuminanceToLinear(const float* source, float* destination, int32_t count, const ToneCurve& curve,
                               const LuminanceSpace& space, float exponent);

} // namespace PK
