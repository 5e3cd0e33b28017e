#pragma once

// Planar 4:2:0: three planes of bytes, taken to any raster format and made from one.

#include "convert/Image.h"
#include "convert/Streams.h"
#include "frame/Planes.h"

namespace PK {

/// The rule of ChooseDecodeTarget for a planar stream. Widenings by 4/3 and 3/2, half heights and, below quality 3,
/// sizes of which the picture's are an even and a whole multiple, are decoded as they are wanted; else half the picture
/// if it covers what is wanted, or all of it.
DecodeTarget ChoosePlanarTarget(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality);

/// Decodes to a raster image of any size that the planes can be taken to without filtering luma.
/// \param source       the planes of the whole picture.
/// \param format       that of the source.
/// \param destination  walked from the top of the picture.
/// \param field        0 for the frame, 1 or 2 for one field, where the destination has half the height.
/// \return PK_Success, or as PK::DecompressYUV_420_8u.
PK_Result DecodePlanar420(const SourcePlanes& source, PK_PixelFormat format,
                          const DestinationImage& destination, int32_t field, int32_t quality);

} // namespace PK
