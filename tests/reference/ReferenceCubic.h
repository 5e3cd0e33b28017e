#pragma once

// The weights of motion's highest quality, restated for one axis.

#include "reference/ReferenceMotionSample.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <vector>

namespace PKReference {

/// The cubic of Keys with a = -0.75 at 128 places between two pixels, stretched for a reduction down to a quarter.
class ReferenceCubic {
public:
    explicit ReferenceCubic(float scale) {
        const double stretch = std::clamp(scale, 0.25f, 1.0f);
        fTaps = 2 * static_cast<int32_t>(std::ceil(2 / stretch));
        for (int32_t phase = 0; phase < 128; ++phase) {
            std::vector<double> shape;
            double sum = 0;
            for (int32_t tap = 0; tap < fTaps; ++tap) {
                shape.push_back(Shape((tap - (fTaps / 2 - 1) - phase / 128.0) * stretch));
                sum += shape.back();
            }
            for (const double height : shape)
                fWeights.push_back(static_cast<int16_t>(height * (16384 / sum))); // towards zero
        }
    }

    MotionWeights Weights() const { return {fWeights.data(), fTaps}; }

private:
    static double Shape(double place) {
        constexpr double a = -0.75;
        const double x = std::abs(place);
        if (x >= 2) return 0;
        return x >= 1 ? ((a * x - 5 * a) * x + 8 * a) * x - 4 * a : ((a + 2) * x - (a + 3)) * x * x + 1;
    }

    int32_t fTaps;
    std::vector<int16_t> fWeights;
};

} // namespace PKReference
