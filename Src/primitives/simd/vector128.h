#pragma once

// The vector types of 128 bits, for SSE2, SSSE3 and SSE4.1: the same text, with the shorter instruction
// sequences where the target has them.

#include "primitives/simd/Targets.h"

#include <cstdint>
#include <cstring>
#include <immintrin.h>

/// Before a loop over groups: the formula of a group is compiled into it, however long.
#define PK_FLATTEN [[gnu::flatten]]

namespace PK::PK_TARGET {

inline constexpr int kLanes = 4;
inline constexpr bool kHasByteShuffle = kTarget >= Target::ssse3;
inline constexpr bool kHasSSE41 = kTarget >= Target::sse41;

struct F32 {
    __m128 v;
};

struct I32 {
    __m128i v;
};

inline F32 Floats(float x) {
    return {_mm_set1_ps(x)};
}
inline F32 PixelFloats(float c0, float c1, float c2, float c3) {
    return {_mm_setr_ps(c0, c1, c2, c3)};
}
inline I32 Ints(int32_t x) {
    return {_mm_set1_epi32(x)};
}
inline I32 PixelInts(int32_t c0, int32_t c1, int32_t c2, int32_t c3) {
    return {_mm_setr_epi32(c0, c1, c2, c3)};
}

inline F32 LoadFloats(const void* source) {
    return {_mm_loadu_ps(static_cast<const float*>(source))};
}
inline I32 LoadInts(const void* source) {
    return {_mm_loadu_si128(static_cast<const __m128i*>(source))};
}
/// From a place aligned to the vector's size. Where the instruction set can, uncached memory is read by whole lines.
inline I32 LoadStreamed(const void* source) {
    if constexpr (kHasSSE41) {
        return {_mm_stream_load_si128(static_cast<__m128i*>(const_cast<void*>(source)))};
    } else {
        return LoadInts(source);
    }
}
inline void Store(void* destination, F32 x) {
    _mm_storeu_ps(static_cast<float*>(destination), x.v);
}
inline void Store(void* destination, I32 x) {
    _mm_storeu_si128(static_cast<__m128i*>(destination), x.v);
}

inline F32 operator+(F32 a, F32 b) {
    return {_mm_add_ps(a.v, b.v)};
}
inline F32 operator-(F32 a, F32 b) {
    return {_mm_sub_ps(a.v, b.v)};
}
inline F32 operator*(F32 a, F32 b) {
    return {_mm_mul_ps(a.v, b.v)};
}
inline F32 operator/(F32 a, F32 b) {
    return {_mm_div_ps(a.v, b.v)};
}
inline F32 Min(F32 a, F32 b) {
    return {_mm_min_ps(a.v, b.v)};
}
inline F32 Max(F32 a, F32 b) {
    return {_mm_max_ps(a.v, b.v)};
}
inline F32 SquareRoot(F32 a) {
    return {_mm_sqrt_ps(a.v)};
}
inline F32 ReciprocalEstimate(F32 a) {
    return {_mm_rcp_ps(a.v)};
}

inline I32 operator+(I32 a, I32 b) {
    return {_mm_add_epi32(a.v, b.v)};
}
inline I32 operator-(I32 a, I32 b) {
    return {_mm_sub_epi32(a.v, b.v)};
}
inline I32 operator&(I32 a, I32 b) {
    return {_mm_and_si128(a.v, b.v)};
}
inline I32 operator|(I32 a, I32 b) {
    return {_mm_or_si128(a.v, b.v)};
}
inline I32 operator^(I32 a, I32 b) {
    return {_mm_xor_si128(a.v, b.v)};
}
inline I32 Not(I32 a) {
    return {_mm_xor_si128(a.v, _mm_set1_epi32(-1))};
}
template <int kBits>
inline I32 ShiftLeft(I32 a) {
    return {_mm_slli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRight(I32 a) {
    return {_mm_srli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRightSigned(I32 a) {
    return {_mm_srai_epi32(a.v, kBits)};
}
inline I32 ShiftRightSigned(I32 a, int32_t bits) {
    return {_mm_sra_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 ShiftLeft(I32 a, int32_t bits) {
    return {_mm_sll_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 operator*(I32 a, I32 b) {
    if constexpr (kHasSSE41) {
        return {_mm_mullo_epi32(a.v, b.v)};
    } else {
        const __m128i even = _mm_mul_epu32(a.v, b.v);
        const __m128i odd = _mm_mul_epu32(_mm_srli_epi64(a.v, 32), _mm_srli_epi64(b.v, 32));
        return {_mm_unpacklo_epi32(_mm_shuffle_epi32(even, _MM_SHUFFLE(0, 0, 2, 0)),
                                   _mm_shuffle_epi32(odd, _MM_SHUFFLE(0, 0, 2, 0)))};
    }
}
/// The low 16 bits of the product of each 16-bit half with its counterpart.
inline I32 MultiplyHalves(I32 a, I32 b) {
    return {_mm_mullo_epi16(a.v, b.v)};
}

/// All bits set where the comparison holds.
inline I32 Equal(I32 a, I32 b) {
    return {_mm_cmpeq_epi32(a.v, b.v)};
}
inline I32 Less(F32 a, F32 b) {
    return {_mm_castps_si128(_mm_cmplt_ps(a.v, b.v))};
}
inline I32 NotGreater(F32 a, F32 b) {
    return {_mm_castps_si128(_mm_cmple_ps(a.v, b.v))};
}

inline I32 Bits(F32 a) {
    return {_mm_castps_si128(a.v)};
}
inline F32 FromBits(I32 a) {
    return {_mm_castsi128_ps(a.v)};
}
inline I32 Select(I32 mask, I32 a, I32 b) {
    return {_mm_or_si128(_mm_and_si128(mask.v, a.v), _mm_andnot_si128(mask.v, b.v))};
}
inline F32 Select(I32 mask, F32 a, F32 b) {
    return FromBits(Select(mask, Bits(a), Bits(b)));
}

inline I32 Min(I32 a, I32 b) {
    if constexpr (kHasSSE41) {
        return {_mm_min_epi32(a.v, b.v)};
    } else {
        return Select(I32{_mm_cmplt_epi32(a.v, b.v)}, a, b);
    }
}
inline I32 Max(I32 a, I32 b) {
    if constexpr (kHasSSE41) {
        return {_mm_max_epi32(a.v, b.v)};
    } else {
        return Select(I32{_mm_cmpgt_epi32(a.v, b.v)}, a, b);
    }
}

inline F32 ToFloat(I32 a) {
    return {_mm_cvtepi32_ps(a.v)};
}
inline I32 Nearest(F32 a) {
    return {_mm_cvtps_epi32(a.v)};
}
inline I32 Truncate(F32 a) {
    return {_mm_cvttps_epi32(a.v)};
}

/// table[index] in each lane.
inline F32 Lookup(const float* table, I32 index) {
    int32_t i[kLanes];
    Store(i, index);
    return {_mm_setr_ps(table[i[0]], table[i[1]], table[i[2]], table[i[3]])};
}
inline I32 Lookup(const uint32_t* table, I32 index) {
    uint32_t i[kLanes];
    Store(i, index);
    return PixelInts(static_cast<int32_t>(table[i[0]]), static_cast<int32_t>(table[i[1]]),
                     static_cast<int32_t>(table[i[2]]), static_cast<int32_t>(table[i[3]]));
}

inline I32 LoadBytes(const void* source) {
    int32_t bytes;
    std::memcpy(&bytes, source, sizeof bytes);
    const __m128i zero = _mm_setzero_si128();
    return {_mm_unpacklo_epi16(_mm_unpacklo_epi8(_mm_cvtsi32_si128(bytes), zero), zero)};
}
inline I32 LoadWords(const void* source) {
    return {_mm_unpacklo_epi16(_mm_loadl_epi64(static_cast<const __m128i*>(source)), _mm_setzero_si128())};
}
inline I32 LoadSignedWords(const void* source) {
    const __m128i words = _mm_loadl_epi64(static_cast<const __m128i*>(source));
    return {_mm_srai_epi32(_mm_unpacklo_epi16(words, words), 16)};
}
/// The low 16 bits of each lane, unsaturated.
inline void StoreWords(void* destination, I32 a) {
    // Sign-extending the low half first makes the saturating pack exact.
    const __m128i low = _mm_srai_epi32(_mm_slli_epi32(a.v, 16), 16);
    _mm_storel_epi64(static_cast<__m128i*>(destination), _mm_packs_epi32(low, low));
}

template <int kFirst, int kSecond, int kThird, int kFourth>
inline I32 ShufflePixel(I32 a) {
    return {_mm_shuffle_epi32(a.v, _MM_SHUFFLE(kFourth, kThird, kSecond, kFirst))};
}
template <int kFirst, int kSecond, int kThird, int kFourth>
inline F32 ShufflePixel(F32 a) {
    return {_mm_shuffle_ps(a.v, a.v, _MM_SHUFFLE(kFourth, kThird, kSecond, kFirst))};
}

/// Reverses the four bytes of each lane.
inline I32 ReverseBytes(I32 a) {
    if constexpr (kHasByteShuffle) {
        return {_mm_shuffle_epi8(a.v, _mm_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12))};
    } else {
        const __m128i swapped = _mm_or_si128(_mm_slli_epi16(a.v, 8), _mm_srli_epi16(a.v, 8));
        return {_mm_or_si128(_mm_slli_epi32(swapped, 16), _mm_srli_epi32(swapped, 16))};
    }
}

/// Turns four interleaved pixels, one a vector, into four channels of four pixels, and back.
inline void TransposePixels(F32& a, F32& b, F32& c, F32& d) {
    _MM_TRANSPOSE4_PS(a.v, b.v, c.v, d.v);
}

/// The lower halves of both vectors, those of a first, and the upper halves.
inline void PairHalves(F32 a, F32 b, F32& lower, F32& upper) {
    lower = {_mm_movelh_ps(a.v, b.v)};
    upper = {_mm_movehl_ps(b.v, a.v)};
}

/// Four float vectors of kLanes interleaved pixels to one vector a channel.
inline void LoadFloatChannels(const void* source, F32& c0, F32& c1, F32& c2, F32& c3) {
    const auto* pixels = static_cast<const float*>(source);
    c0 = LoadFloats(pixels);
    c1 = LoadFloats(pixels + 4);
    c2 = LoadFloats(pixels + 8);
    c3 = LoadFloats(pixels + 12);
    TransposePixels(c0, c1, c2, c3);
}
inline void StoreFloatChannels(void* destination, F32 c0, F32 c1, F32 c2, F32 c3) {
    auto* pixels = static_cast<float*>(destination);
    TransposePixels(c0, c1, c2, c3);
    Store(pixels, c0);
    Store(pixels + 4, c1);
    Store(pixels + 8, c2);
    Store(pixels + 12, c3);
}

/// Saturates each channel to a byte and interleaves them into kLanes four-byte pixels.
inline I32 PackByteChannels(I32 c0, I32 c1, I32 c2, I32 c3) {
    if constexpr (kHasByteShuffle) {
        const __m128i planes = _mm_packus_epi16(_mm_packs_epi32(c0.v, c1.v), _mm_packs_epi32(c2.v, c3.v));
        return {
            _mm_shuffle_epi8(planes, _mm_setr_epi8(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15))};
    } else {
        const __m128i even = _mm_packs_epi32(c0.v, c2.v);
        const __m128i odd = _mm_packs_epi32(c1.v, c3.v);
        const __m128i first = _mm_unpacklo_epi16(even, odd);  // c0 c1 of each pixel
        const __m128i second = _mm_unpackhi_epi16(even, odd); // c2 c3 of each pixel
        return {_mm_packus_epi16(_mm_unpacklo_epi32(first, second), _mm_unpackhi_epi32(first, second))};
    }
}

/// The lanes of a and b at even places, a first, and those at odd places.
inline void SeparateLanes(I32 a, I32 b, I32& even, I32& odd) {
    const __m128 lower = _mm_castsi128_ps(a.v), upper = _mm_castsi128_ps(b.v);
    even.v = _mm_castps_si128(_mm_shuffle_ps(lower, upper, _MM_SHUFFLE(2, 0, 2, 0)));
    odd.v = _mm_castps_si128(_mm_shuffle_ps(lower, upper, _MM_SHUFFLE(3, 1, 3, 1)));
}

/// The same of bytes: those of a and b at even places, a first, and those at odd places.
inline void SeparateBytes(I32 a, I32 b, I32& even, I32& odd) {
    if constexpr (kHasByteShuffle) {
        const __m128i order = _mm_setr_epi8(0, 2, 4, 6, 8, 10, 12, 14, 1, 3, 5, 7, 9, 11, 13, 15);
        const __m128i first = _mm_shuffle_epi8(a.v, order), second = _mm_shuffle_epi8(b.v, order);
        even.v = _mm_unpacklo_epi64(first, second);
        odd.v = _mm_unpackhi_epi64(first, second);
    } else {
        const __m128i low = _mm_set1_epi16(0xff);
        even.v = _mm_packus_epi16(_mm_and_si128(a.v, low), _mm_and_si128(b.v, low));
        odd.v = _mm_packus_epi16(_mm_srli_epi16(a.v, 8), _mm_srli_epi16(b.v, 8));
    }
}

/// The lanes of `lanes` moved up by one, with the last lane of `before` in front.
inline I32 ShiftInLane(I32 before, I32 lanes) {
    return {_mm_or_si128(_mm_slli_si128(lanes.v, 4), _mm_srli_si128(before.v, 12))};
}

/// The high 16 bits of the product of each 16-bit half with its counterpart, both without sign.
inline I32 MultiplyHalvesHigh(I32 a, I32 b) {
    return {_mm_mulhi_epu16(a.v, b.v)};
}
/// The mean of each 16-bit half and its counterpart, both without sign, rounded up.
inline I32 AverageHalves(I32 a, I32 b) {
    return {_mm_avg_epu16(a.v, b.v)};
}
/// The sum of each byte and its counterpart, at most 255.
inline I32 AddBytes(I32 a, I32 b) {
    return {_mm_adds_epu8(a.v, b.v)};
}
/// The lesser of each 16-bit half and its counterpart; both are below 32768.
inline I32 MinHalves(I32 a, I32 b) {
    return {_mm_min_epi16(a.v, b.v)};
}
/// The lesser and the greater of each byte and its counterpart, both without sign.
inline I32 MinBytes(I32 a, I32 b) {
    return {_mm_min_epu8(a.v, b.v)};
}
inline I32 MaxBytes(I32 a, I32 b) {
    return {_mm_max_epu8(a.v, b.v)};
}
/// In each block of 16 bytes, the bytes of `table` that the bytes of `places`, 0 to 15, point to.
inline I32 LookUpBytes(I32 table, I32 places) {
    if constexpr (kHasByteShuffle) {
        return {_mm_shuffle_epi8(table.v, places.v)};
    } else {
        uint8_t from[16], bytes[16];
        Store(from, table);
        Store(bytes, places);
        for (uint8_t& byte : bytes) byte = from[byte];
        return LoadInts(bytes);
    }
}
/// Twice the products of unsigned bytes of `a` with signed bytes of `b`, in 16-bit halves in their order. They
/// must fit.
inline void DoubleByteProducts(I32 a, I32 b, I32& first, I32& second) {
    if constexpr (kHasByteShuffle) {
        first = {_mm_maddubs_epi16(_mm_unpacklo_epi8(a.v, a.v), _mm_unpacklo_epi8(b.v, b.v))};
        second = {_mm_maddubs_epi16(_mm_unpackhi_epi8(a.v, a.v), _mm_unpackhi_epi8(b.v, b.v))};
    } else {
        const __m128i zero = _mm_setzero_si128(), sign = _mm_cmpgt_epi8(zero, b.v);
        const __m128i low = _mm_mullo_epi16(_mm_unpacklo_epi8(a.v, zero), _mm_unpacklo_epi8(b.v, sign));
        const __m128i high = _mm_mullo_epi16(_mm_unpackhi_epi8(a.v, zero), _mm_unpackhi_epi8(b.v, sign));
        first = {_mm_adds_epi16(low, low)};
        second = {_mm_adds_epi16(high, high)};
    }
}
/// Swaps the two bytes of each 16-bit half.
inline I32 SwapBytes(I32 a) {
    if constexpr (kHasByteShuffle) {
        return {_mm_shuffle_epi8(a.v, _mm_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14))};
    } else {
        return {_mm_or_si128(_mm_slli_epi16(a.v, 8), _mm_srli_epi16(a.v, 8))};
    }
}
/// Reverses the four 16-bit halves of each pair of lanes.
inline I32 ReverseHalves(I32 a) {
    const __m128i low = _mm_shufflelo_epi16(a.v, _MM_SHUFFLE(0, 1, 2, 3));
    return {_mm_shufflehi_epi16(low, _MM_SHUFFLE(0, 1, 2, 3))};
}
/// 2 x kLanes bytes, each to a 16-bit half.
inline I32 LoadBytesAsHalves(const void* source) {
    return {_mm_unpacklo_epi8(_mm_loadl_epi64(static_cast<const __m128i*>(source)), _mm_setzero_si128())};
}
/// The 16-bit halves of two vectors to bytes in their order; the halves are below 32768 and saturate.
inline I32 PackHalves(I32 a, I32 b) {
    return {_mm_packus_epi16(a.v, b.v)};
}
/// The lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanes(I32 a, I32 b, I32 c, I32 d) {
    return {_mm_packus_epi16(_mm_packs_epi32(a.v, b.v), _mm_packs_epi32(c.v, d.v))};
}
/// The lanes of two vectors, each from 0 to 65535, to 16-bit halves in their order.
inline I32 PackLanesToHalves(I32 a, I32 b) {
    if constexpr (kHasSSE41) {
        return {_mm_packus_epi32(a.v, b.v)};
    } else {
        // Sign-extending the low halves first makes the saturating pack exact.
        return {_mm_packs_epi32(_mm_srai_epi32(_mm_slli_epi32(a.v, 16), 16),
                                _mm_srai_epi32(_mm_slli_epi32(b.v, 16), 16))};
    }
}
/// The lanes of two vectors to signed 16-bit halves in their order, saturated.
inline I32 PackSignedLanes(I32 a, I32 b) {
    return {_mm_packs_epi32(a.v, b.v)};
}
/// Lanes for even and for odd places to 2 x kLanes interleaved lanes.
inline void StoreLanePairs(void* destination, I32 even, I32 odd) {
    auto* lanes = static_cast<int32_t*>(destination);
    Store(lanes, I32{_mm_unpacklo_epi32(even.v, odd.v)});
    Store(lanes + kLanes, I32{_mm_unpackhi_epi32(even.v, odd.v)});
}

/// Two registers, so that there is a double for each float lane: `low` for the first half of the lanes.
struct F64 {
    __m128d low, high;
};

struct I64 {
    __m128i low, high;
};

inline F64 Doubles(double x) {
    return {_mm_set1_pd(x), _mm_set1_pd(x)};
}
inline I64 Longs(int64_t x) {
    return {_mm_set1_epi64x(x), _mm_set1_epi64x(x)};
}
inline F64 operator+(F64 a, F64 b) {
    return {_mm_add_pd(a.low, b.low), _mm_add_pd(a.high, b.high)};
}
inline F64 operator-(F64 a, F64 b) {
    return {_mm_sub_pd(a.low, b.low), _mm_sub_pd(a.high, b.high)};
}
inline F64 operator*(F64 a, F64 b) {
    return {_mm_mul_pd(a.low, b.low), _mm_mul_pd(a.high, b.high)};
}
inline F64 operator/(F64 a, F64 b) {
    return {_mm_div_pd(a.low, b.low), _mm_div_pd(a.high, b.high)};
}
inline F64 Min(F64 a, F64 b) {
    return {_mm_min_pd(a.low, b.low), _mm_min_pd(a.high, b.high)};
}
inline F64 Max(F64 a, F64 b) {
    return {_mm_max_pd(a.low, b.low), _mm_max_pd(a.high, b.high)};
}
inline I64 operator+(I64 a, I64 b) {
    return {_mm_add_epi64(a.low, b.low), _mm_add_epi64(a.high, b.high)};
}
inline I64 operator&(I64 a, I64 b) {
    return {_mm_and_si128(a.low, b.low), _mm_and_si128(a.high, b.high)};
}
template <int kBits>
inline I64 ShiftLeft(I64 a) {
    return {_mm_slli_epi64(a.low, kBits), _mm_slli_epi64(a.high, kBits)};
}
template <int kBits>
inline I64 ShiftRight(I64 a) {
    return {_mm_srli_epi64(a.low, kBits), _mm_srli_epi64(a.high, kBits)};
}
inline I64 Bits(F64 a) {
    return {_mm_castpd_si128(a.low), _mm_castpd_si128(a.high)};
}
inline F64 FromBits(I64 a) {
    return {_mm_castsi128_pd(a.low), _mm_castsi128_pd(a.high)};
}
inline F64 ToDouble(F32 a) {
    return {_mm_cvtps_pd(a.v), _mm_cvtps_pd(_mm_movehl_ps(a.v, a.v))};
}
inline F32 ToFloat(F64 a) {
    return {_mm_movelh_ps(_mm_cvtpd_ps(a.low), _mm_cvtpd_ps(a.high))};
}
inline F64 ToDouble(I32 a) {
    return {_mm_cvtepi32_pd(a.v), _mm_cvtepi32_pd(_mm_unpackhi_epi64(a.v, a.v))};
}
inline I32 Truncate(F64 a) {
    return {_mm_unpacklo_epi64(_mm_cvttpd_epi32(a.low), _mm_cvttpd_epi32(a.high))};
}

// Blocks of four lanes: the pieces of which a wider vector is made.

/// The block i is loaded from, or stored to, i x stride bytes further on.
inline F32 LoadFloatBlocks(const void* source, [[maybe_unused]] int64_t stride) {
    return LoadFloats(source);
}
inline void StoreFloatBlocks(void* destination, [[maybe_unused]] int64_t stride, F32 a) {
    Store(destination, a);
}

/// The blocks of two or three vectors in turns.
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b) {
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, a);
    Store(bytes + sizeof a, b);
}
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b, I32 c) {
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, a);
    Store(bytes + sizeof a, b);
    Store(bytes + 2 * sizeof a, c);
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b));
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b, F32 c) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b), Bits(c));
}

