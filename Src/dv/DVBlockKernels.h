#pragma once

// What the encoders of DV do with the coefficients of blocks of 8 x 8. Kernel sources include this header.

#include "primitives/simd/Targets.h"

#include <cstdint>

namespace PK {

/// Factors for the 64 coefficients of a block.
using DVBlockFactors = float[64];

/// The levels of a block, in the order of the scan.
struct DVLevels {
    alignas(64) uint8_t level[64]; ///< Magnitudes; of one above 255, that.
    uint64_t nonZero;              ///< A bit for each that is not 0, the lowest for the first.
    bool areTooLarge;              ///< One is above 255.
};

/// How levels are made: |coefficient| x factor + roundUp, cut to an integer; 0 where that is below `least`, which is at
/// least 1.
struct DVQuantisation {
    const DVBlockFactors& factors;
    float roundUp, least;
};

/// Sums of differences between the samples of a block, over its first six lines: with the next line, and with the next of
/// the same field.
struct DVLineDifferences {
    uint32_t ofFrame, ofField;
};

struct DVBlockKernels {
    DVLineDifferences (*lineDifferences)(const int16_t* samples);
    /// The greatest of all magnitudes.
    uint32_t (*greatest)(const int16_t* block);
    /// Every value becomes sign x (|value| x factor + roundUp), cut to an integer and saturated.
    void (*scale)(const DVBlockFactors& factors, float roundUp, int16_t* block);
    /// The sum of log2(1 + |value| x factor) in 2^-15, linear between powers of two.
    uint32_t (*sumOfLogarithms)(const int16_t* block, float factor);
    /// The coefficients are in the order of the scan.
    void (*quantise)(const int16_t* coefficients, const DVQuantisation& quantisation, DVLevels& levels);

    static constexpr const char* kFamily = "DVBlock";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DVBlockKernels& For();
};

} // namespace PK
