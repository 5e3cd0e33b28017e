// The exported forms of the primitives on arrays: selectors, refusals and the state they leave.

#include "support/FloatEnvironment.h"

#include <PixelKiln/PixelKiln.h>

#include <gtest/gtest.h>
#include <vector>

using namespace PKTest;

TEST(MultiplyByConstant, MultipliesTheRectangle) {
    const uint8_t source[] = {10, 20, 30, 40, 0, 1, 3, 255, 200}, constants[4] = {1, 2, 128, 255};
    uint8_t image[12];
    std::fill_n(image, 12, uint8_t{9});
    ASSERT_EQ(PK_MultiplyByConstant(1, 2, source, 5, image, 6, constants, 1), PK_Success);
    const std::vector<uint8_t> expected = {5, 20, 255, 255, 9, 9, 0, 3, 255, 255, 9, 9}; // 0.5 goes to 0
    EXPECT_EQ(std::vector<uint8_t>(image, image + 12), expected);
}

TEST(MultiplyByConstant, RefusesImpossibleArguments) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    EXPECT_EQ(PK_MultiplyByConstant(1, 1, nullptr, 4, pixel, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(1, 1, pixel, 4, nullptr, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(1, 1, pixel, 4, pixel, 4, nullptr, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(-1, 1, pixel, 4, pixel, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(INT32_MAX, 1, pixel, 4, pixel, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(0, -1, pixel, 4, pixel, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(-1, 0, pixel, 4, pixel, 4, pixel, 0), PK_ErrFailed);
    EXPECT_EQ(PK_MultiplyByConstant(0, 1, nullptr, 4, nullptr, 4, nullptr, 0), PK_Success);
    EXPECT_EQ(PK_MultiplyByConstant(1, 0, nullptr, 4, nullptr, 4, nullptr, 0), PK_Success);
    EXPECT_EQ(pixel[3], 4);
}

TEST(Convert32fSfs, RoundsForSelectorOneAndTruncatesForAllOthers) {
    const float source[] = {1.5f, 2.5f, -2.5f, 1e9f, -1e9f};
    int32_t integers[5];
    int16_t words[5];
    ASSERT_EQ(PK_Convert_32f32sSfs(source, integers, 5, 1, 0), PK_Success);
    EXPECT_EQ(std::vector<int32_t>(integers, integers + 5),
              (std::vector<int32_t>{2, 2, -2, 1000000000, -1000000000}));
    ASSERT_EQ(PK_Convert_32f16sSfs(source, words, 5, 1, -1), PK_Success);
    EXPECT_EQ(std::vector<int16_t>(words, words + 5), (std::vector<int16_t>{3, 5, -5, 32767, -32768}));
    for (const int32_t rounding : {0, 2, -1}) {
        ASSERT_EQ(PK_Convert_32f32sSfs(source, integers, 5, rounding, 0), PK_Success);
        EXPECT_EQ(integers[0], 1);
        EXPECT_EQ(integers[2], -2);
        ASSERT_EQ(PK_Convert_32f16sSfs(source, words, 5, rounding, 1), PK_Success);
        EXPECT_EQ(words[0], 0);
        EXPECT_EQ(words[2], -1);
    }
}

TEST(Convert32fSfs, RefusesImpossibleArguments) {
    const float source = 1;
    int32_t integer = 5;
    int16_t word = 5;
    EXPECT_EQ(PK_Convert_32f32sSfs(nullptr, &integer, 1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f32sSfs(&source, nullptr, 1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f32sSfs(&source, &integer, -1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f16sSfs(nullptr, &word, 1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f16sSfs(&source, nullptr, 1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f16sSfs(&source, &word, -1, 1, 0), PK_ErrFailed);
    EXPECT_EQ(PK_Convert_32f32sSfs(nullptr, nullptr, 0, 1, 0), PK_Success);
    EXPECT_EQ(PK_Convert_32f16sSfs(nullptr, nullptr, 0, 1, 0), PK_Success);
    EXPECT_EQ(integer, 5);
    EXPECT_EQ(word, 5);
}

TEST(Convert32fSfs, LeavesTheFloatingPointStateAsItWas) {
    const float source[] = {0.1f, 1e38f, 1e-45f};
    int32_t integers[3];
    int16_t words[3];
    const FloatEnvironment environment(kRoundUp | kDenormalsAreZero);
    PK_Convert_32f32sSfs(source, integers, 3, 1, 0);
    EXPECT_TRUE(environment.IsAsGiven());
    PK_Convert_32f16sSfs(source, words, 3, 0, 0);
    EXPECT_TRUE(environment.IsAsGiven());
    EXPECT_EQ(integers[0], 0);
}

TEST(DecodeALawTo16Bit, DecodesSamples) {
    const uint8_t codes[] = {0xd5, 0x55, 0xaa, 0x2a};
    int16_t samples[4];
    ASSERT_EQ(PK_DecodeALawTo16Bit(codes, 4, samples), PK_Success);
    EXPECT_EQ(std::vector<int16_t>(samples, samples + 4), (std::vector<int16_t>{8, -8, 32256, -32256}));
}

TEST(DecodeALawTo16Bit, RefusesImpossibleArguments) {
    const uint8_t code = 0;
    int16_t sample = 5;
    EXPECT_EQ(PK_DecodeALawTo16Bit(nullptr, 1, &sample), PK_ErrFailed);
    EXPECT_EQ(PK_DecodeALawTo16Bit(&code, 1, nullptr), PK_ErrFailed);
    EXPECT_EQ(PK_DecodeALawTo16Bit(&code, -1, &sample), PK_ErrFailed);
    EXPECT_EQ(PK_DecodeALawTo16Bit(nullptr, 0, nullptr), PK_Success);
    EXPECT_EQ(sample, 5);
}
