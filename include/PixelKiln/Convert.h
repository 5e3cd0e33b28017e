#pragma once

/// \file
/// Conversion of whole images between pixel formats.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Converts an image to another pixel format, size unchanged.
///
/// Formats: every plain raster format with a constant in PixelFormat.h to every other one, in exact steps of
/// one row at a time; and streams (DV and planar 4:2:0) from and to raster formats. Source and destination of one format are copied: a raster image without its row padding, unless the
/// row bytes of both are exactly the bytes of the pixels, and a stream as the one block that it is.
///
/// Alpha: a straight source (A) loses its alpha by premultiplication, that is over black; a premultiplied one
/// (P) keeps its colour. A source without alpha becomes opaque.
///
/// Planar 4:2:0 is one block as PK_GetPlanarBuffers lays it out. It is decoded as PK::DecompressYUV_420_8u does, to
/// VUYX_4444_8u of the destination's matrix if that is 8-bit YUV, else of its own, and goes on from there as any image of
/// that format. To encode it, rows are taken to VUYP_4444_8u of its matrix; each sample of chroma is the sum of two
/// rows, of one field where it has field pictures, weighed 1-2-1 about the even pixel, over 8, rounded down. Frame
/// pictures lose the last row of an odd height; of field pictures, rows behind the last whole four make one row of chroma,
/// of the first of them, which for a lone one lies behind half of the height. Formats of the full range go through BGRX_4444_8u, by the matrix
/// of video range. Bytes of the block beside the samples stay.
///
/// A frame of DV (IEC 61834-2, SMPTE 314M and 370M) is decoded at these sizes:
///
/// | Stream | Sizes | To |
/// |--------|-------|----|
/// | NTSCDV25 | 720 x 480, 720 x 240; below quality 3 also 180 x 120 and 90 x 60 | BGRA, BGRP, BGRX, VUYA, VUYP and VUYX of 8 bits; VUYX for other 4444 of YUV or of floats, BGRX for those of RGB, UYVY for all else |
/// | PALDV25 | 720 x 576, 720 x 288; below quality 3 also 180 x 144 and 90 x 72 | the same |
/// | NTSCDV50, PALDV50 | 720 x 480 or 576, and half the height, with half the width too | YUYV; of half the width VUYA |
/// | DV100 | 960 x 720, 1280 or 1440 x 1080, and half the height, with half the width too | YUYV and VUYA of BT.709 |
///
/// and goes on from there as any image of that format. Half the height alone is rows 0, 2, 4 and so on of the picture. Chroma
/// of 4:1:1 goes in straight lines from one sample to the next, (4 - i) c + i n over 4, rounded down, for pixel i of four; that
/// of 4:2:0 between the rows of its field; at 180 and 90 columns chroma is repeated. Frames of DV25 with 625 lines tell by their
/// header whether they are 4:2:0 or 4:1:1, and those of 720 lines by byte 1 whether they are the first or the second of a pair.
/// Damage in a segment of a frame changes the picture within its five macroblocks alone.
///
/// It is encoded at full size, DV25 also from half of it both ways, DV25 from BGRA_4444_8u for RGB, VUYA_4444_8u for 4444 YUV
/// and UYVY_422_8u or YUYV_422_8u by the order of all else, DV50 from YUYV_422_8u, DV100 from YUYV_422_8u_709; see DV.h. The
/// same picture gives the same bytes at any time.
///
/// Origin: the picture keeps its sense. Between a format that is stored bottom-up and one that is stored
/// top-down (PK_IsOriginTopLeft), rows are exchanged on the way.
///
/// Memory: row bytes may be of either sign and need not be those of PK_PixelFormatRowBytes; for a raster
/// format the first row is the one at the pointer, and row n lies n times the row bytes further on. No
/// alignment is asked for. Of each row exactly PK_PixelFormatPackedRowBytes are read or written: an odd width
/// of a 4:2:2 format goes to the end of its last pair, a width of V210 to the end of its last group of six
/// pixels. A stream of DV or 4:2:0 ignores its row bytes, but for a DV25 or DV100 destination, whose row bytes are the
/// bytes of the frame; one of an unknown kind can only be copied, as a
/// block of that many bytes. Source and destination must not overlap.
///
/// Cache: where bytes are copied as they are, a block of 524288 bytes and more is written past the cache, as
/// PK_CopyMemory does it. Another thread may rely on the destination after any locked or fencing operation, as
/// every mutex performs; a plain or relaxed flag does not suffice.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on
/// different destinations. PK_Initialize must have been called. During the call MXCSR has the flush-to-zero
/// and the precision bit set in addition, and rounds as the caller has it, but for the codecs of DV, which round to
/// nearest; it is restored on return, whatever the result, and pending x87 exceptions are cleared.
///
/// \param source               first byte of the image.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param sourceFormat         a raster format or a stream.
/// \param destination          first byte of the image that is written.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param destinationFormat    a raster format or a stream.
/// \param width                pixels in a row, 0 to 134217727 (16 bytes a pixel in 32 bits). A DV frame that
///                             is copied has its own size and ignores width and height.
/// \param height               rows.
/// \param quality              render quality, 0 to 5. Above 1, chroma of 4:2:2 float is interpolated on its
///                             way to 4:4:4 instead of repeated.
/// \return
///  - PK_Success: converted. A raster conversion of height below 1 or of width 0 does nothing, nor does one of planes
///    without a pixel.
///  - PK_ErrBadSrcFormat: the source format is neither a stream nor a raster format that has a constant.
///  - PK_ErrBadDstFormat: likewise the destination format.
///  - PK_ErrSizeMismatch: the decoder of a source stream gives another size than this; or streams of one
///    unknown kind with different row bytes.
///  - PK_ErrNotSupported: a stream that has no decoder or encoder.
///  - PK_ErrBadDVFormat: a frame of DV25 whose header is none: its application numbers are not all 0 or all 1.
///  - PK_ErrBadDVSourceSize: a size that DV50 or DV100 is not encoded from; PK_ErrSizeMismatch for DV25.
///  - PK_ErrBadDVDestination: row bytes of a DV25 or DV100 destination that are not the bytes of the frame.
///  - PK_ErrOutOfMemory: no memory for a picture between decoding, conversion and encoding, or for rows above
///    16384 pixels.
///  - PK_ErrFailed: a null pointer, a negative width, a width too great, a negative height where there is a stream,
///    planes that have no places in 32 bits, negative row bytes of a stream of unknown kind, or no way between the
///    formats. A copy of a stream of unknown kind looks at no width.
///  - whatever a decoder or encoder reports.
///
/// Arguments are checked before memory is touched. After a failure of a codec or a lack of memory the
/// destination may be partly written.
PK_API PK_Result PK_Convert(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                            void* destination, int32_t destinationRowBytes, PK_PixelFormat destinationFormat,
                            int32_t width, int32_t height, int32_t quality) noexcept;

} // extern "C"
