#pragma once

// Work on one frame after another, on several threads, with what comes out in the order of what went in.

#include <boost/asio/packaged_task.hpp>
#include <boost/asio/post.hpp>
#include <boost/asio/thread_pool.hpp>

#include <cstddef>
#include <cstdint>
#include <deque>
#include <future>
#include <type_traits>
#include <utility>

namespace tool {

/// Takes inputs through a job, each by itself, and hands on what comes out.
/// \param threads  that work at once. Of one, nothing is started; more are beside the calling one, which alone calls \p next
///                 and \p use.
/// \param next     gives an optional input, empty at the end.
/// \param job      from an input to a result. What it throws is thrown here when its turn comes.
/// \param use      gets the results in the order of the inputs.
template <typename Next, typename Job, typename Use>
void RunInOrder(int32_t threads, const Next& next, const Job& job, const Use& use) {
    if (threads == 1) {
        while (auto input = next()) use(job(*input));
        return;
    }
    using Input = typename std::invoke_result_t<Next>::value_type;
    using Result = std::invoke_result_t<Job, const Input&>;
    const size_t most = 2 * static_cast<size_t>(threads); // begun or waiting, so that nobody lacks work
    boost::asio::thread_pool pool(static_cast<size_t>(threads));
    std::deque<std::future<Result>> results;
    const auto useFirst = [&] {
        std::future<Result> first = std::move(results.front());
        results.pop_front();
        use(first.get());
    };
    while (auto input = next()) {
        if (results.size() == most) useFirst();
        results.push_back(boost::asio::post(
            pool, std::packaged_task<Result()>([&job, given = std::move(*input)] { return job(given); })));
    }
    while (!results.empty()) useFirst();
}

} // namespace tool
