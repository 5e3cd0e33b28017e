#pragma once

// Which kernel samples a source for motion, and what its line is scaled by afterwards.

#include "geometry/MotionSampleKernels.h"

#include <PixelKiln/Types.h>

#include <optional>

namespace PK {

/// The best body that is enabled for what is sampled: the source, or its blurred copy.
/// \param format   four channels, packed.
/// \param quality  5 resamples by weights where the format is premultiplied RGB in float; all others weigh four pixels.
SampleMotionRow ChooseMotionSampler(PK_PixelFormat format, int32_t quality) noexcept;

/// What takes a line sampled from a format to the range of floats; nothing for floats.
std::optional<LineScale> MotionLineScale(PK_PixelFormat format) noexcept;

/// Scales so many pixels in place.
void ScaleMotionLine(const LineScale& scale, float* pixels, int32_t count) noexcept;

} // namespace PK
