#pragma once

// The debug switches that are not capabilities. PK_SetDebugFlag writes them; both are off by default.

#include <cstdint>

namespace PK {

extern uint8_t sMotionBlurLinear;  // The blur of motion works in BGRP_4444_32f_Linear.
extern uint8_t sAllOriginsTopLeft; // Every format counts as stored top-down.

} // namespace PK
