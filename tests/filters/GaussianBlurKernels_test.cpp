// The line filter of the Gaussian blur: by hand, and every body to the bit of a restatement on whole arrays.

#include "filters/GaussianBlurKernels.h"
#include "filters/GaussianCoefficients.h"
#include "reference/ReferenceGaussianBlur.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <vector>

namespace {

using namespace PKTest;

using Line = std::vector<FloatPixel>;

struct Shape {
    int32_t count, sourceLength, length;
    bool repeatEdge;
};

GuardedRows Scratch(int32_t length) {
    return {size_t{PK::kGaussianLines * PK::kGaussianPixelBytes} * static_cast<size_t>(length),
            Guard::kAfter};
}

void FilterBy(PK::Target target, const PK::GaussianLines& lines, const PK::GaussianCoefficients& c) {
    PK::KernelsFor<PK::GaussianBlurKernels>(target).filterLines(lines, c);
}

/// Lines that all begin `step` bytes apart and end at a guard page.
class Lines {
public:
    Lines(int32_t count, int32_t length, int64_t padding)
        : fLength(length), fStep(int64_t{length} * PK::kGaussianPixelBytes + padding),
          fMemory(static_cast<size_t>((count - 1) * fStep + int64_t{length} * PK::kGaussianPixelBytes),
                  Guard::kAfter) {}

    uint8_t* At(int32_t line) const { return fMemory.Bytes() + line * fStep; }
    int64_t Step() const { return fStep; }

    void Set(int32_t line, const Line& pixels) const {
        std::memcpy(At(line), pixels.data(), pixels.size() * sizeof(FloatPixel));
    }
    Line Get(int32_t line) const {
        Line pixels(static_cast<size_t>(fLength));
        std::memcpy(pixels.data(), At(line), pixels.size() * sizeof(FloatPixel));
        return pixels;
    }

private:
    int32_t fLength;
    int64_t fStep;
    GuardedRows fMemory;
};

std::vector<uint32_t> Bits(const Line& line) {
    std::vector<uint32_t> bits(4 * line.size());
    std::memcpy(bits.data(), line.data(), line.size() * sizeof(FloatPixel));
    return bits;
}

Line DrawLine(int32_t length, Random& random) {
    Line line(static_cast<size_t>(length));
    for (FloatPixel& pixel : line)
        for (float& sample : pixel) sample = static_cast<float>(random.Below(2000)) / 1024 - 0.5f;
    return line;
}

class GaussianBlurKernels : public testing::Test {
protected:
    void Check(const Shape& shape, double sigma) {
        const auto [count, sourceLength, length, repeatEdge] = shape;
        const PK::GaussianCoefficients c = PK::GaussianCoefficientsOf(sigma);
        const GuardedRows scratch = Scratch(length);
        std::vector<Line> sources, expected;
        for (int32_t i = 0; i < count; ++i) {
            sources.push_back(DrawLine(sourceLength, fRandom));
            expected.push_back(ReferenceGaussianLine(sources.back(), length,
                                                     {c.c0, c.c1, c.c2, c.c3, c.d1, c.d2}, repeatEdge));
        }
        for (const PK::Target target : TargetsOfThisProcessor()) {
            SCOPED_TRACE(testing::Message()
                         << PK::TargetName(target) << ", " << count << " lines from " << sourceLength
                         << " to " << length << ", repeated " << repeatEdge << ", sigma " << sigma);
            const Lines from(count, sourceLength, 4), to(count, length, 12);
            for (int32_t i = 0; i < count; ++i) from.Set(i, sources[static_cast<size_t>(i)]);
            FilterBy(target,
                     {from.At(0), from.Step(), to.At(0), to.Step(), scratch.Bytes(), count, sourceLength,
                      length, repeatEdge},
                     c);
            for (int32_t i = 0; i < count; ++i)
                ASSERT_EQ(Bits(to.Get(i)), Bits(expected[static_cast<size_t>(i)])) << "line " << i;

            const Lines both(count, length + 1, 0);
            for (int32_t i = 0; i < count; ++i) both.Set(i, sources[static_cast<size_t>(i)]);
            FilterBy(target,
                     {both.At(0), both.Step(), both.At(0) + PK::kGaussianPixelBytes, both.Step(),
                      scratch.Bytes(), count, sourceLength, length, repeatEdge},
                     c);
            for (int32_t i = 0; i < count; ++i) {
                Line line = both.Get(i);
                line.erase(line.begin());
                ASSERT_EQ(Bits(line), Bits(expected[static_cast<size_t>(i)])) << "line " << i << ", in place";
            }
        }
    }

    Random fRandom{6100};
};

/// A line of grey pixels through coefficients that make sums easy.
std::vector<float> Filtered(const std::vector<float>& source, int32_t length, bool repeatEdge) {
    constexpr PK::GaussianCoefficients kEasy = {
        .c0 = 4, .c1 = 2, .c2 = 8, .c3 = 16, .d1 = -0.5f, .d2 = 0.25f};
    Line line;
    for (const float sample : source) line.push_back({sample, 0, 0, sample});
    Line result(static_cast<size_t>(length));
    const GuardedRows scratch = Scratch(length);
    const PK::GaussianLines lines = {reinterpret_cast<const uint8_t*>(line.data()),
                                     0,
                                     reinterpret_cast<uint8_t*>(result.data()),
                                     0,
                                     scratch.Bytes(),
                                     1,
                                     static_cast<int32_t>(source.size()),
                                     length,
                                     repeatEdge};
    FilterBy(TargetsOfThisProcessor().back(), lines, kEasy);
    std::vector<float> samples;
    for (const FloatPixel& pixel : result) {
        EXPECT_EQ(pixel[0], pixel[3]);
        EXPECT_EQ(pixel[1], 0);
        samples.push_back(pixel[0]);
    }
    return samples;
}

} // namespace

