#pragma once

// An image of any format whose rows all begin at 64-byte boundaries, and the same rows in another format.

#include "support/Random.h"
#include "support/Samples.h"

#include <PixelKiln/Convert.h>

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace PKTest {

/// Expansion to 15 bits rounds by where a pixel lies to a boundary of 16 bytes; here all rows lie alike.
class AlignedPicture {
public:
    AlignedPicture(PK_PixelFormat pixelFormat, int32_t columns, int32_t rows)
        : format(pixelFormat), width(columns), height(rows),
          rowLength(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width))),
          fUnits((rowLength + sizeof(Unit) - 1) / sizeof(Unit)),
          fMemory(fUnits * static_cast<size_t>(height)) {}

    uint8_t* Row(int32_t row) { return fMemory[fUnits * static_cast<size_t>(row)].bytes; }
    const uint8_t* Row(int32_t row) const { return fMemory[fUnits * static_cast<size_t>(row)].bytes; }
    uint8_t* RowFromTop(int32_t row) { return Row(PK_IsOriginTopLeft(format) ? row : height - 1 - row); }
    const uint8_t* RowFromTop(int32_t row) const {
        return Row(PK_IsOriginTopLeft(format) ? row : height - 1 - row);
    }
    uint8_t* Pixels() { return Row(0); }
    const uint8_t* Pixels() const { return Row(0); }
    int32_t RowBytes() const { return static_cast<int32_t>(fUnits * sizeof(Unit)); }

    void FillOrdinary(Random& random) {
        for (int32_t row = 0; row < height; ++row) FillOrdinarySamples(format, Row(row), rowLength, random);
    }

    /// Where the rows first differ from expected ones; empty if they agree.
    std::string DifferenceFrom(const AlignedPicture& expected) const {
        for (int32_t row = 0; row < height; ++row) {
            const std::string difference = FirstDifference(format, rowLength, expected.Row(row), Row(row));
            if (!difference.empty()) return "row " + std::to_string(row) + ", " + difference;
        }
        return {};
    }

    const PK_PixelFormat format;
    const int32_t width, height;
    const size_t rowLength;

private:
    struct alignas(64) Unit {
        uint8_t bytes[64] = {};
    };

    size_t fUnits;
    std::vector<Unit> fMemory;
};

/// Each row of a picture in another format, where it was: a conversion of several rows might turn them.
inline AlignedPicture RowsIn(PK_PixelFormat format, const AlignedPicture& picture, int32_t quality) {
    AlignedPicture converted(format, picture.width, picture.height);
    for (int32_t row = 0; row < picture.height; ++row)
        EXPECT_EQ(PK_Convert(picture.Row(row), 0, picture.format, converted.Row(row), 0, format,
                             picture.width, 1, quality),
                  PK_Success);
    return converted;
}

} // namespace PKTest
