#pragma once

// The switches of PK_SetDebugFlag, by number.

#include "support/ByteStream.h"

#include <array>
#include <cstdint>

namespace PKFuzz {

inline constexpr uint32_t kSwitchSSE4 = 6;
inline constexpr uint32_t kSwitchAVX = 8;
inline constexpr uint32_t kSwitchAVX2 = 9;
inline constexpr uint32_t kSwitchTopLeft = 10;
inline constexpr uint32_t kSwitchCount = 11;

/// The state of all switches.
using Switches = std::array<bool, kSwitchCount>;

/// The state after start on this processor: what it has is on, all else is off.
Switches SwitchesAfterStart();

/// Whether a switch may be on here: all that are no capability, and the capabilities that there are.
bool MayBeOn(uint32_t which);

/// Brings the library to a state.
void SetSwitches(const Switches& switches);

/// A state that this processor can be in; that after start half of the time.
Switches DrawSwitches(ByteStream& stream);

} // namespace PKFuzz
