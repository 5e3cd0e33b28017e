#pragma once

// Decoding of A-law (ITU-T G.711).

#include "primitives/simd/Targets.h"

#include <cstddef>
#include <cstdint>

namespace PK {

/// The bodies of one instruction set.
struct ALawKernels {
    void (*toLinear16)(const uint8_t* source, uint8_t* destination, size_t count);

    template <Target>
    static const ALawKernels& For();
};

/// A-law codes to 16-bit linear samples: the 13 bits of the law, sign included, in the highest places.
/// \return 0; -8 for a null pointer, -6 for a negative count.
int32_t ALawToLinear16(const uint8_t* source, int16_t* destination, int32_t count) noexcept;

} // namespace PK
