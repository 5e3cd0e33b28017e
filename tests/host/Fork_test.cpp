// What a forked child has of its parent's pool of threads.

#include "support/CallCounts.h"
#include "support/Child.h"
#include "support/ThreadCount.h"

#include "zebcore/threads.h"

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <gtest/gtest.h>
#include <latch>
#include <thread>
#include <unistd.h>

using namespace zebcore::threads;

namespace {

using namespace PKTest;

constexpr int32_t kParts = 64;
const size_t kThreadsOfExecutor = std::max(std::thread::hardware_concurrency(), 1u) - 1;

bool RunsEveryPartOnce() {
    CallCounts calls(kParts);
    ExecuteCPUBoundTaskOnAllProcessors([&calls](int32_t part) { calls.Add(part); }, kParts);
    return calls.EachIs(1);
}

/// Runs a task of two parts that begin together, one on the calling thread and one on a thread of the executor.
template <class OnCaller, class OnHelper>
void RunOnBoth(OnCaller onCaller, OnHelper onHelper) {
    const std::thread::id caller = std::this_thread::get_id();
    std::latch bothBegun(2);
    ExecuteCPUBoundTaskOnAllProcessors(
        [&](int32_t) {
            bothBegun.arrive_and_wait();
            if (std::this_thread::get_id() == caller)
                onCaller();
            else
                onHelper();
        },
        2);
}

class ForkedPool : public testing::Test {
protected:
    void SetUp() override {
        if (kThreadsOfExecutor == 0) GTEST_SKIP() << "there is one processor";
    }

    boost::shared_ptr<AsyncExecutor> fExecutor = CreateCPUBoundExecutor();
};

} // namespace

TEST_F(ForkedPool, StartsItsThreadsAnewAtTheFirstTaskOfTheChild) {
    EXPECT_TRUE(RunsEveryPartOnce());
    EXPECT_EQ(EndOfChild([] {
                  if (ThreadCount() != 1) return 1;
                  if (!RunsEveryPartOnce()) return 2;
                  if (SettledThreadCount(1 + kThreadsOfExecutor) != 1 + kThreadsOfExecutor) return 3;
                  bool isOnBoth = false;
                  RunOnBoth([] {}, [&isOnBoth] { isOnBoth = true; });
                  return isOnBoth ? 0 : 4;
              }),
              0);
    EXPECT_TRUE(RunsEveryPartOnce());
}

TEST_F(ForkedPool, IsLetGoAndCreatedAnewByTheChild) {
    for (const bool hasThreads : {false, true})
        EXPECT_EQ(EndOfChild([&] {
                      if (hasThreads && !RunsEveryPartOnce()) return 1;
                      fExecutor.reset();
                      if (SettledThreadCount(1) != 1) return 2;
                      fExecutor = CreateCPUBoundExecutor();
                      if (SettledThreadCount(1 + kThreadsOfExecutor) != 1 + kThreadsOfExecutor) return 3;
                      return RunsEveryPartOnce() ? 0 : 4;
                  }),
                  0)
            << hasThreads;
}

TEST_F(ForkedPool, WorksInTheChildOfAChild) {
    EXPECT_EQ(EndOfChild([] {
                  if (!RunsEveryPartOnce()) return 1;
                  return EndOfChild([] { return RunsEveryPartOnce() ? 0 : 2; });
              }),
              0);
}

// The parts that the parent's helpers are at are lost to the child. Nobody waits for them there.
TEST_F(ForkedPool, DoesTheRestOfATaskForTheChildThatAPartForked) {
    constexpr int32_t kNobodysParts = 10;
    const auto threads = static_cast<int32_t>(kThreadsOfExecutor + 1);
    const std::thread::id caller = std::this_thread::get_id();
    std::latch allHaveBegun(threads), isForked(1);
    std::atomic<int32_t> partsDone = 0;
    pid_t child = -1;
    ExecuteCPUBoundTaskOnAllProcessors(
        [&](int32_t part) {
            if (part < threads) {
                allHaveBegun.arrive_and_wait();
                if (std::this_thread::get_id() == caller) {
                    child = ForkChild();
                    isForked.count_down();
                }
                isForked.wait();
            }
            ++partsDone;
        },
        threads + kNobodysParts);
    if (child == 0) _exit(partsDone == 1 + kNobodysParts && RunsEveryPartOnce() ? 0 : 1);
    EXPECT_EQ(EndOf(child), 0);
    EXPECT_EQ(partsDone, threads + kNobodysParts);
}

TEST_F(ForkedPool, GoesOnWithTheTaskAroundTheTaskThatForked) {
    const std::thread::id caller = std::this_thread::get_id();
    pid_t child = -1;
    std::latch isForked(1);
    std::atomic<int> outerParts = 0;
    RunOnBoth(
        [&] {
            ExecuteCPUBoundTaskOnAllProcessors(
                [&](int32_t) {
                    if (std::this_thread::get_id() != caller || child >= 0) return;
                    child = ForkChild();
                    isForked.count_down();
                },
                10000);
            ++outerParts;
        },
        [&] {
            isForked.wait();
            ++outerParts;
        });
    if (child == 0) _exit(outerParts == 1 && RunsEveryPartOnce() ? 0 : 1);
    EXPECT_EQ(EndOf(child), 0);
    EXPECT_EQ(outerParts, 2);
}

// The thread whose task it is does not exist in the child. A thread of the pool has nothing else to go back to.
TEST_F(ForkedPool, EndsTheChildWithThePartThatForkedOnAThreadOfThePool) {
    for (const bool runsATask : {false, true}) {
        pid_t child = -1;
        RunOnBoth([] {},
                  [&] {
                      child = ForkChild();
                      if (child == 0 && runsATask && !RunsEveryPartOnce()) _exit(1);
                  });
        ASSERT_NE(child, 0); // the child is not to come here
        EXPECT_EQ(EndOf(child), 0) << runsATask;
    }
}

TEST_F(ForkedPool, LetsTheChildExitWithinAPart) {
    for (const bool isOnHelper : {false, true}) {
        int end = -1;
        const auto fork = [&end] {
            end = EndOfChild([]() -> int {
                if (!RunsEveryPartOnce()) return 1;
                std::exit(0);
            });
        };
        const auto doNothing = [] {};
        isOnHelper ? RunOnBoth(doNothing, fork) : RunOnBoth(fork, doNothing);
        EXPECT_EQ(end, 0) << isOnHelper;
    }
}
