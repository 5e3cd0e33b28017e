#pragma once

// A picture that flies over another, frame by frame.

#include "Placing.h"

#include <string>

namespace tool {

struct Flight {
    Placing start, end; ///< of one format to sample, and one destination field
    int32_t frames = 1;
    int32_t framesASecond = 25;
    int32_t pngDepth = 8;
};

/// Writes a Y4M stream, or a PNG a frame where the name is that of numbered ones. Of an interlaced destination the fields
/// are half a frame apart.
/// \param picture  as ToBePlaced makes it.
void Fly(const Flight& flight, const Frame& picture, const Frame& back, const std::string& output);

} // namespace tool
