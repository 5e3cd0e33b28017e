// The parse of DV segments, on segments that are put together bit by bit here.

#include "primitives/DVHuffman.h"

#include "support/GuardedRows.h"
#include "support/Random.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <numeric>
#include <string>
#include <vector>

namespace PK {
namespace {

constexpr int kMacroblocks = 5, kPlaces = 64;
constexpr int kBlockBytes = 80, kSegmentBytes = 400;
constexpr int kAreas50[] = {14, 14, 14, 14, 10, 10};
constexpr int kAreas100[] = {10, 10, 10, 10, 10, 10, 8, 8};

// Code words, with their signs, as the standard prints them.
const std::string kEnd = "0110";
const std::string kOne = "000", kMinusOne = "001"; // no zero before them
const std::string kThreeAfterOne = "11010110";     // 3 after a run of 1
const std::string kMinus23 = "1111111000101111", kPlus255 = "1111111111111110";
const std::string kRunOf61 = "1111110111101", kRunOf0 = "11111001110";

DVScan Straight() {
    DVScan scan;
    std::iota(scan.begin(), scan.end(), uint8_t{0});
    return scan;
}
DVScan Backwards() {
    DVScan scan = Straight();
    std::reverse(scan.begin() + 1, scan.end());
    return scan;
}

const DVHuffmanTable& Table() {
    static const DVHuffmanTable table = [] {
        DVHuffmanTable made;
        EXPECT_EQ(0, InitDVHuffmanTable(kDVCodes, {kDVRunEscape, kDVAmplitudeEscape}, &made));
        return made;
    }();
    return table;
}

/// A segment in which every block has a DC of 0, mode and class 0, and ends at once; what is spare is ones.
class TestSegment {
public:
    explicit TestSegment(bool is100 = false)
        : fAreas(is100 ? std::vector<int>(kAreas100, kAreas100 + 8)
                       : std::vector<int>(kAreas50, kAreas50 + 6)) {
        fBytes.fill(0xff);
        for (int macroblock = 0; macroblock < kMacroblocks; ++macroblock) {
            SetQNO(macroblock, 0);
            for (int block = 0; block < Blocks(); ++block) Put(macroblock, block, "000000000000" + kEnd);
        }
    }

    int Blocks() const { return static_cast<int>(fAreas.size()); }

    void SetQNO(int macroblock, int qno) {
        fBytes[size_t(kBlockBytes * macroblock + 3)] = static_cast<uint8_t>(0xa0 | qno);
    }

    /// Bits from the beginning of an area on, as far as it goes.
    /// \return those that it has no room for.
    std::string Put(int macroblock, int block, const std::string& bits) {
        const size_t begin = 8 * size_t(Begin(macroblock, block)), room = 8 * size_t(fAreas[size_t(block)]);
        return PutAt(begin, begin + room, bits);
    }

    /// Into what is spare behind the first bits of an area.
    std::string PutBehind(int macroblock, int block, size_t used, const std::string& bits) {
        const size_t begin = 8 * size_t(Begin(macroblock, block)), room = 8 * size_t(fAreas[size_t(block)]);
        return PutAt(begin + used, begin + room, bits);
    }

    const uint8_t* Bytes() const { return fBytes.data(); }

private:
    int Begin(int macroblock, int block) const {
        return kBlockBytes * macroblock + 4 + std::accumulate(fAreas.begin(), fAreas.begin() + block, 0);
    }

    std::string PutAt(size_t place, size_t end, const std::string& bits) {
        size_t i = 0;
        for (; i < bits.size() && place < end; ++i, ++place) {
            const auto mask = static_cast<uint8_t>(0x80 >> place % 8);
            uint8_t& byte = fBytes[place / 8];
            byte = static_cast<uint8_t>(bits[i] == '1' ? byte | mask : byte & ~mask);
        }
        return bits.substr(i);
    }

    std::vector<int> fAreas;
    std::array<uint8_t, kSegmentBytes> fBytes;
};

struct Parsed {
    int blocks;
    std::vector<int16_t> coefficients;
    std::vector<uint32_t> parameters;

