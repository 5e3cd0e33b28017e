#pragma once

// Scope objects for memory that does not outlive an operation: released on every path out.

#include <PixelKiln/Buffers.h>

namespace PK {

/// A transient block of bytes, 16-byte aligned.
class TransientBlock {
public:
    explicit TransientBlock(uint64_t bytes) noexcept
        : fBytes(PK_AllocateTransientMemoryBlock(bytes, &fBase, &fAllocatedSize)) {}
    ~TransientBlock() { PK_FreeTransientMemoryBlock(fBase, fAllocatedSize); }
    TransientBlock(const TransientBlock&) = delete;
    TransientBlock& operator=(const TransientBlock&) = delete;

    /// Null for size 0 and if the memory could not be had.
    uint8_t* Bytes() const noexcept { return static_cast<uint8_t*>(fBytes); }

private:
    void* fBase = nullptr;
    uint64_t fAllocatedSize = 0;
    void* fBytes;
};

/// A transient image.
class TransientPixelBuffer {
public:
    TransientPixelBuffer(PK_PixelFormat format, int32_t width, int32_t height) noexcept
        : fFormat(format), fResult(PK_AllocateTransientPixelBuffer(format, width, height, &fBase, &fPixels,
                                                                   &fRowBytes, &fAllocatedSize)) {}
    ~TransientPixelBuffer() { PK_FreeTransientPixelBuffer(fFormat, fBase, fAllocatedSize); }
    TransientPixelBuffer(const TransientPixelBuffer&) = delete;
    TransientPixelBuffer& operator=(const TransientPixelBuffer&) = delete;

    /// Outcome of the allocation; an image of size 0 succeeds and has null pixels.
    PK_Result Result() const noexcept { return fResult; }
    uint8_t* Pixels() const noexcept { return static_cast<uint8_t*>(fPixels); }
    int32_t RowBytes() const noexcept { return fRowBytes; }

private:
    PK_PixelFormat fFormat;
    void* fBase = nullptr;
    void* fPixels = nullptr;
    int32_t fRowBytes = 0;
    uint64_t fAllocatedSize = 0;
    PK_Result fResult;
};

} // namespace PK
