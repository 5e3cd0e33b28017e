#pragma once

// One field copied out of a planar 4:2:0 image.

#include <PixelKiln/Types.h>

namespace PK {

/// Copies every second line of each plane, from row 1 on of luma of field 2 and else from row 0. That chroma does not follow the
/// field is deliberate: callers know it so.
/// \param source       a block as PK_GetPlanarBuffers lays it out.
/// \param destination  a block of half the height likewise.
/// \param width        luma samples in a row, at least 1.
/// \param height       luma rows of the source, at least 2.
/// \return PK_Success; PK_ErrFailed for planes that have no offsets in 32 bits.
PK_Result CopyPlanarField(const uint8_t* source, uint8_t* destination, PK_PixelFormat format, int32_t width,
                          int32_t height, int32_t field);

} // namespace PK
