#pragma once

/// \file
/// Bridges to codecs: conversions between pixel layouts that only codecs use and formats of PixelFormat.h.
///
/// Of all functions here:
///
/// Rows: row bytes may be of either sign; the first row is the one at the pointer, and row n lies n times the
/// row bytes further on. No alignment is asked for. The order of rows stays, unless the function says that it
/// turns the picture. Nothing is read or written between the rows.
///
/// Sizes: width and height are those of the source. A height below 1 or a width of 0 does nothing, with any
/// pointers, and succeeds. Arguments are checked before memory is touched.
///
/// Overlap: source and destination must not overlap. Functions that end in In_Place, and
/// PK_Scale16uBufferTo15uSIMD, work in their one buffer.
///
/// Threads: each runs on the calling thread, allocates nothing, and may be called from any number of threads
/// at the same time on different destinations. PK_Initialize must have been called. The floating-point mode
/// is the caller's, denormals included; the exception flags of MXCSR are left as the arithmetic sets them.
///
/// Words and samples of more than a byte are little-endian.

#include <PixelKiln/Types.h>

extern "C" {

/// Three-byte RGB to BGRA_4444_8u with an alpha of 255.
/// \param source               pixels of three bytes, R, G, B, without padding between them.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          BGRA_4444_8u.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_ConvertRGB_444_8uToBGRA_4444_8u(const void* source, int32_t sourceRowBytes,
                                                    void* destination, int32_t destinationRowBytes,
                                                    int32_t width, int32_t height) noexcept;

/// Four-word pixels to RGB_444_10u: bits 6-15 of the first word go to bits 2-11 of the pixel, those of the
/// second to bits 12-21, those of the third to bits 22-31. The fourth word is ignored. Rows follow each other
/// without padding at both ends.
/// \param source       width x height pixels of four 16-bit words.
/// \param destination  width x height pixels of RGB_444_10u.
/// \param width        pixels in a row, 0 to 134217727.
/// \param height       rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_DNxHD16u_To_RGB_444_10u(const void* source, void* destination, int32_t width,
                                                    int32_t height) noexcept;

/// RGB_444_10u to four-word pixels, the inverse of PK_Convert_DNxHD16u_To_RGB_444_10u. Bits 0-5 of the first
/// three words become 0. The fourth word of each pixel is neither read nor written; that of the last pixel need not
/// be there.
/// \param source       width x height pixels of RGB_444_10u, without padding.
/// \param destination  width x height pixels of four 16-bit words, without padding.
/// \param width        pixels in a row, 0 to 134217727.
/// \param height       rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_RGB_444_10u_To_DNxHD16u(const void* source, void* destination, int32_t width,
                                                    int32_t height) noexcept;

/// Unpacked samples of 4:2:2 to V210_422_10u: each word is s0 | s1 << 10 | s2 << 20 of three samples. Samples
/// are taken as they are: bits above the tenth run into the next sample of the word. What a last group of
/// fewer than six pixels lacks is black (luma 64, chroma 512); that group is left out where the row bytes of
/// the destination, without their sign, are below 16 times the count of groups.
/// \param source               two 16-bit words a pixel in the order U, Y, V, Y, values 0 to 1023.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          V210_422_10u.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param width                pixels in a row, 0 to 134217727. Of an odd width the last chroma is U alone.
/// \param height               rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_ConvertUYVY_422_10uToV210_422_10u(const void* source, int32_t sourceRowBytes,
                                                      void* destination, int32_t destinationRowBytes,
                                                      int32_t width, int32_t height) noexcept;

/// Three-word BGR to RGB_444_10u: bits 6-15 of B, G and R go to bits 2-11, 12-21 and 22-31 of the pixel.
/// \param source               three 16-bit words a pixel, B, G, R.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          RGB_444_10u.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_j2k_BGR16u_To_RGB_444_10u(const void* source, int32_t sourceRowBytes,
                                                      void* destination, int32_t destinationRowBytes,
                                                      int32_t width, int32_t height) noexcept;

