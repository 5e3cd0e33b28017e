// The numbered debug switches and the capability queries.

#include "frame/DebugSwitches.h"

#include <PixelKiln/Lifecycle.h>

#include <iterator>

namespace PK {

constinit Flag sMotionBlurLinear;
constinit Flag sAllOriginsTopLeft;

namespace {

// By number; a switch without a flag is accepted and does nothing.
constexpr Flag* kSwitches[] = {
    &sMotionBlurLinear, nullptr,       &sCPUHasSSE, &sCPUHasSSE2, &sCPUHasSSE3,        &sCPUHasSSSE3,
    &sCPUHasSSE4,       &sCPUHasSSE42, &sCPUHasAVX, &sCPUHasAVX2, &sAllOriginsTopLeft,
};

} // namespace
} // namespace PK

PK_Result PK_SetDebugFlag(uint32_t which, int32_t value) noexcept {
    if (which < std::size(PK::kSwitches) && PK::kSwitches[which] != nullptr)
        *PK::kSwitches[which] = value != 0;
    return PK_Success;
}

bool PK_hasSSE4(void) noexcept {
    return PK::sCPUHasSSE4 != 0;
}

bool PK_hasAVX(void) noexcept {
    return PK::sCPUHasAVX != 0;
}

bool PK_hasAVX2(void) noexcept {
    return PK::sCPUHasAVX2 != 0;
}
