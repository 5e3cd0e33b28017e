#pragma once

// A picture made to a size by taking rows and columns away, or adding them.

#include "Frame.h"

namespace tool {

/// The middle of a picture, or the picture in the middle of opaque black, each direction by itself; to whole pixels.
/// \param picture  BGRA_4444_8u or BGRA_4444_32f.
Frame Centred(const Frame& picture, int32_t width, int32_t height);

} // namespace tool
