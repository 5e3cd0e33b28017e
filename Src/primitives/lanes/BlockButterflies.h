#pragma once

// The butterflies of the cosine transforms of 8 x 8 blocks (BlockTransforms.h), and how a block goes through them.
//
// A transform of the columns is a butterfly on eight vectors that hold a line each, one of the lines the same
// on vectors that hold a column each. Between the two the block is transposed, and again at the end, after the
// rounding, when a value has 16 bits.

#include "primitives/simd/Target.h"

#include <cstring>

namespace PK::PK_TARGET {

inline constexpr int kSide = 8;

inline constexpr float kCos1 = 0x1.f6297cp-2f; // cos(1 pi / 16) / 2
inline constexpr float kCos2 = 0x1.d906bcp-2f; // cos(2 pi / 16) / 2
inline constexpr float kCos3 = 0x1.a9b662p-2f; // and so on
inline constexpr float kCos4 = 0x1.6a09e6p-2f; // also 1 / sqrt(8)
inline constexpr float kCos5 = 0x1.1c73b4p-2f;
inline constexpr float kCos6 = 0x1.87de2ap-3f;
inline constexpr float kCos7 = 0x1.8f8b84p-4f;

struct Four {
    F32 v0, v1, v2, v3;
};

/// C(u) times the sum over z of x(z) cos(pi u (2z + 1) / 8), for u = 0 to 3: the even coefficients of the
/// transform of eight values, from their sums in pairs, and either half of the lines of the 2-4-8 transform.
inline Four ForwardFour(Four x) {
    const F32 outerSum = x.v0 + x.v3, innerSum = x.v1 + x.v2;
    const F32 outer = x.v0 - x.v3, inner = x.v1 - x.v2;
    const F32 cos2 = Floats(kCos2), cos4 = Floats(kCos4), cos6 = Floats(kCos6);
    return {(outerSum + innerSum) * cos4, outer * cos2 + inner * cos6, (outerSum - innerSum) * cos4,
            outer * cos6 - inner * cos2};
}

/// The transpose of ForwardFour.
inline Four InverseFour(Four x) {
    const F32 cos2 = Floats(kCos2), cos4 = Floats(kCos4), cos6 = Floats(kCos6);
    const F32 outerSum = (x.v0 + x.v2) * cos4, innerSum = (x.v0 - x.v2) * cos4;
    const F32 outer = x.v1 * cos2 + x.v3 * cos6, inner = x.v1 * cos6 - x.v3 * cos2;
    return {outerSum + outer, innerSum + inner, innerSum - inner, outerSum - outer};
}

/// The sum over z of x(z) cos(pi (2u + 1)(2z + 1) / 16) / 2, for u = 0 to 3: the odd coefficients of the
/// transform of eight values, from their differences in pairs. It is its own transpose.
inline Four Odd(Four x) {
    const F32 cos1 = Floats(kCos1), cos3 = Floats(kCos3), cos5 = Floats(kCos5), cos7 = Floats(kCos7);
    return {(x.v0 * cos1 + x.v1 * cos3) + (x.v2 * cos5 + x.v3 * cos7),
            (x.v0 * cos3 - x.v1 * cos7) - (x.v2 * cos1 + x.v3 * cos5),
            (x.v0 * cos5 - x.v1 * cos1) + (x.v2 * cos7 + x.v3 * cos3),
            (x.v0 * cos7 - x.v1 * cos5) + (x.v2 * cos3 - x.v3 * cos1)};
}

inline Four operator+(Four a, Four b) {
    return {a.v0 + b.v0, a.v1 + b.v1, a.v2 + b.v2, a.v3 + b.v3};
}
inline Four operator-(Four a, Four b) {
    return {a.v0 - b.v0, a.v1 - b.v1, a.v2 - b.v2, a.v3 - b.v3};
}

inline Four EvenPlaces(const F32 (&x)[kSide]) {
    return {x[0], x[2], x[4], x[6]};
}
inline Four OddPlaces(const F32 (&x)[kSide]) {
    return {x[1], x[3], x[5], x[7]};
}
inline void Interleave(Four even, Four odd, F32 (&x)[kSide]) {
    x[0] = even.v0, x[1] = odd.v0, x[2] = even.v1, x[3] = odd.v1;
    x[4] = even.v2, x[5] = odd.v2, x[6] = even.v3, x[7] = odd.v3;
}
/// The eight in the order 0, 1, 2, 3 and 7, 6, 5, 4.
inline Four FirstHalf(const F32 (&x)[kSide]) {
    return {x[0], x[1], x[2], x[3]};
}
inline Four SecondHalfReversed(const F32 (&x)[kSide]) {
    return {x[7], x[6], x[5], x[4]};
}
inline Four SecondHalf(const F32 (&x)[kSide]) {
    return {x[4], x[5], x[6], x[7]};
}

struct ForwardEight {
    static void Apply(F32 (&x)[kSide]) {
        const Four first = FirstHalf(x), second = SecondHalfReversed(x);
        Interleave(ForwardFour(first + second), Odd(first - second), x);
    }
};

struct InverseEight {
    static void Apply(F32 (&x)[kSide]) {
        const Four even = InverseFour(EvenPlaces(x)), odd = Odd(OddPlaces(x));
        const Four first = even + odd, second = even - odd;
        x[0] = first.v0, x[1] = first.v1, x[2] = first.v2, x[3] = first.v3;
        x[4] = second.v3, x[5] = second.v2, x[6] = second.v1, x[7] = second.v0;
    }
};

/// Sums and differences of the lines of two fields.
struct ForwardFields {
    static void Apply(F32 (&x)[kSide]) {
        const Four upper = EvenPlaces(x), lower = OddPlaces(x);
        const Four sums = ForwardFour(upper + lower), differences = ForwardFour(upper - lower);
        x[0] = sums.v0, x[1] = sums.v1, x[2] = sums.v2, x[3] = sums.v3;
        x[4] = differences.v0, x[5] = differences.v1, x[6] = differences.v2, x[7] = differences.v3;
    }
};

struct InverseFields {
    static void Apply(F32 (&x)[kSide]) {
        const Four sums = InverseFour(FirstHalf(x)), differences = InverseFour(SecondHalf(x));
        Interleave(sums + differences, sums - differences, x);
    }
};

/// Four columns to 16 bits, saturated, and to lines: the first two lines of each block of lanes, then the others.
inline void PackFourColumns(const F32* columns, F32& firstTwo, F32& lastTwo) {
    const I32 even = PackSignedInBlocks(Nearest(columns[0]), Nearest(columns[2]));
    const I32 odd = PackSignedInBlocks(Nearest(columns[1]), Nearest(columns[3]));
    I32 left, right, low, high;
    InterleaveHalvesInBlocks(even, odd, left, right);
    InterleaveInBlocks(left, right, low, high);
    firstTwo = FromBits(low);
    lastTwo = FromBits(high);
}

/// Rounds eight columns by the current rounding mode and stores them as lines: first those on place 0 of each
/// block of lanes, then those on place 1 and so on.
[[maybe_unused]] inline void StoreLines(const F32 (&columns)[kSide], int16_t* lines) {
    constexpr int kValues = 2 * kLanes; // of a vector
    F32 left[2], right[2];
    PackFourColumns(columns, left[0], left[1]);
    PackFourColumns(columns + 4, right[0], right[1]);
    Store(lines, LowPairs(left[0], right[0]));
    Store(lines + kValues, HighPairs(left[0], right[0]));
    Store(lines + 2 * kValues, LowPairs(left[1], right[1]));
    Store(lines + 3 * kValues, HighPairs(left[1], right[1]));
}

/// For eight lanes. Turns vectors that hold a line each into vectors that hold a column each, with the lines in
/// the order 0, 2, 4, 6, 1, 3, 5, 7, in which StoreLines stores them one after the other.
[[maybe_unused]] inline void TransposeBlock(F32 (&x)[kSide]) {
    TransposePixels(x[0], x[2], x[4], x[6]);
    TransposePixels(x[1], x[3], x[5], x[7]);
    F32 columns[kSide];
    for (int i = 0; i < kSide / 2; ++i) PairHalves(x[2 * i], x[2 * i + 1], columns[i], columns[i + 4]);
    for (int i = 0; i < kSide; ++i) x[i] = columns[i];
}

/// The lines of a block as they are.
struct PlainLines {
    const int16_t* block;

