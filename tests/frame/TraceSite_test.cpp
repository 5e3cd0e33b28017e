// A site of the trace: what it writes, and that it asks the host only after a change.

#include "frame/TraceSite.h"

#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <vector>

using namespace zebcore;
using PK::TraceSite;

namespace {

std::string sTraced;

class Trace : public testing::Test {
protected:
    Trace() {
        sTraced.clear();
        debug::SetTraceSink([](const char* text) { sTraced += text; });
    }
    ~Trace() override {
        debug::SetTraceSink(nullptr);
        debug::ClearTraceLevel(kChannel);
    }

    static constexpr const char* kChannel = "PK.Test";
};

} // namespace

TEST_F(Trace, WritesALine) {
    const TraceSite site = {kChannel, 3, true};
    site.Write("a text");
    EXPECT_EQ(sTraced, "<" + std::to_string(threads::GetCurrentThreadID()) + "> <PK.Test> <3> a text\n");
}

TEST_F(Trace, GoesByItsDefaultUntilTheChannelIsSet) {
    TraceSite on = {kChannel, 3, true}, off = {kChannel, 3, false};
    EXPECT_TRUE(on.IsOn());
    EXPECT_FALSE(off.IsOn());
    debug::SetTraceLevel(kChannel, 3);
    EXPECT_TRUE(on.IsOn());
    EXPECT_TRUE(off.IsOn());
    debug::SetTraceLevel(kChannel, 2);
    EXPECT_FALSE(on.IsOn());
    EXPECT_FALSE(off.IsOn());
    debug::ClearTraceLevel(kChannel);
    EXPECT_TRUE(on.IsOn());
    EXPECT_FALSE(off.IsOn());
}

TEST_F(Trace, KeepsTheAnswerUntilAChange) {
    for (const bool kept : {false, true}) {
        TraceSite site = {kChannel, 3, !kept};
        site.answer = TraceSite::Answer(debug::TraceChangeCount(), kept);
        EXPECT_EQ(site.IsOn(), kept) << "the host would have said otherwise";
        debug::SetTraceLevel("Another", 1);
        EXPECT_EQ(site.IsOn(), !kept);
        EXPECT_EQ(site.answer, TraceSite::Answer(debug::TraceChangeCount(), !kept));
        debug::ClearTraceLevel("Another");
    }
}

TEST_F(Trace, IsAskedByAnyNumberOfThreads) {
    TraceSite site = {kChannel, 3, false};
    debug::SetTraceLevel(kChannel, 3);
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i)
        threads.emplace_back([&site] {
            for (int k = 0; k < 1000; ++k) EXPECT_TRUE(site.IsOn());
        });
    for (std::thread& thread : threads) thread.join();
}
