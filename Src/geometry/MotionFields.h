#pragma once

// Which rows of an interlaced source a pass over the rows of a destination reads.

#include "frame/Fields.h"

namespace PK {

struct FieldOfSource {
    int32_t firstRow; ///< of an even place; at an odd place the other one of 0 and 1
    bool isSameLine;  ///< else rows lie half a row of the source higher

    constexpr int32_t RowFrom(int32_t row) const { return row + (row % 2 == 0 ? firstRow : 1 - firstRow); }
};

/// \param sourceField       1 or 2: that field of the source comes first in time.
/// \param destinationField  that of the destination; any other number is a progressive one.
/// \param pass              the field that is written, 0 for all rows.
constexpr FieldOfSource ChooseFieldOfSource(int32_t sourceField, int32_t destinationField, int32_t pass) {
    if (!IsInterlaced(destinationField))
        return sourceField == 1 ? FieldOfSource{0, true} : FieldOfSource{1, false};
    constexpr FieldOfSource kSameOrder[] = {{1, true}, {0, true}, {1, false}};
    constexpr FieldOfSource kOtherOrder[] = {{0, true}, {1, false}, {0, true}};
    const int32_t column = pass == 0 || pass == 1 ? pass : 2;
    return sourceField == destinationField ? kSameOrder[column] : kOtherOrder[column];
}

} // namespace PK
