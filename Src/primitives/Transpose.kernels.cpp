// Transposition in tiles: a tile takes as many source rows as fill a vector, and one block of four lanes from each.
// Its transposed vectors are runs of destination rows.

#include "primitives/TransposeKernels.h"
#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {
namespace {

/// Source rows that are walked together. A cache line of each stays in the cache while the columns go by, and
/// destination rows are written in runs of whole lines.
inline constexpr int32_t kBandRows = 16;

struct Tile4 {
    static constexpr int32_t kPixelBytes = 4, kRows = kLanes, kColumns = 4;

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

    static void Move(const uint8_t* source, int64_t sourceStep, uint8_t* destination,
                     int64_t destinationStep) {
        for (int32_t column = 0; column < kColumns; ++column)
            Store(destination + column * destinationStep,
                  LoadFloatBlocks(source + column * kPixelBytes, sourceStep));
    }
};

/// Rows and columns that fill no tile.
template <class Tile>
void MoveRim(const TransposeArea& area, int32_t firstRow, int32_t lastRow, int32_t firstColumn) {
    for (int32_t column = firstColumn; column < area.columns; ++column)
        for (int32_t row = firstRow; row < lastRow; ++row)
            std::memcpy(area.destination + column * area.destinationStep + int64_t{row} * Tile::kPixelBytes,
                        area.source + row * area.sourceStep + int64_t{column} * Tile::kPixelBytes,
                        Tile::kPixelBytes);
}

template <class Tile>
void Transpose(const TransposeArea& area) {
    const int32_t tiledColumns = area.columns - area.columns % Tile::kColumns;
    const int32_t tiledRows = area.rows - area.rows % Tile::kRows;
    for (int32_t band = 0; band < tiledRows; band += kBandRows) {
        const int32_t bandEnd = band + kBandRows < tiledRows ? band + kBandRows : tiledRows;
        for (int32_t column = 0; column < tiledColumns; column += Tile::kColumns)
            for (int32_t row = band; row < bandEnd; row += Tile::kRows)
                Tile::Move(area.source + row * area.sourceStep + int64_t{column} * Tile::kPixelBytes,
                           area.sourceStep,
                           area.destination + column * area.destinationStep +
                               int64_t{row} * Tile::kPixelBytes,
                           area.destinationStep);
        MoveRim<Tile>(area, band, bandEnd, tiledColumns);
    }
    MoveRim<Tile>(area, tiledRows, area.rows, 0);
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
    static constexpr TransposeKernels kernels = {Transpose<Tile4>, Transpose<Tile8>, Transpose<Tile16>,
                                                 ReverseRow};
    return kernels;
}
