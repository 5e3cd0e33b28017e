// Layouts of pixels as lanes, votes of groups and products by 255ths, in the bodies of every target.

#include "primitives/LaneProbes.h"

#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <vector>

namespace {

using namespace PK;
using PKTest::LaneProbes;
using PKTest::LayoutProbe;

constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr int32_t kPixels = 37; // some groups of every target and a rest

class PixelLanes : public testing::TestWithParam<Target> {
protected:
    const LaneProbes& probes = KernelsFor<LaneProbes>(GetParam());
    PKTest::Random random{17};

    template <class Sample>
    std::vector<Sample> Draw(uint32_t limit) {
        std::vector<Sample> samples(4 * kPixels);
        for (Sample& sample : samples) sample = static_cast<Sample>(random.Below(limit));
        return samples;
    }

    template <class Sample>
    static std::vector<float> Load(const LayoutProbe& layout, const std::vector<Sample>& pixels) {
        std::vector<float> channels(pixels.size());
        layout.load(pixels.data(), channels.data(), static_cast<int32_t>(pixels.size() / 4));
        return channels;
    }

    template <class Sample>
    static std::vector<Sample> Store(const LayoutProbe& layout, const std::vector<float>& channels) {
        std::vector<Sample> pixels(channels.size());
        layout.store(channels.data(), pixels.data(), static_cast<int32_t>(channels.size() / 4));
        return pixels;
    }

    /// Samples come out in their order, or each pixel's in the reverse order, and go back to where they were.
    template <class Sample>
    void CheckOrders(const LayoutProbe& alphaLast, const LayoutProbe& alphaFirst, uint32_t limit) {
        const std::vector<Sample> pixels = Draw<Sample>(limit);
        std::vector<float> expected(pixels.begin(), pixels.end());
        EXPECT_EQ(Load(alphaLast, pixels), expected);
        EXPECT_EQ(Store<Sample>(alphaLast, expected), pixels);
        for (size_t i = 0; i < expected.size(); i += 4)
            std::reverse(expected.begin() + static_cast<ptrdiff_t>(i),
                         expected.begin() + static_cast<ptrdiff_t>(i + 4));
        EXPECT_EQ(Load(alphaFirst, pixels), expected);
        EXPECT_EQ(Store<Sample>(alphaFirst, expected), pixels);
    }
};

TEST_P(PixelLanes, ComeInTheOrderOfBGRA) {
    CheckOrders<uint8_t>(probes.bytesAlphaLast, probes.bytesAlphaFirst, 256);
    CheckOrders<uint16_t>(probes.wordsAlphaLast, probes.wordsAlphaFirst, 32769);
    CheckOrders<float>(probes.floatsAlphaLast, probes.floatsAlphaFirst, 1000);
}

TEST_P(PixelLanes, AreRoundedToTheNearestCodeWithTiesToEvenAndLimited) {
    const std::vector<float> channels = {0.5f,   1.5f,  2.5f,   254.5f,    -0.5f,      -1,
                                         255.5f, 1e30f, -1e30f, kInfinity, -kInfinity, kNaN};
    const std::vector<uint8_t> bytes = {0, 2, 2, 254, 0, 0, 255, 255, 0, 255, 0, 0};
    EXPECT_EQ(Store<uint8_t>(probes.bytesAlphaLast, channels), bytes);
    std::vector<float> great = channels;
    great[3] = 32766.5f;
    great[6] = 32768.5f;
    const std::vector<uint16_t> words = {0, 2, 2, 32766, 0, 0, 32768, 32768, 0, 32768, 0, 0};
    EXPECT_EQ(Store<uint16_t>(probes.wordsAlphaLast, great), words);
}

TEST_P(PixelLanes, KeepWordsAboveFullScaleOnLoading) {
    const std::vector<uint16_t> words = {32768, 32769, 65535, 40000};
    EXPECT_EQ(Load(probes.wordsAlphaLast, words), (std::vector<float>{32768, 32769, 65535, 40000}));
}

TEST_P(PixelLanes, VoteInGroupsOfFour) {
    for (uint32_t first = 0; first < 16; ++first)
        for (uint32_t second = 0; second < 16; ++second) {
            std::array<uint32_t, 8> masks, expected;
            for (uint32_t i = 0; i < 4; ++i) {
                masks[i] = first >> i & 1 ? ~0u : 0;
                masks[i + 4] = second >> i & 1 ? ~0u : 0;
                expected[i] = first == 15 ? ~0u : 0;
                expected[i + 4] = second == 15 ? ~0u : 0;
            }
            std::array<uint32_t, 8> votes{};
            probes.vote(masks.data(), votes.data(), 8);
            EXPECT_EQ(votes, expected) << first << ' ' << second;
        }
}

TEST_P(PixelLanes, ProductsBy255thsAreTheNearestOfAllPairsOfBytes) {
    std::vector<uint32_t> a, b, expected;
    for (uint32_t i = 0; i < 65536; ++i) {
        a.push_back(i >> 8);
        b.push_back(i & 255);
        expected.push_back(((i >> 8) * (i & 255) * 2 + 255) / 510);
    }
    std::vector<uint32_t> products(a.size());
    probes.products(a.data(), b.data(), products.data(), static_cast<int32_t>(a.size()));
    EXPECT_EQ(products, expected);
}

TEST_P(PixelLanes, BytesAreComparedWithoutSign) {
    std::vector<uint8_t> a, b, lesser, greater;
    for (uint32_t i = 0; i < 65536; ++i) {
        a.push_back(static_cast<uint8_t>(i >> 8));
        b.push_back(static_cast<uint8_t>(i));
        lesser.push_back(std::min(a.back(), b.back()));
        greater.push_back(std::max(a.back(), b.back()));
    }
    std::vector<uint8_t> out(a.size());
    probes.lesserBytes(a.data(), b.data(), out.data(), static_cast<int32_t>(a.size() / 4));
    EXPECT_EQ(out, lesser);
    probes.greaterBytes(a.data(), b.data(), out.data(), static_cast<int32_t>(a.size() / 4));
    EXPECT_EQ(out, greater);
}

INSTANTIATE_TEST_SUITE_P(Targets, PixelLanes, PKTest::EveryTarget(), PKTest::TargetOf);

} // namespace
