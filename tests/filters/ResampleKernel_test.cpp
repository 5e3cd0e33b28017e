// Tables of filter weights: values, widths, what is kept from build to build, and what is reported.

#include "filters/ResampleKernel.h"
#include "support/Allocations.h"

#include "zebcore/debug.h"

#include <algorithm>
#include <cmath>
#include <gtest/gtest.h>
#include <limits>
#include <numbers>
#include <numeric>
#include <string>
#include <vector>

using PK::ResampleKernel;

namespace {

using Row = std::vector<int>;

Row RowOf(const ResampleKernel& kernel, int phase) {
    const int16_t* first = kernel.Weights() + phase * kernel.Width();
    return {first, first + kernel.Width()};
}

Row Table(const ResampleKernel& kernel) {
    return {kernel.Weights(), kernel.Weights() + ResampleKernel::kPhases * kernel.Width()};
}

int SumOf(const Row& row) {
    return std::accumulate(row.begin(), row.end(), 0);
}

ResampleKernel Reduced(int kind, float scale) {
    ResampleKernel kernel(kind);
    kernel.ScaleForDownSample(scale, scale);
    return kernel;
}

ResampleKernel Enlarged(int kind) {
    ResampleKernel kernel(kind);
    kernel.ScaleForUpSample(2);
    return kernel;
}

/// The cubic by its powers.
double Cubic(double argument, double a) {
    const double x = std::abs(argument);
    if (x >= 2) return 0;
    if (x >= 1) return a * std::pow(x, 3) - 5 * a * std::pow(x, 2) + 8 * a * x - 4 * a;
    return (a + 2) * std::pow(x, 3) - (a + 3) * std::pow(x, 2) + 1;
}

double Spline(double argument) {
    const double x = std::abs(argument);
    if (x >= 3) return 0;
    if (x >= 2) return (x - 2) * ((x - 2) * ((x - 2) / 11 - 45.0 / 209) + 26.0 / 209);
    if (x >= 1) return (x - 1) * ((x - 1) * ((x - 1) * -6 / 11 + 270.0 / 209) - 156.0 / 209);
    return 13.0 / 11 * std::pow(x, 3) - 453.0 / 209 * x * x - 3.0 / 209 * x + 1;
}

double Sinc(double x) {
    return x == 0 ? 1 : std::sin(std::numbers::pi * x) / (std::numbers::pi * x);
}

double Lanczos(double x) {
    return std::abs(x) >= 8 ? 0 : Sinc(x) * Sinc(x / 8);
}

/// Holds every weight to a shape whose centre is at index width / 2 - 1: cut towards zero, so at most one below the exact
/// value in magnitude, and never beyond it.
template <class Shape>
void ExpectShape(const ResampleKernel& kernel, Shape shape, int reach, int firstPhase = 0) {
    const int width = kernel.Width(), centre = width / 2 - 1;
    for (int phase = firstPhase; phase < ResampleKernel::kPhases; ++phase) {
        double sum = 0;
        for (int k = -reach; k <= reach; ++k) sum += shape(k - phase / 128.0);
        const Row row = RowOf(kernel, phase);
        for (int k = 0; k < width; ++k) {
            const double exact = shape(k - centre - phase / 128.0) * 16384 / sum;
            EXPECT_NEAR(row[static_cast<size_t>(k)], std::trunc(exact), 1)
                << "phase " << phase << ", tap " << k;
            EXPECT_LE(std::abs(row[static_cast<size_t>(k)]), std::abs(exact) + 1e-6);
            EXPECT_GT(std::abs(row[static_cast<size_t>(k)]), std::abs(exact) - 1 - 1e-6);
        }
    }
}

std::vector<std::string> sReports;

/// Counts what the host is told.
class ResampleContract : public testing::Test {
protected:
    ResampleContract() {
        sReports.clear();
        zebcore::debug::SetTraceSink([](const char* text) { sReports.emplace_back(text); });
    }
    ~ResampleContract() override { zebcore::debug::SetTraceSink(nullptr); }

    static void ExpectReport(const std::string& line, const std::string& function,
                             const std::string& expression) {
        ASSERT_EQ(sReports.size(), 2u) << "a report and an error";
        EXPECT_EQ(sReports[0], "Src/ResampleKernel:" + line + ": PK::ResampleKernel::" + function +
                                   ": contract violated: " + expression + "\n");
        EXPECT_EQ(sReports[1],
                  "error 105 (category 25, level 0): An input contract violation has occurred!\n");
        sReports.clear();
    }
};

} // namespace

TEST(ResampleKernel, HasNoTableAtFirst) {
    const ResampleKernel kernel(2);
    EXPECT_EQ(kernel.Width(), 0);
}

