#pragma once

// The plain vector types: four lanes in an array, one scalar operation a lane. This is the form that every
// processor runs and that a debugger can step through; the build keeps the compiler from vectorising it.

#include <cstdint>
#include <cstring>
#include <immintrin.h> // conversions by the current rounding mode and the reciprocal estimate, one lane at a time

/// Left to the compiler here: sanitizers make a branch of each operation on each lane, and a whole formula of these in
/// one loop would take minutes to compile.
#define PK_FLATTEN

namespace PK::plain {

inline constexpr int kLanes = 4;
inline constexpr bool kHasByteShuffle = false;

struct F32 {
    float lane[kLanes];
};

struct I32 {
    uint32_t lane[kLanes];
};

template <class Result, class Operand, class Operation>
inline Result Map(Operand a, Operation operation) {
    Result result;
    for (int i = 0; i < kLanes; ++i) result.lane[i] = operation(a.lane[i]);
    return result;
}

template <class Result, class Operand, class Operation>
inline Result Map(Operand a, Operand b, Operation operation) {
    Result result;
    for (int i = 0; i < kLanes; ++i) result.lane[i] = operation(a.lane[i], b.lane[i]);
    return result;
}

inline F32 Floats(float x) {
    return {{x, x, x, x}};
}
inline F32 PixelFloats(float c0, float c1, float c2, float c3) {
    return {{c0, c1, c2, c3}};
}
inline I32 Ints(int32_t x) {
    const auto bits = static_cast<uint32_t>(x);
    return {{bits, bits, bits, bits}};
}
inline I32 PixelInts(int32_t c0, int32_t c1, int32_t c2, int32_t c3) {
    return {{static_cast<uint32_t>(c0), static_cast<uint32_t>(c1), static_cast<uint32_t>(c2),
             static_cast<uint32_t>(c3)}};
}

template <class Vector>
inline Vector LoadVector(const void* source) {
    Vector result;
    std::memcpy(&result, source, sizeof result);
    return result;
}
inline F32 LoadFloats(const void* source) {
    return LoadVector<F32>(source);
}
inline I32 LoadInts(const void* source) {
    return LoadVector<I32>(source);
}
/// From a place aligned to the vector's size. Where the instruction set can, uncached memory is read by whole lines.
inline I32 LoadStreamed(const void* source) {
    return LoadInts(source);
}
inline void Store(void* destination, F32 x) {
    std::memcpy(destination, &x, sizeof x);
}
inline void Store(void* destination, I32 x) {
    std::memcpy(destination, &x, sizeof x);
}

inline F32 operator+(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x + y; });
}
inline F32 operator-(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x - y; });
}
inline F32 operator*(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x * y; });
}
inline F32 operator/(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x / y; });
}
inline F32 Min(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x < y ? x : y; });
}
inline F32 Max(F32 a, F32 b) {
    return Map<F32>(a, b, [](float x, float y) { return x > y ? x : y; });
}
inline F32 SquareRoot(F32 a) {
    return Map<F32>(a, [](float x) { return _mm_cvtss_f32(_mm_sqrt_ss(_mm_set_ss(x))); });
}
inline F32 ReciprocalEstimate(F32 a) {
    return Map<F32>(a, [](float x) { return _mm_cvtss_f32(_mm_rcp_ss(_mm_set_ss(x))); });
}

inline I32 operator+(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x + y; });
}
inline I32 operator-(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x - y; });
}
inline I32 operator*(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x * y; });
}
inline I32 operator&(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x & y; });
}
inline I32 operator|(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x | y; });
}
inline I32 operator^(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x ^ y; });
}
inline I32 Not(I32 a) {
    return Map<I32>(a, [](uint32_t x) { return ~x; });
}
template <int kBits>
inline I32 ShiftLeft(I32 a) {
    return Map<I32>(a, [](uint32_t x) { return x << kBits; });
}
template <int kBits>
inline I32 ShiftRight(I32 a) {
    return Map<I32>(a, [](uint32_t x) { return x >> kBits; });
}
template <int kBits>
inline I32 ShiftRightSigned(I32 a) {
    return Map<I32>(a, [](uint32_t x) { return static_cast<uint32_t>(static_cast<int32_t>(x) >> kBits); });
}
inline I32 ShiftRightSigned(I32 a, int32_t bits) {
    return Map<I32>(a, [bits](uint32_t x) { return static_cast<uint32_t>(static_cast<int32_t>(x) >> bits); });
}
inline I32 ShiftLeft(I32 a, int32_t bits) {
    return Map<I32>(a, [bits](uint32_t x) { return x << bits; });
}
inline I32 Min(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) {
        return static_cast<int32_t>(x) < static_cast<int32_t>(y) ? x : y;
    });
}
inline I32 Max(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) {
        return static_cast<int32_t>(x) > static_cast<int32_t>(y) ? x : y;
    });
}

