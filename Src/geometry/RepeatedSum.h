#pragma once

// What slopes add up to along many scan lines.

#include <cstdint>

namespace PK {

/// value + change + change and so on, `times` times, each sum rounded to single precision by the current mode. The
/// time hardly depends on the number of times.
float RepeatedSum(float value, float change, int64_t times);

} // namespace PK