/// In each block: a0 b0 a1 b1 and a2 b2 a3 b3.
inline void InterleaveInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm_unpacklo_epi32(a.v, b.v)};
    high = {_mm_unpackhi_epi32(a.v, b.v)};
}

/// The same with 16-bit halves: a0 b0 to a3 b3 and a4 b4 to a7 b7.
inline void InterleaveHalvesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm_unpacklo_epi16(a.v, b.v)};
    high = {_mm_unpackhi_epi16(a.v, b.v)};
}
/// The same with bytes: a0 b0 to a7 b7 and a8 b8 to a15 b15.
inline void InterleaveBytesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm_unpacklo_epi8(a.v, b.v)};
    high = {_mm_unpackhi_epi8(a.v, b.v)};
}
/// In each block: the lanes of a and then those of b, saturated to signed 16-bit halves.
inline I32 PackSignedInBlocks(I32 a, I32 b) {
    return {_mm_packs_epi32(a.v, b.v)};
}

/// Three lanes a block, which stand in memory without a gap; loading leaves the fourth 0.
inline I32 LoadThrees(const void* source) {
    int32_t third;
    std::memcpy(&third, static_cast<const uint8_t*>(source) + 8, sizeof third);
    return {
        _mm_unpacklo_epi64(_mm_loadl_epi64(static_cast<const __m128i*>(source)), _mm_cvtsi32_si128(third))};
}
inline void StoreThrees(void* destination, I32 a) {
    _mm_storel_epi64(static_cast<__m128i*>(destination), a.v);
    const int32_t third = _mm_cvtsi128_si32(_mm_unpackhi_epi64(a.v, a.v));
    std::memcpy(static_cast<uint8_t*>(destination) + 8, &third, sizeof third);
}
/// Six lanes a block: four of `low` and the first two of `high`.
inline void StoreSixes(void* destination, I32 low, I32 high) {
    Store(destination, low);
    _mm_storel_epi64(static_cast<__m128i*>(destination) + 1, high.v);
}
/// Three 16-bit halves: lane kLane of `pair` and the lower half of that of `third`.
template <int kLane>
inline void StoreThreeHalves(uint8_t* destination, __m128i pair, __m128i third) {
    const int32_t firstAndSecond = _mm_cvtsi128_si32(_mm_shuffle_epi32(pair, kLane));
    const auto half = static_cast<uint16_t>(_mm_extract_epi16(third, 2 * kLane));
    std::memcpy(destination, &firstAndSecond, sizeof firstAndSecond);
    std::memcpy(destination + 4, &half, sizeof half);
}
/// Groups of four 16-bit halves, one for each lane: two halves of `pair` and the lower half of `third`. The fourth of
/// each group is neither read nor written.
inline void StoreThreeOfFourHalves(void* destination, I32 pair, I32 third) {
    auto* bytes = static_cast<uint8_t*>(destination);
    StoreThreeHalves<0>(bytes, pair.v, third.v);
    StoreThreeHalves<1>(bytes + 8, pair.v, third.v);
    StoreThreeHalves<2>(bytes + 16, pair.v, third.v);
    StoreThreeHalves<3>(bytes + 24, pair.v, third.v);
}

