#pragma once

// One plane of bytes in guarded memory, rows in either direction, with padding that must stay.

#include "support/GuardedRows.h"
#include "support/Random.h"

#include <algorithm>
#include <cstdlib>
#include <vector>

namespace PKTest {

class Plane {
public:
    static constexpr uint8_t kFill = 0xa5;

    /// Its last byte in memory touches a guard page.
    Plane(size_t rowLength, size_t rows, size_t padding, bool upward)
        : fRowLength(rowLength), fRows(rows), fStep(rowLength + padding), fUpward(upward),
          fMemory(rows == 0 ? 0 : (rows - 1) * fStep + rowLength, Guard::kAfter) {
        std::fill_n(fMemory.Bytes(), fMemory.Size(), kFill);
    }

    uint8_t* First() const { return Row(0); }
    int32_t RowBytes() const { return static_cast<int32_t>(fStep) * (fUpward ? -1 : 1); }
    uint8_t* Row(size_t row) const {
        return fMemory.Bytes() + (fUpward && fRows > 0 ? fRows - 1 - row : row) * fStep;
    }
    uint8_t At(size_t row, size_t column) const { return Row(row)[column]; }

    void FillRandom(Random& random) const {
        for (size_t row = 0; row < fRows; ++row) random.Fill(Row(row), fRowLength);
    }

    /// The samples of all rows, in the order of the rows.
    std::vector<uint8_t> Samples() const {
        std::vector<uint8_t> samples;
        for (size_t row = 0; row < fRows; ++row)
            samples.insert(samples.end(), Row(row), Row(row) + fRowLength);
        return samples;
    }

    bool PaddingIntact() const {
        const auto isFill = [](uint8_t byte) { return byte == kFill; };
        for (size_t row = 0; row + 1 < fRows; ++row) {
            const uint8_t* lower = fMemory.Bytes() + row * fStep;
            if (!std::all_of(lower + fRowLength, lower + fStep, isFill)) return false;
        }
        return true;
    }

private:
    size_t fRowLength, fRows, fStep;
    bool fUpward;
    GuardedRows fMemory;
};

} // namespace PKTest