/// The low 16 bits of the product of each 16-bit half with its counterpart.
inline I32 MultiplyHalves(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) {
        return ((x & 0xffff) * (y & 0xffff) & 0xffff) | ((x >> 16) * (y >> 16) << 16);
    });
}

/// All bits set where the comparison holds.
inline I32 Equal(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) { return x == y ? ~0u : 0u; });
}
inline I32 Less(F32 a, F32 b) {
    return Map<I32>(a, b, [](float x, float y) { return x < y ? ~0u : 0u; });
}
inline I32 NotGreater(F32 a, F32 b) {
    return Map<I32>(a, b, [](float x, float y) { return x <= y ? ~0u : 0u; });
}

inline I32 Bits(F32 a) {
    return LoadInts(&a);
}
inline F32 FromBits(I32 a) {
    return LoadFloats(&a);
}
inline I32 Select(I32 mask, I32 a, I32 b) {
    return (a & mask) | (b & Not(mask));
}
inline F32 Select(I32 mask, F32 a, F32 b) {
    return FromBits(Select(mask, Bits(a), Bits(b)));
}

inline F32 ToFloat(I32 a) {
    return Map<F32>(a, [](uint32_t x) { return static_cast<float>(static_cast<int32_t>(x)); });
}
inline I32 Nearest(F32 a) {
    return Map<I32>(a, [](float x) { return static_cast<uint32_t>(_mm_cvtss_si32(_mm_set_ss(x))); });
}
inline I32 Truncate(F32 a) {
    return Map<I32>(a, [](float x) { return static_cast<uint32_t>(_mm_cvttss_si32(_mm_set_ss(x))); });
}

/// table[index] in each lane.
inline F32 Lookup(const float* table, I32 index) {
    return Map<F32>(index, [table](uint32_t i) { return table[i]; });
}
inline I32 Lookup(const uint32_t* table, I32 index) {
    return Map<I32>(index, [table](uint32_t i) { return table[i]; });
}

template <class Element>
inline I32 LoadElements(const void* source) {
    Element elements[kLanes];
    std::memcpy(elements, source, sizeof elements);
    return {{elements[0], elements[1], elements[2], elements[3]}};
}
inline I32 LoadBytes(const void* source) {
    return LoadElements<uint8_t>(source);
}
inline I32 LoadWords(const void* source) {
    return LoadElements<uint16_t>(source);
}

inline uint32_t Saturate(uint32_t x, int32_t limit) {
    const auto value = static_cast<int32_t>(x);
    return static_cast<uint32_t>(value < 0 ? 0 : value > limit ? limit : value);
}
inline void StoreBytes(void* destination, I32 a) {
    uint8_t bytes[kLanes];
    for (int i = 0; i < kLanes; ++i) bytes[i] = static_cast<uint8_t>(Saturate(a.lane[i], 255));
    std::memcpy(destination, bytes, sizeof bytes);
}
inline I32 LoadSignedWords(const void* source) {
    return ShiftRightSigned<16>(ShiftLeft<16>(LoadWords(source)));
}
/// The low 16 bits of each lane, unsaturated.
inline void StoreWords(void* destination, I32 a) {
    uint16_t words[kLanes];
    for (int i = 0; i < kLanes; ++i) words[i] = static_cast<uint16_t>(a.lane[i]);
    std::memcpy(destination, words, sizeof words);
}

template <int kFirst, int kSecond, int kThird, int kFourth>
inline I32 ShufflePixel(I32 a) {
    return {{a.lane[kFirst], a.lane[kSecond], a.lane[kThird], a.lane[kFourth]}};
}
template <int kFirst, int kSecond, int kThird, int kFourth>
inline F32 ShufflePixel(F32 a) {
    return {{a.lane[kFirst], a.lane[kSecond], a.lane[kThird], a.lane[kFourth]}};
}