TEST(ResampleKernel, LinearWeightsAddUpInIntegers) {
    const ResampleKernel kernel = Enlarged(1);
    ASSERT_EQ(kernel.Width(), 2);
    for (int phase = 0; phase < 128; ++phase)
        EXPECT_EQ(RowOf(kernel, phase), (Row{16384 - 128 * phase, 128 * phase}));
    EXPECT_EQ(RowOf(kernel, 127), (Row{128, 16256}));
}

TEST(ResampleKernel, EnlargesByACubicOfFourTaps) {
    const ResampleKernel kernel = Enlarged(2);
    ASSERT_EQ(kernel.Width(), 4);
    EXPECT_EQ(RowOf(kernel, 0), (Row{0, 16384, 0, 0}));
    // Half way: -0.75 x 3.375 + 3.75 x 2.25 - 6 x 1.5 + 3 = -0.09375, and 1.25 / 8 - 2.25 / 4 + 1 = 0.59375.
    EXPECT_EQ(RowOf(kernel, 64), (Row{-1536, 9728, 9728, -1536}));
    // A quarter: -0.10546875, 0.87890625, 0.26171875, -0.03515625.
    EXPECT_EQ(RowOf(kernel, 32), (Row{-1728, 14400, 4288, -576}));
    ExpectShape(
        kernel, [](double x) { return Cubic(x, -0.75); }, 3);
}

TEST(ResampleKernel, EnlargesByWiderShapesOfEachKind) {
    struct {
        int kind;
        float stretch, a;
    } const cubics[] = {{3, 1.15f, -0.625f}, {4, 1.05f, -1.0f}, {5, 1.2f, -0.5f}};
    for (const auto& [kind, stretch, a] : cubics) {
        SCOPED_TRACE(testing::Message() << "kind " << kind);
        const ResampleKernel kernel = Enlarged(kind);
        ASSERT_EQ(kernel.Width(), 6);
        ExpectShape(
            kernel, [s = stretch, p = a](double x) { return Cubic(x / s, p); }, 3);
    }
    ASSERT_EQ(Enlarged(6).Width(), 6);
    ExpectShape(Enlarged(6), Spline, 4);
    ASSERT_EQ(Enlarged(7).Width(), 16);
    ExpectShape(Enlarged(7), Lanczos, 9);
    EXPECT_EQ(RowOf(Enlarged(7), 0)[7], 16384);
}

TEST(ResampleKernel, WeightsAreCutAndNotCorrected) {
    // Negative lobes that are cut towards zero let a row add up to more than one.
    int least = 16384, greatest = 16384;
    for (const int kind : {2, 3, 4, 5, 6, 7})
        for (const float scale : {0.25f, 0.3f, 0.5f, 0.77f, 1.0f, 2.0f}) {
            if (scale <= 1 && kind > 5) continue; // which have no room for a cubic at each of these
            const ResampleKernel kernel = scale > 1 ? Enlarged(kind) : Reduced(kind, scale);
            for (int phase = 0; phase < 128; ++phase) {
                const int sum = SumOf(RowOf(kernel, phase));
                least = std::min(least, sum);
                greatest = std::max(greatest, sum);
            }
        }
    EXPECT_LT(least, 16384);
    EXPECT_GE(least, 16384 - 20);
    EXPECT_GT(greatest, 16384);
    EXPECT_LE(greatest, 16384 + 20);
}

TEST(ResampleKernel, ScaleOfExactlyOneKeepsItsWidthAndAnImpulse) {
    const ResampleKernel kernel = Reduced(2, 1);
    ASSERT_EQ(kernel.Width(), 10);
    EXPECT_EQ(RowOf(kernel, 0), (Row{0, 0, 0, 0, 16384, 0, 0, 0, 0, 0}));
    EXPECT_EQ(RowOf(kernel, 64), (Row{0, 0, 0, -1536, 9728, 9728, -1536, 0, 0, 0}));
    // The outer two of the four are cut to nothing where they are a 128th from the end of the shape.
    for (int phase = 1; phase < 128; ++phase) {
        const Row row = RowOf(kernel, phase);
        for (size_t k = 0; k < row.size(); ++k)
            EXPECT_EQ(row[k] != 0, k >= (phase < 127 ? 3u : 4u) && k <= (phase > 1 ? 6u : 5u)) << phase;
    }
}

TEST(ResampleKernel, HalfScaleIsTrimmedToEightTaps) {
    const ResampleKernel kernel = Reduced(2, 0.5f);
    ASSERT_EQ(kernel.Width(), 8);
    const Row row = RowOf(kernel, 0);
    EXPECT_EQ(*std::max_element(row.begin(), row.end()), row[3]) << "the pixel of the sample";
    ExpectShape(
        kernel, [](double x) { return Cubic(x * 0.5, -0.75); }, 6);
}

