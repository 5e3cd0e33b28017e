#pragma once

// The vector types of 512 bits, for AVX-512 with its byte and word, double and quad word, and vector length
// extensions. Comparisons give masks in vectors, as for all targets; the compiler turns them into the mask
// registers where that is shorter.

#include <cstdint>
#include <cstring>
#ifndef __clang__ // g++'s own definitions leave operands uninitialised whose value does not matter, and it warns of that
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wuninitialized"
#pragma GCC diagnostic ignored "-Wmaybe-uninitialized"
#endif
#include <immintrin.h>
#ifndef __clang__
#pragma GCC diagnostic pop
#endif

/// Before a loop over groups: the formula of a group is compiled into it, however long.
#define PK_FLATTEN [[gnu::flatten]]

namespace PK::avx512 {

inline constexpr int kLanes = 16;
inline constexpr bool kHasByteShuffle = true;

struct F32 {
    __m512 v;
};

struct I32 {
    __m512i v;
};

inline F32 Floats(float x) {
    return {_mm512_set1_ps(x)};
}
inline F32 PixelFloats(float c0, float c1, float c2, float c3) {
    return {_mm512_broadcast_f32x4(_mm_setr_ps(c0, c1, c2, c3))};
}
inline I32 Ints(int32_t x) {
    return {_mm512_set1_epi32(x)};
}
inline I32 PixelInts(int32_t c0, int32_t c1, int32_t c2, int32_t c3) {
    return {_mm512_broadcast_i32x4(_mm_setr_epi32(c0, c1, c2, c3))};
}

inline F32 LoadFloats(const void* source) {
    return {_mm512_loadu_ps(source)};
}
inline I32 LoadInts(const void* source) {
    return {_mm512_loadu_si512(source)};
}
/// From a place aligned to the vector's size. Where the instruction set can, uncached memory is read by whole lines.
inline I32 LoadStreamed(const void* source) {
    return {_mm512_stream_load_si512(const_cast<void*>(source))};
}
inline void Store(void* destination, F32 x) {
    _mm512_storeu_ps(destination, x.v);
}
inline void Store(void* destination, I32 x) {
    _mm512_storeu_si512(destination, x.v);
}

inline F32 operator+(F32 a, F32 b) {
    return {_mm512_add_ps(a.v, b.v)};
}
inline F32 operator-(F32 a, F32 b) {
    return {_mm512_sub_ps(a.v, b.v)};
}
inline F32 operator*(F32 a, F32 b) {
    return {_mm512_mul_ps(a.v, b.v)};
}
inline F32 operator/(F32 a, F32 b) {
    return {_mm512_div_ps(a.v, b.v)};
}
inline F32 Min(F32 a, F32 b) {
    return {_mm512_min_ps(a.v, b.v)};
}
inline F32 Max(F32 a, F32 b) {
    return {_mm512_max_ps(a.v, b.v)};
}

inline __m256 LowerHalf(F32 a) {
    return _mm512_castps512_ps256(a.v);
}
inline __m256 UpperHalf(F32 a) {
    return _mm512_extractf32x8_ps(a.v, 1);
}
inline F32 JoinHalves(__m256 lower, __m256 upper) {
    return {_mm512_insertf32x8(_mm512_castps256_ps512(lower), upper, 1)};
}

/// The lower halves of both vectors, those of a first, and the upper halves.
inline void PairHalves(F32 a, F32 b, F32& lower, F32& upper) {
    lower = JoinHalves(LowerHalf(a), LowerHalf(b));
    upper = JoinHalves(UpperHalf(a), UpperHalf(b));
}

inline F32 SquareRoot(F32 a) {
    return {_mm512_sqrt_ps(a.v)};
}
/// In halves: the estimate of 512 bits is another, more precise one.
inline F32 ReciprocalEstimate(F32 a) {
    return JoinHalves(_mm256_rcp_ps(LowerHalf(a)), _mm256_rcp_ps(UpperHalf(a)));
}

inline I32 operator+(I32 a, I32 b) {
    return {_mm512_add_epi32(a.v, b.v)};
}
inline I32 operator-(I32 a, I32 b) {
    return {_mm512_sub_epi32(a.v, b.v)};
}
inline I32 operator&(I32 a, I32 b) {
    return {_mm512_and_si512(a.v, b.v)};
}
inline I32 operator|(I32 a, I32 b) {
    return {_mm512_or_si512(a.v, b.v)};
}
inline I32 operator^(I32 a, I32 b) {
    return {_mm512_xor_si512(a.v, b.v)};
}
inline I32 Not(I32 a) {
    return {_mm512_xor_si512(a.v, _mm512_set1_epi32(-1))};
}
template <int kBits>
inline I32 ShiftLeft(I32 a) {
    return {_mm512_slli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRight(I32 a) {
    return {_mm512_srli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRightSigned(I32 a) {
    return {_mm512_srai_epi32(a.v, kBits)};
}
inline I32 ShiftRightSigned(I32 a, int32_t bits) {
    return {_mm512_sra_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 ShiftLeft(I32 a, int32_t bits) {
    return {_mm512_sll_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 operator*(I32 a, I32 b) {
    return {_mm512_mullo_epi32(a.v, b.v)};
}
/// The low 16 bits of the product of each 16-bit half with its counterpart.
inline I32 MultiplyHalves(I32 a, I32 b) {
    return {_mm512_mullo_epi16(a.v, b.v)};
}

/// All bits set where the comparison holds.
inline I32 Equal(I32 a, I32 b) {
    return {_mm512_movm_epi32(_mm512_cmpeq_epi32_mask(a.v, b.v))};
}
inline I32 Less(F32 a, F32 b) {
    return {_mm512_movm_epi32(_mm512_cmp_ps_mask(a.v, b.v, _CMP_LT_OS))};
}
inline I32 NotGreater(F32 a, F32 b) {
    return {_mm512_movm_epi32(_mm512_cmp_ps_mask(a.v, b.v, _CMP_LE_OS))};
}

inline I32 Bits(F32 a) {
    return {_mm512_castps_si512(a.v)};
}
inline F32 FromBits(I32 a) {
    return {_mm512_castsi512_ps(a.v)};
}
inline I32 Select(I32 mask, I32 a, I32 b) {
    return {_mm512_ternarylogic_epi32(mask.v, a.v, b.v, 0xca)};
}
inline F32 Select(I32 mask, F32 a, F32 b) {
    return FromBits(Select(mask, Bits(a), Bits(b)));
}

inline I32 Min(I32 a, I32 b) {
    return {_mm512_min_epi32(a.v, b.v)};
}
inline I32 Max(I32 a, I32 b) {
    return {_mm512_max_epi32(a.v, b.v)};
}

inline F32 ToFloat(I32 a) {
    return {_mm512_cvtepi32_ps(a.v)};
}
inline I32 Nearest(F32 a) {
    return {_mm512_cvtps_epi32(a.v)};
}
inline I32 Truncate(F32 a) {
    return {_mm512_cvttps_epi32(a.v)};
}

/// table[index] in each lane.
inline F32 Lookup(const float* table, I32 index) {
    return {_mm512_i32gather_ps(index.v, table, 4)};
}
inline I32 Lookup(const uint32_t* table, I32 index) {
    return {_mm512_i32gather_epi32(index.v, table, 4)};
}

inline I32 LoadBytes(const void* source) {
    return {_mm512_cvtepu8_epi32(_mm_loadu_si128(static_cast<const __m128i*>(source)))};
}
inline I32 LoadWords(const void* source) {
    return {_mm512_cvtepu16_epi32(_mm256_loadu_si256(static_cast<const __m256i*>(source)))};
}
inline I32 LoadSignedWords(const void* source) {
    return {_mm512_cvtepi16_epi32(_mm256_loadu_si256(static_cast<const __m256i*>(source)))};
}
/// The low 16 bits of each lane, unsaturated.
inline void StoreWords(void* destination, I32 a) {
    _mm256_storeu_si256(static_cast<__m256i*>(destination), _mm512_cvtepi32_epi16(a.v));
}

template <int kFirst, int kSecond, int kThird, int kFourth>
inline F32 ShufflePixel(F32 a) {
    return {_mm512_permute_ps(a.v, _MM_SHUFFLE(kFourth, kThird, kSecond, kFirst))};
}
template <int kFirst, int kSecond, int kThird, int kFourth>
inline I32 ShufflePixel(I32 a) {
    return Bits(ShufflePixel<kFirst, kSecond, kThird, kFourth>(FromBits(a)));
}

/// The bytes of each block in another order.
inline I32 ShuffleBytes(I32 a, __m128i order) {
    return {_mm512_shuffle_epi8(a.v, _mm512_broadcast_i32x4(order))};
}
/// Reverses the four bytes of each lane.
inline I32 ReverseBytes(I32 a) {
    return ShuffleBytes(a, _mm_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12));
}

/// Turns four interleaved pixels, one a vector, into four channels of four pixels, and back, in each block.
inline void TransposePixels(F32& a, F32& b, F32& c, F32& d) {
    const __m512 ab01 = _mm512_unpacklo_ps(a.v, b.v), ab23 = _mm512_unpackhi_ps(a.v, b.v);
    const __m512 cd01 = _mm512_unpacklo_ps(c.v, d.v), cd23 = _mm512_unpackhi_ps(c.v, d.v);
    a.v = _mm512_shuffle_ps(ab01, cd01, _MM_SHUFFLE(1, 0, 1, 0));
    b.v = _mm512_shuffle_ps(ab01, cd01, _MM_SHUFFLE(3, 2, 3, 2));
    c.v = _mm512_shuffle_ps(ab23, cd23, _MM_SHUFFLE(1, 0, 1, 0));
    d.v = _mm512_shuffle_ps(ab23, cd23, _MM_SHUFFLE(3, 2, 3, 2));
}

/// Two channels of four pixels each from `a` and `b`, the first channel in the lower half.
template <int kChannel>
inline __m512 TwoChannels(__m512 a, __m512 b) {
    constexpr int k = kChannel;
    const __m512i order = _mm512_setr_epi32(k, k + 4, k + 8, k + 12, k + 16, k + 20, k + 24, k + 28, k + 1,
                                            k + 5, k + 9, k + 13, k + 17, k + 21, k + 25, k + 29);
    return _mm512_permutex2var_ps(a, order, b);
}

/// Four float vectors of kLanes interleaved pixels to one vector a channel.
inline void LoadFloatChannels(const void* source, F32& c0, F32& c1, F32& c2, F32& c3) {
    const auto* pixels = static_cast<const float*>(source);
    const __m512 a = _mm512_loadu_ps(pixels), b = _mm512_loadu_ps(pixels + 16);
    const __m512 c = _mm512_loadu_ps(pixels + 32), d = _mm512_loadu_ps(pixels + 48);
    const __m512 ab01 = TwoChannels<0>(a, b), ab23 = TwoChannels<2>(a, b);
    const __m512 cd01 = TwoChannels<0>(c, d), cd23 = TwoChannels<2>(c, d);
    c0.v = _mm512_shuffle_f32x4(ab01, cd01, _MM_SHUFFLE(1, 0, 1, 0));
    c1.v = _mm512_shuffle_f32x4(ab01, cd01, _MM_SHUFFLE(3, 2, 3, 2));
    c2.v = _mm512_shuffle_f32x4(ab23, cd23, _MM_SHUFFLE(1, 0, 1, 0));
    c3.v = _mm512_shuffle_f32x4(ab23, cd23, _MM_SHUFFLE(3, 2, 3, 2));
}

/// Four pixels from kPixel on, of the eight whose first two channels are in the halves of c01 and whose last
/// two are in those of c23.
template <int kPixel>
inline __m512 FourPixels(__m512 c01, __m512 c23) {
    constexpr int k = kPixel;
    const __m512i order = _mm512_setr_epi32(k, k + 8, k + 16, k + 24, k + 1, k + 9, k + 17, k + 25, k + 2,
                                            k + 10, k + 18, k + 26, k + 3, k + 11, k + 19, k + 27);
    return _mm512_permutex2var_ps(c01, order, c23);
}

inline void StoreFloatChannels(void* destination, F32 c0, F32 c1, F32 c2, F32 c3) {
    auto* pixels = static_cast<float*>(destination);
    const __m512 lower01 = _mm512_shuffle_f32x4(c0.v, c1.v, _MM_SHUFFLE(1, 0, 1, 0));
    const __m512 lower23 = _mm512_shuffle_f32x4(c2.v, c3.v, _MM_SHUFFLE(1, 0, 1, 0));
    const __m512 upper01 = _mm512_shuffle_f32x4(c0.v, c1.v, _MM_SHUFFLE(3, 2, 3, 2));
    const __m512 upper23 = _mm512_shuffle_f32x4(c2.v, c3.v, _MM_SHUFFLE(3, 2, 3, 2));
    _mm512_storeu_ps(pixels, FourPixels<0>(lower01, lower23));
    _mm512_storeu_ps(pixels + 16, FourPixels<4>(lower01, lower23));
    _mm512_storeu_ps(pixels + 32, FourPixels<0>(upper01, upper23));
    _mm512_storeu_ps(pixels + 48, FourPixels<4>(upper01, upper23));
}

/// Saturates each channel to a byte and interleaves them into kLanes four-byte pixels.
inline I32 PackByteChannels(I32 c0, I32 c1, I32 c2, I32 c3) {
    const __m512i planes =
        _mm512_packus_epi16(_mm512_packs_epi32(c0.v, c1.v), _mm512_packs_epi32(c2.v, c3.v));
    return ShuffleBytes({planes}, _mm_setr_epi8(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15));
}

/// The lanes of a and b at even places, a first, and those at odd places.
inline void SeparateLanes(I32 a, I32 b, I32& even, I32& odd) {
    const __m512i evens = _mm512_setr_epi32(0, 2, 4, 6, 8, 10, 12, 14, 16, 18, 20, 22, 24, 26, 28, 30);
    const __m512i odds = _mm512_setr_epi32(1, 3, 5, 7, 9, 11, 13, 15, 17, 19, 21, 23, 25, 27, 29, 31);
    even.v = _mm512_permutex2var_epi32(a.v, evens, b.v);
    odd.v = _mm512_permutex2var_epi32(a.v, odds, b.v);
}

/// The same of bytes: those of a and b at even places, a first, and those at odd places.
inline void SeparateBytes(I32 a, I32 b, I32& even, I32& odd) {
    const __m128i order = _mm_setr_epi8(0, 2, 4, 6, 8, 10, 12, 14, 1, 3, 5, 7, 9, 11, 13, 15);
    const I32 first = ShuffleBytes(a, order), second = ShuffleBytes(b, order);
    const __m512i evens = _mm512_setr_epi64(0, 2, 4, 6, 8, 10, 12, 14);
    const __m512i odds = _mm512_setr_epi64(1, 3, 5, 7, 9, 11, 13, 15);
    even.v = _mm512_permutex2var_epi64(first.v, evens, second.v);
    odd.v = _mm512_permutex2var_epi64(first.v, odds, second.v);
}

/// The lanes of `lanes` moved up by one, with the last lane of `before` in front.
inline I32 ShiftInLane(I32 before, I32 lanes) {
    return {_mm512_alignr_epi32(lanes.v, before.v, 15)};
}

/// The high 16 bits of the product of each 16-bit half with its counterpart, both without sign.
inline I32 MultiplyHalvesHigh(I32 a, I32 b) {
    return {_mm512_mulhi_epu16(a.v, b.v)};
}
/// The mean of each 16-bit half and its counterpart, both without sign, rounded up.
inline I32 AverageHalves(I32 a, I32 b) {
    return {_mm512_avg_epu16(a.v, b.v)};
}
/// The sum of each byte and its counterpart, at most 255.
inline I32 AddBytes(I32 a, I32 b) {
    return {_mm512_adds_epu8(a.v, b.v)};
}
/// The lesser of each 16-bit half and its counterpart; both are below 32768.
inline I32 MinHalves(I32 a, I32 b) {
    return {_mm512_min_epi16(a.v, b.v)};
}
/// The lesser and the greater of each byte and its counterpart, both without sign.
inline I32 MinBytes(I32 a, I32 b) {
    return {_mm512_min_epu8(a.v, b.v)};
}
inline I32 MaxBytes(I32 a, I32 b) {
    return {_mm512_max_epu8(a.v, b.v)};
}
/// In each block of 16 bytes, the bytes of `table` that the bytes of `places`, 0 to 15, point to.
inline I32 LookUpBytes(I32 table, I32 places) {
    return {_mm512_shuffle_epi8(table.v, places.v)};
}
/// Twice the products of unsigned bytes of `a` with signed bytes of `b`, in 16-bit halves in their order. They
/// must fit.
inline void DoubleByteProducts(I32 a, I32 b, I32& first, I32& second) {
    const __m512i order = _mm512_setr_epi64(0, 4, 1, 5, 2, 6, 3, 7);
    const __m512i x = _mm512_permutexvar_epi64(order, a.v), y = _mm512_permutexvar_epi64(order, b.v);
    first = {_mm512_maddubs_epi16(_mm512_unpacklo_epi8(x, x), _mm512_unpacklo_epi8(y, y))};
    second = {_mm512_maddubs_epi16(_mm512_unpackhi_epi8(x, x), _mm512_unpackhi_epi8(y, y))};
}
/// Swaps the two bytes of each 16-bit half.
inline I32 SwapBytes(I32 a) {
    return ShuffleBytes(a, _mm_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14));
}
/// Reverses the four 16-bit halves of each pair of lanes.
inline I32 ReverseHalves(I32 a) {
    return ShuffleBytes(a, _mm_setr_epi8(6, 7, 4, 5, 2, 3, 0, 1, 14, 15, 12, 13, 10, 11, 8, 9));
}
/// 2 x kLanes bytes, each to a 16-bit half.
inline I32 LoadBytesAsHalves(const void* source) {
    return {_mm512_cvtepu8_epi16(_mm256_loadu_si256(static_cast<const __m256i*>(source)))};
}

/// What packing two vectors leaves, a pair of lanes of one and a pair of the other in turns, to their order.
inline I32 InOrderOfPairs(__m512i packed) {
    return {_mm512_permutexvar_epi64(_mm512_setr_epi64(0, 2, 4, 6, 1, 3, 5, 7), packed)};
}
/// The 16-bit halves of two vectors to bytes in their order; the halves are below 32768 and saturate.
inline I32 PackHalves(I32 a, I32 b) {
    return InOrderOfPairs(_mm512_packus_epi16(a.v, b.v));
}
/// The lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanes(I32 a, I32 b, I32 c, I32 d) {
    const __m512i bytes = _mm512_packus_epi16(_mm512_packs_epi32(a.v, b.v), _mm512_packs_epi32(c.v, d.v));
    const __m512i order = _mm512_setr_epi32(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15);
    return {_mm512_permutexvar_epi32(order, bytes)};
}
/// The lanes of two vectors, each from 0 to 65535, to 16-bit halves in their order.
inline I32 PackLanesToHalves(I32 a, I32 b) {
    return InOrderOfPairs(_mm512_packus_epi32(a.v, b.v));
}
/// The lanes of two vectors to signed 16-bit halves in their order, saturated.
inline I32 PackSignedLanes(I32 a, I32 b) {
    return InOrderOfPairs(_mm512_packs_epi32(a.v, b.v));
}
/// Lanes for even and for odd places to 2 x kLanes interleaved lanes.
inline void StoreLanePairs(void* destination, I32 even, I32 odd) {
    const __m512i lower = _mm512_setr_epi32(0, 16, 1, 17, 2, 18, 3, 19, 4, 20, 5, 21, 6, 22, 7, 23);
    const __m512i upper = _mm512_setr_epi32(8, 24, 9, 25, 10, 26, 11, 27, 12, 28, 13, 29, 14, 30, 15, 31);
    auto* lanes = static_cast<int32_t*>(destination);
    Store(lanes, I32{_mm512_permutex2var_epi32(even.v, lower, odd.v)});
    Store(lanes + kLanes, I32{_mm512_permutex2var_epi32(even.v, upper, odd.v)});
}

/// Two registers, so that there is a double for each float lane: `low` for the first half of the lanes.
struct F64 {
    __m512d low, high;
};

struct I64 {
    __m512i low, high;
};

inline F64 Doubles(double x) {
    return {_mm512_set1_pd(x), _mm512_set1_pd(x)};
}
inline I64 Longs(int64_t x) {
    return {_mm512_set1_epi64(x), _mm512_set1_epi64(x)};
}
inline F64 operator+(F64 a, F64 b) {
    return {_mm512_add_pd(a.low, b.low), _mm512_add_pd(a.high, b.high)};
}
inline F64 operator-(F64 a, F64 b) {
    return {_mm512_sub_pd(a.low, b.low), _mm512_sub_pd(a.high, b.high)};
}
inline F64 operator*(F64 a, F64 b) {
    return {_mm512_mul_pd(a.low, b.low), _mm512_mul_pd(a.high, b.high)};
}
inline F64 operator/(F64 a, F64 b) {
    return {_mm512_div_pd(a.low, b.low), _mm512_div_pd(a.high, b.high)};
}
inline F64 Min(F64 a, F64 b) {
    return {_mm512_min_pd(a.low, b.low), _mm512_min_pd(a.high, b.high)};
}
inline F64 Max(F64 a, F64 b) {
    return {_mm512_max_pd(a.low, b.low), _mm512_max_pd(a.high, b.high)};
}
inline I64 operator+(I64 a, I64 b) {
    return {_mm512_add_epi64(a.low, b.low), _mm512_add_epi64(a.high, b.high)};
}
inline I64 operator&(I64 a, I64 b) {
    return {_mm512_and_si512(a.low, b.low), _mm512_and_si512(a.high, b.high)};
}
template <int kBits>
inline I64 ShiftLeft(I64 a) {
    return {_mm512_slli_epi64(a.low, kBits), _mm512_slli_epi64(a.high, kBits)};
}
template <int kBits>
inline I64 ShiftRight(I64 a) {
    return {_mm512_srli_epi64(a.low, kBits), _mm512_srli_epi64(a.high, kBits)};
}
inline I64 Bits(F64 a) {
    return {_mm512_castpd_si512(a.low), _mm512_castpd_si512(a.high)};
}
inline F64 FromBits(I64 a) {
    return {_mm512_castsi512_pd(a.low), _mm512_castsi512_pd(a.high)};
}
inline F64 ToDouble(F32 a) {
    return {_mm512_cvtps_pd(LowerHalf(a)), _mm512_cvtps_pd(UpperHalf(a))};
}
inline F32 ToFloat(F64 a) {
    return JoinHalves(_mm512_cvtpd_ps(a.low), _mm512_cvtpd_ps(a.high));
}
inline F64 ToDouble(I32 a) {
    return {_mm512_cvtepi32_pd(_mm512_castsi512_si256(a.v)),
            _mm512_cvtepi32_pd(_mm512_extracti32x8_epi32(a.v, 1))};
}
inline I32 Truncate(F64 a) {
    return {_mm512_inserti32x8(_mm512_castsi256_si512(_mm512_cvttpd_epi32(a.low)),
                               _mm512_cvttpd_epi32(a.high), 1)};
}

// Blocks of four lanes: the pieces of which a wider vector is made.

inline __m128 LoadBlock(const uint8_t* source) {
    return _mm_loadu_ps(reinterpret_cast<const float*>(source));
}
inline void StoreBlock(uint8_t* destination, __m128 block) {
    _mm_storeu_ps(reinterpret_cast<float*>(destination), block);
}
/// The block i is loaded from, or stored to, i x stride bytes further on.
inline F32 LoadFloatBlocks(const void* source, int64_t stride) {
    const auto* bytes = static_cast<const uint8_t*>(source);
    return JoinHalves(_mm256_set_m128(LoadBlock(bytes + stride), LoadBlock(bytes)),
                      _mm256_set_m128(LoadBlock(bytes + 3 * stride), LoadBlock(bytes + 2 * stride)));
}
inline void StoreFloatBlocks(void* destination, int64_t stride, F32 a) {
    auto* bytes = static_cast<uint8_t*>(destination);
    StoreBlock(bytes, _mm512_castps512_ps128(a.v));
    StoreBlock(bytes + stride, _mm512_extractf32x4_ps(a.v, 1));
    StoreBlock(bytes + 2 * stride, _mm512_extractf32x4_ps(a.v, 2));
    StoreBlock(bytes + 3 * stride, _mm512_extractf32x4_ps(a.v, 3));
}

/// The blocks of two or three vectors in turns.
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b) {
    const __m512i lower = _mm512_setr_epi64(0, 1, 8, 9, 2, 3, 10, 11);
    const __m512i upper = _mm512_setr_epi64(4, 5, 12, 13, 6, 7, 14, 15);
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, I32{_mm512_permutex2var_epi64(a.v, lower, b.v)});
    Store(bytes + sizeof a, I32{_mm512_permutex2var_epi64(a.v, upper, b.v)});
}
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b, I32 c) {
    auto* bytes = static_cast<uint8_t*>(destination);
    const __m512i ab0 = _mm512_setr_epi64(0, 1, 8, 9, 0, 0, 2, 3);     // a0 b0 -- a1
    const __m512i ab1 = _mm512_setr_epi64(10, 11, 0, 0, 4, 5, 12, 13); // b1 -- a2 b2
    const __m512i ab2 = _mm512_setr_epi64(0, 0, 6, 7, 14, 15, 0, 0);   // -- a3 b3 --
    const __m512i c0 = _mm512_setr_epi64(0, 0, 0, 0, 0, 1, 0, 0);      // what the others leave out
    const __m512i c1 = _mm512_setr_epi64(0, 0, 2, 3, 0, 0, 0, 0);
    const __m512i c2 = _mm512_setr_epi64(4, 5, 0, 0, 0, 0, 6, 7);
    const __m512i first = _mm512_permutex2var_epi64(a.v, ab0, b.v);
    const __m512i second = _mm512_permutex2var_epi64(a.v, ab1, b.v);
    const __m512i third = _mm512_permutex2var_epi64(a.v, ab2, b.v);
    Store(bytes, I32{_mm512_mask_permutexvar_epi64(first, 0x30, c0, c.v)});
    Store(bytes + sizeof a, I32{_mm512_mask_permutexvar_epi64(second, 0x0c, c1, c.v)});
    Store(bytes + 2 * sizeof a, I32{_mm512_mask_permutexvar_epi64(third, 0xc3, c2, c.v)});
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b));
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b, F32 c) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b), Bits(c));
}

