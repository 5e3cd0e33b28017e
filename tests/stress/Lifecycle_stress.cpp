// Starts, stops and switches beside everything else, as by plug-ins that know nothing of each other.

#include "stress/Operation.h"

#include <PixelKiln/Lifecycle.h>

namespace {

using namespace PKStress;

/// With many threads the count of starts passes zero either way, so that all that a start does meets running operations.
bool StopAndStart() {
    return PK_Terminate() == PK_Success && PK_Initialize() == PK_Success;
}

/// Results stay, since the bodies of AVX2 and those of SSE4.1 follow the same rules.
bool SwitchAVX2() {
    constexpr uint32_t kSwitchAVX2 = 9;
    const bool wasOn = PK_hasAVX2();
    return PK_SetDebugFlag(kSwitchAVX2, 0) == PK_Success && PK_SetDebugFlag(kSwitchAVX2, wasOn) == PK_Success;
}

const Operation sStopAndStart("stop-and-start", [] { return std::function(StopAndStart); });
const Operation sSwitchAVX2("switch-avx2", [] { return std::function(SwitchAVX2); });

} // namespace
