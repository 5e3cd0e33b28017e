#pragma once

// An image as an operation walks it: row 0 is the first that is read or written, the row bytes lead on. Other
// orders and fields are views of the image.

#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <cstddef>
#include <cstdint>

namespace PK {

template <class Byte>
struct Image {
    Byte* pixels;
    ptrdiff_t rowBytes; // of either sign; wide enough for the double of any row bytes of a caller
    PK_PixelFormat format;
    int32_t width;
    int32_t height;

    Byte* Row(int32_t row) const { return pixels + row * rowBytes; }
};

using SourceImage = Image<const uint8_t>;
using DestinationImage = Image<uint8_t>;

/// An image or a plane walked from its last row in memory to its first. The height is at least 1.
template <class View>
View Reversed(const View& image) {
    View reversed = image;
    reversed.pixels = image.Row(image.height - 1);
    reversed.rowBytes = -image.rowBytes;
    return reversed;
}

/// The image walked from the top of the picture, wherever its format has it. The height is at least 1.
template <class Byte>
Image<Byte> FromTop(const Image<Byte>& image) {
    return PK_IsOriginBottomLeft(image.format) ? Reversed(image) : image;
}

/// One field of an image or a plane as it is walked: rows 0, 2, 4 and so on for field 1, rows 1, 3, 5 and so on for
/// field 2, and all of them for field 0. The height is at least 1, and that of a second field may then be 0.
template <class View>
View Field(const View& image, int32_t field) {
    if (field == 0) return image;
    View rows = image;
    rows.rowBytes = 2 * image.rowBytes;
    rows.height = field == 1 ? image.height / 2 + image.height % 2 : image.height / 2;
    if (field == 2 && rows.height > 0) rows.pixels = image.Row(1);
    return rows;
}

} // namespace PK
