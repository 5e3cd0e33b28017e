// The host's identifiers of pixel formats and the formats they stand for.

#include <PixelKiln/PixelFormat.h>

#include "zebmediatypes/PixelFormat.h"

namespace {

using namespace zebmediatypes;

struct HostFormat {
    const PixelFormat* identifier;
    PK_PixelFormat format;
};

// Looked up from the top; the first match decides.
// clang-format off
constexpr HostFormat kHostFormats[] = {
    {&kPixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {&kPixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYA_4444_8u},
    {&kPixelFormat_VUYA_4444_8u_709, PK_PixelFormat_VUYA_4444_8u_709},
    {&kPixelFormat_ARGB_4444_8u, PK_PixelFormat_ARGB_4444_8u},
    {&kPixelFormat_BGRX_4444_8u, PK_PixelFormat_BGRX_4444_8u},
    {&kPixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYX_4444_8u},
    {&kPixelFormat_VUYX_4444_8u_709, PK_PixelFormat_VUYX_4444_8u_709},
    {&kPixelFormat_XRGB_4444_8u, PK_PixelFormat_XRGB_4444_8u},
    {&kPixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRP_4444_8u},
    {&kPixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYP_4444_8u},
    {&kPixelFormat_VUYP_4444_8u_709, PK_PixelFormat_VUYP_4444_8u_709},
    {&kPixelFormat_PRGB_4444_8u, PK_PixelFormat_PRGB_4444_8u},
    {&kPixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_15u},
    {&kPixelFormat_BGRX_4444_15u, PK_PixelFormat_BGRX_4444_15u},
    {&kPixelFormat_BGRP_4444_15u, PK_PixelFormat_BGRP_4444_15u},
    {&kPixelFormat_ARGB_4444_15u, PK_PixelFormat_ARGB_4444_15u},
    {&kPixelFormat_XRGB_4444_15u, PK_PixelFormat_XRGB_4444_15u},
    {&kPixelFormat_PRGB_4444_15u, PK_PixelFormat_PRGB_4444_15u},
    {&kPixelFormat_RGB_444_10u, PK_PixelFormat_RGB_444_10u},
    {&kPixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_32f},
    {&kPixelFormat_VUYA_4444_32f, PK_PixelFormat_VUYA_4444_32f},
    {&kPixelFormat_VUYA_4444_32f_709, PK_PixelFormat_VUYA_4444_32f_709},
    {&kPixelFormat_ARGB_4444_32f, PK_PixelFormat_ARGB_4444_32f},
    {&kPixelFormat_XRGB_4444_32f, PK_PixelFormat_XRGB_4444_32f},
    {&kPixelFormat_BGRX_4444_32f, PK_PixelFormat_BGRX_4444_32f},
    {&kPixelFormat_VUYX_4444_32f, PK_PixelFormat_VUYX_4444_32f},
    {&kPixelFormat_VUYX_4444_32f_709, PK_PixelFormat_VUYX_4444_32f_709},
    {&kPixelFormat_PRGB_4444_32f, PK_PixelFormat_PRGB_4444_32f},
    {&kPixelFormat_BGRP_4444_32f, PK_PixelFormat_BGRP_4444_32f},
    {&kPixelFormat_VUYP_4444_32f, PK_PixelFormat_VUYP_4444_32f},
    {&kPixelFormat_VUYP_4444_32f_709, PK_PixelFormat_VUYP_4444_32f_709},
    {&kPixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_BGRA_4444_32f_Linear},
    {&kPixelFormat_ARGB_4444_32f_Linear, PK_PixelFormat_ARGB_4444_32f_Linear},
    {&kPixelFormat_BGRP_4444_32f_Linear, PK_PixelFormat_BGRP_4444_32f_Linear},
    {&kPixelFormat_PRGB_4444_32f_Linear, PK_PixelFormat_PRGB_4444_32f_Linear},
    {&kPixelFormat_UYVY_422_32f, PK_PixelFormat_UYVY_422_32f},
    {&kPixelFormat_UYVY_422_32f_709, PK_PixelFormat_UYVY_422_32f_709},
    {&kPixelFormat_NTSCDV25, PK_PixelFormat_NTSCDV25},
    {&kPixelFormat_PALDV25, PK_PixelFormat_PALDV25},
    {&kPixelFormat_NTSCDV50, PK_PixelFormat_NTSCDV50},
    {&kPixelFormat_PALDV50, PK_PixelFormat_PALDV50},
    {&kPixelFormat_NTSC_DV100_720p, PK_PixelFormat_NTSC_DV100_720p},
    {&kPixelFormat_PAL_DV100_720p, PK_PixelFormat_PAL_DV100_720p},
    {&kPixelFormat_NTSC_DV100_1080i, PK_PixelFormat_NTSC_DV100_1080i},
    {&kPixelFormat_PAL_DV100_1080i, PK_PixelFormat_PAL_DV100_1080i},
    {&kPixelFormat_YUYV_422_8u, PK_PixelFormat_YUYV_422_8u},
    {&kPixelFormat_YUYV_422_8u_709, PK_PixelFormat_YUYV_422_8u_709},
    {&kPixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u},
    {&kPixelFormat_V210_422_10u_709, PK_PixelFormat_V210_422_10u_709},
    {&kPixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u},
    {&kPixelFormat_UYVY_422_8u_709, PK_PixelFormat_UYVY_422_8u_709},
    {&kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601, PK_PixelFormat_YUV_420_MPEG2_FIELD},
    {&kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601, PK_PixelFormat_YUV_420_MPEG2_FRAME},
    {&kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601_FullRange, PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange},
    {&kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601_FullRange, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange},
    {&kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709_FullRange, PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709},
    {&kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709_FullRange, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709},
    {&kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709, PK_PixelFormat_YUV_420_MPEG2_FIELD_709},
    {&kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709, PK_PixelFormat_YUV_420_MPEG2_FRAME_709},
    {&kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601, PK_PixelFormat_YUV_420_MPEG4_FIELD},
    {&kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601, PK_PixelFormat_YUV_420_MPEG4_FRAME},
    {&kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601_FullRange, PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange},
    {&kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601_FullRange, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange},
    {&kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709_FullRange, PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709},
    {&kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709_FullRange, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709},
    {&kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709, PK_PixelFormat_YUV_420_MPEG4_FIELD_709},
    {&kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709, PK_PixelFormat_YUV_420_MPEG4_FRAME_709},
};
// clang-format on

} // namespace

PK_PixelFormat PK_ZEBPixelFormatToPKPixelFormat(const zebmediatypes::PixelFormat& format) noexcept {
    for (const HostFormat& row : kHostFormats) {
        if (*row.identifier == format) return row.format;
    }
    return PK_PixelFormat_Invalid;
}
