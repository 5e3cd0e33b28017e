// A child that is forked while threads of its parent are at work all over the library can do whatever the parent can.

#include "frame/Bands.h"
#include "support/Child.h"
#include "support/Random.h"

#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <functional>
#include <gtest/gtest.h>
#include <ostream>
#include <span>
#include <string>
#include <thread>
#include <vector>

extern "C" [[gnu::weak]] size_t
__sanitizer_get_current_allocated_bytes(); // there is one with a heap of its own

namespace {

using namespace PKTest;

constexpr int32_t kWidth = 17001, kHeight = 3; // wide enough for rows from the recycler
constexpr PK_PixelFormat kFrom = PK_PixelFormat_BGRA_4444_8u, kTo = PK_PixelFormat_V210_422_10u;

using Bytes = std::vector<uint8_t>;

Bytes Image(PK_PixelFormat format) {
    return Bytes(static_cast<size_t>(PK_PixelFormatSize(format, kWidth, kHeight)));
}

const Bytes& Source() {
    static const Bytes source = Random(55).Bytes(Image(kFrom).size());
    return source;
}

/// The image converted, each row as a part of a task of its own or all at once.
Bytes Converted(int32_t rowsAtOnce) {
    const int32_t fromRowBytes = PK_PixelFormatRowBytes(kFrom, kWidth);
    const int32_t toRowBytes = PK_PixelFormatRowBytes(kTo, kWidth);
    Bytes image = Image(kTo);
    PK::RunInBands(kHeight, PK::Bands::OfRows(rowsAtOnce), [&](int32_t row, int32_t endRow) {
        return PK_Convert(Source().data() + row * fromRowBytes, fromRowBytes, kFrom,
                          image.data() + row * toRowBytes, toRowBytes, kTo, kWidth, endRow - row, 4);
    });
    return image;
}

bool ConvertsInBands() {
    static const Bytes expected = Converted(1);
    return Converted(1) == expected;
}

bool Converts() {
    static const Bytes expected = Converted(kHeight);
    return Converted(kHeight) == expected;
}

bool RunsTasksWithinTasks() {
    std::atomic<int32_t> rows = 0;
    PK::RunInBands(8, PK::Bands::OfRows(1), [&rows](int32_t, int32_t) {
        return PK::RunInBands(8, PK::Bands::OfRows(1), [&rows](int32_t, int32_t) {
            ++rows;
            return PK_Success;
        });
    });
    return rows == 64;
}

bool AllocatesAndRecycles() {
    for (uint64_t bytes = 100; bytes < 20000; bytes += 1700) {
        void* base = nullptr;
        uint64_t size = 0;
        if (PK_AllocateTransientMemoryBlock(bytes, &base, &size) == nullptr) return false;
        PK_FreeTransientMemoryBlock(base, size);
    }
    return true;
}

bool UsesColourSpaces() {
    const PK::PQColorSpace pq(true, false);
    const PK::HLGColorSpace hlg;
    const PK::DCIP3ColorSpace p3(PK::kIlluminantD50), copy(p3);
    float pixels[4 * 16] = {0.5f};
    pq.ConvertPixelsToRec709(pixels, pixels, 16, false);
    hlg.ConvertPixelsToRec709(pixels, pixels, 16, false);
    copy.ConvertPixelsFromRec709(pixels, pixels, 16, true);
    return std::equal(p3.LuminanceCoeffs(), p3.LuminanceCoeffs() + 3, copy.LuminanceCoeffs());
}

bool CopiesColourSpaces() {
    const PK::SRGBColorSpace space;
    for (int i = 0; i < 1000; ++i) {
        const PK::SRGBColorSpace copy(space);
        if (copy.LuminanceCoeffs()[1] != space.LuminanceCoeffs()[1]) return false;
    }
    return true;
}

bool AsksTheHost() {
    using namespace zebcore::debug;
    const std::string name = "Test." + std::to_string(zebcore::threads::GetCurrentThreadID());
    DebugDatabase::Instance().SetEntry(name, "busy");
    SetTraceLevel(name.c_str(), 3);
    const bool isRight =
        TraceEnabled(name.c_str(), 3, false) && DebugDatabase::Instance().GetEntry(name, "default") == "busy";
    ClearTraceLevel(name.c_str());
    DebugDatabase::Instance().RemoveEntry(name);
    return isRight;
}

bool StartsAndStops() {
    return PK_Initialize() == PK_Success && RunsTasksWithinTasks() && PK_Terminate() == PK_Success;
}

/// A thread of the parent may have one more start open than this file's tests.
bool StopsAllAndStartsAgain() {
    PK_Terminate();
    PK_Terminate();
    if (!ConvertsInBands()) return false;
    PK_Initialize();
    PK_Initialize();
    return ConvertsInBands() && StartsAndStops();
}

bool DoesEverything() {
    return Converts() && ConvertsInBands() && RunsTasksWithinTasks() && AllocatesAndRecycles() &&
           UsesColourSpaces() && CopiesColourSpaces() && AsksTheHost() && StartsAndStops();
}

bool Exits() {
    std::exit(0);
}

bool WorksAndExits() {
    std::exit(DoesEverything() ? 0 : 1);
}

bool ForksAChild() {
    return DoesEverything() && EndOfChild([]() -> int { std::exit(DoesEverything() ? 0 : 1); }) == 0;
}

struct Deed {
    const char* name;
    bool (*isDone)();
};

constexpr Deed kDeedsOfParent[] = {
    {"Converts", Converts},
    {"ConvertsInBands", ConvertsInBands},
    {"RunsTasksWithinTasks", RunsTasksWithinTasks},
    {"AllocatesAndRecycles", AllocatesAndRecycles},
    {"UsesColourSpaces", UsesColourSpaces},
    {"CopiesColourSpaces", CopiesColourSpaces},
    {"AsksTheHost", AsksTheHost},
    {"StartsAndStops", StartsAndStops},
};

constexpr Deed kDeedsOfChild[] = {
    {"DoesEverything", DoesEverything},
    {"StopsAllAndStartsAgain", StopsAllAndStartsAgain},
    {"Exits", Exits},
    {"WorksAndExits", WorksAndExits},
    {"ForksAChild", ForksAChild},
};

void PrintTo(const Deed& deed, std::ostream* stream) {
    *stream << deed.name;
}

std::string NameOfDeed(const testing::TestParamInfo<Deed>& info) {
    return info.param.name;
}

/// Threads of the parent that do the same things over and over. There are none under a sanitizer: the locks of its heap
/// stay taken in a child that is forked while other threads allocate, and the child hangs there, outside the library.
class BusyThreads {
public:
    explicit BusyThreads(std::span<const Deed> deeds) {
        for (const Deed& deed : deeds) deed.isDone(); // what is expected is known before
        if (__sanitizer_get_current_allocated_bytes != nullptr) return;
        for (const Deed& deed : deeds)
            fThreads.emplace_back([this, isDone = deed.isDone] {
                while (!fIsOver)
                    if (!isDone()) ++fFailures;
            });
    }
    ~BusyThreads() {
        fIsOver = true;
        for (std::thread& thread : fThreads) thread.join();
        EXPECT_EQ(fFailures, 0);
    }
    BusyThreads(const BusyThreads&) = delete;
    BusyThreads& operator=(const BusyThreads&) = delete;

private:
    std::atomic<bool> fIsOver = false;
    std::atomic<int> fFailures = 0;
    std::vector<std::thread> fThreads;
};

void ExpectOfChildren(int count, const Deed& deed) {
    for (int i = 0; i < count; ++i)
        ASSERT_EQ(EndOfChild([&deed] { return deed.isDone() ? 0 : 1; }), 0) << "child " << i;
}

/// What the child does.
class Fork : public testing::TestWithParam<Deed> {};
class ForkOfABusyProcess : public testing::TestWithParam<Deed> {};

} // namespace

INSTANTIATE_TEST_SUITE_P(Child, Fork, testing::ValuesIn(kDeedsOfParent), NameOfDeed);
INSTANTIATE_TEST_SUITE_P(Child, ForkOfABusyProcess, testing::ValuesIn(kDeedsOfChild), NameOfDeed);

// Nothing else is going on, so that the lock which they have in common is nearly always taken.
TEST_P(Fork, LetsTheChildDoWhatOtherThreadsOfItsParentAreDoing) {
    const Deed deeds[] = {GetParam(), GetParam()};
    const BusyThreads threads(deeds);
    ExpectOfChildren(40, GetParam());
}

TEST_P(ForkOfABusyProcess, LeavesTheChildAllItNeeds) {
    PK_Initialize();
    {
        const BusyThreads threads(kDeedsOfParent);
        ExpectOfChildren(15, GetParam());
    }
    PK_Terminate();
}
