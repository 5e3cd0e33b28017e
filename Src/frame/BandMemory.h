#pragma once

// Scratch for the bands of an operation, none of which may fail for want of it when others have written already.

#include "frame/RowScratch.h"

#include <mutex>

namespace PK {

/// So many bytes for each band: on the stack as far as row scratch is. Beyond that one block is taken before any band
/// runs. Bands that meet take blocks of their own, and where there is no memory for one, wait for the first.
class BandMemory {
public:
    /// \param bytes  at least 1
    explicit BandMemory(uint64_t bytes)
        : fBytes(bytes), fFirst(RowScratchIsOnStack(bytes) ? 0 : BlockBytes()) {}

    /// PK_ErrOutOfMemory where not even one band could run.
    PK_Result Result() const {
        return RowScratchIsOnStack(fBytes) || fFirst.Bytes() != nullptr ? PK_Success : PK_ErrOutOfMemory;
    }

    /// Calls use(scratch) with a uint8_t*, aligned to 64 bytes, and returns what it returns. Only if Result() is a
    /// success.
    template <class Use>
    PK_Result With(const Use& use) {
        if (RowScratchIsOnStack(fBytes)) return WithRowScratch(fBytes, use);
        if (const std::unique_lock lock(fMutex, std::try_to_lock); lock) return use(Aligned(fFirst));
        if (const TransientBlock own(BlockBytes()); own.Bytes() != nullptr) return use(Aligned(own));
        const std::lock_guard lock(fMutex);
        return use(Aligned(fFirst));
    }

private:
    /// A block that is aligned to less.
    uint64_t BlockBytes() const { return fBytes + kRowScratchAlignment - 1; }
    static uint8_t* Aligned(const TransientBlock& block) {
        const uintptr_t place = reinterpret_cast<uintptr_t>(block.Bytes()) + kRowScratchAlignment - 1;
        return reinterpret_cast<uint8_t*>(place & ~(kRowScratchAlignment - 1));
    }

    uint64_t fBytes;
    TransientBlock fFirst;
    std::mutex fMutex; // held by the band that uses the first
};

} // namespace PK
