#pragma once

// The power law of the hub.

namespace PK {

inline constexpr float kHubDecoding = 2.4f;
inline constexpr float kHubEncoding = 0.41666666f; // 1 / 2.4

} // namespace PK
