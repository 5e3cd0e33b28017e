// Tasks, tasks within tasks and tasks that throw.

#include "stress/Operation.h"

#include "frame/Task.h"

#include <array>
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

const Operation sTasks("tasks", PrepareCounting<Counting>);
const Operation sNestedTasks("nested-tasks", PrepareCounting<Nesting>);
const Operation sThrowingTasks("throwing-tasks", PrepareThrowing);

} // namespace
