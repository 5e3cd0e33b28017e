#pragma once

// What an operation answers before it touches memory: sizes first, then pointers.

#include "frame/PixelFormat.h"

#include <algorithm>
#include <initializer_list>
#include <optional>

namespace PK {

/// What a negative size is. Each family of operations has its own answer, and callers know it.
enum class BelowZero {
    Refused,     ///< Neither width nor height may be negative.
    EmptyHeight, ///< A negative height is an image without rows, whatever its width; a negative width is refused.
    Empty,       ///< An image without pixels.
};

/// The result for an image that has no pixels or cannot have any; none where there is work to do.
constexpr std::optional<PK_Result> ResultOfSize(int32_t width, int32_t height, BelowZero rule) {
    if (rule == BelowZero::Refused && (width < 0 || height < 0)) return PK_ErrFailed;
    if (height < 1 || width == 0) return PK_Success;
    if (width < 0) return rule == BelowZero::Empty ? PK_Success : PK_ErrFailed;
    return std::nullopt;
}

constexpr bool HasNull(std::initializer_list<const void*> pointers) {
    return std::ranges::find(pointers, nullptr) != pointers.end();
}

/// The same with what pixels ask for besides: rows that can be told in 32 bits, and memory.
constexpr std::optional<PK_Result> ResultWithoutWork(int32_t width, int32_t height,
                                                     std::initializer_list<const void*> pointers,
                                                     BelowZero rule = BelowZero::EmptyHeight) {
    if (const auto result = ResultOfSize(width, height, rule)) return result;
    if (width > kMaximumWidth || HasNull(pointers)) return PK_ErrFailed;
    return std::nullopt;
}

} // namespace PK
