#pragma once

// A place of the library that tells the host's trace what happens there.

#include "primitives/Relaxed.h"

#include "zebcore/debug.h"

#include <cstdint>
#include <string>

namespace PK {

/// Asks the host only after a change of its levels; while the answer is no, a message costs one comparison of integers. May
/// be asked from any number of threads at the same time.
struct TraceSite {
    const char* channel;
    int32_t level;
    bool isOnByDefault;
    Relaxed<uint64_t> answer = UINT64_MAX; ///< none yet

    /// What stands in `answer` after the host was asked: one word, so that threads never see half of it.
    static constexpr uint64_t Answer(uint32_t changeCount, bool isOn) {
        return uint64_t{changeCount} << 1 | (isOn ? 1 : 0);
    }

    bool IsOn() {
        const uint32_t changeCount = zebcore::debug::TraceChangeCount();
        return answer != Answer(changeCount, false) && IsOnByHost(changeCount);
    }

    /// One line: thread, channel, level, text.
    void Write(const std::string& text) const;

private:
    bool IsOnByHost(uint32_t changeCount);
};

} // namespace PK
