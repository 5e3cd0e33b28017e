#pragma once

// Images whose rows all begin at 64-byte boundaries, since expansion to 15 bits rounds by where a pixel lies to one.

#include "support/Samples.h"

#include <PixelKiln/PixelFormat.h>

#include <vector>

namespace PKTest {

class AlignedPicture {
public:
    /// All bytes are 0.
    AlignedPicture(PK_PixelFormat format, int32_t width, int32_t height)
        : fFormat(format), fRowLength(static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width))),
          fStep((fRowLength + 63) / 64 * 64), fHeight(height),
          fBlock(fStep / 64 * static_cast<size_t>(height)) {}

    /// Values in the format's nominal range.
    void Fill(Random& random) {
        FillOrdinarySamples(fFormat, Pixels(), fBlock.size() * sizeof(Unit), random);
    }

    PK_PixelFormat Format() const { return fFormat; }
    size_t RowLength() const { return fRowLength; }
    int32_t RowBytes() const { return static_cast<int32_t>(fStep); }
    uint8_t* Pixels() { return fBlock.data()->bytes; }

    /// Counted from the top of the picture.
    uint8_t* Row(int32_t row) {
        const int32_t place = PK_IsOriginBottomLeft(fFormat) ? fHeight - 1 - row : row;
        return Pixels() + fStep * static_cast<size_t>(place);
    }

private:
    struct alignas(64) Unit {
        uint8_t bytes[64];
    };

    PK_PixelFormat fFormat;
    size_t fRowLength, fStep;
    int32_t fHeight;
    std::vector<Unit> fBlock;
};

} // namespace PKTest
