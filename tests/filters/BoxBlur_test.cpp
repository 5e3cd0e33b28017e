// PK_BoxBlur by values worked out by hand, and against a reference that adds up every window anew.

#include <PixelKiln/BoxBlur.h>
#include <PixelKiln/Lifecycle.h>

#include "filters/BoxBlurKernels.h"
#include "reference/ReferenceBoxBlur.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <map>
#include <vector>

namespace {

using namespace PKTest;

using Pixel = BoxPixel;

constexpr int32_t kAllBytes = 15, kRenormalise = 16, kColumns = 128;

/// An image between guard pages, and scratch of exactly the size that callers give.
class Frame {
public:
    Frame(int32_t width, int32_t height, int32_t rowBytes, Guard guard = Guard::kAfter)
        : fWidth(width), fHeight(height), fRowBytes(rowBytes),
          fMemory(static_cast<size_t>((height - 1) * std::abs(int64_t{rowBytes}) + int64_t{width} * 4),
                  guard),
          fScratch(4 * static_cast<size_t>(width + height + std::max(width, height)), guard) {
        std::fill_n(fMemory.Bytes(), fMemory.Size(), uint8_t{0xa5});
    }

    Pixel* At(int32_t x, int32_t y) const {
        uint8_t* first = fMemory.Bytes() + (fRowBytes < 0 ? (fHeight - 1) * -int64_t{fRowBytes} : 0);
        return reinterpret_cast<Pixel*>(first + y * int64_t{fRowBytes} + int64_t{x} * 4);
    }
    void FillRandomly(Random& random) const {
        for (int32_t y = 0; y < fHeight; ++y) random.Fill(At(0, y)->data(), static_cast<size_t>(fWidth) * 4);
    }
    /// Three lines that follow one another through the image.
    void FillWithThreeLines(Random& random, int32_t direction) const {
        FillRandomly(random);
        for (int32_t y = 0; y < fHeight; ++y)
            for (int32_t x = 0; x < fWidth; ++x) *At(x, y) = direction != 0 ? *At(x % 3, y) : *At(x, y % 3);
    }
    void Fill(Pixel pixel) const {
        for (int32_t y = 0; y < fHeight; ++y) std::fill_n(At(0, y), fWidth, pixel);
    }
    std::vector<uint8_t> Bytes() const { return {fMemory.Bytes(), fMemory.Bytes() + fMemory.Size()}; }

    void Blur(std::vector<double>& radii, int32_t flags) const {
        PK_BoxBlur(static_cast<int32_t>(radii.size()), radii.data(), flags, fScratch.Bytes(), At(0, 0),
                   fRowBytes, fWidth, fHeight);
    }

    /// What the image should hold after Blur; bytes between the rows stay.
    std::vector<uint8_t> Expected(const std::vector<double>& radii, int32_t flags) const {
        const std::vector<uint8_t> before = Bytes();
        const bool areColumns = (flags & kColumns) != 0;
        const int32_t lines = areColumns ? fWidth : fHeight, length = areColumns ? fHeight : fWidth;
        const double limit = std::min(fWidth, fHeight) - 3;
        std::map<BoxLine, BoxLine> blurred;
        for (int32_t i = 0; i < lines; ++i) {
            BoxLine line;
            for (int32_t x = 0; x < length; ++x) line.push_back(areColumns ? *At(i, x) : *At(x, i));
            const auto [place, isNew] = blurred.try_emplace(line, line);
            BoxLine& result = place->second;
            for (const double radius : radii)
                if (isNew) result = ReferenceBoxPass(result, ReferenceBoxOf(std::min(radius, limit)), flags);
            for (int32_t x = 0; x < length; ++x)
                (areColumns ? *At(i, x) : *At(x, i)) = result[static_cast<size_t>(x)];
        }
        const std::vector<uint8_t> after = Bytes();
        std::copy(before.begin(), before.end(), fMemory.Bytes());
        return after;
    }

