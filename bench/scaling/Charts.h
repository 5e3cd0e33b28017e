#pragma once

// The pictures that are scaled: two that formulas draw, whose every value is known, and photographs.

#include "Grey.h"

#include <string>

namespace Scaling {

/// Of the charts; a multiple of what all scales need for whole sides.
inline constexpr int32_t kSide = 320;
inline constexpr double kMiddle = kSide / 2.0;

/// What 16 bits without a sign cannot exceed by ringing.
inline constexpr double kAmplitude = 0.4;

/// Rings that get finer outward, at a place in pixels from the middle: 1/2 + kAmplitude cos(pi r^2 / kSide). Along each axis
/// the frequency rises in proportion to the distance, up to half a wave a pixel at the edge.
double ZonePlateAt(double x, double y);
Grey ZonePlate();

/// A step of twice kAmplitude from dark on the left to bright, smooth by a Gaussian of 0.8 pixels, and turned by 5 degrees from upright; as
/// high as the other charts.
/// \param column  where it lies half way down.
Grey SlantedEdge(int32_t width = kSide, double column = kMiddle);
/// How much further right it lies at a place in pixels below that.
double SlantedEdgeAt(double y);

/// Columns for rows.
Grey Transposed(const Grey& grey);

/// Luma of the middle of a PNG file, whose sides are cut to multiples of 40.
Grey Photograph(const std::string& name);

} // namespace Scaling
