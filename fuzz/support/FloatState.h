#pragma once

// The floating-point state around a call.

#include "support/ByteStream.h"
#include "support/Check.h"

#include <cstdint>
#include <utility>
#include <xmmintrin.h>

namespace PKFuzz {

/// An MXCSR as a caller may have it: any rounding mode, denormals either way, sticky bits set or not, every
/// exception masked.
inline uint32_t DrawFloatState(ByteStream& stream) {
    constexpr uint32_t kMasks = 0x1f80;
    return kMasks | (stream.OneIn(3) ? stream.U32() & (0xe000 | 0x007f) : 0);
}

/// The exception flags, which are the caller's to clear. Set beforehand, they do not change where an operation leaves
/// them as its arithmetic sets them.
inline constexpr uint32_t kExceptionFlags = 0x3f;

/// Makes one call in a state, which the call must leave as it was.
template <class Function>
auto CallIn(uint32_t state, Function&& function) {
    struct Scope {
        explicit Scope(uint32_t given) : fGiven(given), fSaved(_mm_getcsr()) { _mm_setcsr(given); }
        ~Scope() {
            const uint32_t left = _mm_getcsr();
            _mm_setcsr(fSaved);
            Check(left == fGiven, "MXCSR is the same after the call");
        }
        uint32_t fGiven, fSaved;
    } const scope(state);
    return std::forward<Function>(function)();
}

} // namespace PKFuzz
