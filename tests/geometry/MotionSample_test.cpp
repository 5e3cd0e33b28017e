// Motion's sampling of rows: every body against the restatement, and what a caller relies on by hand.

#include "convert/RasterFormats.h"
#include "filters/ResampleKernel.h"
#include "frame/PixelFormat.h"
#include "geometry/MotionSample.h"
#include "geometry/MotionSampleKernels.h"
#include "reference/ReferenceMotionSample.h"
#include "support/Allocations.h"
#include "support/ColumnsOfBand.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Samples.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <vector>

using namespace PK;
using namespace PKTest;
using PKReference::MotionLine;
using PKReference::MotionPlace;
using PKReference::MotionSource;

namespace {

using Pixel = std::array<float, 4>;

constexpr float kUntouched = -777;

int32_t BytesOfPixel(PK_PixelFormat format) {
    return DepthOf(format) == kDepth8u ? 4 : DepthOf(format) == kDepth15u ? 8 : 16;
}

std::vector<PK_PixelFormat> PackedFormats() {
    std::vector<PK_PixelFormat> formats;
    for (const PK_PixelFormat format : kRasterFormats)
        if (IsPacked4444(format)) formats.push_back(format);
    return formats;
}

/// Memory that holds a rectangle of an image and nothing before its first pixel, or behind its last.
class Crop {
public:
    Crop(const PK_Rect& rect, PK_PixelFormat format, int32_t rowBytes, Guard guard)
        : fRect(rect), fFormat(format), fRowBytes(rowBytes),
          fMemory(static_cast<size_t>((rect.bottom - rect.top - 1) * std::abs(rowBytes) +
                                      (rect.right - rect.left) * BytesOfPixel(format)),
                  guard) {}

    uint8_t* Bytes() const { return fMemory.Bytes(); }
    size_t Size() const { return fMemory.Size(); }

    /// Of pixel (0, 0), which need not be there.
    const uint8_t* Origin() const {
        const int32_t lowest = fRowBytes < 0 ? fRect.bottom - 1 : fRect.top;
        const int64_t offset = int64_t{lowest} * fRowBytes + int64_t{fRect.left} * BytesOfPixel(fFormat);
        return reinterpret_cast<const uint8_t*>(reinterpret_cast<uintptr_t>(fMemory.Bytes()) -
                                                static_cast<uintptr_t>(offset));
    }
    MotionSource Source(bool smoothEdges) const { return {Origin(), fRowBytes, fRect, fFormat, smoothEdges}; }

    /// Every row by itself, as samples need not lie as far apart as rows do.
    void FillOrdinary(Random& random) const {
        for (int32_t row = fRect.top; row < fRect.bottom; ++row)
            FillOrdinarySamples(fFormat, Row(row), RowLength(), random);
    }

    /// No float sample is below 0: alphas show, then, or do not, in one way.
    void MakeFloatsPositive() const {
        if (DepthOf(fFormat) != kDepth32f) return;
        for (int32_t row = fRect.top; row < fRect.bottom; ++row)
            for (size_t i = 3; i < RowLength(); i += 4) Row(row)[i] &= 0x7f;
    }

private:
    size_t RowLength() const {
        return static_cast<size_t>((fRect.right - fRect.left) * BytesOfPixel(fFormat));
    }
    uint8_t* Row(int32_t row) const {
        const int32_t lowest = fRowBytes < 0 ? fRect.bottom - 1 : fRect.top;
        return fMemory.Bytes() + int64_t{row - lowest} * fRowBytes;
    }

