#pragma once

/// \file
/// A four-sided piece of one image drawn into another.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Draws a quadrilateral of a source image into a quadrilateral of a destination image, both of 8-bit
/// four-channel pixels. The destination quadrilateral is filled row by row; places in the source are
/// interpolated linearly along its edges and along each row between them.
///
/// A pixel is drawn if its centre, at (column + 0.5, row + 0.5), lies in the quadrilateral or on its border. It
/// may be convex or not and may cross itself; two corners may be equal. In the formulas, div255(n) =
/// (n + 128 + ((n + 128) >> 8)) >> 8, and nearest() goes by the rounding mode of MXCSR, as the caller has it.
///
/// Sampling, quality 2 and below: the pixel at column nearest(u) and row nearest(v), limited to the source
/// rectangle. There is no half-pixel shift: at a copy of whole pixels u = column + 0.5, and ties go to even.
///
/// Sampling, quality above 2: bilinear. x = u - 0.5 is limited to the first and the last column of the source
/// rectangle, i = nearest(x), fx = x - i; y, j and fy likewise from v. The fraction has a sign: a place that
/// rounds up is extrapolated from columns i and i + 1. Per channel, p0 = (i, j) + ((i, j + 1) - (i, j)) fy, p1
/// likewise at i + 1, value = nearest(p0 + (p1 - p0) fx), limited to 0 to 255. The last column and row stand for
/// the one behind them. With \p field 1 or 2, unless \p ignoreFields, the rows of that field are read: j' =
/// nearest(y / 2), or nearest(y / 2 + 0.5) for field 2, fy is taken from that, j = 2 j', or 2 j' - 1, and the row
/// below is j + 2; j is limited to the last row of the field inside the rectangle, both to its top.
///
/// Writing, with the sampled colours and their alpha s, and an edge alpha e of 255 except on the rim:
///  - \p featherOver: each colour of the destination d becomes div255(d (255 - e) + c e), its alpha becomes s.
///    Opacity and \p blend are ignored.
///  - not \p blend: colours are copied. Alpha becomes e for an opacity of 255 without \p keepSourceAlpha, else
///    div255(m opacity) with m = div255(e s).
///  - \p blend: composited, with a = div255(opacity m) and the destination's alpha d. An a of 0 leaves the pixel.
///    An a of 255, or a d of 0, puts the colours with alpha a. Otherwise alpha becomes r = a + d - div255(a d),
///    and, for \p format BGRA_4444_8u, each colour truncate((c (255 a) + t ((255 - a) d)) / (255 r)) with t the
///    colour that stands there. For VUYA_4444_8u the same holds about 128 for the first two bytes and about 16
///    for the third. What leaves 0 to 255 is limited. Pixels of any other format stand.
///
/// The soft rim, \p feather above 0: each corner is moved inward along its bisector by the feather, in the
/// destination and, by the same formula, in the source. The quadrilateral of the moved corners is drawn as
/// above. With quality above 2 four strips follow, one for each edge, whose edge alpha rises from 0 at the
/// corners as given to 255 at the moved ones; with quality 2 and below the rim is left out. A feather that is
/// negative or not a number counts as 0.
///
/// A quadrilateral with a coordinate that is infinite or not a number, given or moved, is not drawn; nor is
/// anything if a rectangle is empty or inverted. A destination quadrilateral outside its rectangle draws
/// nothing.
///
/// Memory: images are addressed from their first row down, whatever the sign of the row bytes and the origin of
/// the format; pixel (column, row) lies at row x (|row bytes| / 4) + column pixels. No alignment is asked for.
/// Nothing outside the rectangles is read or written. Source and destination must not overlap. Nothing is
/// allocated.
///
/// Time: goes by the pixels of the quadrilateral and the rows that have some, and by no more than some ten thousand
/// other rows, however far it and the rectangle reach.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on
/// different destinations. PK_Initialize must have been called for the vector bodies to be chosen; results do
/// not depend on them.
///
/// \param unused1              not read.
/// \param unused2              not read.
/// \param source               pixel (0, 0) of the source.
/// \param sourceRowBytes       bytes from one row to the next, a multiple of 4; the sign is ignored.
/// \param sourceRect           the pixels that may be read; right and bottom are exclusive.
/// \param sourceQuad           x and y of the four corners in the source, in pixels.
/// \param destination          pixel (0, 0) of the destination.
/// \param destinationRowBytes  bytes from one row to the next, a multiple of 4; the sign is ignored.
/// \param destinationRect      the pixels that may be written; right and bottom are exclusive.
/// \param destinationQuad      x and y of the four corners in the destination, in the order of the source's.
/// \param quality              above 2: bilinear sampling and, with a feather, a soft rim.
/// \param opacity              0 to 255; what lies beyond counts as the nearer bound.
/// \param blend                composite over the destination instead of replacing it.
/// \param keepSourceAlpha      at full opacity and without \p blend, write the source's alpha.
/// \param format               the format of both images; BGRA_4444_8u and VUYA_4444_8u are blended.
/// \param field                0: all rows are written; 1: rows 0, 2, 4 and so on; 2: rows 1, 3, 5 and so on. Of
///                             any other number no row is.
/// \param ignoreFields         bilinear sampling reads all source rows, whatever the field.
/// \param featherOver          write colours by the edge alpha alone.
/// \param feather              width of the soft rim, in pixels.
/// \return
///  - PK_Success: drawn, or nothing to draw.
///  - PK_ErrNullDestination: the destination is null. This is looked at first.
///  - PK_ErrNullSource: the source is null.
///  - PK_ErrFailed: a row bytes value is 0, or a rectangle or quadrilateral is null.
PK_API PK_Result PK_WarpAffineQuad(const void* unused1, const void* unused2, const void* source,
                                   int32_t sourceRowBytes, const PK_Rect* sourceRect,
                                   const double sourceQuad[8], void* destination, int32_t destinationRowBytes,
                                   const PK_Rect* destinationRect, const double destinationQuad[8],
                                   int32_t quality, int32_t opacity, bool blend, bool keepSourceAlpha,
                                   PK_PixelFormat format, int32_t field, bool ignoreFields, bool featherOver,
                                   float feather) noexcept;

} // extern "C"
