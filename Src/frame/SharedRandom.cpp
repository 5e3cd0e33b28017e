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

SharedRandoms::SharedRandoms() noexcept {
    sMutex.lock();
}

SharedRandoms::~SharedRandoms() {
    sMutex.unlock();
}

int SharedRandoms::Next() noexcept {
    return std::rand();
}

int SharedRandom() noexcept {
    return SharedRandoms().Next();
}

void SeedSharedRandom(unsigned seed) noexcept {
    const std::scoped_lock lock(sMutex);
    std::srand(seed);
}

} // namespace PK
