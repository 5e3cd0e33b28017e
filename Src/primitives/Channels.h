#pragma once

// One channel of four-channel pixels: set, set in a copy, or inverted.

#include "primitives/KernelShapes.h"

namespace PK {

/// Bits of one channel as they stand in 16 bytes of pixels: one, two or four pixels by depth.
struct ChannelPattern {
    uint32_t mask[4]; ///< the bits of the channel
    uint32_t bits[4]; ///< a value in the place of the channel; 0 elsewhere
};

/// The bodies of one instruction set. Each works on a row of bytes that begins with a pixel; source and
/// destination may be the same row.
struct ChannelKernels {
    /// Copies, with the bits of the pattern in the place of the channel.
    RowKernelWith<ChannelPattern> replace;
    /// Sets the channel of the destination to that of the source, subtracted from the pattern's value as
    /// integers that wrap around, or as floats. The other channels of the destination stay.
    RowKernelWith<ChannelPattern> invertInteger;
    RowKernelWith<ChannelPattern> invertFloat;

    static constexpr const char* kFamily = "Channel";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const ChannelKernels& For();
};

/// The pattern of a sample that is the first (0) to last (3) of its pixel.
ChannelPattern PatternOfChannel(int32_t channel, uint8_t value) noexcept;
ChannelPattern PatternOfChannel(int32_t channel, uint16_t value) noexcept;
ChannelPattern PatternOfChannel(int32_t channel, float value) noexcept;

/// Writes a value to one channel of `height` rows of `width` pixels.
/// \param channelStart  the sample of the first pixel; what lies before it is not touched, nor what lies
///                      behind the sample of the last pixel.
/// \param step          bytes from one row to the next, of either sign.
/// \return 0; -8 for a null pointer, -6 for a negative width or height.
int32_t SetChannel8u(uint8_t value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                     int32_t height) noexcept;
int32_t SetChannel16u(uint16_t value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                      int32_t height) noexcept;
int32_t SetChannel32f(float value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                      int32_t height) noexcept;

} // namespace PK
