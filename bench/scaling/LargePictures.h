#pragma once

// Pictures of 3840 x 2160 with detail in every pixel, and what half of their size should be.

#include "Frame.h"

#include <string>
#include <vector>

namespace Scaling {

/// The zone plate, repeated in both directions, from 0.1 to 0.9 of white.
tool::Frame LargePlates();

/// Photographs beside each other, each in as much of the width, as large as they are and repeated in turns with their
/// mirror images, so that no seam is seen but between two of them.
tool::Frame LargePhotographs(const std::vector<std::string>& names);

/// Blue, green and red of half a picture, in codes of 8 bits that are not rounded.
struct Ideal {
    std::vector<double> channels[3]; ///< from the top
};

/// All that half the size can hold, in double: by a sinc under the window of Lanczos, 16 lobes to each side; outside the
/// borders their pixels are repeated.
/// \param isOfLight  reduces what the codes to the power of 2.4 are.
Ideal IdealHalf(const tool::Frame& picture, bool isOfLight);

/// An ideal as pixels.
tool::Frame Rounded(const Ideal& ideal);

/// dB of all three channels, without 32 pixels at each border.
double SignalToNoise(const tool::Frame& half, const Ideal& ideal);

} // namespace Scaling
