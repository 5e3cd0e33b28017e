#pragma once

/// \file
/// Alpha of whole images, and conversions of plain arrays.
///
/// Images are a first row and row bytes of either sign; rows are walked in the buffers' own order, whatever
/// the origin of the format, and no byte outside their pixels is touched. No alignment is asked for. All
/// functions run on the calling thread and may be called from any number of threads at the same time on
/// different destinations. The floating-point mode is the caller's, denormals included, unless a function says
/// otherwise; the exception flags of MXCSR are left as the arithmetic sets them.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Sets the alpha of every pixel to its full value or to 0. Colour samples stay.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param buffer    first row of the image.
/// \param rowBytes  bytes from one row to the next.
/// \param format    one of BGRA_4444_8u, VUYA_4444_8u (full is 255), BGRA_4444_15u (32768), BGRA_4444_32f,
///                  BGRA_4444_32f_Linear, VUYA_4444_32f, ARGB_4444_32f and ARGB_4444_32f_Linear (1.0).
/// \param opaque    true for full, false for 0.
/// \return PK_Success, also for a width or height of 0, which does nothing with any buffer;
///         PK_ErrNotSupported for any other format, ARGB_4444_8u and those of matrix 709 among them;
///         PK_ErrFailed for a null buffer, a negative width or height or a width too great.
PK_API PK_Result PK_SetAlphaChannel(int32_t width, int32_t height, void* buffer, int32_t rowBytes,
                                    PK_PixelFormat format, bool opaque) noexcept;

/// Writes the inverse of each source pixel's alpha a to the destination: 255 - a, 32768 - a (in 16 bits, so
/// that what is above 32768 wraps around) or 1.0 - a. The destination's colour samples stay as they are, so
/// this is normally done in place.
/// \param source               first row of the source.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          first row of the destination; the source itself, or an image that does not
///                             overlap with it.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param format               the format of both: four channels of 8u, 15u or 32f, with alpha where the
///                             component order has it.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows, not negative.
/// \return PK_Success, also for a width or height of 0, which does nothing with any pointers;
///         PK_ErrBadSrcFormat for any other format; PK_ErrFailed for a null pointer, a negative width or
///         height or a width too great.
PK_API PK_Result PK_InvertAlpha(const void* source, int32_t sourceRowBytes, void* destination,
                                int32_t destinationRowBytes, PK_PixelFormat format, int32_t width,
                                int32_t height) noexcept;

/// Copies an image with one alpha for all pixels: nearest(255 alpha) limited to 0 to 255, nearest(32768 alpha)
/// limited to 0 to 32768, or the float itself. Ties go as the caller's rounding mode says, to even by
/// default; NaN counts as 0 for integers.
/// \param source               first row of the source.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          first row of the destination; the source itself, or an image that does not
///                             overlap with it.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param format               the format of both: four channels of 8u, 15u or 32f; where alpha comes first
///                             (ARGB order), of 8u only.
/// \param width                pixels in a row, at most 134217727.
/// \param height               rows.
/// \param alpha                1 is full.
/// \return PK_Success, also for a width or height below 1, which does nothing with any pointers;
///         PK_ErrNotSupported for any other format; PK_ErrFailed for a null pointer or a width too great.
PK_API PK_Result PK_CopyAndSetAlpha(const void* source, int32_t sourceRowBytes, void* destination,
                                    int32_t destinationRowBytes, PK_PixelFormat format, int32_t width,
                                    int32_t height, float alpha) noexcept;

/// Multiplies an image of four-channel 8-bit pixels by a constant a channel:
/// nearest(source x constant x 2^-scaleFactor), ties to even, limited to 255.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows, not negative.
/// \param source               first row of the source.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          first row of the destination; the source itself, or an image that does not
///                             overlap with it.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param constants            one for each channel, in the order of the pixel's bytes.
/// \param scaleFactor          any number; negative ones multiply. Above 16 every result is 0.
/// \return PK_Success, also for a width or height of 0, which does nothing with any pointers; PK_ErrFailed for
///         a null pointer, a negative width or height or a width too great.
PK_API PK_Result PK_MultiplyByConstant(int32_t width, int32_t height, const void* source,
                                       int32_t sourceRowBytes, void* destination, int32_t destinationRowBytes,
                                       const uint8_t constants[4], int32_t scaleFactor) noexcept;

/// Converts floats to 32-bit integers: source x 2^-scaleFactor, rounded and limited to the range of the
/// result. NaN becomes 0. The caller's rounding mode and its treatment of denormals do not count.
/// \param source       the floats.
/// \param destination  the integers, as many; may be the memory of the source, else without overlap.
/// \param length       how many, not negative.
/// \param rounding     1 rounds to nearest, ties to even; any other value truncates towards zero.
/// \param scaleFactor  any number.
/// \return PK_Success, also for a length of 0, which does nothing with any pointers; PK_ErrFailed for a null
///         pointer or a negative length.
PK_API PK_Result PK_Convert_32f32sSfs(const float* source, int32_t* destination, int32_t length,
                                      int32_t rounding, int32_t scaleFactor) noexcept;

/// As PK_Convert_32f32sSfs, to 16-bit integers.
/// \param source       the floats.
/// \param destination  the integers, as many; without overlap with the source.
/// \param length       how many, not negative.
/// \param rounding     1 rounds to nearest, ties to even; any other value truncates towards zero.
/// \param scaleFactor  any number.
/// \return as PK_Convert_32f32sSfs.
PK_API PK_Result PK_Convert_32f16sSfs(const float* source, int16_t* destination, int32_t length,
                                      int32_t rounding, int32_t scaleFactor) noexcept;

/// Decodes A-law (ITU-T G.711) to 16-bit linear samples: the 13 bits of the law, sign included, in the highest
/// places, from -32256 to 32256 in multiples of 8. Code 0xd5 is 8, code 0x55 is -8.
/// \param source       the codes.
/// \param length       how many, not negative.
/// \param destination  the samples, as many; without overlap with the source.
/// \return PK_Success, also for a length of 0, which does nothing with any pointers; PK_ErrFailed for a null
///         pointer or a negative length.
PK_API PK_Result PK_DecodeALawTo16Bit(const uint8_t* source, int32_t length, int16_t* destination) noexcept;

} // extern "C"
