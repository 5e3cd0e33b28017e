#pragma once

// Runs a formula that also reads the neighbours of its group, or whose source and destination rows end at
// different units. Such a formula is a structure with
//
//   kPixels              the pixels of one group: what its Group function converts at once
//   kSourceUnit, kDestinationUnit        the pixels that cannot be parted: 1, or 2 for 4:2:2, or 6 for V210
//   kSourceBytes, kDestinationBytes      of one group
//   what Neighbours has  how far it looks beside its group
//   static void Group(const uint8_t* source, uint8_t* destination)
//
// Where a neighbour lies outside the row, the first or the last of the row stands in for it. Groups at the
// ends of a row go through the same Group on a scratch copy that holds such repetitions, so that every pixel
// of a row has the same arithmetic and no byte beside the row is read or written.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

/// The part of a formula that tells its neighbours, counted in neighbour units of kPixelsEach pixels, which
/// take whole bytes.
template <int32_t kPixelsEach, int32_t kBytesEach, int32_t kBefore, int32_t kAfter>
struct Neighbours {
    static constexpr int32_t kNeighbourPixels = kPixelsEach;
    static constexpr int32_t kNeighboursBefore = kBefore, kNeighboursAfter = kAfter;
    static constexpr int32_t kBytesBefore = kBefore * kBytesEach, kBytesAfter = kAfter * kBytesEach;
    static constexpr uint8_t kPadding = 0; // fills what an incomplete group lacks of source bytes

    /// Copies one neighbour unit of a window over another.
    static void Repeat(uint8_t* window, int32_t from, int32_t to) {
        std::memcpy(window + to * kBytesEach, window + from * kBytesEach, kBytesEach);
    }
};

using NoNeighbours = Neighbours<1, 0, 0, 0>;

/// The bytes of `pixels` pixels, of which `unit` cannot be parted.
inline int64_t UnitBytes(int64_t pixels, int32_t unit, int32_t bytesPerUnit) {
    return (pixels + unit - 1) / unit * bytesPerUnit;
}

template <class Formula>
int64_t SourceBytes(int64_t pixels) {
    return UnitBytes(pixels, Formula::kSourceUnit,
                     Formula::kSourceBytes * Formula::kSourceUnit / Formula::kPixels);
}

template <class Formula>
int64_t DestinationBytes(int64_t pixels) {
    return UnitBytes(pixels, Formula::kDestinationUnit,
                     Formula::kDestinationBytes * Formula::kDestinationUnit / Formula::kPixels);
}

/// A window of the source that is complete only by repetition or padding. `pixelsLeft` counts from the
/// group's first pixel to the end of the row.
template <class Formula>
void EndGroup(const uint8_t* source, uint8_t* destination, bool isFirst, int64_t pixelsLeft) {
    constexpr int32_t kWindowBytes = Formula::kBytesBefore + Formula::kSourceBytes + Formula::kBytesAfter;
    constexpr int32_t kWindowUnits =
        Formula::kNeighboursBefore + Formula::kPixels / Formula::kNeighbourPixels + Formula::kNeighboursAfter;
    alignas(32) uint8_t window[kWindowBytes];
    std::memset(window, Formula::kPadding, sizeof window);
    const int64_t lacking = isFirst ? Formula::kBytesBefore : 0;
    const int64_t left = Formula::kBytesBefore + SourceBytes<Formula>(pixelsLeft);
    const int64_t end = left < kWindowBytes ? left : kWindowBytes;
    std::memcpy(window + lacking, source - (Formula::kBytesBefore - lacking),
                static_cast<size_t>(end - lacking));

    if (isFirst)
        for (int32_t i = Formula::kNeighboursBefore; i > 0; --i) Formula::Repeat(window, i, i - 1);
    const int64_t units = UnitBytes(pixelsLeft, Formula::kNeighbourPixels, 1);
    for (int64_t i = 0; i < Formula::kNeighboursAfter; ++i) {
        const int64_t next = Formula::kNeighboursBefore + units + i;
        if (next < kWindowUnits)
            Formula::Repeat(window, static_cast<int32_t>(next - 1), static_cast<int32_t>(next));
    }

    alignas(32) uint8_t to[Formula::kDestinationBytes];
    Formula::Group(window + Formula::kBytesBefore, to);
    const int64_t pixels = pixelsLeft < Formula::kPixels ? pixelsLeft : Formula::kPixels;
    std::memcpy(destination, to, static_cast<size_t>(DestinationBytes<Formula>(pixels)));
}

/// The pixels that must be left so that a group finds its own source bytes and those after it in the row.
template <class Formula>
constexpr int64_t PixelsOfWholeGroup() {
    constexpr int32_t kUnitBytes = Formula::kSourceBytes * Formula::kSourceUnit / Formula::kPixels;
    constexpr int32_t kUnits = (Formula::kSourceBytes + Formula::kBytesAfter + kUnitBytes - 1) / kUnitBytes;
    constexpr int32_t kPixels = (kUnits - 1) * Formula::kSourceUnit + 1;
    return kPixels > Formula::kPixels ? kPixels : Formula::kPixels;
}

template <class Formula>
void WindowRow(const void* sourceRow, void* destinationRow, int32_t width) {
    static_assert(Formula::kPixels % Formula::kSourceUnit == 0);
    static_assert(Formula::kPixels % Formula::kDestinationUnit == 0);
    static_assert(Formula::kSourceBytes >= Formula::kBytesBefore,
                  "only the first group lacks what is before");
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    for (int64_t left = width; left > 0; left -= Formula::kPixels) {
        const bool isFirst = Formula::kBytesBefore > 0 && source == sourceRow;
        if (left >= PixelsOfWholeGroup<Formula>() && !isFirst)
            Formula::Group(source, destination);
        else
            EndGroup<Formula>(source, destination, isFirst, left);
        source += Formula::kSourceBytes;
        destination += Formula::kDestinationBytes;
    }
}

} // namespace PK::PK_TARGET
