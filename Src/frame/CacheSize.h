#pragma once

// The largest unified cache of the processor. No algorithm asks for it yet.

#include "primitives/Relaxed.h"

#include <cstdint>

namespace PK {

extern Relaxed<int32_t> sLargestCacheLevel;
extern Relaxed<uint64_t> sLargestCacheBytes;

/// Bytes of the largest unified cache, as the last start of the library found it.
uint64_t LargestCacheBytes() noexcept;

/// Asks the system and stores level and size; where the system does not tell, values that fit the
/// capability flags as they stand.
/// \param systemValue  sysconf, or what stands for it.
void DetectCache(long (*systemValue)(int)) noexcept;

} // namespace PK
