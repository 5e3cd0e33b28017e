// Eight threads, each running every operation in turn until the time is over, and each at least once.

#include "stress/Operation.h"

#include <PixelKiln/Lifecycle.h>

#include <atomic>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <deque>
#include <functional>
#include <latch>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace {

using namespace PKStress;
using Clock = std::chrono::steady_clock;

constexpr size_t kThreads = 8;
constexpr char kUsage[] = "usage: pixelkiln_stress [--seconds N] [OPERATION...]\n"
                          "\n"
                          "Runs the named operations, or all, on eight threads at once.\n";

struct Options {
    uint32_t seconds = 5;
    std::vector<const Operation*> operations = Operation::All();
};

/// An operation while it is run.
struct Work {
    explicit Work(const Operation& operation) : name(operation.Name()), run(operation.Ready()) {}

    std::string_view name;
    std::function<bool()> run;
    std::atomic<uint64_t> runs = 0, failures = 0;
};

[[noreturn]] void Refuse(const std::string& why) {
    std::fprintf(stderr, "%s\n%s", why.c_str(), kUsage);
    std::exit(2);
}

uint32_t ParseSeconds(std::string_view text) {
    uint32_t seconds = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), seconds);
    if (error != std::errc{} || end != text.data() + text.size()) Refuse("--seconds wants a number");
    return seconds;
}

const Operation* FindOperation(std::string_view name) {
    std::string known;
    for (const Operation* operation : Operation::All()) {
        if (operation->Name() == name) return operation;
        known += " " + std::string(operation->Name());
    }
    Refuse("no operation " + std::string(name) + "; there are:" + known);
}

Options Parse(int count, char** arguments) {
    Options options;
    std::vector<const Operation*> named;
    for (int i = 1; i < count; ++i) {
        const std::string_view argument = arguments[i];
        if (argument == "--seconds")
            options.seconds = ParseSeconds(++i == count ? "" : arguments[i]);
        else if (argument.starts_with("-"))
            Refuse("unknown option " + std::string(argument));
        else
            named.push_back(FindOperation(argument));
    }
    if (!named.empty()) options.operations = named;
    return options;
}

/// Begins at another place of the list in each thread, so that different operations meet.
void RunAll(std::deque<Work>& works, size_t first, Clock::time_point end) {
    const size_t count = works.size();
    for (size_t i = 0; i < count || Clock::now() < end; ++i) {
        Work& work = works[(first + i) % count];
        if (!work.run()) ++work.failures;
        ++work.runs;
    }
}

void RunOnAllThreads(std::deque<Work>& works, uint32_t seconds) {
    const Clock::time_point end = Clock::now() + std::chrono::seconds(seconds);
    std::latch start(kThreads);
    std::vector<std::thread> threads;
    for (size_t i = 0; i < kThreads; ++i)
        threads.emplace_back([&works, &start, i, end] {
            start.arrive_and_wait();
            RunAll(works, i, end);
        });
    for (std::thread& thread : threads) thread.join();
}

/// \return whether all went well.
bool Tell(const std::deque<Work>& works) {
    bool isRight = true;
    for (const Work& work : works) {
        std::printf("%-24.*s %8llu runs", static_cast<int>(work.name.size()), work.name.data(),
                    static_cast<unsigned long long>(work.runs));
        if (work.failures != 0) std::printf(", %llu WRONG", static_cast<unsigned long long>(work.failures));
        std::printf("\n");
        isRight = isRight && work.failures == 0;
    }
    return isRight;
}

} // namespace

int main(int count, char** arguments) {
    const Options options = Parse(count, arguments);
    PK_Initialize();
    std::deque<Work> works;
    for (const Operation* operation : options.operations) works.emplace_back(*operation);
    RunOnAllThreads(works, options.seconds);
    PK_Terminate();
    return Tell(works) ? 0 : 1;
}