/// The 16 bits that start at each of eight byte offsets in a block.
template <int k0, int k1, int k2, int k3, int k4, int k5, int k6, int k7>
inline I32 HalvesAt(I32 a) {
    if constexpr (kHasByteShuffle) {
        return {_mm_shuffle_epi8(a.v, _mm_setr_epi8(k0, k0 + 1, k1, k1 + 1, k2, k2 + 1, k3, k3 + 1, k4,
                                                    k4 + 1, k5, k5 + 1, k6, k6 + 1, k7, k7 + 1))};
    } else {
        uint8_t bytes[16];
        Store(bytes, a);
        const int offsets[8] = {k0, k1, k2, k3, k4, k5, k6, k7};
        int16_t halves[8];
        for (int i = 0; i < 8; ++i) std::memcpy(&halves[i], bytes + offsets[i], 2);
        return LoadInts(halves);
    }
}

/// Whether the highest bit of any lane is set.
inline bool AnyNegative(I32 a) {
    return _mm_movemask_ps(_mm_castsi128_ps(a.v)) != 0;
}

/// A bit for each byte, the lowest for the first: set where the byte is not 0.
inline uint64_t NonZeroBytes(I32 a) {
    return static_cast<uint16_t>(~_mm_movemask_epi8(_mm_cmpeq_epi8(a.v, _mm_setzero_si128())));
}

