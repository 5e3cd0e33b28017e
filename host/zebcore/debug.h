#pragma once

/// \file
/// The host's settings, its trace, and what it does about a violated contract.
///
/// Everything here is safe from all threads, and in the child of a fork, whatever other threads of the parent were doing
/// here: see threads.h. Settings and levels are those of the parent.

#include <cstdint>
#include <map>
#include <string>

namespace zebcore::debug {

/// Named settings of the process. The library only reads; the program fills it, before it starts the library. At first it
/// has what the environment variable PIXELKILN_SETTINGS tells: "name=text,name=text".
class DebugDatabase {
public:
    static DebugDatabase& Instance();

    /// The text of a setting, or \p defaultText if there is none.
    std::string GetEntry(const std::string& name, const std::string& defaultText) const;

    /// Makes or replaces a setting.
    void SetEntry(const std::string& name, const std::string& text);

    /// Takes a setting out; one that is not there is no error.
    void RemoveEntry(const std::string& name);

private:
    std::map<std::string, std::string> fEntries;
};

/// Number of changes made to what TraceEnabled answers. A site that traces keeps the answer for as long as
/// this stays the same.
uint32_t TraceChangeCount() noexcept;

/// Whether a channel traces messages of a level.
/// \param channel           name of the channel.
/// \param level             level of the message; higher is more talkative.
/// \param enabledByDefault  the answer for a channel that nobody has set.
bool TraceEnabled(const char* channel, int32_t level, bool enabledByDefault);

/// Lets a channel trace messages up to a level; below 0 silences it.
void SetTraceLevel(const char* channel, int32_t highestLevel);

/// Takes a channel back to its defaults.
void ClearTraceLevel(const char* channel);

/// Receives the text of one trace message, with its end of line.
using TraceSink = void (*)(const char* text);

/// Sends trace messages to a function of the program; null sends them to the standard error stream, as at
/// first.
void SetTraceSink(TraceSink sink) noexcept;

/// Writes one message.
void Trace(const std::string& text);

/// Tells the developer that a contract was violated.
/// \return whether the program should stop in the debugger.
bool BreakAfterContractDialog(const char* expression, const char* sourcePath, const char* function,
                              int32_t line);

/// Whether a debugger watches this process now.
bool IsDebuggerAttached() noexcept;

} // namespace zebcore::debug
