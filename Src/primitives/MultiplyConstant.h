#pragma once

// Four-channel 8-bit pixels multiplied by a constant a channel.

#include "primitives/KernelShapes.h"

namespace PK {

/// What a row is multiplied by. Two channels share a lane, in its low and its high 16 bits.
struct ChannelFactors {
    uint32_t even; ///< channels 0 and 2, each factor from 0 to 256
    uint32_t odd;  ///< channels 1 and 3
    uint32_t unit; ///< 2^(16 - scale) in both halves, for scales from 1 to 16
};

/// The bodies of one instruction set. Source and destination may be the same row.
struct MultiplyConstantKernels {
    RowKernelWith<ChannelFactors> unscaled; ///< the products saturated
    RowKernelWith<ChannelFactors>
        scaled; ///< the products divided by 2^scale, to the nearest, ties to even, and saturated

    static constexpr const char* kFamily = "MultiplyConstant";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const MultiplyConstantKernels& For();
};

/// destination = saturate(round(source x value x 2^-scale)), channel by channel; to the nearest, ties to
/// even. Works in place.
/// \param value    the constants of the four channels.
/// \param scale    any number.
/// \return 0; -8 for a null pointer, -6 for a negative width or height.
int32_t MultiplyConstant(const uint8_t* source, ptrdiff_t sourceStep, const uint8_t value[4],
                         uint8_t* destination, ptrdiff_t destinationStep, int32_t width, int32_t height,
                         int32_t scale) noexcept;

} // namespace PK