    PK_Rect fRect;
    PK_PixelFormat fFormat;
    int32_t fRowBytes;
    GuardedRows fMemory;
};

/// An image of float pixels given one by one.
struct FloatImage {
    FloatImage(int32_t columns, std::vector<Pixel> from) : width(columns), pixels(std::move(from)) {}
    MotionSource Source(PK_PixelFormat format, bool smoothEdges) const {
        return {reinterpret_cast<const uint8_t*>(pixels.data()),
                16 * width,
                {0, 0, width, static_cast<int32_t>(pixels.size()) / width},
                format,
                smoothEdges};
    }
    int32_t width;
    std::vector<Pixel> pixels;
};

MotionRow RowOf(const MotionSource& source, const MotionLine& line) {
    MotionRow row{};
    row.pixels = source.pixels;
    row.rowBytes = source.rowBytes;
    row.left = source.rect.left;
    row.top = source.rect.top;
    row.right = source.rect.right;
    row.bottom = source.rect.bottom;
    row.x = line.at.x;
    row.y = line.at.y;
    row.stepX = line.step.x;
    row.stepY = line.step.y;
    row.columns = line.columns;
    row.rotated = line.rotated;
    row.smoothEdges = source.smoothEdges;
    row.isOpaque = AlphaOf(source.format) == kAlphaMeaningless;
    return row;
}

struct Sampled {
    MotionSpan span;
    std::vector<Pixel> line;
};

/// The line ends, or begins, with a guard page.
Sampled SampleRow(SampleMotionRow sample, const MotionRow& row, Guard guard = Guard::kAfter) {
    const auto columns = static_cast<size_t>(row.columns);
    const GuardedRows memory(16 * columns, guard);
    auto* const line = reinterpret_cast<float*>(memory.Bytes());
    std::fill_n(line, 4 * columns, kUntouched);
    ColumnsOfBand band(row.columns);
    MotionRow ofBand = row;
    ofBand.shared = band.Shared();
    Sampled sampled = {sample(ofBand, line), std::vector<Pixel>(columns)};
    if (columns > 0) std::memcpy(sampled.line.data(), line, 16 * columns);
    sample(ofBand, line); // like a further row of the band
    EXPECT_TRUE(columns == 0 || std::memcmp(sampled.line.data(), line, 16 * columns) == 0);
    return sampled;
}

Sampled Sample(const MotionSource& source, const MotionLine& line, int32_t quality = 2) {
    return SampleRow(ChooseMotionSampler(source.format, quality), RowOf(source, line));
}

/// One pixel at one place.
Pixel At(const MotionSource& source, float x, float y, bool rotated = false) {
    return Sample(source, {{x, y}, {1, 0}, 1, rotated}).line[0];
}

void ExpectPixel(const Pixel& actual, const Pixel& expected, float tolerance = 0) {
    for (size_t c = 0; c < 4; ++c) EXPECT_NEAR(actual[c], expected[c], tolerance) << "channel " << c;
}

int32_t Between(Random& random, int32_t low, int32_t high) {
    return low + static_cast<int32_t>(random.Below(static_cast<uint32_t>(high - low + 1)));
}
float Between(Random& random, float low, float high) {
    return low + (high - low) * static_cast<float>(random.Next()) * 0x1p-32f;
}

MotionLine DrawLine(Random& random, const PK_Rect& rect) {
    MotionLine line;
    line.columns = Between(random, 0, 200);
    line.rotated = random.Below(2) == 0;
    const auto x = [&](int32_t side) { return static_cast<float>(side); };
    line.at = {Between(random, x(rect.left - 5), x(rect.right + 5)),
               Between(random, x(rect.top - 5), x(rect.bottom + 5))};
    constexpr float kSteps[] = {1, 0.5f, 0.25f, 2, -1};
    line.step.x = random.Below(3) == 0 ? kSteps[random.Below(5)] : Between(random, -2.5f, 2.5f);
    line.step.y = line.rotated ? Between(random, -1.5f, 1.5f) : 0;
    if (random.Below(4) == 0) line.step.x /= 30;
    if (random.Below(4) == 0) line.step.y /= 30;
    if (random.Below(4) == 0) line.at = {std::floor(line.at.x) + 0.5f, std::floor(line.at.y) + 0.5f};
    return line;
}

PK_Rect DrawRect(Random& random) {
    const int32_t left = Between(random, -6, 9), top = Between(random, -6, 9);
    const int32_t greatest = random.Below(3) == 0 ? 4 : 60;
    return {left, top, left + Between(random, 1, greatest), top + Between(random, 1, greatest)};
}

} // namespace

