#pragma once

// Memory for what the rows of a band share when motion samples them.

#include "geometry/MotionSampleKernels.h"

#include <vector>

namespace PKTest {

class ColumnsOfBand {
public:
    explicit ColumnsOfBand(int32_t columns)
        : fPixels(static_cast<size_t>(columns) + PK::MotionColumns::kMore),
          fWeights(fPixels.size()), fShared{fPixels.data(), fWeights.data()} {}

    PK::MotionColumns* Shared() { return &fShared; }

private:
    std::vector<int32_t> fPixels, fWeights;
    PK::MotionColumns fShared;
};

} // namespace PKTest
