// Buffers and blocks, taken and given back in any order, each filled to its end with a byte of its own; and
// the planes of an image in one block.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"

#include "frame/PixelFormat.h"

#include <PixelKiln/Buffers.h>

#include <algorithm>
#include <cstring>
#include <optional>
#include <utility>
#include <vector>

namespace {

using namespace PKFuzz;

/// Memory up to here is taken and filled; beyond, only what must be refused is asked for.
constexpr int64_t kAffordable = int64_t{1} << 22;
constexpr int64_t kRefused = int64_t{1} << 40;

enum class Kind { Lasting, Transient, Block };

struct Held {
    Kind kind = Kind::Lasting;
    PK_PixelFormat format = 0;
    void* base = nullptr;
    void* usable = nullptr;
    uint64_t allocatedSize = 0;
    size_t usableSize = 0;
    uint8_t content = 0;
};

/// Fills what was given from end to end. The base itself belongs to the allocator.
void Occupy(Held& held, uint8_t content) {
    const auto* first = static_cast<const uint8_t*>(held.usable);
    const auto* base = static_cast<const uint8_t*>(held.base);
    Check(reinterpret_cast<uintptr_t>(first) % 16 == 0, "memory is aligned to 16 bytes");
    Check(first >= base && first + held.usableSize <= base + held.allocatedSize,
          "the usable part lies within the allocation");
    held.content = content;
    std::memset(held.usable, content, held.usableSize);
}

void GiveBack(const Held& held) {
    const auto* first = static_cast<const uint8_t*>(held.usable);
    Check(std::all_of(first, first + held.usableSize, [&](uint8_t byte) { return byte == held.content; }),
          "nobody else writes to memory that is held");
    if (held.kind == Kind::Lasting)
        Check(PK_FreePixelBuffer(held.format, held.base, held.allocatedSize) == PK_Success,
              "freeing succeeds");
    else if (held.kind == Kind::Transient)
        Check(PK_FreeTransientPixelBuffer(held.format, held.base, held.allocatedSize) == PK_Success,
              "freeing succeeds");
    else
        PK_FreeTransientMemoryBlock(held.base, held.allocatedSize);
}

/// About the bytes that an image takes, nothing wrapped around: never fewer, and at most nine times as many.
double BytesAtMost(PK_PixelFormat format, int32_t width, int32_t height) {
    if (width < 0 || height < 0) return 0;
    if (PK::IsStream(format)) return static_cast<double>(PK_PixelFormatSize(format, width, height));
    constexpr double kMostBytesOfPixel = 16;
    constexpr double kMostPadding = 128;
    return (width * kMostBytesOfPixel + kMostPadding) * height;
}

/// Whether the image is small enough to be filled, or so large that it must be refused.
bool IsWorthAsking(PK_PixelFormat format, int32_t width, int32_t height) {
    const double bytes = BytesAtMost(format, width, height);
    return bytes <= double{kAffordable} || bytes >= double{kRefused};
}

/// The length of a side: small, or any.
int32_t DrawSide(ByteStream& stream) {
    return stream.BetweenOrAny(0, 400, 4);
}

std::optional<Held> TakeImage(ByteStream& stream, uint32_t state) {
    const Kind kind = stream.Bool() ? Kind::Lasting : Kind::Transient;
    const PK_PixelFormat format = DrawFormat(stream);
    const int32_t width = DrawSide(stream);
    const int32_t height = DrawSide(stream);
    if (!IsWorthAsking(format, width, height)) return std::nullopt;
    SetCall("an image of " + Words(format) + ", " + std::to_string(width) + " x " + std::to_string(height));

    int place = 0;
    Held held{.kind = kind, .format = format, .base = &place, .usable = &place, .allocatedSize = 1};
    int32_t rowBytes = -1;
    const auto allocate = kind == Kind::Lasting ? PK_AllocatePixelBuffer : PK_AllocateTransientPixelBuffer;
    const PK_Result result = CallIn(state, [&] {
        return allocate(format, width, height, &held.base, &held.usable, &rowBytes, &held.allocatedSize);
    });
    CheckIsNamed(result);
    if (result == PK_Success) Check(rowBytes == PK_PixelFormatRowBytes(format, width), "row bytes are told");
    if (result != PK_Success || PK_PixelFormatSize(format, width, height) == 0) {
        Check(!held.base && !held.usable && held.allocatedSize == 0, "without memory the outputs are 0");
        Check(result != PK_Success || width >= 0, "a negative width has no buffer");
        return std::nullopt;
    }
    held.usableSize = static_cast<size_t>(PK_PixelFormatSize(format, width, height));
    Occupy(held, stream.Byte());
    return held;
}

std::optional<Held> TakeBlock(ByteStream& stream, uint32_t state) {
    const uint64_t size = stream.OneIn(8) ? uint64_t{kRefused} | stream.U64() : stream.Below(100000);
    SetCall("a block of " + std::to_string(size) + " bytes");
    Held held{.kind = Kind::Block, .usableSize = size};
    held.usable =
        CallIn(state, [&] { return PK_AllocateTransientMemoryBlock(size, &held.base, &held.allocatedSize); });
    Check((held.usable != nullptr) == (size != 0 && size < uint64_t{kRefused}),
          "only sizes that can be had are");
    if (held.usable == nullptr) {
        Check(!held.base && held.allocatedSize == 0, "without memory the outputs are 0");
        return std::nullopt;
    }
    Occupy(held, stream.Byte());
    return held;
}

void FindPlanes(ByteStream& stream, uint32_t state) {
    constexpr PK_PixelFormat kPlanar = PK_PixelFormat_YUV_420_MPEG2_FRAME;
    const int32_t width = DrawSide(stream);
    const int32_t height = DrawSide(stream);
    SetCall("PK_GetPlanarBuffers of " + std::to_string(width) + " x " + std::to_string(height));
    uint8_t byte = 0;
    uint8_t* const block = stream.OneIn(8) ? nullptr : &byte; // never touched
    void* planes[3] = {nullptr, nullptr, nullptr};
    int32_t rowBytes[3] = {-1, -1, -1};
    const PK_PixelFormat format = DrawFormat(stream);
    const PK_Result result =
        CallIn(state, [&] { return PK_GetPlanarBuffers(block, format, width, height, planes, rowBytes); });
    Check(result == (width < 0 || height < 0 ? PK_ErrFailed : PK_Success), "only negative sizes fail");
    if (result != PK_Success) {
        Check(!planes[0] && !planes[1] && !planes[2] && rowBytes[0] == -1, "a failure writes nothing");
        return;
    }
    const int64_t size = PK_PixelFormatSize(kPlanar, width, height);
    if (size > kAffordable) return; // there, offsets wrap
    const auto offset = [&](int plane) {
        return static_cast<int64_t>(reinterpret_cast<uintptr_t>(planes[plane]) -
                                    reinterpret_cast<uintptr_t>(block));
    };
    const int64_t rows = (int64_t{height} + 31) / 32 * 32;
    Check(offset(0) == 0 && offset(1) == rowBytes[0] * rows, "U lies behind Y");
    Check(offset(2) == offset(1) + rowBytes[1] * rows / 2, "V lies behind U");
    Check(offset(2) + rowBytes[2] * rows / 2 == size, "the planes take what PK_PixelFormatSize tells");
}

void FuzzBuffers(ByteStream& stream) {
    const uint32_t state = DrawFloatState(stream);
    std::vector<Held> all;
    for (int32_t steps = stream.Between(1, 16); steps > 0; --steps) {
        std::optional<Held> taken;
        switch (stream.Below(5)) {
        case 0:
        case 1:
            taken = TakeImage(stream, state);
            break;
        case 2:
            taken = TakeBlock(stream, state);
            break;
        case 3:
            FindPlanes(stream, state);
            break;
        default:
            if (all.empty()) break;
            std::swap(all[stream.Below(static_cast<uint32_t>(all.size()))], all.back());
            GiveBack(all.back());
            all.pop_back();
        }
        if (taken) all.push_back(*taken);
    }
    for (const Held& held : all) GiveBack(held);
    Check(PK_FreePixelBuffer(0, nullptr, stream.U64()) == PK_Success, "giving back nothing succeeds");
}

const Family sFamily('b', "buffers", FuzzBuffers);

} // namespace
