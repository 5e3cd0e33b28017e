#pragma once

// How often this program has called operator new, on all threads, and what comes of it when there is no memory.

#include <limits>

namespace PKTest {

int AllocationCount();

/// While it lives, so many more calls of operator new get memory, and none after them.
class AllocationLimit {
public:
    explicit AllocationLimit(int allocations) { SetLimit(allocations); }
    ~AllocationLimit() { SetLimit(std::numeric_limits<int>::max()); }
    AllocationLimit(const AllocationLimit&) = delete;
    AllocationLimit& operator=(const AllocationLimit&) = delete;

private:
    static void SetLimit(int allocations);
};

} // namespace PKTest
