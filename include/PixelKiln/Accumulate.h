#pragma once

/// \file
/// Images scaled by a gain, weighted sums of images, and whether a blend mode needs to blend at all.

#include <PixelKiln/BlendMode.h>
#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Scales an image by a gain: through its alpha where the colour is to stay as it is, through all channels where the
/// colour holds the alpha already.
///
/// The destination's format decides in which format W the gain is applied, and to what:
///
/// | Destination                                         | W              | Scaled                               |
/// |-----------------------------------------------------|----------------|--------------------------------------|
/// | 8u, alpha last and straight (A)                     | of destination | alpha                                |
/// | 8u RGB, alpha last, premultiplied (P) or X          | of destination | all four samples                     |
/// | 8u VUY, P or X                                      | of destination | alpha; V and U about 128, Y about 16 |
/// | 32f, four channels, alpha last, A                   | of destination | alpha                                |
/// | 32f, four channels, alpha last, P or X              | of destination | all four samples                     |
/// | 32f RGB, alpha first                                | BGRA_4444_32f  | all four samples                     |
/// | any other RGB: 8u with alpha first, 10u, 15u        | BGRA_4444_8u   | alpha                                |
/// | 32f 4:2:2 and V210, where the quality is 3 or more  | VUYP_4444_32f  | alpha                                |
/// | any other YUV: 4:2:2                                | VUYP_4444_8u   | alpha                                |
///
/// Linear formats count as the 32f that they are. In the last four rows what is scaled does not follow from the alpha
/// kind of W: callers rely on that. So a 4:2:2 destination, which has no alpha, gets the source unscaled.
///
/// With g the gain, c a sample and K its zero (128, 16, or 0 for alpha and RGB), an 8-bit result is the integer
/// nearest to (c - K) x g + K, computed in float, rounded by the current mode (ties to even unless the caller changed
/// it), and limited to 0 through 255; not-a-number gives 0. A float result is c x g, with no limit. A sample that is
/// not scaled keeps its bits.
///
/// A gain below 8e-6, a negative one included, does none of this: the destination is filled by
/// PK_FillWithTransparentBlack, whose result is returned, and the source is not looked at. Not-a-number is a gain.
///
/// Formats: both are any raster formats. Where the source's is not W, its rows are converted to W as PK_Convert
/// converts them, and from W to the destination's format where that is not W.
///
/// Origin: row 0 in memory goes to row 0 in memory, whatever the origin of the formats.
///
/// Memory: row bytes may be of either sign, and 0 for a single row; no alignment is asked for. Of each row exactly
/// the pixels are read or written, to the end of the last pair or group of six where the format has these. The
/// destination may be the source itself, with the same format, first byte and row bytes, and must not overlap it
/// otherwise.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called. The floating-point mode is the caller's: denormal results stay.
/// The exception flags of MXCSR are left as the arithmetic sets them.
///
/// \param source          first row of the image.
/// \param sourceRowBytes  bytes from one row of it to the next.
/// \param sourceFormat    a raster format.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a raster format; one that has alpha (A or P) where the gain is below 8e-6.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows, not negative.
/// \param gain            any number. With 1 rows still go by way of W.
/// \param quality         render quality of the conversions, 0 to 5; it also decides on W, as told above.
/// \return
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrBadSrcFormat: the source is of no raster format.
///  - PK_ErrBadDstFormat: the destination is of no raster format; or the gain is below 8e-6 and the destination has no
///    alpha (4:2:2, V210, RGB_444_10u) or a meaningless one (X).
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels; of the
///    source too, unless the gain is below 8e-6.
///  - PK_ErrOutOfMemory: no memory for rows that are converted, above 256 KiB in all.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_AlphaGain(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                              void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                              int32_t height, float gain, int32_t quality) noexcept;

/// Adds up any number of images, each of its own format and with its own weight: their mean, if the weights add up
/// to 1. Nothing scales the weights to that, and nothing limits the sum before it is converted to the destination's
/// format.
///
/// The sum is made of premultiplied floats, in BGRP_4444_32f, or from quality 5 up in linear light, in
/// BGRP_4444_32f_Linear. Rows are converted to that and the sum from it as PK_Convert converts them. With r_i a sample
/// of source i in that format, w_i its weight as a float, and products and sums rounded to float one by one:
///
///     p_i = w_i x r_i                                     p_i = 0 where w_i is below 8e-6
///     sum = ((p_0 + p_1) + p_2) + ... + p_9               of the first ten, or of as many as there are
///     sum = sum + (((p_10 + p_11) + p_12) + ... + p_19)   and so on for each ten that follow, the last being fewer
///
/// A weight below 8e-6 leaves its source out, so that nothing can be subtracted: its pixels are not looked at, though
/// its format and pointer have to be good ones. The sum of no images is transparent black, and is converted like any
/// other.
///
/// Origin: the pictures meet upright. Row 0 is the top row of each, wherever its format has it in memory
/// (PK_IsOriginBottomLeft).
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Of each row exactly the pixels are read or
/// written, to the end of the last pair or group of six where the format has these. The destination may be any of the
/// sources of its own format, with the same first byte and row bytes, and must not overlap them otherwise. The four
/// arrays stay as they are during the call.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called. The floating-point mode is the caller's: denormal results stay.
/// The exception flags of MXCSR are left as the arithmetic sets them.
///
/// \param sources         the first byte of each image.
/// \param sourceRowBytes  of each the bytes from one row to the next.
/// \param sourceFormats   of each the format, a raster format.
/// \param weights         of each the weight, any number.
/// \param count           how many images there are, not negative. With 0 the arrays are not looked at.
/// \param dest            first byte of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a raster format.
/// \param width           pixels in a row of every image, 0 to 134217727.
/// \param height          rows of every image, not negative.
/// \param quality         render quality of the conversions, 0 to 5; 5 sums in linear light.
/// \return
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrBadDstFormat: the destination is of no raster format.
///  - PK_ErrBadSrcFormat: one of the sources is of no raster format. An array of formats that is null tells none.
///  - PK_ErrFailed: a negative count, width or height, a width too great, or a null pointer where there are pixels:
///    an array, a source or the destination.
///  - PK_ErrOutOfMemory: no memory for rows, above 256 KiB in all.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_Accumulate(const void* const* sources, const int32_t* sourceRowBytes,
                               const PK_PixelFormat* sourceFormats, const double* weights, int32_t count,
                               void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                               int32_t height, int32_t quality) noexcept;

/// Whether a top image without alpha of its own would come through a blend mode at an opacity as it is, so that it
/// need not be blended. May be called from any thread, and before PK_Initialize.
/// \param blendMode  a mode; any number may be given.
/// \param opacity    any number.
/// \return true for PK_BlendMode_Dissolve and PK_BlendMode_Normal where |opacity - 1| is below 8e-6; else false.
PK_API bool PK_IsOpacityNOP(PK_BlendMode blendMode, float opacity) noexcept;

} // extern "C"
