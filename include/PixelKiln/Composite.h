#pragma once

/// \file
/// One image laid over another, plainly or by a blend mode.

#include <PixelKiln/BlendMode.h>
#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Lays a top image over a back image with an opacity and writes the result to a third image.
///
/// The destination says how: if its alpha is straight, straight colour is mixed, else premultiplied colour. All rows
/// are converted, as PK_Convert converts them, to a working format: that of the destination in 4:4:4 and in the
/// order BGRA or VUYA, with 8 bits where it has 8 bits and else with floats, with premultiplied alpha in place of
/// alpha that it lacks. In the formulas s and b are samples of top and back, sa and ba their alphas, o is the opacity,
/// full is 255 or 1.0, and K is the zero of a sample: 128 for 8-bit chroma, 16 for 8-bit luma, else 0. An opacity above
/// 1 - 8e-6 counts as 1. An image whose format has no alpha or an opaque one has full alpha, whatever stands there.
///
///     a = sa x o / full           A = sa x o + ba x (1 - a), alpha of the result
///     straight, 8u                (s x a + b x (1 - a) x (ba / 255)) x (255 / A)
///     straight, 32f               (s x a + b x (1 - a) x ba) / A
///     premultiplied               (s - K) x o + K + (b - K) x (1 - a)
///
/// |a| below 8e-6 gives the back pixel, |1 - a| below 8e-6 the colour of the top with full alpha. Over a pixel of the
/// back without alpha the top shows alone: straight with its own colour, premultiplied as the formula has it without b; its
/// alpha is sa x o. Straight YUV of 8 bits is mixed by its codes, without regard to their zeros. Codes are rounded as the
/// caller's rounding mode says, by default to the nearest, premultiplied RGB at full opacity always to the nearest, and
/// limited to 0 to 255; floats are not limited.
///
/// With SSE2 the 8-bit formulas go by runs of four pixels, from the first that begins at a 16-byte boundary of the row
/// that is written on. The shortcuts are taken where all four agree: that a is exactly 0, that it is at least
/// 0.99999237, and for straight colour that ba is 0. Else a
/// pixel without alpha counts as one without colour too, so that stale colour never shows; 1 / 255 is the nearest
/// float, and 255 / A is the processor's estimate of a reciprocal times 255, 0 where A is at most 2^-17. Results may
/// differ from those of single pixels by a step of rounding.
///
/// A destination of 4:2:2 gives alpha up: the result is s x o + b x (1 - o) about the zeros, of colours premultiplied
/// in VUYP_4444_8u, or VUYP_4444_32f if it has more than 8 bits.
///
/// Shortcuts of the whole call: an opacity below 8e-6, negative ones included, is PK_Convert of the back image; one
/// above 1 - 8e-6 with an opaque top is PK_Convert of the top image. As conversions these turn pictures between
/// bottom-up and top-down formats. Else row 0 in memory meets row 0 in memory, whatever the origins of the formats.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Of each row exactly its pixels are read or
/// written, to the end of the last pair or group of six where the format has these. The destination may be the top or
/// the back image, with the same format, first byte and row bytes; it must not overlap them otherwise.
///
/// Threads: images above 64 rows are worked on by all processors, in four bands; may be called from any number of
/// threads at the same time on different destinations. PK_Initialize must have been called. Denormal results are
/// flushed to zero; the floating-point mode of the caller is put back on every way out, as by PK_Convert. Infinities
/// and not-a-numbers go through float formats by the rules of IEEE 754, each within its pixel.
///
/// \param top           first row of the image on top.
/// \param topRowBytes   bytes from one row of it to the next.
/// \param topFormat     a raster format.
/// \param back          first row of the image behind it.
/// \param backRowBytes  bytes from one row of it to the next.
/// \param backFormat    a raster format.
/// \param dest          first row of the image that is written.
/// \param destRowBytes  bytes from one row of it to the next.
/// \param destFormat    a raster format.
/// \param width         pixels in a row, 0 to 134217727.
/// \param height        rows; below 1 nothing is done.
/// \param opacity       of the top image, 0 to 1.
/// \param quality       render quality of the conversions, 0 to 5.
/// \param compositeInLinear  whether a destination in linear light is composited in linear light. If not, rows are
///                      mixed in the gamma-encoded form of the working format; of other destinations it changes nothing.
/// \return
///  - PK_ErrBadSrcFormat: the top or the back format is compressed or planar.
///  - PK_ErrBadDstFormat: the destination format is.
///  - what PK_Convert returns, in the shortcuts of the whole call.
///  - PK_ErrBadSrcFormat, PK_ErrBadDstFormat: a format is outside the catalogue.
///  - PK_Success: done; with a width of 0 or a height below 1 nothing was to do.
///  - PK_ErrFailed: a negative width, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows of a wide image that are converted.
///
/// Arguments are checked in this order, before memory is touched. After PK_ErrOutOfMemory bands may be written.
PK_API PK_Result PK_Composite(const void* top, int32_t topRowBytes, PK_PixelFormat topFormat,
                              const void* back, int32_t backRowBytes, PK_PixelFormat backFormat, void* dest,
                              int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width, int32_t height,
                              float opacity, int32_t quality, bool compositeInLinear) noexcept;

