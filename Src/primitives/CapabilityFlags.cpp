#include "primitives/CapabilityFlags.h"

namespace PK {

constinit Flag sCPUHasSSE;
constinit Flag sCPUHasSSE2;
constinit Flag sCPUHasSSE3;
constinit Flag sCPUHasSSSE3;
constinit Flag sCPUHasSSE4;
constinit Flag sCPUHasSSE42;
constinit Flag sCPUHasAVX;
constinit Flag sCPUHasAVX2;
constinit Flag sCPUHasAVX512;

} // namespace PK
