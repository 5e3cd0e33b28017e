#include "composite/InkLayers.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/Buffers.h>

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
    return (format & kOrderMask) == kOrderARGB ? inks.turned : inks.ordinary;
}

InkLayer RasterLayer(const DestinationImage& picture) {
    const Ink& ink = InkOf(picture.format);
    const bool hasBytes = (picture.format & kDepthMask) == kDepth8u;
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

InkLayer PlaneLayer(void* plane, int32_t rowBytes, const DestinationImage& image, int32_t shift,
                    uint8_t ink) {
    return {static_cast<uint8_t*>(plane),
            rowBytes,
            image.width >> shift,
            image.height >> shift,
            shift,
            shift,
            1,
            {ink}};
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
    if ((format & kDepthMask) == kDepth15u) return false;
    return IsStream(format) ? Is420Planar(format) : IsRasterFormat(format & ~kOrderMask);
}

InkLayers LayersOf(const DestinationImage& image) noexcept {
    if (!IsStream(image.format))
        return {{RasterLayer(PK_IsOriginBottomLeft(image.format) ? Reversed(image) : image)}, 1};

    void* planes[3];
    int32_t rowBytes[3];
    PK_GetPlanarBuffers(image.pixels, image.format, image.width, image.height, planes, rowBytes);
    return {{PlaneLayer(planes[0], rowBytes[0], image, 0, kY),
             PlaneLayer(planes[1], rowBytes[1], image, 1, kU),
             PlaneLayer(planes[2], rowBytes[2], image, 1, kV)},
            3};
}

} // namespace PK
