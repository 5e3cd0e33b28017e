#include "primitives/FirstUse.h"

#include <pthread.h>

namespace PK {
namespace {

constinit std::mutex sMutex;

[[gnu::constructor(101)]] void FollowForks() {
    constexpr auto goOn = [] { sMutex.unlock(); };
    pthread_atfork([] { sMutex.lock(); }, goOn, goOn);
}

} // namespace

std::mutex& FirstUseMutex() {
    return sMutex;
}

} // namespace PK