TEST(MotionSample, EveryBodySamplesEveryFormatAsTheRestatement) {
    const std::vector<PK_PixelFormat> formats = PackedFormats();
    Random random(5101);
    Walk walk;
    for (int32_t round = 0; round < 4000; ++round) {
        if (walk.LeavesOut()) continue;
        const PK_PixelFormat format = formats[static_cast<size_t>(round) % formats.size()];
        const PK_Rect rect = DrawRect(random);
        const int32_t least = (rect.right - rect.left) * BytesOfPixel(format);
        const int32_t rowBytes =
            (least + Between(random, 0, 3) * Between(random, 0, 9)) * (random.Below(2) == 0 ? 1 : -1);
        const Guard guard = random.Below(2) == 0 ? Guard::kBefore : Guard::kAfter;
        const Crop crop(rect, format, rowBytes, guard);
        crop.FillOrdinary(random);
        if (random.Below(3) == 0) // some samples of nothing, so that alpha vanishes here and there
            for (size_t i = 0; i + 16 <= crop.Size(); i += 16)
                if (random.Below(2) == 0) std::memset(crop.Bytes() + i, 0, 16);
        const MotionSource source = crop.Source(random.Below(2) == 0);
        const MotionLine line = DrawLine(random, rect);

        const PKReference::MotionPlaces walkway = PKReference::WalkMotionLine(rect, line, 2);
        std::vector<Pixel> expected(static_cast<size_t>(line.columns),
                                    Pixel{kUntouched, kUntouched, kUntouched, kUntouched});
        const float full = DepthOf(format) == kDepth8u    ? 255.0f
                           : DepthOf(format) == kDepth15u ? 32768.0f
                                                          : 1.0f;
        for (size_t i = 0; i < walkway.places.size(); ++i) {
            const MotionPlace& place = walkway.places[i];
            Pixel& pixel = expected[static_cast<size_t>(walkway.first) + i];
            pixel = PKReference::SampleBilinear<float>(source, place);
            const std::array<double, 4> exact = PKReference::SampleBilinear<double>(source, place);
            for (size_t c = 0; c < 4; ++c)
                ASSERT_NEAR(pixel[c], exact[c], 2e-5 * full) << "round " << round << ", column " << i;
        }
        AtEveryTarget([&] {
            const Sampled sampled = SampleRow(ChooseMotionSampler(format, 2), RowOf(source, line), guard);
            ASSERT_EQ(sampled.span.first, walkway.first);
            ASSERT_EQ(sampled.span.count, static_cast<int32_t>(walkway.places.size()));
            ASSERT_EQ("", FirstDifference(Samples::Floats, 16 * expected.size(),
                                          reinterpret_cast<const uint8_t*>(expected.data()),
                                          reinterpret_cast<const uint8_t*>(sampled.line.data())))
                << "round " << round << ", seed " << random.Seed() << ", " << PK_PixelFormatName(format)
                << ", rect " << rect.left << ' ' << rect.top << ' ' << rect.right << ' ' << rect.bottom
                << ", at " << line.at.x << ' ' << line.at.y << ", step " << line.step.x << ' ' << line.step.y
                << ", smooth " << source.smoothEdges << ", rotated " << line.rotated;
        });
        if (HasFatalFailure()) return;
    }
}

/// The sums inside are those at the edges, with a few units in the last place between them.
TEST(MotionSample, InsideAndEdgeAgree) {
    Random random(5102);
    const PK_Rect rect = {0, 0, 40, 40};
    for (const PK_PixelFormat format : PackedFormats()) {
        const Crop crop(rect, format, 40 * BytesOfPixel(format), Guard::kAfter);
        crop.FillOrdinary(random);
        crop.MakeFloatsPositive();
        const MotionSource source = crop.Source(true);
        for (int32_t i = 0; i < 50; ++i) {
            const PK_Point at = {Between(random, 4.0f, 36.0f), Between(random, 4.0f, 36.0f)};
            const auto edge = PKReference::SampleBilinear<float>(source, {at, false});
            const float full = DepthOf(format) == kDepth8u    ? 255.0f
                               : DepthOf(format) == kDepth15u ? 32768.0f
                                                              : 1.0f;
            ExpectPixel(At(source, at.x, at.y), edge, 1e-5f * full);
        }
    }
}

