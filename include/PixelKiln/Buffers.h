#pragma once

/// \file
/// Pixel buffers, transient memory and plain memory helpers.
///
/// An image in a call is a base pointer, signed row bytes, a width, a height and a format. The base pointer
/// is the first row as the operation walks it and the row bytes lead to the next; negative row bytes walk an
/// image from its last row in memory to its first. No alignment is asked for unless a function says so. All
/// functions may be called from any thread at the same time on different memory. Those that allocate draw
/// from the process-wide rand(), which they never seed. A child that is forked while a thread of the program's own
/// is in rand() cannot call it, nor these: that lock is the C library's.

#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Allocates an image that lives on after the call. Buffers of equal size begin at different distances from
/// a multiple of 8192, so that they do not compete for the same cache lines.
/// \param format          any format.
/// \param width           pixels in a row, not negative.
/// \param height          rows, not negative.
/// \param allocationBase  receives what PK_FreePixelBuffer wants back.
/// \param pixels          receives the first pixel, 16-byte aligned; the contents are undefined.
/// \param rowBytes        receives PK_PixelFormatRowBytes: 0 for a stream.
/// \param allocatedSize   receives the size that PK_FreePixelBuffer wants back, in bytes.
/// \return PK_Success, also for a size of 0 (as an unknown format has), which gives null pointers and an
///         allocated size of 0; PK_ErrOutOfMemory if the memory cannot be had, or if the image takes more
///         bytes than 32 signed bits can tell; all outputs are 0 then; PK_ErrFailed for a null output or a
///         negative width or height; all outputs that are given are 0 then.
PK_API PK_Result PK_AllocatePixelBuffer(PK_PixelFormat format, int32_t width, int32_t height,
                                        void** allocationBase, void** pixels, int32_t* rowBytes,
                                        uint64_t* allocatedSize) noexcept;

/// Gives an image back.
/// \param format          ignored.
/// \param allocationBase  from PK_AllocatePixelBuffer; null does nothing.
/// \param allocatedSize   from PK_AllocatePixelBuffer.
/// \return always PK_Success.
PK_API PK_Result PK_FreePixelBuffer(PK_PixelFormat format, void* allocationBase,
                                    uint64_t allocatedSize) noexcept;

/// As PK_AllocatePixelBuffer, for an image that does not outlive the operation that asks for it.
PK_API PK_Result PK_AllocateTransientPixelBuffer(PK_PixelFormat format, int32_t width, int32_t height,
                                                 void** allocationBase, void** pixels, int32_t* rowBytes,
                                                 uint64_t* allocatedSize) noexcept;

/// As PK_FreePixelBuffer, for an image of PK_AllocateTransientPixelBuffer.
PK_API PK_Result PK_FreeTransientPixelBuffer(PK_PixelFormat format, void* allocationBase,
                                             uint64_t allocatedSize) noexcept;

/// Allocates a block of bytes for the length of an operation.
/// \param size            bytes.
/// \param allocationBase  receives what PK_FreeTransientMemoryBlock wants back.
/// \param allocatedSize   receives the size that PK_FreeTransientMemoryBlock wants back, in bytes.
/// \return the block, 16-byte aligned, its contents undefined. Null for size 0, with both outputs 0; null
///         too if the memory cannot be had or an output is null, with the outputs left as they were.
PK_API void* PK_AllocateTransientMemoryBlock(uint64_t size, void** allocationBase,
                                             uint64_t* allocatedSize) noexcept;

/// Gives a block back; a null base does nothing.
PK_API void PK_FreeTransientMemoryBlock(void* allocationBase, uint64_t allocatedSize) noexcept;

/// Finds the planes of a 4:2:0 image that lies in one block: Y with rows of width padded to 128 bytes and
/// height padded to 32 rows, then U and V, each with rows of half the width padded to 128 bytes and half
/// the padded height. Touches no memory of the block. Offsets are computed in 32 bits and wrap beyond.
/// \param block     the first byte of the image; null gives the planes' offsets.
/// \param format    ignored.
/// \param width     pixels in a row of Y, not negative.
/// \param height    rows of Y, not negative.
/// \param planes    receives the first bytes of Y, U and V.
/// \param rowBytes  receives the row bytes of Y, U and V.
/// \return PK_Success; PK_ErrFailed for a null output or a negative size, with nothing written.
PK_API PK_Result PK_GetPlanarBuffers(void* block, PK_PixelFormat format, int32_t width, int32_t height,
                                     void* planes[3], int32_t rowBytes[3]) noexcept;

/// Moves the pointer of an interleaved four-channel image to the corner of a rectangle. Touches no memory
/// of the image.
/// \param buffer    first row of the image; null gives the corner's offset.
/// \param rowBytes  bytes to the next row, of either sign.
/// \param width     ignored.
/// \param height    ignored.
/// \param format    a 4:4:4 format with an alpha kind other than 0.
/// \param left      pixels to the right.
/// \param top       rows in the direction of the row bytes, whatever the origin of the format: for a format
///                  that is stored bottom-up it counts from the bottom of the picture.
/// \param clipped   receives the pointer.
/// \return PK_Success; PK_ErrBadSrcFormat for any other format (4:2:2 and RGB_444_10u among them), with
///         nothing written; PK_ErrFailed for a null output.
PK_API PK_Result PK_ClipBufferToRect(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                     PK_PixelFormat format, int32_t left, int32_t top,
                                     void** clipped) noexcept;

/// Copies a block of bytes. Blocks of 524288 bytes and more are written past the cache with non-temporal
/// stores and no fence after them: another thread may rely on the copy after any locked or fencing
/// operation, as every mutex performs.
/// \param destination  where to; the blocks must not overlap.
/// \param source       where from.
/// \param bytes        how many; 0 does nothing.
/// \return PK_Success; PK_ErrFailed for a null pointer with \p bytes above 0.
PK_API PK_Result PK_CopyMemory(void* destination, const void* source, uint64_t bytes) noexcept;

/// Turns an image upside down by swapping its rows. Only the bytes of the pixels are moved
/// (PK_PixelFormatPackedRowBytes); row padding stays. Not meant for streams, which have no rows; a number
/// that says it is one goes by its other bits.
/// \param buffer    first row.
/// \param rowBytes  bytes to the next row, of either sign.
/// \param width     pixels in a row, not negative where there are rows to swap.
/// \param height    rows; below 2 there is nothing to swap, and no memory or other argument is looked at.
/// \param format    any format.
/// \return PK_Success; with rows to swap PK_ErrFailed for a null buffer, a negative width or a row too long
///         for 32 bits; PK_ErrOutOfMemory if a row of more than 256 KiB found no scratch; nothing is
///         changed then.
PK_API PK_Result PK_FlipInPlace(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                                PK_PixelFormat format) noexcept;

} // extern "C"
