#pragma once

// Images for the tests of codec bridges: rows of either direction with padding, ending at a guard page.

#include "reference/ReferenceBridges.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <PixelKiln/Types.h>

#include <algorithm>
#include <gtest/gtest.h>

namespace PKTest {

struct ImageShape {
    size_t rowLength;
    int32_t height;
    size_t padding;
    bool upwards;
};

/// Random bytes; the last row in memory ends at a guard page, and the first begins behind known bytes.
class BridgeImage {
public:
    BridgeImage(ImageShape shape, Random& random)
        : fShape(shape), fStep(shape.rowLength + shape.padding),
          fMemory(fStep * static_cast<size_t>(shape.height), Guard::kAfter) {
        random.Fill(fMemory.Bytes(), fMemory.Size());
        fBefore = Memory();
    }

    uint8_t* Row(int32_t row) const {
        const int32_t place = fShape.upwards ? fShape.height - 1 - row : row;
        return fMemory.Bytes() + fShape.padding + static_cast<size_t>(place) * fStep;
    }
    uint8_t* Pixels() const { return Row(0); }
    int32_t RowBytes() const {
        const auto bytes = static_cast<int32_t>(fStep);
        return fShape.upwards ? -bytes : bytes;
    }
    Bytes RowContent(int32_t row) const { return {Row(row), Row(row) + fShape.rowLength}; }

    /// Holds the rows to the expected ones; what follows a shorter expectation must be as it was, like the
    /// padding.
    void ExpectRows(const std::vector<Bytes>& rows) const {
        Bytes expected = fBefore;
        for (int32_t row = 0; row < fShape.height; ++row) {
            const Bytes& content = rows[static_cast<size_t>(row)];
            ASSERT_LE(content.size(), fShape.rowLength);
            std::copy(content.begin(), content.end(), expected.begin() + (Row(row) - fMemory.Bytes()));
        }
        const Bytes now = Memory();
        const auto difference = std::mismatch(expected.begin(), expected.end(), now.begin());
        ASSERT_TRUE(difference.first == expected.end())
            << "byte " << difference.first - expected.begin() << " of the memory";
    }

    void Restore() const { std::copy(fBefore.begin(), fBefore.end(), fMemory.Bytes()); }

private:
    Bytes Memory() const { return {fMemory.Bytes(), fMemory.Bytes() + fMemory.Size()}; }

    ImageShape fShape;
    size_t fStep;
    GuardedRows fMemory;
    Bytes fBefore;
};

} // namespace PKTest
