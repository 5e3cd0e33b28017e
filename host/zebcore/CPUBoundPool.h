#pragma once

/// \file
/// The bundled pool behind zebcore::threads::ExecuteCPUBoundTaskOnAllProcessors.
///
/// A task is a job on the stack of the thread that runs it, which lists the job, wakes helpers and works itself.
/// A helper that wakes is bound to no job: it takes whichever has parts left, until none has. So nobody waits
/// for a helper that has not begun, and a job can end while helpers are still on their way to it.

#include "zebcore/threads.h"

#include <array>
#include <atomic>
#include <boost/asio/thread_pool.hpp>
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
        Job(const Function& theFunction, int32_t theCount) : function(theFunction), count(theCount) {}

        bool HasPartsLeft() const noexcept { return nextPart.load(std::memory_order_relaxed) < count; }

        const Function& function;
        const int64_t count;
        std::atomic<int64_t> nextPart{0}; // passes count by one for each thread that finds no part left
        int32_t helpersInside = 0;        // these two are guarded by the pool's mutex
        std::exception_ptr failure;
        std::condition_variable lastHelperLeft;
    };

    // The right to have one thread of the pool at work, with memory to ask for it.
    struct Helper : boost::intrusive::list_base_hook<> {
        static constexpr size_t kRequestBytes = 128;
        alignas(std::max_align_t) std::array<std::byte, kRequestBytes> request;
    };

    template <typename T>
    class RequestMemory;
    struct Request;

    // Each thread that begins a job wakes so many: all are soon awake, and none spends long on waking others.
    static constexpr size_t kWokenAtOnce = 2;
    using WokenHelpers = std::array<Helper*, kWokenAtOnce>;

    void StartThreads(uint32_t count);
    WokenHelpers TakeIdleHelpers(const Job& job) noexcept;
    void Wake(const WokenHelpers& helpers) noexcept;
    void Help(Helper& helper) noexcept;
    Job* FindJob() noexcept;
    void RunParts(Job& job) noexcept;

    std::mutex fMutex;
    boost::intrusive::list<Job> fJobs; // guarded by fMutex
    std::vector<Helper> fHelpers;
    boost::intrusive::list<Helper> fIdle; // guarded by fMutex; as many at most as there are threads
    boost::asio::thread_pool fPool{0};    // no threads of its own
    std::vector<std::thread> fThreads;    // attached to fPool
};

} // namespace zebcore::threads
