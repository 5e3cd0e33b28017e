#pragma once

// Counts the calls for each index of a task, from any thread.

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace PKTest {

class CallCounts {
public:
    explicit CallCounts(int32_t parts) : fCounts(static_cast<size_t>(std::max(parts, 0))) {}

    /// An index that is out of range makes EachIs false.
    void Add(int32_t index) {
        if (index < 0 || static_cast<size_t>(index) >= fCounts.size())
            fIsOutOfRange = true;
        else
            ++fCounts[static_cast<size_t>(index)];
    }

    bool EachIs(int expected) const {
        return !fIsOutOfRange &&
               std::ranges::all_of(fCounts, [expected](const auto& count) { return count == expected; });
    }

private:
    std::vector<std::atomic<int>> fCounts;
    std::atomic<bool> fIsOutOfRange = false;
};

} // namespace PKTest
