#include "frame/CacheSize.h"

#include "primitives/CapabilityFlags.h"

#include <unistd.h>

namespace PK {

constinit Relaxed<int32_t> sLargestCacheLevel;
constinit Relaxed<uint64_t> sLargestCacheBytes;

namespace {

struct CacheLevel {
    int32_t level;
    int name; // of its size, for sysconf
};

// Unified on every x86 processor; level 1 is split into code and data.
constexpr CacheLevel kUnifiedLevels[] = {
    {4, _SC_LEVEL4_CACHE_SIZE},
    {3, _SC_LEVEL3_CACHE_SIZE},
    {2, _SC_LEVEL2_CACHE_SIZE},
};

void StoreCache(int32_t level, uint64_t bytes) {
    sLargestCacheLevel = level;
    sLargestCacheBytes = bytes;
}

} // namespace

uint64_t LargestCacheBytes() noexcept {
    return sLargestCacheBytes;
}

void DetectCache(long (*systemValue)(int)) noexcept {
    for (const CacheLevel& cache : kUnifiedLevels) {
        const long bytes = systemValue(cache.name);
        if (bytes > 0) return StoreCache(cache.level, static_cast<uint64_t>(bytes));
    }
    if (sCPUHasAVX || sCPUHasAVX2) return StoreCache(3, 0x300000);
    if (sCPUHasSSE2) return StoreCache(2, 0x100000);
    StoreCache(0, 0);
}

} // namespace PK