TEST(ResampleKernel, GrowsWithTheReductionAndNoFurtherThanAQuarter) {
    EXPECT_EQ(Reduced(2, 0.4f).Width(), 10);
    EXPECT_EQ(Reduced(2, 0.36f).Width(), 12);
    // A row of 20 is trimmed to what has weights.
    EXPECT_LE(Reduced(2, 0.1f).Width(), 16);
    EXPECT_EQ(Table(Reduced(2, 0.1f)), Table(Reduced(2, 0.25f)));
    EXPECT_EQ(Table(Reduced(2, -3)), Table(Reduced(2, 0.25f)));
    ExpectShape(
        Reduced(2, 0.25f), [](double x) { return Cubic(x * 0.25, -0.75); }, 10);
}

TEST(ResampleKernel, WidthsAreEvenAndTheCentreStays) {
    for (const int kind : {2, 3, 4, 5})
        for (int hundredths = 20; hundredths <= 100; ++hundredths) {
            const ResampleKernel kernel = Reduced(kind, static_cast<float>(hundredths) / 100);
            ASSERT_EQ(kernel.Width() % 2, 0) << kind << ", " << hundredths;
            const Row row = RowOf(kernel, 0);
            ASSERT_EQ(std::max_element(row.begin(), row.end()) - row.begin(), kernel.Width() / 2 - 1)
                << kind << ", " << hundredths;
        }
}

TEST(ResampleKernel, SlidesTheCubicAndStretchesIt) {
    // At a quarter the far parameter applies, at 1 the near one and no stretch.
    ExpectShape(
        Reduced(3, 0.25f), [](double x) { return Cubic(x * (0.25f / 1.15f), -1.0); }, 12);
    ExpectShape(
        Reduced(3, 1), [](double x) { return Cubic(x, -0.625f); }, 4, 1);
    EXPECT_EQ(RowOf(Reduced(3, 1), 0)[4], 16384);
    // Half way between 1 and a quarter lies 0.625, and so does the parameter.
    const double half = -1.0f + 0.5f * (-2.2f + 1.0f);
    ExpectShape(
        Reduced(4, 0.625f), [half](double x) { return Cubic(x * (0.625f / 1.05f), half); }, 6);
    ExpectShape(
        Reduced(5, 0.25f), [](double x) { return Cubic(x * (0.25f / 1.2f), -0.5); }, 12);
    // What is decimated already is stretched for one scale and shaped for another.
    ResampleKernel kernel(3);
    kernel.ScaleForDownSample(0.5f, 0.25f);
    ExpectShape(
        kernel, [](double x) { return Cubic(x * (0.5f / 1.15f), -1.0); }, 8);
}

TEST(ResampleKernel, KeepsATableForScalesThatHardlyDiffer) {
    ResampleKernel kernel = Reduced(2, 0.5f);
    const Row half = Table(kernel);
    kernel.ScaleForDownSample(0.9f, 0.505f);
    EXPECT_EQ(Table(kernel), half);
    kernel.ScaleForDownSample(0.9f, 0.52f);
    EXPECT_NE(Table(kernel), half);
    EXPECT_EQ(Table(kernel), Table(Reduced(2, 0.9f))) << "the decimated scale makes the table";
}

TEST(ResampleKernel, OneTableServesAllEnlargementsAndWhatIsNearOne) {
    ResampleKernel kernel(2);
    kernel.ScaleForUpSample(7.5f);
    const Row first = Table(kernel);
    EXPECT_EQ(first, Table(Enlarged(2)));
    kernel.ScaleForDownSample(0.995f, 0.995f);
    EXPECT_EQ(Table(kernel), first);
    kernel.ScaleForDownSample(0.5f, 0.5f);
    EXPECT_EQ(kernel.Width(), 8);
    kernel.ScaleForUpSample(3);
    EXPECT_EQ(Table(kernel), first);
}

TEST(ResampleKernel, IsACopyOfItsOwn) {
    ResampleKernel kernel = Reduced(2, 0.5f);
    const ResampleKernel copy = kernel;
    kernel.ScaleForUpSample(2);
    EXPECT_EQ(copy.Width(), 8);
    EXPECT_EQ(Table(copy), Table(Reduced(2, 0.5f)));
}

