// A-law decoding, beside the law itself: a code with every other bit inverted is sign, segment and step.

#include "primitives/ALaw.h"

#include "support/Targets.h"

#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

int16_t Expected(uint8_t code) {
    const int32_t bits = code ^ 0x55, segment = bits >> 4 & 7, step = bits & 15;
    // the middle of the step, in units of half a step of segment 0 and 1
    const int32_t middle = segment == 0 ? 2 * step + 1 : (2 * step + 33) << (segment - 1);
    return static_cast<int16_t>((bits & 0x80) != 0 ? 8 * middle : -8 * middle);
}

std::vector<int16_t> Decode(const std::vector<uint8_t>& codes) {
    std::vector<int16_t> samples(codes.size());
    EXPECT_EQ(ALawToLinear16(codes.data(), samples.data(), static_cast<int32_t>(codes.size())), 0);
    return samples;
}

TEST(ALaw, DecodesKnownCodes) {
    // least, end of segment 0, begin of 1, begin of 2, greatest; positive and negative
    const std::vector<uint8_t> codes = {0xd5, 0x55, 0xda, 0xc5, 0xf5, 0xaa, 0x2a, 0x80, 0x00};
    const std::vector<int16_t> samples = {8, -8, 248, 264, 528, 32256, -32256, 5504, -5504};
    AtEveryTarget([&] { EXPECT_EQ(Decode(codes), samples); });
}

TEST(ALaw, DecodesEveryCodeAtEveryPlace) {
    AtEveryTarget([] {
        for (int32_t shift = 0; shift < 256; ++shift) {
            const auto count = static_cast<size_t>(256 + shift % 70); // tails of all lengths
            std::vector<uint8_t> codes(count);
            std::vector<int16_t> expected(count);
            for (size_t i = 0; i < count; ++i) {
                codes[i] = static_cast<uint8_t>(static_cast<int32_t>(i) + shift);
                expected[i] = Expected(codes[i]);
            }
            ASSERT_EQ(Decode(codes), expected) << "shift " << shift;
        }
    });
}

TEST(ALaw, RefusesNullPointersAndNegativeCounts) {
    const uint8_t code = 0;
    int16_t sample = 5;
    EXPECT_EQ(ALawToLinear16(nullptr, &sample, 1), -8);
    EXPECT_EQ(ALawToLinear16(&code, nullptr, 1), -8);
    EXPECT_EQ(ALawToLinear16(&code, &sample, -1), -6);
    EXPECT_EQ(sample, 5);
}

} // namespace
} // namespace PK
