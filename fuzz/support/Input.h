#pragma once

// An image of drawn samples, given to a call as it is or, now and then, as null.

#include "support/ImageMemory.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>

namespace PKFuzz {

/// Rows of the bytes of so many pixels.
inline RowsLayout DrawRaster(ByteStream& stream, PK_PixelFormat format, Size size) {
    return DrawLayout(stream, int64_t{PK_PixelFormatPackedRowBytes(format, std::max(size.width, 0))}, size);
}

struct Input {
    PK_PixelFormat format;
    SourceImage memory;
    bool isNull;

    Input(ByteStream& stream, PK_PixelFormat pixelFormat, const RowsLayout& layout)
        : format(pixelFormat), memory(layout, stream), isNull(stream.OneIn(64)) {}
    Input(ByteStream& stream, PK_PixelFormat pixelFormat, Size size)
        : Input(stream, pixelFormat, DrawRaster(stream, pixelFormat, size)) {}

    uint8_t* Pixels() const { return isNull ? nullptr : memory.Pixels(); }
    int32_t RowBytes() const { return memory.RowBytes(); }
};

} // namespace PKFuzz
