#include "support/Switches.h"

#include "primitives/Dispatch.h"
#include "support/Check.h"

#include <PixelKiln/Lifecycle.h>

namespace PKFuzz {

namespace {

// Asked of the compiler's own detection, not of the library's; what the library is held below counts as missing.
Switches Capabilities() {
    const PK::Target highest = PK::HighestTarget();
    Switches has{};
    has[2] = __builtin_cpu_supports("sse");
    has[3] = __builtin_cpu_supports("sse2") && highest >= PK::Target::sse2;
    has[4] = __builtin_cpu_supports("sse3") && highest >= PK::Target::sse2;
    has[5] = __builtin_cpu_supports("ssse3") && highest >= PK::Target::ssse3;
    has[kSwitchSSE4] = __builtin_cpu_supports("sse4.1") && highest >= PK::Target::sse41;
    has[7] = __builtin_cpu_supports("sse4.2") && highest >= PK::Target::sse41;
    has[kSwitchAVX] = __builtin_cpu_supports("avx") && highest >= PK::Target::avx;
    has[kSwitchAVX2] = __builtin_cpu_supports("avx2") && highest >= PK::Target::avx2;
    return has;
}

bool IsCapability(uint32_t which) {
    return which >= 2 && which <= kSwitchAVX2;
}

} // namespace

Switches SwitchesAfterStart() {
    static const Switches capabilities = Capabilities();
    return capabilities;
}

bool MayBeOn(uint32_t which) {
    return !IsCapability(which) || SwitchesAfterStart()[which];
}

void SetSwitches(const Switches& switches) {
    for (uint32_t which = 0; which < kSwitchCount; ++which)
        Check(PK_SetDebugFlag(which, switches[which]) == PK_Success, "PK_SetDebugFlag succeeds");
}

Switches DrawSwitches(ByteStream& stream) {
    Switches switches = SwitchesAfterStart();
    if (!stream.Bool()) return switches;
    const uint32_t bits = stream.U32();
    for (uint32_t which = 0; which < kSwitchCount; ++which)
        switches[which] = (bits >> which & 1) != 0 && MayBeOn(which);
    return switches;
}

} // namespace PKFuzz
