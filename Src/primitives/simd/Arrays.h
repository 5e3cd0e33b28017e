#pragma once

// Runs a formula of two operands along arrays. A formula is a structure with
//
//   kBytes               of one element, the same in all three arrays
//   kElements            the elements of one group
//   void Group(const uint8_t* a, const uint8_t* b, uint8_t* result) const
//
// What does not fill a group goes through the same Group on a scratch copy, so that no byte past the last
// element is read or written. The result may be one of the operands.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

template <class Formula>
void ForElements(const Formula& formula, const void* a, const void* b, void* result, int32_t count) {
    constexpr int32_t kGroupBytes = Formula::kElements * Formula::kBytes;
    const auto* first = static_cast<const uint8_t*>(a);
    const auto* second = static_cast<const uint8_t*>(b);
    auto* to = static_cast<uint8_t*>(result);
    for (; count >= Formula::kElements; count -= Formula::kElements) {
        formula.Group(first, second, to);
        first += kGroupBytes;
        second += kGroupBytes;
        to += kGroupBytes;
    }
    if (count < 1) return;
    const auto bytes = static_cast<size_t>(count * Formula::kBytes);
    alignas(64) uint8_t scratch[2][kGroupBytes] = {};
    std::memcpy(scratch[0], first, bytes);
    std::memcpy(scratch[1], second, bytes);
    formula.Group(scratch[0], scratch[1], scratch[0]);
    std::memcpy(to, scratch[0], bytes);
}

} // namespace PK::PK_TARGET
