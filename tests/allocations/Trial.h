#pragma once

// One call with one failing allocation, in a process of its own, so that nothing is there that an earlier call has made:
// kept blocks, tables, bound kernels.

#include "allocations/Call.h"

#include <cstdint>
#include <string>

namespace PKAllocations {

struct Trial {
    uint64_t allocations; ///< that the call asked for, the failed one included
    int64_t blocksLeft;   ///< after it and one more without a failure
    std::string wrong;    ///< empty if the call did what its header tells
};

/// \param failing  which allocation fails, from 1 on; 0 is none.
Trial Try(const Call& call, uint64_t failing);

} // namespace PKAllocations
