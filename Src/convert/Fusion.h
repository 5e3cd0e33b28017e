#pragma once

// Neighbouring kernels of a chain that run as one pass over the row, with the same numbers.

#include "convert/Kernel.h"

namespace PK {

/// The fused body for the first kernels of a run, the longest that there is. `consumed` tells how many
/// kernels it stands for. Null, with `consumed` unwritten, if none begins here or the capability flags allow
/// none at this moment.
RowKernel ChooseFusedBody(const Kernel* kernels, int32_t count, int32_t& consumed) noexcept;

} // namespace PK
