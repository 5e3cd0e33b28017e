#pragma once

// Frames of DV to images of 8-bit pixels.

#include "convert/Image.h"
#include "convert/Streams.h"

namespace PK {

struct ConversionChain;

/// Decodes DV25 row by row to the format that a chain begins with, one of those that ChooseDecodeTarget names or
/// YUYV_422_8u, and by the chain to the destination's.
/// \param frame        as many bytes as the format has.
/// \param destination  walked from the top of the picture; of the whole size, of one field, or half, a quarter or an eighth
///                     of it in both directions.
/// \param field        of half the height: 2 for rows 1, 3, 5 and so on, else rows 0, 2, 4.
/// \param quality      of reduced sizes: from 3 on, chroma is interpolated, as that of others always is.
/// \return PK_Success; PK_ErrBadSrcFormat for a stream that is no DV25; PK_ErrSizeMismatch for any other size;
///         PK_ErrBadDVFormat for a header that is none of DV25; PK_ErrBadDstFormat for a chain from other pixels;
///         PK_ErrOutOfMemory. Nothing is written but with PK_Success.
PK_Result DecodeDV25(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                     const DestinationImage& destination, int32_t field, int32_t quality);

/// Decodes DV50: at full width to YUYV_422_8u, at half width and height row by row to VUYA_4444_8u and by the chain to the
/// destination's format.
/// \return PK_Success; PK_ErrBadWidth and PK_ErrBadHeight for a size that it does not have; PK_ErrBadSrcFormat,
///         PK_ErrBadDstFormat, PK_ErrOutOfMemory as above.
PK_Result DecodeDV50(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                     const DestinationImage& destination, int32_t field);

/// The same for DV100, whose pixels are those of BT.709.
PK_Result DecodeDV100(const ConversionChain& onward, const uint8_t* frame, PK_PixelFormat stream,
                      const DestinationImage& destination, int32_t field);

} // namespace PK
