// Tasks, tasks within tasks, tasks that throw, bands, and the floating-point mode in which all of them run.

#include "stress/Operation.h"

#include "frame/Bands.h"
#include "frame/Task.h"
#include "support/FloatEnvironment.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdint>
#include <stdexcept>

namespace {

using namespace PKStress;
using namespace PK::Threading;

/// Counts each part without atomics: the sanitizer sees it if parts meet or if the end of the task comes early.
class Counting : public Task {
public:
    int32_t GetPartCount() const override { return static_cast<int32_t>(fCalls.size()); }
    void RunPart(int32_t partIndex) const override { ++fCalls[static_cast<size_t>(partIndex)]; }

    bool EachPartRanOnce() const {
        for (const int calls : fCalls)
            if (calls != 1) return false;
        return true;
    }

private:
    mutable std::array<int, 68> fCalls{};
};

class Nesting : public Task {
public:
    int32_t GetPartCount() const override { return static_cast<int32_t>(fInner.size()); }
    void RunPart(int32_t partIndex) const override {
        RunTaskOnAllProcessors(fInner[static_cast<size_t>(partIndex)]);
    }

    bool EachPartRanOnce() const {
        for (const Counting& inner : fInner)
            if (!inner.EachPartRanOnce()) return false;
        return true;
    }

private:
    std::array<Counting, 5> fInner;
};

class Throwing : public Task {
public:
    int32_t GetPartCount() const override { return 40; }
    void RunPart(int32_t partIndex) const override {
        if (partIndex % 8 == 5) throw std::runtime_error("a part that throws");
    }
};

template <typename TaskType>
std::function<bool()> PrepareCounting() {
    return [] {
        const TaskType task;
        RunTaskOnAllProcessors(task);
        return task.EachPartRanOnce();
    };
}

std::function<bool()> PrepareThrowing() {
    return [] {
        try {
            RunTaskOnAllProcessors(Throwing());
        } catch (const std::runtime_error&) {
            return true;
        }
        return false;
    };
}

/// Rows are counted without atomics, as the parts above. One band fails, and those behind it may be left out.
bool RunBands(PK::Bands bands, int32_t failingRow) {
    std::array<int, 100> rows{};
    const PK_Result result = PK::RunInBands(100, bands, [&](int32_t firstRow, int32_t endRow) {
        for (int32_t row = firstRow; row < endRow; ++row) ++rows[static_cast<size_t>(row)];
        return firstRow <= failingRow && failingRow < endRow ? PK_ErrOutOfMemory : PK_Success;
    });
    const auto sure = rows.begin() + std::min(failingRow, 100);
    return result == (failingRow < 100 ? PK_ErrOutOfMemory : PK_Success) &&
           std::all_of(rows.begin(), sure, [](int count) { return count == 1; }) &&
           std::all_of(sure, rows.end(), [](int count) { return count <= 1; });
}

std::function<bool()> PrepareBands() {
    return [] {
        return RunBands(PK::Bands::Count(4), 100) && RunBands(PK::Bands::OfRows(3), 100) &&
               RunBands(PK::Bands::OfRows(3), 40);
    };
}

/// Each run has another mode, so that helpers meet tasks of different ones.
std::function<bool()> PrepareFloatModes() {
    return [] {
        static std::atomic<uint32_t> sRuns = 0;
        const uint32_t rounding = sRuns++ % 4 * PKTest::kRoundDown;
        const PKTest::FloatEnvironment environment(rounding | PKTest::kExceptionFlags);
        const PK_Result result = PK::RunInBands(100, PK::Bands::OfRows(3), [&](int32_t, int32_t) {
            return environment.IsAsGiven() ? PK_Success : PK_ErrFailed;
        });
        return result == PK_Success && environment.IsAsGiven();
    };
}

const Operation sTasks("tasks", PrepareCounting<Counting>);
const Operation sNestedTasks("nested-tasks", PrepareCounting<Nesting>);
const Operation sThrowingTasks("throwing-tasks", PrepareThrowing);
const Operation sBands("bands", PrepareBands);
const Operation sFloatModes("float-modes-of-tasks", PrepareFloatModes);

} // namespace
