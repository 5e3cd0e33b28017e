#include "composite/InkLayers.h"

#include "convert/RasterFormats.h"
#include "frame/Planes.h"

#include <algorithm>
#include <cstring>

namespace PK {
namespace {

constexpr uint8_t kY = 0x51, kU = 0x5a, kV = 0xef;
constexpr float kFloatY = 0.299f, kFloatU = -0.168736f, kFloatV = 0.5f;

struct Ink {
    uint8_t bytes[4];
    float floats[4];
};

/// Ink in the order of components and in the reversed or swapped one.
struct Inks {
    Ink ordinary, turned;
};

constexpr Inks kRGB = {{{0, 0, 255, 255}, {0, 0, 1, 1}}, {{255, 255, 0, 0}, {1, 1, 0, 0}}};
constexpr Inks kVUY = {{{kV, kU, kY, 255}, {kFloatV, kFloatU, kFloatY, 1}},
                       {{255, kY, kU, kV}, {1, kFloatY, kFloatU, kFloatV}}};
// The first luma of UYVY is that of U, not of Y: deliberate, callers compare with it.
constexpr Inks k422 = {{{kU, kU, kV, kY}, {kFloatU, kFloatY, kFloatV, kFloatY}},
                       {{kY, kU, kY, kV}, {kFloatY, kFloatU, kFloatY, kFloatV}}};

const Ink& InkOf(PK_PixelFormat format) {
    const Inks& inks = Is422(format) ? k422 : IsYUV(format) ? kVUY : kRGB;
    return IsOrderReversed(format) ? inks.turned : inks.ordinary;
}

InkLayer RasterLayer(const DestinationImage& picture) {
    const Ink& ink = InkOf(picture.format);
    const bool hasBytes = DepthOf(picture.format) == kDepth8u;
    InkLayer layer = {};
    layer.unitBytes = hasBytes ? sizeof ink.bytes : sizeof ink.floats;
    std::memcpy(layer.ink, hasBytes ? static_cast<const void*>(ink.bytes) : ink.floats,
                static_cast<size_t>(layer.unitBytes));
    layer.top = picture.pixels;
    layer.rowBytes = picture.rowBytes;
    // By the bytes of a row: 10-bit formats are written as floats and have fewer of these than pixels.
    layer.columns = PK_PixelFormatPackedRowBytes(picture.format, picture.width) / layer.unitBytes;
    layer.rows = picture.height;
    layer.columnShift = Is422(picture.format) ? 1 : 0;
    return layer;
}

InkLayer PlaneLayer(const Plane<uint8_t>& plane, int32_t shift, uint8_t ink) {
    return {plane.pixels, plane.rowBytes, plane.width, plane.height, shift, shift, 1, {ink}};
}

} // namespace

void InkLayer::Draw(const Stroke& stroke) const {
    const int64_t column = stroke.column >> columnShift, row = stroke.row >> rowShift;
    const int64_t length = stroke.length >> (stroke.isHorizontal ? columnShift : rowShift);
    if (column >= columns || row >= rows) return;

    const int64_t room = stroke.isHorizontal ? columns - column : rows - row;
    const ptrdiff_t step = stroke.isHorizontal ? unitBytes : rowBytes;
    uint8_t* const start = top + row * rowBytes + column * unitBytes;
    for (int64_t i = 0; i < std::min(length, room); ++i)
        std::memcpy(start + i * step, ink, static_cast<size_t>(unitBytes));
}

bool HasInk(PK_PixelFormat format) noexcept {
    if (DepthOf(format) == kDepth15u) return false;
    return IsStream(format) ? Is420Planar(format) : IsRasterFormat(format & ~kOrderMask);
}

InkLayers LayersOf(const DestinationImage& image) noexcept {
    if (!IsStream(image.format)) return {{RasterLayer(FromTop(image))}, 1};
    const auto [y, u, v] = PlanesInBlock(image.pixels, image.format, image.width, image.height);
    return {{PlaneLayer(y, 0, kY), PlaneLayer(u, 1, kU), PlaneLayer(v, 1, kV)}, 3};
}

} // namespace PK
