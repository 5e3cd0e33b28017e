#pragma once

// Constant fills of rectangles with pixels of 4, 8 or 16 bytes.

#include "primitives/simd/Targets.h"

#include <cstddef>
#include <cstdint>

namespace PK {

/// A pixel repeated without a gap, so that 64 bytes of it can be had from any phase.
struct FillPattern {
    static constexpr size_t kPeriod = 16; // which pixels of 4, 8 and 16 bytes divide
    uint8_t bytes[kPeriod + 64];
};

/// The bodies of one instruction set.
struct FillKernels {
    /// Fills a run of bytes that begins with the pattern's first.
    void (*run)(uint8_t* destination, size_t bytes, const FillPattern& pattern);

    static constexpr const char* kFamily = "Fill";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const FillKernels& For();
};

/// Fills `height` rows of `width` pixels.
/// \param value    the pixel.
/// \param step     bytes from one row to the next, of either sign.
/// \return 0; -8 for a null pointer, -6 for a negative width or height.
int32_t FillPixels4x8u(const uint8_t value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                       int32_t height) noexcept;
int32_t FillPixels4x16u(const uint16_t value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                        int32_t height) noexcept;
int32_t FillPixels4x32f(const float value[4], uint8_t* destination, ptrdiff_t step, int32_t width,
                        int32_t height) noexcept;

} // namespace PK