/// Two four-byte pixels side by side for each block, from places of any alignment: block i has its first at
/// index[4 x i], in pixels. Their bytes go to lanes, a pixel a block.
inline void LoadPixelPairs(const uint8_t* pixels, const int32_t* index, I32& first, I32& second) {
    const I32 halves = LoadBytesAsHalves(pixels + 4 * int64_t{*index});
    first.v = _mm_unpacklo_epi16(halves.v, _mm_setzero_si128());
    second.v = _mm_unpackhi_epi16(halves.v, _mm_setzero_si128());
}

/// In each block, the lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanesInBlocks(I32 a, I32 b, I32 c, I32 d) {
    return PackLanes(a, b, c, d);
}

/// In each lane, the sum of the products of its two signed 16-bit halves with their counterparts.
inline I32 MultiplyAddHalves(I32 a, I32 b) {
    return {_mm_madd_epi16(a.v, b.v)};
}

/// In each block, the lanes of `a` whose bits are set in kMask, lane 0 the lowest, and the others of `b`.
template <int kMask>
inline F32 BlendBlocks(F32 a, F32 b) {
    if constexpr (kHasSSE41) {
        return {_mm_blend_ps(b.v, a.v, kMask)};
    } else {
        return Select(PixelInts(-(kMask & 1), -(kMask >> 1 & 1), -(kMask >> 2 & 1), -(kMask >> 3 & 1)), a, b);
    }
}
template <int kMask>
inline I32 BlendBlocks(I32 a, I32 b) {
    return Bits(BlendBlocks<kMask>(FromBits(a), FromBits(b)));
}

/// In each block: a0 a1 b0 b1 and a2 a3 b2 b3.
inline F32 LowPairs(F32 a, F32 b) {
    return {_mm_shuffle_ps(a.v, b.v, _MM_SHUFFLE(1, 0, 1, 0))};
}
inline F32 HighPairs(F32 a, F32 b) {
    return {_mm_shuffle_ps(a.v, b.v, _MM_SHUFFLE(3, 2, 3, 2))};
}

/// All lanes in the other order.
inline I32 ReverseLanes(I32 a) {
    return ShufflePixel<3, 2, 1, 0>(a);
}

/// Two lanes side by side for each lane, from any places: lane i has its two at offsets[i], in bytes.
inline void LoadLanePairsAt(const uint8_t* base, const int64_t* offsets, I32& first, I32& second) {
    const auto pair = [base, offsets](int i) {
        return _mm_loadl_epi64(reinterpret_cast<const __m128i*>(base + offsets[i]));
    };
    SeparateLanes(I32{_mm_unpacklo_epi64(pair(0), pair(1))}, I32{_mm_unpacklo_epi64(pair(2), pair(3))}, first,
                  second);
}

} // namespace PK::PK_TARGET

#include "primitives/simd/OneBlock.h"
