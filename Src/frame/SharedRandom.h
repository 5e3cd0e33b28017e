#pragma once

// The numbers of std::rand(), whose sequence the library shares with the rest of the process.

namespace PK {

/// The next number. Safe from all threads.
int SharedRandom() noexcept;

} // namespace PK
