#pragma once

// An image as an operation walks it: row 0 is the first that is read or written, the row bytes lead on.

#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <cstddef>
#include <cstdint>

namespace PK {

template <class Byte>
struct Image {
    Byte* pixels;
    ptrdiff_t rowBytes; // of either sign; wide enough for the negative of any row bytes of a caller
    PK_PixelFormat format;
    int32_t width;
    int32_t height;

    Byte* Row(int32_t row) const { return pixels + row * rowBytes; }
};

using SourceImage = Image<const uint8_t>;
using DestinationImage = Image<uint8_t>;

/// The image walked from its last row in memory to its first. The height is at least 1.
template <class Byte>
Image<Byte> Reversed(const Image<Byte>& image) {
    Image<Byte> reversed = image;
    reversed.pixels = image.Row(image.height - 1);
    reversed.rowBytes = -image.rowBytes;
    return reversed;
}

} // namespace PK
