#pragma once

/// \file
/// Two pixel tools: a choice between two images by a mask of one bit a pixel, and numbers burnt into an image.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Takes each pixel from one of two images by one bit of a mask: from the first where the bit is set, from the
/// second where it is clear. Nothing is blended, alpha goes along with the pixel.
///
/// Formats: the destination is any raster format that is not 4:2:2 (pixels of 4, 8 or 16 bytes). The images
/// are of any raster format; where theirs is not the destination's, their rows are converted as PK_Convert
/// converts them.
///
/// The mask is rows of bytes. In a byte the most significant bit is the leftmost pixel. Bit
/// maskBitOffset & 7, counted from the most significant, is the first pixel of every row.
///
/// Origin: row 0 in memory meets row 0 in memory in all three images and in the mask, whatever the origin of
/// their formats.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Of each row of an image exactly the
/// pixels are read or written, to the end of the last pair or group of six where the format has these; of a
/// row of the mask exactly the bytes that hold its bits are read. The destination may be an image of its own
/// format itself, with the same first byte and row bytes, and must not overlap them or the mask otherwise.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// destinations. PK_Initialize must have been called. The floating-point mode is the caller's: denormal
/// results of conversions stay, which PK_Convert makes 0. The exception flags of MXCSR are left as the arithmetic
/// sets them.
///
/// \param first           first row of the image for set bits.
/// \param firstRowBytes   bytes from one row of it to the next.
/// \param firstFormat     a raster format.
/// \param second          first row of the image for clear bits.
/// \param secondRowBytes  bytes from one row of it to the next.
/// \param secondFormat    a raster format.
/// \param mask            first row of the mask.
/// \param maskRowBytes    bytes from one row of it to the next.
/// \param maskBitOffset   the bit at which each row of the mask begins; only the low three bits count.
/// \param dest            first row of the image that is written.
/// \param destRowBytes    bytes from one row of it to the next.
/// \param destFormat      a raster format that is not 4:2:2.
/// \param width           pixels in a row, 0 to 134217727.
/// \param height          rows, not negative.
/// \param quality         render quality of the conversions, 0 to 5.
/// \return
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrBadDstFormat: the destination is 4:2:2 or no raster format.
///  - PK_ErrBadSrcFormat: one of the images is of no raster format.
///  - PK_ErrOutOfMemory: no memory for rows above 16384 pixels that are converted.
///  - PK_ErrFailed: a negative width or height, a width too great, a null pointer where there are pixels, or
///    no conversion to the destination's format.
///
/// Arguments are checked in this order, before memory is touched; nothing is written after a failure.
PK_API PK_Result PK_OneBitMaskComposite(const void* first, int32_t firstRowBytes, PK_PixelFormat firstFormat,
                                        const void* second, int32_t secondRowBytes,
                                        PK_PixelFormat secondFormat, const uint8_t* mask,
                                        int32_t maskRowBytes, uint8_t maskBitOffset, void* dest,
                                        int32_t destRowBytes, PK_PixelFormat destFormat, int32_t width,
                                        int32_t height, int32_t quality) noexcept;

/// Burns a number into an image, in digits of seven strokes, each one pixel thick and of opaque red: a mark for
/// debugging that needs no font.
///
/// The number is written as printf writes it with "%d" or "%x". All products and quotients below are
/// truncated, and n is the count of characters.
///
///     cell   = size x width, made even by clearing the lowest bit
///     startX = max(position.x x width, 4)        startY = max(position.y x height, 4)
///     if width  < cell x (n + 1) + startX:       cell = (width - startX) / (n + 1)
///     if height < startY + 2 x cell:             cell = (height - startY) / 2
///     L      = cell x 3 / 4, made even by clearing the lowest bit
///
/// Character i has its top left corner at column startX + i x cell and row startY of the picture, with the
/// picture's top row as row 0, whatever the origin of the format; its strokes are L pixels long. Horizontal
/// ones stand at rows 0, L and 2 L, vertical ones at columns 0 and L and begin at rows 0 and L. A minus sign is
/// three horizontal strokes. What does not fit the image is cut off.
///
/// A stroke on a 4:2:2 format goes by whole pairs of pixels, that is at half the column and, where it is
/// horizontal, with half the length. On a planar 4:2:0 format the chroma planes get the stroke at half the
/// column and row, with half the length; the planes lie in one block as PK_GetPlanarBuffers finds them.
///
/// Formats, with the ink in the order of memory:
///
/// | Format                             | Ink                                               |
/// |------------------------------------|---------------------------------------------------|
/// | 8u RGB, alpha last                 | 0, 0, 255, 255                                    |
/// | 8u RGB, alpha first                | 255, 255, 0, 0                                    |
/// | 8u VUY 4:4:4, alpha last           | 0xEF, 0x5A, 0x51, 0xFF                            |
/// | 8u VUY 4:4:4, in reversed order    | 0xFF, 0x51, 0x5A, 0xEF                            |
/// | 8u UYVY                            | 0x5A, 0x5A, 0xEF, 0x51; callers know the first Y  |
/// | 8u YUYV                            | 0x51, 0x5A, 0x51, 0xEF                            |
/// | 4:2:0 planes                       | Y 0x51, U 0x5A, V 0xEF                            |
/// | 32f RGB, alpha last                | 0, 0, 1.0, 1.0                                    |
/// | 32f RGB, alpha first               | 1.0, 1.0, 0, 0                                    |
/// | 32f VUY 4:4:4, alpha last          | 0.5, -0.168736, 0.299, 1.0                        |
/// | 32f VUY 4:4:4, in reversed order   | 1.0, 0.299, -0.168736, 0.5                        |
/// | 32f UYVY                           | -0.168736, 0.299, 0.5, 0.299                      |
/// | 32f YUYV                           | 0.299, -0.168736, 0.299, 0.5                      |
///
/// RGB_444_10u and V210 are accepted and written as if they were 32f, with 16 bytes where these have a pixel or
/// a pair: what appears is a mark, but neither red nor a digit.
///
/// Memory: no alignment is asked for. Nothing is written outside the image, whatever the arguments.
///
/// Threads: runs on the calling thread; may be called from any number of threads at the same time on different
/// images. The exception flags of MXCSR are left as the arithmetic sets them.
///
/// \param buffer    first row of the image, or first byte of the block of planes.
/// \param rowBytes  bytes from one row to the next, of either sign; ignored for 4:2:0.
/// \param format    a raster format but those of 15u, one of them in reversed component order, or a planar
///                  4:2:0 format.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows, not negative.
/// \param number    what to write.
/// \param size      width of a character as a fraction of the width of the image, 0 to 1.
/// \param position  top left corner of the first character, as fractions of width and height, 0 to 1.
/// \param decimal   decimal digits with a minus sign for a negative number; else hexadecimal ones of the
///                  number as 32 bits without sign.
/// \return
///  - PK_Success: done. A width or height of 0 does nothing.
///  - PK_ErrBadDstFormat: any other format.
///  - PK_ErrBadPosX: the width is negative.
///  - PK_ErrBadPosY: the height is negative.
///  - PK_ErrFailed: a fraction that is not from 0 to 1, not-a-number among them; a null buffer where there are
///    pixels; a width too great; a block of planes above 2147483647 bytes.
///
/// Arguments are checked in this order; nothing is written after a failure.
PK_API PK_Result PK_PrintNum(void* buffer, int32_t rowBytes, PK_PixelFormat format, int32_t width,
                             int32_t height, int32_t number, float size, PK_Point position,
                             bool decimal) noexcept;

} // extern "C"