    /// Leaves the image as it was.
    void Check(const std::vector<double>& radii, int32_t flags) const {
        const std::vector<uint8_t> before = Bytes(), expected = Expected(radii, flags);
        AtEveryTarget([&] {
            std::vector<double> given = radii;
            Blur(given, flags);
            const bool isRight = Bytes() == expected;
            std::copy(before.begin(), before.end(), fMemory.Bytes());
            ASSERT_TRUE(isRight) << fWidth << " x " << fHeight << ", row bytes " << fRowBytes << ", flags "
                                 << flags << ", first radius " << radii.front();
        });
    }

private:
    int32_t fWidth, fHeight, fRowBytes;
    GuardedRows fMemory, fScratch;
};

/// The blue bytes of a row of `values`, blurred; the other rows of the image are black.
std::vector<int> BlurredRow(const std::vector<int>& values, double radius, int32_t flags) {
    const auto width = static_cast<int32_t>(values.size());
    const Frame frame(width, width, 4 * width);
    frame.Fill({0, 0, 0, 0});
    for (int32_t x = 0; x < width; ++x)
        (*frame.At(x, 1))[0] = static_cast<uint8_t>(values[static_cast<size_t>(x)]);
    std::vector<double> radii = {radius};
    frame.Blur(radii, flags);
    std::vector<int> blurred;
    for (int32_t x = 0; x < width; ++x) blurred.push_back((*frame.At(x, 1))[0]);
    return blurred;
}

} // namespace

// Radius 1 on ten pixels: size 2, no edge pixels, Dfull = 3 x 255. Pixel 0 has two pixels in its window, 1 to 5
// three, 6 and 7 lose one that nothing replaces, 8 has p[7] to p[6] and so nothing: it stays if the divisor follows
// the window, and is black if not.
TEST(BoxBlur, RadiusOneByHand) {
    const std::vector<int> line = {30, 60, 90, 120, 150, 180, 210, 240, 6, 9};
    EXPECT_EQ(BlurredRow(line, 1, kAllBytes | kRenormalise),
              (std::vector<int>{45, 60, 90, 120, 150, 180, 195, 210, 6, 9}));
    EXPECT_EQ(BlurredRow(line, 1, kAllBytes), (std::vector<int>{30, 60, 90, 120, 150, 180, 130, 70, 0, 0}));
}

// Size 3: pixels 0 to 2 have up to two on their left, 5 and later lose one each, and 9
// has none left.
TEST(BoxBlur, RadiusTwoByHand) {
    const std::vector<int> line = {30, 60, 90, 120, 150, 180, 210, 240, 6, 9};
    EXPECT_EQ(BlurredRow(line, 2, kAllBytes | kRenormalise),
              (std::vector<int>{60, 75, 90, 120, 150, 165, 180, 195, 210, 9}));
    EXPECT_EQ(BlurredRow(line, 2, kAllBytes), (std::vector<int>{36, 60, 90, 120, 150, 132, 108, 78, 42, 0}));
}

TEST(BoxBlur, WithoutRenormalisingLinesFadeToBlackToTheirLastPixel) {
    const std::vector<int> white(12, 255);
    for (const double radius : {1.0, 1.0039, 2.0, 2.0039})
        EXPECT_EQ(BlurredRow(white, radius, kAllBytes)[11], 0);
    for (const double radius : {1.0, 1.0039}) EXPECT_EQ(BlurredRow(white, radius, kAllBytes)[10], 0);
    for (const double radius : {0.0, 0.0039}) EXPECT_EQ(BlurredRow(white, radius, kAllBytes), white);
}

// Size 2. On six pixels the last two never enter: 2 is the last that takes one in, since only the first of the
// places that x can have counts. On five it is only the last, on four none.
TEST(BoxBlur, LinesWithoutAMiddleByHand) {
    EXPECT_EQ(BlurredRow({10, 20, 30, 40, 50, 60}, 1, kAllBytes | kRenormalise),
              (std::vector<int>{15, 20, 30, 35, 40, 60}));
    EXPECT_EQ(BlurredRow({10, 20, 30, 40, 50, 60}, 1, kAllBytes), (std::vector<int>{10, 20, 30, 23, 13, 0}));
    EXPECT_EQ(BlurredRow({10, 20, 30, 40, 50}, 1, kAllBytes | kRenormalise),
              (std::vector<int>{15, 20, 30, 35, 40}));
    EXPECT_EQ(BlurredRow({10, 20, 30, 40, 50}, 1, kAllBytes), (std::vector<int>{10, 20, 30, 23, 13}));
    EXPECT_EQ(BlurredRow({10, 20, 30, 40}, 1, kAllBytes | kRenormalise), (std::vector<int>{15, 20, 30, 35}));
    EXPECT_EQ(BlurredRow({10, 20, 30, 40}, 1, kAllBytes), (std::vector<int>{10, 20, 30, 23}));
}

