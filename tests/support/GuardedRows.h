#pragma once

// Memory that ends (or begins) at an inaccessible page, so that a read or write past it is a crash.

#include <cstddef>
#include <cstdint>
#include <map>
#include <new>
#include <sys/mman.h>
#include <unistd.h>
#include <vector>

namespace PKTest {

/// Whole pages with an inaccessible one on each side. A thread keeps those that it has given back: tests ask for the same few
/// sizes hundreds of thousands of times.
class GuardedPages {
public:
    static uint8_t* Take(size_t bytes) {
        std::vector<uint8_t*>& kept = Kept()[bytes];
        if (kept.empty()) return Map(bytes);
        uint8_t* const pages = kept.back();
        kept.pop_back();
        return pages;
    }
    static void GiveBack(uint8_t* pages, size_t bytes) {
        constexpr size_t kGreatestKept = size_t{1} << 20;
        if (bytes <= kGreatestKept)
            Kept()[bytes].push_back(pages);
        else
            munmap(pages - PageSize(), bytes + 2 * PageSize());
    }
    static size_t PageSize() { return static_cast<size_t>(sysconf(_SC_PAGESIZE)); }

private:
    static std::map<size_t, std::vector<uint8_t*>>& Kept() {
        static thread_local std::map<size_t, std::vector<uint8_t*>> kept;
        return kept;
    }
    static uint8_t* Map(size_t bytes) {
        const size_t page = PageSize();
        void* const mapped = mmap(nullptr, bytes + 2 * page, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        if (mapped == MAP_FAILED) throw std::bad_alloc();
        uint8_t* const first = static_cast<uint8_t*>(mapped) + page;
        if (bytes != 0 && mprotect(first, bytes, PROT_READ | PROT_WRITE) != 0) throw std::bad_alloc();
        return first;
    }
};

/// The side on which the bytes touch an inaccessible page exactly. Both sides have one.
enum class Guard { kBefore, kAfter };

class GuardedRows {
public:
    GuardedRows(size_t bytes, Guard guard)
        : fSize(bytes), fPagesSize((bytes + GuardedPages::PageSize() - 1) / GuardedPages::PageSize() *
                                   GuardedPages::PageSize()),
          fPages(GuardedPages::Take(fPagesSize)),
          fBytes(guard == Guard::kBefore ? fPages : fPages + fPagesSize - bytes) {}
    ~GuardedRows() { GuardedPages::GiveBack(fPages, fPagesSize); }
    GuardedRows(const GuardedRows&) = delete;
    GuardedRows& operator=(const GuardedRows&) = delete;

    uint8_t* Bytes() const { return fBytes; }
    size_t Size() const { return fSize; }

private:
    size_t fSize, fPagesSize;
    uint8_t *fPages, *fBytes;
};

} // namespace PKTest
