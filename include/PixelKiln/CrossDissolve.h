#pragma once

/// \file
/// The mix of two images by a ratio.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Mixes two images into a third: a fade from the first, at ratio 0, to the second, at ratio 1. Neither lies
/// over the other. Where there is alpha, colour is weighted by it as well, so that a transparent pixel does not
/// darken the mix.
///
/// A ratio below 8e-6 is PK_Convert of the first image to the destination, and one above 1 - 8e-6 that of the
/// second: what PK_Convert takes, flips and refuses holds then. Otherwise a pixel a of the first and a pixel b
/// of the second are mixed with the weights w = 1 - ratio and r = 1 - w, in float. A result is rounded to an
/// integer by the current rounding mode and limited to 0 to 255 at 8 bits and to 0 to 32768 at 15; floats are
/// neither.
///
///     alpha of a is 0:        the colour of b; alpha of b x r
///     else alpha of b is 0:   the colour of a; alpha of a x w
///     else alphas are equal:  each colour channel a x w + b x r; alpha of a
///     else, straight:         each colour channel (a x A1 + b x A2) x (1 / S); alpha S,
///                             with A1 = alpha of a x w, A2 = alpha of b x r and S = A1 + A2
///     else, premultiplied:    each channel a x w + b x r
///
/// Codes of alpha are compared exactly; of float alphas one below 8e-6 is 0, and two that are less than 8e-6
/// apart are equal. The colour of a pixel that is mixed with a transparent one stays as it is, in premultiplied
/// formats too, although its alpha shrinks: callers know it so.
///
/// Two images without alpha (4:2:2, V210, RGB_444_10u and the X formats) are taken for straight ones: where the
/// working format is that of an X image itself, **its fourth sample is read as alpha** and mixed so. Whoever
/// leaves it undefined gets an undefined mix. With SSE2 switched off such images are mixed by a x w + b x r
/// alone, and the fourth sample of the result is opaque.
///
/// Three V210 images of one format are mixed sample by sample, as they are; not so with SSE2 switched off.
///
/// The working format, to which images are converted and from which the result is:
///  - Depth: that of the destination. If the three depths are not all the same, 32f, unless quality is 2.
///  - Both images without alpha: the destination's format in 4:4:4, as its X form, in the order of BGRA; with
///    SSE2 switched off, RGB formats keep their order.
///  - Otherwise the format of one image in 4:4:4, in the order of BGRA: the second image's, if the first has no
///    alpha or the second is premultiplied; else the first image's. Its alpha kind decides between straight and
///    premultiplied.
///  - What does not exist in 4:4:4 (10 bits, VUY of 15 bits, linear light of integers) is 32f.
///
/// Origin: the top row of the picture meets the top row of the picture in all three images.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Of each row exactly the pixels are read
/// or written, to the end of the last pair or group of six where the format has these: a row of 7 pixels of
/// V210 is two groups, room for 12. The destination may be one of the images of its own format itself, with the
/// same first byte and row bytes, and must not overlap them otherwise.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called. The floating-point mode is the caller's: denormal results
/// stay, but where the call is one of PK_Convert. The exception flags of MXCSR are left as the arithmetic sets
/// them; nothing is divided by 0.
///
/// \param first           first row of the image at ratio 0.
/// \param firstRowBytes   bytes from one row of it to the next.
/// \param firstFormat     a raster format.
/// \param second          first row of the image at ratio 1.
/// \param secondRowBytes  bytes from one row of it to the next.
/// \param secondFormat    a raster format.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a raster format.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows, not negative.
/// \param ratio           0 to 1; what lies below or above counts as 0 or 1. Of not-a-number the products
///                        above are 0 in integers and not-a-number in floats; what is no product stays.
/// \param quality         render quality of the conversions, 0 to 5; 2 also keeps the destination's depth.
/// \return
///  - What PK_Convert returns, if ratio is at an end.
///  - PK_ErrBadSrcFormat: one of the images is of no raster format.
///  - PK_ErrBadDstFormat: the destination is of no raster format.
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows that are converted and together take more than 256 KiB.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_CrossDissolve(const void* first, int32_t firstRowBytes, PK_PixelFormat firstFormat,
                                  const void* second, int32_t secondRowBytes, PK_PixelFormat secondFormat,
                                  void* dest, int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                                  int32_t height, float ratio, int32_t quality) noexcept;

} // extern "C"
