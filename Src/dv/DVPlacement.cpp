#include "dv/DVPlacement.h"

namespace PK {
namespace {

// Of the five macroblocks of a segment: the super block's column, and how many of its rows further on it lies.
constexpr int32_t kColumns[kMacroblocksOfSegment] = {2, 1, 3, 0, 4};
constexpr int32_t kRowsOn[kMacroblocksOfSegment] = {2, 6, 8, 0, 4};

constexpr DVPlace At(int32_t x, int32_t y, DVShape shape) {
    return {static_cast<int16_t>(x), static_cast<int16_t>(y), shape};
}

/// Up and down in turns, from column to column of a super block.
constexpr int32_t Meander(int32_t index, int32_t rows) {
    const int32_t row = index % rows;
    return index / rows % 2 == 0 ? row : rows - 1 - row;
}

/// Super blocks of 48 lines, 144 pixels wide: they share a column of macroblocks with their neighbours, so that every
/// other one begins in its middle.
DVPlace Place411(int32_t superRow, int32_t macroblock, int32_t segment) {
    constexpr int32_t kRows = 6, kLeft[] = {288, 128, 416, 0, 576};
    const bool beginsWithin = macroblock == 1 || macroblock == 2;
    const int32_t index = segment + (beginsWithin ? 3 : 0);
    const int32_t x = 32 * (index / kRows) + kLeft[macroblock], row = Meander(index, kRows);
    constexpr int32_t kFirstStacked = 704, kFirstOfLastColumn = 24;
    if (x < kFirstStacked) return At(x, 48 * superRow + 8 * row, DVShape::k411);
    return At(x, 48 * superRow + 16 * (segment - kFirstOfLastColumn), DVShape::k411Stacked);
}

DVPlace Place420(int32_t superRow, int32_t macroblock, int32_t segment) {
    return At(144 * kColumns[macroblock] + 16 * (segment / 3), 48 * superRow + 16 * Meander(segment, 3),
              DVShape::k420);
}

/// Each channel has the half of every super block.
DVPlace Place422(int32_t superRow, int32_t channel, int32_t macroblock, int32_t segment) {
    return At(144 * kColumns[macroblock] + 16 * (segment / 3),
              48 * superRow + 24 * channel + 8 * Meander(segment, 3), DVShape::k422);
}

/// The last lines of a picture of 1080, which are half a macroblock high: two pieces side by side.
DVPlace PlaceInHalfRow(int32_t index) {
    return At(32 * index, 1072, DVShape::kHDSideBySide);
}

DVPlace Place720(const int32_t channel, int32_t sequence, int32_t segment, int32_t macroblock) {
    const int32_t t = kSegmentsOfSequence * sequence + segment;
    const int32_t i = (4 * channel + sequence / 5 + 2 * (t % 5) + kRowsOn[macroblock]) % 10;
    const int32_t q = t / 5 % 27 + 3 * (i & 1);
    return At(16 * (12 * kColumns[macroblock] + 6 * (channel & 1) + q % 6),
              16 * (9 * (i / 2) + 4 * (i & 1) + q / 6), DVShape::kHD);
}

/// The raster is 90 macroblocks wide, of which the picture has 80: the others are brought to the lines above and below
/// those that the raster has.
DVPlace FoldedInto1280(int32_t column, int32_t row) {
    constexpr int32_t kColumnsOfPicture = 80, kFirstRow = 4, kAbove = 32, kBelow = 56;
    if (column < kColumnsOfPicture) return At(16 * column, 16 * (row + kFirstRow), DVShape::kHD);
    const int32_t beyond = column - kColumnsOfPicture;
    if (row < kAbove) return At(16 * (10 * (row / 4) + beyond), 16 * (row % 4), DVShape::kHD);
    if (row < kBelow) {
        const int32_t below = row - kAbove;
        return At(16 * (10 * (below / 3) + beyond), 16 * (64 + below % 3), DVShape::kHD);
    }
    return PlaceInHalfRow(10 * (row - kBelow) + beyond);
}

DVPlace Place1080(bool is625, int32_t channel, int32_t sequence, int32_t segment, int32_t macroblock) {
    const int32_t t = kSegmentsOfSequence * sequence + segment;
    const int32_t turn = 4 * channel + kRowsOn[macroblock];
    const int32_t i = is625 ? (turn + t) % 11 : (turn + sequence / 5 + 2 * (t % 5)) % 10;
    const int32_t q = is625 ? t / 11 : t / 5 % 27;
    const int32_t column = 18 * kColumns[macroblock] + 9 * (channel & 1) + q % 9;
    const int32_t row = 6 * i + 2 * (q / 9) + channel / 2;
    if (is625) return At(16 * column, 16 * (row + 1), DVShape::kHD);
    return FoldedInto1280(column, row);
}

/// The twelfth sequence of the first channel has the lines above and below the others'.
DVPlace PlaceInOuterRows(int32_t segment, int32_t macroblock) {
    constexpr int32_t kColumnsOfPicture = 90;
    const int32_t index = kSegmentsOfSequence * macroblock + segment;
    if (index < kColumnsOfPicture) return At(16 * index, 0, DVShape::kHD);
    return PlaceInHalfRow(index - kColumnsOfPicture);
}

DVPlace Place(const DVFormat& format, int32_t channel, int32_t sequence, int32_t segment,
              int32_t macroblock) {
    const int32_t superRow = (sequence + kRowsOn[macroblock]) % format.Sequences();
    switch (format.sampling) {
    case DVSampling::k411:
        return Place411(superRow, macroblock, segment);
    case DVSampling::k420:
        return Place420(superRow, macroblock, segment);
    case DVSampling::k422:
        return Place422(superRow, channel, macroblock, segment);
    case DVSampling::kHD:
        break;
    }
    if (format.isProgressive) return Place720(channel, sequence, segment, macroblock);
    constexpr int32_t kOuterRows = 11;
    if (sequence == kOuterRows) return PlaceInOuterRows(segment, macroblock);
    return Place1080(format.is625, channel, sequence, segment, macroblock);
}

bool HasPicture(const DVFormat& format, int32_t channel, int32_t sequence) {
    if (!format.IsHD()) return true;
    if (format.isProgressive) return sequence < 10;
    return sequence < 11 || channel == 0;
}

} // namespace

bool PlaceSegment(const DVFormat& format, int32_t channel, int32_t sequence, int32_t segment,
                  DVPlace (&places)[kMacroblocksOfSegment]) {
    if (!HasPicture(format, channel, sequence)) return false;
    for (int32_t i = 0; i < kMacroblocksOfSegment; ++i)
        places[i] = Place(format, channel, sequence, segment, i);
    return true;
}

} // namespace PK
