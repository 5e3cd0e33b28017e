#pragma once

// The floating-point mode of heavy operations: denormal results become zero and the precision bit stands. All
// else, the rounding mode above all, stays as the caller has it.

#include <cstdint>
#include <xmmintrin.h>

namespace PK {

/// Holds the mode for the calling thread until the end of the scope. Put it in the driver: the arithmetic
/// that relies on it belongs into functions that the driver calls, where the compiler cannot move it past the
/// switch.
class FloatMode {
public:
    FloatMode() noexcept : fSaved(_mm_getcsr()) { _mm_setcsr(fSaved | kFlushToZero | kPrecision); }

    ~FloatMode() {
        _mm_setcsr(fSaved);
        asm volatile("fnclex" ::: "memory"); // pending x87 exceptions
    }

    FloatMode(const FloatMode&) = delete;
    FloatMode& operator=(const FloatMode&) = delete;

private:
    static constexpr uint32_t kFlushToZero = 0x8000;
    static constexpr uint32_t kPrecision = 0x0020; // the sticky bit: exactly these two are the convention

    uint32_t fSaved;
};

/// The mode that a program begins with, for what is made once and must not depend on who needs it first. Nothing of it is
/// seen by the caller.
class InitialFloatMode {
public:
    InitialFloatMode() noexcept : fSaved(_mm_getcsr()) {
        constexpr uint32_t kInitial = 0x1f80; // rounding to nearest, all exceptions masked
        _mm_setcsr(kInitial);
    }
    ~InitialFloatMode() { _mm_setcsr(fSaved); }

    InitialFloatMode(const InitialFloatMode&) = delete;
    InitialFloatMode& operator=(const InitialFloatMode&) = delete;

private:
    uint32_t fSaved;
};

} // namespace PK
