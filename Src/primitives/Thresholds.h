#pragma once

// Differences that do not count. Kernel sources include this header, so it holds constants and nothing else.

namespace PK {

/// A float sample, opacity or weight below this counts as 0, and one as near to 1 as 1.
inline constexpr float kNegligible = 8e-6f;

} // namespace PK
