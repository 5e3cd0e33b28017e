#pragma once

/// \file
/// Copies of planar 4:2:0 images, and planes from surfaces whose chroma is interleaved.
///
/// A planar image is three first bytes and three row bytes, each an array in the order luma, first chroma,
/// second chroma. All samples are bytes. The chroma planes have half the width and half the height of the luma
/// plane, both rounded down.

#include <PixelKiln/Types.h>

extern "C" {

/// Copies the three planes of an 8-bit 4:2:0 image.
///
/// Only samples are copied, no row padding. A plane whose row bytes are its width on both sides goes as one
/// block, by the rules of PK_CopyMemory: from 524288 bytes on with non-temporal stores and no fence after
/// them.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Planes of the source and of the
/// destination must not overlap. A plane without samples is not touched, and its pointer may be null.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations.
///
/// \param sourcePlanes         first bytes of the planes that are read.
/// \param sourceRowBytes       bytes from one row of each to the next.
/// \param destinationPlanes    first bytes of the planes that are written.
/// \param destinationRowBytes  bytes from one row of each to the next.
/// \param width                luma samples in a row, not negative. Chroma rows have half as many.
/// \param height               luma rows, not negative. Chroma planes have half as many.
/// \return
///  - PK_Success: copied. A width or height of 0 does nothing.
///  - PK_ErrFailed: a negative width or height, a null array, or a null pointer to a plane that has samples;
///    nothing is written then.
PK_API PK_Result PK_CopyPlanar_8u(const void* const sourcePlanes[3], const int32_t sourceRowBytes[3],
                                  void* const destinationPlanes[3], const int32_t destinationRowBytes[3],
                                  int32_t width, int32_t height) noexcept;

} // extern "C"

namespace PK {

/// Decodes the three planes of an 8-bit 4:2:0 image to a raster image.
///
/// Sizes. With w x h the size of the source and / rounding down, the first that applies:
///  - width 4 w / 3 of a w that is a multiple of 96, or 3 w / 2 of a multiple of 16, and height h or h / 2, with SSE2:
///    rows get wider. Of three samples a, b, c come a, (a + 2 b) / 3, (2 b + c) / 3, c; of two come a, (a + b) >> 1, b, in
///    each plane alone. Samples are rounded by the current mode, of BT.601 on their way to V210 to 10 bits. Chroma serves
///    two pixels and two rows;
///  - width w and height h: all of it, chroma interpolated between its rows and columns;
///  - width w and height h / 2: one field, with chroma interpolated between the rows of that field; of frame pictures
///    every second row, chroma as it stands in rows;
///  - w / 2 x h / 2: every second sample of every second row, chroma as it stands;
///  - below quality 3, h over an even number and w over 1, 2, 4 or 8: samples likewise.
///
/// Rows of chroma. Those of frame pictures lie half-way between two rows of luma: (3 a + b + 2) >> 2 and
/// (a + 3 b + 2) >> 2 between rows a and b. Those of field pictures, which alternate between the fields as luma does,
/// give (5 a + 3 b + 4) >> 3 and (a + 7 b + 4) >> 3 in the field of row 0, (7 a + b + 4) >> 3 and (3 a + 5 b + 4) >> 3 in
/// the other. The first and the last row of a frame, or of a field, have the nearest row of chroma as it stands; a field
/// without a row of chroma has those of the other.
///
/// Columns of chroma. Under MPEG2 siting they lie on the even pixels: c[k] and (c[k] + c[k + 1] + 1) >> 1. Under MPEG4
/// siting between the two: (c[k - 1] + 3 c[k] + 2) >> 2 and (3 c[k] + c[k + 1] + 2) >> 2. So a VUYX_4444_8u destination
/// of the source's matrix is made; any other takes the conversion from UYVY_422_8u of that matrix, whose pairs hold the
/// samples c[k] of either siting.
///
/// A picture without chroma, of a width or height of 1, is grey; the last column of an odd width has the chroma beside it.
/// Full-range formats are converted like those of video range: their codes are not stretched.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. The destination must not overlap the planes. A plane
/// without samples is not touched, and its pointer may be null.
///
/// Threads: runs on the calling thread, in its floating-point mode; may be called from any number of threads at the same
/// time on different destinations. PK_Initialize must have been called.
///
/// \param planes               first bytes of the planes, in the order Y, U, V. U and V have half the width and half the
///                             height, rounded down.
/// \param planeRowBytes        bytes from one row of each to the next.
/// \param sourceWidth          luma samples in a row.
/// \param sourceHeight         luma rows.
/// \param sourceFormat         a planar 4:2:0 format: its matrix, siting, and field or frame pictures.
/// \param destination          the top row of the picture, whatever the format's origin.
/// \param destinationRowBytes  bytes from one row of it to the next.
/// \param destinationWidth     its pixels in a row.
/// \param destinationHeight    its rows.
/// \param destinationFormat    a raster format.
/// \param field                at half height 2 for the rows 1, 3, 5 and so on; else those of rows 0, 2, 4 and so on.
/// \param quality              render quality, 0 to 5.
/// \return
///  - PK_ErrBadSrcFormat: the source is not of a planar 4:2:0 format.
///  - PK_ErrBadDstFormat: the destination is not of a raster format.
///  - PK_ErrFailed: a negative or too great size, a null pointer, or, where there are two rows, row bytes that are fewer
///    than the bytes of a row.
///  - PK_Success: decoded, or a destination of width or height 0.
///  - PK_ErrSizeMismatch: another size, at quality 3 or above.
///  - PK_ErrBadHeight: another size, whose height is not h over an even number.
///  - PK_ErrBadWidth: another size, whose width is not w over 1, 2, 4 or 8.
///  - PK_ErrOutOfMemory: no memory for rows.
///
/// Arguments are checked in this order, before memory is touched. A refusal writes nothing.
PK_API PK_Result DecompressYUV_420_8u(const void* const planes[3], const int32_t planeRowBytes[3],
                                      int32_t sourceWidth, int32_t sourceHeight, PK_PixelFormat sourceFormat,
                                      void* destination, int32_t destinationRowBytes,
                                      int32_t destinationWidth, int32_t destinationHeight,
                                      PK_PixelFormat destinationFormat, int32_t field,
                                      int32_t quality) noexcept;

} // namespace PK

