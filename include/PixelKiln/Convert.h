#pragma once

/// \file
/// Conversion of whole images between pixel formats.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Converts an image to another pixel format, size unchanged.
///
/// Formats: every plain raster format with a constant in PixelFormat.h to every other one, in exact steps of
/// one row at a time; and streams (DV and planar 4:2:0) from and to raster formats as far as there is a
/// codec. Source and destination of one format are copied: a raster image without its row padding, unless the
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
/// Origin: the picture keeps its sense. Between a format that is stored bottom-up and one that is stored
/// top-down (PK_IsOriginTopLeft), rows are exchanged on the way.
///
/// Memory: row bytes may be of either sign and need not be those of PK_PixelFormatRowBytes; for a raster
/// format the first row is the one at the pointer, and row n lies n times the row bytes further on. No
/// alignment is asked for. Of each row exactly PK_PixelFormatPackedRowBytes are read or written: an odd width
/// of a 4:2:2 format goes to the end of its last pair, a width of V210 to the end of its last group of six
/// pixels. A stream of DV or 4:2:0 ignores its row bytes; one of an unknown kind can only be copied, as a
/// block of that many bytes. Source and destination must not overlap.
///
/// Cache: where bytes are copied as they are, a block of 524288 bytes and more is written past the cache, as
/// PK_CopyMemory does it. Another thread may rely on the destination after any locked or fencing operation, as
/// every mutex performs; a plain or relaxed flag does not suffice.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on
/// different destinations. PK_Initialize must have been called. During the call MXCSR has the flush-to-zero
/// and the precision bit set in addition, and rounds as the caller has it; it is restored on return, whatever
/// the result, and pending x87 exceptions are cleared.
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
