#pragma once

// Frames of DV to draw: made, kept in media/dv/ or of noise, with whatever went wrong with their bytes.

#include "support/ByteStream.h"
#include "support/Size.h"

#include <PixelKiln/Types.h>

#include <string>
#include <vector>

namespace PKFuzz {

struct DVFrame {
    PK_PixelFormat format;
    Size size; ///< of its picture
    std::vector<uint8_t> bytes;
};

/// A format of DV, of standard definition most of the time: others take longer.
PK_PixelFormat DrawDVFormat(ByteStream& stream);

/// A frame of a format. Half of the time it is whole, but for a few bits.
DVFrame DrawDVFrame(ByteStream& stream, PK_PixelFormat format);

/// Whether a decoder of its format takes the header for that of a frame.
bool HasGoodHeader(const DVFrame& frame);

} // namespace PKFuzz
