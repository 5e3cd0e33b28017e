#pragma once

// Fills an image with a pixel, or a unit of pixels, that is in the image's format already.

#include "convert/Image.h"

#include <PixelKiln/Types.h>

namespace PK {

/// The codes of one colour at 8 bits.
struct YUVCodes {
    uint8_t v, u, y;
};

/// The unit that a fill repeats, in the bytes of the format.
struct FillUnit {
    uint8_t bytes[16];
    int32_t size;   ///< 4, 8 or 16; 0 where a format has no such unit
    int32_t pixels; ///< how many it holds
};

/// Bytes and pixels of the unit of a raster format: a pixel of four channels or a pair of 4:2:2, of the depths
/// that are filled so. The bytes are 0.
FillUnit EmptyFillUnit(PK_PixelFormat format) noexcept;

/// The groups of six pixels that a row of V210 is stored in, the last of which may be incomplete.
constexpr int32_t GroupsOfV210(int32_t width) {
    return static_cast<int32_t>((int64_t{width} + 5) / 6);
}

/// Six pixels of V210, each sample 4 times its code.
FillUnit V210FillUnit(YUVCodes codes) noexcept;

/// Fills each row with `units` units. A width or height of 0 succeeds with any pointer.
PK_Result FillWithUnits(const DestinationImage& image, const FillUnit& unit, int32_t units) noexcept;

/// Fills the planes of a 4:2:0 image that lies in one block.
PK_Result FillPlanes(const DestinationImage& image, YUVCodes codes) noexcept;

} // namespace PK