/// Reverses the four bytes of each lane.
inline I32 ReverseBytes(I32 a) {
    return Map<I32>(a, [](uint32_t x) { return __builtin_bswap32(x); });
}

/// Turns four interleaved pixels, one a vector, into four channels of four pixels, and back.
inline void TransposePixels(F32& a, F32& b, F32& c, F32& d) {
    const F32 rows[4] = {a, b, c, d};
    F32* const columns[4] = {&a, &b, &c, &d};
    for (int i = 0; i < 4; ++i)
        for (int j = 0; j < 4; ++j) columns[i]->lane[j] = rows[j].lane[i];
}

/// The lower halves of both vectors, those of a first, and the upper halves.
inline void PairHalves(F32 a, F32 b, F32& lower, F32& upper) {
    lower = {{a.lane[0], a.lane[1], b.lane[0], b.lane[1]}};
    upper = {{a.lane[2], a.lane[3], b.lane[2], b.lane[3]}};
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
    I32 pixels;
    for (int i = 0; i < kLanes; ++i)
        pixels.lane[i] = Saturate(c0.lane[i], 255) | Saturate(c1.lane[i], 255) << 8 |
                         Saturate(c2.lane[i], 255) << 16 | Saturate(c3.lane[i], 255) << 24;
    return pixels;
}

/// The lanes of a and b at even places, a first, and those at odd places.
inline void SeparateLanes(I32 a, I32 b, I32& even, I32& odd) {
    for (int i = 0; i < kLanes / 2; ++i) {
        even.lane[i] = a.lane[2 * i];
        odd.lane[i] = a.lane[2 * i + 1];
        even.lane[i + kLanes / 2] = b.lane[2 * i];
        odd.lane[i + kLanes / 2] = b.lane[2 * i + 1];
    }
}

/// The same of bytes: those of a and b at even places, a first, and those at odd places.
inline void SeparateBytes(I32 a, I32 b, I32& even, I32& odd) {
    uint8_t from[32], parted[2][16];
    Store(from, a);
    Store(from + 16, b);
    for (int i = 0; i < 32; ++i) parted[i % 2][i / 2] = from[i];
    even = LoadInts(parted[0]);
    odd = LoadInts(parted[1]);
}

/// The lanes of `lanes` moved up by one, with the last lane of `before` in front.
inline I32 ShiftInLane(I32 before, I32 lanes) {
    return {{before.lane[kLanes - 1], lanes.lane[0], lanes.lane[1], lanes.lane[2]}};
}

