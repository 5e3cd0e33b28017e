#pragma once

// Decoding of A-law (ITU-T G.711).

#include "primitives/KernelShapes.h"

#include <cstdint>

namespace PK {

/// The bodies of one instruction set.
struct ALawKernels {
    RowKernel toLinear16;

    static constexpr const char* kFamily = "ALaw";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const ALawKernels& For();
};

/// A-law codes to 16-bit linear samples: the 13 bits of the law, sign included, in the highest places.
/// \return 0; -8 for a null pointer, -6 for a negative count.
int32_t ALawToLinear16(const uint8_t* source, int16_t* destination, int32_t count) noexcept;

} // namespace PK
