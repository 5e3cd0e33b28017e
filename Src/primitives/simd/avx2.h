#pragma once

// The vector types of 256 bits, for AVX2.

#include "primitives/simd/vector256.h"

namespace PK::PK_TARGET {

inline constexpr bool kHasByteShuffle = true;

inline I32 operator+(I32 a, I32 b) {
    return {_mm256_add_epi32(a.v, b.v)};
}
inline I32 operator-(I32 a, I32 b) {
    return {_mm256_sub_epi32(a.v, b.v)};
}
inline I32 operator&(I32 a, I32 b) {
    return {_mm256_and_si256(a.v, b.v)};
}
inline I32 operator|(I32 a, I32 b) {
    return {_mm256_or_si256(a.v, b.v)};
}
inline I32 operator^(I32 a, I32 b) {
    return {_mm256_xor_si256(a.v, b.v)};
}
inline I32 Not(I32 a) {
    return {_mm256_xor_si256(a.v, _mm256_set1_epi32(-1))};
}
template <int kBits>
inline I32 ShiftLeft(I32 a) {
    return {_mm256_slli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRight(I32 a) {
    return {_mm256_srli_epi32(a.v, kBits)};
}
template <int kBits>
inline I32 ShiftRightSigned(I32 a) {
    return {_mm256_srai_epi32(a.v, kBits)};
}
inline I32 ShiftRightSigned(I32 a, int32_t bits) {
    return {_mm256_sra_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 ShiftLeft(I32 a, int32_t bits) {
    return {_mm256_sll_epi32(a.v, _mm_cvtsi32_si128(bits))};
}
inline I32 operator*(I32 a, I32 b) {
    return {_mm256_mullo_epi32(a.v, b.v)};
}

/// The low 16 bits of the product of each 16-bit half with its counterpart.
inline I32 MultiplyHalves(I32 a, I32 b) {
    return {_mm256_mullo_epi16(a.v, b.v)};
}

/// All bits set where the comparison holds.
inline I32 Equal(I32 a, I32 b) {
    return {_mm256_cmpeq_epi32(a.v, b.v)};
}

inline I32 Select(I32 mask, I32 a, I32 b) {
    return {_mm256_or_si256(_mm256_and_si256(mask.v, a.v), _mm256_andnot_si256(mask.v, b.v))};
}
inline F32 Select(I32 mask, F32 a, F32 b) {
    return FromBits(Select(mask, Bits(a), Bits(b)));
}
inline I32 Min(I32 a, I32 b) {
    return {_mm256_min_epi32(a.v, b.v)};
}
inline I32 Max(I32 a, I32 b) {
    return {_mm256_max_epi32(a.v, b.v)};
}

/// table[index] in each lane.
inline F32 Lookup(const float* table, I32 index) {
    return {_mm256_i32gather_ps(table, index.v, 4)};
}
inline I32 Lookup(const uint32_t* table, I32 index) {
    return {_mm256_i32gather_epi32(reinterpret_cast<const int*>(table), index.v, 4)};
}

/// From a place aligned to the vector's size. Where the instruction set can, uncached memory is read by whole lines.
inline I32 LoadStreamed(const void* source) {
    return {_mm256_stream_load_si256(static_cast<__m256i*>(const_cast<void*>(source)))};
}
inline I32 LoadBytes(const void* source) {
    return {_mm256_cvtepu8_epi32(_mm_loadl_epi64(static_cast<const __m128i*>(source)))};
}
inline I32 LoadWords(const void* source) {
    return {_mm256_cvtepu16_epi32(_mm_loadu_si128(static_cast<const __m128i*>(source)))};
}
inline I32 LoadSignedWords(const void* source) {
    return {_mm256_cvtepi16_epi32(_mm_loadu_si128(static_cast<const __m128i*>(source)))};
}
/// The low 16 bits of each lane, unsaturated.
inline void StoreWords(void* destination, I32 a) {
    const __m256i low = _mm256_and_si256(a.v, _mm256_set1_epi32(0xffff)); // makes the saturating pack exact
    _mm_storeu_si128(static_cast<__m128i*>(destination),
                     _mm_packus_epi32(_mm256_castsi256_si128(low), _mm256_extracti128_si256(low, 1)));
}

template <int kFirst, int kSecond, int kThird, int kFourth>
inline I32 ShufflePixel(I32 a) {
    return {_mm256_shuffle_epi32(a.v, _MM_SHUFFLE(kFourth, kThird, kSecond, kFirst))};
}

/// Reverses the four bytes of each lane.
inline I32 ReverseBytes(I32 a) {
    const __m128i order = _mm_setr_epi8(3, 2, 1, 0, 7, 6, 5, 4, 11, 10, 9, 8, 15, 14, 13, 12);
    return {_mm256_shuffle_epi8(a.v, _mm256_broadcastsi128_si256(order))};
}

/// Saturates each channel to a byte and interleaves them into kLanes four-byte pixels.
inline I32 PackByteChannels(I32 c0, I32 c1, I32 c2, I32 c3) {
    const __m128i order = _mm_setr_epi8(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15);
    const __m256i planes =
        _mm256_packus_epi16(_mm256_packs_epi32(c0.v, c1.v), _mm256_packs_epi32(c2.v, c3.v));
    return {_mm256_shuffle_epi8(planes, _mm256_broadcastsi128_si256(order))};
}

/// The lanes of a and b at even places, a first, and those at odd places.
inline void SeparateLanes(I32 a, I32 b, I32& even, I32& odd) {
    const __m256 lower = _mm256_castsi256_ps(a.v), upper = _mm256_castsi256_ps(b.v);
    const __m256i evens = _mm256_castps_si256(_mm256_shuffle_ps(lower, upper, _MM_SHUFFLE(2, 0, 2, 0)));
    const __m256i odds = _mm256_castps_si256(_mm256_shuffle_ps(lower, upper, _MM_SHUFFLE(3, 1, 3, 1)));
    even.v = _mm256_permute4x64_epi64(evens, _MM_SHUFFLE(3, 1, 2, 0));
    odd.v = _mm256_permute4x64_epi64(odds, _MM_SHUFFLE(3, 1, 2, 0));
}

/// The same of bytes: those of a and b at even places, a first, and those at odd places.
inline void SeparateBytes(I32 a, I32 b, I32& even, I32& odd) {
    const __m256i order =
        _mm256_broadcastsi128_si256(_mm_setr_epi8(0, 2, 4, 6, 8, 10, 12, 14, 1, 3, 5, 7, 9, 11, 13, 15));
    const __m256i first = _mm256_shuffle_epi8(a.v, order), second = _mm256_shuffle_epi8(b.v, order);
    const __m256i evens = _mm256_unpacklo_epi64(first, second), odds = _mm256_unpackhi_epi64(first, second);
    even.v = _mm256_permute4x64_epi64(evens, _MM_SHUFFLE(3, 1, 2, 0));
    odd.v = _mm256_permute4x64_epi64(odds, _MM_SHUFFLE(3, 1, 2, 0));
}

/// The lanes of `lanes` moved up by one, with the last lane of `before` in front.
inline I32 ShiftInLane(I32 before, I32 lanes) {
    const __m256i across = _mm256_permute2x128_si256(before.v, lanes.v, 0x21);
    return {_mm256_alignr_epi8(lanes.v, across, 12)};
}

/// The high 16 bits of the product of each 16-bit half with its counterpart, both without sign.
inline I32 MultiplyHalvesHigh(I32 a, I32 b) {
    return {_mm256_mulhi_epu16(a.v, b.v)};
}
/// The mean of each 16-bit half and its counterpart, both without sign, rounded up.
inline I32 AverageHalves(I32 a, I32 b) {
    return {_mm256_avg_epu16(a.v, b.v)};
}
/// The sum of each byte and its counterpart, at most 255.
inline I32 AddBytes(I32 a, I32 b) {
    return {_mm256_adds_epu8(a.v, b.v)};
}
/// The lesser of each 16-bit half and its counterpart; both are below 32768.
inline I32 MinHalves(I32 a, I32 b) {
    return {_mm256_min_epi16(a.v, b.v)};
}
/// The lesser and the greater of each byte and its counterpart, both without sign.
inline I32 MinBytes(I32 a, I32 b) {
    return {_mm256_min_epu8(a.v, b.v)};
}
inline I32 MaxBytes(I32 a, I32 b) {
    return {_mm256_max_epu8(a.v, b.v)};
}
/// In each block of 16 bytes, the bytes of `table` that the bytes of `places`, 0 to 15, point to.
inline I32 LookUpBytes(I32 table, I32 places) {
    return {_mm256_shuffle_epi8(table.v, places.v)};
}
/// Twice the products of unsigned bytes of `a` with signed bytes of `b`, in 16-bit halves in their order. They
/// must fit.
inline void DoubleByteProducts(I32 a, I32 b, I32& first, I32& second) {
    const __m256i x = _mm256_permute4x64_epi64(a.v, _MM_SHUFFLE(3, 1, 2, 0));
    const __m256i y = _mm256_permute4x64_epi64(b.v, _MM_SHUFFLE(3, 1, 2, 0));
    first = {_mm256_maddubs_epi16(_mm256_unpacklo_epi8(x, x), _mm256_unpacklo_epi8(y, y))};
    second = {_mm256_maddubs_epi16(_mm256_unpackhi_epi8(x, x), _mm256_unpackhi_epi8(y, y))};
}
/// Swaps the two bytes of each 16-bit half.
inline I32 SwapBytes(I32 a) {
    const __m128i order = _mm_setr_epi8(1, 0, 3, 2, 5, 4, 7, 6, 9, 8, 11, 10, 13, 12, 15, 14);
    return {_mm256_shuffle_epi8(a.v, _mm256_broadcastsi128_si256(order))};
}
/// Reverses the four 16-bit halves of each pair of lanes.
inline I32 ReverseHalves(I32 a) {
    const __m128i order = _mm_setr_epi8(6, 7, 4, 5, 2, 3, 0, 1, 14, 15, 12, 13, 10, 11, 8, 9);
    return {_mm256_shuffle_epi8(a.v, _mm256_broadcastsi128_si256(order))};
}
/// 2 x kLanes bytes, each to a 16-bit half.
inline I32 LoadBytesAsHalves(const void* source) {
    return {_mm256_cvtepu8_epi16(_mm_loadu_si128(static_cast<const __m128i*>(source)))};
}
/// The 16-bit halves of two vectors to bytes in their order; the halves are below 32768 and saturate.
inline I32 PackHalves(I32 a, I32 b) {
    return {_mm256_permute4x64_epi64(_mm256_packus_epi16(a.v, b.v), _MM_SHUFFLE(3, 1, 2, 0))};
}
/// The lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanes(I32 a, I32 b, I32 c, I32 d) {
    const __m256i bytes = _mm256_packus_epi16(_mm256_packs_epi32(a.v, b.v), _mm256_packs_epi32(c.v, d.v));
    return {_mm256_permutevar8x32_epi32(bytes, _mm256_setr_epi32(0, 4, 1, 5, 2, 6, 3, 7))};
}
/// The lanes of two vectors, each from 0 to 65535, to 16-bit halves in their order.
inline I32 PackLanesToHalves(I32 a, I32 b) {
    return {_mm256_permute4x64_epi64(_mm256_packus_epi32(a.v, b.v), _MM_SHUFFLE(3, 1, 2, 0))};
}
/// The lanes of two vectors to signed 16-bit halves in their order, saturated.
inline I32 PackSignedLanes(I32 a, I32 b) {
    return {_mm256_permute4x64_epi64(_mm256_packs_epi32(a.v, b.v), _MM_SHUFFLE(3, 1, 2, 0))};
}
/// Lanes for even and for odd places to 2 x kLanes interleaved lanes.
inline void StoreLanePairs(void* destination, I32 even, I32 odd) {
    const __m256i outer = _mm256_unpacklo_epi32(even.v, odd.v), inner = _mm256_unpackhi_epi32(even.v, odd.v);
    auto* lanes = static_cast<int32_t*>(destination);
    Store(lanes, I32{_mm256_permute2x128_si256(outer, inner, 0x20)});
    Store(lanes + kLanes, I32{_mm256_permute2x128_si256(outer, inner, 0x31)});
}

inline I64 operator+(I64 a, I64 b) {
    return {_mm256_add_epi64(a.low, b.low), _mm256_add_epi64(a.high, b.high)};
}
inline I64 operator&(I64 a, I64 b) {
    return {_mm256_and_si256(a.low, b.low), _mm256_and_si256(a.high, b.high)};
}
template <int kBits>
inline I64 ShiftLeft(I64 a) {
    return {_mm256_slli_epi64(a.low, kBits), _mm256_slli_epi64(a.high, kBits)};
}
template <int kBits>
inline I64 ShiftRight(I64 a) {
    return {_mm256_srli_epi64(a.low, kBits), _mm256_srli_epi64(a.high, kBits)};
}
inline F64 ToDouble(I32 a) {
    return {_mm256_cvtepi32_pd(_mm256_castsi256_si128(a.v)),
            _mm256_cvtepi32_pd(_mm256_extracti128_si256(a.v, 1))};
}

// Blocks of four lanes: the pieces of which a wider vector is made.

/// The block i is loaded from, or stored to, i x stride bytes further on.
inline F32 LoadFloatBlocks(const void* source, int64_t stride) {
    const auto* second = static_cast<const uint8_t*>(source) + stride;
    return {_mm256_loadu2_m128(reinterpret_cast<const float*>(second), static_cast<const float*>(source))};
}
inline void StoreBlocks(void* destination, int64_t stride, I32 a) {
    auto* second = static_cast<uint8_t*>(destination) + stride;
    _mm_storeu_si128(static_cast<__m128i*>(destination), _mm256_castsi256_si128(a.v));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(second), _mm256_extracti128_si256(a.v, 1));
}
inline void StoreFloatBlocks(void* destination, int64_t stride, F32 a) {
    StoreBlocks(destination, stride, Bits(a));
}

/// The blocks of two or three vectors in turns.
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b) {
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, I32{_mm256_permute2x128_si256(a.v, b.v, 0x20)});
    Store(bytes + sizeof a, I32{_mm256_permute2x128_si256(a.v, b.v, 0x31)});
}
inline void StoreBlocksInTurns(void* destination, I32 a, I32 b, I32 c) {
    auto* bytes = static_cast<uint8_t*>(destination);
    Store(bytes, I32{_mm256_permute2x128_si256(a.v, b.v, 0x20)});
    Store(bytes + sizeof a, I32{_mm256_blend_epi32(c.v, a.v, 0xf0)});
    Store(bytes + 2 * sizeof a, I32{_mm256_permute2x128_si256(b.v, c.v, 0x31)});
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b));
}
inline void StoreBlocksInTurns(void* destination, F32 a, F32 b, F32 c) {
    StoreBlocksInTurns(destination, Bits(a), Bits(b), Bits(c));
}

