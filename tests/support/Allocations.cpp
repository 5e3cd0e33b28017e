#include "support/Allocations.h"

#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<int> sAllocations = 0;

} // namespace

// Counted in the whole test program. Not inlined: g++ 12 would see a mismatch where it inlines only one of a pair.
[[gnu::noinline]] void* operator new(size_t size) {
    ++sAllocations;
    if (void* memory = std::malloc(size != 0 ? size : 1)) return memory;
    throw std::bad_alloc();
}
[[gnu::noinline]] void* operator new(size_t size, const std::nothrow_t&) noexcept {
    ++sAllocations;
    return std::malloc(size != 0 ? size : 1);
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

} // namespace PKTest