/// The operation on the two 16-bit halves of each lane.
template <class Operation>
inline I32 MapHalves(I32 a, I32 b, Operation operation) {
    return Map<I32>(a, b, [operation](uint32_t x, uint32_t y) {
        return (operation(x & 0xffff, y & 0xffff) & 0xffff) | operation(x >> 16, y >> 16) << 16;
    });
}
/// The high 16 bits of the product of each 16-bit half with its counterpart, both without sign.
inline I32 MultiplyHalvesHigh(I32 a, I32 b) {
    return MapHalves(a, b, [](uint32_t x, uint32_t y) { return x * y >> 16; });
}
/// The mean of each 16-bit half and its counterpart, both without sign, rounded up.
inline I32 AverageHalves(I32 a, I32 b) {
    return MapHalves(a, b, [](uint32_t x, uint32_t y) { return (x + y + 1) >> 1; });
}
/// The sum of each byte and its counterpart, at most 255.
inline I32 AddBytes(I32 a, I32 b) {
    uint8_t bytes[16], others[16];
    Store(bytes, a);
    Store(others, b);
    for (int i = 0; i < 16; ++i) bytes[i] = static_cast<uint8_t>(Saturate(bytes[i] + others[i], 255));
    return LoadInts(bytes);
}
/// The lesser of each 16-bit half and its counterpart; both are below 32768.
inline I32 MinHalves(I32 a, I32 b) {
    return MapHalves(a, b, [](uint32_t x, uint32_t y) { return x < y ? x : y; });
}
/// The operation on the four bytes of each lane.
template <class Operation>
inline I32 MapBytes(I32 a, I32 b, Operation operation) {
    uint8_t x[16], y[16];
    Store(x, a);
    Store(y, b);
    for (int i = 0; i < 16; ++i) x[i] = operation(x[i], y[i]);
    return LoadInts(x);
}
/// The lesser and the greater of each byte and its counterpart, both without sign.
inline I32 MinBytes(I32 a, I32 b) {
    return MapBytes(a, b, [](uint8_t x, uint8_t y) { return x < y ? x : y; });
}
inline I32 MaxBytes(I32 a, I32 b) {
    return MapBytes(a, b, [](uint8_t x, uint8_t y) { return x > y ? x : y; });
}
/// In each block of 16 bytes, the bytes of `table` that the bytes of `places`, 0 to 15, point to.
inline I32 LookUpBytes(I32 table, I32 places) {
    uint8_t from[16], bytes[16];
    Store(from, table);
    Store(bytes, places);
    for (uint8_t& byte : bytes) byte = from[byte];
    return LoadInts(bytes);
}
/// Twice the products of unsigned bytes of `a` with signed bytes of `b`, in 16-bit halves in their order. They
/// must fit.
inline void DoubleByteProducts(I32 a, I32 b, I32& first, I32& second) {
    uint8_t unsignedBytes[16];
    int8_t signedBytes[16];
    int16_t products[16];
    Store(unsignedBytes, a);
    Store(signedBytes, b);
    for (int i = 0; i < 16; ++i) products[i] = static_cast<int16_t>(2 * unsignedBytes[i] * signedBytes[i]);
    first = LoadInts(products);
    second = LoadInts(products + 8);
}
/// Swaps the two bytes of each 16-bit half.
inline I32 SwapBytes(I32 a) {
    return (ShiftLeft<8>(a) & Ints(static_cast<int32_t>(0xff00ff00))) | (ShiftRight<8>(a) & Ints(0x00ff00ff));
}
/// Reverses the four 16-bit halves of each pair of lanes.
inline I32 ReverseHalves(I32 a) {
    const I32 swapped = ShiftLeft<16>(a) | ShiftRight<16>(a);
    return ShufflePixel<1, 0, 3, 2>(swapped);
}
/// 2 x kLanes bytes, each to a 16-bit half.
inline I32 LoadBytesAsHalves(const void* source) {
    uint8_t bytes[2 * kLanes];
    std::memcpy(bytes, source, sizeof bytes);
    I32 result;
    for (int i = 0; i < kLanes; ++i)
        result.lane[i] = static_cast<uint32_t>(bytes[2 * i] | bytes[2 * i + 1] << 16);
    return result;
}
/// The 16-bit halves of two vectors to bytes in their order; the halves are below 32768 and saturate.
inline I32 PackHalves(I32 a, I32 b) {
    const auto pack = [](uint32_t x) { return Saturate(x & 0xffff, 255) | Saturate(x >> 16, 255) << 8; };
    I32 result;
    for (int i = 0; i < kLanes; ++i) {
        const uint32_t* pair = i < kLanes / 2 ? a.lane + 2 * i : b.lane + (2 * i - kLanes);
        result.lane[i] = pack(pair[0]) | pack(pair[1]) << 16;
    }
    return result;
}
/// The lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanes(I32 a, I32 b, I32 c, I32 d) {
    I32 result;
    StoreBytes(result.lane, a);
    StoreBytes(result.lane + 1, b);
    StoreBytes(result.lane + 2, c);
    StoreBytes(result.lane + 3, d);
    return result;
}
/// The lanes of two vectors, each from 0 to 65535, to 16-bit halves in their order.
inline I32 PackLanesToHalves(I32 a, I32 b) {
    I32 result;
    StoreWords(result.lane, a);
    StoreWords(result.lane + kLanes / 2, b);
    return result;
}
/// The lanes of two vectors to signed 16-bit halves in their order, saturated.
inline I32 PackSignedLanes(I32 a, I32 b) {
    int16_t halves[2 * kLanes];
    for (int i = 0; i < 2 * kLanes; ++i) {
        const auto lane = static_cast<int32_t>(i < kLanes ? a.lane[i] : b.lane[i - kLanes]);
        halves[i] = static_cast<int16_t>(lane < INT16_MIN ? INT16_MIN : lane > INT16_MAX ? INT16_MAX : lane);
    }
    return LoadInts(halves);
}
/// Lanes for even and for odd places to 2 x kLanes interleaved lanes.
inline void StoreLanePairs(void* destination, I32 even, I32 odd) {
    uint32_t lanes[2 * kLanes];
    for (int i = 0; i < kLanes; ++i) {
        lanes[2 * i] = even.lane[i];
        lanes[2 * i + 1] = odd.lane[i];
    }
    std::memcpy(destination, lanes, sizeof lanes);
}

