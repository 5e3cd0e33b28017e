#pragma once

// The row loop of conversion between raster images.

#include "convert/Image.h"

namespace PK {

/// Converts row 0 of the source to row 0 of the destination and so on; origins are the caller's affair. The
/// destination's width and height are those of the source.
/// \return PK_ErrBadSrcFormat or PK_ErrBadDstFormat for a format that is no raster format of the catalogue;
///         PK_ErrFailed if there is no chain; PK_Success with nothing done for a height below 1 or a width
///         of 0; PK_ErrFailed for a width below 0 or above kMaximumWidth and for a null pointer;
///         PK_ErrOutOfMemory if rows above 16384 pixels found no scratch.
PK_Result ConvertRasterRows(const SourceImage& source, const DestinationImage& destination,
                            int32_t quality) noexcept;

} // namespace PK
