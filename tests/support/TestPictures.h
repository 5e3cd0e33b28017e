#pragma once

// Pictures of every kind that a codec meets, of any size.

#include <cstdint>
#include <string>
#include <vector>

namespace PKTest {

struct TestPicture {
    std::string name;
    std::vector<uint8_t> yuyv; ///< rows without gaps, from the top
};

/// Photographs, the same as two fields of a moving camera, fine patterns, graphics, colours that move, and noise.
std::vector<TestPicture> TestPictures(int32_t width, int32_t height);

} // namespace PKTest
