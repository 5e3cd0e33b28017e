#pragma once

// Powers and exponentials of float vectors, correct to a little more than half a unit in the last place.
//
// A float has 24 bits and a double 53, so the work runs in double and is rounded to float once, at the end:
// overflow, underflow and denormal results come out as IEEE rounding makes them. All targets run the same
// double operations in the same order and so give the same bits.
//
// The functions take several vectors at once: each is a chain of some forty steps that wait for each other,
// and a processor looks ahead far enough to fill the waits only if the steps of different chains stand close
// together. Three, the colour channels of a group of pixels, run at 1.4 times the rate of one after the
// other.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// coefficients[kFirst] + coefficients[kFirst + 1] x and so on, kCount terms; powers are x, x^2, x^4. Halves
/// are evaluated apart, which makes the chain of dependent operations as short as can be.
template <int kFirst, int kCount, int kTotal>
inline F64 PolynomialPart(const F64* powers, const double (&coefficients)[kTotal]) {
    if constexpr (kCount == 1) {
        return Doubles(coefficients[kFirst]);
    } else {
        constexpr int kLevel = kCount > 4 ? 2 : kCount > 2 ? 1 : 0;
        constexpr int kLow = 1 << kLevel;
        return PolynomialPart<kFirst, kLow>(powers, coefficients) +
               PolynomialPart<kFirst + kLow, kCount - kLow>(powers, coefficients) * powers[kLevel];
    }
}

/// coefficients[0] + coefficients[1] x + coefficients[2] x^2 and so on.
template <int kTerms>
inline F64 Polynomial(F64 x, const double (&coefficients)[kTerms]) {
    static_assert(kTerms <= 8);
    const F64 square = x * x;
    const F64 powers[] = {x, square, square * square};
    return PolynomialPart<0, kTerms>(powers, coefficients);
}

/// log2((1 + s) / (1 - s)) / s in powers of s^2, minimax for |s| <= (sqrt(2) - 1) / (sqrt(2) + 1): relative
/// error below 2.7e-14.
inline constexpr double kLog2Coefficients[] = {0x1.71547652b8251p+1, 0x1.ec709dc53c318p-1,
                                               0x1.2776c29380d1cp-1, 0x1.a61a2e9186581p-2,
                                               0x1.47955fcd9a096p-2, 0x1.21b059a45be7dp-2};

/// 2^f in powers of f, minimax for |f| <= 1/2 with 2^0 = 1: relative error below 4.7e-11.
inline constexpr double kExp2Coefficients[] = {1.0,
                                               0x1.62e42ff0e18f7p-1,
                                               0x1.ebfbe077872cep-3,
                                               0x1.c6b08ac06d6acp-5,
                                               0x1.3b29f39d478f2p-7,
                                               0x1.5d8a85fe35099p-10,
                                               0x1.445c84091a5ecp-13,
                                               0x1.fde5fe224f348p-17};

/// The binary logarithm of positive normal numbers, in place; 0 and infinity give about -1023 and 1024.
template <int kCount>
inline void Log2(F64 (&x)[kCount]) {
    constexpr int64_t kOne = 0x3ff0000000000000;
    constexpr int64_t kRootHalf = 0x3fe6a09e667f3bcd; // sqrt(1/2), where mantissas begin
    constexpr int64_t kTwoTo52 = 0x4330000000000000;  // an integer added to these bits is added to 2^52
    constexpr int64_t kFraction = 0x000fffffffffffff;
    F64 exponent[kCount], s[kCount], factor[kCount];
    for (int i = 0; i < kCount; ++i) {
        const I64 shifted = Bits(x[i]) + Longs(kOne - kRootHalf);
        exponent[i] = FromBits(ShiftRight<52>(shifted) + Longs(kTwoTo52)) - Doubles(0x1p52 + 1023);
        const F64 mantissa = FromBits((shifted & Longs(kFraction)) + Longs(kRootHalf));
        s[i] = (mantissa - Doubles(1)) / (mantissa + Doubles(1));
    }
    for (int i = 0; i < kCount; ++i) factor[i] = Polynomial(s[i] * s[i], kLog2Coefficients);
    for (int i = 0; i < kCount; ++i) x[i] = exponent[i] + s[i] * factor[i];
}

/// 2^x, in place, for |x| <= 1000.
template <int kCount>
inline void Exp2(F64 (&x)[kCount]) {
    // Adding this leaves x in fixed point with 26 bits behind the point; cutting those off rounds x to the
    // nearest integer under every rounding mode.
    constexpr double kShifter = 0x1.8p26;
    constexpr int64_t kInteger = -(int64_t{1} << 26);
    I64 shifted[kCount];
    for (int i = 0; i < kCount; ++i) {
        shifted[i] = Bits(x[i] + Doubles(kShifter + 0.5)) & Longs(kInteger);
        x[i] = x[i] - (FromBits(shifted[i]) - Doubles(kShifter));
    }
    for (int i = 0; i < kCount; ++i) x[i] = Polynomial(x[i], kExp2Coefficients);
    for (int i = 0; i < kCount; ++i) x[i] = FromBits(Bits(x[i]) + ShiftLeft<26>(shifted[i]));
}

/// x^exponent, in place, for x >= 0, with an error below 0.501 units in the last place (1.001 where the
/// rounding mode is not the nearest). 0, infinity and NaN stay as they are, which is right for positive
/// exponents.
template <int kCount>
inline void Power(F32 (&x)[kCount], F64 exponent) {
    F64 power[kCount];
    for (int i = 0; i < kCount; ++i) power[i] = ToDouble(x[i]);
    Log2(power);
    for (int i = 0; i < kCount; ++i) // 2^200 and 2^-200 are beyond all floats
        power[i] = Max(Doubles(-200), Min(Doubles(200), exponent * power[i]));
    Exp2(power);
    for (int i = 0; i < kCount; ++i) {
        const I32 isOrdinary = Less(Floats(0), x[i]) & Less(x[i], Floats(__builtin_inff()));
        x[i] = Select(isOrdinary, ToFloat(power[i]), x[i] + x[i]);
    }
}

/// sign(x) |x|^exponent, in place, with a positive exponent.
template <int kCount>
inline void SignedPower(F32 (&x)[kCount], F64 exponent) {
    I32 sign[kCount];
    for (int i = 0; i < kCount; ++i) {
        sign[i] = Bits(x[i]) & Ints(INT32_MIN);
        x[i] = FromBits(Bits(x[i]) ^ sign[i]);
    }
    Power(x, exponent);
    for (int i = 0; i < kCount; ++i) x[i] = FromBits(Bits(x[i]) | sign[i]);
}

} // namespace PK::PK_TARGET
