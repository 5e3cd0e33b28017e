// PK_PrintNum: a number burnt into an image in seven-segment digits.

#include <PixelKiln/Overlay.h>

#include "composite/InkLayers.h"
#include "composite/SevenSegments.h"

#include <algorithm>
#include <cstdio>

namespace PK {
namespace {

/// The text of a number: 11 characters at most, as of -2147483648.
struct NumberText {
    char characters[12];
    int32_t length;

    NumberText(int32_t number, bool decimal)
        : length(std::snprintf(characters, sizeof characters, decimal ? "%d" : "%x", number)) {}
};

/// Where characters stand, in pixels.
struct TextLayout {
    int32_t cell; // from one character to the next
    int32_t left, top;
    int32_t stroke; // length of a stroke
};

constexpr bool IsFraction(float value) {
    return value >= 0.0f && value <= 1.0f;
}

/// The product as a whole number. In float, as callers know it; that may round up to just above an extent that
/// float cannot tell.
int32_t Part(float fraction, int32_t extent) {
    const auto part = static_cast<int64_t>(fraction * static_cast<float>(extent));
    return static_cast<int32_t>(std::min<int64_t>(part, extent));
}

constexpr int32_t Even(int32_t value) {
    return value & ~1;
}

TextLayout LayOut(int32_t width, int32_t height, int32_t length, float size, PK_Point position) {
    constexpr int32_t kMargin = 4;
    TextLayout layout = {};
    layout.left = std::max(Part(position.x, width), kMargin);
    layout.top = std::max(Part(position.y, height), kMargin);
    layout.cell = Even(Part(size, width));
    const int64_t wanted = int64_t{layout.cell} * (length + 1) + layout.left;
    if (width < wanted) layout.cell = (width - layout.left) / (length + 1);
    if (height < layout.top + int64_t{2} * layout.cell) layout.cell = (height - layout.top) / 2;
    layout.stroke = Even(static_cast<int32_t>(int64_t{layout.cell} * 3 / 4));
    return layout;
}

void DrawText(const InkLayers& layers, const NumberText& text, const TextLayout& layout) {
    for (int32_t i = 0; i < text.length; ++i) {
        const int32_t left = layout.left + i * layout.cell;
        for (const Segment* segment : SegmentsOf(text.characters[i])) {
            layers.Draw({left + segment->column * layout.stroke, layout.top + segment->row * layout.stroke,
                         layout.stroke, segment->isHorizontal});
        }
    }
}

/// Whether the image has an extent that can be addressed: rows as long as 32 bits tell, planes in a block of
/// such a size.
bool IsAddressable(const DestinationImage& image) {
    if (image.width > kMaximumWidth) return false;
    return !IsStream(image.format) ||
           PK_PixelFormatSize(image.format, image.width, image.height) <= INT32_MAX;
}

PK_Result PrintNum(const DestinationImage& image, int32_t number, float size, PK_Point position,
                   bool decimal) {
    if (!HasInk(image.format)) return PK_ErrBadDstFormat;
    if (image.width < 0) return PK_ErrBadPosX;
    if (image.height < 0) return PK_ErrBadPosY;
    if (!IsFraction(size) || !IsFraction(position.x) || !IsFraction(position.y)) return PK_ErrFailed;
    if (image.width == 0 || image.height == 0) return PK_Success;
    if (image.pixels == nullptr || !IsAddressable(image)) return PK_ErrFailed;

    const NumberText text(number, decimal);
    DrawText(LayersOf(image), text, LayOut(image.width, image.height, text.length, size, position));
    return PK_Success;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_PrintNum(void* buffer, int32_t rowBytes, PK_PixelFormat format, int32_t width, int32_t height,
                      int32_t number, float size, PK_Point position, bool decimal) noexcept {
    return PrintNum({static_cast<uint8_t*>(buffer), rowBytes, format, width, height}, number, size, position,
                    decimal);
}
