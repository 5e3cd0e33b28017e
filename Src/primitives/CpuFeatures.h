#pragma once

// What the processor can do, as the kernels of the colour spaces ask it. This record is apart from the capability flags
// of the other rooms, so that no setting and no debug switch reaches it and no start-up is needed.

#include <cstdint>

namespace PK {

/// A byte each, 1 where the processor (and for AVX and what stands on it, the operating system) has it.
struct CpuFlags {
    uint8_t mmx, extended3DNow, sse, sse2, sse3, ssse3, sse4a, sse41, sse42, aes;
    uint8_t avx, avx2, fma3, fma4, xop, f16c, popcnt, misalignedSSE, rdtscp, rdrand;
};

/// What CPUID and XGETBV say; registers that cannot be asked are 0.
struct CpuidReport {
    uint32_t leaf1ECX, leaf1EDX;
    uint32_t leaf7EBX;
    uint32_t extendedECX, extendedEDX; ///< Leaf 0x80000001.
    uint32_t xcr0;
};

CpuFlags FlagsOf(const CpuidReport& report);

/// The record of this processor: the same flags in three runs, of which the colour spaces read the third.
struct CpuFeatures {
    CpuFlags runs[3];

    /// Asks the processor at the first call.
    static const CpuFeatures& Instance();

    static const CpuFlags& Flags() { return Instance().runs[2]; }
};

} // namespace PK
