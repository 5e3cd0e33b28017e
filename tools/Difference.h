#pragma once

// How far two pictures of one size are apart.

#include "Frame.h"

#include <string>

namespace tool {

/// All differences are in steps of 8 bits: 255 is from black to white, whatever the depth.
struct Difference {
    double largestColour = 0; ///< over red, green and blue; infinite if a sample is not a number
    double largestAlpha = 0;
    double psnr = 0; ///< dB over red, green and blue; infinite for equal pictures
    int64_t differingPixels = 0;
};

/// \param a,  b  both BGRA_4444_8u or both BGRA_4444_32f, of one size.
Difference MeasureDifference(const Frame& a, const Frame& b);

/// The differences of two BGRA_4444_8u pictures as an opaque picture, `factor` times as bright.
Frame DifferencePicture(const Frame& a, const Frame& b, int factor);

std::string PsnrText(double psnr);

} // namespace tool
