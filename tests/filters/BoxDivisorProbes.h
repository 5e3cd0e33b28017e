#pragma once

// Kernels for the test of the quotients of the box blur.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PKTest {

struct BoxDivisorProbes {
    /// Divides \p count numerators, a multiple of 16.
    using Divide = void (*)(const int32_t* numerators, int32_t* quotients, int64_t count, int64_t divisor);

    Divide small; ///< for divisors up to largestSmall
    Divide large; ///< for any
    int64_t largestSmall;

    static constexpr PK::Offer kOffer = PK::Offer::flags;
    template <PK::Target>
    static const BoxDivisorProbes& For(); // BoxDivisorProbes.kernels.cpp
};

} // namespace PKTest
