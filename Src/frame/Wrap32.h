#pragma once

// Arithmetic in 32 bits that wraps around on purpose: sizes of images are computed so, and hosts rely on the
// numbers.

#include <cstdint>

namespace PK {

constexpr int32_t WrapAdd(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) + static_cast<uint32_t>(b));
}

constexpr int32_t WrapMultiply(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) * static_cast<uint32_t>(b));
}

/// \param multiple  a power of two.
constexpr int32_t WrapRoundUp(int32_t value, int32_t multiple) {
    return WrapAdd(value, multiple - 1) & ~(multiple - 1);
}

} // namespace PK
