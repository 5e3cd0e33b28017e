#pragma once

// Scratch for a row or a table: on the stack up to 256 KiB, so that a row loop can ask for it on every row,
// and from transient memory beyond.

#include "frame/TransientMemory.h"

#include <alloca.h>

namespace PK {

inline constexpr uint64_t kRowScratchStackBytes = 0x40000;
inline constexpr uint64_t kRowScratchAlignment = 64; // a cache line

constexpr bool RowScratchIsOnStack(uint64_t bytes) {
    return bytes >= 1 && bytes <= kRowScratchStackBytes;
}

/// Calls use(scratch) with \p bytes of uninitialised scratch and returns what it returns, or
/// PK_ErrOutOfMemory without a call if the scratch cannot be had.
/// \param bytes  0 gives a null pointer.
/// \param use    takes a uint8_t* (64-byte aligned on the stack, else 16-byte) and returns a PK_Result.
///
/// Never inlined: the stack scratch is this frame's, and a loop around the call would otherwise collect it.
template <class Use>
[[gnu::noinline]] PK_Result WithRowScratch(uint64_t bytes, Use&& use) {
    if (RowScratchIsOnStack(bytes)) {
        const uintptr_t raw = reinterpret_cast<uintptr_t>(alloca(bytes + kRowScratchAlignment - 1));
        return use(
            reinterpret_cast<uint8_t*>((raw + kRowScratchAlignment - 1) & ~(kRowScratchAlignment - 1)));
    }
    const TransientBlock block(bytes);
    if (bytes != 0 && block.Bytes() == nullptr) return PK_ErrOutOfMemory;
    return use(block.Bytes());
}

} // namespace PK
