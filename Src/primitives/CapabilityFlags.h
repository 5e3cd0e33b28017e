#pragma once

// What the processor can do, as every kernel chooser asks it.
//
// The flags are plain bytes, written during start-up and by the debug switches only and read without
// synchronisation. AVX-512 has no switch and no setting of its own: its code also asks for the AVX2 flag.

#include <cstdint>

namespace PK {

extern uint8_t sCPUHasSSE;
extern uint8_t sCPUHasSSE2;
extern uint8_t sCPUHasSSE3;
extern uint8_t sCPUHasSSSE3;
extern uint8_t sCPUHasSSE4; // SSE4.1
extern uint8_t sCPUHasSSE42;
extern uint8_t sCPUHasAVX;
extern uint8_t sCPUHasAVX2;
extern uint8_t sCPUHasAVX512; // F, DQ, BW and VL

} // namespace PK
