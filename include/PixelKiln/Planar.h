#pragma once

/// \file
/// Copies of planar 4:2:0 images.
///
/// A planar image is three first bytes and three row bytes, each an array in the order luma, first chroma,
/// second chroma. All samples are bytes. The chroma planes have half the width and half the height of the luma
/// plane, both rounded down.

#include <PixelKiln/Types.h>

extern "C" {

/// Copies the three planes of an 8-bit 4:2:0 image.
///
/// Only samples are copied, no row padding. A plane whose row bytes are its width on both sides goes as one
/// block, by the rules of PK_CopyMemory: from 524288 bytes on with non-temporal stores and no fence after
/// them.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Planes of the source and of the
/// destination must not overlap. A plane without samples is not touched, and its pointer may be null.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations.
///
/// \param sourcePlanes         first bytes of the planes that are read.
/// \param sourceRowBytes       bytes from one row of each to the next.
/// \param destinationPlanes    first bytes of the planes that are written.
/// \param destinationRowBytes  bytes from one row of each to the next.
/// \param width                luma samples in a row, not negative. Chroma rows have half as many.
/// \param height               luma rows, not negative. Chroma planes have half as many.
/// \return
///  - PK_Success: copied. A width or height of 0 does nothing.
///  - PK_ErrFailed: a negative width or height, a null array, or a null pointer to a plane that has samples;
///    nothing is written then.
PK_API PK_Result PK_CopyPlanar_8u(const void* const sourcePlanes[3], const int32_t sourceRowBytes[3],
                                  void* const destinationPlanes[3], const int32_t destinationRowBytes[3],
                                  int32_t width, int32_t height) noexcept;

} // extern "C"
