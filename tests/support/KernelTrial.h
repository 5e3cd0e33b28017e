#pragma once

// A kernel of the register as something that can be called: what it reads and writes at a size, and a call with constants
// that a seed draws, the same for every body. The sweep and the micro-benchmark walk the register through this.

#include "primitives/KernelRow.h"

#include <cstdint>
#include <functional>
#include <vector>

namespace PKTest {

/// Memory of a call.
struct TrialRow {
    PK::Samples samples;
    size_t bytes;
};

struct KernelTrial {
    std::vector<TrialRow> sources;
    TrialRow destination;
    std::function<void(PK::AnyKernel body, const std::vector<const uint8_t*>& sources, uint8_t* destination)>
        call;
};

/// The trial of a kernel for `size` elements, rounded down to the groups that it takes; for a kernel of areas the size
/// decides the extent in a way of its own.
KernelTrial MakeTrial(const PK::KernelRow& kernel, int32_t size, uint64_t seed);

} // namespace PKTest