/// In each block: a0 b0 a1 b1 and a2 b2 a3 b3.
inline void InterleaveInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm512_unpacklo_epi32(a.v, b.v)};
    high = {_mm512_unpackhi_epi32(a.v, b.v)};
}

/// The same with 16-bit halves: a0 b0 to a3 b3 and a4 b4 to a7 b7.
inline void InterleaveHalvesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm512_unpacklo_epi16(a.v, b.v)};
    high = {_mm512_unpackhi_epi16(a.v, b.v)};
}
/// The same with bytes: a0 b0 to a7 b7 and a8 b8 to a15 b15.
inline void InterleaveBytesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm512_unpacklo_epi8(a.v, b.v)};
    high = {_mm512_unpackhi_epi8(a.v, b.v)};
}
/// In each block: the lanes of a and then those of b, saturated to signed 16-bit halves.
inline I32 PackSignedInBlocks(I32 a, I32 b) {
    return {_mm512_packs_epi32(a.v, b.v)};
}

/// Three lanes a block, which stand in memory without a gap; loading leaves the fourth 0.
inline I32 LoadThrees(const void* source) {
    const __m512i lanes = _mm512_maskz_loadu_epi32(0x0fff, source);
    const __m512i order = _mm512_setr_epi32(0, 1, 2, 0, 3, 4, 5, 0, 6, 7, 8, 0, 9, 10, 11, 0);
    return {_mm512_maskz_permutexvar_epi32(0x7777, order, lanes)};
}
inline void StoreThrees(void* destination, I32 a) {
    const __m512i order = _mm512_setr_epi32(0, 1, 2, 4, 5, 6, 8, 9, 10, 12, 13, 14, 0, 0, 0, 0);
    const __m512i lanes = _mm512_permutexvar_epi32(order, a.v);
    auto* bytes = static_cast<uint8_t*>(destination);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(bytes), _mm512_castsi512_si256(lanes));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(bytes + 32), _mm512_extracti32x4_epi32(lanes, 2));
}
/// Six lanes a block: four of `low` and the first two of `high`.
inline void StoreSixes(void* destination, I32 low, I32 high) {
    const __m512i first = _mm512_setr_epi32(0, 1, 2, 3, 16, 17, 4, 5, 6, 7, 20, 21, 8, 9, 10, 11);
    const __m512i rest = _mm512_setr_epi32(24, 25, 12, 13, 14, 15, 28, 29, 0, 0, 0, 0, 0, 0, 0, 0);
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, I32{_mm512_permutex2var_epi32(low.v, first, high.v)});
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(bytes + 64),
                        _mm512_castsi512_si256(_mm512_permutex2var_epi32(low.v, rest, high.v)));
}
/// Groups of four 16-bit halves, one for each lane: two halves of `pair` and the lower half of `third`. The fourth of
/// each group is neither read nor written.
inline void StoreThreeOfFourHalves(void* destination, I32 pair, I32 third) {
    constexpr __mmask32 kWritten = 0x77777777;
    const __m512i lower = _mm512_setr_epi32(0, 16, 1, 17, 2, 18, 3, 19, 4, 20, 5, 21, 6, 22, 7, 23);
    const __m512i upper = _mm512_setr_epi32(8, 24, 9, 25, 10, 26, 11, 27, 12, 28, 13, 29, 14, 30, 15, 31);
    auto* bytes = static_cast<uint8_t*>(destination);
    _mm512_mask_storeu_epi16(bytes, kWritten, _mm512_permutex2var_epi32(pair.v, lower, third.v));
    _mm512_mask_storeu_epi16(bytes + 64, kWritten, _mm512_permutex2var_epi32(pair.v, upper, third.v));
}

