#pragma once

// A frame of DV to samples: planes of bytes, or pairs of pixels where the format has them.

#include "dv/DVSegment.h"
#include "frame/Planes.h"

#include <cstddef>

namespace PK {

/// A size and, of the full one, which lines: 0 all, 1 rows 0, 2, 4 and so on, 2 rows 1, 3, 5 and so on.
struct DecodedPicture {
    const DVFormat& format;
    DVSize size;
    int32_t field;

    int32_t Width() const { return format.width >> static_cast<int32_t>(size); }
    int32_t Height() const { return format.height >> (field != 0 ? 1 : static_cast<int32_t>(size)); }
};

/// The planes that a picture has, in a block of memory. A sample of chroma is for 2 or 4 luma samples of a row, a last one
/// for as many as are left; 4:2:0 has a row for every two.
DestinationPlanes DVPlanesIn(uint8_t* block, const DecodedPicture& picture);

/// What they take in all.
size_t DVPlanesBytes(const DecodedPicture& picture);

/// Whatever the bytes of the frame: what cannot be read stays as far as it came, and damage in a segment changes nothing
/// outside its five macroblocks.
/// \param frame  FrameBytes() of the format.
void DecodeDVToPlanes(const uint8_t* frame, const DecodedPicture& picture, const DestinationPlanes& planes);

/// DV50 and DV100 at full size, to pairs of pixels.
/// \param pixels  of the first row of the picture.
void DecodeDVToYUYV(const uint8_t* frame, const DecodedPicture& picture, uint8_t* pixels, ptrdiff_t rowBytes);

} // namespace PK
