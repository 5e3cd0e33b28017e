#pragma once

// Powers and exponentials of float vectors, correct to a little more than half a unit in the last place.
//
// A float has 24 bits and a double 53, so the work runs in double and is rounded to float once, at the end:
// overflow, underflow and denormal results come out as IEEE rounding makes them. All targets run the same
// double operations in the same order and so give the same bits.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// coefficients[0] + coefficients[1] x + coefficients[2] x^2 and so on.
template <int kCount>
inline F64 Polynomial(F64 x, const double (&coefficients)[kCount]) {
    F64 sum = Doubles(coefficients[kCount - 1]);
    for (int i = kCount - 2; i >= 0; --i) sum = sum * x + Doubles(coefficients[i]);
    return sum;
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

/// The binary logarithm of a positive normal number; 0 and infinity give about -1023 and 1024.
inline F64 Log2(F64 x) {
    constexpr int64_t kOne = 0x3ff0000000000000;
    constexpr int64_t kRootHalf = 0x3fe6a09e667f3bcd; // sqrt(1/2), where mantissas begin
    constexpr int64_t kTwoTo52 = 0x4330000000000000;  // an integer added to these bits is added to 2^52
    constexpr int64_t kFraction = 0x000fffffffffffff;
    const I64 shifted = Bits(x) + Longs(kOne - kRootHalf);
    const F64 exponent = FromBits(ShiftRight<52>(shifted) + Longs(kTwoTo52)) - Doubles(0x1p52 + 1023);
    const F64 mantissa = FromBits((shifted & Longs(kFraction)) + Longs(kRootHalf));
    const F64 s = (mantissa - Doubles(1)) / (mantissa + Doubles(1));
    return exponent + s * Polynomial(s * s, kLog2Coefficients);
}

/// 2^x for |x| <= 1000.
inline F64 Exp2(F64 x) {
    const F64 shifter = Doubles(0x1.8p52); // adding it leaves the nearest integer in the low bits
    const F64 shifted = x + shifter;
    const F64 power = Polynomial(x - (shifted - shifter), kExp2Coefficients);
    return FromBits(Bits(power) + ShiftLeft<52>(Bits(shifted)));
}

/// x^exponent for x >= 0. The error is below 0.501 units in the last place. 0, infinity and NaN are returned
/// as they are, which is right for a positive exponent.
inline F32 Power(F32 x, F64 exponent) {
    const F64 logarithm = exponent * Log2(ToDouble(x));
    const F64 bounded = Max(Doubles(-200), Min(Doubles(200), logarithm)); // beyond all floats
    const I32 isOrdinary = Less(Floats(0), x) & Less(x, Floats(__builtin_inff()));
    return Select(isOrdinary, ToFloat(Exp2(bounded)), x + x);
}

/// sign(x) |x|^exponent, with a positive exponent.
inline F32 SignedPower(F32 x, F64 exponent) {
    const I32 sign = Bits(x) & Ints(INT32_MIN);
    return FromBits(Bits(Power(FromBits(Bits(x) ^ sign), exponent)) | sign);
}

} // namespace PK::PK_TARGET
