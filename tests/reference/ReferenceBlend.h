#pragma once

// The blend modes, pixel by pixel in single precision as their rules are told, without anything of the library.

#include <cstdint>

namespace PKTest::reference {

/// A pixel of BGRA_4444_32f over another by the mode of a number, of 0 to 26 without 6, in a row of `width` pixels.
void BlendPixel(int32_t mode, const float* top, const float* back, float* destination, float opacity,
                int32_t width);

} // namespace PKTest::reference