/// The 16 bits that start at each of eight byte offsets in a block.
template <int k0, int k1, int k2, int k3, int k4, int k5, int k6, int k7>
inline I32 HalvesAt(I32 a) {
    return ShuffleBytes(a, _mm_setr_epi8(k0, k0 + 1, k1, k1 + 1, k2, k2 + 1, k3, k3 + 1, k4, k4 + 1, k5,
                                         k5 + 1, k6, k6 + 1, k7, k7 + 1));
}

/// In each lane, the sum of the products of its two signed 16-bit halves with their counterparts.
inline I32 MultiplyAddHalves(I32 a, I32 b) {
    return {_mm512_madd_epi16(a.v, b.v)};
}

/// In each block, the lanes of `a` whose bits are set in kMask, lane 0 the lowest, and the others of `b`.
template <int kMask>
inline F32 BlendBlocks(F32 a, F32 b) {
    return {_mm512_mask_blend_ps(kMask * 0x1111, b.v, a.v)};
}
template <int kMask>
inline I32 BlendBlocks(I32 a, I32 b) {
    return {_mm512_mask_blend_epi32(kMask * 0x1111, b.v, a.v)};
}

/// In each block: a0 a1 b0 b1 and a2 a3 b2 b3.
inline F32 LowPairs(F32 a, F32 b) {
    return {_mm512_shuffle_ps(a.v, b.v, _MM_SHUFFLE(1, 0, 1, 0))};
}
inline F32 HighPairs(F32 a, F32 b) {
    return {_mm512_shuffle_ps(a.v, b.v, _MM_SHUFFLE(3, 2, 3, 2))};
}

