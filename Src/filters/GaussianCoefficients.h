#pragma once

// The filter whose response comes near to a Gaussian.

#include "filters/GaussianBlurKernels.h"

namespace PK {

/// \param sigma  of the Gaussian, in pixels, above 0. Where it is so small or so great that the arithmetic leaves the
///               numbers, coefficients are not-a-number.
GaussianCoefficients GaussianCoefficientsOf(double sigma) noexcept;

} // namespace PK
