#include "zebcore/CPUBoundPool.h"

#include <algorithm>
#include <boost/asio/post.hpp>
#include <csignal>

namespace zebcore::threads {

// Hands out the memory of one helper, so that asking for a thread allocates nothing. A helper has at most one
// request under way, and its memory is free again before the helper begins.
template <typename T>
class CPUBoundPool::RequestMemory {
public:
    using value_type = T;

    explicit RequestMemory(Helper& helper) noexcept : fHelper(&helper) {}
    template <typename U>
    RequestMemory(const RequestMemory<U>& other) noexcept : fHelper(other.fHelper) {}

    T* allocate(size_t) noexcept {
        static_assert(sizeof(T) <= Helper::kRequestBytes && alignof(T) <= alignof(std::max_align_t));
        return reinterpret_cast<T*>(fHelper->request.data());
    }
    void deallocate(T*, size_t) noexcept {}

    template <typename U>
    bool operator==(const RequestMemory<U>& other) const noexcept {
        return fHelper == other.fHelper;
    }

private:
    template <typename U>
    friend class RequestMemory;
    Helper* fHelper;
};

// What a thread of the pool is asked to do.
struct CPUBoundPool::Request {
    using allocator_type = RequestMemory<std::byte>;
    allocator_type get_allocator() const noexcept { return allocator_type(*helper); }

    void operator()() const noexcept { pool->Help(*helper); }

    CPUBoundPool* pool;
    Helper* helper;
};

CPUBoundPool::CPUBoundPool(uint32_t threadCount) : fHelpers(threadCount) {
    fThreads.reserve(threadCount);
    // Signals are the program's: its handlers run on its own threads.
    sigset_t all, previous;
    sigfillset(&all);
    pthread_sigmask(SIG_SETMASK, &all, &previous);
    StartThreads(threadCount);
    pthread_sigmask(SIG_SETMASK, &previous, nullptr);
    for (size_t i = 0; i < fThreads.size(); ++i) fIdle.push_back(fHelpers[i]);
}

// The threads attach themselves, rather than being the pool's own: its constructor does not come back from a
// thread that cannot be had.
void CPUBoundPool::StartThreads(uint32_t count) {
    try {
        while (fThreads.size() < count) fThreads.emplace_back([this] { fPool.attach(); });
    } catch (const std::exception&) {
        // The ones that there are must do.
    }
}

CPUBoundPool::~CPUBoundPool() {
    fPool.stop();
    for (std::thread& thread : fThreads) thread.join();
}

void CPUBoundPool::Run(const Function& function, int32_t count) {
    Job job(function, count);
    WokenHelpers woken;
    {
        const std::lock_guard lock(fMutex);
        fJobs.push_back(job);
        woken = TakeIdleHelpers(job);
    }
    Wake(woken);
    RunParts(job);
    {
        std::unique_lock lock(fMutex);
        fJobs.erase(fJobs.iterator_to(job)); // from here on nobody enters it
        job.lastHelperLeft.wait(lock, [&job] { return job.helpersInside == 0; });
    }
    if (job.failure) std::rethrow_exception(job.failure);
}

// Under the lock. One part of those left is the caller's own.
CPUBoundPool::WokenHelpers CPUBoundPool::TakeIdleHelpers(const Job& job) noexcept {
    const int64_t wanted = job.count - job.nextPart.load(std::memory_order_relaxed) - 1;
    WokenHelpers woken{};
    for (size_t i = 0; i < woken.size() && static_cast<int64_t>(i) < wanted && !fIdle.empty(); ++i) {
        woken[i] = &fIdle.front();
        fIdle.pop_front();
    }
    return woken;
}

void CPUBoundPool::Wake(const WokenHelpers& helpers) noexcept {
    for (Helper* helper : helpers)
        if (helper != nullptr) boost::asio::post(fPool, Request{this, helper});
}

void CPUBoundPool::Help(Helper& helper) noexcept {
    std::unique_lock lock(fMutex);
    while (Job* job = FindJob()) {
        ++job->helpersInside;
        const WokenHelpers woken = TakeIdleHelpers(*job);
        lock.unlock();
        Wake(woken);
        RunParts(*job);
        lock.lock();
        // Still under the lock, since the job may be gone as soon as its thread gets it.
        if (--job->helpersInside == 0) job->lastHelperLeft.notify_one();
    }
    fIdle.push_front(helper);
}

// Under the lock. Of the jobs with parts left the oldest, or null.
CPUBoundPool::Job* CPUBoundPool::FindJob() noexcept {
    const auto found = std::ranges::find_if(fJobs, &Job::HasPartsLeft);
    return found == fJobs.end() ? nullptr : &*found;
}

void CPUBoundPool::RunParts(Job& job) noexcept {
    int64_t part;
    while ((part = job.nextPart.fetch_add(1, std::memory_order_relaxed)) < job.count) {
        try {
            job.function(static_cast<int32_t>(part));
        } catch (...) {
            job.nextPart.store(job.count, std::memory_order_relaxed);
            const std::lock_guard lock(fMutex);
            if (!job.failure) job.failure = std::current_exception();
        }
    }
}

} // namespace zebcore::threads
