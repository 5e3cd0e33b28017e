#pragma once

// The Gaussian blur as motion calls it.

#include <PixelKiln/Types.h>

#include <cstddef>

namespace PK {

/// PK_GaussianBlur, with one choice more.
/// \param sourceRowBytes    may be twice those of a caller.
/// \param reuseDestination  Rows that are blurred and wait for the columns to be blurred stand in the destination, where
///                          its depth is that of the source; without, or where it is another, in an image of their own.
PK_Result BlurForMotion(const void* source, ptrdiff_t sourceRowBytes, int32_t sourceWidth,
                        int32_t sourceHeight, PK_PixelFormat sourceFormat, void* dest, int32_t destRowBytes,
                        int32_t destWidth, int32_t destHeight, PK_PixelFormat destFormat, double sigmaX,
                        double sigmaY, bool repeatEdge, bool linear, bool reuseDestination, int32_t direction,
                        int32_t quality) noexcept;

} // namespace PK
