#pragma once

// What primitives return: 0 for success, a negative number for a check that failed.

#include <cstdint>

namespace PK {

inline constexpr int32_t kStatusOk = 0;
inline constexpr int32_t kStatusBadSize = -6; // a negative width, height or count
inline constexpr int32_t kStatusNullPointer = -8;

} // namespace PK
