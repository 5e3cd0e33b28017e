// Tasks on the host's pool of threads.

#include "frame/Task.h"

#include "zebcore/threads.h"

namespace PK::Threading {
namespace {

// Keeps the pool alive; tasks are not handed to it directly.
boost::shared_ptr<zebcore::threads::AsyncExecutor> sCPUBoundExecutor;

} // namespace

void RunTaskOnAllProcessors(const Task& task) {
    // One pointer: small enough to be held without an allocation.
    const boost::function<void(int32_t)> runPart = [&task](int32_t partIndex) { task.RunPart(partIndex); };
    zebcore::threads::ExecuteCPUBoundTaskOnAllProcessors(runPart, task.GetPartCount());
}

void CreateTaskExecutor() noexcept {
    try {
        sCPUBoundExecutor = zebcore::threads::CreateCPUBoundExecutor();
    } catch (...) {
        sCPUBoundExecutor.reset(); // a start reports no failure
    }
}

void ReleaseTaskExecutor() noexcept {
    sCPUBoundExecutor.reset();
}

} // namespace PK::Threading
