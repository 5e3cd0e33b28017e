#pragma once

// What the processor can do, as every kernel chooser asks it.
//
// The flags are written during start-up and by the debug switches only, and read at any time. AVX-512 has no switch
// and no setting of its own: its code also asks for the AVX2 flag.

#include "primitives/Relaxed.h"

#include <cstdint>

namespace PK {

using Flag = Relaxed<uint8_t>;

extern Flag sCPUHasSSE;
extern Flag sCPUHasSSE2;
extern Flag sCPUHasSSE3;
extern Flag sCPUHasSSSE3;
extern Flag sCPUHasSSE4; // SSE4.1
extern Flag sCPUHasSSE42;
extern Flag sCPUHasAVX;
extern Flag sCPUHasAVX2;
extern Flag sCPUHasAVX512; // F, DQ, BW and VL

} // namespace PK