struct F64 {
    double lane[kLanes];
};

struct I64 {
    uint64_t lane[kLanes];
};

inline F64 Doubles(double x) {
    return {{x, x, x, x}};
}
inline I64 Longs(int64_t x) {
    const auto bits = static_cast<uint64_t>(x);
    return {{bits, bits, bits, bits}};
}
inline F64 operator+(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x + y; });
}
inline F64 operator-(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x - y; });
}
inline F64 operator*(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x * y; });
}
inline F64 operator/(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x / y; });
}
inline F64 Min(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x < y ? x : y; });
}
inline F64 Max(F64 a, F64 b) {
    return Map<F64>(a, b, [](double x, double y) { return x > y ? x : y; });
}
inline I64 operator+(I64 a, I64 b) {
    return Map<I64>(a, b, [](uint64_t x, uint64_t y) { return x + y; });
}
inline I64 operator&(I64 a, I64 b) {
    return Map<I64>(a, b, [](uint64_t x, uint64_t y) { return x & y; });
}
template <int kBits>
inline I64 ShiftLeft(I64 a) {
    return Map<I64>(a, [](uint64_t x) { return x << kBits; });
}
template <int kBits>
inline I64 ShiftRight(I64 a) {
    return Map<I64>(a, [](uint64_t x) { return x >> kBits; });
}
inline I64 Bits(F64 a) {
    return LoadVector<I64>(&a);
}
inline F64 FromBits(I64 a) {
    return LoadVector<F64>(&a);
}
inline F64 ToDouble(F32 a) {
    return Map<F64>(a, [](float x) { return static_cast<double>(x); });
}
inline F32 ToFloat(F64 a) {
    return Map<F32>(a, [](double x) { return static_cast<float>(x); });
}
inline F64 ToDouble(I32 a) {
    return Map<F64>(a, [](uint32_t x) { return static_cast<double>(static_cast<int32_t>(x)); });
}
inline I32 Truncate(F64 a) {
    return Map<I32>(a, [](double x) { return static_cast<uint32_t>(_mm_cvttsd_si32(_mm_set_sd(x))); });
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
    low = {{a.lane[0], b.lane[0], a.lane[1], b.lane[1]}};
    high = {{a.lane[2], b.lane[2], a.lane[3], b.lane[3]}};
}

/// The same with 16-bit halves: a0 b0 to a3 b3 and a4 b4 to a7 b7.
inline void InterleaveHalvesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    for (int i = 0; i < kLanes; ++i) {
        I32& result = i < kLanes / 2 ? low : high;
        const int lane = 2 * i % kLanes;
        result.lane[lane] = (a.lane[i] & 0xffff) | b.lane[i] << 16;
        result.lane[lane + 1] = a.lane[i] >> 16 | (b.lane[i] & 0xffff0000);
    }
}
/// The same with bytes: a0 b0 to a7 b7 and a8 b8 to a15 b15.
inline void InterleaveBytesInBlocks(I32 a, I32 b, I32& low, I32& high) {
    uint8_t from[2][16], bytes[32];
    Store(from[0], a);
    Store(from[1], b);
    for (int i = 0; i < 32; ++i) bytes[i] = from[i % 2][i / 2];
    low = LoadInts(bytes);
    high = LoadInts(bytes + 16);
}
/// In each block: the lanes of a and then those of b, saturated to signed 16-bit halves.
inline I32 PackSignedInBlocks(I32 a, I32 b) {
    const I32 low = Ints(-32768), high = Ints(32767);
    I32 result;
    StoreWords(result.lane, Min(Max(a, low), high));
    StoreWords(result.lane + kLanes / 2, Min(Max(b, low), high));
    return result;
}

