#pragma once

// The plain raster formats of the catalogue: the only ones that rows can be converted between. Any other
// number has no layout that a row kernel could rely on.

#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <iterator>

namespace PK {

inline constexpr PK_PixelFormat kRasterFormats[] = {
    PK_PixelFormat_VUYA_4444_8u,         PK_PixelFormat_VUYP_4444_8u,
    PK_PixelFormat_VUYX_4444_8u,         PK_PixelFormat_VUYA_4444_8u_709,
    PK_PixelFormat_VUYP_4444_8u_709,     PK_PixelFormat_VUYX_4444_8u_709,
    PK_PixelFormat_VUYA_4444_32f,        PK_PixelFormat_VUYP_4444_32f,
    PK_PixelFormat_VUYX_4444_32f,        PK_PixelFormat_VUYA_4444_32f_709,
    PK_PixelFormat_VUYP_4444_32f_709,    PK_PixelFormat_VUYX_4444_32f_709,
    PK_PixelFormat_BGRA_4444_8u,         PK_PixelFormat_BGRP_4444_8u,
    PK_PixelFormat_BGRX_4444_8u,         PK_PixelFormat_BGRA_4444_32f,
    PK_PixelFormat_BGRP_4444_32f,        PK_PixelFormat_BGRX_4444_32f,
    PK_PixelFormat_ARGB_4444_8u,         PK_PixelFormat_PRGB_4444_8u,
    PK_PixelFormat_XRGB_4444_8u,         PK_PixelFormat_ARGB_4444_32f,
    PK_PixelFormat_PRGB_4444_32f,        PK_PixelFormat_XRGB_4444_32f,
    PK_PixelFormat_UYVY_422_8u,          PK_PixelFormat_UYVY_422_8u_709,
    PK_PixelFormat_YUYV_422_8u,          PK_PixelFormat_YUYV_422_8u_709,
    PK_PixelFormat_UYVY_422_32f,         PK_PixelFormat_UYVY_422_32f_709,
    PK_PixelFormat_YUYV_422_32f,         PK_PixelFormat_YUYV_422_32f_709,
    PK_PixelFormat_V210_422_10u,         PK_PixelFormat_V210_422_10u_709,
    PK_PixelFormat_BGRA_4444_15u,        PK_PixelFormat_BGRP_4444_15u,
    PK_PixelFormat_BGRX_4444_15u,        PK_PixelFormat_ARGB_4444_15u,
    PK_PixelFormat_PRGB_4444_15u,        PK_PixelFormat_XRGB_4444_15u,
    PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_BGRP_4444_32f_Linear,
    PK_PixelFormat_BGRX_4444_32f_Linear, PK_PixelFormat_ARGB_4444_32f_Linear,
    PK_PixelFormat_PRGB_4444_32f_Linear, PK_PixelFormat_XRGB_4444_32f_Linear,
    PK_PixelFormat_RGB_444_10u,
};

constexpr bool IsRasterFormat(PK_PixelFormat format) {
    return std::ranges::find(kRasterFormats, format) != std::end(kRasterFormats);
}

/// The 4:4:4 format of a format's colour and order, for an operation to work in. What there is none of is 32f: 10 bits, VUY
/// of 15 bits, linear light of integers. VUY has one order.
constexpr PK_PixelFormat Packed4444(PK_PixelFormat format, uint32_t alpha, uint32_t depth) {
    const uint32_t order = IsYUV(format) ? kOrderBGRA : OrderOf(format);
    const PK_PixelFormat packed = With(format, kStructureMask | kAlphaMask | kDepthMask | kOrderMask,
                                       kStructure444 | alpha | depth | order);
    return IsRasterFormat(packed) ? packed : WithDepth(packed, kDepth32f);
}

} // namespace PK