/// In each block: a0 b0 a1 b1 and a2 b2 a3 b3.
inline void InterleaveInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm256_unpacklo_epi32(a.v, b.v)};
    high = {_mm256_unpackhi_epi32(a.v, b.v)};
}

/// The same with 16-bit halves: a0 b0 to a3 b3 and a4 b4 to a7 b7.
inline void InterleaveHalvesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm256_unpacklo_epi16(a.v, b.v)};
    high = {_mm256_unpackhi_epi16(a.v, b.v)};
}
/// The same with bytes: a0 b0 to a7 b7 and a8 b8 to a15 b15.
inline void InterleaveBytesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    low = {_mm256_unpacklo_epi8(a.v, b.v)};
    high = {_mm256_unpackhi_epi8(a.v, b.v)};
}
/// In each block: the lanes of a and then those of b, saturated to signed 16-bit halves.
inline I32 PackSignedInBlocks(I32 a, I32 b) {
    return {_mm256_packs_epi32(a.v, b.v)};
}

/// Three lanes a block, which stand in memory without a gap; loading leaves the fourth 0.
inline I32 LoadThrees(const void* source) {
    const I32 blocks = Bits(LoadFloatBlocks(source, 8)); // the second ends with the last of the 24 bytes
    const __m256i order = _mm256_setr_epi32(0, 1, 2, 7, 5, 6, 7, 7);
    return {_mm256_blend_epi32(_mm256_permutevar8x32_epi32(blocks.v, order), _mm256_setzero_si256(), 0x88)};
}
inline void StoreThrees(void* destination, I32 a) {
    const __m256i order = _mm256_setr_epi32(0, 1, 2, 4, 5, 6, 6, 6);
    const __m256i lanes = _mm256_permutevar8x32_epi32(a.v, order);
    _mm_storeu_si128(static_cast<__m128i*>(destination), _mm256_castsi256_si128(lanes));
    _mm_storel_epi64(static_cast<__m128i*>(destination) + 1, _mm256_extracti128_si256(lanes, 1));
}
/// Six lanes a block: four of `low` and the first two of `high`.
inline void StoreSixes(void* destination, I32 low, I32 high) {
    auto* bytes = static_cast<uint8_t*>(destination);
    StoreBlocks(bytes, 24, low);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(bytes + 16), _mm256_castsi256_si128(high.v));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(bytes + 40), _mm256_extracti128_si256(high.v, 1));
}
/// Three 16-bit halves: lane kLane of `pair` and the lower half of that of `third`.
template <int kLane>
inline void StoreThreeHalves(uint8_t* destination, I32 pair, I32 third) {
    const int32_t firstAndSecond = _mm256_extract_epi32(pair.v, kLane);
    const auto half = static_cast<uint16_t>(_mm256_extract_epi16(third.v, 2 * kLane));
    std::memcpy(destination, &firstAndSecond, sizeof firstAndSecond);
    std::memcpy(destination + 4, &half, sizeof half);
}
/// Groups of four 16-bit halves, one for each lane: two halves of `pair` and the lower half of `third`. The fourth of
/// each group is neither read nor written.
inline void StoreThreeOfFourHalves(void* destination, I32 pair, I32 third) {
    auto* bytes = static_cast<uint8_t*>(destination);
    StoreThreeHalves<0>(bytes, pair, third);
    StoreThreeHalves<1>(bytes + 8, pair, third);
    StoreThreeHalves<2>(bytes + 16, pair, third);
    StoreThreeHalves<3>(bytes + 24, pair, third);
    StoreThreeHalves<4>(bytes + 32, pair, third);
    StoreThreeHalves<5>(bytes + 40, pair, third);
    StoreThreeHalves<6>(bytes + 48, pair, third);
    StoreThreeHalves<7>(bytes + 56, pair, third);
}

