#pragma once

// A real photograph for tests.

#include <cstdint>
#include <string>
#include <vector>

namespace PKTest {

/// Tightly packed rows of B, G, R, A bytes, the first row of the picture first.
struct Photograph {
    int32_t width = 0, height = 0;
    std::vector<uint8_t> pixels;

    const uint8_t* Row(int32_t row) const {
        return pixels.data() + static_cast<size_t>(row) * 4 * static_cast<size_t>(width);
    }
};

/// One of the pictures of media/. Throws if it cannot be read.
Photograph ReadPhotograph(const std::string& name);

} // namespace PKTest