    F32 Load(int line, int column = 0) const {
        return ToFloat(LoadSignedWords(block + kSide * line + column));
    }
    F32 Finish(F32 samples) const { return samples; }
};

template <class ColumnButterfly, class LineButterfly, class Lines>
inline void TransformInRegisters(const Lines& source, int16_t* destination) {
    F32 vectors[kSide];
    for (int i = 0; i < kSide; ++i) vectors[i] = source.Load(i);
    ColumnButterfly::Apply(vectors);
    TransposeBlock(vectors);
    LineButterfly::Apply(vectors);
    for (F32& vector : vectors) vector = source.Finish(vector);
    StoreLines(vectors, destination);
}

/// For four lanes, which are half a line. In between, the block lies in memory as two panels of four columns, in
/// which the four values of a line stand together: loading them like interleaved pixels transposes it.
template <class ColumnButterfly, class LineButterfly, class Lines>
inline void TransformInPanels(const Lines& source, int16_t* destination) {
    constexpr int kPanel = kLanes * kSide;
    alignas(64) float panels[2 * kPanel];
    for (int half = 0; half < 2; ++half) {
        F32 lines[kSide];
        for (int i = 0; i < kSide; ++i) lines[i] = source.Load(i, kLanes * half);
        ColumnButterfly::Apply(lines);
        for (int i = 0; i < kSide; ++i) Store(panels + kPanel * half + kLanes * i, lines[i]);
    }
    for (int line = 0; line < kSide; line += kLanes) {
        const float* left = panels + kLanes * line;
        const float* right = left + kPanel;
        F32 columns[kSide];
        LoadFloatChannels(left, columns[0], columns[1], columns[2], columns[3]);
        LoadFloatChannels(right, columns[4], columns[5], columns[6], columns[7]);
        LineButterfly::Apply(columns);
        for (F32& column : columns) column = source.Finish(column);
        StoreLines(columns, destination + kSide * line);
    }
}

/// \param source  gives the lines of a block, whole or in halves, and has the last word on samples before they are rounded.
template <class ColumnButterfly, class LineButterfly, class Lines>
inline void TransformBlock(const Lines& source, int16_t* destination) {
    if constexpr (kLanes < kSide)
        TransformInPanels<ColumnButterfly, LineButterfly>(source, destination);
    else
        TransformInRegisters<ColumnButterfly, LineButterfly>(source, destination);
}

/// A block for each block of lanes: all four of them with sixteen lanes. The lines of the blocks stand beside each other, in
/// vectors of four even and of four odd columns, so that no vector mixes blocks and nothing crosses from one to the other.
/// \param source  gives a line of all blocks, even columns and odd ones apart.
/// \param stride  bytes from one block of the destination to the next.
template <class ColumnButterfly, class LineButterfly, class Lines>
inline void TransformBlocksOfLanes(const Lines& source, int16_t* destination, int64_t stride) {
    F32 even[kSide], odd[kSide];
    for (int i = 0; i < kSide; ++i) source.Load(i, even[i], odd[i]);
    ColumnButterfly::Apply(even);
    ColumnButterfly::Apply(odd);
    for (int line = 0; line < kSide; line += 4) {
        TransposePixels(even[line], even[line + 1], even[line + 2], even[line + 3]);
        TransposePixels(odd[line], odd[line + 1], odd[line + 2], odd[line + 3]);
        F32 columns[kSide];
        for (int i = 0; i < 4; ++i) {
            columns[2 * i] = even[line + i];
            columns[2 * i + 1] = odd[line + i];
        }
        LineButterfly::Apply(columns);
        for (F32& column : columns) column = source.Finish(column);
        F32 left[2], right[2];
        PackFourColumns(columns, left[0], left[1]);
        PackFourColumns(columns + 4, right[0], right[1]);
        int16_t* const lines = destination + kSide * line;
        for (int i = 0; i < 2; ++i) {
            StoreFloatBlocks(lines + 2 * kSide * i, stride, LowPairs(left[i], right[i]));
            StoreFloatBlocks(lines + (2 * i + 1) * kSide, stride, HighPairs(left[i], right[i]));
        }
    }
}

/// Half the size, of the first four coefficients of the first four lines: the columns, then the lines.
template <class Lines>
inline void ReduceBlock(const Lines& source, int16_t* destination) {
    Four x = InverseFour({source.Load(0), source.Load(1), source.Load(2), source.Load(3)});
    TransposePixels(x.v0, x.v1, x.v2, x.v3);
    x = InverseFour(x);
    TransposePixels(x.v0, x.v1, x.v2, x.v3);
    alignas(64) int16_t lines[2][2 * kLanes];
    Store(lines[0], PackSignedInBlocks(Nearest(source.Finish(x.v0)), Nearest(source.Finish(x.v1))));
    Store(lines[1], PackSignedInBlocks(Nearest(source.Finish(x.v2)), Nearest(source.Finish(x.v3))));
    for (int i = 0; i < 2; ++i) std::memcpy(destination + kSide * i, lines[i], kSide * sizeof(int16_t));
}

} // namespace PK::PK_TARGET
