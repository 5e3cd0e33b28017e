#pragma once

// What a decoded frame of DV comes to in pixels of 4:4:4, from the planes that the reference makes; and how the library's
// pixels are looked at beside it.

#include "reference/ReferenceDV.h"

#include <PixelKiln/Convert.h>

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace PKTest {

/// Y, U and V of every pixel, from the top.
struct DVPixels {
    int width = 0, height = 0;
    std::vector<std::array<int, 3>> pixels;

    DVPixels(int width_, int height_)
        : width(width_), height(height_), pixels(static_cast<size_t>(width_) * static_cast<size_t>(height_)) {
    }
    std::array<int, 3>& At(int x, int y) {
        return pixels.at(static_cast<size_t>(y) * static_cast<size_t>(width) + static_cast<size_t>(x));
    }
    const std::array<int, 3>& At(int x, int y) const { return const_cast<DVPixels*>(this)->At(x, y); }
};

/// Chroma of each pixel: 4:1:1 goes linearly from one sample to the next, cut; 4:2:0 is interpolated within its field and
/// then between columns; that of 4:2:2 is repeated.
DVPixels DVExpectedPixels(DVKind kind, const DVPicture& picture);

/// The rows of one field. \param first 0 or 1
DVPixels OneFieldOf(const DVPixels& frame, int first);

/// Decodes by PK_Convert into rows with padding, of which nothing may be written.
struct DVDecoded {
    PK_Result result;
    std::vector<uint8_t> rows; ///< as they lie in memory, without padding
};
DVDecoded DecodeDV(PK_PixelFormat stream, const uint8_t* frame, PK_PixelFormat format, int width, int height,
                   int quality);

/// VUY? of one origin, UYVY and YUYV, as rows in memory; a pixel of 4:2:2 has the chroma of its pair.
DVPixels DVPixelsFromMemory(const std::vector<uint8_t>& rows, PK_PixelFormat format, int width, int height);

/// Empty if no component of any pixel is off by more than the tolerance, else where the worst one lies and how much of the
/// picture is off. Chroma of \p is422 is compared at even pixels.
std::string DVDifference(const DVPixels& expected, const DVPixels& actual, bool is422, int tolerance);

} // namespace PKTest