// Radius 1.5: size 2, weight 127. One white pixel, so that each result tells its place in the window:
// 255 x 255 + 128 = 65153 as a whole pixel, 127 x 255 + 128 = 32513 as an edge pixel. Pixels 8 and 9 have one edge
// pixel and nothing else: what is black there becomes 128 / 127 = 1.
TEST(BoxBlur, RadiusOneAndAHalfByHand) {
    const int whole = 65153, edge = 32513;
    const auto white = [](size_t place) {
        std::vector<int> line(10, 0);
        line[place] = 255;
        return BlurredRow(line, 1.5, kAllBytes | kRenormalise);
    };
    // At x = 2 the window is p[1] to p[3] with the right edge p[4] only.
    EXPECT_EQ(white(0), (std::vector<int>{whole / (510 + 127), whole / (765 + 127), 0, 0, 0, 0, 0, 0, 1, 1}));
    EXPECT_EQ(white(1)[3], edge / (765 + 254));
    EXPECT_EQ(white(4), (std::vector<int>{0, 0, edge / (765 + 127), whole / (765 + 254), whole / (765 + 254),
                                          whole / (765 + 254), edge / (510 + 254), 0, 1, 1}));
    // p[7] is never a whole pixel: the right edge of 5 and the left one of 9, where 32513 / 127 = 256 saturates.
    EXPECT_EQ(white(7), (std::vector<int>{0, 0, 0, 0, 0, edge / (765 + 254), 0, 0, 1, 255}));
    EXPECT_EQ(white(9), (std::vector<int>{0, 0, 0, 0, 0, 0, 0, edge / (255 + 254), 1, 1}));
}

TEST(BoxBlur, WithoutRenormalisingAFlatImageDarkensAtBothEnds) {
    const std::vector<int> blurred = BlurredRow(std::vector<int>(20, 200), 3, kAllBytes);
    for (int x = 3; x <= 13; ++x) EXPECT_EQ(blurred[static_cast<size_t>(x)], 200) << x;
    EXPECT_EQ(blurred[0], 200 * 4 / 7);
    EXPECT_EQ(blurred[18], 200 * 2 / 7);
    EXPECT_EQ(blurred[19], 200 * 1 / 7);
}

// Exactly so for whole radii. Radii with a fraction up to 2 end in windows of edge pixels only, where the rounding
// term shows.
TEST(BoxBlur, RenormalisingKeepsAFlatImageFlat) {
    for (const double radius : {1.0, 3.25, 7.0, 9.75, 16.0, 18.0})
        for (const int32_t direction : {0, kColumns}) {
            const Frame frame(33, 21, 140);
            frame.Fill({0, 100, 254, 255});
            const std::vector<uint8_t> before = frame.Bytes();
            std::vector<double> radii = {radius};
            frame.Blur(radii, kAllBytes | kRenormalise | direction);
            EXPECT_EQ(frame.Bytes(), before) << radius;
        }
}

TEST(BoxBlur, RadiiThatAreNotAboveZeroLeaveTheImage) {
    Random random(1);
    for (const int32_t flags : {kAllBytes, kAllBytes | kRenormalise, kAllBytes | kColumns}) {
        const Frame frame(37, 19, 37 * 4);
        frame.FillRandomly(random);
        const std::vector<uint8_t> before = frame.Bytes();
        const double infinity = std::numeric_limits<double>::infinity();
        const double nan = std::numeric_limits<double>::quiet_NaN();
        std::vector<double> radii = {0.0, -0.0, -0.5, -7.25, -infinity, nan, -nan, -1e300, 1e-310, 0.0039};
        frame.Blur(radii, flags);
        EXPECT_EQ(frame.Bytes(), before);
        EXPECT_EQ(radii[2], -0.5);
        EXPECT_EQ(radii[4], -infinity);
        EXPECT_TRUE(std::isnan(radii[5]));
    }
}