TEST(MotionSample, ColumnsThatMissAreNoneAndNotWritten) {
    const FloatImage image(2, {{1, 2, 3, 1}, {1, 2, 3, 1}, {1, 2, 3, 1}, {1, 2, 3, 1}});
    const MotionSource source = image.Source(PK_PixelFormat_BGRA_4444_32f, true);
    const Sampled missed = Sample(source, {{0, 50}, {1, 0}, 9, false});
    EXPECT_EQ(missed.span.first, 9);
    EXPECT_EQ(missed.span.count, 0);
    EXPECT_EQ(missed.line, std::vector<Pixel>(9, Pixel{kUntouched, kUntouched, kUntouched, kUntouched}));
    EXPECT_EQ(Sample(source, {{0, 1}, {1, 0}, 0, false}).span.count, 0);
}

TEST(MotionSample, AnImageOfOnePixelIsAllEdge) {
    const FloatImage image(1, {{0.25f, 0.5f, 0.75f, 1}});
    for (const bool smooth : {false, true}) {
        const MotionSource source = image.Source(PK_PixelFormat_BGRP_4444_32f, smooth);
        const Sampled sampled = Sample(source, {{-3.5f, 0.5f}, {1, 0}, 9, false});
        EXPECT_EQ(sampled.span.first, 1);
        EXPECT_EQ(sampled.span.count, 6);
        ExpectPixel(sampled.line[4], {0.25f, 0.5f, 0.75f, 1});
        // The cell to the left still has the pixel, with no weight, which a hard edge does not look at.
        ExpectPixel(sampled.line[3], smooth ? Pixel{} : Pixel{0.25f, 0.5f, 0.75f, 1});
        ExpectPixel(sampled.line[5], {0, 0, 0, 0});
    }
}

TEST(MotionSample, APixelWithoutAlphaIsNeverSeen) {
    const uint8_t pixels[] = {200, 100, 50, 255, 9, 99, 199, 0};
    const MotionSource source = {pixels, 8, {0, 0, 2, 1}, PK_PixelFormat_BGRA_4444_8u, false};
    ExpectPixel(At(source, 1, 0.5f), {100, 50, 25, 127.5f}, 1e-5f);
    ExpectPixel(At(source, 1.5f, 0.5f), {0, 0, 0, 0});
}

TEST(MotionSample, SmoothEdgesFadeOverOnePixelAndHardOnesDoNot) {
    const uint8_t pixels[] = {40, 80, 120, 200, 40, 80, 120, 200, 40, 80, 120, 200};
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u}) {
        MotionSource source = {pixels, 12, {0, 0, 3, 1}, format, true};
        const float alpha = format == PK_PixelFormat_BGRX_4444_8u ? 255 : 200;
        // Half a pixel outside, the centre of the sample lies on the border.
        EXPECT_NEAR(At(source, 3, 0.5f)[3], alpha / 2, 1e-4f);
        EXPECT_NEAR(At(source, 0, 0.5f)[3], alpha / 2, 1e-4f);
        EXPECT_NEAR(At(source, 1.5f, 0)[3], alpha / 2, 1e-4f);
        EXPECT_NEAR(At(source, 3, 0)[3], alpha / 4, 1e-4f);
        source.smoothEdges = false;
        for (const PK_Point at : {PK_Point{3, 0.5f}, PK_Point{0, 0.5f}, PK_Point{1.5f, 0}, PK_Point{3, 0}})
            EXPECT_NEAR(At(source, at.x, at.y)[3], alpha, 1e-4f);
    }
}

