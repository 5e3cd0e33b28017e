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

} // namespace PK
