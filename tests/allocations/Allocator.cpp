#include "allocations/Allocator.h"

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <new>

namespace {

std::atomic<bool> sIsCounting = false;
std::atomic<uint64_t> sCount = 0, sFailing = 0;
std::atomic<int64_t> sLive = 0;

bool Fails() {
    if (!sIsCounting || ++sCount != sFailing) return false;
    errno = ENOMEM;
    return true;
}

void* Kept(void* block) {
    if (block != nullptr) ++sLive;
    return block;
}

} // namespace

// The linker leads all calls of `f` to `__wrap_f`, and those of `__real_f` to `f` itself.
extern "C" {
void* __real_malloc(size_t size);
void* __real_calloc(size_t count, size_t size);
void* __real_realloc(void* block, size_t size);
void* __real_aligned_alloc(size_t alignment, size_t size);
int __real_posix_memalign(void** block, size_t alignment, size_t size);
void __real_free(void* block);

void* __wrap_malloc(size_t size) {
    return Fails() ? nullptr : Kept(__real_malloc(size));
}
void* __wrap_calloc(size_t count, size_t size) {
    return Fails() ? nullptr : Kept(__real_calloc(count, size));
}
void* __wrap_realloc(void* block, size_t size) {
    if (Fails()) return nullptr;
    return block == nullptr ? Kept(__real_realloc(block, size)) : __real_realloc(block, size);
}
void* __wrap_aligned_alloc(size_t alignment, size_t size) {
    return Fails() ? nullptr : Kept(__real_aligned_alloc(alignment, size));
}
int __wrap_posix_memalign(void** block, size_t alignment, size_t size) {
    if (Fails()) return ENOMEM;
    const int error = __real_posix_memalign(block, alignment, size);
    if (error == 0) ++sLive;
    return error;
}
void __wrap_free(void* block) {
    if (block != nullptr) --sLive;
    __real_free(block);
}
}

// The other forms of the standard library call these. Not inlined: g++ 12 would see a mismatch where it inlines only one
// of a pair.
[[gnu::noinline]] void* operator new(size_t size) {
    if (void* block = Fails() ? nullptr : Kept(__real_malloc(size != 0 ? size : 1))) return block;
    throw std::bad_alloc();
}
[[gnu::noinline]] void* operator new(size_t size, std::align_val_t alignment) {
    const auto unit = static_cast<size_t>(alignment);
    const size_t rounded = size == 0 ? unit : (size + unit - 1) / unit * unit;
    if (void* block = Fails() ? nullptr : Kept(__real_aligned_alloc(unit, rounded))) return block;
    throw std::bad_alloc();
}
[[gnu::noinline]] void operator delete(void* block) noexcept {
    __wrap_free(block);
}
[[gnu::noinline]] void operator delete(void* block, size_t) noexcept {
    __wrap_free(block);
}
[[gnu::noinline]] void operator delete(void* block, std::align_val_t) noexcept {
    __wrap_free(block);
}
[[gnu::noinline]] void operator delete(void* block, size_t, std::align_val_t) noexcept {
    __wrap_free(block);
}

namespace PKAllocations {

AllocationScope::AllocationScope(uint64_t failing) {
    sCount = 0;
    sFailing = failing;
    sIsCounting = true;
}

AllocationScope::~AllocationScope() {
    sIsCounting = false;
}

uint64_t AllocationScope::Count() const {
    return sCount;
}

int64_t LiveBlocks() {
    return sLive;
}

} // namespace PKAllocations
