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
constexpr int64_t UnitBytes(int64_t pixels, int32_t unit, int32_t bytesPerUnit) {
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

/// Fills the neighbours that a window lacks with the first and the last of the row. `pixelsLeft` counts from
/// the group's first pixel to the end of the row.
template <class Formula>
void RepeatEnds(uint8_t* window, bool isFirst, int64_t pixelsLeft) {
    constexpr int32_t kGroupUnits = Formula::kPixels / Formula::kNeighbourPixels;
    constexpr int32_t kUnits = Formula::kNeighboursBefore + kGroupUnits + Formula::kNeighboursAfter;
    if (isFirst)
        for (int32_t i = Formula::kNeighboursBefore; i > 0; --i) Formula::Repeat(window, i, i - 1);
    const int64_t end = Formula::kNeighboursBefore + UnitBytes(pixelsLeft, Formula::kNeighbourPixels, 1);
    for (int64_t i = end; i < kUnits && i < end + Formula::kNeighboursAfter; ++i)
        Formula::Repeat(window, static_cast<int32_t>(i - 1), static_cast<int32_t>(i));
}

/// Where a group stands in its rows, and the pixels from there to their end.
template <class Formula>
struct Position {
    const uint8_t* source;
    uint8_t* destination;
    int64_t pixelsLeft;

    void Advance() {
        source += Formula::kSourceBytes;
        destination += Formula::kDestinationBytes;
        pixelsLeft -= Formula::kPixels;
    }
};

/// A group whose window is complete only by repetition or padding.
template <class Formula>
void EndGroup(Position<Formula> at, bool isFirst) {
    alignas(32) uint8_t window[Formula::kBytesBefore + Formula::kSourceBytes + Formula::kBytesAfter];
    std::memset(window, Formula::kPadding, sizeof window);
    const int64_t before = isFirst ? 0 : Formula::kBytesBefore;
    const int64_t left = SourceBytes<Formula>(at.pixelsLeft);
    const int64_t wanted = Formula::kSourceBytes + Formula::kBytesAfter;
    std::memcpy(window + Formula::kBytesBefore - before, at.source - before,
                static_cast<size_t>(before + (left < wanted ? left : wanted)));
    RepeatEnds<Formula>(window, isFirst, at.pixelsLeft);

    alignas(32) uint8_t to[Formula::kDestinationBytes];
    Formula::Group(window + Formula::kBytesBefore, to);
    const int64_t pixels = at.pixelsLeft < Formula::kPixels ? at.pixelsLeft : Formula::kPixels;
    std::memcpy(at.destination, to, static_cast<size_t>(DestinationBytes<Formula>(pixels)));
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
    Position<Formula> at = {static_cast<const uint8_t*>(sourceRow), static_cast<uint8_t*>(destinationRow),
                            width};
    if (Formula::kBytesBefore > 0 && width > 0) {
        EndGroup(at, true);
        at.Advance();
    }
    for (; at.pixelsLeft >= PixelsOfWholeGroup<Formula>(); at.Advance())
        Formula::Group(at.source, at.destination);
    for (; at.pixelsLeft > 0; at.Advance()) EndGroup(at, false);
}

} // namespace PK::PK_TARGET