/// RGB_444_10u to three-word BGR with the samples in bits 0-9 and the other bits 0.
/// \param source               RGB_444_10u.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          three 16-bit words a pixel, B, G, R.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u(const void* source,
                                                                     int32_t sourceRowBytes,
                                                                     void* destination,
                                                                     int32_t destinationRowBytes,
                                                                     int32_t width, int32_t height) noexcept;

/// V210_422_10u to unpacked samples, in bits 0-9 of a word each, the other bits 0.
/// \param source               V210_422_10u; the last group of six pixels is read whole.
/// \param sourceRowBytes       bytes from one row to the next.
/// \param destination          two 16-bit words a pixel in the order U, Y, V, Y. Of a last group that is not
///                             full only the pixels of the width are written.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param width                pixels in a row, 0 to 134217727. Of an odd width the last chroma is U alone.
/// \param height               rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u(const void* source, int32_t sourceRowBytes,
                                                               void* destination, int32_t destinationRowBytes,
                                                               int32_t width, int32_t height) noexcept;

/// Moves float chroma from the range 0 to 1 to that about 0, in place: U - 0.5 and V - 0.5. Luma keeps its
/// bits.
/// \param buffer    two floats a pixel in the order U, Y, V, Y. Of an odd width the last pair is U and Y
///                  alone, and what follows is not touched.
/// \param rowBytes  bytes from one row to the next.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(void* buffer, int32_t rowBytes, int32_t width,
                                                             int32_t height) noexcept;

/// Gamma-coded XYZ to gamma-coded BGR, in place. With f(c, p) = sign(c) |c|^p and Z, Y, X = f(sample, 2.6):
///
///     B = f( 0.0556434 X - 0.2040259 Y + 1.0572252 Z, 0.41666666)
///     G = f(-0.969266  X + 1.8760108 Y + 0.041556  Z, 0.41666666)
///     R = f( 3.2404542 X - 1.5371385 Y - 0.4985314 Z, 0.41666666)
///
/// in single precision, from left to right. Nothing is limited: negative samples and those above 1 pass, and
/// denormal numbers count.
/// \param buffer    four floats a pixel: Z, Y, X to B, G, R, and one that stays.
/// \param rowBytes  bytes from one row to the next.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(void* buffer, int32_t rowBytes, int32_t width,
                                                              int32_t height) noexcept;

/// Three-word RGB to XRGB_4444_15u, upside down: the source is read from its last row upward. Rows follow
/// each other without padding at both ends.
///
/// Two members differ, and callers compare against each. The plain one gives samples of (c x 32768) / 1023,
/// truncated, of which 16 bits are kept, and a first word of 65535 in each pixel. That of SSE4.1 and AVX2
/// gives c x 32.03128, rounded to nearest by the current rounding mode and limited to 65535, and a first word
/// of 0. The second runs where the switch of SSE4.1 or that of AVX2 is on, whatever the others are.
///
/// A height below 1, a width that is not positive or above 134217727, and a null pointer do nothing.
/// \param source       width x height pixels of three 16-bit words, R, G, B, values 0 to 1023.
/// \param destination  width x height pixels of four 16-bit words, X, R, G, B.
/// \param width        pixels in a row.
/// \param height       rows.
PK_API void PK_ConvertRGB_444_16u_To_XRGB_4444_15u(const void* source, void* destination, int32_t width,
                                                   int32_t height) noexcept;

/// 16-bit samples to those that are white at 32768, in place: ((c << 15) | 0x7fff) / 65535, truncated.
/// \param buffer    four 16-bit samples a pixel.
/// \param rowBytes  bytes from one row to the next.
/// \param width     pixels in a row, 0 to 134217727.
/// \param height    rows.
/// \param byteSwap  true where the samples are big-endian: their bytes are exchanged before they are scaled.
///                  Results are little-endian in every case.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, or a width that is negative or too great.
PK_API PK_Result PK_Scale16uBufferTo15uSIMD(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                            bool byteSwap) noexcept;

