#pragma once

// Floats to integers of 32 and 16 bits, scaled by a power of two.

#include "primitives/KernelShapes.h"

namespace PK {

/// A power of two as a product, since neither half of it leaves the range of normal floats.
struct PowerOfTwo {
    float first, second;
};

/// The bodies of one instruction set. They round by the current mode or truncate, and saturate; NaN gives 0.
struct ConvertFloatKernels {
    RowKernelWith<PowerOfTwo> nearestToInt32, truncatedToInt32;
    RowKernelWith<PowerOfTwo> nearestToInt16, truncatedToInt16;

    static constexpr const char* kFamily = "ConvertFloat";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const ConvertFloatKernels& For();
};

inline constexpr int32_t kRoundTruncate = 0;
inline constexpr int32_t kRoundNearest = 1; // ties to even

/// destination[i] = saturate(round(source[i] x 2^-scale)), whatever rounding mode the caller has set, which
/// stays. NaN gives 0. The 32-bit form may work in place.
/// \param roundMode  kRoundNearest; anything else truncates towards zero.
/// \param scale      any number.
/// \return 0; -8 for a null pointer, -6 for a negative count.
int32_t ConvertFloatToInt32(const float* source, int32_t* destination, int32_t count, int32_t roundMode,
                            int32_t scale) noexcept;
int32_t ConvertFloatToInt16(const float* source, int16_t* destination, int32_t count, int32_t roundMode,
                            int32_t scale) noexcept;

} // namespace PK
