// Turns an image upside down in its own memory.

#include "frame/RowScratch.h"

#include <PixelKiln/Buffers.h>

namespace PK {
namespace {

void SwapRows(uint8_t* a, uint8_t* b, uint8_t* scratch, uint64_t bytes) {
    PK_CopyMemory(scratch, a, bytes);
    PK_CopyMemory(a, b, bytes);
    PK_CopyMemory(b, scratch, bytes);
}

} // namespace
} // namespace PK

PK_Result PK_FlipInPlace(void* buffer, int32_t rowBytes, int32_t width, int32_t height,
                         PK_PixelFormat format) noexcept {
    if (height <= 1) return PK_Success;
    if (width < 0) return PK_ErrFailed;
    const int32_t rowLength = PK_PixelFormatPackedRowBytes(format, width);
    if (rowLength == 0) return PK_Success;
    if (buffer == nullptr || rowLength < 0) return PK_ErrFailed;

    const uint64_t bytes = static_cast<uint64_t>(rowLength);
    return PK::WithRowScratch(bytes, [&](uint8_t* scratch) -> PK_Result {
        uint8_t* upper = static_cast<uint8_t*>(buffer);
        uint8_t* lower = upper + int64_t{rowBytes} * (height - 1);
        for (int32_t i = 0; i < height / 2; ++i, upper += rowBytes, lower -= rowBytes)
            PK::SwapRows(upper, lower, scratch, bytes);
        return PK_Success;
    });
}
