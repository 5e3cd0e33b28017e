#pragma once

// Copies between images of one format, where no conversion is called for.

#include "convert/Image.h"

namespace PK {

/// Copies a raster image row by row, or in one go where both are contiguous, and a stream as the block that
/// it is. Width, height and format are those of the source.
///
/// - Raster formats of the catalogue: the bytes that the pixels of a row take, not the padding behind them.
/// - DV: one frame, whatever the size.
/// - 4:2:0 planar: the three planes in one block.
/// - Any other stream: as many bytes as the row bytes of both images tell.
///
/// \return PK_Success, also with nothing done for a raster of height below 1 or width 0;
///         PK_ErrBadSrcFormat for a format that is neither a raster format of the catalogue nor a stream;
///         PK_ErrSizeMismatch for an unknown stream with different row bytes;
///         PK_ErrFailed for a null pointer, a negative width of a raster or of 4:2:0, a raster wider than
///         kMaximumWidth, or negative row bytes of an unknown stream.
PK_Result CopySameFormat(const SourceImage& source, const DestinationImage& destination) noexcept;

} // namespace PK
