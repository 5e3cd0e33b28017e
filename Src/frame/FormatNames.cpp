// Names of the pixel formats, for tracing.

#include <PixelKiln/PixelFormat.h>

namespace {

struct FormatName {
    uint32_t format;
    char name[36];
};

// RGB_444_10u has no row; traces of it read as unknown.
// clang-format off
constexpr FormatName kFormatNames[] = {
    {PK_PixelFormat_Invalid, "Invalid"},
    {PK_PixelFormat_VUYA_4444_8u, "VUYA_4444_8u"},
    {PK_PixelFormat_VUYP_4444_8u, "VUYP_4444_8u"},
    {PK_PixelFormat_VUYX_4444_8u, "VUYX_4444_8u"},
    {PK_PixelFormat_VUYA_4444_8u_709, "VUYA_4444_8u_709"},
    {PK_PixelFormat_VUYP_4444_8u_709, "VUYP_4444_8u_709"},
    {PK_PixelFormat_VUYX_4444_8u_709, "VUYX_4444_8u_709"},
    {PK_PixelFormat_VUYA_4444_32f, "VUYA_4444_32f"},
    {PK_PixelFormat_VUYP_4444_32f, "VUYP_4444_32f"},
    {PK_PixelFormat_VUYX_4444_32f, "VUYX_4444_32f"},
    {PK_PixelFormat_VUYA_4444_32f_709, "VUYA_4444_32f_709"},
    {PK_PixelFormat_VUYP_4444_32f_709, "VUYP_4444_32f_709"},
    {PK_PixelFormat_VUYX_4444_32f_709, "VUYX_4444_32f_709"},
    {PK_PixelFormat_BGRA_4444_8u, "BGRA_4444_8u"},
    {PK_PixelFormat_BGRP_4444_8u, "BGRP_4444_8u"},
    {PK_PixelFormat_BGRX_4444_8u, "BGRX_4444_8u"},
    {PK_PixelFormat_BGRA_4444_32f, "BGRA_4444_32f"},
    {PK_PixelFormat_BGRP_4444_32f, "BGRP_4444_32f"},
    {PK_PixelFormat_BGRX_4444_32f, "BGRX_4444_32f"},
    {PK_PixelFormat_ARGB_4444_8u, "ARGB_4444_8u"},
    {PK_PixelFormat_PRGB_4444_8u, "PRGB_4444_8u"},
    {PK_PixelFormat_XRGB_4444_8u, "XRGB_4444_8u"},
    {PK_PixelFormat_ARGB_4444_32f, "ARGB_4444_32f"},
    {PK_PixelFormat_PRGB_4444_32f, "PRGB_4444_32f"},
    {PK_PixelFormat_XRGB_4444_32f, "XRGB_4444_32f"},
    {PK_PixelFormat_UYVY_422_8u, "UYVY_422_8u"},
    {PK_PixelFormat_UYVY_422_8u_709, "UYVY_422_8u_709"},
    {PK_PixelFormat_YUYV_422_8u, "YUYV_422_8u"},
    {PK_PixelFormat_YUYV_422_8u_709, "YUYV_422_8u_709"},
    {PK_PixelFormat_UYVY_422_32f, "UYVY_422_32f"},
    {PK_PixelFormat_UYVY_422_32f_709, "UYVY_422_32f_709"},
    {PK_PixelFormat_YUYV_422_32f, "YUYV_422_32f"},
    {PK_PixelFormat_YUYV_422_32f_709, "YUYV_422_32f_709"},
    {PK_PixelFormat_V210_422_10u, "V210_422_10u"},
    {PK_PixelFormat_V210_422_10u_709, "V210_422_10u_709"},
    {PK_PixelFormat_BGRA_4444_15u, "BGRA_4444_15u"},
    {PK_PixelFormat_BGRP_4444_15u, "BGRP_4444_15u"},
    {PK_PixelFormat_BGRX_4444_15u, "BGRX_4444_15u"},
    {PK_PixelFormat_ARGB_4444_15u, "ARGB_4444_15u"},
    {PK_PixelFormat_PRGB_4444_15u, "PRGB_4444_15u"},
    {PK_PixelFormat_XRGB_4444_15u, "XRGB_4444_15u"},
    {PK_PixelFormat_BGRA_4444_32f_Linear, "BGRA_4444_32f_Linear"},
    {PK_PixelFormat_BGRP_4444_32f_Linear, "BGRP_4444_32f_Linear"},
    {PK_PixelFormat_BGRX_4444_32f_Linear, "BGRX_4444_32f_Linear"},
    {PK_PixelFormat_ARGB_4444_32f_Linear, "ARGB_4444_32f_Linear"},
    {PK_PixelFormat_PRGB_4444_32f_Linear, "PRGB_4444_32f_Linear"},
    {PK_PixelFormat_XRGB_4444_32f_Linear, "XRGB_4444_32f_Linear"},
    {PK_PixelFormat_NTSCDV25, "NTSCDV25"},
    {PK_PixelFormat_PALDV25, "PALDV25"},
    {PK_PixelFormat_NTSC_DV100_720p, "NTSC_DV100_720p"},
    {PK_PixelFormat_PAL_DV100_720p, "PAL_DV100_720p"},
    {PK_PixelFormat_NTSC_DV100_1080i, "NTSC_DV100_1080i"},
    {PK_PixelFormat_PAL_DV100_1080i, "PAL_DV100_1080i"},
    {PK_PixelFormat_NTSCDV50, "NTSCDV50"},
    {PK_PixelFormat_PALDV50, "PALDV50"},
    {PK_PixelFormat_YUV_420_MPEG2_FIELD, "YUV_420_MPEG2_FIELD"},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME, "YUV_420_MPEG2_FRAME"},
    {PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange, "YUV_420_MPEG2_FIELD_FullRange"},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange, "YUV_420_MPEG2_FRAME_FullRange"},
    {PK_PixelFormat_YUV_420_MPEG2_FIELD_709, "YUV_420_MPEG2_FIELD_709"},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME_709, "YUV_420_MPEG2_FRAME_709"},
    {PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709, "YUV_420_MPEG2_FIELD_FullRange_709"},
    {PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709, "YUV_420_MPEG2_FRAME_FullRange_709"},
    {PK_PixelFormat_YUV_420_MPEG4_FIELD, "YUV_420_MPEG4_FIELD"},
    {PK_PixelFormat_YUV_420_MPEG4_FRAME, "YUV_420_MPEG4_FRAME"},
    {PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange, "YUV_420_MPEG4_FIELD_FullRange"},
    {PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange, "YUV_420_MPEG4_FRAME_FullRange"},
    {PK_PixelFormat_YUV_420_MPEG4_FIELD_709, "YUV_420_MPEG4_FIELD_709"},
    {PK_PixelFormat_YUV_420_MPEG4_FRAME_709, "YUV_420_MPEG4_FRAME_709"},
    {PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709, "YUV_420_MPEG4_FIELD_FullRange_709"},
    {PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709, "YUV_420_MPEG4_FRAME_FullRange_709"},
};
// clang-format on

static_assert(sizeof kFormatNames == 71 * 40, "71 rows of a 32-bit number and 36 characters");

} // namespace

const char* PK_PixelFormatName(PK_PixelFormat format) noexcept {
    for (const FormatName& row : kFormatNames) {
        if (row.format == format) return row.name;
    }
    return "Unknown pixel format";
}
