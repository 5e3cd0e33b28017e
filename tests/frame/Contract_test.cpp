// How the host hears of a broken contract.

#include "frame/Contract.h"

#include "zebcore/debug.h"

#include <csignal>
#include <gtest/gtest.h>
#include <string>
#include <sys/ptrace.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

std::string sTraced;

void Report() {
    PK::ReportContractViolation("width > 0", "Src/Unit", "PK::Scale", 12);
}

} // namespace

TEST(Contract, IsReportedByItsPlaceAndThenAsAnError) {
    sTraced.clear();
    zebcore::debug::SetTraceSink([](const char* text) { sTraced += text; });
    Report();
    zebcore::debug::SetTraceSink(nullptr);
    EXPECT_EQ(sTraced, "Src/Unit:12: PK::Scale: contract violated: width > 0\n"
                       "error 105 (category 25, level 0): An input contract violation has occurred!\n");
}

TEST(Contract, StopsInADebugger) {
    constexpr int kWentOn = 0, kForbidden = 3;
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        zebcore::debug::SetTraceSink([](const char*) {});
        if (ptrace(PTRACE_TRACEME, 0, nullptr, nullptr) != 0) _exit(kForbidden);
        Report();
        _exit(kWentOn);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    if (WIFEXITED(status) && WEXITSTATUS(status) == kForbidden)
        GTEST_SKIP() << "this system lets nobody trace";
    ASSERT_TRUE(WIFSTOPPED(status));
    EXPECT_EQ(WSTOPSIG(status), SIGTRAP);
    ASSERT_EQ(ptrace(PTRACE_CONT, child, nullptr, nullptr), 0);
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), kWentOn) << "the caller goes on behind the stop";
}