TEST(ResampleKernel, WithoutMemoryHasNoTableAndTriesAgain) {
    ResampleKernel kernel(2);
    int widths[2];
    {
        const PKTest::AllocationLimit none(0);
        kernel.ScaleForDownSample(0.5f, 0.5f);
        widths[0] = kernel.Width();
        kernel.ScaleForUpSample(2);
        widths[1] = kernel.Width();
    }
    EXPECT_EQ(widths[0], 0);
    EXPECT_EQ(widths[1], 0);
    kernel.ScaleForDownSample(0.5f, 0.5f);
    EXPECT_EQ(Table(kernel), Table(Reduced(2, 0.5f)));
    {
        const PKTest::AllocationLimit none(0);
        kernel.ScaleForUpSample(2);
    }
    EXPECT_EQ(Table(kernel), Table(Enlarged(2))) << "made in the memory that is there";
}

TEST_F(ResampleContract, WantsReductionsAndEnlargementsToBeSuch) {
    ResampleKernel kernel(2);
    kernel.ScaleForDownSample(1.5f, 0.5f);
    ASSERT_NO_FATAL_FAILURE(ExpectReport("476", "ScaleForDownSample", "decimatedScale <= 1.0"));
    EXPECT_GT(kernel.Width(), 0) << "the build goes on";
    kernel.ScaleForUpSample(0.5f);
    ASSERT_NO_FATAL_FAILURE(ExpectReport("440", "ScaleForUpSample", "scaleFactor >= 1.0"));
    EXPECT_EQ(Table(kernel), Table(Enlarged(2)));
    kernel.ScaleForDownSample(1, 1);
    kernel.ScaleForUpSample(1);
    EXPECT_TRUE(sReports.empty());
}

TEST_F(ResampleContract, TakesAnythingForAScale) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    const float nan = std::nanf("");
    for (const float scale : {nan, kInfinity, -kInfinity, 1e30f, -1e30f, 4.5f, 0.0f}) {
        for (const int kind : {1, 2, 3, 4, 5, 6, 7}) {
            ResampleKernel down(kind), up(kind);
            down.ScaleForDownSample(scale, scale);
            up.ScaleForUpSample(scale);
            EXPECT_EQ(Table(up), Table(Enlarged(kind)));
        }
        sReports.clear();
        ResampleKernel kernel(2);
        kernel.ScaleForDownSample(scale, scale);
        EXPECT_EQ(sReports.size(), 1.0f >= scale ? 0u : 2u) << scale;
    }
}

TEST_F(ResampleContract, KindsWithoutRoomForACubicAreReportedAndLeftAlone) {
    for (const int kind : {1, 6}) {
        ResampleKernel kernel(kind);
        kernel.ScaleForUpSample(2);
        const Row before = Table(kernel);
        kernel.ScaleForDownSample(0.5f, 0.5f);
        ASSERT_NO_FATAL_FAILURE(ExpectReport("541", "ScaleCubicKernel", "fAllocatedWidth >= 10"));
        kernel.ScaleForDownSample(0.25f, 0.25f);
        ASSERT_NO_FATAL_FAILURE(ExpectReport("599", "ScaleCubicKernel", "fAllocatedWidth >= 20"));
        EXPECT_EQ(Table(kernel), before);
    }
    ResampleKernel kernel(7);
    kernel.ScaleForDownSample(0.5f, 0.5f);
    EXPECT_TRUE(sReports.empty());
    EXPECT_EQ(kernel.Width(), 8);
    kernel.ScaleForDownSample(0.3f, 0.3f);
    ASSERT_NO_FATAL_FAILURE(ExpectReport("599", "ScaleCubicKernel", "fAllocatedWidth >= 20"));
}

/// The one kind that has room for ten weights and not for twenty tells which of the two a scale takes.
TEST_F(ResampleContract, TenWeightsAreEnoughDownToTwoFifths) {
    ResampleKernel kernel(7);
    kernel.ScaleForDownSample(0.4f, 0.4f);
    EXPECT_TRUE(sReports.empty());
    ResampleKernel other(7);
    other.ScaleForDownSample(std::nextafter(0.4f, 0.0f), 0.4f);
    ASSERT_NO_FATAL_FAILURE(ExpectReport("599", "ScaleCubicKernel", "fAllocatedWidth >= 20"));
}

TEST_F(ResampleContract, UnknownKindsHaveNoTable) {
    for (const int kind : {0, 8, -1, std::numeric_limits<int>::max(), std::numeric_limits<int>::min()}) {
        ResampleKernel kernel(kind);
        kernel.ScaleForUpSample(2);
        ASSERT_NO_FATAL_FAILURE(ExpectReport("0", "CalculateDefaultKernel", "false"));
        kernel.ScaleForDownSample(0.5f, 0.5f);
        ASSERT_NO_FATAL_FAILURE(ExpectReport("541", "ScaleCubicKernel", "fAllocatedWidth >= 10"));
        EXPECT_EQ(kernel.Width(), 0);
    }
}
