#pragma once

/// \file
/// The host's threads.

#include <cstdint>

namespace zebcore::threads {

/// The number by which the system knows the calling thread.
uint32_t GetCurrentThreadID() noexcept;

} // namespace zebcore::threads
