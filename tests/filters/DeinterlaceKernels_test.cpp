// The kernels of PK_Deinterlace along edges, against a restatement pixel by pixel and against pixels by hand.

#include "filters/DeinterlaceKernels.h"
#include "reference/ReferenceDeinterlace.h"
#include "support/FloatEnvironment.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <limits>
#include <vector>

using namespace PKTest;

namespace {

using PK::DeinterlaceKernels;

struct Case {
    PK::TwoRowKernel DeinterlaceKernels::*kernel;
    SampleDepth depth;
    bool alphaFirst;
    PK::Samples samples;
};

constexpr Case kCases[] = {
    {&DeinterlaceKernels::alphaLast8u, SampleDepth::k8u, false, PK::Samples::Bytes},
    {&DeinterlaceKernels::alphaLast15u, SampleDepth::k15u, false, PK::Samples::Words},
    {&DeinterlaceKernels::alphaLast32f, SampleDepth::k32f, false, PK::Samples::Floats},
    {&DeinterlaceKernels::alphaFirst8u, SampleDepth::k8u, true, PK::Samples::Bytes},
    {&DeinterlaceKernels::alphaFirst15u, SampleDepth::k15u, true, PK::Samples::Words},
    {&DeinterlaceKernels::alphaFirst32f, SampleDepth::k32f, true, PK::Samples::Floats},
};

class DeinterlaceBodies : public TargetTest {
protected:
    using Row = std::vector<uint8_t>;
    const DeinterlaceKernels& fKernels = PK::KernelsFor<DeinterlaceKernels>(GetParam());
    Random fRandom{6301};

    void Check(const Case& c, const Row& above, const Row& below, int32_t width) {
        Row out(above.size()), expected(above.size());
        ReferenceInterpolateRow(c.depth, c.alphaFirst, above.data(), below.data(), expected.data(), width);
        (fKernels.*c.kernel)(above.data(), below.data(), out.data(), width);
        ASSERT_EQ("", FirstDifference(c.samples, out.size(), expected.data(), out.data()))
            << "kernel " << &c - kCases << ", width " << width << ", seed " << fRandom.Seed();
    }

