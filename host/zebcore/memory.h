#pragma once

/// \file
/// The host's recycling allocator, from which all frame-sized memory comes.

#include <cstdint>

namespace zebcore::utility {

/// Keeps blocks that were given back and hands them out again. Safe from all threads, and in the child of a fork,
/// whatever other threads of the parent were doing here: see threads.h.
class MemoryRecycler {
public:
    /// A block of at least \p size bytes, 16-byte aligned, its contents undefined.
    /// \param size        bytes asked for.
    /// \param actualSize  receives the size to hand back to Recycle; untouched on failure.
    /// \return the block, or null if the memory cannot be had.
    static void* Allocate(uint64_t size, uint64_t* actualSize) noexcept;

    /// Takes a block back.
    /// \param block  from Allocate; null does nothing.
    /// \param size   the actual size that Allocate told.
    static void Recycle(void* block, uint64_t size) noexcept;
};

} // namespace zebcore::utility
