// The bundled recycler reuses blocks by size class and keeps no more than its cap.

#include "zebcore/RecyclerPool.h"
#include "zebcore/memory.h"

#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <thread>
#include <vector>

using zebcore::utility::MemoryRecycler;
using zebcore::utility::RecyclerPool;

namespace {

constexpr uint64_t kMegabyte = uint64_t{1} << 20;

// A pool of the test's own, emptied at its end.
struct Pool : RecyclerPool {
    explicit Pool(uint64_t cap) : RecyclerPool(cap) {}
    ~Pool() { SetCap(0); }

    void* Take(uint64_t size) {
        uint64_t actual = 0;
        void* block = Allocate(size, &actual);
        EXPECT_NE(block, nullptr);
        EXPECT_EQ(actual, ClassSize(size));
        return block;
    }
    void Give(void* block, uint64_t size) { Recycle(block, ClassSize(size)); }
};

} // namespace

TEST(RecyclerPool, ClassesWasteAQuarterAtMost) {
    EXPECT_EQ(RecyclerPool::ClassSize(0), 4096u);
    EXPECT_EQ(RecyclerPool::ClassSize(4096), 4096u);
    EXPECT_EQ(RecyclerPool::ClassSize(4097), 5120u);
    EXPECT_EQ(RecyclerPool::ClassSize(5121), 6144u);
    EXPECT_EQ(RecyclerPool::ClassSize(7169), 8192u);
    EXPECT_EQ(RecyclerPool::ClassSize(8192), 8192u);
    EXPECT_EQ(RecyclerPool::ClassSize(8193), 10240u);
    EXPECT_EQ(RecyclerPool::ClassSize(1024 * kMegabyte), 1024 * kMegabyte);
    EXPECT_EQ(RecyclerPool::ClassSize(1024 * kMegabyte + 1), 1024 * kMegabyte + 1);
    uint64_t last = 0;
    for (uint64_t size = 4096; size <= 1024 * kMegabyte; size += size / 61 + 1) {
        const uint64_t classSize = RecyclerPool::ClassSize(size);
        EXPECT_GE(classSize, size);
        EXPECT_LE(classSize, size + size / 4 + 1) << size;
        EXPECT_GE(classSize, last);
        EXPECT_EQ(RecyclerPool::ClassSize(classSize), classSize);
        last = classSize;
    }
}

TEST(RecyclerPool, HandsABlockOutAgain) {
    Pool pool(16 * kMegabyte);
    void* block = pool.Take(3 * kMegabyte);
    EXPECT_EQ(pool.KeptBytes(), 0u);
    pool.Give(block, 3 * kMegabyte);
    EXPECT_EQ(pool.KeptBytes(), RecyclerPool::ClassSize(3 * kMegabyte));
    EXPECT_EQ(pool.Take(3 * kMegabyte - 100), block);
    EXPECT_EQ(pool.KeptBytes(), 0u);
    void* second = pool.Take(3 * kMegabyte); // the only block is out
    EXPECT_NE(second, block);
    pool.Give(second, 3 * kMegabyte);
    pool.Give(block, 3 * kMegabyte);
}

TEST(RecyclerPool, KeepsClassesApart) {
    Pool pool(16 * kMegabyte);
    void* small = pool.Take(5000);
    void* large = pool.Take(9000);
    pool.Give(small, 5000);
    pool.Give(large, 9000);
    EXPECT_EQ(pool.Take(9000), large);
    EXPECT_EQ(pool.Take(5000), small);
    pool.Give(small, 5000);
    pool.Give(large, 9000);
}

TEST(RecyclerPool, KeepsNoMoreThanItsCap) {
    Pool pool(4 * kMegabyte);
    std::vector<void*> blocks;
    for (int i = 0; i < 10; ++i) blocks.push_back(pool.Take(kMegabyte));
    for (void* block : blocks) {
        pool.Give(block, kMegabyte);
        EXPECT_LE(pool.KeptBytes(), 4 * kMegabyte);
    }
    EXPECT_EQ(pool.KeptBytes(), 4 * kMegabyte);
}

TEST(RecyclerPool, GivesUpTheClassThatWasQuietForLongest) {
    Pool pool(4 * kMegabyte);
    void* old = pool.Take(2 * kMegabyte);
    void* recent = pool.Take(kMegabyte);
    pool.Give(old, 2 * kMegabyte);
    pool.Give(recent, kMegabyte);
    void* other = pool.Take(kMegabyte + kMegabyte / 2);
    pool.Give(other, kMegabyte + kMegabyte / 2); // 4.5 MB in all
    EXPECT_EQ(pool.KeptBytes(), 2 * kMegabyte + kMegabyte / 2);
    EXPECT_EQ(pool.Take(kMegabyte), recent);
    EXPECT_EQ(pool.Take(kMegabyte + kMegabyte / 2), other);
    EXPECT_EQ(pool.KeptBytes(), 0u);
    pool.Give(recent, kMegabyte);
    pool.Give(other, kMegabyte + kMegabyte / 2);
}

