#include "support/Allocations.h"

#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<int> sAllocations = 0;
std::atomic<int> sLastToSucceed = std::numeric_limits<int>::max(); // by number

void* AllocateIfAllowed(size_t size) {
    return ++sAllocations <= sLastToSucceed ? std::malloc(size != 0 ? size : 1) : nullptr;
}

} // namespace

// Counted in the whole test program. Not inlined: g++ 12 would see a mismatch where it inlines only one of a pair.
[[gnu::noinline]] void* operator new(size_t size) {
    if (void* memory = AllocateIfAllowed(size)) return memory;
    throw std::bad_alloc();
}
[[gnu::noinline]] void* operator new(size_t size, const std::nothrow_t&) noexcept {
    return AllocateIfAllowed(size);
}
[[gnu::noinline]] void operator delete(void* memory) noexcept {
    std::free(memory);
}
[[gnu::noinline]] void operator delete(void* memory, size_t) noexcept {
    std::free(memory);
}

namespace PKTest {

int AllocationCount() {
    return sAllocations;
}

void AllocationLimit::SetLimit(int allocations) {
    constexpr int kNone = std::numeric_limits<int>::max();
    sLastToSucceed = allocations == kNone ? kNone : sAllocations + allocations;
}

} // namespace PKTest
