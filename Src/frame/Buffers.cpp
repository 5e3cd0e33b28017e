// Pixel buffers, transient memory and the addressing of rectangles and planes.

#include "frame/PixelFormat.h"
#include "frame/RowScratch.h"
#include "frame/SharedRandom.h"
#include "frame/Wrap32.h"

#include <PixelKiln/Buffers.h>

#include "zebcore/memory.h"

#include <cstdlib>
#include <limits>

using zebcore::utility::MemoryRecycler;

namespace PK {
namespace {

constexpr int kStaggerSteps = 64;
constexpr uint64_t kStaggerBytes = 128;
constexpr uint64_t kBlockAlignment = 16;
constexpr uint64_t kMaximalOverhead = (kStaggerSteps - 1) * kStaggerBytes + kBlockAlignment - 1;

struct Block {
    void* base = nullptr;
    void* usable = nullptr;
    uint64_t allocatedSize = 0;
};

// The usable part starts at a random distance from the base, so that blocks of equal size do not all begin at
// the same address modulo 8192. All null if there is no memory.
Block AllocateStaggered(uint64_t bytes) {
    if (bytes > std::numeric_limits<uint64_t>::max() - kMaximalOverhead) return {};
    const uint64_t offset = static_cast<uint64_t>(SharedRandom() % kStaggerSteps) * kStaggerBytes;
    const uint64_t overhead = offset + kBlockAlignment - 1;
    Block block;
    block.base = MemoryRecycler::Allocate(bytes + overhead, &block.allocatedSize);
    if (block.base == nullptr) return {};
    const uintptr_t usable = reinterpret_cast<uintptr_t>(block.base) + overhead;
    block.usable = reinterpret_cast<void*>(usable & ~(kBlockAlignment - 1));
    return block;
}

// The address so many bytes further on, also from a null pointer, on which C++ defines no arithmetic.
void* Offset(void* base, int64_t bytes) {
    return reinterpret_cast<void*>(reinterpret_cast<uintptr_t>(base) + static_cast<uintptr_t>(bytes));
}

void Recycle(void* base, uint64_t allocatedSize) {
    if (base != nullptr) MemoryRecycler::Recycle(base, allocatedSize);
}

// Whether a raster image of this size is as large as 32 bits say, nothing having wrapped around on the way.
bool SizeFits32Bits(PK_PixelFormat format, int64_t width, int64_t height) {
    const RowLayout layout = LayoutOfRow(format);
    const int64_t groups = (width + layout.groupPixels - 1) / layout.groupPixels;
    const int64_t alignment = layout.alignment;
    const int64_t rowBytes = (groups * layout.groupBytes + alignment - 1) & ~(alignment - 1);
    constexpr int64_t kLargest = std::numeric_limits<int32_t>::max();
    return rowBytes <= kLargest && rowBytes * height <= kLargest;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_AllocatePixelBuffer(PK_PixelFormat format, int32_t width, int32_t height, void** allocationBase,
                                 void** pixels, int32_t* rowBytes, uint64_t* allocatedSize) noexcept {
    if (allocationBase != nullptr) *allocationBase = nullptr;
    if (pixels != nullptr) *pixels = nullptr;
    if (rowBytes != nullptr) *rowBytes = 0;
    if (allocatedSize != nullptr) *allocatedSize = 0;
    if (!allocationBase || !pixels || !rowBytes || !allocatedSize) return PK_ErrFailed;
    if (width < 0 || height < 0) return PK_ErrFailed;
    if (!IsStream(format) && !SizeFits32Bits(format, width, height)) return PK_ErrOutOfMemory;

    const int64_t bytes = PK_PixelFormatSize(format, width, height);
    Block block;
    if (bytes != 0) {
        block = AllocateStaggered(static_cast<uint64_t>(bytes));
        if (block.base == nullptr) return PK_ErrOutOfMemory;
    }
    *allocationBase = block.base;
    *pixels = block.usable;
    *rowBytes = PK_PixelFormatRowBytes(format, width);
    *allocatedSize = block.allocatedSize;
    return PK_Success;
}

PK_Result PK_FreePixelBuffer(PK_PixelFormat, void* allocationBase, uint64_t allocatedSize) noexcept {
    Recycle(allocationBase, allocatedSize);
    return PK_Success;
}

PK_Result PK_AllocateTransientPixelBuffer(PK_PixelFormat format, int32_t width, int32_t height,
                                          void** allocationBase, void** pixels, int32_t* rowBytes,
                                          uint64_t* allocatedSize) noexcept {
    return PK_AllocatePixelBuffer(format, width, height, allocationBase, pixels, rowBytes, allocatedSize);
}

PK_Result PK_FreeTransientPixelBuffer(PK_PixelFormat format, void* allocationBase,
                                      uint64_t allocatedSize) noexcept {
    return PK_FreePixelBuffer(format, allocationBase, allocatedSize);
}

void* PK_AllocateTransientMemoryBlock(uint64_t size, void** allocationBase,
                                      uint64_t* allocatedSize) noexcept {
    if (!allocationBase || !allocatedSize) return nullptr;
    Block block;
    if (size != 0) {
        block = AllocateStaggered(size);
        if (block.base == nullptr) return nullptr;
    }
    *allocationBase = block.base;
    *allocatedSize = block.allocatedSize;
    return block.usable;
}

void PK_FreeTransientMemoryBlock(void* allocationBase, uint64_t allocatedSize) noexcept {
    Recycle(allocationBase, allocatedSize);
}

PK_Result PK_GetPlanarBuffers(void* block, PK_PixelFormat, int32_t width, int32_t height, void* planes[3],
                              int32_t rowBytes[3]) noexcept {
    if (!planes || !rowBytes || width < 0 || height < 0) return PK_ErrFailed;
    const int32_t rows = WrapRoundUp(height, 32);
    const int32_t lumaRowBytes = WrapRoundUp(width, 128);
    const int32_t chromaRowBytes = WrapRoundUp(width / 2, 128);

    planes[0] = block;
    planes[1] = Offset(planes[0], WrapMultiply(lumaRowBytes, rows));
    planes[2] = Offset(planes[1], WrapMultiply(rows, chromaRowBytes) / 2);
    rowBytes[0] = lumaRowBytes;
    rowBytes[1] = chromaRowBytes;
    rowBytes[2] = chromaRowBytes;
    return PK_Success;
}

PK_Result PK_ClipBufferToRect(void* buffer, int32_t rowBytes, int32_t, int32_t, PK_PixelFormat format,
                              int32_t left, int32_t top, void** clipped) noexcept {
    const int32_t pixelBytes = BytesPerPixel(format);
    if (pixelBytes == 0 || !IsPacked4444(format)) return PK_ErrBadSrcFormat;
    if (!clipped) return PK_ErrFailed;
    *clipped = Offset(buffer, int64_t{rowBytes} * top + int64_t{left} * pixelBytes);
    return PK_Success;
}