TEST(MotionSample, VideoFadesTowardsItsZeros) {
    const uint8_t pixels[] = {240, 30, 235, 255};
    for (const PK_PixelFormat format :
         {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYX_4444_8u}) {
        const MotionSource source = {pixels, 4, {0, 0, 1, 1}, format, true};
        ExpectPixel(At(source, 0, 0.5f), {184, 79, 125.5f, 127.5f}, 1e-4f);
        ExpectPixel(At(source, 1.5f, 0.5f), {128, 128, 16, 0});
    }
    // In floats the zeros are 0.
    const FloatImage image(1, {{0.5f, -0.5f, 1, 1}});
    ExpectPixel(At(image.Source(PK_PixelFormat_VUYP_4444_32f, true), 0, 0.5f), {0.25f, -0.25f, 0.5f, 0.5f});
}

TEST(MotionSample, AlphaInFrontComesLastInTheLine) {
    const uint16_t words[] = {32768, 300, 200, 100};
    const auto* pixels = reinterpret_cast<const uint8_t*>(words);
    ExpectPixel(At({pixels, 8, {0, 0, 1, 1}, PK_PixelFormat_ARGB_4444_15u, false}, 0.5f, 0.5f),
                {100, 200, 300, 32768});
    ExpectPixel(At({pixels, 8, {0, 0, 1, 1}, PK_PixelFormat_BGRX_4444_15u, false}, 0.5f, 0.5f),
                {32768, 300, 200, 32768});
}

/// Half the interlaced height of one row is none.
TEST(MotionSample, ASourceWithoutRowsIsTransparentAndNotRead) {
    for (const PK_PixelFormat format : PackedFormats()) {
        const MotionSource source = {nullptr, 64, {0, 0, 16, 0}, format, false};
        const Sampled sampled = Sample(source, {{0.5f, 0.5f}, {1, 0}, 16, false});
        ASSERT_EQ(sampled.span.count, 16);
        const bool isVideo = IsYUV(format) && DepthOf(format) == kDepth8u;
        for (const Pixel& pixel : sampled.line)
            ExpectPixel(pixel, isVideo ? Pixel{128, 128, 16, 0} : Pixel{});
    }
}

TEST(MotionSample, AnythingForAPlaceStaysInTheSourceAndInTheLine) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    const float odd[] = {std::nanf(""), kInfinity, -kInfinity, 3e38f, -3e38f, 1e10f,
                         -1e10f,        1e-40f,    0,          8.25f, -1,     0.3f};
    const PK_Rect rect = {-2, 3, 14, 19};
    ResampleKernel table(2);
    table.ScaleForDownSample(0.3f, 0.3f);
    Random random(5103);
    Walk walk;
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_XRGB_4444_15u, PK_PixelFormat_BGRP_4444_32f_Linear}) {
        const Crop crop(rect, format, 16 * BytesOfPixel(format), Guard::kAfter);
        FillOrdinarySamples(format, crop.Bytes(), crop.Size(), random);
        for (const int32_t quality : {2, 5})
            for (const float x : odd)
                for (const float y : odd) {
                    if (walk.LeavesOut()) continue;
                    for (const float stepX : odd)
                        for (const float stepY : odd) {
                            MotionRow row =
                                RowOf(crop.Source(true), {{x, y}, {stepX, stepY}, 37, stepY != 0});
                            row.kernelX = row.kernelY = {table.Weights(), table.Width()};
                            const Sampled sampled = SampleRow(ChooseMotionSampler(format, quality), row);
                            const auto [first, count] = sampled.span;
                            ASSERT_TRUE(first >= 0 && count >= 0 && first + count <= 37);
                            for (int32_t i = 0; i < 37; ++i) {
                                if (i >= first && i < first + count) continue;
                                ASSERT_EQ(sampled.line[static_cast<size_t>(i)][0], kUntouched);
                            }
                        }
                }
    }
}

