// Bundled settings and trace of the host.

#include "zebcore/debug.h"

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <mutex>
#include <pthread.h>
#include <string_view>
#include <unistd.h>

namespace zebcore::debug {
namespace {

// One, not zero: a site whose kept count is still zero asks for its first answer.
std::atomic<uint32_t> sTraceChanges{1};
std::atomic<TraceSink> sTraceSink{nullptr};

// Guards what follows. Both tables are made as the library is loaded, ahead of those who fill them: a
// fork would leave the child with one that another thread of the parent was just making at its first use.
constinit std::mutex sMutex;
[[gnu::init_priority(101)]] std::map<std::string, int32_t, std::less<>> sHighestLevels;
[[gnu::init_priority(101)]] DebugDatabase sDatabase;
bool sHasReadEnvironment = false;

[[gnu::constructor(101)]] void FollowForks() {
    constexpr auto goOn = [] { sMutex.unlock(); };
    pthread_atfork([] { sMutex.lock(); }, goOn, goOn);
}

// A piece without "=" is no setting.
void ReadEnvironment(std::map<std::string, std::string>& settings) {
    const char* list = secure_getenv("PIXELKILN_SETTINGS");
    std::string_view rest = list != nullptr ? list : "";
    while (!rest.empty()) {
        const std::string_view piece = rest.substr(0, rest.find(','));
        rest.remove_prefix(std::min(piece.size() + 1, rest.size()));
        const size_t equals = piece.find('=');
        if (equals != std::string_view::npos)
            settings.insert_or_assign(std::string(piece.substr(0, equals)),
                                      std::string(piece.substr(equals + 1)));
    }
}

} // namespace

DebugDatabase& DebugDatabase::Instance() {
    const std::lock_guard lock(sMutex);
    if (!sHasReadEnvironment) ReadEnvironment(sDatabase.fEntries);
    sHasReadEnvironment = true;
    return sDatabase;
}

std::string DebugDatabase::GetEntry(const std::string& name, const std::string& defaultText) const {
    const std::lock_guard lock(sMutex);
    const auto entry = fEntries.find(name);
    return entry == fEntries.end() ? defaultText : entry->second;
}

void DebugDatabase::SetEntry(const std::string& name, const std::string& text) {
    const std::lock_guard lock(sMutex);
    fEntries[name] = text;
}

void DebugDatabase::RemoveEntry(const std::string& name) {
    const std::lock_guard lock(sMutex);
    fEntries.erase(name);
}

uint32_t TraceChangeCount() noexcept {
    return sTraceChanges;
}

bool TraceEnabled(const char* channel, int32_t level, bool enabledByDefault) {
    const std::lock_guard lock(sMutex);
    const auto entry = sHighestLevels.find(std::string_view(channel));
    return entry == sHighestLevels.end() ? enabledByDefault : level <= entry->second;
}

void SetTraceLevel(const char* channel, int32_t highestLevel) {
    const std::lock_guard lock(sMutex);
    sHighestLevels[channel] = highestLevel;
    ++sTraceChanges;
}

void ClearTraceLevel(const char* channel) {
    const std::lock_guard lock(sMutex);
    sHighestLevels.erase(channel);
    ++sTraceChanges;
}

void SetTraceSink(TraceSink sink) noexcept {
    sTraceSink = sink;
}

void Trace(const std::string& text) {
    if (const TraceSink sink = sTraceSink)
        sink(text.c_str());
    else
        std::fputs(text.c_str(), stderr);
}

// There is no dialog here: the violation is traced, and a debugger that is there is worth stopping in.
bool BreakAfterContractDialog(const char* expression, const char* sourcePath, const char* function,
                              int32_t line) {
    Trace(std::string(sourcePath) + ":" + std::to_string(line) + ": " + function +
          ": contract violated: " + expression + "\n");
    return true;
}

// The kernel tells the tracing process, or 0, in a line of the process status.
bool IsDebuggerAttached() noexcept {
    const int file = open("/proc/self/status", O_RDONLY | O_CLOEXEC);
    if (file < 0) return false;
    char text[4096];
    const ssize_t length = read(file, text, sizeof text);
    close(file);
    if (length <= 0) return false;
    constexpr std::string_view kLabel = "TracerPid:\t";
    const std::string_view status(text, static_cast<size_t>(length));
    const size_t at = status.find(kLabel);
    if (at == std::string_view::npos || at + kLabel.size() >= status.size()) return false;
    return status[at + kLabel.size()] != '0';
}

} // namespace zebcore::debug
