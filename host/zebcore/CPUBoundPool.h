#pragma once

/// \file
/// The bundled pool behind zebcore::threads::ExecuteCPUBoundTaskOnAllProcessors.
///
/// A task is a job on the stack of the thread that runs it, which lists the job, wakes helpers and works itself.
/// A helper that wakes is bound to no job: it takes whichever has parts left, until none has. So nobody waits
/// for a helper that has not begun, and a job can end while helpers are still on their way to it.
///
/// A forked child has of all threads the one that forked. Its pool starts threads anew at its next task.

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

    /// \param threadCount  threads to start; the pool goes without those that the system refuses. Throws
    ///                     std::bad_alloc.
    explicit CPUBoundPool(uint32_t threadCount);

    /// No task may be running.
    ~CPUBoundPool() override;

    size_t ThreadCount() const noexcept { return fThreads.size(); }

    /// Calls \p function for each index below \p count; see ExecuteCPUBoundTaskOnAllProcessors.
    void Run(const Function& function, int32_t count);

    /// Around a fork, on the thread that forks: first HoldForFork, then in each process what it is named after. In
    /// between no other thread moves anything in the pool.
    void HoldForFork() noexcept { fMutex.lock(); }
    void GoOnInParent() noexcept { fMutex.unlock(); }
    void StartOverInChild() noexcept;

private:
    // A task that has not ended. Lives on the stack of Run.
    struct Job : boost::intrusive::list_base_hook<> {
        Job(const Function& theFunction, int32_t theCount) noexcept;

        int64_t PartsLeft() const noexcept { return count - nextPart.load(std::memory_order_relaxed); }

        const Function& function;
        const int64_t count;
        const std::thread::id runner;     // the thread that runs the task
        const uint32_t floatMode;         // its MXCSR
        std::atomic<int64_t> nextPart{0}; // passes count by one for each thread that finds no part left
        int32_t helpersInside = 0;        // this and what follows is guarded by the pool's mutex
        uint32_t floatExceptions = 0;     // what helpers raised
        std::exception_ptr failure;
        std::condition_variable lastHelperLeft;
    };

    void StartThreads() noexcept;
    void Serve() noexcept;
    Job* FindJob() noexcept;
    void Help(Job& job, std::unique_lock<std::mutex>& lock) noexcept;
    size_t ClaimSleepers(const Job& job) noexcept;
    void Wake(size_t count) noexcept;
    enum class Role { runner, helper };
    void RunParts(Job& job, Role role) noexcept;

    std::mutex fMutex; // guards what follows, but for the forks
    boost::intrusive::list<Job> fJobs;
    size_t fSleepers = 0; // helpers that sleep and that nobody has claimed
    size_t fWakes = 0;    // helpers that were claimed and have not woken
    bool fIsStopping = false;
    std::condition_variable fHasWork;
    const uint32_t fWantedThreads;
    std::vector<std::thread> fThreads;
    bool fLacksThreads = true; // nobody has tried to start them in this process
    uint32_t fForks = 0;       // that led to this process; changes only while it has a single thread
};

} // namespace zebcore::threads
