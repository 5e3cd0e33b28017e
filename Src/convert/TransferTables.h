#pragma once

// The tables of the transfer function at 8 bits, which are data. Kernel sources include this header.

#include <cstdint>

namespace PK {

/// Where a linear sample's 8-bit code changes, found without a search. The samples from 2^-22 to 1 are parted
/// into cells by the upper 16 bits of the float: exponent and seven bits of the fraction. A cell holds at
/// most one threshold.
inline constexpr int kFirstGammaCell = 0x3480; // 2^-22, below the first threshold
inline constexpr int kGammaCells = 0x3f80 - kFirstGammaCell;

struct TransferTables {
    float linear[256];     ///< (code / 255)^2.4
    float thresholds[255]; ///< ((k + 0.5) / 255)^2.4: at or above it, the code is at least k + 1.

    /// 65536 x the count of thresholds below the cell, and if a threshold stands in the cell, 65536 minus its
    /// lower 16 bits: adding the lower 16 bits of a sample carries into the count if it reaches the
    /// threshold.
    uint32_t gammaCells[kGammaCells];
};

extern const TransferTables kTransferTables;

} // namespace PK
