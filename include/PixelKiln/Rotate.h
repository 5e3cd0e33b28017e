#pragma once

/// \file
/// Exact moves of pixels: transposition, and rotation by quarter turns. Nothing is filtered.
///
/// Both run on the calling thread and may be called from any number of threads at the same time on different
/// destinations. Source and destination must not overlap. No alignment is asked for.

#include <PixelKiln/Types.h>

extern "C" {

/// Swaps rows and columns: pixel x of destination row y is pixel y of source row x. Rows count in memory order.
/// \param source          first row of `height` rows of `width` pixels.
/// \param sourceRowBytes  bytes to the next source row, of either sign. Where no SSE2 is used, and for pixels of
///                        1 and 2 bytes, a step that is no multiple of \p pixelBytes is cut to one.
/// \param dest            first row of `width` rows of `height` pixels.
/// \param destRowBytes    bytes to the next destination row, likewise.
/// \param width           pixels in a source row, not negative; 0 does nothing.
/// \param height          source rows, not negative; 0 does nothing.
/// \param pixelBytes      1, 2, 4, 8 or 16.
/// \return PK_Success; PK_ErrBadSrcFormat for any other \p pixelBytes; PK_ErrFailed for a negative size, or for a
///         null pointer with pixels to move. On failure nothing is written.
PK_API PK_Result PK_Transpose(const void* source, int32_t sourceRowBytes, void* dest, int32_t destRowBytes,
                              int32_t width, int32_t height, uint8_t pixelBytes) noexcept;

/// Turns an 8-bit four-channel image by a multiple of 90 degrees, counted in memory rows and columns: by 90, pixel
/// c of destination row r is pixel r of source row height - 1 - c; by 180, pixel width - 1 - c of row
/// height - 1 - r; by 270, pixel width - 1 - r of row c. (So a picture whose format is stored bottom-up turns the
/// other way round.)
/// \param source          first row.
/// \param sourceRowBytes  bytes to the next source row, of either sign; cut to a multiple of 4.
/// \param dest            first row; `width` rows of `height` pixels, or for 180 degrees the size of the source.
/// \param destRowBytes    bytes to the next destination row, likewise.
/// \param width           pixels in a source row; below 1 does nothing.
/// \param height          source rows; below 1 does nothing.
/// \param format          a 4:4:4 format of 8 bits with an alpha kind other than 0.
/// \param degrees         90, 180, 270, -90, -180 or -270.
/// \return PK_Success; PK_ErrBadSrcFormat for any other format; PK_ErrFailed for any other angle, 0 and 360
///         included, or for a null pointer with pixels to move. On failure nothing is written.
PK_API PK_Result PK_RotateImage(const void* source, int32_t sourceRowBytes, void* dest, int32_t destRowBytes,
                                int32_t width, int32_t height, PK_PixelFormat format,
                                int32_t degrees) noexcept;

} // extern "C"
