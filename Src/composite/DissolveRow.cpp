#include "composite/DissolveRow.h"

#include "frame/SharedRandom.h"
#include "primitives/Thresholds.h"

#include <cmath>
#include <cstring>
#include <emmintrin.h>

namespace PK {
namespace {

struct Pixel {
    float b, g, r, a;
};

/// Truncated, also where it does not fit: that is the least integer, as the processor has it.
int32_t Odds(float alpha) {
    return _mm_cvttsd_si32(_mm_set_sd(static_cast<double>(alpha) * 32767.0));
}

bool TopShows(float alpha, SharedRandoms& numbers) {
    if (std::abs(alpha) < kNegligible) return false;
    const int32_t odds = Odds(alpha);
    return odds < 0 || (numbers.Next() & 32767) <= odds;
}

} // namespace

void DissolveRow(const void* top, const void* back, void* destination, int32_t width, const float& opacity) {
    SharedRandoms numbers;
    const float amount = opacity;
    for (int32_t x = 0; x < width; ++x) {
        const int64_t at = int64_t{x} * static_cast<int64_t>(sizeof(Pixel));
        Pixel pixel;
        std::memcpy(&pixel, static_cast<const uint8_t*>(top) + at, sizeof pixel);
        if (!TopShows(pixel.a * amount, numbers))
            std::memcpy(&pixel, static_cast<const uint8_t*>(back) + at, sizeof pixel);
        std::memcpy(static_cast<uint8_t*>(destination) + at, &pixel, sizeof pixel);
    }
}

} // namespace PK
