#include "zebcore/RecyclerPool.h"

#include <bit>
#include <cstdlib>
#include <new>

namespace zebcore::utility {

// Class 4d + s holds blocks of (4 + s) / 4 x 2^d x kSmallest bytes.
uint64_t RecyclerPool::SizeOfClass(size_t index) noexcept {
    const uint64_t steps = (uint64_t{1} << kStepBits) + (index & ((1 << kStepBits) - 1));
    return (steps << (kSmallestBits - kStepBits)) << (index >> kStepBits);
}

// The smallest class that holds size bytes; size is at most kLargest.
size_t RecyclerPool::ClassIndex(uint64_t size) noexcept {
    if (size <= kSmallest) return 0;
    const int doubling = static_cast<int>(std::bit_width(size - 1)) - 1 - kSmallestBits;
    const int stepShift = doubling + kSmallestBits - kStepBits;
    const uint64_t stepsAbove = ((size - 1) >> stepShift) - (uint64_t{1} << kStepBits) + 1;
    return (static_cast<size_t>(doubling) << kStepBits) + static_cast<size_t>(stepsAbove);
}

uint64_t RecyclerPool::ClassSize(uint64_t size) noexcept {
    return size > kLargest ? size : SizeOfClass(ClassIndex(size));
}

void* RecyclerPool::Allocate(uint64_t size, uint64_t* actualSize) noexcept {
    if (size >= kRefusedFrom) return nullptr;
    const uint64_t blockSize = ClassSize(size);
    if (size <= kLargest) {
        const std::lock_guard lock(fMutex);
        SizeClass& sizeClass = fClasses[ClassIndex(size)];
        sizeClass.lastUse = ++fClock;
        if (Kept* block = sizeClass.first) {
            sizeClass.first = block->next;
            fKept -= blockSize;
            *actualSize = blockSize;
            return block;
        }
    }
    void* block = std::malloc(blockSize);
    if (block != nullptr) *actualSize = blockSize;
    return block;
}

void RecyclerPool::Recycle(void* block, uint64_t size) noexcept {
    if (block == nullptr) return;
    Kept* surplus = nullptr;
    {
        const std::lock_guard lock(fMutex);
        if (size <= kLargest && size <= fCap && size == ClassSize(size)) {
            surplus = Evict(fCap - size);
            SizeClass& sizeClass = fClasses[ClassIndex(size)];
            sizeClass.lastUse = ++fClock;
            sizeClass.first = new (block) Kept{sizeClass.first};
            fKept += size;
            block = nullptr;
        }
    }
    FreeList(surplus);
    std::free(block);
}

void RecyclerPool::SetCap(uint64_t cap) noexcept {
    Kept* surplus = nullptr;
    {
        const std::lock_guard lock(fMutex);
        fCap = cap;
        surplus = Evict(cap);
    }
    FreeList(surplus);
}

uint64_t RecyclerPool::KeptBytes() const noexcept {
    const std::lock_guard lock(fMutex);
    return fKept;
}

// Takes blocks out until no more than bytesToKeep are left, from the class that was used longest ago onwards.
// The caller frees them once the lock is off.
RecyclerPool::Kept* RecyclerPool::Evict(uint64_t bytesToKeep) noexcept {
    Kept* evicted = nullptr;
    while (fKept > bytesToKeep) {
        SizeClass* oldest = nullptr;
        for (SizeClass& candidate : fClasses) {
            if (candidate.first == nullptr) continue;
            if (oldest == nullptr || candidate.lastUse < oldest->lastUse) oldest = &candidate;
        }
        Kept* block = oldest->first;
        oldest->first = block->next;
        fKept -= SizeOfClass(static_cast<size_t>(oldest - fClasses.data()));
        block->next = evicted;
        evicted = block;
    }
    return evicted;
}

void RecyclerPool::FreeList(Kept* list) noexcept {
    while (list != nullptr) {
        Kept* next = list->next;
        std::free(list);
        list = next;
    }
}

} // namespace zebcore::utility
