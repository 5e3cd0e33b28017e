#pragma once

// Start of the primitives, and the one trace line of the library: the warning of an initialiser.

#include <cstdint>

namespace PK {

/// What a place that traces remembers, so that it asks the host again only after a change.
struct TraceSite {
    uint32_t changeCount = ~uint32_t{0};
    bool enabled = false;
};

/// Writes a warning if the status is one (positive) and the channel is on. Never fails: a line that cannot
/// be composed is not written.
/// \param statusText  the primitives' text for the status.
void TraceInitialiserWarning(TraceSite& site, int32_t status, const char* statusText) noexcept;

/// Calls the initialisers. No status stops the start-up.
void StartPrimitives() noexcept;

} // namespace PK
