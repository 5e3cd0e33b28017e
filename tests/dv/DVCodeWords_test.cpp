#include "dv/DVCodeWords.h"

#include <gtest/gtest.h>

namespace {

using namespace PK;

struct Word {
    int32_t run, amplitude;
    uint32_t code; // with a sign bit of 0
    int32_t length;
};

TEST(DVCodeWords, AreTheCanonicalOnesOfTheList) {
    constexpr Word kWords[] = {
        {0, 1, 0b00'0, 3},
        {0, 2, 0b010'0, 4},
        {1, 1, 0b0111'0, 5},
        {0, 3, 0b1000'0, 5},
        {0, 4, 0b1001'0, 5},
        {2, 1, 0b10100'0, 6},
        {1, 2, 0b10101'0, 6},
        {0, 5, 0b10110'0, 6},
        {0, 6, 0b10111'0, 6},
        {3, 1, 0b110000'0, 7},
        {0, 8, 0b110011'0, 7},
        {5, 1, 0b1101000'0, 8},
        {1, 17, 0b111110111111'0, 13},
    };
    for (const Word& word : kWords) {
        EXPECT_EQ(kVLCCode[word.run][word.amplitude], word.code) << word.run << " " << word.amplitude;
        EXPECT_EQ(kVLCLength[word.run][word.amplitude], word.length) << word.run << " " << word.amplitude;
    }
    EXPECT_EQ(kDVEndOfBlock.code, 0b0110u);
    EXPECT_EQ(kDVEndOfBlock.length, 4);
}

TEST(DVCodeWords, ALongAmplitudeIsWrittenAsItIs) {
    EXPECT_EQ(kVLCLength[0][22], 10);
    EXPECT_EQ(kVLCLength[0][23], 16);
    EXPECT_EQ(kVLCCode[0][23], 0b1111111'00010111'0u);
    EXPECT_EQ(kVLCCode[0][255], 0b1111111'11111111'0u);
}

TEST(DVCodeWords, APairWithoutAWordIsARunAndAnAmplitude) {
    // One zero by the word for a run of none, 11111001110, and the amplitude.
    EXPECT_EQ(kVLCCode[1][18], 0b11111001110u << 10 | kVLCCode[0][18]);
    EXPECT_EQ(kVLCLength[1][18], 11 + 10);
    // Runs of 6 and more as they are.
    EXPECT_EQ(kVLCCode[7][4], (0b1111110'000110u << 5) | 0b1001'0u);
    EXPECT_EQ(kVLCLength[15][1], 13 + 3);
    EXPECT_EQ(kVLCCode[62][255], (0b1111110'111101u << 16) | 0b1111111'11111111'0u);
    EXPECT_EQ(kVLCLength[62][255], 13 + 16);
}

TEST(DVCodeWords, TheGreatestAmplitudesWithAWordOfTheirOwn) {
    constexpr int32_t kGreatest[] = {255, 17, 11, 7, 5, 3, 3, 3, 3, 2, 2, 1, 1, 1, 1, 0, 0};
    for (size_t run = 0; run < std::size(kGreatest); ++run) EXPECT_EQ(kRunMaxAmp[run], kGreatest[run]) << run;
    EXPECT_EQ(kRunMaxAmp[62], 0);
}

TEST(DVCodeWords, LeaveNoBitsWithoutAMeaning) {
    constexpr int32_t kUnit = 1 << 16;
    int32_t sum = 2 * (kUnit >> kDVEscapePrefixBits);
    for (const DVCode& code : kDVCodes) sum += kUnit >> code.length;
    EXPECT_EQ(sum, kUnit);
}

} // namespace
