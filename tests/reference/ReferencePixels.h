#pragma once

// Samples of pixels of four channels at any depth, as the values of their codes.

#include "ReferenceSamples.h"

#include <cstddef>

namespace PKTest {

/// By the bytes of a sample.
enum class SampleDepth : size_t { k8u = 1, k15u = 2, k32f = 4 };

inline float LoadSample(SampleDepth depth, const void* row, int64_t index) {
    if (depth == SampleDepth::k8u) return reference::Get<uint8_t>(row, index);
    if (depth == SampleDepth::k15u) return reference::Get<uint16_t>(row, index);
    return reference::Get<float>(row, index);
}

/// The value is a code already.
inline void StoreSample(SampleDepth depth, void* row, int64_t index, float value) {
    if (depth == SampleDepth::k8u)
        reference::Put(row, index, static_cast<uint8_t>(value));
    else if (depth == SampleDepth::k15u)
        reference::Put(row, index, static_cast<uint16_t>(value));
    else
        reference::Put(row, index, value);
}

} // namespace PKTest
