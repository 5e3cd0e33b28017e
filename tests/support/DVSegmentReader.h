#pragma once

// A slow reader of video segments, bit by bit, that shares nothing with the library but the list of code words.

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace PKTest {

struct ReadBlock {
    int32_t dc = 0, mode = 0, classNumber = 0;
    std::array<int32_t, 64> levels{}; ///< in the order of the scan
    bool hasEnded = false;            ///< the end of the block was found
    size_t bits = 0;                  ///< of the block, as far as it was read
};

struct ReadSegment {
    std::vector<ReadBlock> blocks;
    std::array<int32_t, 5> qno;
    std::array<int32_t, 5> status;
};

/// \param blocks  of a macroblock: 6 or 8.
ReadSegment ReadDVSegment(const uint8_t* segment, int32_t blocks);

} // namespace PKTest
