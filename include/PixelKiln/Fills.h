#pragma once

/// \file
/// Filling an image with one colour.
///
/// The buffer is the first row in memory as the row bytes walk it; for a stream it is the first byte and row
/// bytes are ignored. Row bytes may be of either sign. No alignment is asked for. Only pixels are written, no
/// row padding. All functions run on the calling thread and may be called from any number of threads at the
/// same time on different buffers.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Fills with opaque black: samples B, G, R = 0, or V, U = 128 and Y = 16; alpha is full, where there is one.
///
/// What is written by format, here and in the other named fills:
///
/// | Format                  | Written |
/// |-------------------------|---------|
/// | four channels, 8u       | the samples, in the order of the format |
/// | four channels, 15u      | 0 or 32768 for each sample |
/// | four channels, 32f      | 0.0 or 1.0 for each sample; chroma 0.0 |
/// | 4:2:2, 8u and 32f       | width / 2 whole pairs a row: an odd width leaves the last pixel unwritten |
/// | V210                    | whole groups of six pixels up to the width, each sample 4 times the 8-bit one |
/// | planar 4:2:0            | width bytes of Y in each row; width / 2 bytes of U and V in height / 2 rows,
///                             placed as PK_GetPlanarBuffers does; the same codes for full range |
/// | NTSCDV25, PALDV25       | an encoded frame of black, whatever the fill, the width and the height |
/// | other DV                | nothing, with PK_Success |
///
/// \param buffer    the image.
/// \param rowBytes  bytes from one row to the next; ignored for a stream.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param format    the format of the image.
/// \return
///  - PK_Success: filled. A width or height of 0 does nothing, with any buffer, but to a frame of DV25.
///  - PK_ErrBadSrcFormat: a stream that is neither DV nor a well-formed planar 4:2:0 format.
///  - PK_ErrNotSupported: any other depth or layout, RGB_444_10u among them.
///  - PK_ErrFailed: a null buffer, a negative width or height, a width too great, or planes too large for 32 bits.
///  Nothing is written unless the result is PK_Success.
PK_API PK_Result PK_FillWithOpaqueBlack(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                        PK_PixelFormat format) noexcept;

/// Fills with opaque white: samples B, G, R = 255, or V, U = 128 and Y = 235; alpha is full, where there is
/// one. See PK_FillWithOpaqueBlack for formats and result codes.
/// \param buffer    the image.
/// \param rowBytes  bytes from one row to the next; ignored for a stream.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param format    the format of the image.
/// \return as PK_FillWithOpaqueBlack.
PK_API PK_Result PK_FillWithOpaqueWhite(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                        PK_PixelFormat format) noexcept;

/// Fills with the colour of PK_FillWithOpaqueBlack and alpha 0.
/// \param buffer    the image.
/// \param rowBytes  bytes from one row to the next.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param format    a format with straight or premultiplied alpha.
/// \return PK_ErrBadDstFormat for a format without alpha (kind 0, as 4:2:2 has) or with a meaningless one (X),
///         before anything else is looked at; otherwise as PK_FillWithOpaqueBlack.
PK_API PK_Result PK_FillWithTransparentBlack(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                             PK_PixelFormat format) noexcept;

/// Fills with the colour of PK_FillWithOpaqueWhite and alpha 0; a premultiplied format, in which that has no
/// colour, with transparent black.
/// \param buffer    the image.
/// \param rowBytes  bytes from one row to the next.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param format    a format with straight or premultiplied alpha.
/// \return as PK_FillWithTransparentBlack.
PK_API PK_Result PK_FillWithTransparentWhite(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                             PK_PixelFormat format) noexcept;

/// Fills with the colour of a pixel, converted to the format of the image as PK_Convert does at quality 4.
///
/// - Four channels of 8u, 15u or 32f: every pixel.
/// - 4:2:2 of 8u or 32f: width / 2 whole pairs a row; an odd width leaves the last pixel unwritten.
/// - Planar 4:2:0: the planes, as in the named fills, with the samples of the pixel over black, in the matrix
///   of the format. Row bytes are ignored.
/// - V210: the first row in groups of six pixels up to the width, all others in width / 6 whole groups only;
///   samples are 4 times those of the pixel as VUYA_4444_8u, whatever the matrix of the format. The fill is
///   complete and the result is still PK_ErrBadDstFormat: both are deliberate, callers rely on them.
///
/// \param buffer       the image.
/// \param rowBytes     bytes from one row to the next; ignored for a stream.
/// \param width        pixels in a row, 0 to 134217727.
/// \param height       rows, not negative.
/// \param format       the format of the image.
/// \param pixel        one pixel of pixelFormat, 2 to 16 bytes; may lie in the image. Of a 4:2:2 format it is
///                     one chroma and one luma sample in their order, and the chroma sample stands for both.
/// \param pixelFormat  a raster format other than V210.
/// \return
///  - PK_Success: filled. A width or height of 0 does nothing, with any pointers.
///  - PK_ErrBadDstFormat: V210, after the fill; otherwise a format that cannot be filled, with nothing
///    written: DV and unknown streams, RGB_444_10u, and any number that has no constant.
///  - PK_ErrBadSrcFormat: a pixel format that has no single pixel (V210, streams) or no constant.
///  - PK_ErrFailed: a null buffer or pixel, a negative width or height, a width too great, or planes too large for 32 bits.
PK_API PK_Result PK_FillWithColor(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                  PK_PixelFormat format, const void* pixel,
                                  PK_PixelFormat pixelFormat) noexcept;

} // extern "C"
