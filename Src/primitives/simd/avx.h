#pragma once

// The vector types of 256 bits for AVX without AVX2, which has no arithmetic of integers of that width: it is done in
// halves. Only the functions that the kernels on floats need are here.

#include "primitives/simd/vector256.h"

namespace PK::PK_TARGET {

template <class Operation>
inline __m256i InHalves(__m256i a, Operation operation) {
    return _mm256_set_m128i(operation(_mm256_extractf128_si256(a, 1)), operation(_mm256_castsi256_si128(a)));
}
template <class Operation>
inline __m256i InHalves(__m256i a, __m256i b, Operation operation) {
    return _mm256_set_m128i(operation(_mm256_extractf128_si256(a, 1), _mm256_extractf128_si256(b, 1)),
                            operation(_mm256_castsi256_si128(a), _mm256_castsi256_si128(b)));
}
inline __m256i And(__m256i a, __m256i b) {
    return _mm256_castps_si256(_mm256_and_ps(_mm256_castsi256_ps(a), _mm256_castsi256_ps(b)));
}

inline I32 operator+(I32 a, I32 b) {
    return {InHalves(a.v, b.v, [](__m128i x, __m128i y) { return _mm_add_epi32(x, y); })};
}
inline I32 operator-(I32 a, I32 b) {
    return {InHalves(a.v, b.v, [](__m128i x, __m128i y) { return _mm_sub_epi32(x, y); })};
}
inline I32 operator&(I32 a, I32 b) {
    return {And(a.v, b.v)};
}
inline I32 operator|(I32 a, I32 b) {
    return {_mm256_castps_si256(_mm256_or_ps(_mm256_castsi256_ps(a.v), _mm256_castsi256_ps(b.v)))};
}
inline I32 operator^(I32 a, I32 b) {
    return {_mm256_castps_si256(_mm256_xor_ps(_mm256_castsi256_ps(a.v), _mm256_castsi256_ps(b.v)))};
}
template <int kBits>
inline I32 ShiftLeft(I32 a) {
    return {InHalves(a.v, [](__m128i x) { return _mm_slli_epi32(x, kBits); })};
}
template <int kBits>
inline I32 ShiftRight(I32 a) {
    return {InHalves(a.v, [](__m128i x) { return _mm_srli_epi32(x, kBits); })};
}
template <int kBits>
inline I32 ShiftRightSigned(I32 a) {
    return {InHalves(a.v, [](__m128i x) { return _mm_srai_epi32(x, kBits); })};
}
inline I32 Max(I32 a, I32 b) {
    return {InHalves(a.v, b.v, [](__m128i x, __m128i y) { return _mm_max_epi32(x, y); })};
}

inline I32 Select(I32 mask, I32 a, I32 b) {
    return {_mm256_castps_si256(
        _mm256_blendv_ps(_mm256_castsi256_ps(b.v), _mm256_castsi256_ps(a.v), _mm256_castsi256_ps(mask.v)))};
}
inline F32 Select(I32 mask, F32 a, F32 b) {
    return FromBits(Select(mask, Bits(a), Bits(b)));
}

/// table[index] in each lane.
inline F32 Lookup(const float* table, I32 index) {
    int32_t at[kLanes];
    Store(at, index);
    return {_mm256_setr_ps(table[at[0]], table[at[1]], table[at[2]], table[at[3]], table[at[4]], table[at[5]],
                           table[at[6]], table[at[7]])};
}

inline I32 LoadBytes(const void* source) {
    const __m128i bytes = _mm_loadl_epi64(static_cast<const __m128i*>(source));
    return {_mm256_set_m128i(_mm_cvtepu8_epi32(_mm_srli_si128(bytes, 4)), _mm_cvtepu8_epi32(bytes))};
}

/// The lanes of a and b at even places, a first, and those at odd places.
inline void SeparateLanes(I32 a, I32 b, I32& even, I32& odd) {
    F32 lower, upper;
    PairHalves(FromBits(a), FromBits(b), lower, upper);
    even = Bits(F32{_mm256_shuffle_ps(lower.v, upper.v, _MM_SHUFFLE(2, 0, 2, 0))});
    odd = Bits(F32{_mm256_shuffle_ps(lower.v, upper.v, _MM_SHUFFLE(3, 1, 3, 1))});
}

inline I64 operator+(I64 a, I64 b) {
    const auto add = [](__m128i x, __m128i y) { return _mm_add_epi64(x, y); };
    return {InHalves(a.low, b.low, add), InHalves(a.high, b.high, add)};
}
inline I64 operator&(I64 a, I64 b) {
    return {And(a.low, b.low), And(a.high, b.high)};
}
template <int kBits>
inline I64 ShiftLeft(I64 a) {
    const auto shift = [](__m128i x) { return _mm_slli_epi64(x, kBits); };
    return {InHalves(a.low, shift), InHalves(a.high, shift)};
}
template <int kBits>
inline I64 ShiftRight(I64 a) {
    const auto shift = [](__m128i x) { return _mm_srli_epi64(x, kBits); };
    return {InHalves(a.low, shift), InHalves(a.high, shift)};
}

} // namespace PK::PK_TARGET
