#pragma once

/// \file
/// The bundled pool behind zebcore::threads::ExecuteCPUBoundTaskOnAllProcessors.
///
/// A task is a job on the stack of the thread that runs it, which lists the job, wakes helpers and works itself.
/// A helper that wakes is bound to no job: it takes whichever has parts left, until none has. So nobody waits
/// for a helper that has not begun, and a job can end while helpers are still on their way to it.

#include "zebcore/threads.h"

#include <atomic>
#include <boost/intrusive/list.hpp>
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <mutex>
#include <thread>
#include <vector>

namespace zebcore::threads {

class CPUBoundPool final : public AsyncExecutor {
public:
    using Function = boost::function<void(int32_t)>;

    /// \param threadCount  threads to start; the pool goes without those that the system refuses.
    explicit CPUBoundPool(uint32_t threadCount);

    /// No task may be running.
    ~CPUBoundPool() override;

    size_t ThreadCount() const noexcept { return fThreads.size(); }

    /// Calls \p function for each index below \p count; see ExecuteCPUBoundTaskOnAllProcessors.
    void Run(const Function& function, int32_t count);

private:
    // A task that has not ended. Lives on the stack of Run.
    struct Job : boost::intrusive::list_base_hook<> {
        Job(const Function& theFunction, int32_t theCount) noexcept;

        int64_t PartsLeft() const noexcept { return count - nextPart.load(std::memory_order_relaxed); }

        const Function& function;
        const int64_t count;
        const uint32_t floatMode;         // MXCSR of the thread that runs the task
        std::atomic<int64_t> nextPart{0}; // passes count by one for each thread that finds no part left
        int32_t helpersInside = 0;        // this and what follows is guarded by the pool's mutex
        uint32_t floatExceptions = 0;     // what helpers raised
        std::exception_ptr failure;
        std::condition_variable lastHelperLeft;
    };

    void StartThreads(uint32_t count);
    void Serve() noexcept;
    Job* FindJob() noexcept;
    void Help(Job& job, std::unique_lock<std::mutex>& lock) noexcept;
    size_t ClaimSleepers(const Job& job) noexcept;
    void Wake(size_t count) noexcept;
    void RunParts(Job& job) noexcept;

    std::mutex fMutex; // guards what follows, but for the threads
    boost::intrusive::list<Job> fJobs;
    size_t fSleepers = 0; // helpers that sleep and that nobody has claimed
    size_t fWakes = 0;    // helpers that were claimed and have not woken
    bool fIsStopping = false;
    std::condition_variable fHasWork;
    std::vector<std::thread> fThreads;
};

} // namespace zebcore::threads