/// Lays a top image over a back image by a blend mode and writes the result to a third image.
///
/// All rows are converted to BGRA_4444_32f, straight alpha, as PK_Convert converts them, and the result from there, so
/// that samples may leave 0 to 1 on the way. Exceptions are PK_BlendMode_Normal, which is PK_Composite with the same
/// arguments and nothing else, and rows that have this format.
///
/// In the formulas s and b are samples of top and back, B is what the mode makes of them, as the top's alpha times the
/// opacity, which is taken as it is given, ab the back's alpha. |x| below 8e-6 counts as 0.
///
///     ar = ab + as - ab x as, alpha of the result        k = as / ar        w = ab + (1 - ab)
///     separable            b x (1 - k) + (s x (1 - ab) + B x ab) x k
///     of whole colours     b x (1 - k) + B x w x k
///
/// Where ar is 0 the colour is 0. The blend counts as far as the back has alpha; that of whole colours has its full
/// weight everywhere, as callers know it. clamp limits to 0 to 1, s' and b' are clamp(s) and clamp(b), and a range in
/// brackets is that to which a sample is limited.
///
/// | Mode | B |
/// |---|---|
/// | ColorBurn | clamp(1 - (1 - b') / s), s in [1e-7, 1] |
/// | ColorDodge | clamp(b' / (1 - s)), s in [0, 0.99999] |
/// | Darken, Lighten | min(s, b), max(s, b) |
/// | Difference | \|s - b\| |
/// | Exclusion | clamp(s' + b' - 2 s' b') |
/// | HardLight | clamp(2 s' b') where s' is at most 0.5, else clamp(1 - 2 (1 - s') (1 - b')) |
/// | HardMix | 0 where 1 - b is above s, else 1 |
/// | LinearBurn, LinearDodge | clamp(s' + b' - 1), s + b |
/// | LinearLight | 2 s' + b' - 1 |
/// | Multiply | s b |
/// | Overlay | HardLight with s' and b' exchanged |
/// | PinLight | with t = 2 s' - 1: t where it is above b', else min(2 s', b') |
/// | Screen | clamp(1 - (1 - s) (1 - b)), both in [1e-7, 1] |
/// | SoftLight | clamp(t (b' - b' b') + b') where s' is at most 0.5, else clamp(t (sqrt(b') - b') + b'), t = 2 s' - 1 |
/// | VividLight | clamp(1 - (1 - b') / (2 s)) where s is at most 0.5, else clamp(b' / (2 (1 - s))), s in [1e-6, 0.999999] |
/// | Subtract, Divide | b - s, b / s with s not nearer to 0 than 1e-7 |
///
/// Of whole colours, with Lum(c) = 0.3 R + 0.59 G + 0.11 B and Sat(c) the clamped difference of greatest and least
/// channel: Color is the top with the Lum of the back, Luminosity the back with that of the top, Hue the top with Sat
/// and Lum of the back, Saturation the back with the Sat of the top and its own Lum. Setting Lum moves all channels by
/// the difference of the clamped ones, then draws the colour to its grey until no channel is below 0 or above 1; setting
/// Sat scales the channels so that the least becomes 0 and the greatest Sat.
///
/// DarkerColor and LighterColor show the pixel whose luma is the less or the greater, the back one where they are
/// equal, the top one as B of whole colours. The weights are those of BT.709 where the width is above 720, else of
/// BT.601. A clear top gives the back pixel, a clear back the top's colour with the alpha as.
///
/// Dissolve copies each pixel from top or back whole: from the top where std::rand(), reduced to 15 bits, is at most
/// as x 32767, truncated. So opacity changes the odds only. Above one row the sequence begins anew with the seed 1 at
/// each call, on the calling thread; images above 64 rows are drawn by bands, whose order is not fixed. For one row
/// the caller seeds.
///
/// Opacity takes no shortcut here: at 0 all modes run. Row 0 in memory meets row 0 in memory, whatever the origins.
///
/// Memory, threads, floating-point mode and the parameters are those of PK_Composite, and:
///
/// \param blendMode          a PK_BlendMode.
/// \param compositeInLinear  counts for PK_BlendMode_Normal only.
/// \return
///  - PK_ErrBadSrcFormat: the top or the back format is compressed or planar.
///  - PK_ErrBadDstFormat: the destination format is.
///  - PK_ErrNotSupported: the number is no blend mode.
///  - PK_ErrBadSrcFormat, PK_ErrBadDstFormat: a format is outside the catalogue.
///  - PK_Success: done; with a width of 0 or a height below 1 nothing was to do.
///  - PK_ErrFailed: a negative width, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows of a wide image that are converted.
///
/// Arguments are checked in this order, before memory is touched. After PK_ErrOutOfMemory bands may be written.
PK_API PK_Result PK_CompositeWithBlendMode(const void* top, int32_t topRowBytes, PK_PixelFormat topFormat,
                                           const void* back, int32_t backRowBytes, PK_PixelFormat backFormat,
                                           void* dest, int32_t destRowBytes, PK_PixelFormat destFormat,
                                           int32_t width, int32_t height, float opacity,
                                           PK_BlendMode blendMode, int32_t quality,
                                           bool compositeInLinear) noexcept;

} // extern "C"
