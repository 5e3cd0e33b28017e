#pragma once

// Planar 4:2:0 decoded and encoded slowly, a whole picture and a step at a time: planes to planes of full height, these to
// pixels.

#include <PixelKiln/PixelFormat.h>

#include <cstdint>
#include <vector>

namespace PKTest {

using Samples = std::vector<std::vector<uint8_t>>; ///< rows of a plane

struct PlanarPicture {
    PK_PixelFormat format;
    int32_t width, height;
    Samples planes[3];
};

/// Rows of pixels from the top, in a format that the planes come to directly.
struct DecodedPicture {
    PK_PixelFormat format;
    Samples rows;
};

/// At the picture's own size, or at half its height with one field.
DecodedPicture ReferenceFullWidth(const PlanarPicture& picture, int32_t height, PK_PixelFormat destination,
                                  int32_t field);

/// Of so many columns and rows one.
DecodedPicture ReferenceDecimated(const PlanarPicture& picture, int32_t columns, int32_t rows);

/// Wider by 3/2 or 4/3, at full height or at half with one field; rounding to nearest.
DecodedPicture ReferenceWidened(const PlanarPicture& picture, int32_t width, int32_t height,
                                PK_PixelFormat destination, int32_t field);

/// The planes that rows of VUYP make. Rows of luma that an encoder leaves out are empty.
PlanarPicture ReferenceEncoded(const Samples& pixels, PK_PixelFormat format, int32_t width);

} // namespace PKTest
