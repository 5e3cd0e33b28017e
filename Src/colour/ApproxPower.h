#pragma once

// Fast powers and logarithms of floats, good to about 2^-11: exponent and mantissa are taken apart, and rational
// approximations stand on the processor's reciprocal estimate, unrefined. Like those of simd/Power.h, they take several
// vectors at once.

#include "primitives/simd/MultiplyAdd.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

inline F32 FromPattern(uint32_t bits) {
    return FromBits(Ints(static_cast<int32_t>(bits)));
}

/// 1 / a, by the estimate and one step of Newton's method.
inline F32 Reciprocal(F32 a) {
    const F32 r = ReciprocalEstimate(a);
    return MultiplyAdd(Floats(0) - a, r * r, r + r);
}

/// ln x = fraction x s + s + exponent x ln 2, for x >= 0; what is below the smallest normal float counts as that, and NaN
/// as 2^128 x 1.5.
struct LogarithmParts {
    F32 fraction, s, exponent;
};

inline LogarithmParts SplitLogarithm(F32 x) {
    constexpr int32_t kSmallestNormal = 0x00800000, kFraction = 0x007fffff, kOne = 0x3f800000;
    const I32 bits = Max(Bits(x), Ints(kSmallestNormal));
    const F32 exponent = ToFloat(ShiftRight<23>(bits) - Ints(127));
    const F32 mantissa = FromBits((bits & Ints(kFraction)) | Ints(kOne));
    const F32 z = (mantissa - Floats(1)) * ReciprocalEstimate(mantissa + Floats(1));
    const F32 s = z + z;
    const F32 w = s * s;
    const F32 numerator = MultiplyAdd(MultiplyAdd(FromPattern(0xbf4a21ef), w, FromPattern(0x418317e4)), w,
                                      FromPattern(0xc2804831)); // (-0.78958028 w + 16.386665) w - 64.141
    const F32 denominator = MultiplyAdd(MultiplyAdd(FromPattern(0xc20eb06a), w, FromPattern(0x439c0c01)), w,
                                        FromPattern(0xc4406c49)); // (-35.672279 w + 312.09378) w - 769.69196
    return {w * numerator * ReciprocalEstimate(denominator), s, exponent};
}

/// The natural logarithm, for x >= 0.
inline F32 ApproxLn(F32 x) {
    constexpr float kLn2 = 0.69314718f;
    const LogarithmParts parts = SplitLogarithm(x);
    return MultiplyAdd(parts.exponent, Floats(kLn2), MultiplyAdd(parts.fraction, parts.s, parts.s));
}

/// The binary logarithm, for x >= 0.
inline F32 ApproxLog2(F32 x) {
    const F32 kLog2E = FromPattern(0x3fb8aa3b);
    const LogarithmParts parts = SplitLogarithm(x);
    return MultiplyAdd(parts.fraction * parts.s, kLog2E, MultiplyAdd(parts.s, kLog2E, parts.exponent));
}

/// 2^y for -127.5 < y < 127.5.
inline F32 ApproxExp2(F32 y) {
    const F32 shifted = y + Floats(0.5f);
    // A comparison's mask is -1 where it holds.
    const I32 n = Truncate(shifted) + NotGreater(shifted, Floats(0));
    const F32 f = y - ToFloat(n);
    const F32 g = f * f;
    const F32 a = MultiplyAdd(MultiplyAdd(FromPattern(0x3cbd2e43), g, FromPattern(0x41a19dd5)), g,
                              FromPattern(0x44bd3d05)); // (0.023093348 g + 20.202066) g + 1513.9069
    const F32 b = MultiplyAdd(FromPattern(0x43692f28), g, FromPattern(0x458881b1)); // 233.1842 g + 4368.2114
    const F32 q = f * a;
    const F32 h = q * ReciprocalEstimate(b - q);
    const F32 power = FromBits(ShiftLeft<23>(n + Ints(127)));
    return (Floats(1) + (h + h)) * power;
}

/// x^exponent for x >= 0, in place; 0 where x is not above 0, for NaN too.
template <int kCount>
inline void ApproxPow(F32 (&x)[kCount], F32 exponent) {
    const F32 kMost = FromPattern(0x42feffff); // 127.49999
    F32 y[kCount];
    for (int i = 0; i < kCount; ++i) y[i] = Max(Min(ApproxLog2(x[i]) * exponent, kMost), Floats(0) - kMost);
    for (int i = 0; i < kCount; ++i) x[i] = FromBits(Bits(ApproxExp2(y[i])) & Less(Floats(0), x[i]));
}

} // namespace PK::PK_TARGET
