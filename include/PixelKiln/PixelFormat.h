#pragma once

/// \file
/// Pixel formats: their numbers, sizes, names and the mapping from the host's identifiers.
///
/// A pixel format is a bit-field. Every function here goes by the bits and takes any number, named or not.
///
/// | Bits  | Field           | Values |
/// |-------|-----------------|--------|
/// | 0     | colour model    | 0 RGB, 1 YUV |
/// | 1     | light           | 0 gamma-coded, 1 linear |
/// | 2-3   | alpha kind      | 0 none, 4 straight (A), 8 premultiplied (P), 0xc stored but meaningless (X) |
/// | 4-5   | structure       | 0 4:4:4 interleaved, 0x10 4:2:2 interleaved, 0x20 DV, 0x30 4:2:0 planar |
/// | 6-8   | sample depth    | 0 8u, 0x40 10u packed, 0x80 15u in 16-bit words, 0x100 32f |
/// | 9-10  | colour matrix   | 0 BT.601, 0x200 BT.709 |
/// | 11    | range           | 0x800 on YUV of video range; 0 on full range and on RGB |
/// | 12    | component order | 0 BGRA or UYVY, 0x1000 ARGB or YUYV |
/// | 13-23 | reserved        | 0 |
/// | 24-31 | stream kind     | 0 plain raster, 1 to 8 DV, 9 to 12 planar 4:2:0 |
///
/// Names give the memory order of a pixel from the lowest address, the channel structure and the depth.
/// All functions may be called from any thread.

#include <PixelKiln/HostTypes.h>
#include <PixelKiln/Types.h>

/// No format.
inline constexpr PK_PixelFormat PK_PixelFormat_Invalid = 0;

// YUV 8-bit, matrix 601.
inline constexpr PK_PixelFormat PK_PixelFormat_VUYA_4444_8u = 0x805;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYP_4444_8u = 0x809;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYX_4444_8u = 0x80d;

// YUV 8-bit, matrix 709.
inline constexpr PK_PixelFormat PK_PixelFormat_VUYA_4444_8u_709 = 0xa05;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYP_4444_8u_709 = 0xa09;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYX_4444_8u_709 = 0xa0d;

// YUV float, matrix 601.
inline constexpr PK_PixelFormat PK_PixelFormat_VUYA_4444_32f = 0x905;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYP_4444_32f = 0x909;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYX_4444_32f = 0x90d;

// YUV float, matrix 709.
inline constexpr PK_PixelFormat PK_PixelFormat_VUYA_4444_32f_709 = 0xb05;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYP_4444_32f_709 = 0xb09;
inline constexpr PK_PixelFormat PK_PixelFormat_VUYX_4444_32f_709 = 0xb0d;

// BGR 8-bit.
inline constexpr PK_PixelFormat PK_PixelFormat_BGRA_4444_8u = 0x4;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRP_4444_8u = 0x8;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRX_4444_8u = 0xc;

// BGR float.
inline constexpr PK_PixelFormat PK_PixelFormat_BGRA_4444_32f = 0x104;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRP_4444_32f = 0x108;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRX_4444_32f = 0x10c;

// ARGB 8-bit.
inline constexpr PK_PixelFormat PK_PixelFormat_ARGB_4444_8u = 0x1004;
inline constexpr PK_PixelFormat PK_PixelFormat_PRGB_4444_8u = 0x1008;
inline constexpr PK_PixelFormat PK_PixelFormat_XRGB_4444_8u = 0x100c;

// ARGB float.
inline constexpr PK_PixelFormat PK_PixelFormat_ARGB_4444_32f = 0x1104;
inline constexpr PK_PixelFormat PK_PixelFormat_PRGB_4444_32f = 0x1108;
inline constexpr PK_PixelFormat PK_PixelFormat_XRGB_4444_32f = 0x110c;

// 4:2:2 8-bit.
inline constexpr PK_PixelFormat PK_PixelFormat_UYVY_422_8u = 0x811;
inline constexpr PK_PixelFormat PK_PixelFormat_UYVY_422_8u_709 = 0xa11;
inline constexpr PK_PixelFormat PK_PixelFormat_YUYV_422_8u = 0x1811;
inline constexpr PK_PixelFormat PK_PixelFormat_YUYV_422_8u_709 = 0x1a11;

// 4:2:2 float.
inline constexpr PK_PixelFormat PK_PixelFormat_UYVY_422_32f = 0x911;
inline constexpr PK_PixelFormat PK_PixelFormat_UYVY_422_32f_709 = 0xb11;
inline constexpr PK_PixelFormat PK_PixelFormat_YUYV_422_32f = 0x1911;
inline constexpr PK_PixelFormat PK_PixelFormat_YUYV_422_32f_709 = 0x1b11;

// 4:2:2 10-bit, six pixels packed into 16 bytes.
inline constexpr PK_PixelFormat PK_PixelFormat_V210_422_10u = 0x851;
inline constexpr PK_PixelFormat PK_PixelFormat_V210_422_10u_709 = 0xa51;

// BGR 15-bit in 16-bit words.
inline constexpr PK_PixelFormat PK_PixelFormat_BGRA_4444_15u = 0x84;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRP_4444_15u = 0x88;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRX_4444_15u = 0x8c;

// ARGB 15-bit in 16-bit words.
inline constexpr PK_PixelFormat PK_PixelFormat_ARGB_4444_15u = 0x1084;
inline constexpr PK_PixelFormat PK_PixelFormat_PRGB_4444_15u = 0x1088;
inline constexpr PK_PixelFormat PK_PixelFormat_XRGB_4444_15u = 0x108c;

