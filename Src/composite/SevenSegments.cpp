#include "composite/SevenSegments.h"

#include <iterator>

namespace PK {
namespace {

constexpr Segment kTop = {0, 0, true};
constexpr Segment kTopRight = {1, 0, false};
constexpr Segment kBottomRight = {1, 1, false};
constexpr Segment kBottom = {0, 2, true};
constexpr Segment kBottomLeft = {0, 1, false};
constexpr Segment kTopLeft = {0, 0, false};
constexpr Segment kMiddle = {0, 1, true};

constexpr int kMostSegments = 7;

/// Ends at the first null.
struct Glyph {
    const Segment* segments[kMostSegments];
};

// The digits, then a to f. 9 has no bottom stroke and c no upper half: deliberate.
constexpr Glyph kGlyphs[] = {
    {{&kTop, &kTopRight, &kBottomRight, &kBottom, &kBottomLeft, &kTopLeft}},
    {{&kTopRight, &kBottomRight}},
    {{&kTop, &kTopRight, &kMiddle, &kBottomLeft, &kBottom}},
    {{&kTop, &kTopRight, &kMiddle, &kBottomRight, &kBottom}},
    {{&kTopRight, &kBottomRight, &kTopLeft, &kMiddle}},
    {{&kTop, &kTopLeft, &kMiddle, &kBottomRight, &kBottom}},
    {{&kTop, &kBottomRight, &kBottom, &kBottomLeft, &kTopLeft, &kMiddle}},
    {{&kTop, &kTopRight, &kBottomRight}},
    {{&kTop, &kTopRight, &kBottomRight, &kBottom, &kBottomLeft, &kTopLeft, &kMiddle}},
    {{&kTop, &kTopRight, &kBottomRight, &kTopLeft, &kMiddle}},
    {{&kTop, &kTopRight, &kBottomRight, &kBottomLeft, &kTopLeft, &kMiddle}},
    {{&kBottomRight, &kBottom, &kBottomLeft, &kTopLeft, &kMiddle}},
    {{&kBottom, &kBottomLeft, &kMiddle}},
    {{&kTopRight, &kBottomRight, &kBottom, &kBottomLeft, &kMiddle}},
    {{&kTop, &kTopLeft, &kMiddle, &kBottomLeft, &kBottom}},
    {{&kTop, &kBottomLeft, &kTopLeft, &kMiddle}},
};
constexpr Glyph kOther = {{&kTop, &kBottom, &kMiddle}};
static_assert(std::size(kGlyphs) == 16);

const Glyph& GlyphOf(char character) {
    if (character >= '0' && character <= '9') return kGlyphs[character - '0'];
    if (character >= 'a' && character <= 'f') return kGlyphs[character - 'a' + 10];
    return kOther;
}

} // namespace

std::span<const Segment* const> SegmentsOf(char character) noexcept {
    const Glyph& glyph = GlyphOf(character);
    size_t count = 0;
    while (count < kMostSegments && glyph.segments[count] != nullptr) ++count;
    return {glyph.segments, count};
}

} // namespace PK
