#pragma once

/// \file
/// Fast reductions of planar 8-bit 4:2:0 images: one field is taken by dropping samples, none is filtered.
///
/// A planar image is three first bytes and three row bytes, each an array in the order luma, first chroma,
/// second chroma. The chroma planes have half the width and half the height of the luma plane.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Source and destination must not
/// overlap. A plane of which nothing is read or written may be null.
///
/// Threads: both functions run on the calling thread and may be called from any number of threads at the same
/// time on different destinations.

#include <PixelKiln/Types.h>

extern "C" {

/// Reduces one field of an image to half its width, in each plane: out[i] = in[2 i].
///
/// Of the luma plane every second row is taken, from row 0 for field 1 and from row 1 for field 2: height / 2
/// rows. Of the chroma planes every second row is taken too, height / 4 rows, but always from row 0: the field
/// decides on luma alone, and callers rely on it.
///
/// How many samples a row gets depends on the processor flag of SSE2 (switch 3 of PK_SetDebugFlag), and
/// callers rely on both forms:
///
/// | SSE2 | luma samples of a row                              | chroma samples of a row                  |
/// |------|----------------------------------------------------|------------------------------------------|
/// | on   | width / 32 x 32, or width / 2 for a width below 32 | width / 64 x 32, or width / 4 below 64   |
/// | off  | width / 2                                          | width / 4                                |
///
/// All quotients are rounded down. So with SSE2 the width counts the luma samples of a row of the destination,
/// the rows of the source are twice as long, and only a multiple of 64 fills whole rows; what lies behind the
/// samples of the table stays as it was. Without SSE2 the width counts the luma samples of a row of the source.
///
/// \param srcPlanes    first bytes of the planes that are read. Of a row twice as many bytes are read as
///                     samples are written.
/// \param srcRowBytes  bytes from one row of each to the next.
/// \param dstPlanes    first bytes of the planes that are written.
/// \param dstRowBytes  bytes from one row of each to the next.
/// \param width        luma samples in a row, of the destination or of the source as told above; at most
///                     2147483647.
/// \param height       luma rows of the source, both fields, at most 2147483647. Below 2 nothing is written,
///                     below 4 no chroma.
/// \param field        1 for rows 0, 2, 4 and so on, 2 for rows 1, 3, 5 and so on.
/// \return
///  - PK_Success: done. A size that gives no samples does nothing.
///  - PK_ErrBadFieldType: the field is neither 1 nor 2.
///  - PK_ErrFailed: a width or height above 2147483647, or a null array or plane with samples to read or
///    write.
///
/// Nothing is written after a failure.
PK_API PK_Result PK_QuarterScalePlanar420_8u(const void* const srcPlanes[3], const int32_t srcRowBytes[3],
                                             void* const dstPlanes[3], const int32_t dstRowBytes[3],
                                             uint32_t width, uint32_t height, int32_t field) noexcept;

/// Takes the luma rows of one field at full width, and interleaves them with the chroma rows of the image to
/// packed 4:2:2 rows.
///
/// Row r of the destination has luma row 2 r (2 r + 1 for field 2) and row r of both chroma planes: each chroma
/// row is used once, and the result is an image of height / 2 rows. In memory each two pixels are luma, first
/// chroma, luma, second chroma, or first chroma, luma, second chroma, luma. In the last group of an odd width
/// the second luma is 0.
///
/// \param srcPlanes    first bytes of the planes that are read.
/// \param srcRowBytes  bytes from one row of each to the next.
/// \param dst          first byte of the packed image; (width + 1) / 2 x 4 bytes of each row are written.
/// \param dstRowBytes  bytes from one row of it to the next.
/// \param width        luma samples in a row, at most 2147483647. (width + 1) / 2 samples of each chroma row
///                     are read.
/// \param height       luma rows of the source, both fields, at most 2147483647. Below 2 nothing is written.
/// \param yuyvOrder    whether each two pixels begin with luma.
/// \param field        2 for luma rows 1, 3, 5 and so on; any other number for rows 0, 2, 4 and so on.
/// \return
///  - PK_Success: done. A width of 0 does nothing.
///  - PK_ErrFailed: a width or height above 2147483647, or a null array, plane or destination with samples to
///    read or write; nothing is written then.
PK_API PK_Result PK_QuarterScalePlanar_8uAndConvertTo422_8u(const void* const srcPlanes[3],
                                                            const int32_t srcRowBytes[3], void* dst,
                                                            int32_t dstRowBytes, uint32_t width,
                                                            uint32_t height, bool yuyvOrder,
                                                            int32_t field) noexcept;

} // extern "C"
