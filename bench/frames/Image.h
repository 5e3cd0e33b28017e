#pragma once

// The images that the frame benchmark converts, each in memory of its own that is aligned and paged alike, so that no
// contender is better placed than another.

#include <PixelKiln/PixelFormat.h>

#include <cstddef>
#include <memory>

namespace FrameBench {

struct Size {
    int32_t width, height;
};
inline constexpr Size kHD = {1920, 1080};
inline constexpr Size kUHD = {3840, 2160};

struct Free {
    void operator()(uint8_t* bytes) const;
};
using Bytes = std::unique_ptr<uint8_t, Free>;

/// Zeroed memory on a boundary of 2 MiB, in huge pages where the system grants them.
Bytes Allocate(size_t count);

struct Image {
    Image(PK_PixelFormat theFormat, Size theSize);

    PK_PixelFormat format;
    Size size;
    int32_t rowBytes;
    size_t packedBytes; ///< without row padding
    Bytes bytes;

    uint8_t* Row(int32_t row) const { return bytes.get() + static_cast<ptrdiff_t>(row) * rowBytes; }
};

/// A picture that is valid in its format: colour is at most alpha where it is premultiplied.
Image MakePicture(PK_PixelFormat format, Size size);

/// A way through the rows of an image.
struct Rows {
    uint8_t* first;
    int32_t rowBytes;
};

/// The rows from the top of the picture to its bottom, so that a peer turns the picture over where we do.
Rows FromTop(const Image& image);

/// The largest difference between two samples of two images of one format, in units of that format: 8-bit
/// codes, 10-bit codes, 15-bit codes, or floats between 0 and 1.
double LargestDifference(const Image& a, const Image& b);

} // namespace FrameBench
