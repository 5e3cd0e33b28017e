// Bands take every row once, wherever they run, and the first of those that fail tells the result.

#include "frame/Bands.h"

#include "support/Allocations.h"
#include "support/CallCounts.h"

#include <PixelKiln/Lifecycle.h>

#include <algorithm>
#include <chrono>
#include <gtest/gtest.h>
#include <initializer_list>
#include <latch>
#include <stdexcept>
#include <thread>
#include <utility>
#include <vector>

using namespace PK;
using PKTest::CallCounts;

namespace {

using Rows = std::vector<std::pair<int32_t, int32_t>>;

class BandsTest : public testing::Test {
protected:
    BandsTest() { PK_Initialize(); }
    ~BandsTest() override { PK_Terminate(); }
};

/// The bands in their order, which is that of the calling thread.
Rows BandsOf(int32_t height, Bands bands) {
    Rows rows;
    EXPECT_EQ(RunInBands(height, bands.AsTaskIf(false),
                         [&rows](int32_t firstRow, int32_t endRow) {
                             rows.emplace_back(firstRow, endRow);
                             return PK_Success;
                         }),
              PK_Success);
    return rows;
}

/// Runs ten bands, of which those given fail with -100 less their number, and tells the result.
PK_Result RunWithFailures(Bands bands, std::initializer_list<int32_t> failing) {
    return RunInBands(10, bands, [failing](int32_t firstRow, int32_t) -> PK_Result {
        return std::ranges::find(failing, firstRow) != failing.end() ? -100 - firstRow : PK_Success;
    });
}

constexpr Bands kSingleRows = Bands::OfRows(1);

} // namespace

TEST_F(BandsTest, OfSixtyFiveRowsInFourTheLastHasOneMore) {
    EXPECT_EQ(BandsOf(65, Bands::Count(4)), (Rows{{0, 16}, {16, 32}, {32, 48}, {48, 65}}));
}

TEST_F(BandsTest, TheLastOfFourTakesTheWholeRemainder) {
    EXPECT_EQ(BandsOf(67, Bands::Count(4)), (Rows{{0, 16}, {16, 32}, {32, 48}, {48, 67}}));
    EXPECT_EQ(BandsOf(4, Bands::Count(4)), (Rows{{0, 1}, {1, 2}, {2, 3}, {3, 4}}));
}

TEST_F(BandsTest, MoreBandsThanRowsAreOne) {
    EXPECT_EQ(BandsOf(3, Bands::Count(4)), (Rows{{0, 3}}));
    EXPECT_EQ(BandsOf(1, Bands::Count(1000)), (Rows{{0, 1}}));
}

TEST_F(BandsTest, OfThirtyTwoRowsTheLastHasWhatIsLeft) {
    EXPECT_EQ(BandsOf(31, Bands::OfRows(32)), (Rows{{0, 31}}));
    EXPECT_EQ(BandsOf(32, Bands::OfRows(32)), (Rows{{0, 32}}));
    EXPECT_EQ(BandsOf(65, Bands::OfRows(32)), (Rows{{0, 32}, {32, 64}, {64, 65}}));
}

TEST_F(BandsTest, OfTheLargestHeightsEndWithThem) {
    EXPECT_EQ(BandsOf(INT32_MAX, Bands::OfRows(1 << 30)), (Rows{{0, 1 << 30}, {1 << 30, INT32_MAX}}));
    EXPECT_EQ(BandsOf(INT32_MAX, Bands::OfRows(INT32_MAX)), (Rows{{0, INT32_MAX}}));
    EXPECT_EQ(BandsOf(INT32_MAX, Bands::Count(2)), (Rows{{0, INT32_MAX / 2}, {INT32_MAX / 2, INT32_MAX}}));
}

TEST_F(BandsTest, OfNoRowsAreNone) {
    for (const int32_t height : {0, -1, INT32_MIN})
        for (const Bands bands : {Bands::Count(4), Bands::OfRows(32)}) {
            EXPECT_EQ(BandsOf(height, bands), Rows());
            EXPECT_EQ(RunInBands(height, bands, [](int32_t, int32_t) { return PK_ErrFailed; }), PK_Success);
        }
}

TEST_F(BandsTest, TakeEveryRowOnce) {
    for (const bool isTask : {true, false})
        for (const Bands bands : {Bands::Count(1), Bands::Count(4), Bands::Count(7), Bands::Count(200),
                                  Bands::OfRows(1), Bands::OfRows(7), Bands::OfRows(32)})
            for (int32_t height = 0; height < 150; ++height) {
                CallCounts rows(height);
                const PK_Result result =
                    RunInBands(height, bands.AsTaskIf(isTask), [&rows](int32_t firstRow, int32_t endRow) {
                        for (int32_t row = firstRow; row < endRow; ++row) rows.Add(row);
                        return PK_Success;
                    });
                EXPECT_EQ(result, PK_Success);
                EXPECT_TRUE(rows.EachIs(1)) << height;
            }
}

