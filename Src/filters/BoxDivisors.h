#pragma once

// Whole quotients of the sums of a box by what is in its window, as products with an inverse in float. They are those
// of integers in every rounding mode.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// Divisors up to 7900. The inverse is so much too large that no rounding, in whatever mode, takes a product below the
/// true quotient, by at most 2.07 x 2^-22 of it in all: less than 1/divisor, as long as the numerator is at most
/// 255 x 7900 + 128. So no product reaches the next whole number.
class SmallDivisor {
public:
    static constexpr int64_t kLargest = 7900;

    explicit SmallDivisor(int64_t divisor)
        : fInverse(Floats(static_cast<float>((1.0 + 0x1.1p-22) / static_cast<double>(divisor)))) {}

    I32 Quotient(I32 numerator) const { return Truncate(ToFloat(numerator) * fInverse); }

private:
    F32 fInverse;
};

/// Any divisor. The inverse is so much too small that the first quotient is the true one or 1 less, which the
/// remainder tells.
class LargeDivisor {
public:
    explicit LargeDivisor(int64_t divisor)
        : fInverse(Floats(static_cast<float>((1.0 - 0x1p-20) / static_cast<double>(divisor)))),
          fDivisor(Ints(static_cast<int32_t>(divisor))), fGreatest(Ints(static_cast<int32_t>(divisor - 1))) {}

    I32 Quotient(I32 numerator) const {
        const I32 quotient = Truncate(ToFloat(numerator) * fInverse);
        const I32 remainder = numerator - quotient * fDivisor;
        return quotient - ShiftRightSigned<31>(fGreatest - remainder);
    }

private:
    F32 fInverse;
    I32 fDivisor;
    I32 fGreatest;
};

} // namespace PK::PK_TARGET
