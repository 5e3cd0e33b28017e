#pragma once

// The vector types of 256 bits, and what AVX alone can do with them: everything but the arithmetic of integers.

#include <cstdint>
#include <cstring>
#include <immintrin.h>

/// Before a loop over groups: the formula of a group is compiled into it, however long.
#define PK_FLATTEN [[gnu::flatten]]

namespace PK::PK_TARGET {

inline constexpr int kLanes = 8;

struct F32 {
    __m256 v;
};

struct I32 {
    __m256i v;
};

inline F32 Floats(float x) {
    return {_mm256_set1_ps(x)};
}
inline F32 PixelFloats(float c0, float c1, float c2, float c3) {
    return {_mm256_setr_ps(c0, c1, c2, c3, c0, c1, c2, c3)};
}
inline I32 Ints(int32_t x) {
    return {_mm256_set1_epi32(x)};
}
inline I32 PixelInts(int32_t c0, int32_t c1, int32_t c2, int32_t c3) {
    return {_mm256_setr_epi32(c0, c1, c2, c3, c0, c1, c2, c3)};
}

inline F32 LoadFloats(const void* source) {
    return {_mm256_loadu_ps(static_cast<const float*>(source))};
}
inline I32 LoadInts(const void* source) {
    return {_mm256_loadu_si256(static_cast<const __m256i*>(source))};
}
inline void Store(void* destination, F32 x) {
    _mm256_storeu_ps(static_cast<float*>(destination), x.v);
}
inline void Store(void* destination, I32 x) {
    _mm256_storeu_si256(static_cast<__m256i*>(destination), x.v);
}

inline F32 operator+(F32 a, F32 b) {
    return {_mm256_add_ps(a.v, b.v)};
}
inline F32 operator-(F32 a, F32 b) {
    return {_mm256_sub_ps(a.v, b.v)};
}
inline F32 operator*(F32 a, F32 b) {
    return {_mm256_mul_ps(a.v, b.v)};
}
inline F32 operator/(F32 a, F32 b) {
    return {_mm256_div_ps(a.v, b.v)};
}
inline F32 Min(F32 a, F32 b) {
    return {_mm256_min_ps(a.v, b.v)};
}
inline F32 Max(F32 a, F32 b) {
    return {_mm256_max_ps(a.v, b.v)};
}
inline F32 SquareRoot(F32 a) {
    return {_mm256_sqrt_ps(a.v)};
}
inline F32 ReciprocalEstimate(F32 a) {
    return {_mm256_rcp_ps(a.v)};
}

inline I32 Less(F32 a, F32 b) {
    return {_mm256_castps_si256(_mm256_cmp_ps(a.v, b.v, _CMP_LT_OS))};
}
inline I32 NotGreater(F32 a, F32 b) {
    return {_mm256_castps_si256(_mm256_cmp_ps(a.v, b.v, _CMP_LE_OS))};
}

inline I32 Bits(F32 a) {
    return {_mm256_castps_si256(a.v)};
}
inline F32 FromBits(I32 a) {
    return {_mm256_castsi256_ps(a.v)};
}
inline F32 ToFloat(I32 a) {
    return {_mm256_cvtepi32_ps(a.v)};
}
inline I32 Nearest(F32 a) {
    return {_mm256_cvtps_epi32(a.v)};
}
inline I32 Truncate(F32 a) {
    return {_mm256_cvttps_epi32(a.v)};
}

template <int kFirst, int kSecond, int kThird, int kFourth>
inline F32 ShufflePixel(F32 a) {
    return {_mm256_shuffle_ps(a.v, a.v, _MM_SHUFFLE(kFourth, kThird, kSecond, kFirst))};
}

/// Turns four interleaved pixels, one a vector, into four channels of four pixels, and back, in each half.
inline void TransposePixels(F32& a, F32& b, F32& c, F32& d) {
    const __m256 ab01 = _mm256_unpacklo_ps(a.v, b.v), ab23 = _mm256_unpackhi_ps(a.v, b.v);
    const __m256 cd01 = _mm256_unpacklo_ps(c.v, d.v), cd23 = _mm256_unpackhi_ps(c.v, d.v);
    a.v = _mm256_shuffle_ps(ab01, cd01, _MM_SHUFFLE(1, 0, 1, 0));
    b.v = _mm256_shuffle_ps(ab01, cd01, _MM_SHUFFLE(3, 2, 3, 2));
    c.v = _mm256_shuffle_ps(ab23, cd23, _MM_SHUFFLE(1, 0, 1, 0));
    d.v = _mm256_shuffle_ps(ab23, cd23, _MM_SHUFFLE(3, 2, 3, 2));
}

/// The lower halves of both vectors, those of a first, and the upper halves.
inline void PairHalves(F32 a, F32 b, F32& lower, F32& upper) {
    lower = {_mm256_insertf128_ps(a.v, _mm256_castps256_ps128(b.v), 1)};
    upper = {_mm256_permute2f128_ps(a.v, b.v, 0x31)};
}

/// Pixel i in the lower half and pixel i + 4 in the upper, so that the transposed lanes come out in order.
inline F32 LoadPixelAndFourth(const float* pixel) {
    return {_mm256_insertf128_ps(_mm256_castps128_ps256(_mm_loadu_ps(pixel)), _mm_loadu_ps(pixel + 16), 1)};
}
inline void StorePixelAndFourth(float* pixel, F32 a) {
    _mm_storeu_ps(pixel, _mm256_castps256_ps128(a.v));
    _mm_storeu_ps(pixel + 16, _mm256_extractf128_ps(a.v, 1));
}

/// Four float vectors of kLanes interleaved pixels to one vector a channel.
inline void LoadFloatChannels(const void* source, F32& c0, F32& c1, F32& c2, F32& c3) {
    const auto* pixels = static_cast<const float*>(source);
    c0 = LoadPixelAndFourth(pixels);
    c1 = LoadPixelAndFourth(pixels + 4);
    c2 = LoadPixelAndFourth(pixels + 8);
    c3 = LoadPixelAndFourth(pixels + 12);
    TransposePixels(c0, c1, c2, c3);
}
inline void StoreFloatChannels(void* destination, F32 c0, F32 c1, F32 c2, F32 c3) {
    auto* pixels = static_cast<float*>(destination);
    TransposePixels(c0, c1, c2, c3);
    StorePixelAndFourth(pixels, c0);
    StorePixelAndFourth(pixels + 4, c1);
    StorePixelAndFourth(pixels + 8, c2);
    StorePixelAndFourth(pixels + 12, c3);
}

/// Two registers, so that there is a double for each float lane: `low` for the first half of the lanes.
struct F64 {
    __m256d low, high;
};

struct I64 {
    __m256i low, high;
};

inline F64 Doubles(double x) {
    return {_mm256_set1_pd(x), _mm256_set1_pd(x)};
}
inline I64 Longs(int64_t x) {
    return {_mm256_set1_epi64x(x), _mm256_set1_epi64x(x)};
}
inline F64 operator+(F64 a, F64 b) {
    return {_mm256_add_pd(a.low, b.low), _mm256_add_pd(a.high, b.high)};
}
inline F64 operator-(F64 a, F64 b) {
    return {_mm256_sub_pd(a.low, b.low), _mm256_sub_pd(a.high, b.high)};
}
inline F64 operator*(F64 a, F64 b) {
    return {_mm256_mul_pd(a.low, b.low), _mm256_mul_pd(a.high, b.high)};
}
inline F64 operator/(F64 a, F64 b) {
    return {_mm256_div_pd(a.low, b.low), _mm256_div_pd(a.high, b.high)};
}
inline F64 Min(F64 a, F64 b) {
    return {_mm256_min_pd(a.low, b.low), _mm256_min_pd(a.high, b.high)};
}
inline F64 Max(F64 a, F64 b) {
    return {_mm256_max_pd(a.low, b.low), _mm256_max_pd(a.high, b.high)};
}
inline I64 Bits(F64 a) {
    return {_mm256_castpd_si256(a.low), _mm256_castpd_si256(a.high)};
}
inline F64 FromBits(I64 a) {
    return {_mm256_castsi256_pd(a.low), _mm256_castsi256_pd(a.high)};
}
inline F64 ToDouble(F32 a) {
    return {_mm256_cvtps_pd(_mm256_castps256_ps128(a.v)), _mm256_cvtps_pd(_mm256_extractf128_ps(a.v, 1))};
}
inline F32 ToFloat(F64 a) {
    return {_mm256_set_m128(_mm256_cvtpd_ps(a.high), _mm256_cvtpd_ps(a.low))};
}
inline I32 Truncate(F64 a) {
    return {_mm256_set_m128i(_mm256_cvttpd_epi32(a.high), _mm256_cvttpd_epi32(a.low))};
}

/// Whether the highest bit of any lane is set.
inline bool AnyNegative(I32 a) {
    return _mm256_movemask_ps(_mm256_castsi256_ps(a.v)) != 0;
}

} // namespace PK::PK_TARGET
