#pragma once

/// \file
/// Box blur of four-byte pixels with fractional radii.

#include <PixelKiln/Types.h>

extern "C" {

/// Bits of the flags of PK_BoxBlur.
enum PK_BoxBlurFlags : int32_t {
    PK_BoxBlur_Byte0 = 1,        ///< filter byte 0 of each pixel
    PK_BoxBlur_Byte1 = 2,        ///< filter byte 1
    PK_BoxBlur_Byte2 = 4,        ///< filter byte 2
    PK_BoxBlur_Byte3 = 8,        ///< filter byte 3
    PK_BoxBlur_Renormalise = 16, ///< divide by what is in the window; else lines fade to black at their ends
    PK_BoxBlur_Columns = 128,    ///< filter along columns; else along rows
};

/// Runs box filters along the rows or the columns of an image of four independent bytes a pixel, in place. Several
/// radii are several filters, one after the other, on each line; three of them come near to a Gaussian blur. The
/// cost does not depend on the radius.
///
/// A radius r of whole part i has size = i + 1 and f = trunc((r - i) x 255). The window of pixel x of a line of n
/// pixels is the whole pixels x - size + 1 to x + size - 1 that lie in the line, c of them with the sum S, and the
/// edge pixels x - size and x + size that lie in it, e of them with the sum E. Each filtered byte becomes
///
///     (255 x S + f x E + 128) / (255 x c + f x e), truncated, at most 255
///
/// where without PK_BoxBlur_Renormalise 255 x (2 x size - 1) stands for 255 x c. Two things are particular to it.
/// Pixel x = size has no left edge pixel. And towards the end of a line no more whole pixels enter: pixel n - 4 is the
/// last of them, or on lines of fewer than 2 x size + 3 pixels, pixel 2 x size - 1, the last in the window of pixel
/// x = size. So the ends of a line do not mirror each other. Where nothing in the window weighs anything (c = 0 and
/// f = 0), a pixel becomes 0, and with PK_BoxBlur_Renormalise, which has nothing to divide by, stays as it is. Radii
/// below 1/255 count as 0, and change nothing.
///
/// The quotients are exact on every processor and in every floating-point mode; the exception flags of MXCSR are
/// left as the arithmetic on radii sets them.
///
/// Lines whose length is above 2048 pixels go side by side through memory that is taken for the length of the call. Where
/// it cannot be had they go one by one through the scratch, which is slower and gives the same.
///
/// Does nothing, and looks at no memory, if \p passCount is below 1, a pointer is null, or \p width or \p height
/// is below 4. Runs on the calling thread; may be called from any number of threads at the same time with different
/// radii, scratch and images. No alignment is asked for.
/// \param passCount  number of radii.
/// \param radii      in pixels, in the order of the passes; each above min(width, height) - 3 is set to that. Radii
///                   below 0 and NaN stay in the array and count as 0.
/// \param flags      PK_BoxBlurFlags. Bytes without a flag keep their values; without any there is no change but to
///                   \p radii. Other bits do not count.
/// \param scratch    room for width + height + max(width, height) pixels, overlapping neither image nor radii. Its
///                   content afterwards is of no meaning.
/// \param image      first row in memory.
/// \param rowBytes   bytes to the next row, of either sign; along columns cut to a multiple of 4. Rows must not
///                   overlap.
/// \param width      pixels of a row.
/// \param height     rows.
PK_API void PK_BoxBlur(int32_t passCount, double* radii, int32_t flags, void* scratch, void* image,
                       int32_t rowBytes, int32_t width, int32_t height) noexcept;

} // extern "C"
