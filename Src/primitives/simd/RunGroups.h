#pragma once

// Runs a formula that has constants of its own along rows of elements. A formula is a structure with
//
//   kElements                            the elements of one group: what its Group function works on at once
//   kSourceElement, kDestinationElement  bytes of an element, of every source and of the destination
//   void Group(const uint8_t* source..., uint8_t* destination) const     one pointer a source
//
// Group may read what the destination holds. The tail of a row goes through the same Group on scratch copies,
// so that every element has the same arithmetic and no byte past the last is read or written. The destination
// may be a source if their elements have one size.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// The last elements of a row, with zeros behind them up to a whole group.
template <size_t kBytes>
struct PaddedGroup {
    alignas(64) uint8_t bytes[kBytes] = {};

    PaddedGroup(const uint8_t* source, size_t byteCount) { std::memcpy(bytes, source, byteCount); }
};

inline const uint8_t* Bytes(const void* source) {
    return static_cast<const uint8_t*>(source);
}

/// The formula comes by value: behind a reference its constants would be loaded anew after every store.
/// \param elements  below 1 does nothing.
/// \param sources   pointers to elements.
template <class Formula, class... Sources>
void RunGroups(const Formula formula, ptrdiff_t elements, void* destination, Sources... sources) {
    constexpr ptrdiff_t kElements = Formula::kElements;
    constexpr size_t kSourceElement = Formula::kSourceElement;
    constexpr size_t kDestinationElement = Formula::kDestinationElement;
    auto* to = static_cast<uint8_t*>(destination);
    ptrdiff_t at = 0;
    for (; at + kElements <= elements; at += kElements)
        formula.Group(Bytes(sources) + at * kSourceElement..., to + at * kDestinationElement);
    if (at >= elements) return;
    const auto rest = static_cast<size_t>(elements - at);
    to += at * kDestinationElement;
    PaddedGroup<kElements * kDestinationElement> result(to, rest * kDestinationElement);
    formula.Group(
        PaddedGroup<kElements * kSourceElement>(Bytes(sources) + at * kSourceElement, rest * kSourceElement)
            .bytes...,
        result.bytes);
    std::memcpy(to, result.bytes, rest * kDestinationElement);
}

} // namespace PK::PK_TARGET
