#include "allocations/Trial.h"

#include "allocations/Allocator.h"

#include <PixelKiln/Lifecycle.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

namespace PKAllocations {
namespace {

/// What the process of a trial leaves to its parent.
struct Report {
    uint64_t allocations;
    int64_t blocksLeft;
    char wrong[200];
};

using Block = std::vector<uint8_t>;

/// Distances of blocks are drawn, and decide on the sizes that are asked for: they are the same for every call.
PK_Result Make(const Call& call, Block& block) {
    std::srand(1);
    return call.make(block.data());
}

const char* WrongWithoutFailure(const Call& call, PK_Result result, const Block& block) {
    if (result != call.result) return "an undisturbed call has another result than told";
    if ((block == call.before) == (result == PK_Success)) return "an undisturbed call does not work";
    return nullptr;
}

const char* WrongWithFailure(const Call& call, PK_Result result, const Block& block, const Block& finished) {
    if (call.memory.kind == Memory::Kind::kOrFinished)
        return result != call.result ? "is not a success" : block != finished ? "is not finished" : nullptr;
    if (result != PK_ErrOutOfMemory) return "is not told as PK_ErrOutOfMemory";
    return block != call.before ? "has changed the destination" : nullptr;
}

const char* RunTrial(const Call& call, uint64_t failing, Report& report) {
    Block block = call.before, finished = call.before, again = call.before;
    if (!call.startsLibrary) PK_Initialize();
    const int64_t blocksBefore = LiveBlocks();
    PK_Result result;
    {
        const AllocationScope scope(failing);
        result = Make(call, block);
        report.allocations = scope.Count();
    }
    const PK_Result resultAfterwards = Make(call, finished);
    report.blocksLeft = LiveBlocks() - blocksBefore;
    Make(call, again);
    const bool grows = LiveBlocks() - blocksBefore != report.blocksLeft;
    if (!call.startsLibrary) PK_Terminate();

    if (const char* wrong = WrongWithoutFailure(call, resultAfterwards, finished)) return wrong;
    if (again != finished) return "two undisturbed calls differ";
    if (grows) return "each call leaves a block behind";
    if (failing != 0 && failing <= report.allocations) return WrongWithFailure(call, result, block, finished);
    return result != resultAfterwards || block != finished ? "the first call differs" : nullptr;
}

[[noreturn]] void RunChild(const Call& call, uint64_t failing, Report& report) {
    const char* wrong = RunTrial(call, failing, report);
    std::snprintf(report.wrong, sizeof report.wrong, "%s", wrong == nullptr ? "" : wrong);
    std::exit(0);
}

std::string WrongOfStatus(int status) {
    if (WIFSIGNALED(status)) return std::string("ends the process: ") + strsignal(WTERMSIG(status));
    return WEXITSTATUS(status) == 0 ? "" : "exits with " + std::to_string(WEXITSTATUS(status));
}

} // namespace

Trial Try(const Call& call, uint64_t failing) {
    void* const shared =
        mmap(nullptr, sizeof(Report), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
    if (shared == MAP_FAILED) return {0, 0, "no memory for its report"};
    auto* const report = static_cast<Report*>(shared);
    std::fflush(nullptr); // or the child would write it too
    const pid_t child = fork();
    if (child == 0) RunChild(call, failing, *report);
    int status = 0;
    const bool isChild = child > 0 && waitpid(child, &status, 0) == child;
    Trial trial = {report->allocations, report->blocksLeft,
                   isChild ? WrongOfStatus(status) : "no process for it"};
    if (trial.wrong.empty()) trial.wrong = report->wrong;
    munmap(shared, sizeof(Report));
    return trial;
}

} // namespace PKAllocations
