#pragma once

// What the decoders of DV can give.

#include "convert/Streams.h"

namespace PK {

/// The rule of ChooseDecodeTarget for DV25: full and field size, or at a low quality what is next above the wanted size of
/// the half, the quarter and the eighth; four-channel formats as they are wanted, others as one of three.
DecodeTarget ChooseDV25Target(PK_PixelFormat stream, const DecodeTarget& wanted, int32_t quality);

/// The rule of ChooseDecodeTarget for DV50 and DV100: pairs of pixels at full size or of one field, else four channels at
/// half width and height.
DecodeTarget ChooseDVTarget(PK_PixelFormat stream, const DecodeTarget& wanted, int32_t quality);

/// The pairs of pixels that DV50 and DV100 are decoded to and encoded from.
PK_PixelFormat DVPairsFormat(PK_PixelFormat stream);

} // namespace PK
