#include "zebcore/CPUBoundPool.h"

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <new>
#include <xmmintrin.h>

namespace zebcore::threads {
namespace {

constexpr uint32_t kFloatExceptions = 0x3f; // the sticky bits of MXCSR

// Each thread that begins a job wakes so many: all are soon awake, and none spends long on waking others.
constexpr size_t kWokenAtOnce = 2;

} // namespace

CPUBoundPool::Job::Job(const Function& theFunction, int32_t theCount) noexcept
    : function(theFunction), count(theCount), runner(std::this_thread::get_id()), floatMode(_mm_getcsr()) {}

CPUBoundPool::CPUBoundPool(uint32_t threadCount) : fWantedThreads(threadCount) {
    fThreads.reserve(threadCount);
    StartThreads();
}

void CPUBoundPool::StartThreads() noexcept {
    fLacksThreads = false;
    // Signals are the program's: its handlers run on its own threads. Only faults belong to who commits them.
    sigset_t blocked, previous;
    sigfillset(&blocked);
    for (const int fault : {SIGBUS, SIGFPE, SIGILL, SIGSEGV}) sigdelset(&blocked, fault);
    pthread_sigmask(SIG_SETMASK, &blocked, &previous);
    try {
        while (fThreads.size() < fWantedThreads) fThreads.emplace_back([this] { Serve(); });
    } catch (const std::exception&) {
        // The ones that there are must do.
    }
    pthread_sigmask(SIG_SETMASK, &previous, nullptr);
}

CPUBoundPool::~CPUBoundPool() {
    {
        const std::lock_guard lock(fMutex);
        fIsStopping = true;
        fWakes += fThreads.size();
    }
    fHasWork.notify_all();
    for (std::thread& thread : fThreads) thread.join();
}

void CPUBoundPool::Run(const Function& function, int32_t count) {
    Job job(function, count);
    size_t woken;
    {
        const std::lock_guard lock(fMutex);
        if (fLacksThreads) StartThreads();
        fJobs.push_back(job);
        woken = ClaimSleepers(job);
    }
    Wake(woken);
    RunParts(job, Role::runner);
    {
        std::unique_lock lock(fMutex);
        fJobs.erase(fJobs.iterator_to(job)); // from here on nobody enters it
        job.lastHelperLeft.wait(lock, [&job] { return job.helpersInside == 0; });
    }
    _mm_setcsr(_mm_getcsr() | job.floatExceptions);
    if (job.failure) std::rethrow_exception(job.failure);
}

// The threads cannot be joined, nor woken from what they wait for: both are made anew in their place. The tasks of
// other threads are lost with their stacks. Those of this thread, if it forked from within a part, go on without the
// parts that helpers had begun.
void CPUBoundPool::StartOverInChild() noexcept {
    ++fForks;
    for (std::thread& thread : fThreads) new (&thread) std::thread;
    fThreads.clear();
    fLacksThreads = true;
    new (&fHasWork) std::condition_variable;
    fSleepers = fWakes = 0;
    fJobs.remove_if([](const Job& job) { return job.runner != std::this_thread::get_id(); });
    for (Job& job : fJobs) job.helpersInside = 0;
    fMutex.unlock();
}

// A thread of the pool: works while there is work, and sleeps until somebody claims it.
void CPUBoundPool::Serve() noexcept {
    std::unique_lock lock(fMutex);
    while (!fIsStopping) {
        while (Job* job = FindJob()) Help(*job, lock);
        ++fSleepers;
        fHasWork.wait(lock, [this] { return fWakes > 0; });
        --fWakes;
    }
}

// Under the lock. Of the jobs with parts left the oldest, or null.
CPUBoundPool::Job* CPUBoundPool::FindJob() noexcept {
    const auto found = std::ranges::find_if(fJobs, [](const Job& job) { return job.PartsLeft() > 0; });
    return found == fJobs.end() ? nullptr : &*found;
}

// Works in the floating-point mode of the job's own thread, as if that had taken the parts, and has its own again
// afterwards.
void CPUBoundPool::Help(Job& job, std::unique_lock<std::mutex>& lock) noexcept {
    ++job.helpersInside;
    const size_t woken = ClaimSleepers(job);
    lock.unlock();
    Wake(woken);
    const uint32_t ownFloatMode = _mm_getcsr();
    _mm_setcsr(job.floatMode);
    RunParts(job, Role::helper);
    const uint32_t raised = _mm_getcsr() & kFloatExceptions;
    _mm_setcsr(ownFloatMode);
    lock.lock();
    job.floatExceptions |= raised;
    // Still under the lock, since the job may be gone as soon as its thread gets it.
    if (--job.helpersInside == 0) job.lastHelperLeft.notify_one();
}

// Under the lock. How many to wake for a job: one part of those left is for who wakes them. One that is on its way
// already is not claimed again.
size_t CPUBoundPool::ClaimSleepers(const Job& job) noexcept {
    const auto wanted = static_cast<size_t>(std::max<int64_t>(job.PartsLeft() - 1, 0));
    const size_t claimed = std::min({wanted, kWokenAtOnce, fSleepers});
    fSleepers -= claimed;
    fWakes += claimed;
    return claimed;
}

// Without the lock, which is the first thing that they want.
void CPUBoundPool::Wake(size_t count) noexcept {
    for (; count > 0; --count) fHasWork.notify_one();
}

void CPUBoundPool::RunParts(Job& job, Role role) noexcept {
    const uint32_t forks = fForks;
    int64_t part;
    while ((part = job.nextPart.fetch_add(1, std::memory_order_relaxed)) < job.count) {
        std::exception_ptr failure;
        try {
            job.function(static_cast<int32_t>(part));
        } catch (...) {
            failure = std::current_exception();
        }
        // A helper that forked in its part and comes back from it in the child: nobody is there whom it could help, the
        // job least of all. It was the only thread, and so the process ends with it.
        if (role == Role::helper && fForks != forks) std::exit(EXIT_SUCCESS);
        if (failure) {
            job.nextPart.store(job.count, std::memory_order_relaxed);
            const std::lock_guard lock(fMutex);
            if (!job.failure) job.failure = failure;
        }
    }
}

} // namespace zebcore::threads
