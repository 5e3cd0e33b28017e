#pragma once

// The pixel formats that have a constant, some numbers that have none, and their names in lines.

#include <PixelKiln/PixelFormat.h>

#include <string>

namespace PKResults {

// clang-format off
inline constexpr PK_PixelFormat kRasters[] = {
    PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYX_4444_8u,
    PK_PixelFormat_VUYA_4444_8u_709, PK_PixelFormat_VUYP_4444_8u_709, PK_PixelFormat_VUYX_4444_8u_709,
    PK_PixelFormat_VUYA_4444_32f, PK_PixelFormat_VUYP_4444_32f, PK_PixelFormat_VUYX_4444_32f,
    PK_PixelFormat_VUYA_4444_32f_709, PK_PixelFormat_VUYP_4444_32f_709, PK_PixelFormat_VUYX_4444_32f_709,
    PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u,
    PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRP_4444_32f, PK_PixelFormat_BGRX_4444_32f,
    PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_PRGB_4444_8u, PK_PixelFormat_XRGB_4444_8u,
    PK_PixelFormat_ARGB_4444_32f, PK_PixelFormat_PRGB_4444_32f, PK_PixelFormat_XRGB_4444_32f,
    PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u_709,
    PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_YUYV_422_8u_709,
    PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_UYVY_422_32f_709,
    PK_PixelFormat_YUYV_422_32f, PK_PixelFormat_YUYV_422_32f_709,
    PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u_709,
    PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRP_4444_15u, PK_PixelFormat_BGRX_4444_15u,
    PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_XRGB_4444_15u,
    PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_BGRP_4444_32f_Linear, PK_PixelFormat_BGRX_4444_32f_Linear,
    PK_PixelFormat_ARGB_4444_32f_Linear, PK_PixelFormat_PRGB_4444_32f_Linear, PK_PixelFormat_XRGB_4444_32f_Linear,
    PK_PixelFormat_RGB_444_10u,
};

inline constexpr PK_PixelFormat kStreams[] = {
    PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25,
    PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_PAL_DV100_720p,
    PK_PixelFormat_NTSC_DV100_1080i, PK_PixelFormat_PAL_DV100_1080i,
    PK_PixelFormat_NTSCDV50, PK_PixelFormat_PALDV50,
    PK_PixelFormat_YUV_420_MPEG2_FIELD, PK_PixelFormat_YUV_420_MPEG2_FRAME,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_709, PK_PixelFormat_YUV_420_MPEG2_FRAME_709,
    PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709, PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709,
    PK_PixelFormat_YUV_420_MPEG4_FIELD, PK_PixelFormat_YUV_420_MPEG4_FRAME,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_709, PK_PixelFormat_YUV_420_MPEG4_FRAME_709,
    PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709,
};

/// Invalid; components in an order that their constants lack, video range of RGB, an unknown depth, all bits; then
/// streams: of kinds beyond the last, and of known kinds with the structure of others.
inline constexpr PK_PixelFormat kStrangers[] = {
    PK_PixelFormat_Invalid, 0x1805, 0x804, 0x1c4, 0xffffffff,
    0x0d000831, 0x10000021, 0x09000811, 0x01000831, 0x0a000931,
};
// clang-format on

/// A name of its own for every format: the one of RGB_444_10u is its own too, strangers have their number.
std::string NameOf(PK_PixelFormat format);

constexpr bool IsFloat(PK_PixelFormat format) {
    return (format & 0x1c0) == 0x100;
}

} // namespace PKResults