/// Steps that floats cannot tell from others add up to places far from where they should be.
TEST(MotionSample, LongRowsStayInTheSource) {
    constexpr int32_t kWidth = 70000;
    for (const float step : {1.0f / 3, 0.7f, 1.00001f}) {
        const PK_Rect rect = {0, 0, kWidth, 5};
        const Crop crop(rect, PK_PixelFormat_BGRA_4444_8u, 4 * kWidth, Guard::kAfter);
        std::fill_n(crop.Bytes(), crop.Size(), uint8_t{77});
        AtEveryTarget([&] {
            const Sampled sampled = Sample(
                crop.Source(false), {{0.5f, 2.4f}, {step, 0}, static_cast<int32_t>(kWidth / step), false});
            for (int32_t i = 0; i < sampled.span.count; ++i) {
                const Pixel& pixel = sampled.line[static_cast<size_t>(sampled.span.first + i)];
                ASSERT_NEAR(pixel[3], 77, 1e-3f);
            }
        });
        if (HasFatalFailure()) return;
    }
}

TEST(MotionSample, TakesNoMemory) {
    const PK_Rect rect = {0, 0, 50, 50};
    ResampleKernel table(2);
    table.ScaleForDownSample(0.5f, 0.5f);
    const Crop crop(rect, PK_PixelFormat_BGRP_4444_32f_Linear, 800, Guard::kAfter);
    std::memset(crop.Bytes(), 0, crop.Size());
    std::vector<float> line(4 * 40000);
    for (const int32_t quality : {2, 5}) {
        MotionRow row = RowOf(crop.Source(true), {{0, 20}, {50.0f / 40000, 0}, 40000, false});
        row.kernelX = row.kernelY = {table.Weights(), table.Width()};
        const SampleMotionRow sample = ChooseMotionSampler(PK_PixelFormat_BGRP_4444_32f_Linear, quality);
        ColumnsOfBand band(row.columns);
        row.shared = band.Shared();
        const int before = AllocationCount();
        const MotionSpan span = sample(row, line.data());
        EXPECT_EQ(AllocationCount(), before);
        EXPECT_EQ(span.count, 40000);
    }
}

TEST(MotionResample, IsTheSumOverTheAreaOfBothAxes) {
    Random random(5104);
    Walk walk;
    for (int32_t round = 0; round < 1200; ++round) {
        if (walk.LeavesOut()) continue;
        const PK_PixelFormat format =
            random.Below(2) == 0 ? PK_PixelFormat_BGRP_4444_32f_Linear : PK_PixelFormat_PRGB_4444_32f;
        const PK_Rect rect = DrawRect(random);
        const int32_t rowBytes =
            ((rect.right - rect.left) * 16 + Between(random, 0, 3) * 4) * (random.Below(2) == 0 ? 1 : -1);
        const Guard guard = random.Below(2) == 0 ? Guard::kBefore : Guard::kAfter;
        const Crop crop(rect, format, rowBytes, guard);
        FillOrdinarySamples(format, crop.Bytes(), crop.Size(), random);
        const MotionSource source = crop.Source(random.Below(2) == 0);
        ResampleKernel x(Between(random, 2, 5)), y(Between(random, 1, 7));
        const float scale = Between(random, 0.2f, 1.0f);
        x.ScaleForDownSample(scale, scale);
        y.ScaleForUpSample(1.5f);
        const MotionLine line = DrawLine(random, rect);
        MotionRow row = RowOf(source, line);
        row.kernelX = {x.Weights(), x.Width()};
        row.kernelY = {y.Weights(), y.Width()};
        if (random.Below(2) == 0) std::swap(row.kernelX, row.kernelY);

        const PKReference::MotionPlaces walkway = PKReference::WalkMotionLine(rect, line, 6);
        std::vector<Pixel> first;
        AtEveryTarget([&] {
            const Sampled sampled = SampleRow(ChooseMotionSampler(format, 5), row, guard);
            if (first.empty()) first = sampled.line;
            ASSERT_EQ("", FirstDifference(Samples::Floats, 16 * first.size(),
                                          reinterpret_cast<const uint8_t*>(first.data()),
                                          reinterpret_cast<const uint8_t*>(sampled.line.data())))
                << "round " << round << ", seed " << random.Seed();
            ASSERT_EQ(sampled.span.first, walkway.first);
            ASSERT_EQ(sampled.span.count, static_cast<int32_t>(walkway.places.size()));
        });
        if (HasFatalFailure()) return;
        for (size_t i = 0; i < first.size(); ++i) {
            const auto place = static_cast<ptrdiff_t>(i) - walkway.first;
            if (place < 0 || place >= static_cast<ptrdiff_t>(walkway.places.size())) {
                ASSERT_EQ(first[i][0], kUntouched);
                continue;
            }
            const auto exact = PKReference::SampleByWeights(
                source, walkway.places[static_cast<size_t>(place)].at,
                {row.kernelX.weights, row.kernelX.width}, {row.kernelY.weights, row.kernelY.width});
            for (size_t c = 0; c < 4; ++c)
                ASSERT_NEAR(first[i][c], exact.pixel[c], 2e-6 * exact.magnitude + 1e-30)
                    << "round " << round << ", seed " << random.Seed() << ", column " << i << ", channel "
                    << c << ", rotated " << line.rotated << ", step " << line.step.x;
        }
    }
}