/// The 16 bits that start at each of eight byte offsets in a block.
template <int k0, int k1, int k2, int k3, int k4, int k5, int k6, int k7>
inline I32 HalvesAt(I32 a) {
    const __m128i order = _mm_setr_epi8(k0, k0 + 1, k1, k1 + 1, k2, k2 + 1, k3, k3 + 1, k4, k4 + 1, k5,
                                        k5 + 1, k6, k6 + 1, k7, k7 + 1);
    return {_mm256_shuffle_epi8(a.v, _mm256_broadcastsi128_si256(order))};
}

/// A bit for each byte, the lowest for the first: set where the byte is not 0.
inline uint64_t NonZeroBytes(I32 a) {
    return ~static_cast<uint32_t>(_mm256_movemask_epi8(_mm256_cmpeq_epi8(a.v, _mm256_setzero_si256())));
}

/// Two four-byte pixels side by side for each block, from places of any alignment: block i has its first at
/// index[4 x i], in pixels. Their bytes go to lanes, a pixel a block.
inline void LoadPixelPairs(const uint8_t* pixels, const int32_t* index, I32& first, I32& second) {
    const auto pair = [pixels](int64_t at) {
        return _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(pixels + 4 * at)));
    };
    const __m256i lower = pair(index[0]), upper = pair(index[4]);
    first.v = _mm256_permute2x128_si256(lower, upper, 0x20);
    second.v = _mm256_permute2x128_si256(lower, upper, 0x31);
}

