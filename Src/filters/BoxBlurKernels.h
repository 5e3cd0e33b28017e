#pragma once

// The box filter along lines of four-byte pixels.

#include "primitives/simd/Targets.h"

namespace PK {

/// One run of the box over a line. The window of a pixel is the 2 x size - 1 pixels around it, and one edge pixel
/// on each side that counts weight/255 of a whole one.
struct BoxPass {
    int32_t length;   ///< of the line; at least size + 2
    int32_t size;     ///< at least 1
    int32_t weight;   ///< 0 to 254, or 255 where the caller rounds upward
    bool renormalise; ///< divide by what is in the window, not by what a full one has
    uint32_t bytes;   ///< all bits set in the bytes of a pixel that are filtered; the others are copied
};

/// Lines of a bundle lie side by side: their pixels 0, then their pixels 1, and so on.
inline constexpr int32_t kBundleLines = 16;
inline constexpr int32_t kBundleStep = 4 * kBundleLines;

/// Whether 32 bits with a sign hold what a bundle forms of white pixels: 256 times the sum of a window, on the way to
/// 255 times, and the numerator with edge pixels of weight 255.
constexpr bool BoxFits32Bits(int64_t size) {
    const int64_t sum = 255 * (2 * size - 1);
    return 256 * sum <= INT32_MAX && 255 * (sum + 2 * 255) + 128 <= INT32_MAX;
}

inline constexpr int32_t kLargestBundleSize = 16448;
static_assert(BoxFits32Bits(kLargestBundleSize) && !BoxFits32Bits(kLargestBundleSize + 1));

struct BoxBlurKernels {
    using Run = void (*)(const BoxPass& pass, const uint8_t* source, uint8_t* destination);

    Run bundle; ///< for sizes that fit 32 bits: up to kLargestBundleSize
    Run line;   ///< a single line, for any size

    static constexpr const char* kFamily = "BoxBlur";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const BoxBlurKernels& For(); // BoxBlur.kernels.cpp
};

} // namespace PK
