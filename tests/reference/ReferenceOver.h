#pragma once

// One row over another, pixel by pixel as the rules are told, without anything of the library.

#include <cstdint>

namespace PKTest::reference {

struct OverRule {
    bool isStraight;
    bool isYUV; ///< Premultiplied about the zeros of 8-bit samples.
    bool topIsOpaque, backIsOpaque;
};

/// Pixels by themselves, or by fours between the first 16-byte boundary of `destination` and the last whole four.
void Over8u(const OverRule& rule, bool byFours, const uint8_t* top, const uint8_t* back, uint8_t* destination,
            int32_t width, float opacity);

void Over32f(const OverRule& rule, const float* top, const float* back, float* destination, int32_t width,
             float opacity);

} // namespace PKTest::reference
