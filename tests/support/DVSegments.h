#pragma once

// Segments with drawn samples, for tests of the compressors.

#include "dv/DVCodeWords.h"
#include "support/Random.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdlib>
#include <gtest/gtest.h>
#include <vector>

namespace PKTest {

using Values = std::array<int16_t, 64>;
using Segment = std::array<uint8_t, 400>;

/// The samples of all blocks of a segment, less 128.
using Picture = std::vector<Values>;

inline Picture Flat(size_t blocks, int16_t value = 0) {
    Values values;
    values.fill(value);
    return Picture(5 * blocks, values);
}

/// Edges and noise of a contrast that differs from block to block.
inline Picture Drawn(size_t blocks, int32_t contrast, Random& random) {
    Picture picture = Flat(blocks);
    for (Values& values : picture) {
        const auto most = static_cast<int32_t>(random.Below(static_cast<uint32_t>(contrast)) + 1);
        const auto edge = static_cast<int32_t>(random.Below(16));
        const bool areFieldsApart = random.Below(3) == 0;
        for (int32_t i = 0; i < 64; ++i) {
            const int32_t noise = static_cast<int32_t>(random.Below(static_cast<uint32_t>(most))) - most / 2;
            const int32_t side =
                (i % 8 + i / 8 < edge ? most : -most) * (areFieldsApart && i / 8 % 2 != 0 ? -1 : 1);
            values[static_cast<size_t>(i)] = static_cast<int16_t>(std::clamp(noise + side, -128, 127));
        }
    }
    return picture;
}

template <class Compressor>
Segment Compress(Compressor& compressor, const Picture& picture, int32_t sampleBits) {
    const auto blocks = static_cast<int32_t>(picture.size() / 5);
    for (int32_t i = 0; i < 5 * blocks; ++i)
        for (int32_t k = 0; k < 64; ++k)
            compressor.Samples(i / blocks, i % blocks)[k] = static_cast<int16_t>(
                picture[static_cast<size_t>(i)][static_cast<size_t>(k)] * (1 << sampleBits));
    Segment segment;
    segment.fill(0xff);
    for (size_t m = 0; m < 5; ++m) std::fill_n(segment.begin() + 80 * m, 3, static_cast<uint8_t>(0xa0 + m));
    compressor.Compress(segment.data());
    for (size_t m = 0; m < 5; ++m)
        for (size_t i = 0; i < 3; ++i) EXPECT_EQ(segment[80 * m + i], 0xa0 + m) << "an ID has changed";
    return segment;
}

/// The bits of a block with these levels, told word by word; the budget of a segment where there is no word.
inline int32_t BitsOfLevels(const std::array<int32_t, 64>& levels) {
    int32_t bits = 16, run = 0;
    for (size_t i = 1; i < 64; ++i) {
        const int32_t amplitude = std::abs(levels[i]);
        if (amplitude == 0) {
            ++run;
            continue;
        }
        if (amplitude > 255) return 3040;
        if (amplitude > PK::kRunMaxAmp[static_cast<size_t>(run)] && run > 0) {
            bits += PK::kDVCodeBook.Run(run - 1).length;
            run = 0;
        }
        bits += PK::kVLCLength[static_cast<size_t>(run)][static_cast<size_t>(amplitude)];
        run = 0;
    }
    return bits;
}

} // namespace PKTest