TEST_F(BandsTest, RunAtTheSameTime) {
    if (std::thread::hardware_concurrency() < 2) GTEST_SKIP() << "there is one processor";
    std::latch bothBegun(2);
    EXPECT_EQ(RunInBands(2, Bands::Count(2),
                         [&bothBegun](int32_t, int32_t) {
                             bothBegun.arrive_and_wait();
                             return PK_Success;
                         }),
              PK_Success);
}

TEST_F(BandsTest, StayOnTheCallingThreadWhereTheImageIsSmall) {
    const std::thread::id caller = std::this_thread::get_id();
    const auto work = [caller](int32_t, int32_t) {
        std::this_thread::sleep_for(std::chrono::microseconds(100)); // long enough for others to come
        return std::this_thread::get_id() == caller ? PK_Success : PK_ErrFailed;
    };
    for (int round = 0; round < 20; ++round) {
        EXPECT_EQ(RunInBands(20, Bands::OfRows(1).AsTaskIf(false), work), PK_Success);
        EXPECT_EQ(RunInBands(32, Bands::OfRows(32), work), PK_Success);
    }
}

TEST_F(BandsTest, GiveTheFirstFailureInTheirOrder) {
    for (const bool isTask : {true, false}) {
        const Bands bands = kSingleRows.AsTaskIf(isTask);
        EXPECT_EQ(RunWithFailures(bands, {}), PK_Success);
        EXPECT_EQ(RunWithFailures(bands, {0}), -100);
        EXPECT_EQ(RunWithFailures(bands, {9}), -109);
        for (int round = 0; round < 200; ++round) ASSERT_EQ(RunWithFailures(bands, {8, 3, 4, 9}), -103);
    }
}

TEST_F(BandsTest, GiveTheFirstFailureWhicheverComesSooner) {
    if (std::thread::hardware_concurrency() < 2) GTEST_SKIP() << "there is one processor";
    for (const int32_t later : {0, 1}) {
        std::latch bothBegun(2);
        const PK_Result result = RunInBands(2, Bands::Count(2), [&](int32_t firstRow, int32_t) -> PK_Result {
            bothBegun.arrive_and_wait();
            if (firstRow == later) std::this_thread::sleep_for(std::chrono::milliseconds(20));
            return -1 - firstRow;
        });
        EXPECT_EQ(result, -1) << later;
    }
}

TEST_F(BandsTest, AreNotBegunBehindOneThatFailed) {
    int calls = 0;
    const PK_Result result = RunInBands(10, kSingleRows.AsTaskIf(false), [&calls](int32_t firstRow, int32_t) {
        ++calls;
        return firstRow == 3 ? PK_ErrOutOfMemory : PK_Success;
    });
    EXPECT_EQ(result, PK_ErrOutOfMemory);
    EXPECT_EQ(calls, 4);
}

TEST_F(BandsTest, RunWithinBands) {
    constexpr int32_t kRows = 100, kColumns = 70;
    CallCounts pixels(kRows * kColumns);
    const PK_Result result = RunInBands(kRows, Bands::OfRows(8), [&pixels](int32_t firstRow, int32_t endRow) {
        return RunInBands(kColumns, Bands::Count(4), [&](int32_t firstColumn, int32_t endColumn) {
            for (int32_t row = firstRow; row < endRow; ++row)
                for (int32_t column = firstColumn; column < endColumn; ++column)
                    pixels.Add(row * kColumns + column);
            return PK_Success;
        });
    });
    EXPECT_EQ(result, PK_Success);
    EXPECT_TRUE(pixels.EachIs(1));
}

TEST_F(BandsTest, LetAnExceptionThrough) {
    for (const bool isTask : {true, false}) {
        const auto run = [isTask] {
            RunInBands(10, kSingleRows.AsTaskIf(isTask), [](int32_t firstRow, int32_t) -> PK_Result {
                if (firstRow == 5) throw std::out_of_range("5");
                return PK_Success;
            });
        };
        EXPECT_THROW(run(), std::out_of_range);
    }
}

TEST_F(BandsTest, AllocateNothing) {
    const auto work = [](int32_t firstRow, int32_t) { return firstRow == 70 ? PK_ErrFailed : PK_Success; };
    const int before = PKTest::AllocationCount();
    for (int i = 0; i < 200; ++i) EXPECT_EQ(RunInBands(100, kSingleRows, work), PK_ErrFailed);
    EXPECT_EQ(PKTest::AllocationCount(), before);
}
