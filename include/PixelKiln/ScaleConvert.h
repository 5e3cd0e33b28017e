#pragma once

/// \file
/// One image made another, of any size, format and field order.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Turns an image into one of another size, format or field order, in the first of these ways that serves:
///
///  1. Conversion. Both sizes are equal, all rows are rendered, and the source is progressive or of the destination's
///     field: PK_Convert, with its result. So an interlaced source of the same size goes this way to no progressive
///     destination, and to none of the other field.
///  2. Half size. A 4:2:2 source of exactly twice the width and height, a progressive destination of four channels, below
///     quality 3: source rows height - 1, height - 3 and so on, or height - 2, height - 4 and so on if \p srcField is 1,
///     become the rows of the destination from its first in memory on. Each pair of pixels gives one, V, U, the luma of
///     the even pixel and an opaque alpha, of V210 the high 8 bits; a premultiplied 8u or 32f VUY image of the source's
///     matrix, which is converted row by row to the destination's format. Nothing is averaged. YUYV_422_32f is read as if
///     it were UYVY_422_32f.
///  3. Field of planes. Planar 4:2:0 of one format, one width and one field to half the height, rounded down, below quality
///     3: lines 0, 2, 4 and so on of each plane are copied; of luma, lines 1, 3, 5 and so on for field 2. Both images are
///     blocks as PK_GetPlanarBuffers lays them out, and row bytes are not looked at.
///  4. One field. Below quality 3, an interlaced raster source of an even height to a progressive destination of at most
///     half of it: the rows of \p srcField alone are the source, a progressive one, and it goes the first way of this list
///     that serves.
///  5. Decoding. A DV or 4:2:0 source is decoded to what its decoder makes of such a wish: straight to the destination
///     where that is the destination's format and size, all rows are rendered, and the fields are the same or, with the
///     destination progressive, the decoder gave one. Else what was decoded is the source, progressive if the decoder gave
///     fewer rows than \p srcHeight, and goes the first way of this list that serves.
///  6. Motion. PK_Motion lays the whole source on the whole destination, at the scale that both sizes are of each other,
///     with \p srcField, \p dstField, \p fieldToRender and \p quality. It takes four channels, and to scale at quality 5
///     BGRP_4444_32f_Linear alone. A source of another format is converted first: to the destination's format if motion
///     takes that, else at quality 5 to that format, if it scales, and else to its own colour as 4444 X, 8u below
///     quality 3 and 32f from there on. Is an interlaced source twice as high and just as wide as a progressive
///     destination, its field \p srcField is given to motion as a progressive source. For a DV or 4:2:0 destination motion
///     renders to a buffer, black at first, that is then encoded, whatever motion returned; the result is that of the
///     encoding.
///
/// Fields: 0 is a progressive image or all rows; 1 is the field on rows 0, 2, 4 and so on, 2 that on rows 1, 3, 5 and so
/// on. For an image, 1 or 2 tells which of them comes first in time.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Row bytes of a stream are not looked at, but for a DV25
/// or DV100 destination, whose row bytes are the bytes of the frame. Source and destination must not overlap.
///
/// Threads: motion is a task on all processors, all else runs on the calling thread. May be called from any number of
/// threads at the same time on different destinations. PK_Initialize must have been called. The floating-point mode is
/// that of PK_Convert, and the caller's on return. The way that was taken is told to the trace, on channel
/// "PK.ScaleConvert" at level 5.
///
/// \param src            first row of the source in memory.
/// \param srcRowBytes    bytes from one row of it to the next.
/// \param srcWidth       its pixels in a row.
/// \param srcHeight      its rows.
/// \param srcFormat      a raster format, DV or planar 4:2:0.
/// \param srcField       its earlier field, 1 or 2; any other number: it is progressive.
/// \param dst            first row of the destination in memory.
/// \param dstRowBytes    bytes from one row of it to the next.
/// \param dstWidth       its pixels in a row.
/// \param dstHeight      its rows.
/// \param dstFormat      a raster format, DV or planar 4:2:0.
/// \param dstField       its earlier field, 1 or 2; any other number: it is progressive.
/// \param quality        render quality, 0 to 5: below 3 rows, pixels and fields may be dropped; from 3 on what gets
///                       smaller is filtered; at 5 light is scaled, by a cubic.
/// \return
///  - PK_ErrNullSource: \p src is null, whatever the rest.
///  - PK_ErrNullDestination: \p dst is null.
///  - For a conversion, what PK_Convert returns. Else:
///  - PK_ErrBadSrcFormat: the source is of no raster format and no stream.
///  - PK_ErrBadDstFormat: the destination is of none.
///  - PK_ErrFailed: a negative size or a width above 134217727; row bytes above 1073741823 of rows of which a field is
///    taken; planes above 2147483647 bytes.
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrOutOfMemory: no memory for an image or rows in between.
///  - PK_ErrNotSupported: a stream without decoder or encoder.
///  - What decoder, encoder, PK_Convert or PK_Motion return.
///
/// Arguments are checked in this order, before memory is touched, and without memory for an image in between nothing is
/// written; but for the second field of an interlaced destination, as PK_Motion tells.
PK_API PK_Result PK_ScaleConvert(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                                 PK_PixelFormat srcFormat, int32_t srcField, void* dst, int32_t dstRowBytes,
                                 int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                                 int32_t dstField, int32_t quality) noexcept;