/// Planar ten-bit 4:2:2 to V210_422_10u. Of a last group of fewer than six pixels, the samples that the planes
/// lack repeat the last of their plane, and no more is written than the row bytes of the destination, without
/// their sign, have room for.
/// \param planes               Y, U and V: 16-bit words, values 0 to 1023; larger ones run into their
///                             neighbours. A row of Y has width samples, one of U or V (width + 1) / 2.
/// \param planeRowBytes        bytes from one row to the next, for each plane.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows.
/// \param destination          V210_422_10u.
/// \param destinationRowBytes  bytes from one row to the next.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, among the planes too, or a width that is negative or too great.
PK_API PK_Result PK_ConvertW210toV210(const void* const planes[3], const int32_t planeRowBytes[3],
                                      int32_t width, int32_t height, void* destination,
                                      int32_t destinationRowBytes) noexcept;

/// As PK_ConvertW210toV210, to twice the height: row 2r of the destination is row r of the source, and row
/// 2r + 1 its average with row r + 1, sample by sample, (a + b) >> 1. The last row averages with itself.
/// \param planes               as for PK_ConvertW210toV210.
/// \param planeRowBytes        bytes from one row to the next, for each plane.
/// \param width                pixels in a row, 0 to 134217727.
/// \param height               rows of the source.
/// \param destination          V210_422_10u, 2 height rows.
/// \param destinationRowBytes  bytes from one row to the next.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, among the planes too, or a width that is negative or too great.
PK_API PK_Result PK_TempConvertW210toV210ToReplacePanasonicLTDebayering(const void* const planes[3],
                                                                        const int32_t planeRowBytes[3],
                                                                        int32_t width, int32_t height,
                                                                        void* destination,
                                                                        int32_t destinationRowBytes) noexcept;

/// As PK_ConvertW210toV210, to half the width and half the height, both rounded down: rows 0, 2, 4 and so on,
/// and of each plane samples 0, 2, 4 and so on.
/// \param planes               as for PK_ConvertW210toV210.
/// \param planeRowBytes        bytes from one row to the next, for each plane.
/// \param width                pixels in a row of the source, 0 to 134217727.
/// \param height               rows of the source.
/// \param destination          V210_422_10u, width / 2 by height / 2 pixels.
/// \param destinationRowBytes  bytes from one row to the next.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, among the planes too, or a width that is negative or too great.
PK_API PK_Result PK_QuarterScaleConvertW210toV210(const void* const planes[3], const int32_t planeRowBytes[3],
                                                  int32_t width, int32_t height, void* destination,
                                                  int32_t destinationRowBytes) noexcept;

/// Planar ten-bit 4:2:2 to VUYX_4444_8u of half the width and half the height, both rounded down, upside
/// down: row i of the source, or row i + 1 for field 2, becomes row i of the destination counted from its
/// last. Pixel k has Y = (Y[2k] + Y[2k + 1]) >> 3, U = U[k] >> 2, V = V[k] >> 2 and an alpha of 255.
/// \param planes               as for PK_ConvertW210toV210.
/// \param planeRowBytes        bytes from one row to the next, for each plane.
/// \param width                pixels in a row of the source, 0 to 134217727.
/// \param height               rows of the source, of which the first height / 2 are read; from the second
///                             on for field 2.
/// \param destination          VUYX_4444_8u, width / 2 by height / 2 pixels.
/// \param destinationRowBytes  bytes from one row to the next.
/// \param field                2 begins at the second row; all else at the first.
/// \return
///  - PK_Success: converted, or nothing to do.
///  - PK_ErrFailed: a null pointer, among the planes too, or a width that is negative or too great.
PK_API PK_Result PK_ConvertW210toQuarterResVUYX_8u(const void* const planes[3],
                                                   const int32_t planeRowBytes[3], int32_t width,
                                                   int32_t height, void* destination,
                                                   int32_t destinationRowBytes, int32_t field) noexcept;

} // extern "C"
