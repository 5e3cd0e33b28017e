#pragma once

// How MXCSR rounds until the end of the scope, with all exceptions masked and denormal numbers as they are.

#include <xmmintrin.h>

#include <cstdint>

namespace PKResults {

enum class RoundingMode : uint32_t { kNearest = 0x1f80, kDown = 0x3f80 };

class Rounding {
public:
    explicit Rounding(RoundingMode mode) : fSaved(_mm_getcsr()) { _mm_setcsr(static_cast<uint32_t>(mode)); }
    ~Rounding() { _mm_setcsr(fSaved); }
    Rounding(const Rounding&) = delete;
    Rounding& operator=(const Rounding&) = delete;

private:
    uint32_t fSaved;
};

} // namespace PKResults