TEST(RecyclerPool, TakesAClassThatServesAsBusy) {
    Pool pool(4 * kMegabyte);
    void* first = pool.Take(kMegabyte);
    void* second = pool.Take(kMegabyte);
    void* quiet = pool.Take(2 * kMegabyte);
    pool.Give(first, kMegabyte);
    pool.Give(second, kMegabyte);
    pool.Give(quiet, 2 * kMegabyte);
    ASSERT_EQ(pool.Take(kMegabyte), second); // the last thing done with that class
    pool.Give(pool.Take(kMegabyte + kMegabyte / 2), kMegabyte + kMegabyte / 2); // 4.5 MB in all
    ASSERT_EQ(pool.KeptBytes(), 2 * kMegabyte + kMegabyte / 2);
    ASSERT_EQ(pool.Take(kMegabyte), first);
    pool.Give(first, kMegabyte);
    pool.Give(second, kMegabyte);
}

TEST(RecyclerPool, TakesAClassThatGetsABlockBackAsBusy) {
    Pool pool(4 * kMegabyte);
    void* busy = pool.Take(kMegabyte);
    void* quiet = pool.Take(2 * kMegabyte);
    pool.Give(quiet, 2 * kMegabyte);
    pool.Give(busy, kMegabyte);
    pool.Give(pool.Take(kMegabyte + kMegabyte / 2), kMegabyte + kMegabyte / 2); // 4.5 MB in all
    ASSERT_EQ(pool.KeptBytes(), 2 * kMegabyte + kMegabyte / 2);
    ASSERT_EQ(pool.Take(kMegabyte), busy);
    pool.Give(busy, kMegabyte);
}

TEST(RecyclerPool, GivesUpOneClassAfterTheOtherInTheOrderOfTheirLastUse) {
    Pool pool(8 * kMegabyte);
    const uint64_t sizes[] = {2 * kMegabyte, kMegabyte / 2, 3 * kMegabyte, kMegabyte}; // the oldest first
    std::vector<void*> blocks;
    for (const uint64_t size : sizes) blocks.push_back(pool.Take(size));
    for (size_t i = 0; i < blocks.size(); ++i) pool.Give(blocks[i], sizes[i]);
    uint64_t kept = 6 * kMegabyte + kMegabyte / 2;
    for (const uint64_t size : sizes) {
        pool.SetCap(kept - 1); // one byte too few
        kept -= size;
        EXPECT_EQ(pool.KeptBytes(), kept);
    }
}

TEST(RecyclerPool, KeepsNothingLargerThanItsCapOrOfAForeignSize) {
    Pool pool(kMegabyte);
    void* small = pool.Take(4096);
    pool.Give(small, 4096);
    pool.Give(pool.Take(2 * kMegabyte), 2 * kMegabyte);
    EXPECT_EQ(pool.KeptBytes(), 4096u); // what was there stays

    pool.Recycle(pool.Take(5000), 5000); // no class has this size
    EXPECT_EQ(pool.KeptBytes(), 4096u);
    pool.Recycle(nullptr, 4096);
    EXPECT_EQ(pool.KeptBytes(), 4096u);
}

TEST(RecyclerPool, EmptiesWhenTheCapGoes) {
    Pool pool(16 * kMegabyte);
    pool.Give(pool.Take(kMegabyte), kMegabyte);
    pool.SetCap(0);
    EXPECT_EQ(pool.KeptBytes(), 0u);
    pool.Give(pool.Take(kMegabyte), kMegabyte);
    EXPECT_EQ(pool.KeptBytes(), 0u);
}

TEST(RecyclerPool, ReportsMemoryThatCannotBeHad) {
    Pool pool(kMegabyte);
    uint64_t actual = 9;
    EXPECT_EQ(pool.Allocate(std::numeric_limits<uint64_t>::max() / 2, &actual), nullptr);
    EXPECT_EQ(pool.Allocate(std::numeric_limits<uint64_t>::max(), &actual), nullptr);
    EXPECT_EQ(pool.Allocate(uint64_t{1} << 38, &actual), nullptr);
    EXPECT_EQ(actual, 9u);
}

TEST(RecyclerPool, GivesNoBlockToTwoThreads) {
    Pool pool(2 * kMegabyte);
    const auto work = [&pool](uint8_t mark) {
        for (uint64_t i = 0; i < 4000; ++i) {
            const uint64_t size = 4096 + i * 37 % 60000;
            uint64_t actual = 0;
            auto* block = static_cast<uint8_t*>(pool.Allocate(size, &actual));
            ASSERT_NE(block, nullptr);
            std::memset(block, mark, size);
            std::this_thread::yield();
            ASSERT_EQ(block[0], mark);
            ASSERT_EQ(block[size / 2], mark);
            ASSERT_EQ(block[size - 1], mark);
            pool.Recycle(block, actual);
        }
    };
    std::vector<std::thread> threads;
    for (uint8_t mark = 1; mark <= 4; ++mark) threads.emplace_back(work, mark);
    for (std::thread& thread : threads) thread.join();
    EXPECT_LE(pool.KeptBytes(), 2 * kMegabyte);
    EXPECT_GT(pool.KeptBytes(), 0u);
}

TEST(MemoryRecycler, ServesTheProcessFromOnePool) {
    uint64_t size = 0;
    void* block = MemoryRecycler::Allocate(8 * kMegabyte + 5, &size);
    ASSERT_NE(block, nullptr);
    EXPECT_GE(size, 8 * kMegabyte + 5);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(block) % 16, 0u);
    MemoryRecycler::Recycle(block, size);
    uint64_t again = 0;
    EXPECT_EQ(MemoryRecycler::Allocate(8 * kMegabyte + 5, &again), block);
    EXPECT_EQ(again, size);
    MemoryRecycler::Recycle(block, size);
    MemoryRecycler::Recycle(nullptr, size);
}
