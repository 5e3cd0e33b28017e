#pragma once

// The allocations of this program, which fail on demand. Those of the system's own libraries do not count.

#include <cstdint>

namespace PKAllocations {

/// Counts the allocations of its scope, on all threads, and fails one of them. One scope at a time.
class AllocationScope {
public:
    /// \param failing  which one fails, from 1 on; 0 is none.
    explicit AllocationScope(uint64_t failing);
    ~AllocationScope();
    AllocationScope(const AllocationScope&) = delete;
    AllocationScope& operator=(const AllocationScope&) = delete;

    /// How many were asked for so far, the failed one included.
    uint64_t Count() const;
};

/// The blocks that this program holds, from malloc and from operator new.
int64_t LiveBlocks();

} // namespace PKAllocations