namespace {

/// One row of pixels, enlarged.
Pixel Enlarge(const std::vector<Pixel>& pixels, float x, bool rotated, bool smoothEdges = true) {
    const FloatImage image(static_cast<int32_t>(pixels.size()), pixels);
    static const ResampleKernel table = [] {
        ResampleKernel kernel(2);
        kernel.ScaleForUpSample(2);
        return kernel;
    }();
    const MotionSource source = image.Source(PK_PixelFormat_BGRP_4444_32f_Linear, smoothEdges);
    MotionRow row = RowOf(source, {{x, 0.5f}, {0.5f, 0}, 1, rotated});
    row.kernelX = row.kernelY = {table.Weights(), table.Width()};
    return SampleRow(ChooseMotionSampler(source.format, 5), row).line[0];
}

} // namespace

TEST(MotionResample, KeepsNegativeColoursAndLimitsAlpha) {
    // Half way between two pixels the weights are -3/32, 19/32, 19/32 and -3/32.
    const std::vector<Pixel> beside = {{1, 0, 0, 1}, {0, 0, 0, 0}, {0, 0, 0, 0}, {1, 0, 0, 1}};
    const std::vector<Pixel> between = {{0, 0, 0, 0}, {1, 2, -1, 1}, {1, 2, -1, 1}, {0, 0, 0, 0}};
    for (const bool rotated : {false, true}) {
        ExpectPixel(Enlarge(beside, 2, rotated), {-3.0f / 16, 0, 0, 0}, 1e-6f);
        ExpectPixel(Enlarge(between, 2, rotated), {19.0f / 16, 19.0f / 8, -19.0f / 16, 1}, 1e-6f);
    }
}

TEST(MotionResample, FadesOutsideWhateverTheEdgesAre) {
    const std::vector<Pixel> pixels(4, Pixel{1, 1, 1, 1});
    for (const bool rotated : {false, true})
        for (const bool smooth : {false, true}) {
            ExpectPixel(Enlarge(pixels, 4, rotated, smooth), {0.5f, 0.5f, 0.5f, 0.5f}, 1e-6f);
            ExpectPixel(Enlarge(pixels, 9, rotated, smooth), {0, 0, 0, 0});
        }
}

TEST(MotionResample, WithoutATableGivesNothing) {
    const FloatImage image(2, std::vector<Pixel>(4, Pixel{1, 1, 1, 1}));
    for (const int32_t width : {0, -1998}) {
        MotionRow row =
            RowOf(image.Source(PK_PixelFormat_BGRP_4444_32f_Linear, true), {{0, 1}, {1, 0}, 3, false});
        row.kernelX = row.kernelY = {nullptr, width};
        for (const Pixel& pixel :
             SampleRow(ChooseMotionSampler(PK_PixelFormat_BGRP_4444_32f_Linear, 5), row).line)
            ExpectPixel(pixel, {0, 0, 0, 0});
    }
}

