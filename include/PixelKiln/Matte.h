#pragma once

/// \file
/// Images flattened onto black, and images freed from the colour that they were flattened against.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Flattens an image onto opaque black with an opacity.
///
/// Rows are converted, as PK_Convert converts them but for denormal results, which stay, to a format to work in, laid over black there, and converted to the
/// destination's. It is the destination's own if that is BGRA_4444, ARGB_4444 or VUYA_4444 at 8u or gamma-encoded 32f, VUYA of BT.601; at
/// full opacity VUYA_4444 of BT.709 too. Else it is, of the family of the destination, BGRA_4444 or VUYA_4444 at 32f for
/// a quality of 3 and above, at 8u below. VUYA is of BT.709 at full opacity where the destination is, else of BT.601.
///
/// The arithmetic, with o the opacity, a the alpha and K the zero of a sample (128 for chroma, 16 for luma):
///
///  - RGB 8u: o8 = trunc(o x 255 + 0.5), limited to 0 to 255; a' = a x o8 / 255 and c x a' / 255, each to the nearest.
///  - VUY 8u without SSE2: the same a', and (c - K) x a' / 255 + K, by integers with shifts towards 0, not below 0 nor
///    above 255; unchanged where a' is 255.
///  - VUY 8u with SSE2: af = a x o as a float, and (c - K) x af / 255 + K to the nearest. A pixel passes whose af is at
///    least 254.5; from the first 16-byte boundary of a row on runs of four pass together, or none of them.
///  - 32f: c x a x o; the colour passes where a x o is above 1 - 8e-6. Nothing is limited.
///
/// Alpha becomes opaque. Row 0 in memory meets row 0 in memory, whatever the origins of the formats.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. The destination may be the source, with the same
/// format, first byte and row bytes; it must not overlap it otherwise.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called. The floating-point mode is the caller's, whose rounding mode
/// counts. The exception flags of MXCSR are left as the arithmetic sets them.
///
/// \param source          first row of the image that is read.
/// \param sourceRowBytes  bytes from one row of it to the next.
/// \param sourceFormat    a raster format.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a raster format.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows, not negative.
/// \param opacity         of the image, 0 to 1; above 1 - 8e-6 it is full.
/// \param quality         render quality, 0 to 5.
/// \return
///  - PK_ErrBadSrcFormat: the source format is compressed or planar.
///  - PK_ErrBadDstFormat: the destination format is.
///  - what PK_FillWithOpaqueBlack returns, where the opacity is below 8e-6: the source is not read then.
///  - PK_ErrBadSrcFormat, PK_ErrBadDstFormat: a format is outside the catalogue.
///  - PK_Success: done; with a width or height of 0 nothing was to do.
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows of a wide image that are converted.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_CompositeToBlack(const void* source, int32_t sourceRowBytes, PK_PixelFormat sourceFormat,
                                     void* dest, int32_t destRowBytes, PK_PixelFormat destFormat,
                                     int32_t width, int32_t height, float opacity, int32_t quality) noexcept;

/// Flattens an image onto opaque black as PK_CompositeToBlack does at full opacity, and tells whether all of its pixels
/// were opaque, or all transparent.
///
/// The alpha of each row is looked at in the format that is worked in: at 32f it is full or none within 8e-6. An opaque
/// row is copied or converted, and not written at all where the call is in place: where source and destination have one
/// first byte, row bytes and format. A transparent row is filled with opaque black in the destination's own
/// format as PK_FillWithOpaqueBlack does it, which leaves the last pixel of an odd width of 4:2:2; RGB_444_10u, which has
/// no fill, is laid over black.
///
/// Memory and threads are those of PK_CompositeToBlack, and so are the parameters, and:
///
/// \param alphaTestResult  receives 0 where all rows are opaque, or there is no pixel; 1 where all are transparent; else
///                         2. It is written on success only.
/// \return
///  - PK_ErrBadSrcFormat, PK_ErrBadDstFormat: a format is compressed or planar, else outside the catalogue.
///  - PK_ErrFailed: no place for the test result.
///  - PK_Success: done; with a width or height of 0 nothing was to do.
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for rows of a wide image that are converted.
PK_API PK_Result PK_CompositeToBlackAndTestSourceAlpha(const void* source, int32_t sourceRowBytes,
                                                       PK_PixelFormat sourceFormat, void* dest,
                                                       int32_t destRowBytes, PK_PixelFormat destFormat,
                                                       int32_t width, int32_t height,
                                                       uint32_t* alphaTestResult, int32_t quality) noexcept;

/// Takes from each pixel the share of a matte colour that an image was flattened against.
///
/// The share is the matte colour premultiplied by the complement of the pixel's alpha, as PK_Convert premultiplies it.
/// Each colour sample becomes itself without the share, 0 where the share is greater. Alpha stays. A straight image then
/// goes the way from premultiplied to straight, so that a black matte leaves only its opaque pixels as they are.
///
/// Memory: as for PK_CompositeToBlack. The destination may be the source, with the same first byte and row bytes.
/// Threads: as for PK_CompositeToBlack. Row 0 in memory meets row 0 in memory.
///
/// \param source          first row of the image that is read.
/// \param sourceRowBytes  bytes from one row of it to the next.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param format          of both images: RGB with straight or premultiplied alpha, at 8u, 15u or 32f.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows, not negative.
/// \param matteColor      one pixel.
/// \param matteFormat     of that pixel, any that PK_Convert converts from.
/// \param quality         render quality of the conversions, 0 to 5.
/// \return
///  - PK_ErrBadSrcFormat: any other format.
///  - what PK_Convert returns, where it cannot convert the pixel of the matte.
///  - PK_Success: done; with a width or height of 0 nothing was to do.
///  - PK_ErrFailed: a negative width or height, a width too great, or a null pointer where there are pixels.
///  - PK_ErrNotSupported: no way from straight to premultiplied or back.
///  - PK_ErrOutOfMemory: no memory for the rows of a wide image.
PK_API PK_Result PK_UnPremultiplyAgainstMatteColor(const void* source, int32_t sourceRowBytes, void* dest,
                                                   int32_t destRowBytes, PK_PixelFormat format, int32_t width,
                                                   int32_t height, const void* matteColor,
                                                   PK_PixelFormat matteFormat, int32_t quality) noexcept;

} // extern "C"