/// Three lanes a block, which stand in memory without a gap; loading leaves the fourth 0.
inline I32 LoadThrees(const void* source) {
    I32 result = Ints(0);
    std::memcpy(&result, source, 12);
    return result;
}
inline void StoreThrees(void* destination, I32 a) {
    std::memcpy(destination, &a, 12);
}
/// Six lanes a block: four of `low` and the first two of `high`.
inline void StoreSixes(void* destination, I32 low, I32 high) {
    Store(destination, low);
    std::memcpy(static_cast<uint8_t*>(destination) + 16, &high, 8);
}
/// Groups of four 16-bit halves, one for each lane: two halves of `pair` and the lower half of `third`. The fourth of
/// each group is neither read nor written.
inline void StoreThreeOfFourHalves(void* destination, I32 pair, I32 third) {
    auto* bytes = static_cast<uint8_t*>(destination);
    for (int i = 0; i < kLanes; ++i) {
        std::memcpy(bytes + 8 * i, &pair.lane[i], 4);
        std::memcpy(bytes + 8 * i + 4, &third.lane[i], 2);
    }
}

/// The 16 bits that start at each of eight byte offsets in a block.
template <int... kOffsets>
inline I32 HalvesAt(I32 a) {
    uint8_t bytes[16];
    Store(bytes, a);
    const int offsets[8] = {kOffsets...};
    uint16_t halves[8];
    for (int i = 0; i < 8; ++i) std::memcpy(&halves[i], bytes + offsets[i], 2);
    return LoadInts(halves);
}

/// Whether the highest bit of any lane is set.
inline bool AnyNegative(I32 a) {
    return ((a.lane[0] | a.lane[1] | a.lane[2] | a.lane[3]) >> 31) != 0;
}

/// A bit for each byte, the lowest for the first: set where the byte is not 0.
inline uint64_t NonZeroBytes(I32 a) {
    uint8_t bytes[4 * kLanes];
    Store(bytes, a);
    uint64_t bits = 0;
    for (int i = 0; i < 4 * kLanes; ++i) bits |= uint64_t{bytes[i] != 0} << i;
    return bits;
}

/// Two four-byte pixels side by side for each block, from places of any alignment: block i has its first at
/// index[4 x i], in pixels. Their bytes go to lanes, a pixel a block.
inline void LoadPixelPairs(const uint8_t* pixels, const int32_t* index, I32& first, I32& second) {
    first = LoadBytes(pixels + 4 * int64_t{*index});
    second = LoadBytes(pixels + 4 * int64_t{*index} + 4);
}

/// In each block, the lanes of four vectors to bytes in their order, saturated.
inline I32 PackLanesInBlocks(I32 a, I32 b, I32 c, I32 d) {
    return PackLanes(a, b, c, d);
}

/// In each lane, the sum of the products of its two signed 16-bit halves with their counterparts.
inline I32 MultiplyAddHalves(I32 a, I32 b) {
    return Map<I32>(a, b, [](uint32_t x, uint32_t y) {
        const auto low = static_cast<int16_t>(x) * static_cast<int16_t>(y);
        const auto high = static_cast<int16_t>(x >> 16) * static_cast<int16_t>(y >> 16);
        return static_cast<uint32_t>(low) + static_cast<uint32_t>(high);
    });
}

/// In each block, the lanes of `a` whose bits are set in kMask, lane 0 the lowest, and the others of `b`.
template <int kMask>
inline I32 BlendBlocks(I32 a, I32 b) {
    I32 result = b;
    for (int i = 0; i < kLanes; ++i)
        if (kMask >> i & 1) result.lane[i] = a.lane[i];
    return result;
}
template <int kMask>
inline F32 BlendBlocks(F32 a, F32 b) {
    return FromBits(BlendBlocks<kMask>(Bits(a), Bits(b)));
}

/// In each block: a0 a1 b0 b1 and a2 a3 b2 b3.
inline F32 LowPairs(F32 a, F32 b) {
    return {{a.lane[0], a.lane[1], b.lane[0], b.lane[1]}};
}
inline F32 HighPairs(F32 a, F32 b) {
    return {{a.lane[2], a.lane[3], b.lane[2], b.lane[3]}};
}

/// All lanes in the other order.
inline I32 ReverseLanes(I32 a) {
    return ShufflePixel<3, 2, 1, 0>(a);
}

/// Two lanes side by side for each lane, from any places: lane i has its two at offsets[i], in bytes.
inline void LoadLanePairsAt(const uint8_t* base, const int64_t* offsets, I32& first, I32& second) {
    for (int i = 0; i < kLanes; ++i) {
        std::memcpy(&first.lane[i], base + offsets[i], 4);
        std::memcpy(&second.lane[i], base + offsets[i] + 4, 4);
    }
}

} // namespace PK::plain

#include "primitives/simd/OneBlock.h"
