#pragma once

// The strokes of characters made of seven segments.

#include <cstdint>
#include <span>

namespace PK {

/// A stroke of one stroke length, one pixel thick. Its start, in stroke lengths from the character's top left
/// corner.
struct Segment {
    int32_t column;
    int32_t row;
    bool isHorizontal;
};

/// The strokes of a character in the order in which they are drawn. Digits and a to f have their own; anything
/// else, such as a minus sign, is three horizontal strokes.
std::span<const Segment* const> SegmentsOf(char character) noexcept;

} // namespace PK
