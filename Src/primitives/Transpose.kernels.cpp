// Transposition in tiles: a tile takes as many source rows as fill a vector, and one block of four lanes from each.
// Its transposed vectors are runs of destination rows. Tiles are moved in blocks, whose largest sizes are measured.

#include "primitives/TransposeKernels.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

/// Rows of the pixels that fill a block, one a vector, to columns. To interleave every row with the one half the rows
/// on turns the bits of a pixel's place, those of its row before those of its column, by one.
template <void kInterleave(I32, I32, I32&, I32&), int kSide>
inline void TransposeBlocks(I32 (&rows)[kSide]) {
    for (int bit = 1; bit < kSide; bit *= 2) {
        I32 turned[kSide];
        for (int i = 0; i < kSide / 2; ++i)
            kInterleave(rows[i], rows[i + kSide / 2], turned[2 * i], turned[2 * i + 1]);
        for (int i = 0; i < kSide; ++i) rows[i] = turned[i];
    }
}

/// As many rows in each block as pixels.
template <int32_t kBytes, void kInterleave(I32, I32, I32&, I32&)>
struct SquareTile {
    static constexpr int32_t kPixelBytes = kBytes, kColumns = 16 / kBytes, kRows = kColumns * kLanes / 4;
    static constexpr int32_t kBlockRows = 64 / kBytes, kBlockColumns = 2 * kColumns;

    static void Move(const uint8_t* source, int64_t sourceStep, uint8_t* destination,
                     int64_t destinationStep) {
        I32 pixels[kColumns];
        for (int32_t row = 0; row < kColumns; ++row)
            pixels[row] = Bits(LoadFloatBlocks(source + row * sourceStep, kColumns * sourceStep));
        TransposeBlocks<kInterleave>(pixels);
        for (int32_t column = 0; column < kColumns; ++column)
            Store(destination + column * destinationStep, pixels[column]);
    }
};

using Tile1 = SquareTile<1, InterleaveBytesInBlocks>;
using Tile2 = SquareTile<2, InterleaveHalvesInBlocks>;

struct Tile4 {
    static constexpr int32_t kPixelBytes = 4, kRows = kLanes, kColumns = 4;
    static constexpr int32_t kBlockRows = 16, kBlockColumns = 8;

    static void Move(const uint8_t* source, int64_t sourceStep, uint8_t* destination,
                     int64_t destinationStep) {
        F32 a = LoadFloatBlocks(source, 4 * sourceStep);
        F32 b = LoadFloatBlocks(source + sourceStep, 4 * sourceStep);
        F32 c = LoadFloatBlocks(source + 2 * sourceStep, 4 * sourceStep);
        F32 d = LoadFloatBlocks(source + 3 * sourceStep, 4 * sourceStep);
        TransposePixels(a, b, c, d);
        Store(destination, a);
        Store(destination + destinationStep, b);
        Store(destination + 2 * destinationStep, c);
        Store(destination + 3 * destinationStep, d);
    }
};

struct Tile8 {
    static constexpr int32_t kPixelBytes = 8, kRows = kLanes / 2, kColumns = 2;
    static constexpr int32_t kBlockRows = 16, kBlockColumns = 8;

    static void Move(const uint8_t* source, int64_t sourceStep, uint8_t* destination,
                     int64_t destinationStep) {
        const F32 even = LoadFloatBlocks(source, 2 * sourceStep);
        const F32 odd = LoadFloatBlocks(source + sourceStep, 2 * sourceStep);
        Store(destination, LowPairs(even, odd));
        Store(destination + destinationStep, HighPairs(even, odd));
    }
};

/// As many columns as share a cache line.
struct Tile16 {
    static constexpr int32_t kPixelBytes = 16, kRows = kLanes / 4, kColumns = 4;
    static constexpr int32_t kBlockRows = 32, kBlockColumns = 32;

