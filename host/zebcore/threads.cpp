// Bundled threads of the host.

#include "zebcore/threads.h"

#include <unistd.h>

namespace zebcore::threads {

uint32_t GetCurrentThreadID() noexcept {
    return static_cast<uint32_t>(gettid());
}

} // namespace zebcore::threads
