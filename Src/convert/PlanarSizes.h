#pragma once

// The sizes that planar 4:2:0 is decoded to without filtering.

#include "primitives/Dispatch.h"

#include <cstdint>

namespace PK {

/// How much wider a row gets.
enum class Widening : uint8_t { None, By3To2, By4To3 };

/// Offered from SSE2 on, for widths in whole groups of its kernels.
inline Widening WideningOf(int32_t width, int64_t wanted) {
    if (!IsEnabled(Target::sse2)) return Widening::None;
    if (width % 96 == 0 && wanted == int64_t{width} / 3 * 4) return Widening::By4To3;
    if (width % 16 == 0 && wanted == int64_t{width} / 2 * 3) return Widening::By3To2;
    return Widening::None;
}

/// The samples for each pixel, 1, 2, 4 or 8, of which the first is taken; 0 for another number.
constexpr int32_t StepOfColumns(int32_t width, int32_t wanted) {
    if (wanted < 1 || width % wanted != 0) return 0;
    const int32_t step = width / wanted;
    return step == 1 || step == 2 || step == 4 || step == 8 ? step : 0;
}

/// Whether the rows are an even multiple of the wanted ones.
constexpr bool IsEvenRatio(int32_t height, int32_t wanted) {
    return wanted >= 1 && height >= wanted && height % wanted == 0 && height / wanted % 2 == 0;
}

} // namespace PK
