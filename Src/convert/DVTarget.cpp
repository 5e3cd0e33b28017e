#include "convert/DVTarget.h"

#include "dv/DVFormat.h"

#include <initializer_list>

namespace PK {
namespace {

/// What a decoder of DV25 gives for a wanted format.
PK_PixelFormat DV25PixelFormat(PK_PixelFormat wanted) {
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u,
          PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYX_4444_8u})
        if (wanted == format) return format;
    if (!IsPacked4444(wanted)) return PK_PixelFormat_UYVY_422_8u;
    const bool throughYUV = IsYUV(wanted) || DepthOf(wanted) == kDepth32f;
    return throughYUV ? PK_PixelFormat_VUYX_4444_8u : PK_PixelFormat_BGRX_4444_8u;
}

/// DV25 has the matrix of BT.601, the others that of their size.
PK_PixelFormat OfItsMatrix(PK_PixelFormat stream, PK_PixelFormat format) {
    return With(format, kMatrixMask, stream & kMatrixMask);
}

} // namespace

PK_PixelFormat DVPairsFormat(PK_PixelFormat stream) {
    return OfItsMatrix(stream, PK_PixelFormat_YUYV_422_8u);
}

DecodeTarget ChooseDV25Target(PK_PixelFormat stream, const DecodeTarget& wanted, int32_t quality) {
    const DVFormat& full = *FindDVFormat(stream);
    const int32_t width = full.width, height = full.height;
    const PK_PixelFormat format = DV25PixelFormat(wanted.format);
    const DecodeTarget whole = {format, width, wanted.height <= height / 2 ? height / 2 : height};
    if (quality >= kExactSizeQuality || wanted.width >= width / 2) return whole;
    for (const int32_t part : {8, 4})
        if (wanted.width <= width / part && wanted.height <= height / part)
            return {format, width / part, height / part};
    if (wanted.height < height / 2) return {format, width / 2, height / 2};
    return whole;
}

DecodeTarget ChooseDVTarget(PK_PixelFormat stream, const DecodeTarget& wanted, int32_t quality) {
    const DVFormat& full = *FindDVFormat(stream);
    const int32_t halfWidth = full.width / 2, halfHeight = full.height / 2;
    const PK_PixelFormat pairs = DVPairsFormat(stream);
    const DecodeTarget reduced = {OfItsMatrix(stream, PK_PixelFormat_VUYA_4444_8u), halfWidth, halfHeight};

    if (wanted.width == full.width && wanted.height == halfHeight) return {pairs, full.width, halfHeight};
    if (wanted.width <= halfWidth && wanted.height <= halfHeight) return reduced;
    const bool isSmaller = wanted.width < full.width && wanted.height < full.height;
    if (quality < kExactSizeQuality && isSmaller) return reduced;
    return {pairs, full.width, full.height};
}

} // namespace PK
