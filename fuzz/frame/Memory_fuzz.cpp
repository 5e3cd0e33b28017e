// Copies, flips and the addressing of rectangles, in memory that ends where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"

#include <PixelKiln/Buffers.h>

#include <algorithm>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr size_t kLargestRow = size_t{1} << 20;

uint32_t DrawByteCount(ByteStream& stream) {
    constexpr int32_t kStreamedFrom = 0x80000;
    if (stream.OneIn(16))
        return static_cast<uint32_t>(stream.Between(kStreamedFrom - 70, kStreamedFrom + 200));
    return stream.Below(stream.Bool() ? 400 : 5000);
}

void CopyBytes(ByteStream& stream, uint32_t state) {
    const uint32_t bytes = DrawByteCount(stream);
    SetCall("PK_CopyMemory of " + std::to_string(bytes) + " bytes");
    const SourceImage source({bytes, 1, 0}, stream);
    const ImageMemory destination({bytes, 1, 0}, stream);

    const bool isNull = stream.OneIn(16);
    const PK_Result result = CallIn(state, [&] {
        return PK_CopyMemory(destination.Pixels(), isNull ? nullptr : source.Pixels(), bytes);
    });
    CheckResult(isNull && bytes > 0 ? PK_ErrFailed : PK_Success, result);
    source.CheckStays();
    destination.CheckPadding();
    if (!isNull) CheckSame(source.Content(), destination.Rows(), "the copy is the original");
}

std::vector<uint8_t> RowsInReverse(const std::vector<uint8_t>& rows, size_t rowLength) {
    std::vector<uint8_t> reverse;
    for (size_t end = rows.size(); end >= rowLength && rowLength > 0; end -= rowLength)
        reverse.insert(reverse.end(), rows.begin() + static_cast<ptrdiff_t>(end - rowLength),
                       rows.begin() + static_cast<ptrdiff_t>(end));
    return reverse;
}

void FlipRows(ByteStream& stream, uint32_t state) {
    const PK_PixelFormat format = DrawFormat(stream);
    const int32_t width = stream.OneIn(16) ? stream.Between(16000, 17000) : stream.Between(0, 300);
    const size_t height = stream.Below(9);
    const size_t rowLength = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
    const RowsLayout layout = DrawLayout(stream, rowLength, height);
    if (rowLength > kLargestRow) return;
    SetCall("PK_FlipInPlace of " + Words(format) + ", " + std::to_string(width) + " x " +
            std::to_string(height) + ", row bytes " + std::to_string(layout.rowBytes));

    const SourceImage image(layout, stream);
    const auto flip = [&] {
        return PK_FlipInPlace(image.Pixels(), layout.rowBytes, width, static_cast<int32_t>(height), format);
    };
    Check(CallIn(state, flip) == PK_Success, "an ordinary image is flipped");
    CheckSame(RowsInReverse(image.Content(), rowLength), image.Rows(), "the rows are in reverse");
    Check(CallIn(state, flip) == PK_Success, "a flipped image is flipped");
    image.CheckStays("two flips change nothing");
}

/// Sizes that the flip must refuse, or do nothing for, without a look at memory.
void FlipNothing(ByteStream& stream, uint32_t state) {
    const int32_t height = stream.Between(-2, 4);
    const int32_t width = height < 2 ? stream.AnyI32() : -1 - stream.Between(0, INT32_MAX - 1);
    const PK_PixelFormat format = DrawFormat(stream);
    const int32_t rowBytes = stream.AnyI32();
    SetCall("PK_FlipInPlace of " + Words(format) + ", " + std::to_string(width) + " x " +
            std::to_string(height));
    ImageMemory image({}, stream);
    const PK_Result result =
        CallIn(state, [&] { return PK_FlipInPlace(image.Pixels(), rowBytes, width, height, format); });
    Check(result == (height < 2 ? PK_Success : PK_ErrFailed), "only rows of negative width are refused");
}

void ClipToRectangle(ByteStream& stream, uint32_t state) {
    const PK_PixelFormat format = DrawFormat(stream);
    const int32_t width = stream.Between(1, 2000);
    const int32_t height = stream.Between(1, 2000);
    const int32_t left = stream.Between(0, width);
    const int32_t top = stream.Between(0, height);
    const int32_t rowBytes = stream.Bool() ? stream.Between(0, 40000) : -stream.Between(0, 40000);
    SetCall("PK_ClipBufferToRect of " + Words(format) + " at " + std::to_string(left) + ", " +
            std::to_string(top) + ", row bytes " + std::to_string(rowBytes));
    uint8_t byte = 0;
    uint8_t* const buffer = stream.OneIn(8) ? nullptr : &byte; // never touched
    void* clipped = nullptr;
    const PK_Result result = CallIn(state, [&] {
        return PK_ClipBufferToRect(buffer, rowBytes, width, height, format, left, top, &clipped);
    });
    Check(result == PK_Success || result == PK_ErrBadSrcFormat, "only the format can be wrong");
    if (result != PK_Success) {
        Check(clipped == nullptr, "a failure writes nothing");
        return;
    }
    const int32_t pixelBytes = PK_PixelFormatPackedRowBytes(format, 1);
    const int64_t offset = int64_t{rowBytes} * top + int64_t{pixelBytes} * left;
    Check(reinterpret_cast<uintptr_t>(clipped) ==
              reinterpret_cast<uintptr_t>(buffer) + static_cast<uintptr_t>(offset),
          "the corner lies rows and pixels further on");
}

void FuzzMemory(ByteStream& stream) {
    const uint32_t state = DrawFloatState(stream);
    switch (stream.Below(8)) {
    case 0:
    case 1:
    case 2:
        return CopyBytes(stream, state);
    case 3:
        return ClipToRectangle(stream, state);
    case 4:
        return FlipNothing(stream, state);
    default:
        return FlipRows(stream, state);
    }
}

const Family sFamily('m', "memory", FuzzMemory);

} // namespace
