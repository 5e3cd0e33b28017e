// Tasks on the bundled pool: every part once, nested, from many threads, with exceptions; and the executor's life.

#include "support/CallCounts.h"
#include "support/FloatEnvironment.h"
#include "support/ThreadCount.h"

#include "zebcore/CPUBoundPool.h"
#include "zebcore/threads.h"

#include <barrier>
#include <csignal>
#include <gtest/gtest.h>
#include <latch>
#include <pthread.h>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

using namespace zebcore::threads;

namespace {

using namespace PKTest;

class PoolOfThreads : public testing::TestWithParam<uint32_t> {
protected:
    /// Runs a task of which every thread takes one part, all at the same time.
    template <class Part>
    void RunOnAllThreads(const Part& part) {
        const auto threads = static_cast<int32_t>(GetParam() + 1);
        std::barrier everyone(threads);
        fPool.Run(
            [&](int32_t index) {
                everyone.arrive_and_wait();
                part(index);
            },
            threads);
    }

    CPUBoundPool fPool{GetParam()};
};

// Divides there and then, in the mode of the moment.
float Divide(float dividend, float divisor) {
    const volatile float numerator = dividend, denominator = divisor;
    const volatile float quotient = numerator / denominator;
    return quotient;
}

// Notes the floating-point mode in which its thread ends.
struct ModeAtThreadExit {
    std::atomic<uint32_t>* mode = nullptr;
    ~ModeAtThreadExit() {
        if (mode != nullptr) *mode = _mm_getcsr();
    }
};
thread_local ModeAtThreadExit sModeAtThreadExit;

void RunNested(CPUBoundPool& pool, int depth, std::atomic<int>& calls) {
    pool.Run(
        [&](int32_t) {
            ++calls;
            if (depth > 1) RunNested(pool, depth - 1, calls);
        },
        8);
}

// No thread can be had as long as this lives: its stack would be larger than any address space.
class NoMoreThreads {
public:
    NoMoreThreads() {
        pthread_getattr_default_np(&fPrevious);
        pthread_attr_t huge;
        pthread_attr_init(&huge);
        pthread_attr_setstacksize(&huge, size_t{1} << 50);
        pthread_setattr_default_np(&huge);
        pthread_attr_destroy(&huge);
    }
    ~NoMoreThreads() {
        pthread_setattr_default_np(&fPrevious);
        pthread_attr_destroy(&fPrevious);
    }

private:
    pthread_attr_t fPrevious;
};

} // namespace

INSTANTIATE_TEST_SUITE_P(CPUBoundPool, PoolOfThreads, testing::Values(0, 1, 3, 7));

TEST_P(PoolOfThreads, HasThemAll) {
    EXPECT_EQ(fPool.ThreadCount(), GetParam());
}

TEST_P(PoolOfThreads, RunsEveryPartOnce) {
    for (const int32_t count : {-1, 0, 1, 2, 3, 64, 10000}) {
        CallCounts calls(count);
        fPool.Run([&calls](int32_t part) { calls.Add(part); }, count);
        EXPECT_TRUE(calls.EachIs(1)) << count;
    }
}

TEST_P(PoolOfThreads, AllWorkTogetherWithTheCaller) {
    for (int round = 0; round < 20; ++round) {
        std::atomic<int> ofCaller = 0;
        const std::thread::id caller = std::this_thread::get_id();
        RunOnAllThreads([&](int32_t) { ofCaller += std::this_thread::get_id() == caller; });
        EXPECT_EQ(ofCaller, 1);
    }
}

TEST_P(PoolOfThreads, WorkInTheFloatingPointModeOfTheCaller) {
    for (const uint32_t mode : {0u, kRoundDown, kRoundUp, kRoundToZero, kFlushToZero, kDenormalsAreZero,
                                kRoundUp | kFlushToZero | kExceptionFlags}) {
        const FloatEnvironment environment(mode);
        const float third = Divide(1, 3), tiny = Divide(0x1p-126f, 2), denormal = Divide(0x1p-127f, 0x1p-10f);
        std::atomic<int> equal = 0;
        RunOnAllThreads([&](int32_t) {
            const bool isMode = ((_mm_getcsr() ^ (kDefaultMXCSR | mode)) & ~kExceptionFlags) == 0;
            equal += isMode && Divide(1, 3) == third && Divide(0x1p-126f, 2) == tiny &&
                     Divide(0x1p-127f, 0x1p-10f) == denormal;
        });
        EXPECT_EQ(equal, static_cast<int>(GetParam() + 1)) << std::hex << mode;
    }
}

TEST_P(PoolOfThreads, WorkInTheModeOfTheInnermostTask) {
    const FloatEnvironment environment(kRoundUp);
    std::atomic<int> wrong = 0;
    fPool.Run(
        [&](int32_t outer) {
            wrong += _mm_getcsr() != (kDefaultMXCSR | kRoundUp);
            const FloatEnvironment ofPart(outer % 2 == 0 ? kRoundDown : kFlushToZero);
            const uint32_t mode = _mm_getcsr();
            fPool.Run([&wrong, mode](int32_t) { wrong += _mm_getcsr() != mode; }, 8);
        },
        32);
    EXPECT_EQ(wrong, 0);
}

