#pragma once

#include <cstddef>
#include <cstdint>
#include <random>

namespace FrameBench {

/// Fills `count` samples from `low` up to, but not at, `high`. For integer samples the fraction is cut off.
template <class Sample>
void FillRandom(std::mt19937& random, Sample* samples, size_t count, float low, float high) {
    for (size_t i = 0; i < count; ++i) {
        const auto bits = static_cast<uint16_t>(random());
        samples[i] = static_cast<Sample>(low + (high - low) * static_cast<float>(bits) * 0x1p-16F);
    }
}

} // namespace FrameBench
