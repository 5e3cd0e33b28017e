#pragma once

// Work on one frame after another, on several threads, with what comes out in the order of what went in.

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <functional>
#include <future>
#include <memory>
#include <mutex>
#include <thread>
#include <type_traits>
#include <utility>
#include <vector>

namespace tool {

class Workers {
public:
    /// \param threads  the calling one among them.
    explicit Workers(int32_t threads);

    /// Forgets jobs that have not begun, and waits for those that have.
    ~Workers();
    Workers(const Workers&) = delete;
    Workers& operator=(const Workers&) = delete;

    /// \param job  throws nothing.
    void Add(std::function<void()> job);

    /// Does a job that has not begun; false if there is none.
    bool RunOne();

private:
    void Work(std::stop_token stop);

    std::mutex fMutex;
    std::condition_variable_any fHasJob;
    std::deque<std::function<void()>> fJobs;
    std::vector<std::jthread> fThreads; ///< the last member: they end before the others go
};

/// Takes inputs through a job, each by itself, and hands on what comes out.
/// \param threads  the calling one among them; the only one that calls \p next and \p use.
/// \param next  gives an optional input, empty at the end.
/// \param job   from an input to a result. What it throws is thrown here when its turn comes.
/// \param use   gets the results in the order of the inputs.
template <typename Next, typename Job, typename Use>
void RunInOrder(int32_t threads, const Next& next, const Job& job, const Use& use) {
    using Input = typename std::invoke_result_t<Next>::value_type;
    using Result = std::invoke_result_t<Job, const Input&>;
    const size_t most = 2 * static_cast<size_t>(threads); // begun or waiting, so that nobody lacks work
    std::deque<std::future<Result>> results;
    Workers workers(threads);
    for (bool isMore = true; isMore || !results.empty();) {
        if (isMore && results.size() < most) {
            auto input = next();
            isMore = input.has_value();
            if (!isMore) continue;
            const auto task = std::make_shared<std::packaged_task<Result()>>(
                [&job, given = std::make_shared<Input>(std::move(*input))] { return job(*given); });
            results.push_back(task->get_future());
            workers.Add([task] { (*task)(); });
            continue;
        }
        std::future<Result> first = std::move(results.front());
        results.pop_front();
        while (first.wait_for(std::chrono::seconds(0)) != std::future_status::ready && workers.RunOne()) {
        }
        use(first.get());
    }
}

} // namespace tool