TEST_P(PoolOfThreads, GiveTheExceptionFlagsThatTheyRaiseToTheCaller) {
    constexpr uint32_t kDivideByZero = 4, kOverflow = 8, kInexact = 32;
    const auto threads = static_cast<int32_t>(GetParam() + 1);
    const FloatEnvironment environment(kOverflow);
    RunOnAllThreads([threads](int32_t part) {
        if (part == threads - 1) Divide(1, 0);
        if (part == 0) Divide(1, 3);
    });
    EXPECT_EQ(_mm_getcsr(), kDefaultMXCSR | kOverflow | kDivideByZero | kInexact);
}

TEST_P(PoolOfThreads, ShowNoTaskTheExceptionFlagsOfAnother) {
    {
        const FloatEnvironment environment(0);
        RunOnAllThreads([](int32_t) { Divide(1, 0); });
    }
    const FloatEnvironment environment(0);
    std::atomic<int> clear = 0;
    RunOnAllThreads([&clear](int32_t) { clear += _mm_getcsr() == kDefaultMXCSR; });
    EXPECT_EQ(clear, static_cast<int>(GetParam() + 1));
    EXPECT_TRUE(environment.IsAsGiven());
}

TEST_P(PoolOfThreads, GiveTheExceptionFlagsOfATaskThatThrows) {
    const FloatEnvironment environment(0);
    EXPECT_THROW(RunOnAllThreads([](int32_t) {
                     Divide(1, 0);
                     throw std::runtime_error("after the division");
                 }),
                 std::runtime_error);
    EXPECT_EQ(_mm_getcsr(), kDefaultMXCSR | 4);
}

TEST(CPUBoundPool, HasItsOwnFloatingPointModeAgainAfterATask) {
    std::atomic<uint32_t> modeOfHelper = 0;
    {
        const FloatEnvironment atStart(kRoundDown);
        CPUBoundPool pool(1);
        const FloatEnvironment ofTask(kRoundUp | kFlushToZero);
        std::latch bothBegun(2);
        const std::thread::id caller = std::this_thread::get_id();
        pool.Run(
            [&](int32_t) {
                bothBegun.arrive_and_wait();
                if (std::this_thread::get_id() == caller) return;
                sModeAtThreadExit.mode = &modeOfHelper;
                Divide(1, 0);
            },
            2);
    }
    EXPECT_EQ(modeOfHelper, kDefaultMXCSR | kRoundDown);
}

TEST_P(PoolOfThreads, RunsTasksWithinTasks) {
    std::atomic<int> calls = 0;
    RunNested(fPool, 4, calls);
    EXPECT_EQ(calls, 8 + 8 * 8 + 8 * 8 * 8 + 8 * 8 * 8 * 8);
}

TEST_P(PoolOfThreads, ServesManyThreadsAtOnce) {
    const auto work = [this](int seed) {
        for (int i = 0; i < 300; ++i) {
            const int32_t count = (seed * 31 + i * 7) % 70;
            CallCounts calls(count);
            fPool.Run([&calls](int32_t part) { calls.Add(part); }, count);
            ASSERT_TRUE(calls.EachIs(1)) << count;
        }
    };
    std::vector<std::thread> threads;
    for (int seed = 0; seed < 8; ++seed) threads.emplace_back(work, seed);
    for (std::thread& thread : threads) thread.join();
}

TEST_P(PoolOfThreads, CarriesTheFirstExceptionAndSkipsTheRest) {
    const auto threads = static_cast<int32_t>(GetParam() + 1);
    std::barrier everyone(threads);
    std::atomic<int> calls = 0;
    try {
        fPool.Run(
            [&](int32_t part) {
                ++calls;
                everyone.arrive_and_wait(); // all have begun a part before one of them throws
                throw std::runtime_error("part " + std::to_string(part));
            },
            10000);
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        const std::string text = error.what();
        EXPECT_LT(std::stoi(text.substr(5)), threads) << text;
    }
    EXPECT_EQ(calls, threads);
    CallCounts after(64);
    fPool.Run([&after](int32_t part) { after.Add(part); }, 64);
    EXPECT_TRUE(after.EachIs(1));
}

TEST_P(PoolOfThreads, CarriesAnExceptionOutOfATaskWithinATask) {
    const auto run = [this] {
        fPool.Run(
            [this](int32_t outer) {
                fPool.Run(
                    [outer](int32_t inner) {
                        if (outer == 5 && inner == 3) throw std::out_of_range("5, 3");
                    },
                    8);
            },
            8);
    };
    EXPECT_THROW(run(), std::out_of_range);
}

