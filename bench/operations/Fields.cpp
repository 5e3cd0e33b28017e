// Fields rebuilt, in place and beside a copy of those that are kept.

#include "operations/Operation.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Deinterlace.h>

namespace OperationBench {
namespace {

constexpr size_t kCount = kPixels;

template <PK_PixelFormat kFormat, int32_t kRowBytes, int32_t kQuality>
Run Rebuild(const uint8_t*, uint8_t* image) {
    return [=] { PK_Deinterlace(image, kRowBytes, kFormat, kWidth, kHeight, 0, kQuality); };
}

template <PK_PixelFormat kFormat, int32_t kRowBytes>
Run RebuildBesideCopy(const uint8_t* source, uint8_t* destination) {
    return [=] {
        constexpr int32_t kStep = 2 * kRowBytes;
        const int32_t kept =
            PK_IsOriginBottomLeft(kFormat) ? kRowBytes : 0; // rows 0, 2, 4 and so on from the top
        PK_Convert(source + kept, kStep, kFormat, destination + kept, kStep, kFormat, kWidth, kHeight / 2, 4);
        PK_DeinterlaceCopy(source, kRowBytes, kFormat, destination, kRowBytes, kFormat, kWidth, kHeight, 0,
                           4);
    };
}

// Half of the frame is read and half is written; a copy of the frame reads and writes all.
// clang-format off: one row an operation
const AddOperations add = {
    {"Deinterlacing of BGRP 8u along edges", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_BGRP_4444_8u, kBGRARowBytes, 4>},
    {"Deinterlacing of BGRP 15u along edges", 8 * kCount, 8 * kCount, Samples::Bytes, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_BGRP_4444_15u, 2 * kBGRARowBytes, 4>},
    {"Deinterlacing of BGRP 32f along edges", 16 * kCount, 16 * kCount, Samples::Floats, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_BGRP_4444_32f, 4 * kBGRARowBytes, 4>},
    {"Deinterlacing of UYVY 8u along edges", 2 * kCount, 2 * kCount, Samples::Bytes, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_UYVY_422_8u, 2 * kWidth, 4>},
    {"Deinterlacing of BGRP 8u by means", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_BGRP_4444_8u, kBGRARowBytes, 3>},
    {"Deinterlacing of UYVY 8u by means", 2 * kCount, 2 * kCount, Samples::Bytes, Against::Nothing, 0,
     Rebuild<PK_PixelFormat_UYVY_422_8u, 2 * kWidth, 3>},
    {"Deinterlacing of BGRP 8u along edges, copied", 4 * kCount, 4 * kCount, Samples::Bytes, Against::Peer, 1,
     RebuildBesideCopy<PK_PixelFormat_BGRP_4444_8u, kBGRARowBytes>},
    {"Deinterlacing of UYVY 8u along edges, copied", 2 * kCount, 2 * kCount, Samples::Bytes, Against::Peer, 1,
     RebuildBesideCopy<PK_PixelFormat_UYVY_422_8u, 2 * kWidth>},
};
// clang-format on

} // namespace
} // namespace OperationBench
