#pragma once

// How the capability flags are set: what the processor reports, then what the host's settings take away.

#include "primitives/CapabilityFlags.h"

#include <cstdint>

namespace PK {

/// What the processor says of itself.
struct ProcessorReport {
    uint32_t leaf1EAX; ///< CPUID leaf 1: the processor signature.
    uint32_t leaf1ECX;
    uint32_t leaf1EDX;
    uint32_t leaf7EBX; ///< CPUID leaf 7; 0 if not asked.
    uint32_t xcr0;     ///< State that the operating system saves; 0 if not asked.
};

/// Asks the processor; what stands above the highest target (Dispatch.h) counts as missing.
ProcessorReport ReadProcessor() noexcept;

/// Sets the flags that the report carries and clears none.
void SetCapabilities(const ProcessorReport& report) noexcept;

/// Holds the library to the target that the host's setting "PK.highestTarget" names by its word; if there is none, it
/// stays held as it is.
void ApplyTargetSetting() noexcept;

/// Clears AVX and AVX2 where the host's settings ask for it.
void ApplyCapabilitySettings() noexcept;

/// The whole of processor detection, in its order: highest target, capabilities, cache, settings.
void DetectProcessor() noexcept;

} // namespace PK
