#pragma once

// Neighbouring kernels of a chain that run as one pass over the row, with the same numbers.

#include "convert/Kernel.h"

#include <span>

namespace PK {

/// One fused kernel and the run of kernels that it stands for.
struct Fusion {
    Kernel fused;
    std::span<const Kernel> parts;
};

/// All of them; of two that begin alike, the longer stands first.
std::span<const Fusion> Fusions() noexcept;

/// The fused body for the first kernels of a run, the longest that there is. `consumed` tells how many
/// kernels it stands for. Null, with `consumed` unwritten, if none begins here or the capability flags allow
/// none at this moment.
RowKernel ChooseFusedBody(const Kernel* kernels, int32_t count, int32_t& consumed) noexcept;

} // namespace PK