/// The same for one field of the destination. Parameters and results as for PK_ScaleConvert, and:
/// \param fieldToRender  0: all rows; 1 or 2: rows 0, 2, 4 and so on or the others, if \p dstField is 1 or 2. A field goes
///                       by decoding and motion alone. Rows of the other field keep what they hold; those of a DV or 4:2:0
///                       destination become black.
PK_API PK_Result PK_ScaleConvertOneField(const void* src, int32_t srcRowBytes, int32_t srcWidth,
                                         int32_t srcHeight, PK_PixelFormat srcFormat, int32_t srcField,
                                         void* dst, int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight,
                                         PK_PixelFormat dstFormat, int32_t dstField, int32_t quality,
                                         int32_t fieldToRender) noexcept;

/// Turns a planar 4:2:0 image whose planes lie apart into one of another size, format or field order. The planes are decoded
/// to what suits the destination best: straight into it, where that is its format and size; else to a buffer that is
/// scaled and converted as PK_ScaleConvert does it, as a progressive image if it has fewer rows than \p srcHeight.
///
/// Memory, threads and floating-point mode as for PK_ScaleConvert.
///
/// \param planes         first bytes of Y, U and V. One that has no samples may be null.
/// \param planeRowBytes  bytes from one row of each to the next, of either sign.
/// \param srcWidth       luma samples in a row.
/// \param srcHeight      luma rows.
/// \param srcFormat      a planar 4:2:0 format.
/// \param srcField       as for PK_ScaleConvert; it also names the field that is decoded where only one is.
/// \param dst            first row of the destination in memory.
/// \param dstRowBytes    bytes from one row of it to the next.
/// \param dstWidth       its pixels in a row.
/// \param dstHeight      its rows.
/// \param dstFormat      a raster or DV format.
/// \param dstField       its earlier field, 1 or 2; any other number: it is progressive.
/// \param quality        render quality, 0 to 5.
/// \return
///  - PK_ErrBadSrcFormat: the source is not planar 4:2:0.
///  - PK_ErrBadDstFormat: the destination is planar 4:2:0, or no raster format and no stream.
///  - PK_ErrFailed: a negative size or a width above 134217727.
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrFailed: a null array, a null plane that has samples, or, of two rows and more, row bytes that are fewer than
///    their samples.
///  - PK_ErrNullDestination: \p dst is null.
///  - PK_ErrOutOfMemory: no memory for the decoded image.
///  - What PK::DecompressYUV_420_8u and PK_ScaleConvert return.
///
/// Arguments are checked in this order, before memory is touched.
PK_API PK_Result PK_ScaleConvertPlanar(const void* const planes[3], const int32_t planeRowBytes[3],
                                       int32_t srcWidth, int32_t srcHeight, PK_PixelFormat srcFormat,
                                       int32_t srcField, void* dst, int32_t dstRowBytes, int32_t dstWidth,
                                       int32_t dstHeight, PK_PixelFormat dstFormat, int32_t dstField,
                                       int32_t quality) noexcept;

} // extern "C"
