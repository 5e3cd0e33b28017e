#pragma once

/// \file
/// Progressive frames from interlaced ones: one field is kept, the rows of the other are rebuilt.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Rebuilds one field of an image from the other, in place. No row of the kept field is touched, and every row
/// of the other is rebuilt, whether anything moves or not.
///
/// The quality chooses the method, and **the methods name fields differently**; callers rely on both. Rows
/// count from the top of the picture, wherever the format has it.
///
/// | quality     | field | rebuilt rows    | kept rows       |
/// |-------------|-------|-----------------|-----------------|
/// | below 4     | 0     | 1, 3, 5, ...    | 0, 2, 4, ...    |
/// | below 4     | other | 0, 2, 4, ...    | 1, 3, 5, ...    |
/// | 4 and above | 1     | 0, 2, 4, ...    | 1, 3, 5, ...    |
/// | 4 and above | other | 1, 3, 5, ...    | 0, 2, 4, ...    |
///
/// A rebuilt row comes from the kept rows above and below it, but for two at the ends. Where rows 0, 2, 4 and so
/// on are rebuilt, row 0 takes the pixels of row 1, and the last row of an odd height, which has nothing below
/// it, keeps what it held. Where rows 1, 3, 5 and so on are rebuilt, the last of them takes the pixels of the
/// row above it, even if an odd height has one below it.
///
/// **Below quality 4** a row is the mean of its neighbours: PK_CrossDissolve of the two at ratio 0.5 and
/// quality 4, with the working format and the reading of alpha that it has.
///
/// **From quality 4 on** a pixel is interpolated along an edge. With the row a above and the row b below, a
/// distance is the sum of the squared differences of two pixels' three channels beside alpha, summed in float
/// in the order of memory:
///
///     left    a[x - 1] and b[x + 1]
///     centre  a[x]     and b[x]
///     right   a[x + 1] and b[x - 1]
///
/// The smallest chooses the pair, left before centre before right where they are equal, and centre where they
/// are not to be compared. The average v of the pair, (p + q + 1) >> 1 of codes and (p + q) x 0.5 of floats, is
/// then limited to what stands straight above and below, for all four channels: min(max(a, min(b, v)), max(b, v)).
/// The first and the last column, in a row of one pixel the only one, are taken straight down.
///
/// That is done in the premultiplied 4:4:4 format of the image's colour and order: of 8 bits for formats of 8
/// bits, of 15 for those of 15, else of 32f; rows of any other format are converted to it and back at quality
/// 4. So a flat image that is straight and not opaque may come back a code away.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Of each row exactly the pixels are read
/// or written, to the end of the last pair or group of six where the format has these.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// images. PK_Initialize must have been called. From quality 4 on, denormal results become 0, as in
/// conversions, though not the samples of kept rows that limit them. Below, the floating-point mode is the
/// caller's but for the row that is copied. On return it is as it was; results are rounded by it. The exception
/// flags of MXCSR are as before from quality 4 on, and else as the arithmetic left them.
///
/// \param buffer    first row of the image.
/// \param rowBytes  bytes from one row to the next.
/// \param format    a 4:2:2 format, V210 among them, or a 4:4:4 format of four channels: all raster formats but
///                  RGB_444_10u.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative; of fewer than 2 there is nothing to do.
/// \param field     which field is rebuilt, see above.
/// \param quality   the method, see above.
/// \return
///  - PK_ErrBadSrcFormat: none of these formats.
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows that are converted and together take more than 256 KiB.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_Deinterlace(void* buffer, int32_t rowBytes, PK_PixelFormat format, int32_t width,
                                int32_t height, int32_t field, int32_t quality) noexcept;

/// Rebuilds one field of an image from the other into a second image, as PK_Deinterlace does. **Only rebuilt
/// rows are written**: the kept ones are the caller's to provide. Source and destination are each walked from
/// the top by their own format.
///
/// From quality 4 on, the working format is that of the destination's colour and order, and 32f where source
/// and destination are of different depths. Rows that have no neighbour on one side are converted as PK_Convert
/// does at quality 4.
///
/// Memory, threads, floating-point mode: as PK_Deinterlace. The destination may be the source with the same
/// first byte, row bytes and format, and must not overlap it otherwise.
///
/// \param source          first row of the interlaced image.
/// \param sourceRowBytes  bytes from one row of it to the next.
/// \param sourceFormat    a format that PK_Deinterlace takes.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a format that PK_Deinterlace takes.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows of both images, not negative; of fewer than 2 there is nothing to do.
/// \param field           which field is rebuilt, as for PK_Deinterlace.
/// \param quality         the method, as for PK_Deinterlace.
/// \return
///  - PK_ErrBadSrcFormat: the source is of none of these formats.
///  - PK_ErrBadDstFormat: the destination is of none of these formats.
///  - PK_Success, PK_ErrFailed and PK_ErrOutOfMemory as PK_Deinterlace.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_DeinterlaceCopy(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                                    void* dest, int32_t destRowBytes, PK_PixelFormat destFormat,
                                    int32_t width, int32_t height, int32_t field, int32_t quality) noexcept;

} // extern "C"
