#pragma once

/// \file
/// The host's identifiers of pixel formats. The numbers are those of the bundled host: a group and a place in
/// it, none of them 0. A host with numbers of its own puts a header of this name in front of this one.

#include <PixelKiln/HostTypes.h>

namespace zebmediatypes {

// clang-format off
// BGRA, VUYA, ARGB and kin, 8-bit.
inline constexpr PixelFormat kPixelFormat_BGRA_4444_8u = {{1, 1}};
inline constexpr PixelFormat kPixelFormat_VUYA_4444_8u = {{1, 2}};
inline constexpr PixelFormat kPixelFormat_VUYA_4444_8u_709 = {{1, 3}};
inline constexpr PixelFormat kPixelFormat_ARGB_4444_8u = {{1, 4}};
inline constexpr PixelFormat kPixelFormat_BGRX_4444_8u = {{1, 5}};
inline constexpr PixelFormat kPixelFormat_VUYX_4444_8u = {{1, 6}};
inline constexpr PixelFormat kPixelFormat_VUYX_4444_8u_709 = {{1, 7}};
inline constexpr PixelFormat kPixelFormat_XRGB_4444_8u = {{1, 8}};
inline constexpr PixelFormat kPixelFormat_BGRP_4444_8u = {{1, 9}};
inline constexpr PixelFormat kPixelFormat_VUYP_4444_8u = {{1, 10}};
inline constexpr PixelFormat kPixelFormat_VUYP_4444_8u_709 = {{1, 11}};
inline constexpr PixelFormat kPixelFormat_PRGB_4444_8u = {{1, 12}};

// 15-bit.
inline constexpr PixelFormat kPixelFormat_BGRA_4444_15u = {{2, 1}};
inline constexpr PixelFormat kPixelFormat_BGRX_4444_15u = {{2, 2}};
inline constexpr PixelFormat kPixelFormat_BGRP_4444_15u = {{2, 3}};
inline constexpr PixelFormat kPixelFormat_ARGB_4444_15u = {{2, 4}};
inline constexpr PixelFormat kPixelFormat_XRGB_4444_15u = {{2, 5}};
inline constexpr PixelFormat kPixelFormat_PRGB_4444_15u = {{2, 6}};

// 10-bit RGB.
inline constexpr PixelFormat kPixelFormat_RGB_444_10u = {{3, 1}};

// Float.
inline constexpr PixelFormat kPixelFormat_BGRA_4444_32f = {{4, 1}};
inline constexpr PixelFormat kPixelFormat_VUYA_4444_32f = {{4, 2}};
inline constexpr PixelFormat kPixelFormat_VUYA_4444_32f_709 = {{4, 3}};
inline constexpr PixelFormat kPixelFormat_ARGB_4444_32f = {{4, 4}};
inline constexpr PixelFormat kPixelFormat_XRGB_4444_32f = {{4, 5}};
inline constexpr PixelFormat kPixelFormat_BGRX_4444_32f = {{4, 6}};
inline constexpr PixelFormat kPixelFormat_VUYX_4444_32f = {{4, 7}};
inline constexpr PixelFormat kPixelFormat_VUYX_4444_32f_709 = {{4, 8}};
inline constexpr PixelFormat kPixelFormat_PRGB_4444_32f = {{4, 9}};
inline constexpr PixelFormat kPixelFormat_BGRP_4444_32f = {{4, 10}};
inline constexpr PixelFormat kPixelFormat_VUYP_4444_32f = {{4, 11}};
inline constexpr PixelFormat kPixelFormat_VUYP_4444_32f_709 = {{4, 12}};

// Float, linear light.
inline constexpr PixelFormat kPixelFormat_BGRA_4444_32f_Linear = {{5, 1}};
inline constexpr PixelFormat kPixelFormat_ARGB_4444_32f_Linear = {{5, 2}};
inline constexpr PixelFormat kPixelFormat_BGRP_4444_32f_Linear = {{5, 3}};
inline constexpr PixelFormat kPixelFormat_PRGB_4444_32f_Linear = {{5, 4}};

// 4:2:2 float.
inline constexpr PixelFormat kPixelFormat_UYVY_422_32f = {{6, 1}};
inline constexpr PixelFormat kPixelFormat_UYVY_422_32f_709 = {{6, 2}};

// DV.
inline constexpr PixelFormat kPixelFormat_NTSCDV25 = {{7, 1}};
inline constexpr PixelFormat kPixelFormat_PALDV25 = {{7, 2}};
inline constexpr PixelFormat kPixelFormat_NTSCDV50 = {{7, 3}};
inline constexpr PixelFormat kPixelFormat_PALDV50 = {{7, 4}};
inline constexpr PixelFormat kPixelFormat_NTSC_DV100_720p = {{7, 5}};
inline constexpr PixelFormat kPixelFormat_PAL_DV100_720p = {{7, 6}};
inline constexpr PixelFormat kPixelFormat_NTSC_DV100_1080i = {{7, 7}};
inline constexpr PixelFormat kPixelFormat_PAL_DV100_1080i = {{7, 8}};

// 4:2:2 8-bit and 10-bit.
inline constexpr PixelFormat kPixelFormat_YUYV_422_8u = {{8, 1}};
inline constexpr PixelFormat kPixelFormat_YUYV_422_8u_709 = {{8, 2}};
inline constexpr PixelFormat kPixelFormat_V210_422_10u = {{8, 3}};
inline constexpr PixelFormat kPixelFormat_V210_422_10u_709 = {{8, 4}};
inline constexpr PixelFormat kPixelFormat_UYVY_422_8u = {{8, 5}};
inline constexpr PixelFormat kPixelFormat_UYVY_422_8u_709 = {{8, 6}};

// 4:2:0 planar, chroma sited as in MPEG-2.
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601 = {{9, 1}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601 = {{9, 2}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_601_FullRange = {{9, 3}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_601_FullRange = {{9, 4}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709_FullRange = {{9, 5}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709_FullRange = {{9, 6}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FIELD_PICTURE_PLANAR_8u_709 = {{9, 7}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG2_FRAME_PICTURE_PLANAR_8u_709 = {{9, 8}};

// 4:2:0 planar, chroma sited as in MPEG-4.
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601 = {{10, 1}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601 = {{10, 2}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_601_FullRange = {{10, 3}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_601_FullRange = {{10, 4}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709_FullRange = {{10, 5}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709_FullRange = {{10, 6}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FIELD_PICTURE_PLANAR_8u_709 = {{10, 7}};
inline constexpr PixelFormat kPixelFormat_YUV_420_MPEG4_FRAME_PICTURE_PLANAR_8u_709 = {{10, 8}};

// clang-format on

} // namespace zebmediatypes
