#pragma once

// The formulas of PK_CrossDissolve restated, one pixel at a time. They round by the current mode.

#include "reference/ReferencePixels.h"

namespace PKTest {

enum class DissolveRule { kOpaque, kStraight, kPremultiplied };

/// Rows of four samples a pixel.
void ReferenceDissolveRow(DissolveRule rule, SampleDepth depth, bool alphaFirst, const uint8_t* first,
                          const uint8_t* second, uint8_t* destination, size_t pixels, float weight);

/// Three samples of 10 bits.
uint32_t ReferenceDissolveV210(uint32_t first, uint32_t second, float weight);

} // namespace PKTest
