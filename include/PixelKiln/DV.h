#pragma once

/// \file
/// Frames of DV, where PK_Convert does not say enough: the second frame of a pair of 720 lines, and DVCPRO of 625 lines; and
/// two frames joined field by field.
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
/// Memory and threads: as PK_CompressDV100720pWithChannelOffset; a host's own encoder of DV25 may take one frame at a time.
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

/// Makes one frame of DV25 of two, a field of each. Both are decoded to YUYV_422_8u, the odd rows of the first replace those
/// of the second, and what comes out is encoded: rows 0, 2, 4 ... are the second frame's, rows 1, 3, 5 ... the first's.
///
/// The result says of the shape of its picture what the first frame says. Each DIF sequence of a frame may have a VAUX
/// source control pack (0x61), 453 bytes behind its begin in sequences 0, 2, 4 ..., 248 bytes in the others. What
/// most of those in the first frame tell, of equally many the first in this list, goes into every such pack of the
/// result; their other bits are the encoder's. Where no pack tells one of these, the packs stay as they are encoded.
///
/// | Shape                | low 3 bits of the third byte and low 2 of the fourth, as they are read | as they are written |
/// |----------------------|---------------------------------------------|-----------------------------------------|
/// | 4:3                  | 0, 0; 0, 1                                  | 0 and 0, or 0 and 1 in 625 lines        |
/// | 16:9 between bars    | 1, 0; 3 to 5, 1                             | 1, 0                                    |
/// | 16:9                 | 2, 0; 7, 1                                  | 2 and 0, or 7 and 1 in 625 lines        |
/// | 14:9 between bars    | 1 or 2, 1                                   | 1, 1                                    |
/// | 14:9                 | 6, 1                                        | 6, 1                                    |
///
/// A frame of 625 lines may be 4:2:0 or, as its header tells, 4:1:1; the result is 4:2:0. Audio, time code and whatever
/// else the frames carry beside the picture is not taken over.
///
/// Memory: no alignment is asked for. The frames may overlap in any way, and \p dst may be one of them: all that is read
/// is read before the first byte is written.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time with different results.
/// PK_Initialize must have been called. MXCSR is left as it was.
///
/// \param frameA      the frame of the odd rows and of the shape.
/// \param frameB      the frame of the even rows.
/// \param dst         the frame that is written, whole.
/// \param frameBytes  120000 for NTSCDV25; with any other number all three are frames of PALDV25, of 144000 bytes. Hosts
///                    rely on it.
/// \param quality     render quality of decoding and encoding, 0 to 5, as for PK_Convert.
/// \return
///  - PK_Success: done.
///  - PK_ErrFailed: a null pointer.
///  - PK_ErrOutOfMemory: no memory for the two pictures.
///  - PK_ErrBadDVFormat: one of the frames has no header of DV25.
///  - whatever else PK_Convert reports of the decoder or the encoder.
///
/// Nothing is written before both frames are decoded, so that these leave \p dst as it was, but for a failure of the
/// encoder.
PK_API PK_Result PK_MergeDV(const void* frameA, const void* frameB, void* dst, int32_t frameBytes,
                            int32_t quality) noexcept;

/// The same for frames of every DV format, all three of PK_PixelFormatSize bytes: 120000 and 144000 for DV25, 240000 and
/// 288000 for DV50 and for 720 lines, 480000 and 576000 for 1080 lines.
///
/// Of DV100 it is the even rows of the first frame that replace those of the second: rows 0, 2, 4 ... are the first
/// frame's, rows 1, 3, 5 ... the second's. Of 720 lines, byte 8 of the second frame is kept in the result, which is the
/// first of a pair even where both frames are second ones. DV100 is coded by the matrix of BT.709 and joined in YUYV_422_8u,
/// which is of BT.601: it is taken there and back.
///
/// \param frameA   the frame of one field and of the shape.
/// \param frameB   the frame of the other.
/// \param dst      the frame that is written, whole; may overlap the others.
/// \param format   the format of all three, one of DV.
/// \param quality  render quality of decoding and encoding, 0 to 5, as for PK_Convert.
/// \return as PK_MergeDV, and before all else PK_ErrBadSrcFormat for a format that is no DV.
PK_API PK_Result PK_MergeDVCPRO(const void* frameA, const void* frameB, void* dst, PK_PixelFormat format,
                                int32_t quality) noexcept;

} // extern "C"
