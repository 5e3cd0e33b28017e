// Buffers, blocks, and the helpers for memory.

#include "allocations/Call.h"

#include <PixelKiln/Buffers.h>

#include <cstring>

namespace {

using namespace PKAllocations;

constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
constexpr Memory kPointers = TakesNone("adds to pointers");

using Allocate = decltype(&PK_AllocatePixelBuffer);
using Free = decltype(&PK_FreePixelBuffer);

/// A refusal leaves all outputs 0, whatever they were.
PK_Result TakeAndFree(Allocate allocate, Free free, uint8_t* block) {
    uint8_t mark = 0;
    void *base = &mark, *pixels = &mark;
    int32_t rowBytes = 1;
    uint64_t size = 1;
    const PK_Result result = allocate(kFormat, kWidth, kHeight, &base, &pixels, &rowBytes, &size);
    if (result != PK_Success)
        return base == nullptr && pixels == nullptr && rowBytes == 0 && size == 0 ? result : PK_ErrFailed;
    std::memset(pixels, 1, static_cast<size_t>(rowBytes) * kHeight);
    std::memcpy(block, pixels, 4);
    return free(kFormat, base, size);
}

/// A refusal leaves the outputs as they were.
PK_Result TakeAndFreeBlock(uint8_t* block) {
    uint8_t mark = 0;
    void* base = &mark;
    uint64_t size = 77;
    void* const bytes = PK_AllocateTransientMemoryBlock(100000, &base, &size);
    if (bytes == nullptr) return base == &mark && size == 77 ? PK_ErrOutOfMemory : PK_ErrFailed;
    std::memset(bytes, 1, 100000);
    std::memcpy(block, bytes, 4);
    PK_FreeTransientMemoryBlock(base, size);
    return PK_Success;
}

void AddBuffers(Calls& calls) {
    const std::vector<uint8_t> none(4);
    calls.push_back(
        {{"PK_AllocatePixelBuffer", "PK_FreePixelBuffer"},
         TakesOrRefuses("the image"),
         none,
         [](uint8_t* block) { return TakeAndFree(PK_AllocatePixelBuffer, PK_FreePixelBuffer, block); }});
    calls.push_back({{"PK_AllocateTransientPixelBuffer", "PK_FreeTransientPixelBuffer"},
                     TakesOrRefuses("the image"),
                     none,
                     [](uint8_t* block) {
                         return TakeAndFree(PK_AllocateTransientPixelBuffer, PK_FreeTransientPixelBuffer,
                                            block);
                     }});
    calls.push_back({{"PK_AllocateTransientMemoryBlock", "PK_FreeTransientMemoryBlock"},
                     TakesOrRefuses("the block"),
                     none,
                     TakeAndFreeBlock});
}

void AddMemory(Calls& calls) {
    calls.push_back({{"PK_GetPlanarBuffers"}, kPointers, std::vector<uint8_t>(24), [](uint8_t* block) {
                         void* planes[3];
                         int32_t rowBytes[3];
                         const PK_Result result = PK_GetPlanarBuffers(
                             nullptr, PK_PixelFormat_YUV_420_MPEG2_FRAME, kWidth, kHeight, planes, rowBytes);
                         std::memcpy(block, planes, sizeof planes);
                         return result;
                     }});
    calls.push_back({{"PK_ClipBufferToRect"}, kPointers, std::vector<uint8_t>(8), [](uint8_t* block) {
                         void* clipped = nullptr;
                         const PK_Result result =
                             PK_ClipBufferToRect(nullptr, 1024, 256, 256, kFormat, 3, 5, &clipped);
                         std::memcpy(block, &clipped, sizeof clipped);
                         return result;
                     }});
    calls.push_back({{"PK_CopyMemory"},
                     TakesNone("copies through registers"),
                     std::vector<uint8_t>(size_t{3} << 20),
                     [source = Content(size_t{3} << 20)](uint8_t* block) {
                         return PK_CopyMemory(block, source.data(), source.size());
                     }});
    const Image image(kFormat);
    calls.push_back({{"PK_FlipInPlace"},
                     TakesOrRefuses("a row above 256 KiB"),
                     image.bytes,
                     [rowBytes = image.rowBytes](uint8_t* block) {
                         return PK_FlipInPlace(block, rowBytes, kWidth, kHeight, kFormat);
                     }});
}

const Family sBuffers(AddBuffers), sMemory(AddMemory);

} // namespace
