#pragma once

// PK_Convert between planes of video and pixels.

#include "Video.h"

#include "Frame.h"

namespace ChromaBench {

/// Planes of 4:2:0 as the kind says to pixels of a format, of Rec. 601.
tool::Frame Decoded(const Video& planes, const Kind& kind, PK_PixelFormat format);

Video ToPixels(const tool::Frame& frame);

/// For a picture.
tool::Frame ToRGB(const Video& pixels);

} // namespace ChromaBench
