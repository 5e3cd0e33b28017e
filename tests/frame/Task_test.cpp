// Tasks run every part once wherever they are started from, and allocate nothing; start and stop take the
// executor and let it go.

#include "frame/Task.h"

#include "support/Allocations.h"
#include "support/CallCounts.h"
#include "support/ThreadCount.h"

#include <PixelKiln/Lifecycle.h>

#include <algorithm>
#include <chrono>
#include <gtest/gtest.h>
#include <stdexcept>
#include <thread>
#include <vector>

using PKTest::AllocationCount;
using PKTest::AllocationLimit;
using PKTest::CallCounts;
using PKTest::RestingThreadCount;
using PKTest::SettledThreadCount;
using namespace PK::Threading;

namespace {

class TaskTest : public testing::Test {
protected:
    TaskTest() { PK_Initialize(); }
    ~TaskTest() override { PK_Terminate(); }
};

class CountingTask : public Task {
public:
    explicit CountingTask(int32_t parts) : fParts(parts), fCalls(parts) {}

    int32_t GetPartCount() const override { return fParts; }
    void RunPart(int32_t partIndex) const override { fCalls.Add(partIndex); }

    bool EachPartRan(int times) const { return fCalls.EachIs(times); }

private:
    int32_t fParts;
    mutable CallCounts fCalls;
};

class NestingTask : public Task {
public:
    int32_t GetPartCount() const override { return 16; }
    void RunPart(int32_t) const override { RunTaskOnAllProcessors(fInner); }

    const CountingTask& Inner() const { return fInner; }

private:
    CountingTask fInner{40};
};

class ThrowingTask : public Task {
public:
    int32_t GetPartCount() const override { return 16; }
    void RunPart(int32_t partIndex) const override {
        if (partIndex == 7) throw std::runtime_error("the seventh fails");
    }
};

class EmptyTask : public Task {
public:
    int32_t GetPartCount() const override { return 64; }
    void RunPart(int32_t) const override {}
};

const size_t kThreadsOfExecutor = std::max(std::thread::hardware_concurrency(), 1u) - 1;

} // namespace

TEST_F(TaskTest, RunsEveryPartOnce) {
    for (const int32_t parts : {0, 1, 2, 64, 10000}) {
        const CountingTask task(parts);
        RunTaskOnAllProcessors(task);
        EXPECT_TRUE(task.EachPartRan(1)) << parts;
        RunTaskOnAllProcessors(task);
        EXPECT_TRUE(task.EachPartRan(2)) << parts;
    }
}

TEST_F(TaskTest, RunsATaskWithinAPart) {
    const NestingTask task;
    RunTaskOnAllProcessors(task);
    EXPECT_TRUE(task.Inner().EachPartRan(16));
}

TEST_F(TaskTest, RunsTasksOfManyThreadsAtOnce) {
    const auto work = [] {
        for (int32_t i = 0; i < 200; ++i) {
            const CountingTask task(i % 67);
            RunTaskOnAllProcessors(task);
            ASSERT_TRUE(task.EachPartRan(1)) << i;
        }
    };
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) threads.emplace_back(work);
    for (std::thread& thread : threads) thread.join();
}

TEST_F(TaskTest, LetsAnExceptionThrough) {
    EXPECT_THROW(RunTaskOnAllProcessors(ThrowingTask()), std::runtime_error);
}

TEST_F(TaskTest, AllocatesNothing) {
    const EmptyTask task;
    RunTaskOnAllProcessors(task);
    const int before = AllocationCount();
    for (int i = 0; i < 200; ++i) {
        RunTaskOnAllProcessors(task);
        std::this_thread::sleep_for(
            std::chrono::microseconds(100)); // the pool falls asleep and is woken anew
    }
    EXPECT_EQ(AllocationCount(), before);
}

TEST(TaskExecutor, LivesFromTheFirstStartToTheLastStop) {
    const size_t before = RestingThreadCount();
    PK_Initialize();
    EXPECT_EQ(SettledThreadCount(before + kThreadsOfExecutor), before + kThreadsOfExecutor);
    PK_Initialize();
    EXPECT_EQ(SettledThreadCount(before + kThreadsOfExecutor), before + kThreadsOfExecutor);
    PK_Terminate();
    EXPECT_EQ(SettledThreadCount(before + kThreadsOfExecutor), before + kThreadsOfExecutor);
    PK_Terminate();
    EXPECT_EQ(SettledThreadCount(before), before);
}

TEST(TaskExecutor, LeavesNoThreadBehindAfterManyStarts) {
    const size_t before = RestingThreadCount();
    for (int round = 0; round < 100; ++round) {
        PK_Initialize();
        const CountingTask task(64);
        RunTaskOnAllProcessors(task);
        ASSERT_TRUE(task.EachPartRan(1));
        PK_Terminate();
    }
    EXPECT_EQ(SettledThreadCount(before), before);
}

TEST(TaskExecutor, IsNotTouchedByAStopTooMany) {
    const size_t before = RestingThreadCount();
    PK_Terminate();
    PK_Initialize(); // makes good for the stop, and starts nothing
    EXPECT_EQ(SettledThreadCount(before), before);
    const CountingTask task(64);
    RunTaskOnAllProcessors(task); // on the calling thread
    EXPECT_TRUE(task.EachPartRan(1));
}

// Without memory for the pool there is none, and else it has the threads for which there is memory.
TEST(TaskExecutor, IsDoneWithoutAsFarAsThereIsNoMemoryForIt) {
    const size_t before = RestingThreadCount();
    size_t threads = 0;
    for (int granted = 0; threads < kThreadsOfExecutor; ++granted) {
        ASSERT_LT(granted, 100);
        {
            const AllocationLimit limit(granted);
            ASSERT_EQ(PK_Initialize(), PK_Success);
        }
        const size_t now = RestingThreadCount() - before;
        EXPECT_GE(now, threads) << granted;
        if (granted == 0) {
            EXPECT_EQ(now, 0u);
        }
        threads = now;
        const CountingTask task(64);
        RunTaskOnAllProcessors(task);
        EXPECT_TRUE(task.EachPartRan(1)) << granted;
        ASSERT_EQ(PK_Terminate(), PK_Success);
        EXPECT_EQ(SettledThreadCount(before), before) << granted;
    }
    EXPECT_EQ(threads, kThreadsOfExecutor);
}

TEST(TaskExecutor, IsCreatedAnewWhereThereWasOne) {
    const size_t before = RestingThreadCount();
    CreateTaskExecutor();
    CreateTaskExecutor();
    EXPECT_EQ(SettledThreadCount(before + kThreadsOfExecutor), before + kThreadsOfExecutor);
    ReleaseTaskExecutor();
    ReleaseTaskExecutor();
    EXPECT_EQ(SettledThreadCount(before), before);
}
