#pragma once

// Where and with what bytes strokes of opaque red are drawn on an image of any format.

#include "convert/Image.h"

#include <cstddef>
#include <cstdint>

namespace PK {

/// A horizontal or vertical line, one pixel thick, in pixels of the picture.
struct Stroke {
    int32_t column;
    int32_t row;
    int32_t length;
    bool isHorizontal;
};

/// Units of ink in rows: pixels, pairs of pixels for 4:2:2, or the samples of a plane.
struct InkLayer {
    static constexpr int32_t kLargestUnit = 16;

    uint8_t* top;       // first unit of the picture's top row
    ptrdiff_t rowBytes; // to the row below
    int32_t columns;    // units
    int32_t rows;
    int32_t columnShift; // log2 of the pixels that a unit spans
    int32_t rowShift;
    int32_t unitBytes;
    uint8_t ink[kLargestUnit];

    /// Draws what of the stroke lies in the layer.
    void Draw(const Stroke& stroke) const;
};

/// The layers of an image, one or the three planes.
struct InkLayers {
    InkLayer layers[3];
    int32_t count = 0;

    void Draw(const Stroke& stroke) const {
        for (int32_t i = 0; i < count; ++i) layers[i].Draw(stroke);
    }
};

/// Whether there is ink for a format.
bool HasInk(PK_PixelFormat format) noexcept;

/// The layers of an image with ink, whose width is from 1 to kMaximumWidth and whose height is at least 1.
/// A planar image is one block of at most 2147483647 bytes.
InkLayers LayersOf(const DestinationImage& image) noexcept;

} // namespace PK
