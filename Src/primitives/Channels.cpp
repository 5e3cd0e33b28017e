#include "primitives/Channels.h"

#include "primitives/Dispatch.h"
#include "primitives/Status.h"

#include <cstring>

namespace PK {

namespace {

constexpr int32_t kChannels = 4;

template <class Sample>
ChannelPattern Pattern(int32_t channel, Sample value) {
    ChannelPattern pattern = {};
    auto* mask = reinterpret_cast<uint8_t*>(pattern.mask);
    auto* bits = reinterpret_cast<uint8_t*>(pattern.bits);
    const size_t first = static_cast<size_t>(channel) * sizeof value;
    for (size_t at = first; at < sizeof pattern.mask; at += kChannels * sizeof value) {
        std::memset(mask + at, 0xff, sizeof value);
        std::memcpy(bits + at, &value, sizeof value);
    }
    return pattern;
}

template <class Sample>
int32_t SetChannel(Sample value, uint8_t* channelStart, ptrdiff_t step, int32_t width, int32_t height) {
    if (channelStart == nullptr) return kStatusNullPointer;
    if (width < 0 || height < 0) return kStatusBadSize;
    if (width == 0) return kStatusOk;
    const ChannelKernels& kernels = Best<ChannelKernels>();
    const ChannelPattern pattern = Pattern(0, value);
    const size_t bytes = (static_cast<size_t>(width - 1) * kChannels + 1) * sizeof value;
    for (ptrdiff_t row = 0; row < height; ++row) {
        uint8_t* samples = channelStart + row * step;
        kernels.replace(samples, samples, bytes, pattern);
    }
    return kStatusOk;
}

} // namespace

ChannelPattern PatternOfChannel(int32_t channel, uint8_t value) noexcept {
    return Pattern(channel, value);
}

ChannelPattern PatternOfChannel(int32_t channel, uint16_t value) noexcept {
    return Pattern(channel, value);
}

ChannelPattern PatternOfChannel(int32_t channel, float value) noexcept {
    return Pattern(channel, value);
}

int32_t SetChannel8u(uint8_t value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                     int32_t height) noexcept {
    return SetChannel(value, channelStart, step, width, height);
}

int32_t SetChannel16u(uint16_t value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                      int32_t height) noexcept {
    return SetChannel(value, channelStart, step, width, height);
}

int32_t SetChannel32f(float value, uint8_t* channelStart, ptrdiff_t step, int32_t width,
                      int32_t height) noexcept {
    return SetChannel(value, channelStart, step, width, height);
}

} // namespace PK
