#pragma once

// A picture of one float a pixel, from black at 0 to white at 1, rows from the top.

#include <cstddef>
#include <cstdint>
#include <vector>

namespace Scaling {

struct Grey {
    Grey(int32_t theWidth, int32_t theHeight)
        : width(theWidth), height(theHeight),
          samples(static_cast<size_t>(theWidth) * static_cast<size_t>(theHeight)) {}

    float* Row(int32_t y) { return samples.data() + static_cast<ptrdiff_t>(y) * width; }
    const float* Row(int32_t y) const { return samples.data() + static_cast<ptrdiff_t>(y) * width; }

    int32_t width, height;
    std::vector<float> samples;
};

} // namespace Scaling
