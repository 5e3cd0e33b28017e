#pragma once

// The plain raster formats of the catalogue: the only ones that rows can be converted between. Any other
// number has no layout that a row kernel could rely on.

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

} // namespace PK
