#pragma once

/// \file
/// Gaussian blur of images of four channels, at a cost that does not depend on its width.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Blurs an image along its rows, its columns or both, each by a sigma of its own. A destination that is larger than the
/// source leaves room for the blur to spread: the source lies in the middle of it.
///
/// **Without blur**, that is if neither sigma is greater than 0, the source is copied as PK_Convert copies it, to row
/// (destHeight - sourceHeight) / 2 and pixel (destWidth - sourceWidth) / 2 of the destination, both truncated, which is
/// filled with transparent black beforehand if the sizes differ.
///
/// **Otherwise** rows are blurred if direction is 1 or 3 and sigmaX is greater than 0, and columns if direction is 2 or 3
/// and sigmaY is greater than 0. If neither is so, nothing is written. Rows alone go to the first sourceHeight rows of the
/// destination, columns alone to its first sourceWidth columns; the rest of it stays. Row 0 in memory goes to row 0 in
/// memory, whatever the origins of the formats.
///
/// Each line, a row or a column, is blurred as premultiplied floats: in linear light as BGRP_4444_32f_Linear if
/// \p linear is set, else in the family and matrix of the source. If both directions are blurred, rows and columns meet in
/// the source's format, premultiplied and in the order of BGRA: of a source of 8 bits, in 8 bits.
///
/// A line of s pixels becomes one of n. Its first pixel stands at m = (n - s + 1) / 2, truncated, so that of an odd
/// difference the greater half lies before it. With x the line from there on, for each channel in float:
///
///     y[i] = c0 x[i] + c1 x[i - 1] - d1 y[i - 1] - d2 y[i - 2]          i from m up to n - 1
///     z[i] = c2 x[i + 1] + c3 x[i + 2] - d1 z[i + 1] - d2 z[i + 2]      i from n - m - 1 down to 0
///     result[i] = y[i] + z[i]                                           i from 0 to n - 1
///
/// from left to right, each operation rounded. Beyond the line x, y and z are 0, which is transparent black; with
/// \p repeatEdge x is the first pixel F before the line and the last pixel L behind it, y is 0.5 F before m, and z is 0.5 L
/// from m + s on. Where n - s is odd, z[m + s - 1] is 0 in either case. So a flat image stays flat in its middle, and with
/// \p repeatEdge moves a little near its edges.
///
/// The coefficients come from sigma in double precision, but for what is marked to be rounded to float, with a0 = 0.9629,
/// a1 = 1.942, w = 0.8448 and b = 1.26, which are floats:
///
///     e1 = exp(-b / sigma), e2 = exp(-2.52 / sigma), C = cos(w / sigma), S = sin(w / sigma)
///     den  = float(1 - 2 C e1 + e2)
///     norm = float(2 (a0 (1 - e1 C) / den + a1 (e1 S) / den) - a0)
///     k = 1 / norm, c0 = a0 k, p = a1 k                  in float
///     c1 = float(e1 (S p - C c0)), d1 = float(-2 e1 C), d2 = float(e2)
///     c2 = c1 - c0 d1, c3 = -(c0 d2)                     in float
///
/// A sigma below 0.05 or so changes nothing but by conversions. d1 and d2, being floats, tell great sigmas from each other
/// less and less: at 100 the sum of a line is kept to a ten-thousandth, and past some thousands what comes out is no blur any
/// more, and may be no number.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. The destination may be the source with the same
/// first byte, row bytes, format and size, and must not overlap it otherwise.
///
/// Threads: rows and columns of images with more than 32 of either run on all processors, else on the calling thread. May
/// be called from any number of threads at the same time on different destinations. PK_Initialize must have been called.
/// Denormal results become 0, and rounding is by the caller's mode; on return MXCSR is as it was.
///
/// \param source          first row of the source.
/// \param sourceRowBytes  bytes from one row of it to the next.
/// \param sourceWidth     pixels in a row of it, not negative.
/// \param sourceHeight    rows of it, not negative.
/// \param sourceFormat    a raster format of four channels.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destWidth       pixels in a row of it, from sourceWidth to 134217727.
/// \param destHeight      rows of it, from sourceHeight to 134217727.
/// \param destFormat      a raster format of four channels, of 8u if and only if the source is.
/// \param sigmaX          along rows, in pixels. Below 0 and not-a-number count as 0.
/// \param sigmaY          along columns, in pixels.
/// \param repeatEdge      whether pixels at the edges go on for ever; else the blur fades to transparent black.
/// \param linear          whether light is blurred, and not the codes of samples.
/// \param direction       1 for rows, 2 for columns, 3 for both; any other blurs neither.
/// \param quality         render quality of the conversions, 0 to 5.
/// \return
///  - PK_ErrBadWidth: sourceWidth is greater than destWidth.
///  - PK_ErrBadHeight: sourceHeight is greater than destHeight.
///  - PK_ErrBadSrcFormat: sourceFormat is no raster format of four channels.
///  - PK_ErrBadDstFormat: destFormat is none.
///  - PK_ErrBadSrcFormat: one of them is of 8u and the other is not.
///  - PK_ErrFailed: a negative size, one too great, or a null pointer where there are pixels.
///  - PK_Success: done. A destination without pixels stays; so does any if a source without pixels is to be blurred.
///  - PK_ErrOutOfMemory: no memory for the image in which rows and columns meet, or for lines that together take more than
///    256 KiB.
///
/// Without blur the result is that of PK_Convert. Arguments are checked in this order, before memory is touched; nothing is
/// written after a failure.
PK_API PK_Result PK_GaussianBlur(const void* source, int32_t sourceRowBytes, int32_t sourceWidth,
                                 int32_t sourceHeight, PK_PixelFormat sourceFormat, void* dest,
                                 int32_t destRowBytes, int32_t destWidth, int32_t destHeight,
                                 PK_PixelFormat destFormat, double sigmaX, double sigmaY, bool repeatEdge,
                                 bool linear, int32_t direction, int32_t quality) noexcept;

} // extern "C"
