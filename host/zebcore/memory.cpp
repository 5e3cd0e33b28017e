// Bundled recycler of the host: one pool for the process.

#include "zebcore/memory.h"

#include "zebcore/RecyclerPool.h"

#include <pthread.h>

namespace zebcore::utility {
namespace {

constexpr uint64_t kCap = uint64_t{256} << 20; // some thirty frames of HD in float

constinit RecyclerPool sPool(kCap);

// Empties the pool when the library leaves the process. The pool itself has nothing to destroy, so that
// blocks which come back even later still go to the system.
struct EmptyAtExit {
    ~EmptyAtExit() { sPool.SetCap(0); }
} sEmptyAtExit;

[[gnu::constructor(101)]] void FollowForks() {
    constexpr auto goOn = [] { sPool.GoOnAfterFork(); };
    pthread_atfork([] { sPool.HoldForFork(); }, goOn, goOn);
}

} // namespace

void* MemoryRecycler::Allocate(uint64_t size, uint64_t* actualSize) noexcept {
    return sPool.Allocate(size, actualSize);
}

void MemoryRecycler::Recycle(void* block, uint64_t size) noexcept {
    sPool.Recycle(block, size);
}

} // namespace zebcore::utility
