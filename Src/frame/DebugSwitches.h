#pragma once

// The debug switches that are not capabilities. PK_SetDebugFlag writes them; both are off by default.

#include "primitives/CapabilityFlags.h"

namespace PK {

extern Flag sMotionBlurLinear;  // The blur of motion works in BGRP_4444_32f_Linear.
extern Flag sAllOriginsTopLeft; // Every format counts as stored top-down.

} // namespace PK
