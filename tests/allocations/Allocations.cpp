// Makes every exported call again and again, each time with another of its allocations failed, until it asks for no more.

#include "allocations/Call.h"
#include "allocations/Trial.h"

#include <algorithm>
#include <cstdio>
#include <cstring>

namespace {

using namespace PKAllocations;

constexpr char kUsage[] = "usage: pixelkiln_allocations [--names | EXPORT...]\n"
                          "\n"
                          "Fails each allocation of all calls, or of those of the named functions. With\n"
                          "--names it prints the functions that are called.\n";
constexpr uint64_t kEndless = 10000;

std::string Joined(const Names& names) {
    std::string joined;
    for (const std::string& name : names) joined += (joined.empty() ? "" : ", ") + name;
    return joined;
}

/// What is wrong with a call, or nothing.
std::string Check(const Call& call, uint64_t& allocations) {
    const Trial undisturbed = Try(call, 0);
    allocations = undisturbed.allocations;
    if (!undisturbed.wrong.empty()) return undisturbed.wrong;
    const bool takesNone = call.memory.kind == Memory::Kind::kNone;
    if (takesNone && allocations != 0) return "asks for memory, " + std::to_string(allocations) + " times";
    if (!takesNone && allocations == 0) return "asks for no memory";
    for (uint64_t failing = 1; failing < kEndless; ++failing) {
        const Trial trial = Try(call, failing);
        const std::string which = "with allocation " + std::to_string(failing) + " failed it ";
        if (!trial.wrong.empty()) return which + trial.wrong;
        if (trial.blocksLeft != undisturbed.blocksLeft)
            return which + "leaves " + std::to_string(trial.blocksLeft) + " blocks, not " +
                   std::to_string(undisturbed.blocksLeft);
        if (trial.allocations < failing) return "";
    }
    return "asks for memory without end";
}

bool Run(const Call& call) {
    uint64_t allocations = 0;
    const std::string wrong = Check(call, allocations);
    std::printf("%s: allocations: %llu (%s)%s%s\n", Joined(call.exports).c_str(),
                static_cast<unsigned long long>(allocations), call.memory.why,
                wrong.empty() ? "" : ", WRONG: ", wrong.c_str());
    return wrong.empty();
}

bool IsNamed(const Call& call, int count, char** names) {
    return count == 0 || std::any_of(names, names + count, [&](const char* name) {
               return std::ranges::count(call.exports, name) != 0;
           });
}

} // namespace

int main(int count, char** arguments) {
    const Calls calls = Family::AllCalls();
    if (count == 2 && std::strcmp(arguments[1], "--names") == 0) {
        for (const Call& call : calls)
            for (const std::string& name : call.exports) std::puts(name.c_str());
        return 0;
    }
    bool isRight = true;
    int found = 0;
    for (const Call& call : calls) {
        if (!IsNamed(call, count - 1, arguments + 1)) continue;
        ++found;
        isRight = Run(call) && isRight;
    }
    if (found == 0) std::fputs(kUsage, stderr);
    return found == 0 ? 2 : isRight ? 0 : 1;
}
