#pragma once

// How much a source is blurred before it is sampled, so that what gets smaller does not alias.

#include "geometry/MotionFields.h"
#include "geometry/MotionPlacement.h"

#include <cmath>

namespace PK {

struct MotionBlur {
    double x, y; ///< sigma in pixels of the source, 0 for none

    bool IsAny() const { return x > 0 || y > 0; }
};

/// A progressive source gets more of it where it goes to fields, by how far it is turned.
inline MotionBlur ChooseMotionBlur(const MotionPlacement& placement, double softness, int32_t sourceField,
                                   int32_t destinationField, int32_t quality) {
    constexpr double kLeast = 0.25;
    if (quality < 3) return {0, 0};
    const double sigma = softness * 0.25 + 0.25;
    double alongX = 1, alongY = 1;
    if (!IsInterlaced(sourceField) && IsInterlaced(destinationField)) {
        const double across = softness + 1;
        alongX = std::abs(placement.Cosine() - placement.Sine() * across);
        alongY = std::abs(placement.Sine() + placement.Cosine() * across);
    }
    const auto amount = [](double x) { return x > kLeast ? x : 0; };
    return {amount(sigma / static_cast<double>(placement.Scale().x) * alongX),
            amount(sigma / static_cast<double>(placement.Scale().y) * alongY)};
}

} // namespace PK
