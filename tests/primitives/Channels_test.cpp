// One channel of four is set, replaced in a copy, or inverted; no byte outside the samples changes.

#include "primitives/Channels.h"

#include "support/Random.h"
#include "support/RowBuffer.h"
#include "support/Targets.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <vector>

using namespace PKTest;

namespace PK {
namespace {

constexpr Placement kPlaces[] = {{Placement::kBeforeGuard},
                                 {Placement::kAfterGuard},
                                 {Placement::kAtOffset, 4},
                                 {Placement::kAtOffset, 7}};

int32_t Set(uint8_t value, uint8_t* start, ptrdiff_t step, int32_t width, int32_t height) {
    return SetChannel8u(value, start, step, width, height);
}
int32_t Set(uint16_t value, uint8_t* start, ptrdiff_t step, int32_t width, int32_t height) {
    return SetChannel16u(value, start, step, width, height);
}
int32_t Set(float value, uint8_t* start, ptrdiff_t step, int32_t width, int32_t height) {
    return SetChannel32f(value, start, step, width, height);
}

/// Sets the channel of single rows that end with their last sample, and compares sample by sample.
template <class Sample>
void CheckSet(Sample value) {
    Random random(21);
    AtEveryTarget([&] {
        for (const Placement place : kPlaces) {
            for (size_t width = 1; width <= 70; ++width) {
                SCOPED_TRACE(testing::Message() << "width " << width << ", " << place);
                const RowBuffer row((4 * (width - 1) + 1) * sizeof value, place);
                random.Fill(row.Data(), row.Size());
                std::vector<uint8_t> expected(row.Data(), row.Data() + row.Size());
                for (size_t x = 0; x < width; ++x)
                    std::memcpy(expected.data() + 4 * x * sizeof value, &value, sizeof value);
                ASSERT_EQ(Set(value, row.Data(), 0, static_cast<int32_t>(width), 1), 0);
                ASSERT_TRUE(std::equal(expected.begin(), expected.end(), row.Data()));
                ASSERT_TRUE(row.MarginsIntact());
            }
        }
    });
}

TEST(SetChannel, WritesTheSamplesOfOneChannelOnly) {
    CheckSet<uint8_t>(0xc3);
    CheckSet<uint16_t>(0x8001);
    CheckSet<float>(0.7f);
}

TEST(SetChannel, WalksRowsOfEitherStep) {
    for (const ptrdiff_t step : {12, -12}) {
        uint8_t rows[24] = {};
        uint8_t* start = step > 0 ? rows + 3 : rows + 15;
        EXPECT_EQ(SetChannel8u(255, start, step, 2, 2), 0);
        for (int i = 0; i < 24; ++i) EXPECT_EQ(rows[i], i % 12 < 8 && i % 4 == 3 ? 255 : 0) << i;
    }
}

TEST(SetChannel, RefusesNullPointersAndNegativeSizes) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    EXPECT_EQ(SetChannel8u(0, nullptr, 4, 1, 1), -8);
    EXPECT_EQ(SetChannel16u(0, nullptr, 4, 1, 1), -8);
    EXPECT_EQ(SetChannel32f(0, nullptr, 4, 1, 1), -8);
    EXPECT_EQ(SetChannel8u(0, pixel, 4, -1, 1), -6);
    EXPECT_EQ(SetChannel8u(0, pixel, 4, 1, -1), -6);
    EXPECT_EQ(SetChannel8u(0, pixel, 4, 0, 1), 0);
    EXPECT_EQ(pixel[0], 1);
}

/// Runs a row function with every body, place and width, in place or into another row, beside a rule for
/// samples: alpha(source, destination) is what the destination's alpha becomes, and colour of the destination
/// comes from the source or stays.
template <class Sample, class RowOf, class Alpha>
void CheckRow(RowOf rowOf, bool copiesColour, Sample patternValue, Alpha alpha) {
    Random random(22);
    for (const Target target : TargetsOfThisProcessor()) {
        for (const int32_t channel : {0, 3}) {
            for (size_t width = 0; width <= 40; ++width) {
                const Placement place = kPlaces[width % std::size(kPlaces)];
                const bool inPlace = random.Below(2) == 0;
                SCOPED_TRACE(testing::Message() << TargetName(target) << ", channel " << channel << ", width "
                                                << width << ", " << place << ", in place " << inPlace);
                std::vector<Sample> source(4 * width);
                random.Fill(reinterpret_cast<uint8_t*>(source.data()), source.size() * sizeof(Sample));
                std::vector<Sample> expected(4 * width);
                random.Fill(reinterpret_cast<uint8_t*>(expected.data()), expected.size() * sizeof(Sample));
                if (inPlace) expected = source;
                const RowBuffer row(expected.size() * sizeof(Sample), place);
                std::copy_n(reinterpret_cast<const uint8_t*>(expected.data()), row.Size(), row.Data());
                for (size_t i = 0; i < expected.size(); ++i) {
                    if (static_cast<int32_t>(i % 4) == channel)
                        expected[i] = alpha(source[i]);
                    else if (copiesColour)
                        expected[i] = source[i];
                }
                const auto* from = inPlace ? row.Data() : reinterpret_cast<const uint8_t*>(source.data());
                rowOf(KernelsFor<ChannelKernels>(target))(from, row.Data(), row.Size(),
                                                          PatternOfChannel(channel, patternValue));
                ASSERT_TRUE(std::equal(row.Data(), row.Data() + row.Size(),
                                       reinterpret_cast<const uint8_t*>(expected.data())));
                ASSERT_TRUE(row.MarginsIntact());
            }
        }
    }
}

TEST(ReplaceChannel, CopiesAllButTheChannel) {
    const auto replace = [](const ChannelKernels& kernels) { return kernels.replace; };
    CheckRow<uint8_t>(replace, true, 77, [](uint8_t) { return uint8_t{77}; });
    CheckRow<uint16_t>(replace, true, 32768, [](uint16_t) { return uint16_t{32768}; });
    CheckRow<float>(replace, true, 0.3f, [](float) { return 0.3f; });
}

TEST(InvertChannel, SubtractsIntegersFromTheValueAndLeavesColour) {
    const auto invert = [](const ChannelKernels& kernels) { return kernels.invertInteger; };
    CheckRow<uint8_t>(invert, false, 255, [](uint8_t a) { return static_cast<uint8_t>(255 - a); });
    CheckRow<uint16_t>(invert, false, 32768, [](uint16_t a) { return static_cast<uint16_t>(32768 - a); });
}

TEST(InvertChannel, SubtractsFloatsFromTheValueAndLeavesColour) {
    const float alphas[] = {0.0f, 1.0f, 0.25f, 1.5f, -0.1f, 3e38f, std::numeric_limits<float>::infinity()};
    for (const Target target : TargetsOfThisProcessor()) {
        for (const int32_t channel : {0, 3}) {
            std::vector<float> row;
            for (const float alpha : alphas)
                for (int32_t i = 0; i < 4; ++i)
                    row.push_back(i == channel ? alpha : 0.1f * static_cast<float>(i));
            std::vector<float> expected = row;
            for (size_t i = 0; i < std::size(alphas); ++i)
                expected[4 * i + static_cast<size_t>(channel)] = 1.0f - alphas[i];
            auto* bytes = reinterpret_cast<uint8_t*>(row.data());
            KernelsFor<ChannelKernels>(target).invertFloat(bytes, bytes, row.size() * sizeof(float),
                                                           PatternOfChannel(channel, 1.0f));
            EXPECT_EQ(row, expected) << TargetName(target);
        }
    }
}

TEST(InvertChannel, LeavesColourThatIsNoNumber) {
    const float nan = std::numeric_limits<float>::signaling_NaN();
    for (const Target target : TargetsOfThisProcessor()) {
        float row[4] = {nan, nan, nan, 0.25f}, before[4];
        std::memcpy(before, row, sizeof row);
        auto* bytes = reinterpret_cast<uint8_t*>(row);
        KernelsFor<ChannelKernels>(target).invertFloat(bytes, bytes, sizeof row, PatternOfChannel(3, 1.0f));
        EXPECT_EQ(std::memcmp(row, before, 12), 0) << TargetName(target);
        EXPECT_EQ(row[3], 0.75f);
    }
}

} // namespace
} // namespace PK