/// What is right beside the taps must not be touched, lest infinity spread.
TEST(MotionResample, ReadsNoPixelBesideItsTaps) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    ResampleKernel table(2);
    table.ScaleForDownSample(1, 1);
    ASSERT_EQ(table.Width(), 10);
    std::vector<Pixel> pixels(24, Pixel{1, 1, 1, 1});
    pixels[12 + 6] = pixels[12 - 5] = {kInfinity, kInfinity, kInfinity, kInfinity};
    const FloatImage image(24, pixels);
    for (const bool rotated : {false, true}) {
        MotionRow row = RowOf(image.Source(PK_PixelFormat_BGRP_4444_32f_Linear, true),
                              {{12.75f, 0.5f}, {1, 0}, 1, rotated});
        row.kernelX = row.kernelY = {table.Weights(), table.Width()};
        ExpectPixel(SampleRow(ChooseMotionSampler(PK_PixelFormat_BGRP_4444_32f_Linear, 5), row).line[0],
                    {1, 1, 1, 1}, 1e-3f);
    }
}

TEST(MotionSampleChoice, OnlyTheHighestQualityOfPremultipliedFloatRGBResamples) {
    const auto resamples = [](PK_PixelFormat format, int32_t quality) {
        const SampleMotionRow kernel = ChooseMotionSampler(format, quality);
        const MotionResampleKernels& kernels = Best<MotionResampleKernels>();
        return kernel == kernels.alphaLast || kernel == kernels.alphaFirst;
    };
    AtEveryTarget([&] {
        for (const PK_PixelFormat format : PackedFormats()) {
            const bool isMember =
                !IsYUV(format) && AlphaOf(format) == kAlphaPremultiplied && DepthOf(format) == kDepth32f;
            EXPECT_EQ(resamples(format, 5), isMember) << PK_PixelFormatName(format);
            for (const int32_t quality : {0, 1, 2, 3, 4, 6, 100}) EXPECT_FALSE(resamples(format, quality));
        }
    });
}

TEST(MotionLineScale, TakesCodesToFloats) {
    struct {
        PK_PixelFormat format;
        Pixel codes, floats;
    } const cases[] = {
        {PK_PixelFormat_BGRA_4444_8u, {0, 255, 51, 255}, {0, 1, 0.2f, 1}},
        {PK_PixelFormat_XRGB_4444_8u, {0, 255, 51, 255}, {0, 1, 0.2f, 1}},
        {PK_PixelFormat_VUYP_4444_8u, {128, 240, 235, 255}, {0, 0.5f, 1, 1}},
        {PK_PixelFormat_VUYX_4444_8u_709, {16, 128, 16, 0}, {-0.5f, 0, 0, 0}},
        {PK_PixelFormat_BGRA_4444_15u, {0, 16384, 32768, 32768}, {0, 0.5f, 1, 1}},
        {PK_PixelFormat_PRGB_4444_15u, {0, 16384, 32768, 32768}, {0, 0.5f, 1, 1}},
    };
    for (const auto& each : cases) {
        const auto scale = MotionLineScale(each.format);
        ASSERT_TRUE(scale) << PK_PixelFormatName(each.format);
        for (const int32_t count : {0, 1, 2, 3, 5, 33}) {
            std::vector<Pixel> line(static_cast<size_t>(count) + 1, each.codes);
            AtEveryTarget([&] {
                std::fill(line.begin(), line.end(), each.codes);
                ScaleMotionLine(*scale, line[0].data(), count);
                for (int32_t i = 0; i < count; ++i)
                    ExpectPixel(line[static_cast<size_t>(i)], each.floats, 1e-7f);
                ExpectPixel(line.back(), each.codes);
            });
        }
    }
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_PRGB_4444_32f_Linear, PK_PixelFormat_VUYA_4444_32f})
        EXPECT_FALSE(MotionLineScale(format));
    const auto bits = std::bit_cast<uint32_t>(MotionLineScale(PK_PixelFormat_BGRA_4444_8u)->scale[0]);
    EXPECT_EQ(bits, 0x3b808081u) << "1/255";
}
