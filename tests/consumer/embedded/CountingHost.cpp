#include "CountingHost.h"

#include "zebcore/config.h"
#include "zebcore/debug.h"
#include "zebcore/memory.h"
#include "zebcore/threads.h"

#include <boost/smart_ptr/make_shared.hpp>
#include <cstdlib>

namespace host {

Counts& Count() {
    static Counts counts;
    return counts;
}

} // namespace host

namespace zebcore {

using host::Count;

void* utility::MemoryRecycler::Allocate(uint64_t size, uint64_t* actualSize) noexcept {
    ++Count().allocations;
    *actualSize = size;
    return std::malloc(size);
}

void utility::MemoryRecycler::Recycle(void* block, uint64_t) noexcept {
    if (block != nullptr) ++Count().blocksGivenBack;
    std::free(block);
}

namespace threads {
namespace {

struct Executor final : AsyncExecutor {
    Executor() { ++Count().executors; }
    ~Executor() override { ++Count().executorsLetGo; }
};

} // namespace

uint32_t GetCurrentThreadID() noexcept {
    return 1;
}

boost::shared_ptr<AsyncExecutor> CreateCPUBoundExecutor() {
    return boost::make_shared<Executor>();
}

void ExecuteCPUBoundTaskOnAllProcessors(const boost::function<void(int32_t)>& function, int32_t count) {
    ++Count().tasks;
    for (int32_t part = 0; part < count; ++part, ++Count().parts) function(part);
}

} // namespace threads

namespace debug {

DebugDatabase& DebugDatabase::Instance() {
    static DebugDatabase database;
    return database;
}

std::string DebugDatabase::GetEntry(const std::string&, const std::string& defaultText) const {
    ++Count().settings;
    return defaultText;
}

uint32_t TraceChangeCount() noexcept {
    return 1;
}

bool TraceEnabled(const char*, int32_t, bool) {
    return false;
}

void Trace(const std::string&) {}

bool BreakAfterContractDialog(const char*, const char*, const char*, int32_t) {
    return false;
}

bool IsDebuggerAttached() noexcept {
    return false;
}

} // namespace debug

void config::ThrowError(int32_t, const char*, uint32_t, int32_t, bool, const ReplacementValue&,
                        const ReplacementValue&, const ReplacementValue&, const ReplacementValue&) {}

} // namespace zebcore