/// Takes an NV12 surface, luma and a plane of interleaved pairs of chroma samples, to three planes.
///
/// Bytes change their place and keep their values. With k the number of a pixel or pair in its row, and r that of a
/// row of the destination plane:
///
/// | Member | luma                  | first chroma plane      | second chroma plane         |
/// |--------|-----------------------|-------------------------|-----------------------------|
/// | 0      | Y[r][k] = luma[r][k]  | chroma[r][2 k]          | chroma[r][2 k + 1]          |
/// | 1      | Y[r][k] = luma[2r][k] | chroma[2 r][2 k]        | chroma[2 r][2 k + 1]        |
///
/// Member 0 takes a whole surface. Member 1 takes one field of a surface whose two fields lie in turns, in luma as in
/// chroma; the caller points the source at the first luma row and the first chroma row of the field. The planes are in
/// the order Y, U, V for NV12 (U first in each pair), and Y, V, U for NV21.
///
/// The source is meant to lie in the write-combining memory of a decoder: from SSE4.1 on (switch 6 of
/// PK_SetDebugFlag) whole lines of 64 bytes are read by streaming loads, each once and in order. Rows that begin on a
/// boundary of 64 bytes are read by nothing else. Any other memory and alignment will do, and so will processors
/// without SSE4.1.
///
/// Memory: row bytes may be of either sign, and only bytes of samples are read and written. Source and destination
/// must not overlap. Nothing is allocated, so that the picture is always converted.
///
/// Threads: bands of 32 rows run on all processors; may be called from any number of threads at the same time on
/// different destinations.
///
/// \param luma                 first byte of the luma plane.
/// \param lumaRowBytes         bytes from one row of it to the next, of both fields for member 1 too.
/// \param chroma               first byte of the plane of pairs.
/// \param chromaRowBytes       bytes from one row of it to the next, as for luma.
/// \param destinationPlanes    first bytes of the planes that are written: luma, the first sample of each pair, the
///                             second one. Chroma planes have half as many samples in a row, rounded down.
/// \param destinationRowBytes  bytes from one row of each to the next.
/// \param width                luma samples in a row. Of a chroma row width / 2 pairs are taken, rounded down.
/// \param height               luma rows of the destination, for both members. Chroma planes get half as many, rounded
///                             down; member 1 reads luma up to row 2 height - 2.
///
/// Nothing is returned. A width or height below 1, a null array, or a null pointer to a plane that has samples leaves
/// all memory untouched; chroma may be null where the size leaves no chroma samples.
template <int Member>
void PK_ConvertNV12toYV12_SSE4(const void* luma, int32_t lumaRowBytes, const void* chroma,
                               int32_t chromaRowBytes, void* const destinationPlanes[3],
                               const int32_t destinationRowBytes[3], int32_t width, int32_t height) noexcept;

extern template PK_API void PK_ConvertNV12toYV12_SSE4<0>(const void*, int32_t, const void*, int32_t,
                                                         void* const[3], const int32_t[3], int32_t,
                                                         int32_t) noexcept;
extern template PK_API void PK_ConvertNV12toYV12_SSE4<1>(const void*, int32_t, const void*, int32_t,
                                                         void* const[3], const int32_t[3], int32_t,
                                                         int32_t) noexcept;
