// Buffers and blocks of few sizes, so that threads take over what others gave back: nobody may find another's
// marks in memory of its own.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <atomic>
#include <cstring>
#include <vector>

namespace {

using namespace PKStress;

uint8_t NextMark() {
    static std::atomic<uint8_t> sMark = 0;
    return ++sMark;
}

bool KeepsItsMark(uint8_t* bytes, uint64_t count) {
    const uint8_t mark = NextMark();
    std::memset(bytes, mark, count);
    return std::all_of(bytes, bytes + count, [mark](uint8_t byte) { return byte == mark; });
}

using Allocate = decltype(&PK_AllocatePixelBuffer);
using Free = decltype(&PK_FreePixelBuffer);

bool TakeAndFree(Allocate allocate, Free free, int32_t width) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    constexpr int32_t kHeight = 16;
    void *base, *pixels;
    int32_t rowBytes;
    uint64_t size;
    if (allocate(kFormat, width, kHeight, &base, &pixels, &rowBytes, &size) != PK_Success) return false;
    const uint64_t bytes = static_cast<uint64_t>(rowBytes) * kHeight;
    const bool isRight = KeepsItsMark(static_cast<uint8_t*>(pixels), bytes);
    return free(kFormat, base, size) == PK_Success && isRight;
}

std::function<bool()> PreparePixelBuffers() {
    return [] {
        return TakeAndFree(PK_AllocatePixelBuffer, PK_FreePixelBuffer, 64) &&
               TakeAndFree(PK_AllocateTransientPixelBuffer, PK_FreeTransientPixelBuffer, 200);
    };
}

std::function<bool()> PrepareMemoryBlocks() {
    return [] {
        constexpr uint64_t kBytes = 20000;
        void* base = nullptr;
        uint64_t size = 0;
        auto* bytes = static_cast<uint8_t*>(PK_AllocateTransientMemoryBlock(kBytes, &base, &size));
        if (bytes == nullptr) return false;
        const std::vector<uint8_t> source(kBytes, NextMark());
        const bool isRight = KeepsItsMark(bytes, kBytes) &&
                             PK_CopyMemory(bytes, source.data(), kBytes) == PK_Success &&
                             std::memcmp(bytes, source.data(), kBytes) == 0;
        PK_FreeTransientMemoryBlock(base, size);
        return isRight;
    };
}

Call Flip(int32_t width, int32_t height, PKTest::Random& random) {
    constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_8u;
    return {RandomImage(kFormat, width, height, random), [=](uint8_t* image) {
                return PK_FlipInPlace(image, PK_PixelFormatRowBytes(kFormat, width), width, height, kFormat);
            }};
}

std::function<bool()> PrepareFlip() {
    PKTest::Random random(14);
    return Repeat({Flip(97, 21, random), Flip(70001, 2, random)}); // the second with scratch of the recycler
}

const Operation sPixelBuffers("pixel-buffers", PreparePixelBuffers);
const Operation sMemoryBlocks("memory-blocks", PrepareMemoryBlocks);
const Operation sFlip("flip-in-place", PrepareFlip);

} // namespace