    std::vector<int16_t> Block(int macroblock, int block) const {
        const auto first = coefficients.begin() + kPlaces * (blocks * macroblock + block);
        return {first, first + kPlaces};
    }
    uint32_t Parameters(int macroblock, int block) const {
        return parameters[size_t(blocks * macroblock + block)];
    }
};

Parsed Parse(const uint8_t* segment, bool is100 = false, DVParseDepth depth = {}) {
    const int blocks = is100 ? 8 : 6;
    Parsed parsed = {blocks, std::vector<int16_t>(size_t(kMacroblocks * blocks * kPlaces)),
                     std::vector<uint32_t>(size_t(kMacroblocks * blocks))};
    const DVScan scans[2] = {Straight(), Backwards()};
    const int32_t status =
        is100 ? HuffmanDecodeSegmentDV100(segment, scans[0], &Table(), parsed.coefficients.data(),
                                          parsed.parameters.data(), depth)
              : HuffmanDecodeSegmentDV(segment, scans, &Table(), parsed.coefficients.data(),
                                       parsed.parameters.data(), depth);
    EXPECT_EQ(0, status);
    return parsed;
}

std::vector<int16_t> Levels(std::initializer_list<std::pair<int, int>> placesAndLevels) {
    std::vector<int16_t> levels(kPlaces);
    for (const auto& [place, level] : placesAndLevels) levels[size_t(place)] = static_cast<int16_t>(level);
    return levels;
}

std::string Repeated(const std::string& bits, int times) {
    std::string all;
    for (int i = 0; i < times; ++i) all += bits;
    return all;
}

TEST(DVHuffman, HeadsOfBlocks) {
    TestSegment segment;
    segment.Put(0, 0,
                "100000000"
                "0"
                "00" +
                    kEnd); // DC -256
    segment.Put(1, 3,
                "011111111"
                "1"
                "11" +
                    kEnd); // 255, 2-4-8, class 3
    segment.Put(4, 5,
                "111111111"
                "0"
                "10" +
                    kEnd); // -1, class 2
    segment.SetQNO(1, 13);
    segment.SetQNO(4, 6);
    const Parsed parsed = Parse(segment.Bytes());
    EXPECT_EQ(Levels({{0, -256}}), parsed.Block(0, 0));
    EXPECT_EQ(Levels({{0, 255}}), parsed.Block(1, 3));
    EXPECT_EQ(Levels({{0, -1}}), parsed.Block(4, 5));
    constexpr uint32_t kModeAndClass = 0x70;
    EXPECT_EQ(0u, parsed.Parameters(0, 0) & kModeAndClass);
    EXPECT_EQ(0x70u, parsed.Parameters(1, 3) & kModeAndClass);
    EXPECT_EQ(0x20u, parsed.Parameters(4, 5) & kModeAndClass);
    for (int block = 0; block < 6; ++block) {
        EXPECT_EQ(13u, parsed.Parameters(1, block) >> 16 & 0xf);
        EXPECT_EQ(6u, parsed.Parameters(4, block) >> 16 & 0xf);
        EXPECT_EQ(0u, parsed.Parameters(2, block) >> 16 & 0xf);
    }
}

TEST(DVHuffman, CodeWordsInTheirOwnArea) {
    TestSegment segment;
    segment.Put(0, 0, "000000000000" + kOne + kMinusOne + kThreeAfterOne + kMinus23 + kPlus255 + kEnd);
    segment.Put(0, 1, "000000000100" + kRunOf0 + kOne + kEnd);       // at place 2, of either mode
    segment.Put(0, 2, "000000000000" + kRunOf61 + kMinusOne + kEnd); // at place 63
    segment.Put(0, 3, "000000000100" + kOne + kEnd);
    segment.Put(0, 4, "000000000100" + kRunOf61 + kOne + kOne + kEnd); // one more than there are places
    segment.Put(0, 5, "000000000000" + kOne + kEnd);
    const Parsed parsed = Parse(segment.Bytes());
    EXPECT_EQ(Levels({{1, 1}, {2, -1}, {4, 3}, {5, -23}, {6, 255}}), parsed.Block(0, 0));
    EXPECT_EQ(Levels({{62, 1}}), parsed.Block(0, 1)); // the other scan goes backwards
    EXPECT_EQ(Levels({{63, -1}}), parsed.Block(0, 2));
    EXPECT_EQ(Levels({{63, 1}}), parsed.Block(0, 3));
    EXPECT_EQ(Levels({{1, 1}}), parsed.Block(0, 4));
    EXPECT_EQ(Levels({{1, 1}}), parsed.Block(0, 5));
}

/// Each code word alone, with both signs, against the rule that makes the list.
TEST(DVHuffman, EveryCodeWord) {
    const auto bitsOf = [](uint32_t word, int length) {
        std::string bits;
        for (int i = length - 1; i >= 0; --i) bits += (word >> i & 1) != 0 ? '1' : '0';
        return bits;
    };
    const auto check = [](const std::string& code, int run, int amplitude) {
        for (const bool isNegative : {false, true}) {
            TestSegment segment;
            // What is alone is told by the place of what follows.
            const std::string word = amplitude == 0 ? code + kOne : code + (isNegative ? "1" : "0");
            segment.Put(2, 1, "000000000000" + word + kEnd);
            const int place = amplitude == 0 ? run + 2 : run + 1;
            const int level = amplitude == 0 ? 1 : isNegative ? -amplitude : amplitude;
            ASSERT_EQ(Levels({{place, level}}), Parse(segment.Bytes()).Block(2, 1)) << code;
        }
    };
    uint32_t word = 0;
    int length = kDVCodes[0].length;
    for (const DVCode& code : kDVCodes) {
        word <<= code.length - length;
        length = code.length;
        if (code.run != kEndOfBlockRun) check(bitsOf(word, length), code.run, code.amplitude);
        ++word;
    }
    for (uint32_t run = 0; run <= 61; ++run) check("1111110" + bitsOf(run, 6), static_cast<int>(run), 0);
    for (uint32_t amplitude = 1; amplitude <= 255; ++amplitude)
        check("1111111" + bitsOf(amplitude, 8), 0, static_cast<int>(amplitude));
}

TEST(DVHuffman, ABlockGoesOnInItsMacroblockThenInTheSegment) {
    for (const bool is100 : {false, true}) {
        TestSegment segment(is100);
        const int last = segment.Blocks() - 1;
        // 40 times 16 bits: more than a macroblock has.
        const std::string codes = Repeated(kPlus255, 40) + kEnd;
        std::string rest = segment.Put(1, 2, "000000000000" + codes);
        for (int block = 0; block <= last; ++block)
            if (block != 2) rest = segment.PutBehind(1, block, 16, rest);
        for (int macroblock = 0; macroblock < kMacroblocks; ++macroblock)
            for (int block = 0; macroblock != 1 && block <= last; ++block)
                rest = segment.PutBehind(macroblock, block, 16, rest);
        ASSERT_EQ("", rest);
        std::vector<int16_t> expected(kPlaces);
        std::fill_n(expected.begin() + 1, 40, int16_t{255});
        const Parsed parsed = Parse(segment.Bytes(), is100);
        EXPECT_EQ(expected, parsed.Block(1, 2));
        EXPECT_EQ(Levels({}), parsed.Block(1, 3));
        EXPECT_EQ(Levels({}), parsed.Block(0, 0));
    }
}

TEST(DVHuffman, BlocksTakeSpareBitsInTheirOrder) {
    TestSegment segment;
    const std::string rest1 = segment.Put(3, 1, "000000000000" + Repeated(kMinus23, 8) + kEnd);
    const std::string rest4 = segment.Put(3, 4, "000000000000" + Repeated(kPlus255, 6) + kEnd);
    std::string rest = rest1 + rest4;
    for (const int block : {0, 2, 3, 5}) rest = segment.PutBehind(3, block, 16, rest);
    ASSERT_EQ("", rest);
    const Parsed parsed = Parse(segment.Bytes());
    std::vector<int16_t> expected(kPlaces);
    std::fill_n(expected.begin() + 1, 8, int16_t{-23});
    EXPECT_EQ(expected, parsed.Block(3, 1));
    std::fill_n(expected.begin() + 1, 8, int16_t{0});
    std::fill_n(expected.begin() + 1, 6, int16_t{255});
    EXPECT_EQ(expected, parsed.Block(3, 4));
}

TEST(DVHuffman, ABlockWithoutAnEndStaysAsFarAsItCame) {
    TestSegment segment;
    for (int macroblock = 0; macroblock < kMacroblocks; ++macroblock)
        for (int block = 0; block < 6; ++block)
            segment.Put(macroblock, block,
                        "000000000000" + Repeated(kMinus23, 7)); // of the last, 4 bits are there
    const Parsed parsed = Parse(segment.Bytes());
    std::vector<int16_t> expected(kPlaces);
    std::fill_n(expected.begin() + 1, 6, int16_t{-23});
    EXPECT_EQ(expected, parsed.Block(0, 0));
    EXPECT_EQ(expected, parsed.Block(4, 3));
    std::fill_n(expected.begin() + 1, 6, int16_t{0});
    std::fill_n(expected.begin() + 1, 4, int16_t{-23});
    EXPECT_EQ(expected, parsed.Block(2, 5));
}

/// Whatever the bits, nothing beyond the segment is read, and nothing but the coefficients is written.
TEST(DVHuffman, AnyBitsAtAGuardPage) {
    PKTest::Random random(20261123);
    for (int turn = 0; turn < 3000; ++turn) {
        const PKTest::GuardedRows segment(kSegmentBytes, PKTest::Guard::kAfter);
        for (int i = 0; i < kSegmentBytes; ++i)
            segment.Bytes()[i] =
                static_cast<uint8_t>(random.Next() | (turn % 3 == 0 ? random.Next() | random.Next() : 0));
        const Parsed first = Parse(segment.Bytes(), turn % 2 == 1),
                     second = Parse(segment.Bytes(), turn % 2 == 1);
        ASSERT_EQ(first.coefficients, second.coefficients);
        for (const int16_t level : first.coefficients) ASSERT_LE(std::abs(level), 256);
    }
}

/// The lowest coefficients are those of the whole parse, wherever their code words lie.
TEST(DVHuffman, APartOfTheParse) {
    PKTest::Random random(20261124);
    for (int turn = 0; turn < 2000; ++turn) {
        std::array<uint8_t, kSegmentBytes> segment;
        for (uint8_t& byte : segment)
            byte = static_cast<uint8_t>(turn % 2 == 0 ? random.Next() : random.Next() | random.Next());
        const bool is100 = turn % 4 > 1;
        const Parsed whole = Parse(segment.data(), is100), part = Parse(segment.data(), is100, {4, 8});
        ASSERT_EQ(whole.parameters, part.parameters);
        for (int macroblock = 0; macroblock < kMacroblocks; ++macroblock)
            for (int block = 0; block < whole.blocks; ++block) {
                const bool is248 = !is100 && (whole.Parameters(macroblock, block) & 0x40) != 0;
                const DVScan scan = is248 ? Backwards() : Straight();
                for (size_t place = 0; place <= (is248 ? 8u : 4u); ++place)
                    ASSERT_EQ(whole.Block(macroblock, block)[scan[place]],
                              part.Block(macroblock, block)[scan[place]])
                        << "turn " << turn << ", macroblock " << macroblock << ", block " << block
                        << ", place " << place;
            }
    }
}

TEST(DVHuffman, NullPointersAreAnError) {
    const TestSegment segment;
    std::vector<int16_t> coefficients(size_t{kMacroblocks * 8 * kPlaces});
    std::vector<uint32_t> parameters(size_t{kMacroblocks * 8});
    const DVScan scans[2] = {Straight(), Straight()};
    EXPECT_EQ(-8, InitDVHuffmanTable(kDVCodes, {kDVRunEscape, kDVAmplitudeEscape}, nullptr));
    EXPECT_EQ(-8, HuffmanDecodeSegmentDV(nullptr, scans, &Table(), coefficients.data(), parameters.data()));
    EXPECT_EQ(
        -8, HuffmanDecodeSegmentDV(segment.Bytes(), scans, nullptr, coefficients.data(), parameters.data()));
    EXPECT_EQ(-8, HuffmanDecodeSegmentDV(segment.Bytes(), scans, &Table(), nullptr, parameters.data()));
    EXPECT_EQ(-8,
              HuffmanDecodeSegmentDV100(segment.Bytes(), scans[0], &Table(), coefficients.data(), nullptr));
}

} // namespace
} // namespace PK
