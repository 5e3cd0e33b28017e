#pragma once

/// \file
/// Frames of DV, where PK_Convert does not say enough: the second frame of a pair of 720 lines, and DVCPRO of 625 lines.
///
/// A frame is a block of PK_PixelFormatSize bytes. It is encoded from pixels of one format, which any source is converted
/// to by PK_Convert first:
///
/// | Stream           | Pixels that are encoded |
/// |------------------|-------------------------|
/// | NTSCDV25, PALDV25| BGRA_4444_8u of RGB; of YUV, VUYA_4444_8u of four channels, else UYVY_422_8u or YUYV_422_8u by the order |
/// | NTSCDV50, PALDV50| YUYV_422_8u |
/// | DV100            | YUYV_422_8u_709 |
///
/// DV50 and DV100 take the time for the best picture at quality 5, DV25 from 3 on; below they are encoded plainly. A frame
/// has no sound, the time code 0 and the display mode 4:3, DV100 16:9. The same pixels give the same bytes at any time.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Encodes a frame of DV100. One of 720 lines may be the second of a pair, which its blocks and the places of its
/// macroblocks tell; the first is what PK_Convert makes.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Source and destination must not overlap.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called.
///
/// \param src            first byte of the image.
/// \param srcRowBytes    bytes from one row to the next.
/// \param srcFormat      a raster format, or a stream that is decoded.
/// \param width          960 for 720 lines, 1280 for NTSC_DV100_1080i, 1440 for PAL_DV100_1080i.
/// \param height         720 or 1080.
/// \param dst            receives the frame.
/// \param dstBytes       the bytes of the frame.
/// \param channelOffset  2 for the second frame of a pair; any other value makes the first. Ignored for 1080 lines.
/// \param dstFormat      NTSC_DV100_720p, PAL_DV100_720p, NTSC_DV100_1080i or PAL_DV100_1080i.
/// \param quality        render quality, 0 to 5.
/// \return
///  - PK_Success: encoded.
///  - PK_ErrNotSupported: a destination format that is neither DV nor planar 4:2:0.
///  - PK_ErrBadDstFormat: one of these, but no DV100.
///  - PK_ErrBadDVDestination: dstBytes is another number.
///  - PK_ErrBadDVSourceSize: width or height is another one.
///  - PK_ErrOutOfMemory: no memory for the converted picture.
///  - PK_ErrFailed: a null pointer or a negative width or height.
///  - what PK_Convert reports where it cannot convert the source.
///  Nothing is written unless the result is PK_Success.
PK_API PK_Result PK_CompressDV100720pWithChannelOffset(const void* src, int32_t srcRowBytes,
                                                       PK_PixelFormat srcFormat, int32_t width,
                                                       int32_t height, void* dst, int32_t dstBytes,
                                                       int32_t channelOffset, PK_PixelFormat dstFormat,
                                                       int32_t quality) noexcept;

/// Encodes a frame of DV25 with chroma 4:1:1, as SMPTE 314M has it: of 625 lines too, which PK_Convert encodes with 4:2:0.
///
/// Memory and threads: as PK_CompressDV100720pWithChannelOffset; frames of DV25 are encoded one at a time in a process.
///
/// \param src          first byte of the image.
/// \param srcRowBytes  bytes from one row to the next.
/// \param srcFormat    a raster format, or a stream that is decoded.
/// \param width        720, or 360 of a picture that is doubled both ways.
/// \param height       480 or 240 for NTSCDV25, 576 or 288 for PALDV25.
/// \param dst          receives the frame.
/// \param dstBytes     the bytes of the frame.
/// \param dstFormat    NTSCDV25 or PALDV25.
/// \param quality      render quality, 0 to 5.
/// \return
///  - PK_Success: encoded.
///  - PK_ErrNotSupported: a destination format that is neither DV nor planar 4:2:0.
///  - PK_ErrBadSrcFormat: one of these, but no DV25.
///  - PK_ErrSizeMismatch: width or height is another one.
///  - PK_ErrBadDVDestination: dstBytes is another number.
///  - PK_ErrOutOfMemory: no memory for the converted picture.
///  - PK_ErrFailed: a null pointer or a negative width or height.
///  - what PK_Convert reports where it cannot convert the source.
///  Nothing is written unless the result is PK_Success.
PK_API PK_Result PK_CompressDVCPROPAL25(const void* src, int32_t srcRowBytes, PK_PixelFormat srcFormat,
                                        int32_t width, int32_t height, void* dst, int32_t dstBytes,
                                        PK_PixelFormat dstFormat, int32_t quality) noexcept;

} // extern "C"
