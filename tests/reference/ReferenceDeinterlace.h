#pragma once

// The interpolation of PK_Deinterlace along edges restated, one pixel at a time.

#include "reference/ReferencePixels.h"

namespace PKTest {

/// Rows of four samples a pixel.
void ReferenceInterpolateRow(SampleDepth depth, bool alphaFirst, const uint8_t* above, const uint8_t* below,
                             uint8_t* destination, int32_t width);

} // namespace PKTest