/// All lanes in the other order.
inline I32 ReverseLanes(I32 a) {
    const __m512i order = _mm512_setr_epi32(15, 14, 13, 12, 11, 10, 9, 8, 7, 6, 5, 4, 3, 2, 1, 0);
    return {_mm512_permutexvar_epi32(order, a.v)};
}

inline bool AnyNegative(I32 a) {
    return _mm512_movepi32_mask(a.v) != 0;
}

/// A bit for each byte, the lowest for the first: set where the byte is not 0.
inline uint64_t NonZeroBytes(I32 a) {
    return _mm512_test_epi8_mask(a.v, a.v);
}

/// Two four-byte pixels side by side for each block, from places of any alignment: block i has its first at
/// index[4 x i], in pixels. Their bytes go to lanes, a pixel a block.
inline void LoadPixelPairs(const uint8_t* pixels, const int32_t* index, I32& first, I32& second) {
    const auto twoPairs = [pixels](int64_t one, int64_t other) {
        const auto pair = [pixels](int64_t at) {
            return _mm_loadl_epi64(reinterpret_cast<const __m128i*>(pixels + 4 * at));
        };
        return _mm512_cvtepu8_epi32(_mm_unpacklo_epi64(pair(one), pair(other)));
    };
    const __m512i lower = twoPairs(index[0], index[4]), upper = twoPairs(index[8], index[12]);
    first.v = _mm512_shuffle_i32x4(lower, upper, _MM_SHUFFLE(2, 0, 2, 0));
    second.v = _mm512_shuffle_i32x4(lower, upper, _MM_SHUFFLE(3, 1, 3, 1));
}