TEST(BoxBlur, TheCallerSeesTheLimitedRadii) {
    const Frame frame(100, 50, 400);
    frame.Fill({1, 2, 3, 4});
    const double infinity = std::numeric_limits<double>::infinity();
    for (const int32_t flags : {kAllBytes, kAllBytes | kColumns, 0}) {
        std::vector<double> radii = {1000, 47, 47.001, 46.999, infinity, 1e300};
        frame.Blur(radii, flags);
        EXPECT_EQ(radii, (std::vector<double>{47, 47, 47, 46.999, 47, 47}));
    }
}

TEST(BoxBlur, BytesWithoutAFlagKeepTheirValues) {
    Random random(2);
    for (int32_t flags = 0; flags < 16; ++flags)
        for (const int32_t direction : {0, kColumns, kColumns | 32 | 64, INT32_MIN}) {
            const Frame frame(23, 18, 23 * 4 + 4);
            frame.FillRandomly(random);
            frame.Check({2.5, 4}, flags | direction);
        }
}

// Every length and every size that it allows, by bodies and directions that share what the reference gives.
TEST(BoxBlur, EverySizeOnEveryShortLine) {
    Random random(3);
    Walk walk;
    for (int32_t length = 4; length <= 60; ++length)
        for (int32_t whole = 0; whole <= length - 3; ++whole) {
            if (walk.LeavesOut()) continue;
            const int32_t count = whole + 4; // lines, so that they do not limit the radius
            const Frame rows(length, count, length * 4, whole % 2 ? Guard::kAfter : Guard::kBefore);
            const Frame columns(count, length, count * -4 - 8);
            rows.FillWithThreeLines(random, 0);
            columns.FillWithThreeLines(random, kColumns);
            for (const double part : {0.0, 0.001, 1.001 / 255, 2 / 255.0, 0.5, 254.5 / 255})
                for (const int32_t chosen : {kAllBytes, kAllBytes | kRenormalise}) {
                    rows.Check({whole + part}, chosen);
                    columns.Check({whole + part}, chosen | kColumns);
                    if (testing::Test::HasFatalFailure()) FAIL() << "seed " << random.Seed();
                }
        }
}

TEST(BoxBlur, EveryWholeAndNearlyWholeRadius) {
    Random random(4);
    for (int32_t radius = 0; radius <= 50; ++radius)
        for (const double part : {0.0, 0.004, 0.25, 0.5, 0.999})
            for (const int32_t flags : {kAllBytes, 7 | kRenormalise}) {
                const Frame frame(117, 56, 117 * 4);
                frame.FillRandomly(random);
                frame.Check({radius + part}, flags | (radius % 2 ? kColumns : 0));
                if (testing::Test::HasFatalFailure()) FAIL() << "seed " << random.Seed();
            }
}

TEST(BoxBlur, SeveralPassesAtAnySize) {
    Random random(5);
    for (int run = 0; run < 150; ++run) {
        const auto width = static_cast<int32_t>(4 + random.Below(70)),
                   height = static_cast<int32_t>(4 + random.Below(70));
        const auto padding = static_cast<int32_t>(random.Below(5) * (random.Below(2) ? 4u : 1u));
        const int32_t flags = static_cast<int32_t>(random.Below(32)) | (random.Below(2) ? kColumns : 0);
        int32_t rowBytes = (4 * width + padding) * (random.Below(2) ? 1 : -1);
        if (flags & kColumns) rowBytes = rowBytes / 4 * 4;
        const Frame frame(width, height, rowBytes, random.Below(2) ? Guard::kAfter : Guard::kBefore);
        frame.FillRandomly(random);
        std::vector<double> radii(1 + random.Below(4));
        for (double& radius : radii) radius = random.Below(4000) / 97.0 - 2;
        frame.Check(radii, flags);
        if (testing::Test::HasFatalFailure()) FAIL() << "seed " << random.Seed();
    }
}

TEST(BoxBlur, WideWindows) {
    Random random(6);
    for (const double radius : {126.5, 297.0})
        for (const int32_t flags : {kAllBytes, kAllBytes | kRenormalise}) {
            const Frame frame(604, 300, 604 * 4);
            frame.FillRandomly(random);
            frame.Check({radius}, flags);
            frame.Check({radius}, flags | kColumns);
        }
}

