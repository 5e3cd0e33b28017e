#pragma once

// The quadrilateral that the warps draw: the whole picture, at 0.8 of its size and turned about its middle.

#include "operations/Operation.h"

#include <cmath>

namespace OperationBench {

/// x' = a x - b y + offsetX and y' = b x + a y + offsetY, with pixel centres at halves.
struct WarpMatrix {
    double a = 0.8 * std::cos(0.26);
    double b = 0.8 * std::sin(0.26);
    double offsetX = kWidth / 2.0 - a * kWidth / 2 + b * kHeight / 2;
    double offsetY = kHeight / 2.0 - b * kWidth / 2 - a * kHeight / 2;
};

} // namespace OperationBench