/// In each block, the lanes of four vectors to bytes, saturated: those of a first.
inline I32 PackLanesInBlocks(I32 a, I32 b, I32 c, I32 d) {
    return {_mm512_packus_epi16(_mm512_packs_epi32(a.v, b.v), _mm512_packs_epi32(c.v, d.v))};
}

/// Two lanes side by side for each lane, from any places: lane i has its two at offsets[i], in bytes.
inline void LoadLanePairsAt(const uint8_t* base, const int64_t* offsets, I32& first, I32& second) {
    const auto blocks = [base, offsets](int i) {
        const auto pairs = [base, offsets](int lane) {
            const auto pair = [base](int64_t at) {
                return _mm_loadl_epi64(reinterpret_cast<const __m128i*>(base + at));
            };
            return _mm_unpacklo_epi64(pair(offsets[lane]), pair(offsets[lane + 1]));
        };
        return _mm512_inserti32x8(_mm512_castsi256_si512(_mm256_set_m128i(pairs(i + 4), pairs(i))),
                                  _mm256_set_m128i(pairs(i + 12), pairs(i + 8)), 1);
    };
    const __m512 outer = _mm512_castsi512_ps(blocks(0)), inner = _mm512_castsi512_ps(blocks(2));
    first.v = _mm512_castps_si512(_mm512_shuffle_ps(outer, inner, _MM_SHUFFLE(2, 0, 2, 0)));
    second.v = _mm512_castps_si512(_mm512_shuffle_ps(outer, inner, _MM_SHUFFLE(3, 1, 3, 1)));
}

