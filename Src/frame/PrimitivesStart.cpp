#include "frame/PrimitivesStart.h"

#include "primitives/Initialise.h"

#include "zebcore/debug.h"
#include "zebcore/threads.h"

#include <iterator>
#include <string>

namespace PK {
namespace {

constexpr const char* kChannel = "PK.InitIpp";
constexpr int32_t kLevel = 5;

bool IsTraced(TraceSite& site) {
    const uint32_t changeCount = zebcore::debug::TraceChangeCount();
    if (site.changeCount != changeCount) {
        site.enabled = zebcore::debug::TraceEnabled(kChannel, kLevel, true);
        site.changeCount = changeCount;
    }
    return site.enabled;
}

std::string WarningLine(const char* statusText) {
    std::string line = "<";
    line += std::to_string(zebcore::threads::GetCurrentThreadID());
    line += "> <";
    line += kChannel;
    line += "> <";
    line += std::to_string(kLevel);
    line += "> ippInit warning: ";
    line += statusText;
    line += '\n';
    return line;
}

} // namespace

void TraceInitialiserWarning(TraceSite& site, int32_t status, const char* statusText) noexcept {
    if (status <= 0) return;
    try {
        if (IsTraced(site)) zebcore::debug::Trace(WarningLine(statusText));
    } catch (...) {
        return; // out of memory: the start-up matters more than its trace
    }
}

void StartPrimitives() noexcept {
    using Initialiser = int32_t (*)() noexcept;
    static constexpr Initialiser kInitialisers[] = {InitialiseImagePrimitives, InitialiseSignalPrimitives,
                                                    InitialiseVectorPrimitives};
    static TraceSite sites[std::size(kInitialisers)];
    for (size_t i = 0; i < std::size(kInitialisers); ++i) {
        const int32_t status = kInitialisers[i]();
        TraceInitialiserWarning(sites[i], status, PrimitiveStatusText(status));
    }
}

} // namespace PK
