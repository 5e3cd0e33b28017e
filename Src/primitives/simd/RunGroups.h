#pragma once

// Runs a formula that has constants of its own along a row of elements. A formula is a structure with
//
//   kElements                            the elements of one group: what its Group function works on at once
//   kSourceElement, kDestinationElement  bytes of an element
//   void Group(const uint8_t* source, uint8_t* destination) const
//
// Group may read what the destination holds. The tail of a row goes through the same Group on a scratch copy,
// so that every element has the same arithmetic and no byte past the last is read or written. Source and
// destination may be the same row if their elements have one size.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// The formula comes by value: behind a reference its constants would be loaded anew after every store.
template <class Formula>
void RunGroups(const Formula formula, const uint8_t* source, uint8_t* destination, size_t elements) {
    constexpr size_t kSourceBytes = Formula::kElements * Formula::kSourceElement;
    constexpr size_t kDestinationBytes = Formula::kElements * Formula::kDestinationElement;
    for (; elements >= Formula::kElements; elements -= Formula::kElements) {
        formula.Group(source, destination);
        source += kSourceBytes;
        destination += kDestinationBytes;
    }
    if (elements == 0) return;
    alignas(64) uint8_t from[kSourceBytes] = {};
    alignas(64) uint8_t to[kDestinationBytes] = {};
    std::memcpy(from, source, elements * Formula::kSourceElement);
    std::memcpy(to, destination, elements * Formula::kDestinationElement);
    formula.Group(from, to);
    std::memcpy(destination, to, elements * Formula::kDestinationElement);
}

} // namespace PK::PK_TARGET
