#pragma once

// Memory that ends (or begins) at an inaccessible page, so that a read or write past it is a crash.

#include <cstddef>
#include <cstdint>
#include <new>
#include <sys/mman.h>
#include <unistd.h>

namespace PKTest {

/// The side on which the bytes touch an inaccessible page exactly. Both sides have one.
enum class Guard { kBefore, kAfter };

class GuardedRows {
public:
    GuardedRows(size_t bytes, Guard guard) : fSize(bytes) {
        const size_t page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
        const size_t inner = (bytes + page - 1) / page * page;
        fMappedSize = inner + 2 * page;
        fMapped = mmap(nullptr, fMappedSize, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        if (fMapped == MAP_FAILED) throw std::bad_alloc();
        uint8_t* first = static_cast<uint8_t*>(fMapped) + page;
        if (inner != 0 && mprotect(first, inner, PROT_READ | PROT_WRITE) != 0) throw std::bad_alloc();
        fBytes = guard == Guard::kBefore ? first : first + inner - bytes;
    }
    ~GuardedRows() { munmap(fMapped, fMappedSize); }
    GuardedRows(const GuardedRows&) = delete;
    GuardedRows& operator=(const GuardedRows&) = delete;

    uint8_t* Bytes() const { return fBytes; }
    size_t Size() const { return fSize; }

private:
    size_t fSize;
    size_t fMappedSize;
    void* fMapped;
    uint8_t* fBytes;
};

} // namespace PKTest
