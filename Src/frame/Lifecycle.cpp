// Start and stop of the library.

#include "frame/Capabilities.h"
#include "frame/DVEncoder.h"
#include "frame/PrimitivesStart.h"
#include "frame/Task.h"
#include "frame/Wrap32.h"

#include <PixelKiln/Lifecycle.h>

#include <mutex>
#include <pthread.h>

namespace PK {
namespace {

// Parts of a program that know nothing of each other start and stop the library whenever they like.
constinit std::mutex sMutex;

// Calls of PK_Initialize not yet matched by PK_Terminate; below 0 after a stop too many. Guarded by sMutex.
int32_t sNestingCount = 0;

// Nobody is in the middle of a start or stop while the process forks. This lock is held while others are taken, those of
// the host among them, and so must be taken before them: what is registered last comes first. They are registered by
// constructors of an early priority, this by one that has none.
[[gnu::constructor]] void FollowForks() {
    constexpr auto goOn = [] { sMutex.unlock(); };
    pthread_atfork([] { sMutex.lock(); }, goOn, goOn);
}

} // namespace
} // namespace PK

PK_Result PK_Initialize(void) noexcept {
    using namespace PK;
    const std::scoped_lock lock(sMutex);
    sNestingCount = WrapAdd(sNestingCount, 1);
    if (sNestingCount != 1) return PK_Success;
    DetectProcessor();
    StartPrimitives();
    OpenDVEncoder();
    Threading::CreateTaskExecutor();
    return PK_Success;
}

PK_Result PK_Terminate(void) noexcept {
    using namespace PK;
    const std::scoped_lock lock(sMutex);
    sNestingCount = WrapAdd(sNestingCount, -1);
    if (sNestingCount != 0) return PK_Success;
    Threading::ReleaseTaskExecutor();
    CloseDVEncoder();
    return PK_Success;
}
