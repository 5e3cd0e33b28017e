#pragma once

// What the host's trace is told of a scale-and-convert call.

#include "scale/ScaleRoute.h"

#include <string>

namespace PK {

/// "Low" or "High", as traces have it.
const char* TraceTextOfQuality(int32_t quality);

/// Such as "720 x 486 UYVY_422_8u, field 1, to 360 x 243 BGRA_4444_8u, field 0, quality Low: half size".
std::string DescribeScale(const ScaleCall& call, ScaleRoute route);

/// Writes that to the channel "PK.ScaleConvert" at level 5, which is silent at first. A line that there is no memory for is
/// not written.
void TraceScale(const ScaleCall& call, ScaleRoute route) noexcept;

} // namespace PK
