// Bundled threads of the host: one pool for the process, for as long as somebody holds it.

#include "zebcore/threads.h"

#include "zebcore/CPUBoundPool.h"

#include <algorithm>
#include <boost/smart_ptr/make_shared.hpp>
#include <boost/smart_ptr/weak_ptr.hpp>
#include <pthread.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace zebcore::threads {
namespace {

constinit std::mutex sMutex;
boost::weak_ptr<CPUBoundPool> sPool;           // guarded by sMutex
boost::shared_ptr<CPUBoundPool> sPoolOverFork; // so is this; set while the process forks

boost::shared_ptr<CPUBoundPool> PoolIfAny() {
    const std::lock_guard lock(sMutex);
    return sPool.lock();
}

// Leaves no dangling pointer to those who come or fork even later.
struct ForgetAtExit {
    ~ForgetAtExit() {
        const std::lock_guard lock(sMutex);
        sPool.reset();
    }
} sForgetAtExit;

void HoldForFork() {
    sMutex.lock();
    sPoolOverFork = sPool.lock();
    if (sPoolOverFork) sPoolOverFork->HoldForFork();
}

// The pool is let go behind the lock, since it may have been held for the fork alone in the end.
void EndFork(void (CPUBoundPool::*end)() noexcept) {
    const boost::shared_ptr<CPUBoundPool> pool = std::move(sPoolOverFork);
    if (pool) (pool.get()->*end)();
    sMutex.unlock();
}

[[gnu::constructor(101)]] void FollowForks() {
    pthread_atfork(
        HoldForFork, [] { EndFork(&CPUBoundPool::GoOnInParent); },
        [] { EndFork(&CPUBoundPool::StartOverInChild); });
}

} // namespace

uint32_t GetCurrentThreadID() noexcept {
    return static_cast<uint32_t>(gettid());
}

boost::shared_ptr<AsyncExecutor> CreateCPUBoundExecutor() {
    const std::lock_guard lock(sMutex);
    boost::shared_ptr<CPUBoundPool> pool = sPool.lock();
    if (!pool) {
        // The thread that calls is one of those that work.
        pool = boost::make_shared<CPUBoundPool>(std::max(std::thread::hardware_concurrency(), 1u) - 1);
        sPool = pool;
    }
    return pool;
}

void ExecuteCPUBoundTaskOnAllProcessors(const boost::function<void(int32_t)>& function, int32_t count) {
    // Held until the end, so that the pool outlives the task if the executor is let go meanwhile. It is never
    // a thread of the pool that lets it go last: the task which that thread works for holds it too.
    const boost::shared_ptr<CPUBoundPool> pool = count > 1 ? PoolIfAny() : nullptr;
    if (pool) return pool->Run(function, count);
    for (int32_t part = 0; part < count; ++part) function(part);
}

} // namespace zebcore::threads