TEST(CPUBoundPool, WaitsForPartsThatHaveBegunWhenOneThrows) {
    CPUBoundPool pool(1);
    std::latch bothBegun(2);
    std::atomic<bool> isDone = false;
    const std::thread::id caller = std::this_thread::get_id();
    const auto run = [&] {
        pool.Run(
            [&](int32_t) {
                bothBegun.arrive_and_wait();
                if (std::this_thread::get_id() == caller) throw std::runtime_error("the caller's part");
                std::this_thread::sleep_for(std::chrono::milliseconds(20));
                isDone = true;
            },
            2);
    };
    EXPECT_THROW(run(), std::runtime_error);
    EXPECT_TRUE(isDone);
}

TEST(CPUBoundPool, CarriesAnExceptionFromAThreadOfItsOwn) {
    CPUBoundPool pool(1);
    std::latch bothBegun(2);
    const std::thread::id caller = std::this_thread::get_id();
    const auto run = [&] {
        pool.Run(
            [&](int32_t) {
                bothBegun.arrive_and_wait();
                if (std::this_thread::get_id() != caller) throw std::runtime_error("the helper's part");
            },
            2);
    };
    EXPECT_THROW(run(), std::runtime_error);
}

TEST(CPUBoundPool, CarriesTheExceptionThatCameFirst) {
    CPUBoundPool pool(1);
    std::latch bothBegun(2);
    const std::thread::id caller = std::this_thread::get_id();
    try {
        pool.Run(
            [&](int32_t) {
                bothBegun.arrive_and_wait();
                if (std::this_thread::get_id() == caller) throw std::runtime_error("first");
                std::this_thread::sleep_for(std::chrono::milliseconds(100));
                throw std::runtime_error("second");
            },
            2);
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "first");
    }
}

TEST_P(PoolOfThreads, LeaveSignalsButTheirOwnFaultsToTheProgram) {
    std::atomic<int> blockSignals = 0, blockFaults = 0;
    RunOnAllThreads([&](int32_t) {
        sigset_t mask;
        pthread_sigmask(SIG_SETMASK, nullptr, &mask);
        blockSignals += sigismember(&mask, SIGTERM) == 1 && sigismember(&mask, SIGALRM) == 1;
        for (const int fault : {SIGBUS, SIGFPE, SIGILL, SIGSEGV}) blockFaults += sigismember(&mask, fault);
    });
    EXPECT_EQ(blockSignals, static_cast<int>(GetParam())); // all but the caller
    EXPECT_EQ(blockFaults, 0);
}

TEST(CPUBoundPool, WorksWithoutTheThreadsThatCannotBeHad) {
    const NoMoreThreads scope;
    CPUBoundPool pool(4);
    EXPECT_EQ(pool.ThreadCount(), 0u);
    CallCounts calls(100);
    pool.Run([&calls](int32_t part) { calls.Add(part); }, 100);
    EXPECT_TRUE(calls.EachIs(1));
}

TEST(CPUBoundExecutor, IsOneForAllWhoHoldIt) {
    const boost::shared_ptr<AsyncExecutor> first = CreateCPUBoundExecutor();
    ASSERT_NE(first, nullptr);
    EXPECT_EQ(CreateCPUBoundExecutor(), first);
}

TEST(CPUBoundExecutor, TakesItsThreadsAway) {
    const size_t before = PKTest::RestingThreadCount();
    for (int round = 0; round < 100; ++round) {
        const boost::shared_ptr<AsyncExecutor> executor = CreateCPUBoundExecutor();
        CallCounts calls(64);
        ExecuteCPUBoundTaskOnAllProcessors([&calls](int32_t part) { calls.Add(part); }, 64);
        ASSERT_TRUE(calls.EachIs(1));
    }
    EXPECT_EQ(PKTest::SettledThreadCount(before), before);
}

TEST(CPUBoundExecutor, MayBeLetGoWhileATaskRuns) {
    boost::shared_ptr<AsyncExecutor> executor = CreateCPUBoundExecutor();
    CallCounts calls(64);
    ExecuteCPUBoundTaskOnAllProcessors(
        [&](int32_t part) {
            if (part == 0) executor.reset();
            calls.Add(part);
        },
        64);
    EXPECT_TRUE(calls.EachIs(1));
}

TEST(CPUBoundTask, RunsOnTheCallingThreadWithoutAnExecutor) {
    const std::thread::id caller = std::this_thread::get_id();
    std::vector<int32_t> parts;
    ExecuteCPUBoundTaskOnAllProcessors(
        [&](int32_t part) {
            EXPECT_EQ(std::this_thread::get_id(), caller);
            parts.push_back(part);
        },
        4);
    EXPECT_EQ(parts, (std::vector<int32_t>{0, 1, 2, 3}));
    for (const int32_t none : {0, -1, INT32_MIN})
        ExecuteCPUBoundTaskOnAllProcessors([](int32_t) { FAIL(); }, none);
}

TEST(CPUBoundTask, ThrowsOnTheCallingThreadWithoutAnExecutor) {
    int calls = 0;
    const auto run = [&calls] {
        ExecuteCPUBoundTaskOnAllProcessors(
            [&calls](int32_t) {
                ++calls;
                throw std::runtime_error("the first part");
            },
            4);
    };
    EXPECT_THROW(run(), std::runtime_error);
    EXPECT_EQ(calls, 1);
}