/// In each block, the lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanesInBlocks(I32 a, I32 b, I32 c, I32 d) {
    return {_mm256_packus_epi16(_mm256_packs_epi32(a.v, b.v), _mm256_packs_epi32(c.v, d.v))};
}

/// In each lane, the sum of the products of its two signed 16-bit halves with their counterparts.
inline I32 MultiplyAddHalves(I32 a, I32 b) {
    return {_mm256_madd_epi16(a.v, b.v)};
}

/// In each block, the lanes of `a` whose bits are set in kMask, lane 0 the lowest, and the others of `b`.
template <int kMask>
inline F32 BlendBlocks(F32 a, F32 b) {
    return {_mm256_blend_ps(b.v, a.v, kMask * 0x11)};
}
template <int kMask>
inline I32 BlendBlocks(I32 a, I32 b) {
    return {_mm256_blend_epi32(b.v, a.v, kMask * 0x11)};
}

/// In each block: a0 a1 b0 b1 and a2 a3 b2 b3.
inline F32 LowPairs(F32 a, F32 b) {
    return {_mm256_shuffle_ps(a.v, b.v, _MM_SHUFFLE(1, 0, 1, 0))};
}
inline F32 HighPairs(F32 a, F32 b) {
    return {_mm256_shuffle_ps(a.v, b.v, _MM_SHUFFLE(3, 2, 3, 2))};
}

