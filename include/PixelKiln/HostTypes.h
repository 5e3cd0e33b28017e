#pragma once

/// \file
/// The host's media vocabulary as far as it crosses the interface.

#include <cstdint>

namespace zebmediatypes {

/// The host's identifier of a pixel format. Two identifiers are equal when both words are.
struct PixelFormat {
    uint32_t words[2];

    friend constexpr bool operator==(const PixelFormat&, const PixelFormat&) = default;
};

} // namespace zebmediatypes
