#pragma once

// What the processor can do, as every kernel chooser asks it, and how that is found out.
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

/// What the processor says of itself.
struct ProcessorReport {
    uint32_t leaf1EAX; ///< CPUID leaf 1: the processor signature.
    uint32_t leaf1ECX;
    uint32_t leaf1EDX;
    uint32_t leaf7EBX; ///< CPUID leaf 7; 0 if not asked.
    uint32_t xcr0;     ///< State that the operating system saves; 0 if not asked.
};

/// Asks the processor.
ProcessorReport ReadProcessor() noexcept;

/// Sets the flags that the report carries and clears none.
void SetCapabilities(const ProcessorReport& report) noexcept;

/// Clears AVX and AVX2 where the host's settings ask for it.
void ApplyCapabilitySettings() noexcept;

/// The whole of processor detection, in its order: capabilities, cache, settings.
void DetectProcessor() noexcept;

} // namespace PK
