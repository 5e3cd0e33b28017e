#pragma once

// A floating-point state for the length of a scope, and the check that calls leave it as it was.

#include <cstdint>
#include <xmmintrin.h>

namespace PKTest {

inline constexpr uint32_t kDefaultMXCSR = 0x1f80;
inline constexpr uint32_t kRoundDown = 0x2000, kRoundUp = 0x4000, kRoundToZero = 0x6000;
inline constexpr uint32_t kFlushToZero = 0x8000, kDenormalsAreZero = 0x0040;
inline constexpr uint32_t kExceptionFlags = 0x003f; // set beforehand, they stay as given

class FloatEnvironment {
public:
    /// \param bits  what is set beside the masks of all exceptions.
    explicit FloatEnvironment(uint32_t bits) : fSaved(_mm_getcsr()), fGiven(kDefaultMXCSR | bits) {
        _mm_setcsr(fGiven);
    }
    ~FloatEnvironment() { _mm_setcsr(fSaved); }
    FloatEnvironment(const FloatEnvironment&) = delete;
    FloatEnvironment& operator=(const FloatEnvironment&) = delete;

    bool IsAsGiven() const { return _mm_getcsr() == fGiven; }

private:
    uint32_t fSaved, fGiven;
};

} // namespace PKTest
