#pragma once

// An image whose rows lie in either order in memory, with bytes behind them that belong to nobody.

#include "frame/PixelFormat.h"
#include "support/Random.h"
#include "support/Samples.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

namespace PKTest {

/// Copies lie alike to 64 bytes, as expansion to 15 bits rounds by where a pixel lies.
class PaddedPicture {
public:
    PaddedPicture(PK_PixelFormat pixelFormat, int32_t columns, int32_t rows, Random& random)
        : format(pixelFormat), width(columns), height(rows),
          fRowLength(PK_PixelFormatPackedRowBytes(format, width)),
          fRowBytes((fRowLength + static_cast<int32_t>(16 * random.Below(3)) + 15) / 16 * 16),
          fIsTurned(random.Below(3) == 0),
          fMemory(static_cast<size_t>(fRowBytes) * static_cast<size_t>(height) / sizeof(Unit) + 1) {
        random.Fill(fMemory[0].bytes, Size());
        for (int32_t row = 0; row < height; ++row) FillRow(Row(row), random);
    }

    uint8_t* Row(int32_t row) { return fMemory[0].bytes + OffsetOf(row); }
    const uint8_t* Row(int32_t row) const { return fMemory[0].bytes + OffsetOf(row); }
    int32_t RowBytes() const { return fIsTurned ? -fRowBytes : fRowBytes; }
    size_t RowLength() const { return static_cast<size_t>(fRowLength); }

    /// With all that belongs to no pixel.
    bool HasMemoryOf(const PaddedPicture& other) const {
        return std::memcmp(fMemory[0].bytes, other.fMemory[0].bytes, Size()) == 0;
    }

    const PK_PixelFormat format;
    const int32_t width, height;

private:
    struct alignas(64) Unit {
        uint8_t bytes[64];
    };

    size_t Size() const { return fMemory.size() * sizeof(Unit); }
    int64_t OffsetOf(int32_t row) const { return int64_t{fIsTurned ? height - 1 - row : row} * fRowBytes; }

    /// Alpha is a quarter at least, so that what is divided by it does not show the last bits of sums as codes.
    void FillRow(uint8_t* row, Random& random) const {
        using namespace PK;
        if (!IsPacked4444(format)) return FillOrdinarySamples(format, row, RowLength(), random);
        const auto fraction = [&random] { return static_cast<float>(random.Below(1025)) / 1024; };
        const size_t alphaAt = IsOrderReversed(format) ? 0 : 3;
        for (size_t pixel = 0; pixel < static_cast<size_t>(width); ++pixel) {
            const float alpha = std::min(1.0f, 0.25f + fraction());
            const float most = AlphaOf(format) == kAlphaPremultiplied ? alpha : 1;
            for (size_t c = 0; c < 4; ++c) {
                const bool isAlpha = c == alphaAt, isChroma = IsYUV(format) && c < 2;
                const float value = isAlpha ? alpha : (fraction() - (isChroma ? 0.5f : 0)) * most;
                Store(row, 4 * pixel + c, value, IsYUV(format) && !isAlpha, isChroma);
            }
        }
    }

    void Store(uint8_t* row, size_t sample, float value, bool isVideo, bool isChroma) const {
        using namespace PK;
        if (DepthOf(format) == kDepth32f) {
            std::memcpy(row + 4 * sample, &value, sizeof value);
        } else if (DepthOf(format) == kDepth15u) {
            const auto word = static_cast<uint16_t>(std::lround(value * 32768));
            std::memcpy(row + 2 * sample, &word, sizeof word);
        } else {
            const float code = !isVideo ? value * 255 : isChroma ? 128 + value * 224 : 16 + value * 219;
            row[sample] = static_cast<uint8_t>(std::lround(code));
        }
    }

    int32_t fRowLength, fRowBytes;
    bool fIsTurned;
    std::vector<Unit> fMemory;
};

} // namespace PKTest
