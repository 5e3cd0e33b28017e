#include "frame/TraceSite.h"

#include "zebcore/threads.h"

namespace PK {

bool TraceSite::IsOnByHost(uint32_t changeCount) {
    if (answer == Answer(changeCount, true)) return true;
    const bool isOn = zebcore::debug::TraceEnabled(channel, level, isOnByDefault);
    answer = Answer(changeCount, isOn);
    return isOn;
}

void TraceSite::Write(const std::string& text) const {
    std::string line = "<";
    line += std::to_string(zebcore::threads::GetCurrentThreadID());
    line += "> <";
    line += channel;
    line += "> <";
    line += std::to_string(level);
    line += "> ";
    line += text;
    line += '\n';
    zebcore::debug::Trace(line);
}

} // namespace PK
