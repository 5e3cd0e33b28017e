#pragma once

// 4:2:2 at half its width and height, to four channels: every other row and pixel is dropped, nothing is filtered.

#include "convert/Image.h"
#include "scale/HalveKernels.h"

namespace PK {

/// How the rows of a 4:2:2 format are halved.
struct Halving {
    RowKernel HalveKernels::*kernel;
    const char* kernelName;
    PK_PixelFormat format; ///< that the kernel makes, premultiplied VUY of the source's matrix
};

Halving HalvingOf(PK_PixelFormat source);

/// \param source       first row at the top of the picture; twice the destination's width and height, which are at least 1.
/// \param field        1 for rows 0, 2, 4 and so on, else rows 1, 3, 5 and so on.
/// \param destination  four channels; first row at the bottom of the picture.
PK_Result HalveImage(const SourceImage& source, int32_t field, const DestinationImage& destination,
                     int32_t quality);

} // namespace PK
