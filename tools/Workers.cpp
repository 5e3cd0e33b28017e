#include "Workers.h"

namespace tool {

Workers::Workers(int32_t threads) {
    for (int32_t i = 1; i < threads; ++i)
        fThreads.emplace_back([this](const std::stop_token& stop) { Work(stop); });
}

Workers::~Workers() {
    const std::lock_guard lock(fMutex);
    fJobs.clear();
}

void Workers::Add(std::function<void()> job) {
    {
        const std::lock_guard lock(fMutex);
        fJobs.push_back(std::move(job));
    }
    fHasJob.notify_one();
}

bool Workers::RunOne() {
    std::unique_lock lock(fMutex);
    if (fJobs.empty()) return false;
    const std::function<void()> job = std::move(fJobs.front());
    fJobs.pop_front();
    lock.unlock();
    job();
    return true;
}

void Workers::Work(std::stop_token stop) {
    while (!stop.stop_requested()) {
        {
            std::unique_lock lock(fMutex);
            if (!fHasJob.wait(lock, stop, [this] { return !fJobs.empty(); })) return;
        }
        RunOne();
    }
}

} // namespace tool
