#pragma once

// What colour spaces calculate at first need and then keep, in const operations that many threads may run on one
// object. Every thread calculates the same values; they are written once, under the lock of first uses, and published by
// the flag or number that readers look at first. Copying an object takes the lock, too.

#include "primitives/FirstUse.h"

#include <PixelKiln/ColorSpace.h>

#include <algorithm>
#include <atomic>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <mutex>

namespace PK {

/// Not by value: what has come out as not-a-number is not written again either.
inline bool AreSameBits(const float* a, const float* b, size_t count) {
    return std::equal(a, a + count, b, [](float x, float y) {
        return std::bit_cast<uint32_t>(x) == std::bit_cast<uint32_t>(y);
    });
}

/// The matrix, calculated if it is not valid yet.
template <class Calculate>
const CSMatrix& CachedMatrix(CSMatrix& matrix, bool& isValid, Calculate calculate) {
    const std::atomic_ref<bool> published(isValid);
    if (!published.load(std::memory_order_acquire)) {
        const CSMatrix value = calculate();
        const std::scoped_lock lock(FirstUseMutex());
        if (!published.load(std::memory_order_relaxed)) {
            matrix = value;
            published.store(true, std::memory_order_release);
        }
    }
    return matrix;
}

/// The three floats, calculated if the first is 0 by `calculate`, which fills three floats.
template <class Calculate>
const float* CachedCoeffs(float* coeffs, Calculate calculate) {
    const std::atomic_ref<float> published(coeffs[0]);
    if (published.load(std::memory_order_acquire) == 0.0f) {
        float values[3];
        calculate(values);
        const std::scoped_lock lock(FirstUseMutex());
        if (!AreSameBits(values, coeffs, 3)) {
            coeffs[1] = values[1];
            coeffs[2] = values[2];
            published.store(values[0], std::memory_order_release);
        }
    }
    return coeffs;
}

} // namespace PK