/// All lanes in the other order.
inline I32 ReverseLanes(I32 a) {
    return {_mm256_permutevar8x32_epi32(a.v, _mm256_setr_epi32(7, 6, 5, 4, 3, 2, 1, 0))};
}

/// Two lanes side by side for each lane, from any places: lane i has its two at offsets[i], in bytes.
inline void LoadLanePairsAt(const uint8_t* base, const int64_t* offsets, I32& first, I32& second) {
    const auto pairs = [base, offsets](int i) {
        const auto pair = [base, offsets](int lane) {
            return _mm_loadl_epi64(reinterpret_cast<const __m128i*>(base + offsets[lane]));
        };
        return _mm_unpacklo_epi64(pair(i), pair(i + 1));
    };
    const __m256 outer = _mm256_castsi256_ps(_mm256_set_m128i(pairs(4), pairs(0)));
    const __m256 inner = _mm256_castsi256_ps(_mm256_set_m128i(pairs(6), pairs(2)));
    first.v = _mm256_castps_si256(_mm256_shuffle_ps(outer, inner, _MM_SHUFFLE(2, 0, 2, 0)));
    second.v = _mm256_castps_si256(_mm256_shuffle_ps(outer, inner, _MM_SHUFFLE(3, 1, 3, 1)));
}

