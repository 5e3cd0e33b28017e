// The warning of an initialiser: its text, its conditions, and how seldom the host is asked for them.

#include "frame/PrimitivesStart.h"

#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <gtest/gtest.h>
#include <string>
#include <thread>

using namespace zebcore;
using PK::TraceInitialiserWarning;
using PK::TraceSite;

namespace {

std::string sTraced;

class PrimitivesStart : public testing::Test {
protected:
    PrimitivesStart() {
        sTraced.clear();
        debug::SetTraceSink([](const char* text) { sTraced += text; });
    }
    ~PrimitivesStart() override {
        debug::SetTraceSink(nullptr);
        debug::ClearTraceLevel("PK.InitIpp");
    }

    static TraceSite Site() { return {"PK.InitIpp", 5, true}; }

    static std::string Line(const std::string& thread, const std::string& text) {
        return "<" + thread + "> <PK.InitIpp> <5> ippInit warning: " + text + "\n";
    }
    static std::string Line(const std::string& text) {
        return Line(std::to_string(threads::GetCurrentThreadID()), text);
    }
};

} // namespace

TEST_F(PrimitivesStart, WarnsInOneLine) {
    TraceSite site = Site();
    TraceInitialiserWarning(site, 1, "slow path");
    EXPECT_EQ(sTraced, Line("slow path"));
    TraceInitialiserWarning(site, 20, "");
    EXPECT_EQ(sTraced, Line("slow path") + Line(""));
}

TEST_F(PrimitivesStart, TellsTheThread) {
    std::string thread;
    std::thread([&thread] {
        TraceSite site = Site();
        thread = std::to_string(threads::GetCurrentThreadID());
        TraceInitialiserWarning(site, 1, "text");
    }).join();
    EXPECT_EQ(sTraced, Line(thread, "text"));
    EXPECT_NE(sTraced, Line("text"));
}

TEST_F(PrimitivesStart, IsSilentOnSuccessAndErrors) {
    TraceSite site = Site();
    for (const int32_t status : {0, -1, -8, INT32_MIN}) TraceInitialiserWarning(site, status, "text");
    EXPECT_EQ(sTraced, "");
}

TEST_F(PrimitivesStart, GoesByTheLevelOfTheChannel) {
    TraceSite site = Site();
    debug::SetTraceLevel("PK.InitIpp", 4);
    TraceInitialiserWarning(site, 1, "a");
    EXPECT_EQ(sTraced, "");
    debug::SetTraceLevel("PK.InitIpp", 5);
    TraceInitialiserWarning(site, 1, "b");
    EXPECT_EQ(sTraced, Line("b"));
    debug::SetTraceLevel("PK.InitIpp", -1);
    TraceInitialiserWarning(site, 1, "c");
    EXPECT_EQ(sTraced, Line("b"));
    debug::ClearTraceLevel("PK.InitIpp");
    TraceInitialiserWarning(site, 1, "d");
    EXPECT_EQ(sTraced, Line("b") + Line("d"));
}

TEST_F(PrimitivesStart, KeepsTheAnswerUntilAChange) {
    TraceSite site = Site();
    site.answer = TraceSite::Answer(debug::TraceChangeCount(), false);
    TraceInitialiserWarning(site, 1, "kept");
    EXPECT_EQ(sTraced, ""); // the host would have said yes
    debug::SetTraceLevel("Another", 1);
    TraceInitialiserWarning(site, 1, "asked");
    EXPECT_EQ(sTraced, Line("asked"));
    EXPECT_EQ(site.answer, TraceSite::Answer(debug::TraceChangeCount(), true));
    debug::ClearTraceLevel("Another");
}

TEST_F(PrimitivesStart, HasNothingToWarnOfToday) {
    PK::StartPrimitives();
    EXPECT_EQ(sTraced, "");
}
