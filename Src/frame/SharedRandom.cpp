#include "frame/SharedRandom.h"

#include <cstdlib>
#include <mutex>
#include <pthread.h>

namespace PK {
namespace {

// std::rand() locks, and in the child of a fork the lock stays with a thread that the child lacks. So no thread of ours is
// in there while the process forks.
constinit std::mutex sMutex;

[[gnu::constructor(101)]] void FollowForks() {
    constexpr auto goOn = [] { sMutex.unlock(); };
    pthread_atfork([] { sMutex.lock(); }, goOn, goOn);
}

} // namespace

int SharedRandom() noexcept {
    const std::scoped_lock lock(sMutex);
    return std::rand();
}

} // namespace PK
