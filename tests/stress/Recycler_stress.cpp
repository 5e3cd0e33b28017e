// A pool of blocks whose cap changes while others take blocks and give them back.

#include "stress/Operation.h"

#include "zebcore/RecyclerPool.h"

#include <atomic>
#include <cstdint>
#include <cstring>
#include <memory>

namespace {

using namespace PKStress;
using zebcore::utility::RecyclerPool;

constexpr uint64_t kBlock = 16384, kLargestCap = 4 * kBlock;

bool TakeAndRecycle(RecyclerPool& pool) {
    uint64_t size = 0;
    void* block = pool.Allocate(kBlock, &size);
    if (block == nullptr) return false;
    std::memset(block, 0x5A, size);
    pool.Recycle(block, size);
    return size == kBlock;
}

std::function<bool()> PrepareCaps() {
    const std::shared_ptr<RecyclerPool> pool(new RecyclerPool(kLargestCap), [](RecyclerPool* last) {
        last->SetCap(0);
        delete last;
    });
    return [pool] {
        static std::atomic<uint64_t> sTurn = 0;
        pool->SetCap(++sTurn % 5 * kBlock);
        return TakeAndRecycle(*pool) && TakeAndRecycle(*pool) && pool->KeptBytes() <= kLargestCap;
    };
}

const Operation sCaps("recycler-caps", PrepareCaps);

} // namespace
