#pragma once

// The bodies of the colour spaces' kernels that this processor runs, and the rounding that each restates.

#include "primitives/CpuFeatures.h"
#include "reference/ReferenceColour.h"
#include "support/Targets.h"

#include <vector>

namespace PKTest {

inline reference::Rounding RoundingOf(PK::Target target) {
    return target == PK::Target::avx2fma ? reference::Rounding::kFused : reference::Rounding::kEach;
}

} // namespace PKTest
