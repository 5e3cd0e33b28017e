#include "geometry/RepeatedSum.h"

#include <algorithm>
#include <bit>

namespace PK {

namespace {

constexpr uint32_t kFraction = 0x007fffff;

/// Of one sign and exponent, and so with one distance between neighbours.
bool AreEvenlySpaced(uint32_t a, uint32_t b) {
    return ((a ^ b) & ~kFraction) == 0;
}

/// How often a step can follow within one exponent. Downward it ends a place early: what is rounded to the least
/// number of the exponent may lie below that, where numbers stand closer.
int64_t StepsLeft(uint32_t bits, int64_t step) {
    const int64_t fraction = bits & kFraction;
    return step > 0 ? (kFraction - fraction) / step : std::max<int64_t>(fraction - 1, 0) / -step;
}

} // namespace

// Between evenly spaced numbers all sums round alike, so that all steps are equal. Only a tie may make the first
// step differ: it goes to the even neighbour, and from there on ties go the same way. So a step is taken for all
// that follow if the one before it has ended between the same numbers.
float RepeatedSum(float value, float change, int64_t times) {
    while (times >= 3) {
        const float first = value + change, second = first + change;
        value = second + change;
        times -= 3;
        const auto before = std::bit_cast<uint32_t>(second), now = std::bit_cast<uint32_t>(value);
        if (now == before) return value;
        if (!AreEvenlySpaced(std::bit_cast<uint32_t>(first), before) || !AreEvenlySpaced(before, now))
            continue;
        const int64_t step = int64_t{now} - before;
        const int64_t steps = std::min(times, StepsLeft(now, step));
        value = std::bit_cast<float>(static_cast<uint32_t>(now + steps * step));
        times -= steps;
    }
    for (; times > 0; --times) value += change;
    return value;
}

} // namespace PK
