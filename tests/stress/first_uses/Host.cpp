// The library's start and what the bundled host makes at first need.

#include "stress/first_uses/FirstUse.h"

#include "frame/SharedRandom.h"
#include "support/Random.h"

#include "zebcore/debug.h"
#include "zebcore/memory.h"
#include "zebcore/threads.h"

#include <PixelKiln/PixelKiln.h>

#include <atomic>
#include <memory>

namespace {

using namespace PKStress;

float Truth(bool value) {
    return value ? 1 : 0;
}

Answer Convert() {
    constexpr int32_t kWidth = 17001; // wide enough for rows from the recycler
    const std::vector<uint8_t> source = PKTest::Random(91).Bytes(4 * kWidth);
    const int32_t rowBytes = PK_PixelFormatRowBytes(PK_PixelFormat_V210_422_10u, kWidth);
    std::vector<uint8_t> row(static_cast<size_t>(rowBytes));
    PK_Convert(source.data(), 4 * kWidth, PK_PixelFormat_BGRA_4444_8u, row.data(), rowBytes,
               PK_PixelFormat_V210_422_10u, kWidth, 1, 4);
    return Answer(row.begin(), row.end());
}

Answer StartAndStop() {
    PK_Initialize();
    Answer answer = Convert();
    PK_Terminate();
    return answer;
}

Answer RunATask() {
    const auto executor = zebcore::threads::CreateCPUBoundExecutor();
    std::atomic<int> parts = 0;
    zebcore::threads::ExecuteCPUBoundTaskOnAllProcessors([&parts](int32_t) { ++parts; }, 20);
    return {static_cast<float>(parts), Truth(zebcore::threads::CreateCPUBoundExecutor() == executor)};
}

Answer TakeAndGiveBack() {
    using zebcore::utility::MemoryRecycler;
    uint64_t size = 0;
    void* block = MemoryRecycler::Allocate(10000, &size);
    MemoryRecycler::Recycle(block, size);
    return {static_cast<float>(size)};
}

Answer ReadASetting() {
    const std::string text = zebcore::debug::DebugDatabase::Instance().GetEntry("Test.setting", "default");
    return Answer(text.begin(), text.end());
}

/// Each thread writes a setting and traces a channel of its own.
Answer WriteASetting(size_t thread) {
    using namespace zebcore::debug;
    const std::string name = "Test." + std::to_string(thread);
    DebugDatabase::Instance().SetEntry(name, "text");
    SetTraceLevel(name.c_str(), 3);
    return {Truth(DebugDatabase::Instance().GetEntry(name, "") == "text"),
            Truth(TraceEnabled(name.c_str(), 3, false))};
}

Answer DrawANumber() {
    return {Truth(PK::SharedRandom() >= 0)};
}

const FirstUse sStart("start-and-stop", Once(StartAndStop));
const FirstUse sConvert("convert-without-start", Once(Convert));
const FirstUse sExecutor("executor", Once(RunATask));
const FirstUse sRecycler("recycler", Once(TakeAndGiveBack));
const FirstUse sSettings("settings", Once(ReadASetting));
const FirstUse sTrace("settings-written", [] { return Meeting(WriteASetting); });
const FirstUse sRandom("shared-random", Once(DrawANumber));

} // namespace