// The radius is limited by the shorter side, so that sums beyond 32 bits need two long sides: here all rows are the
// same memory, and a flat row stays flat however often it is filtered. Bundles, which sum in 32 bits, would leave the
// caller's scratch alone.
TEST(BoxBlur, ARadiusWhoseSumsNeedMoreThan32BitsGoesByOneLineAtATime) {
    const int32_t side = PK::kLargestBundleSize + 3;
    std::vector<Pixel> row(side, {255, 128, 3, 200}), scratch(static_cast<size_t>(side) * 3, {1, 1, 1, 1});
    const std::vector<Pixel> before = row, unused = scratch;
    double radius = 1e9;
    PK_BoxBlur(1, &radius, 1 | kRenormalise, scratch.data(), row.data(), 0, side, side);
    EXPECT_EQ(radius, PK::kLargestBundleSize); // of size one more
    EXPECT_EQ(row, before);
    EXPECT_NE(scratch, unused);
}

// Longer than what is worth bundling: 64 MiB of scratch end at 524,288 pixels.
TEST(BoxBlur, LinesTooLongForBundles) {
    Random random(9);
    const Frame frame(524289, 5, 524289 * 4);
    frame.FillRandomly(random);
    frame.Check({1.75, 2}, kAllBytes | kRenormalise);
}

TEST(BoxBlur, UnevenRowBytesAreCutAlongColumns) {
    Random random(10);
    const Frame frame(9, 12, 44);
    frame.FillRandomly(random);
    const std::vector<uint8_t> expected = frame.Expected({2.25}, kAllBytes | kColumns);
    std::vector<uint8_t> image = frame.Bytes();
    std::vector<Pixel> scratch(33);
    double radius = 2.25;
    PK_BoxBlur(1, &radius, kAllBytes | kColumns, scratch.data(), image.data(), 47, 9, 12);
    EXPECT_EQ(image, expected);
}

TEST(BoxBlur, DoesNothingWithoutPassesPixelsOrMemory) {
    double radius = 1000;
    std::vector<Pixel> image(64, {1, 2, 3, 4}), scratch(64);
    image[9] = {200, 100, 50, 25};
    const std::vector<Pixel> before = image;
    const auto blur = [&](int32_t passes, double* radii, void* room, void* pixels, int32_t width,
                          int32_t height) {
        for (const int32_t flags : {kAllBytes, kAllBytes | kColumns})
            PK_BoxBlur(passes, radii, flags, room, pixels, 32, width, height);
    };
    for (const int32_t passes : {0, -1, INT32_MIN}) blur(passes, &radius, scratch.data(), image.data(), 8, 8);
    for (const int32_t size : {3, 2, 1, 0, -1, -4, INT32_MIN}) {
        blur(1, &radius, scratch.data(), image.data(), size, 8);
        blur(1, &radius, scratch.data(), image.data(), 8, size);
    }
    blur(1, nullptr, scratch.data(), image.data(), 8, 8);
    blur(1, &radius, nullptr, image.data(), 8, 8);
    blur(1, &radius, scratch.data(), nullptr, 8, 8);
    EXPECT_EQ(image, before);
    EXPECT_EQ(radius, 1000);
}

TEST(BoxBlur, FloatingPointModeCountsForNothing) {
    Random random(11);
    const Frame frame(90, 70, 360);
    for (const uint32_t mode : {0u, kRoundDown, kRoundUp, kRoundToZero, kFlushToZero | kDenormalsAreZero}) {
        frame.FillRandomly(random);
        std::vector<double> radii = {10, 13.5, 40.25, 1e-310, std::numeric_limits<double>::quiet_NaN()};
        const std::vector<uint8_t> expected = frame.Expected(radii, kAllBytes | kRenormalise);
        {
            const FloatEnvironment environment(mode | kExceptionFlags);
            frame.Blur(radii, kAllBytes | kRenormalise);
            EXPECT_TRUE(environment.IsAsGiven());
        }
        EXPECT_EQ(frame.Bytes(), expected);
    }
}
