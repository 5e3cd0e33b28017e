#pragma once

/// \file
/// The bundled recycler behind zebcore::utility::MemoryRecycler.
///
/// Sizes fall into classes, four to each doubling, so that a block given back serves the next request of
/// about its size and at most a quarter of it is spare. What is kept has a cap; beyond it, the classes that
/// have been quiet for longest give up their blocks first, so that a change of the frame size does not leave
/// the old frames behind.

#include <array>
#include <cstddef>
#include <cstdint>
#include <mutex>

namespace zebcore::utility {

class RecyclerPool {
public:
    explicit constexpr RecyclerPool(uint64_t cap) : fCap(cap) {}
    RecyclerPool(const RecyclerPool&) = delete;
    RecyclerPool& operator=(const RecyclerPool&) = delete;

    void* Allocate(uint64_t size, uint64_t* actualSize) noexcept;
    void Recycle(void* block, uint64_t size) noexcept;

    /// Gives the kept blocks back to the system, keeping no more than \p cap bytes from now on.
    void SetCap(uint64_t cap) noexcept;

    uint64_t KeptBytes() const noexcept;

    /// Around a fork: nobody else changes the pool in between.
    void HoldForFork() noexcept { fMutex.lock(); }
    void GoOnAfterFork() noexcept { fMutex.unlock(); }

    /// The size of the class that serves \p size; \p size itself if it is too large for any.
    static uint64_t ClassSize(uint64_t size) noexcept;

private:
    static constexpr int kStepBits = 2;      // 2^2 classes to a doubling
    static constexpr int kSmallestBits = 12; // 4 KiB
    static constexpr int kLargestBits = 30;  // 1 GiB; larger blocks are never kept
    static constexpr uint64_t kSmallest = uint64_t{1} << kSmallestBits;
    static constexpr uint64_t kLargest = uint64_t{1} << kLargestBits;
    static constexpr uint64_t kRefusedFrom = uint64_t{1} << 38; // 256 GiB: a size gone wrong, no image
    static constexpr size_t kClassCount = ((kLargestBits - kSmallestBits) << kStepBits) + 1;

    // A kept block; the list runs through the blocks themselves.
    struct Kept {
        Kept* next;
    };
    struct SizeClass {
        Kept* first = nullptr;
        uint64_t lastUse = 0;
    };

    static size_t ClassIndex(uint64_t size) noexcept;
    static uint64_t SizeOfClass(size_t index) noexcept;
    Kept* Evict(uint64_t bytesToKeep) noexcept;
    static void FreeList(Kept* list) noexcept;

    mutable std::mutex fMutex;
    std::array<SizeClass, kClassCount> fClasses{};
    uint64_t fCap;
    uint64_t fKept = 0;
    uint64_t fClock = 0;
};

} // namespace zebcore::utility