// BGR float, linear light.
inline constexpr PK_PixelFormat PK_PixelFormat_BGRA_4444_32f_Linear = 0x106;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRP_4444_32f_Linear = 0x10a;
inline constexpr PK_PixelFormat PK_PixelFormat_BGRX_4444_32f_Linear = 0x10e;

// ARGB float, linear light.
inline constexpr PK_PixelFormat PK_PixelFormat_ARGB_4444_32f_Linear = 0x1106;
inline constexpr PK_PixelFormat PK_PixelFormat_PRGB_4444_32f_Linear = 0x110a;
inline constexpr PK_PixelFormat PK_PixelFormat_XRGB_4444_32f_Linear = 0x110e;

// RGB 10-bit, one pixel packed into 4 bytes.
inline constexpr PK_PixelFormat PK_PixelFormat_RGB_444_10u = 0x40;

// DV frames of a fixed number of bytes.
inline constexpr PK_PixelFormat PK_PixelFormat_NTSCDV25 = 0x01000821;
inline constexpr PK_PixelFormat PK_PixelFormat_PALDV25 = 0x02000821;
inline constexpr PK_PixelFormat PK_PixelFormat_NTSC_DV100_720p = 0x03000a21;
inline constexpr PK_PixelFormat PK_PixelFormat_PAL_DV100_720p = 0x04000a21;
inline constexpr PK_PixelFormat PK_PixelFormat_NTSC_DV100_1080i = 0x05000a21;
inline constexpr PK_PixelFormat PK_PixelFormat_PAL_DV100_1080i = 0x06000a21;
inline constexpr PK_PixelFormat PK_PixelFormat_NTSCDV50 = 0x07000821;
inline constexpr PK_PixelFormat PK_PixelFormat_PALDV50 = 0x08000821;

// 4:2:0 planar, chroma sited as in MPEG-2; FIELD and FRAME tell how the picture is coded.
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FIELD = 0x09000831;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FRAME = 0x0a000831;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange = 0x09000031;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange = 0x0a000031;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FIELD_709 = 0x09000a31;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FRAME_709 = 0x0a000a31;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange_709 = 0x09000231;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709 = 0x0a000231;

// 4:2:0 planar, chroma sited as in MPEG-4; FIELD and FRAME tell how the picture is coded.
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FIELD = 0x0b000831;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FRAME = 0x0c000831;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange = 0x0b000031;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange = 0x0c000031;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FIELD_709 = 0x0b000a31;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FRAME_709 = 0x0c000a31;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709 = 0x0b000231;
inline constexpr PK_PixelFormat PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709 = 0x0c000231;

extern "C" {

/// The pixel format of one of the host's identifiers.
/// \param format  the identifier; both words count.
/// \return the format, or PK_PixelFormat_Invalid for an identifier that has none.
PK_API PK_PixelFormat PK_ZEBPixelFormatToPKPixelFormat(const zebmediatypes::PixelFormat& format) noexcept;

/// The bytes that one image takes, rows padded as PK_PixelFormatRowBytes pads them.
/// \param format  any format. A DV format has a frame of fixed size and ignores \p width and \p height. A
///                4:2:0 format counts its three planes as PK_GetPlanarBuffers lays them out.
/// \param width   pixels in a row.
/// \param height  rows.
/// \return the number of bytes; 0 for Invalid and for a format without a known layout. For a raster format the product is
///         formed in 32 bits and sign-extended, so that one above 2147483647 bytes wraps; hosts rely on it.
PK_API int64_t PK_PixelFormatSize(PK_PixelFormat format, int32_t width, int32_t height) noexcept;

/// Whether the first row in memory is the top row of the picture. So it is for all formats but the
/// interleaved four-channel ones (4:4:4 with an alpha kind other than 0), and for those too while switch 10
/// of PK_SetDebugFlag is on.
PK_API bool PK_IsOriginTopLeft(PK_PixelFormat format) noexcept;

/// Whether the first row in memory is the bottom row of the picture: the negation of PK_IsOriginTopLeft.
PK_API bool PK_IsOriginBottomLeft(PK_PixelFormat format) noexcept;

/// The bytes from one row to the next. Rows are padded to 128 bytes for V210, to 16 for other 4:2:2 formats
/// and to 64 for the rest.
/// \param format  any format.
/// \param width   pixels in a row; the bytes are computed in 32 bits and wrap beyond.
/// \return the number of bytes; 0 for a stream (DV and 4:2:0 planar), for Invalid and for an unknown depth.
PK_API int32_t PK_PixelFormatRowBytes(PK_PixelFormat format, int32_t width) noexcept;

/// The bytes that the pixels of a row take, without padding. A 4:2:2 row is counted in whole pairs of
/// pixels, a V210 row in whole groups of six.
/// \param format  any format.
/// \param width   pixels in a row; the bytes are computed in 32 bits and wrap beyond.
/// \return the number of bytes; 0 for Invalid and for an unknown depth of a 4:4:4 format.
PK_API int32_t PK_PixelFormatPackedRowBytes(PK_PixelFormat format, int32_t width) noexcept;

/// The name of a format, for tracing. RGB_444_10u has no entry and counts as unknown.
/// \return constant text, never null: the name without prefix, "Invalid" for 0, or "Unknown pixel format".
PK_API const char* PK_PixelFormatName(PK_PixelFormat format) noexcept;

} // extern "C"
