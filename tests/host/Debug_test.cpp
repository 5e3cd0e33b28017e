// The bundled settings, trace and contract reports.

#include "zebcore/config.h"
#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <gtest/gtest.h>
#include <string>
#include <sys/ptrace.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

using namespace zebcore;

namespace {

std::string sTraced;

class HostTrace : public testing::Test {
protected:
    HostTrace() {
        sTraced.clear();
        debug::SetTraceSink([](const char* text) { sTraced += text; });
    }
    ~HostTrace() override { debug::SetTraceSink(nullptr); }
};

} // namespace

TEST(DebugDatabase, GivesTheEntryOrTheDefault) {
    debug::DebugDatabase& database = debug::DebugDatabase::Instance();
    EXPECT_EQ(&database, &debug::DebugDatabase::Instance());
    EXPECT_EQ(database.GetEntry("Test.entry", "default"), "default");
    database.SetEntry("Test.entry", "first");
    EXPECT_EQ(database.GetEntry("Test.entry", "default"), "first");
    database.SetEntry("Test.entry", "");
    EXPECT_EQ(database.GetEntry("Test.entry", "default"), "");
    database.RemoveEntry("Test.entry");
    database.RemoveEntry("Test.entry");
    EXPECT_EQ(database.GetEntry("Test.entry", "default"), "default");
}

TEST_F(HostTrace, GoesToTheSink) {
    debug::Trace("one\n");
    debug::Trace("two\n");
    EXPECT_EQ(sTraced, "one\ntwo\n");
}

TEST_F(HostTrace, GoesToStandardErrorWithoutASink) {
    debug::SetTraceSink(nullptr);
    testing::internal::CaptureStderr();
    debug::Trace("a line\n");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "a line\n");
    EXPECT_EQ(sTraced, "");
}

TEST_F(HostTrace, AnswersByChannelAndLevelAndCountsChanges) {
    EXPECT_TRUE(debug::TraceEnabled("Test.channel", 5, true));
    EXPECT_FALSE(debug::TraceEnabled("Test.channel", 5, false));
    const uint32_t before = debug::TraceChangeCount();
    debug::SetTraceLevel("Test.channel", 3);
    EXPECT_NE(debug::TraceChangeCount(), before);
    EXPECT_TRUE(debug::TraceEnabled("Test.channel", 3, false));
    EXPECT_FALSE(debug::TraceEnabled("Test.channel", 4, true));
    EXPECT_TRUE(debug::TraceEnabled("Test.other", 4, true));
    const uint32_t between = debug::TraceChangeCount();
    debug::ClearTraceLevel("Test.channel");
    EXPECT_NE(debug::TraceChangeCount(), between);
    EXPECT_TRUE(debug::TraceEnabled("Test.channel", 5, true));
}

TEST_F(HostTrace, TellsAViolatedContract) {
    EXPECT_TRUE(debug::BreakAfterContractDialog("width > 0", "Src/Unit", "Scale", 12));
    EXPECT_EQ(sTraced, "Src/Unit:12: Scale: contract violated: width > 0\n");
}

TEST_F(HostTrace, TellsAnErrorAndReturns) {
    const config::ReplacementValue none;
    config::ThrowError(0, "$$$/key/Name=It went wrong!", 105, 25, true, none, none, none, none);
    EXPECT_EQ(sTraced, "error 105 (category 25, level 0): It went wrong!\n");
    config::ThrowError(1, "No key", 7, 8, true, none, none, none, none);
    EXPECT_EQ(sTraced, "error 105 (category 25, level 0): It went wrong!\n"
                       "error 7 (category 8, level 1): No key\n");
    config::ThrowError(0, "quiet", 7, 8, false, none, none, none, none);
    EXPECT_EQ(sTraced.find("quiet"), std::string::npos);
}

TEST(HostDebugger, IsSeenOnceItIsThere) {
    constexpr int kSeen = 0, kMissed = 1, kImagined = 2, kForbidden = 3;
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        if (debug::IsDebuggerAttached()) _exit(kImagined);
        if (ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0) _exit(kForbidden);
        _exit(debug::IsDebuggerAttached() ? kSeen : kMissed);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) == kForbidden) GTEST_SKIP() << "this system lets nobody trace";
    EXPECT_EQ(WEXITSTATUS(status), kSeen);
}

TEST(HostThreads, HaveDifferentNumbers) {
    const uint32_t here = threads::GetCurrentThreadID();
    EXPECT_NE(here, 0u);
    EXPECT_EQ(threads::GetCurrentThreadID(), here);
    uint32_t there = 0;
    std::thread([&there] { there = threads::GetCurrentThreadID(); }).join();
    EXPECT_NE(there, here);
    EXPECT_NE(there, 0u);
}
