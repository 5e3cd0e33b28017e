#pragma once

// Runs a formula over a row. A formula is a structure with
//
//   kPixels              the pixels of one group: what its Group function converts at once
//   kUnit                the pixels that cannot be parted: 1, or 2 for 4:2:2, or 6 for V210
//   kSourceBytes, kDestinationBytes      of one group
//   static void Group(const uint8_t* source, uint8_t* destination)
//
// The tail of a row goes through the same Group on a scratch copy, so that every pixel of a row has the same
// arithmetic and no byte past the last unit is read or written.
//
// Kernel sources keep their formulas in an unnamed namespace, so that two sources may use the same name.

#include "primitives/simd/Target.h"

namespace PK::PK_TARGET {

template <class Formula>
void RunTail(const uint8_t* source, uint8_t* destination, int32_t pixels) {
    const int32_t units = (pixels + Formula::kUnit - 1) / Formula::kUnit;
    alignas(32) uint8_t from[Formula::kSourceBytes] = {};
    alignas(32) uint8_t to[Formula::kDestinationBytes];
    std::memcpy(from, source,
                static_cast<size_t>(units * (Formula::kSourceBytes * Formula::kUnit / Formula::kPixels)));
    Formula::Group(from, to);
    std::memcpy(
        destination, to,
        static_cast<size_t>(units * (Formula::kDestinationBytes * Formula::kUnit / Formula::kPixels)));
}

template <class Formula>
void Row(const void* sourceRow, void* destinationRow, int32_t width) {
    static_assert(Formula::kPixels % Formula::kUnit == 0);
    const auto* source = static_cast<const uint8_t*>(sourceRow);
    auto* destination = static_cast<uint8_t*>(destinationRow);
    for (; width >= Formula::kPixels; width -= Formula::kPixels) {
        Formula::Group(source, destination);
        source += Formula::kSourceBytes;
        destination += Formula::kDestinationBytes;
    }
    if (width > 0) RunTail<Formula>(source, destination, width);
}

/// A formula on interleaved samples, four a unit: a pixel, or a pair of pixels for 4:2:2. The group is
/// kVectors times kLanes samples.
template <int kSourceSample, int kDestinationSample, int kUnitPixels = 1, int kVectors = 1>
struct SampleGroup {
    static constexpr int32_t kPixels = kVectors * kLanes / 4 * kUnitPixels;
    static constexpr int32_t kUnit = kUnitPixels;
    static constexpr int32_t kSourceBytes = kVectors * kLanes * kSourceSample;
    static constexpr int32_t kDestinationBytes = kVectors * kLanes * kDestinationSample;
};

/// A formula on kLanes pixels, one vector a channel or one lane a pixel.
template <int kSourcePixel, int kDestinationPixel>
struct PixelGroup {
    static constexpr int32_t kPixels = kLanes;
    static constexpr int32_t kUnit = 1;
    static constexpr int32_t kSourceBytes = kLanes * kSourcePixel;
    static constexpr int32_t kDestinationBytes = kLanes * kDestinationPixel;
};

} // namespace PK::PK_TARGET