    static void Move(const uint8_t* source, int64_t sourceStep, uint8_t* destination,
                     int64_t destinationStep) {
        for (int32_t column = 0; column < kColumns; ++column)
            Store(destination + column * destinationStep,
                  LoadFloatBlocks(source + column * kPixelBytes, sourceStep));
    }
};

/// One pixel after the other. As many rows at a time as keep the columns' cache lines.
template <int32_t kPixelBytes>
void TransposePixelwise(const TransposeArea& area) {
    constexpr int32_t kRows = 16;
    for (int32_t top = 0; top < area.rows; top += kRows)
        for (int32_t column = 0; column < area.columns; ++column)
            for (int32_t row = top; row < top + kRows && row < area.rows; ++row)
                std::memcpy(area.destination + column * area.destinationStep + int64_t{row} * kPixelBytes,
                            area.source + row * area.sourceStep + int64_t{column} * kPixelBytes, kPixelBytes);
}

inline int32_t Lesser(int32_t a, int32_t b) {
    return a < b ? a : b;
}

/// A part of the area. The last tiles of the area end with its last row and column, and overlap those before them.
template <class Tile>
void TransposeBlock(const TransposeArea& area, int32_t firstRow, int32_t endRow, int32_t firstColumn,
                    int32_t endColumn) {
    for (int32_t tileColumn = firstColumn; tileColumn < endColumn; tileColumn += Tile::kColumns) {
        const int32_t column = Lesser(tileColumn, area.columns - Tile::kColumns);
        for (int32_t tileRow = firstRow; tileRow < endRow; tileRow += Tile::kRows) {
            const int32_t row = Lesser(tileRow, area.rows - Tile::kRows);
            Tile::Move(area.source + row * area.sourceStep + int64_t{column} * Tile::kPixelBytes,
                       area.sourceStep,
                       area.destination + column * area.destinationStep + int64_t{row} * Tile::kPixelBytes,
                       area.destinationStep);
        }
    }
}

/// In blocks that use up cache lines of both images while they are in the cache. Blocks follow one another down the
/// rows: few destination rows are written at a time, and each goes on where it was left.
template <class Tile>
void Transpose(const TransposeArea& area) {
    // Without vectors, pixels smaller than a lane are not worth gathering in lanes.
    constexpr bool kAreWorthTiles = kTarget != Target::plain || Tile::kPixelBytes >= 4;
    if (!kAreWorthTiles || area.rows < Tile::kRows || area.columns < Tile::kColumns)
        return TransposePixelwise<Tile::kPixelBytes>(area);
    // A source row of one cache line is read once.
    const bool areRowsOneLine = area.columns <= 64 / Tile::kPixelBytes;
    const int32_t blockColumns = areRowsOneLine ? area.columns : Tile::kBlockColumns;
    for (int32_t column = 0; column < area.columns; column += blockColumns)
        for (int32_t row = 0; row < area.rows; row += Tile::kBlockRows)
            TransposeBlock<Tile>(area, row, Lesser(row + Tile::kBlockRows, area.rows), column,
                                 Lesser(column + blockColumns, area.columns));
}

void ReverseRow(const void* sourceRow, void* destinationRow, int32_t width) {
    const auto* source = static_cast<const uint8_t*>(sourceRow) + int64_t{width} * 4;
    auto* destination = static_cast<uint8_t*>(destinationRow);
    for (; width >= kLanes; width -= kLanes) {
        source -= 4 * kLanes;
        Store(destination, ReverseLanes(LoadInts(source)));
        destination += 4 * kLanes;
    }
    for (; width > 0; --width) {
        source -= 4;
        std::memcpy(destination, source, 4);
        destination += 4;
    }
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::TransposeKernels& PK::TransposeKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr TransposeKernels kernels = {Transpose<Tile1>, Transpose<Tile2>,  Transpose<Tile4>,
                                                 Transpose<Tile8>, Transpose<Tile16>, ReverseRow};
    return kernels;
}
