#pragma once

// Start of the primitives, and the warnings of their initialisers.

#include "frame/TraceSite.h"

#include <cstdint>

namespace PK {

/// Writes a warning if the status is one (positive) and the channel is on. Never fails: a line that cannot
/// be composed is not written.
/// \param statusText  the primitives' text for the status.
void TraceInitialiserWarning(TraceSite& site, int32_t status, const char* statusText) noexcept;

/// Calls the initialisers. No status stops the start-up.
void StartPrimitives() noexcept;

} // namespace PK
