// The decoding tables of the HDR signals against the formulas of the standards, and how a signal finds its entry.

#include "colour/DecodeTables.h"

#include "colour/Conversions.h"
#include "colour/ExactColour.h"
#include "colour/WorstError.h"

#include <atomic>
#include <cmath>
#include <limits>
#include <memory>
#include <thread>

namespace PKTest {
namespace {

using namespace PK;

TEST(PQDecodeTable, BeginsAtNothingAndEndsAtAHundred) {
    const float* table = PQDecodeTable();
    EXPECT_EQ(std::bit_cast<uint32_t>(table[0]), 0u);
    EXPECT_NEAR(table[kPQDecodeEntries - 1], 100, 1e-3);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(table) % 16, 0u);
}

TEST(PQDecodeTable, RisesAndFollowsTheStandard) {
    const float* table = PQDecodeTable();
    WorstError worst("PQ table, relative");
    for (int i = 1; i < kPQDecodeEntries; ++i) {
        const double exact = exact::PQLuminance(i / 4095.0) / 100;
        worst.Take(std::abs(double{table[i]} - exact) / exact, i);
        EXPECT_GT(table[i], table[i - 1]) << i;
    }
    // Single precision, in which the denominator of the formula cancels towards the end.
    worst.ExpectBelow(6e-5);
}

TEST(HLGDecodeTable, BeginsAtNothingAndEndsAtOne) {
    const float* table = HLGDecodeTable();
    EXPECT_EQ(std::bit_cast<uint32_t>(table[0]), 0u);
    EXPECT_NEAR(table[kHLGDecodeEntries - 1], 1, 1e-6);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(table) % 16, 0u);
}

TEST(HLGDecodeTable, RisesAndFollowsTheStandard) {
    const float* table = HLGDecodeTable();
    WorstError worst("HLG table, relative");
    for (int i = 1; i < kHLGDecodeEntries; ++i) {
        const double exact = exact::HLGSceneLight(i / 2047.0);
        worst.Take(std::abs(double{table[i]} - exact) / exact, i);
        EXPECT_GT(table[i], table[i - 1]) << i;
    }
    worst.ExpectBelow(2e-6);
}

TEST(SignalIndex, TakesTheEntryBelow) {
    EXPECT_EQ(SignalIndex(0, 4096), 0);
    EXPECT_EQ(SignalIndex(0.9f / 4095, 4096), 0);
    EXPECT_EQ(SignalIndex(1.1f / 4095, 4096), 1);
    EXPECT_EQ(SignalIndex(0.5f, 4096), 2047);
    EXPECT_EQ(SignalIndex(0x1.fffffep-1f, 4096), 4094);
    EXPECT_EQ(SignalIndex(1, 4096), 4095);
    EXPECT_EQ(SignalIndex(1, 2048), 2047);
}

TEST(SignalIndex, LimitsWhatIsNoSignal) {
    for (const float below : {-0.0f, -1e-45f, -0.5f, -3e38f, -kInfinity, kNaN, -kNaN})
        EXPECT_EQ(SignalIndex(below, 4096), 0) << below;
    for (const float above : {0x1.000002p+0f, 2.0f, 3e38f, kInfinity})
        EXPECT_EQ(SignalIndex(above, 4096), 4095) << above;
}

/// Runs a conversion of one space on eight threads that begin together, as the first use of its tables and matrices if
/// the test is run by itself.
void ConvertOnManyThreads(const ColorSpace& space, Way way, const ColorSpace& another) {
    constexpr int kThreads = 8;
    Random random(1);
    const ColourPixels source = MakePixels(Content::kHighlights, 101, random);
    std::vector<ColourPixels> results(kThreads);
    std::atomic<int> waiting = kThreads;
    std::vector<std::thread> threads;
    for (int i = 0; i < kThreads; ++i)
        threads.emplace_back([&, i] {
            --waiting;
            while (waiting > 0) std::this_thread::yield();
            results[static_cast<size_t>(i)] = Convert(space, way, source);
        });
    for (std::thread& thread : threads) thread.join();
    const ColourPixels expected = Convert(another, way, source);
    for (const ColourPixels& result : results) EXPECT_EQ(FirstDifference(source, expected, result), "");
}

TEST(DecodeTables, AreMadeOnceByManyThreads) {
    ConvertOnManyThreads(PQColorSpace(false, false), Way::kToHub, PQColorSpace(false, false));
    ConvertOnManyThreads(HLGColorSpace(), Way::kToHub, HLGColorSpace());
}

TEST(LazyMatrices, AreMadeOnceByManyThreads) {
    for (const Way way : {Way::kFromHub, Way::kToHub}) {
        ConvertOnManyThreads(PQColorSpace(true, true), way, PQColorSpace(true, true));
        ConvertOnManyThreads(DCIP3ColorSpace(kIlluminantDCI), way, DCIP3ColorSpace(kIlluminantDCI));
    }
}

} // namespace
} // namespace PKTest
