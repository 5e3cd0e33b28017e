#pragma once

// How many threads this process has.

#include <chrono>
#include <cstddef>
#include <filesystem>
#include <iterator>
#include <thread>

namespace PKTest {

inline size_t ThreadCount() {
    return static_cast<size_t>(std::distance(std::filesystem::directory_iterator("/proc/self/task"), {}));
}

/// Waits until there are \p expected threads; one that was joined is still seen for a moment.
/// \return what there are in the end.
inline size_t SettledThreadCount(size_t expected) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (ThreadCount() != expected && std::chrono::steady_clock::now() < deadline)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    return ThreadCount();
}

/// The threads that there are once those which were joined before are no longer seen.
inline size_t RestingThreadCount() {
    size_t count = ThreadCount();
    for (int quiet = 0; quiet < 20; ++quiet) {
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
        const size_t now = ThreadCount();
        if (now != count) quiet = 0;
        count = now;
    }
    return count;
}

} // namespace PKTest
