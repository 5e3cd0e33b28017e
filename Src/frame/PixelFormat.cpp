// Sizes and origin of pixel formats.

#include "frame/PixelFormat.h"

#include "frame/DebugSwitches.h"
#include "frame/Wrap32.h"

#include <PixelKiln/PixelFormat.h>

namespace PK {
namespace {

// Bytes of a frame of stream kinds 1 to 8; kind 0 has none.
constexpr int32_t kDVFrameBytes[kStreamLastDV + 1] = {0,      120000, 144000, 240000, 288000,
                                                      480000, 576000, 240000, 288000};

// The planes as PK_GetPlanarBuffers lays them out, U and V of half the padded height each.
int64_t PlanarSize(int64_t width, int64_t height) {
    const int64_t blocks = ((width + 127) >> 7) + ((width / 2 + 127) >> 7);
    return 128 * blocks * ((height + 31) & ~int64_t{31});
}

} // namespace

} // namespace PK

using namespace PK;

int32_t PK_PixelFormatRowBytes(PK_PixelFormat format, int32_t width) noexcept {
    if (IsStream(format)) return 0;
    const RowLayout layout = LayoutOfRow(format);
    const int32_t groups = WrapAdd(width, layout.groupPixels - 1) / layout.groupPixels;
    return WrapRoundUp(WrapMultiply(groups, layout.groupBytes), layout.alignment);
}

int32_t PK_PixelFormatPackedRowBytes(PK_PixelFormat format, int32_t width) noexcept {
    const RowUnit unit = UnitOfRow(format);
    return WrapMultiply(WrapAdd(width, unit.pixels - 1) / unit.pixels, unit.bytes);
}

int64_t PK_PixelFormatSize(PK_PixelFormat format, int32_t width, int32_t height) noexcept {
    const uint32_t kind = StreamKind(format);
    if (kind == 0) return WrapMultiply(PK_PixelFormatRowBytes(format, width), height);
    if (kind <= kStreamLastDV) return kDVFrameBytes[kind];
    if (kind <= kStreamLast420) return PlanarSize(width, height);
    return 0;
}

bool PK_IsOriginTopLeft(PK_PixelFormat format) noexcept {
    return sAllOriginsTopLeft != 0 || !IsPacked4444(format);
}

bool PK_IsOriginBottomLeft(PK_PixelFormat format) noexcept {
    return !PK_IsOriginTopLeft(format);
}
