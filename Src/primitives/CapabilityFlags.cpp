#include "primitives/CapabilityFlags.h"

namespace PK {

uint8_t sCPUHasSSE = 0;
uint8_t sCPUHasSSE2 = 0;
uint8_t sCPUHasSSE3 = 0;
uint8_t sCPUHasSSSE3 = 0;
uint8_t sCPUHasSSE4 = 0;
uint8_t sCPUHasSSE42 = 0;
uint8_t sCPUHasAVX = 0;
uint8_t sCPUHasAVX2 = 0;
uint8_t sCPUHasAVX512 = 0;

} // namespace PK
