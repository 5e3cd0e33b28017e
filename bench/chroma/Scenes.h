#pragma once

// What is drawn: charts that tell errors of chroma, and a picture that moves between its fields.

#include "Video.h"

namespace ChromaBench {

inline constexpr int32_t kSide = 160;

/// Rings of U that get finer outward, up to 0.2 waves a pixel in the middle of each side, or 0.1 upwards and downwards for
/// fields: four fifths of what chroma can hold.
Scene ZonePlate(const Kind& kind);

/// A disc of U, whose edge is smooth by a Gaussian of 1.5 pixels.
Scene Disc();

/// A red disc that moves to the right over grey between the fields; slanted stripes and upright bars stand still.
inline constexpr int32_t kMovingWidth = 128, kMovingHeight = 64;
Codes MovingDisc(double x, double y, int32_t time);

} // namespace ChromaBench
