#pragma once

// The blend mode that draws: each pixel from the top or the back image by chance.

#include <cstdint>

namespace PK {

/// A row of BGRA_4444_32f. The top pixel is copied whole, alpha included, where a number of the C runtime, reduced to 15
/// bits, is at most its alpha by the opacity by 32767. A pixel whose alpha is negligible draws no number.
void DissolveRow(const void* top, const void* back, void* destination, int32_t width, const float& opacity);

} // namespace PK
