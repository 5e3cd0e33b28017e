#pragma once

// Interleaved samples of 8 bits as planes of Y, U and V without padding, as streams have them.

#include "Frame.h"

#include <string>
#include <vector>

namespace tool {

/// Whether a format is one of those here: VUYX_4444_8u and UYVY_422_8u, of either matrix.
bool HasSamplePlanes(PK_PixelFormat format);
bool Is422(PK_PixelFormat format);

PK_PixelFormat UYVYOf(bool is709);

size_t SamplePlanesBytes(PK_PixelFormat format, int32_t width, int32_t height);

void AppendSamplePlanes(const Frame& frame, std::string& bytes);

/// \param bytes  as many as the frame has in planes.
void FromSamplePlanes(const std::vector<uint8_t>& bytes, Frame& frame);

} // namespace tool