    /// One channel repeated: grey pixels, opaque.
    Row Grey(const std::vector<uint8_t>& codes) {
        Row row;
        for (const uint8_t code : codes) row.insert(row.end(), {code, code, code, 255});
        return row;
    }
    /// The second of three grey pixels.
    int Middle(const std::vector<uint8_t>& above, const std::vector<uint8_t>& below) {
        Row out(12);
        fKernels.alphaLast8u(Grey(above).data(), Grey(below).data(), out.data(), 3);
        EXPECT_EQ(out[7], 255);
        return out[4];
    }
};

TEST_P(DeinterlaceBodies, GiveWhatTheFormulaGives) {
    for (const Case& c : kCases)
        for (int32_t width = 0; width < 90; ++width)
            for (int round = 0; round < 4; ++round) {
                Row above(4 * static_cast<size_t>(c.depth) * static_cast<size_t>(width)), below(above.size());
                FillSamples(c.samples, above.data(), above.size(), fRandom);
                FillSamples(c.samples, below.data(), below.size(), fRandom);
                ASSERT_NO_FATAL_FAILURE(Check(c, above, below, width));
            }
}

// Few values make ties, and many of them.
TEST_P(DeinterlaceBodies, BreakTiesAsTheFormulaDoes) {
    for (const Case& c : kCases) {
        constexpr int32_t kWidth = 203;
        for (int round = 0; round < 20; ++round) {
            const size_t sample = static_cast<size_t>(c.depth);
            Row above(4 * sample * kWidth), below(above.size());
            for (Row* row : {&above, &below})
                for (size_t at = 0; at < row->size(); at += sample) {
                    const uint32_t level = fRandom.Below(3);
                    const float value = static_cast<float>(level) * 0.5f;
                    const auto word = static_cast<uint16_t>(level * 20000);
                    if (c.depth == SampleDepth::k32f)
                        std::memcpy(&(*row)[at], &value, sizeof value);
                    else if (c.depth == SampleDepth::k15u)
                        std::memcpy(&(*row)[at], &word, sizeof word);
                    else
                        (*row)[at] = static_cast<uint8_t>(level * 100);
                }
            ASSERT_NO_FATAL_FAILURE(Check(c, above, below, kWidth));
        }
    }
}

// The distances are three times the square of the differences that stand at the side.
TEST_P(DeinterlaceBodies, ChooseTheDirectionOfTheSmallestDistance) {
    EXPECT_EQ(Middle({10, 0, 200}, {0, 10, 20}), 10); // left 10, centre 10: 15, limited to 10
    EXPECT_EQ(Middle({9, 0, 200}, {0, 10, 20}), 5);   // left 11, centre 10
    EXPECT_EQ(Middle({200, 0, 10}, {20, 10, 0}), 5);  // right 10, centre 10
    EXPECT_EQ(Middle({200, 0, 11}, {20, 10, 0}), 10); // right 9, centre 10
    EXPECT_EQ(Middle({4, 0, 2}, {4, 10, 6}), 5);      // left 2, right 2: 5 on the left, 3 on the right
    EXPECT_EQ(Middle({100, 0, 3}, {8, 10, 0}), 6);    // right 5: 5.5, rounded up
}

TEST_P(DeinterlaceBodies, MeasureTheChannelsBesideAlphaAlone) {
    for (const bool alphaFirst : {false, true}) {
        // Colours say right; alphas say left.
        Row above, below, out(12);
        const auto put = [&](Row& row, uint8_t colour, uint8_t alpha) {
            if (alphaFirst) row.push_back(alpha);
            row.insert(row.end(), 3, colour);
            if (!alphaFirst) row.push_back(alpha);
        };
        put(above, 0, 90), put(above, 100, 0), put(above, 120, 0);
        put(below, 120, 255), put(below, 200, 255), put(below, 60, 90);
        (alphaFirst ? fKernels.alphaFirst8u : fKernels.alphaLast8u)(above.data(), below.data(), out.data(),
                                                                    3);
        EXPECT_EQ(out[4 + (alphaFirst ? 1 : 0)], 120);
        EXPECT_EQ(out[4 + (alphaFirst ? 0 : 3)], 128); // of 0 and 255, from the right as well
    }
}

TEST_P(DeinterlaceBodies, TakeTheFirstAndTheLastColumnStraightDown) {
    for (const auto& [above, below, expected] :
         std::vector<std::array<std::vector<uint8_t>, 3>>{{{{0}, {255}, {128}}},
                                                          {{{0, 200}, {200, 1}, {100, 101}}},
                                                          {{{0, 0, 200}, {200, 0, 1}, {100, 0, 101}}}}) {
        Row out(above.size() * 4);
        fKernels.alphaLast8u(Grey(above).data(), Grey(below).data(), out.data(),
                             static_cast<int32_t>(above.size()));
        EXPECT_EQ(out, Grey(expected));
    }
}

TEST_P(DeinterlaceBodies, KeepNotANumberToItsPixel) {
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    constexpr int32_t kWidth = 37;
    for (int32_t place = 0; place < 4 * kWidth; ++place)
        for (const bool isAbove : {false, true}) {
            std::vector<float> above(4 * kWidth), below(above.size()), out(above.size());
            for (float& sample : above) sample = static_cast<float>(fRandom.Below(100));
            for (float& sample : below) sample = static_cast<float>(fRandom.Below(100));
            (isAbove ? above : below)[static_cast<size_t>(place)] = kNaN;
            const FloatEnvironment environment(kExceptionFlags);
            fKernels.alphaLast32f(above.data(), below.data(), out.data(), kWidth);
            EXPECT_TRUE(environment.IsAsGiven());
            for (size_t i = 0; i < out.size(); ++i)
                if (i / 4 != static_cast<size_t>(place) / 4) {
                    ASSERT_FALSE(std::isnan(out[i])) << i << ", odd at " << place;
                    ASSERT_GE(out[i], std::min(above[i], below[i]));
                    ASSERT_LE(out[i], std::max(above[i], below[i]));
                }
        }
}

INSTANTIATE_TEST_SUITE_P(Targets, DeinterlaceBodies, EveryTarget(), TargetOf);

} // namespace