/// Block i is loaded from offsets[4 x i], in bytes.
inline F32 LoadFloatBlocksAt(const uint8_t* base, const int64_t* offsets) {
    return LoadFloatBlocks(base + offsets[0], offsets[4] - offsets[0]);
}

/// Of floats side by side, one for each block, in all its lanes.
inline F32 LoadOnePerBlock(const float* source) {
    return {_mm256_set_m128(_mm_set1_ps(source[1]), _mm_set1_ps(source[0]))};
}

/// Blocks of floats side by side by their numbers.
[[gnu::always_inline]] inline F32 LoadBlocksOf(const float* blocks, const int32_t* index) {
    return LoadFloatBlocks(blocks + int64_t{4} * index[0], int64_t{16} * (int64_t{index[1]} - index[0]));
}

/// The same of no more blocks than a vector has, with the lanes of the numbers: lane i of a block is 4 x number + i.
inline F32 LoadBlocksNear(const float* blocks, I32 lanes) {
    return {_mm256_permutevar8x32_ps(_mm256_loadu_ps(blocks), lanes.v)};
}
inline I32 LoadOneIntPerBlock(const int32_t* source) {
    return Bits(LoadOnePerBlock(reinterpret_cast<const float*>(source)));
}

/// The first kBlocks, and 0 behind them; a vector of no more is loaded whole.
template <int kBlocks>
inline F32 LoadFirstBlocks(const float* source) {
    static_assert(kBlocks >= 2);
    return LoadFloats(source);
}

/// For each block a vector, whose blocks it sums: the halves are added, and then their halves.
inline F32 SumsOfBlocks(const F32 (&vectors)[2]) {
    const __m256 a = vectors[0].v, b = vectors[1].v;
    return {_mm256_add_ps(_mm256_permute2f128_ps(a, b, 0x20), _mm256_permute2f128_ps(a, b, 0x31))};
}

} // namespace PK::PK_TARGET
