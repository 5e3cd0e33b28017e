#pragma once

// An image of random bytes in guarded memory, with rows of either direction and padding between them.

#include "support/GuardedRows.h"
#include "support/Random.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <vector>

namespace PKTest {

struct ImageShape {
    size_t rowLength; ///< bytes of a row
    int32_t height;
    size_t padding = 0; ///< bytes between two rows
    bool upwards = false;
    Guard guard = Guard::kAfter;
};

/// The guarded side of the memory ends with a row; on the other lies padding.
class GuardedImage {
public:
    GuardedImage(ImageShape shape, Random& random)
        : fShape(shape), fStep(shape.rowLength + shape.padding),
          fLead(shape.guard == Guard::kAfter ? shape.padding : 0),
          fMemory(fStep * static_cast<size_t>(shape.height), shape.guard) {
        random.Fill(fMemory.Bytes(), fMemory.Size());
        fBefore = Memory();
    }

    uint8_t* Row(int32_t row) const {
        const int32_t place = fShape.upwards && fShape.height != 0 ? fShape.height - 1 - row : row;
        return fMemory.Bytes() + fLead + static_cast<size_t>(place) * fStep;
    }
    uint8_t* Pixels() const { return Row(0); }
    int32_t RowBytes() const {
        const auto bytes = static_cast<int32_t>(fStep);
        return fShape.upwards ? -bytes : bytes;
    }
    std::vector<uint8_t> RowContent(int32_t row) const { return {Row(row), Row(row) + fShape.rowLength}; }
    std::vector<std::vector<uint8_t>> Rows() const {
        std::vector<std::vector<uint8_t>> rows;
        for (int32_t row = 0; row < fShape.height; ++row) rows.push_back(RowContent(row));
        return rows;
    }

    /// Holds the rows to the expected ones; what follows a shorter expectation must be as it was, like the
    /// padding.
    void ExpectRows(const std::vector<std::vector<uint8_t>>& rows) const {
        ASSERT_EQ(rows.size(), static_cast<size_t>(fShape.height));
        std::vector<uint8_t> expected = fBefore;
        for (int32_t row = 0; row < fShape.height; ++row) {
            const std::vector<uint8_t>& content = rows[static_cast<size_t>(row)];
            ASSERT_LE(content.size(), fShape.rowLength);
            std::copy(content.begin(), content.end(), expected.begin() + (Row(row) - fMemory.Bytes()));
        }
        const std::vector<uint8_t> now = Memory();
        const auto [right, wrong] = std::mismatch(expected.begin(), expected.end(), now.begin());
        if (right == expected.end()) return;
        const auto place = static_cast<size_t>(right - expected.begin());
        FAIL() << "byte " << place % fStep << " of the " << fStep << " of row " << place / fStep
               << " in memory, of which " << fLead << " are padding in front: expected " << int{*right}
               << ", is " << int{*wrong};
    }

    void Restore() const { std::copy(fBefore.begin(), fBefore.end(), fMemory.Bytes()); }

private:
    std::vector<uint8_t> Memory() const { return {fMemory.Bytes(), fMemory.Bytes() + fMemory.Size()}; }

    ImageShape fShape;
    size_t fStep, fLead;
    GuardedRows fMemory;
    std::vector<uint8_t> fBefore;
};

} // namespace PKTest
