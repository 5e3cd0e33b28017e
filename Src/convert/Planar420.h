#pragma once

// Planar 4:2:0: three planes of bytes, taken to any raster format and made from one.

#include "convert/Image.h"
#include "convert/Streams.h"
#include "frame/Planes.h"

#include <optional>

namespace PK {

struct ConversionChain;

/// The rule of ChooseDecodeTarget for a planar stream. Widenings by 4/3 and 3/2, half heights and, below quality 3,
/// sizes of which the picture's are an even and a whole multiple, are decoded as they are wanted; else half the picture
/// if it covers what is wanted, or all of it.
DecodeTarget ChoosePlanarTarget(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality);

/// The planes of a picture that lies in one block; none where their places cannot be told in 32 bits.
template <class Byte>
std::optional<Planes<Byte>> PlanesOfStream(const Image<Byte>& stream) {
    if (!HavePlanesOffsets(stream.width, stream.height)) return std::nullopt;
    return PlanesInBlock(stream.pixels, stream.format, stream.width, stream.height);
}

/// Decodes to a raster image of any size that the planes can be taken to without filtering luma.
/// \param source       the planes of the whole picture.
/// \param format       that of the source.
/// \param destination  walked from the top of the picture.
/// \param field        0 for the frame, 1 or 2 for one field, where the destination has half the height.
/// \return PK_Success, or as PK::DecompressYUV_420_8u.
PK_Result DecodePlanar420(const SourcePlanes& source, PK_PixelFormat format,
                          const DestinationImage& destination, int32_t field, int32_t quality);

/// The same to one format, and by a chain from there to the destination's.
PK_Result DecodePlanar420Through(const ConversionChain& onward, const SourcePlanes& source,
                                 PK_PixelFormat format, const DestinationImage& destination, int32_t field,
                                 int32_t quality);

/// Encodes a raster image. Frame pictures are encoded to an even height. The last column of an odd width gives its luma
/// alone, and so do rows of fields but the first in a last group of less than four.
/// \param source       walked from the top of the picture; at least a pixel.
/// \param format       that of the destination.
/// \param destination  planes of a block: of fields one row of chroma may lie behind half of the height.
/// \return PK_Success, or PK_ErrOutOfMemory where rows find no memory: nothing is written then.
PK_Result EncodePlanar420(const SourceImage& source, PK_PixelFormat format,
                          const DestinationPlanes& destination, int32_t quality);

} // namespace PK
