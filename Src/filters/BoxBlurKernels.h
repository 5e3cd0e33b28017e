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

/// The largest size whose numerators, up to 255 x (255 x (2 x size - 1) + 2 x 255) + 128, stay below 2^31.
inline constexpr int32_t kLargestBundleSize = 16384;

struct BoxBlurKernels {
    using Run = void (*)(const BoxPass& pass, const uint8_t* source, uint8_t* destination);

    Run bundle; ///< for sizes up to kLargestBundleSize
    Run line;   ///< a single line, for any size

    static constexpr const char* kFamily = "BoxBlur";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const BoxBlurKernels& For(); // BoxBlur.kernels.cpp
};

} // namespace PK