// y = 4 x[i] + 2 x[i-1] + 0.5 y[i-1] - 0.25 y[i-2]: of 1 0 0 it is 4, 2 + 2, 2 - 1.
// z = 8 x[i+1] + 16 x[i+2] + 0.5 z[i+1] - 0.25 z[i+2]: of 0 0 1 from behind 0, 8, 16 + 4.
TEST_F(GaussianBlurKernels, AnImpulseByHand) {
    EXPECT_EQ(Filtered({1, 0, 0}, 3, false), (std::vector<float>{4, 4, 1}));
    EXPECT_EQ(Filtered({0, 0, 1}, 3, false), (std::vector<float>{20, 8, 4}));
}

// The source stands at 1: y is 0 there before it and 4, 4, 1 from it on; z is 8 at 0.
TEST_F(GaussianBlurKernels, MarginsTakeTheTailsByHand) {
    EXPECT_EQ(Filtered({1}, 3, false), (std::vector<float>{8, 4, 4}));
    EXPECT_EQ(Filtered({1}, 1, false), (std::vector<float>{4}));
}

// Of an odd difference the greater half lies before the source: it stands at 1 of two. The anticausal pass begins at 0,
// with a z of 0 behind it.
TEST_F(GaussianBlurKernels, OfAnOddDifferenceTheSourceLiesRightOfTheMiddle) {
    EXPECT_EQ(Filtered({1}, 2, false), (std::vector<float>{8, 4}));
    // Repeated: y[0] = 0.5 is preset, and y[1] = 4 + 2 + 0.5 x 0.5 - 0.25 x 0.5 = 6.125. z[1] is 0, not 0.5, and
    // z[2] = 0.5: z[0] = 8 + 16 + 0 - 0.125 = 23.875.
    EXPECT_EQ(Filtered({1}, 2, true), (std::vector<float>{24.375f, 6.125f}));
}

// y[0] = 4 + 2 + 0.25 - 0.125 = 6.125; z[0] = 8 + 16 + 0.25 - 0.125 = 24.125.
TEST_F(GaussianBlurKernels, RepeatedEdgesBeginInTheirPresetsByHand) {
    EXPECT_EQ(Filtered({1}, 1, true), (std::vector<float>{30.25f}));
    // The source stands at 1: y[0] = 0.5, y[1] = 6.125, y[2] = 6 + 3.0625 - 0.125 = 8.9375; z[2] = 0.5,
    // z[1] = 24.125 and z[0] = 24 + 12.0625 - 0.125 = 35.9375.
    EXPECT_EQ(Filtered({1}, 3, true), (std::vector<float>{36.4375f, 30.25f, 9.4375f}));
}

TEST_F(GaussianBlurKernels, EveryBodyGivesTheBitsOfTheRestatement) {
    for (int32_t count = 1; count <= PK::kGaussianLines; ++count)
        for (const int32_t sourceLength : {1, 2, 3, 5, 17})
            for (const int32_t more : {0, 1, 2, 3, 8, 21})
                for (const bool repeatEdge : {false, true})
                    ASSERT_NO_FATAL_FAILURE(
                        Check({count, sourceLength, sourceLength + more, repeatEdge}, 2.3));
    for (int round = 0; round < 60; ++round) {
        const auto length = 1 + static_cast<int32_t>(fRandom.Below(300));
        const auto longer = length + static_cast<int32_t>(fRandom.Below(100));
        ASSERT_NO_FATAL_FAILURE(
            Check({1 + static_cast<int32_t>(fRandom.Below(8)), length, longer, fRandom.Below(2) != 0},
                  0.2 + fRandom.Below(1000) / 10.0));
    }
}

// The restatement is held to what it should be, a Gaussian, within a twentieth of its peak.
TEST_F(GaussianBlurKernels, ComesNearToAGaussian) {
    constexpr int kLength = 201, kMiddle = 100;
    for (const double sigma : {1.0, 3.0, 10.0}) {
        Line line(kLength);
        line[kMiddle] = {1, 1, 1, 1};
        const Line result = ReferenceGaussianLine(line, kLength, ReferenceGaussianOf(sigma), false);
        const double peak = 1 / (sigma * std::sqrt(2 * M_PI));
        double sum = 0;
        for (int i = 0; i < kLength; ++i) {
            const double place = (i - kMiddle) / sigma, value = double{result[static_cast<size_t>(i)][0]};
            sum += value;
            EXPECT_NEAR(value, peak * std::exp(-place * place / 2), 0.05 * peak) << sigma << ' ' << i;
        }
        EXPECT_NEAR(sum, 1, 1e-4);
    }
}
