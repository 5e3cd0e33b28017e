#pragma once

// The router: given where a row stands and where it is to go, the next kernel and the format it leaves the
// row in. Following it step by step leads from any raster format to any other.

#include "convert/Kernel.h"

#include <PixelKiln/Types.h>

namespace PK {

struct ConversionStep {
    Kernel kernel;
    PK_PixelFormat next;
};

/// \param current      format the row is in now.
/// \param destination  format it is to end in; the same as `current` gives a copy.
/// \param quality      render quality, 0 to 5; above 1, float 4:2:2 chroma is interpolated.
/// \param step         receives the next kernel; Kernel::None on failure.
/// \return PK_Success; PK_ErrBadSrcFormat or PK_ErrBadDstFormat for a format that is no raster format of
///         the catalogue, or at which the rules end; PK_ErrFailed where no kernel serves.
///
/// Reads the capability flags: one direct kernel has bodies only from SSE2 up.
PK_Result ChooseConversionStep(PK_PixelFormat current, PK_PixelFormat destination, int32_t quality,
                               ConversionStep& step);

} // namespace PK
