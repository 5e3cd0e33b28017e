#pragma once

// Weighted sums of up to ten rows of float pixels. Kernel sources include this header.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// Ten rows are read while their sum is written once.
inline constexpr int32_t kMostSummands = 10;

/// A row and what each of its samples is multiplied by.
struct WeightedRow {
    const uint8_t* pixels;
    float weight;
};

struct SumKernels {
    /// Sums as many rows as the member takes, each times its weight, from the first to the last:
    /// ((weight 0 x row 0 + weight 1 x row 1) + weight 2 x row 2) + ... The destination may be one of them.
    /// \param width  pixels of four floats.
    using Sum = void (*)(const WeightedRow* rows, void* destination, int32_t width);

    Sum store[kMostSummands]; ///< Of one row to ten; writes the sum.
    Sum add[kMostSummands];   ///< Adds the sum to what the destination holds: destination + sum.

    static constexpr const char* kFamily = "Sum";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const SumKernels& For();
};

} // namespace PK
