#include "frame/PrimitivesStart.h"

#include "primitives/Initialise.h"

#include <iterator>

namespace PK {
namespace {

constinit TraceSite sInitialisers = {"PK.InitIpp", 5, true};

} // namespace

void TraceInitialiserWarning(TraceSite& site, int32_t status, const char* statusText) noexcept {
    if (status <= 0) return;
    try {
        if (site.IsOn()) site.Write(std::string("ippInit warning: ") + statusText);
    } catch (...) {
        return; // out of memory: the start-up matters more than its trace
    }
}

void StartPrimitives() noexcept {
    using Initialiser = int32_t (*)() noexcept;
    static constexpr Initialiser kInitialisers[] = {InitialiseImagePrimitives, InitialiseSignalPrimitives,
                                                    InitialiseVectorPrimitives};
    for (const Initialiser initialise : kInitialisers) {
        const int32_t status = initialise();
        TraceInitialiserWarning(sInitialisers, status, PrimitiveStatusText(status));
    }
}

} // namespace PK
