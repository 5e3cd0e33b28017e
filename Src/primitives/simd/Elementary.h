#pragma once

// Powers with an exponent of its own in each lane, the exponential, and the truncating division of integers.
//
// Pow and Exp work in double as Power does and are rounded once, to float, by the current rounding mode:
// the error is below 0.501 units in the last place in rounding to nearest and 1.001 otherwise. A result that
// is not a number is the quiet NaN 0x7fc00000 in all targets. In a mode that flushes denormal numbers, denormal
// results are 0.
//
// Like those of Power.h, they take several vectors at once, which fills the waits of one with the others.

#include "primitives/simd/Power.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

inline F32 NotANumber() {
    return FromBits(Ints(0x7fc00000));
}

inline I32 IsFinite(F32 x) {
    const float infinity = __builtin_inff();
    return Less(Floats(-infinity), x) & Less(x, Floats(infinity));
}

inline I32 AreEqual(F32 a, F32 b) {
    return NotGreater(a, b) & NotGreater(b, a);
}

/// 2^exponent, rounded to float. 2^200 and 2^-200 are beyond all floats.
template <int kCount>
inline void Exp2ToFloat(F64 (&exponent)[kCount], F32 (&result)[kCount]) {
    for (int i = 0; i < kCount; ++i) exponent[i] = Max(Doubles(-200), Min(Doubles(200), exponent[i]));
    Exp2(exponent);
    for (int i = 0; i < kCount; ++i) result[i] = ToFloat(exponent[i]);
}

/// x^y for x >= 0, in place of x. 1^y and x^0 are 1 for every y and x, NaN included; 0 (of either sign) and
/// infinities give the limits; NaN otherwise, and for every x < 0, gives NaN.
template <int kCount>
inline void Pow(F32 (&x)[kCount], const F32 (&y)[kCount]) {
    const F32 zero = Floats(0), one = Floats(1), infinity = Floats(__builtin_inff());
    F64 power[kCount];
    F32 ordinary[kCount];
    for (int i = 0; i < kCount; ++i) power[i] = ToDouble(x[i]);
    Log2(power);
    for (int i = 0; i < kCount; ++i) power[i] = ToDouble(y[i]) * power[i];
    Exp2ToFloat(power, ordinary);
    for (int i = 0; i < kCount; ++i) {
        const I32 isOrdinary = Less(zero, x[i]) & IsFinite(x[i]) & IsFinite(y[i]);
        const F32 limit = Max(y[i] * Select(Less(x[i], one), zero - infinity, infinity), zero);
        const I32 isNumber = NotGreater(zero, x[i]) & NotGreater(y[i], y[i]);
        const F32 result = Select(isNumber, Select(isOrdinary, ordinary[i], limit), NotANumber());
        x[i] = Select(AreEqual(x[i], one) | AreEqual(y[i], zero), one, result);
    }
}

/// e^x, in place: 0 and infinity for the infinities, NaN for NaN.
template <int kCount>
inline void Exp(F32 (&x)[kCount]) {
    constexpr double kLog2E = 0x1.71547652b82fep+0; // 1 / ln 2
    F64 exponent[kCount];
    F32 ordinary[kCount];
    for (int i = 0; i < kCount; ++i) exponent[i] = ToDouble(x[i]) * Doubles(kLog2E);
    Exp2ToFloat(exponent, ordinary);
    for (int i = 0; i < kCount; ++i) {
        const F32 result = Select(IsFinite(x[i]), ordinary[i], Max(x[i], Floats(0)));
        x[i] = Select(NotGreater(x[i], x[i]), result, NotANumber());
    }
}

/// dividend / divisor, truncated. Where 32 bits have no such number, which is for a divisor of 0 and for
/// INT32_MIN / -1, INT32_MIN. A double has bits enough: a quotient that is no integer is at least
/// 1 / |divisor| away from one, and the rounding moves it by less than 2^-21 / |divisor|.
inline I32 Divide(I32 dividend, I32 divisor) {
    return Truncate(ToDouble(dividend) / ToDouble(divisor));
}

} // namespace PK::PK_TARGET