/// Block i is loaded from offsets[4 x i], in bytes.
inline F32 LoadFloatBlocksAt(const uint8_t* base, const int64_t* offsets) {
    return JoinHalves(_mm256_set_m128(LoadBlock(base + offsets[4]), LoadBlock(base + offsets[0])),
                      _mm256_set_m128(LoadBlock(base + offsets[12]), LoadBlock(base + offsets[8])));
}

/// Of floats side by side, one for each block, in all its lanes.
inline F32 LoadOnePerBlock(const float* source) {
    const __m512i order = _mm512_setr_epi32(0, 0, 0, 0, 1, 1, 1, 1, 2, 2, 2, 2, 3, 3, 3, 3);
    return {_mm512_permutexvar_ps(order, _mm512_castps128_ps512(_mm_loadu_ps(source)))};
}

/// Blocks of floats side by side by their numbers.
[[gnu::always_inline]] inline F32 LoadBlocksOf(const float* blocks, const int32_t* index) {
    const auto block = [blocks, index](int i) { return _mm_loadu_ps(blocks + int64_t{4} * index[i]); };
    return JoinHalves(_mm256_set_m128(block(1), block(0)), _mm256_set_m128(block(3), block(2)));
}

/// The same of no more blocks than a vector has, with the lanes of the numbers: lane i of a block is 4 x number + i.
inline F32 LoadBlocksNear(const float* blocks, I32 lanes) {
    return {_mm512_permutexvar_ps(lanes.v, _mm512_loadu_ps(blocks))};
}
inline I32 LoadOneIntPerBlock(const int32_t* source) {
    return Bits(LoadOnePerBlock(reinterpret_cast<const float*>(source)));
}

/// The first kBlocks, and 0 behind them; a vector of no more is loaded whole.
template <int kBlocks>
inline F32 LoadFirstBlocks(const float* source) {
    return {_mm512_maskz_loadu_ps(static_cast<__mmask16>((1U << (4 * kBlocks)) - 1), source)};
}

/// For each block a vector, whose blocks it sums: the halves are added, and then their halves.
inline F32 SumsOfBlocks(const F32 (&vectors)[4]) {
    const auto halves = [&vectors](int i) {
        const __m512 a = vectors[i].v, b = vectors[i + 1].v;
        return _mm512_add_ps(_mm512_shuffle_f32x4(a, b, _MM_SHUFFLE(1, 0, 1, 0)),
                             _mm512_shuffle_f32x4(a, b, _MM_SHUFFLE(3, 2, 3, 2)));
    };
    const __m512 a = halves(0), b = halves(2);
    return {_mm512_add_ps(_mm512_shuffle_f32x4(a, b, _MM_SHUFFLE(2, 0, 2, 0)),
                          _mm512_shuffle_f32x4(a, b, _MM_SHUFFLE(3, 1, 3, 1)))};
}

} // namespace PK::avx512
