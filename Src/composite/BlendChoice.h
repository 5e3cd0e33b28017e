#pragma once

// The kernel of a blend mode.

#include "composite/MixPlan.h"

#include <PixelKiln/BlendMode.h>

namespace PK {

/// The format in which all modes work.
inline constexpr PK_PixelFormat kBlendFormat = PK_PixelFormat_BGRA_4444_32f;

/// Null where the number is no mode.
MixKernel SelectBlendKernel(PK_BlendMode mode);

} // namespace PK
