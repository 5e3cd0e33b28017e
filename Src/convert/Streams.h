#pragma once

// Where conversion meets the streams (DV and planar 4:2:0): what a decoder gives, what an encoder takes, and
// the way to each.

#include "convert/Image.h"

namespace PK {

struct ConversionChain;

/// Below this render quality a decoder may stop at a size smaller than the wanted one.
inline constexpr int32_t kExactSizeQuality = 3;

/// The picture that a decoder gives.
struct DecodeTarget {
    PK_PixelFormat format;
    int32_t width;
    int32_t height;
};

/// Decides what to decode to. Decoders stop at a reduced size where that is what is wanted, or, at a render
/// quality below 3, where the wanted size is smaller than the picture.
/// \param stream  format and size of the stream.
/// \param wanted  format and size that the caller is after.
/// \param target  receives the answer; untouched on failure.
/// \return PK_Success; PK_ErrBadSrcFormat for a format that is no stream of the catalogue.
PK_Result ChooseDecodeTarget(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality,
                             DecodeTarget& target) noexcept;

/// Decodes one image.
/// \param source       the stream; its size is that of the full picture.
/// \param field        0 for the frame, 1 or 2 for one field.
/// \param destination  the picture, of the format and size that ChooseDecodeTarget named.
/// \return PK_Success or the decoder's failure; PK_ErrNotSupported for a stream without decoder.
PK_Result DecodeStream(const SourceImage& source, int32_t field, const DestinationImage& destination,
                       int32_t quality) noexcept;

/// Whether a stream is decoded row by row, so that a chain can take the rows on.
bool DecodesRows(PK_PixelFormat stream) noexcept;

/// The same to the format that a chain begins with, and, of a stream that is decoded row by row, by the chain to the
/// destination's.
PK_Result DecodeStreamThrough(const ConversionChain& onward, const SourceImage& source, int32_t field,
                              const DestinationImage& destination, int32_t quality) noexcept;

/// Decides from which format to encode.
/// \param source  format at hand.
/// \param format  receives the answer; untouched on failure.
/// \return PK_Success; PK_ErrNotSupported for a format that is no stream of the catalogue.
PK_Result ChooseEncodeSource(PK_PixelFormat source, PK_PixelFormat stream, int32_t quality,
                             PK_PixelFormat& format) noexcept;

/// Encodes one image from a format that ChooseEncodeSource named.
/// \return PK_Success or the encoder's failure; PK_ErrNotSupported for a stream without encoder.
PK_Result EncodeStream(const SourceImage& source, const DestinationImage& destination,
                       int32_t quality) noexcept;

} // namespace PK
