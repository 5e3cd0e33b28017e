// ClampFloatPixels: the walk over rows, the groups of 32 floats and the rest of a row, and what must not be touched.

#include <PixelKiln/ColorSpace.h>

#include "colour/ColourKernels.h"
#include "colour/FloatBodies.h"
#include "support/ColourPixels.h"
#include "support/GuardedRows.h"

#include <algorithm>

namespace {

using namespace PKTest;
using PK::ClampFloatPixels;

/// A float in a group of 32: NaN becomes the upper limit, and the lower limit wins where the two are crossed.
float ClampInGroup(float x, float least, float most) {
    const float limited = x < most ? x : most;
    return limited > least ? limited : least;
}

/// A float behind the groups: NaN becomes the lower limit, and the upper one wins over what is above the lower.
float ClampBehindGroups(float x, float least, float most) {
    if (!(x > least)) return least;
    return x < most ? x : most;
}

/// What ClampFloatPixels should do to two images of the same extent, in floats.
void ClampSlowly(const std::vector<float>& source, std::vector<float>& destination, int32_t rows,
                 int32_t rowBytes, float least, float most) {
    const int32_t floats = rowBytes / 4;
    std::vector<int32_t> walk;
    if (rows >= 1) walk.push_back(0);
    for (int32_t row = 0; row <= rows - 2; ++row) walk.push_back(row);
    for (const int32_t row : walk)
        for (int32_t i = 0; i < floats; ++i) {
            const auto place = static_cast<size_t>(row * rowBytes / 4 + i);
            const auto clamp = i < floats / 32 * 32 ? ClampInGroup : ClampBehindGroups;
            destination[place] = clamp(source[place], least, most);
        }
}

std::vector<float> Clamped(std::vector<float> image, int32_t rows, int32_t rowBytes, float least = 0,
                           float most = 1) {
    ClampFloatPixels(image.data(), image.data(), rows, rowBytes, least, most);
    return image;
}

using Floats = std::vector<float>;

TEST(ClampFloatPixels, LeavesTheLastOfThreeRows) {
    const Floats image = {-1, 2, 0.5f, 3, -4, 0.25f, 5, -6, 7};
    EXPECT_EQ(Clamped(image, 3, 12), (Floats{0, 1, 0.5f, 1, 0, 0.25f, 5, -6, 7}));
    Floats other(9, 99);
    ClampFloatPixels(image.data(), other.data(), 3, 12, 0, 1);
    EXPECT_EQ(other, (Floats{0, 1, 0.5f, 1, 0, 0.25f, 99, 99, 99}));
}

TEST(ClampFloatPixels, TreatsASingleRowAndTheFirstOfTwo) {
    EXPECT_EQ(Clamped({-1, 2}, 1, 8), (Floats{0, 1}));
    EXPECT_EQ(Clamped({-1, 2, -1, 2}, 2, 8), (Floats{0, 1, -1, 2}));
}

TEST(ClampFloatPixels, DoesNothingWithoutRowsOrFloats) {
    const Floats image = {-1, 2, -3, 4};
    for (const int32_t rows : kNoCounts) EXPECT_EQ(Clamped(image, rows, 8), image) << rows;
    for (const int32_t rowBytes : {0, 1, 3, -1, -4, -8, -128, INT32_MIN})
        EXPECT_EQ(Clamped(image, 2, rowBytes), image) << rowBytes;
    for (const int32_t rows : kNoCounts) ClampFloatPixels(nullptr, nullptr, rows, 128, 0, 1);
}

TEST(ClampFloatPixels, NaNIsTheUpperLimitInGroupsAndTheLowerBehindThem) {
    const Floats clamped = Clamped(Floats(33, kNaN), 1, 132, 0.25f, 0.75f);
    EXPECT_EQ(std::count(clamped.begin(), clamped.begin() + 32, 0.75f), 32);
    EXPECT_EQ(clamped[32], 0.25f);
}

TEST(ClampFloatPixels, InfinitiesBecomeTheLimits) {
    Floats image(34, kInfinity);
    image[0] = image[32] = -kInfinity;
    const Floats clamped = Clamped(image, 1, 136, -2, 3);
    for (size_t i = 0; i < image.size(); ++i) EXPECT_EQ(clamped[i], image[i] < 0 ? -2.0f : 3.0f);
    EXPECT_EQ(Clamped({kInfinity, -kInfinity}, 1, 8, -kInfinity, kInfinity), (Floats{kInfinity, -kInfinity}));
}

TEST(ClampFloatPixels, TheFirstRowIsTreatedTwice) {
    // Seen only in place and between crossed limits: what became the upper one is not above the lower one.
    EXPECT_EQ(Clamped({5, 5, 5}, 3, 4, 2, 1), (Floats{2, 1, 5}));
}

TEST(ClampFloatPixels, CrossedLimitsGiveTheLowerInGroupsAndEitherBehindThem) {
    Floats image(35, 5);
    image[34] = -5;
    const Floats clamped = Clamped(image, 1, 140, 2, 1); // from 2 to 1
    EXPECT_EQ(std::count(clamped.begin(), clamped.begin() + 32, 2.0f), 32);
    EXPECT_EQ(clamped[32], 1.0f);
    EXPECT_EQ(clamped[34], 2.0f);
}

TEST(ClampFloatPixels, ZerosTakeTheSignOfALimitThatEqualsThem) {
    // Neither is less than the other, and so the limit is taken.
    for (const float zero : {0.0f, -0.0f})
        for (const float limit : {0.0f, -0.0f}) {
            const Floats low = Clamped(Floats(33, zero), 1, 132, limit, 1);
            const Floats high = Clamped(Floats(33, zero), 1, 132, -1, limit);
            for (size_t i = 0; i < 33; ++i) {
                EXPECT_EQ(Pattern(low[i]), Pattern(limit)) << i;
                EXPECT_EQ(Pattern(high[i]), Pattern(limit)) << i;
            }
        }
}

TEST(ClampFloatPixels, RowsThatAreNoMultipleOfFourBytesBeginAtTheMultipleBelow) {
    // 13 bytes hold three floats; rows begin at bytes 0, 12 and 24 (13 and 26 rounded down), the fifth at 52.
    Floats image(17, 2);
    const Floats three = Clamped(image, 4, 13);
    EXPECT_EQ(three, (Floats{1, 1, 1, 1, 1, 1, 1, 1, 1, 2, 2, 2, 2, 2, 2, 2, 2}));
    const Floats five = Clamped(image, 6, 13);
    EXPECT_EQ(five, (Floats{1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 2, 1, 1, 1, 2}))
        << "a float between rows stays";
}

TEST(ClampFloatPixels, NeitherReadsNorWritesTheLastRow) {
    constexpr int32_t kRowBytes = 4 * 71;
    for (int32_t rows = 1; rows <= 4; ++rows)
        for (const Guard guard : {Guard::kAfter, Guard::kBefore}) {
            const size_t bytes = static_cast<size_t>(std::max(1, rows - 1)) * kRowBytes;
            const GuardedRows source(bytes, guard), destination(bytes, guard);
            Random random(6);
            const Floats image = [&] {
                Floats floats(bytes / 4);
                for (float& x : floats) x = MakeFloat(Content::kMixed, random);
                return floats;
            }();
            Floats expected(image.size(), 0);
            ClampSlowly(image, expected, rows, kRowBytes, -0.5f, 0.75f);
            std::memcpy(source.Bytes(), image.data(), bytes);
            auto* from = reinterpret_cast<float*>(source.Bytes());
            auto* to = reinterpret_cast<float*>(destination.Bytes());
            ClampFloatPixels(from, to, rows, kRowBytes, -0.5f, 0.75f);
            EXPECT_EQ(std::memcmp(to, expected.data(), bytes), 0) << rows << " rows";
            EXPECT_EQ(std::memcmp(from, image.data(), bytes), 0) << "the source changed";
            ClampFloatPixels(from, from, rows, kRowBytes, -0.5f, 0.75f);
            EXPECT_EQ(std::memcmp(from, expected.data(), bytes), 0) << rows << " rows, in place";
        }
}

TEST(ClampFloatPixels, EveryWidthAgreesWithTheSlowForm) {
    Random random(7);
    for (int32_t rowBytes = 0; rowBytes <= 600; rowBytes += 1 + static_cast<int32_t>(random.Below(7)))
        for (const int32_t rows : {1, 2, 3, 6}) {
            const auto floats = static_cast<size_t>(rows * rowBytes / 4 + 2);
            Floats image(floats);
            for (float& x : image) x = MakeFloat(Content::kMixed, random);
            const float least = Uniform(random, -1, 1), most = Uniform(random, -0.5f, 2);
            for (const size_t offset : {size_t{0}, size_t{1}}) { // aligned for vectors and not
                alignas(64) static float source[1024], destination[1024];
                std::ranges::fill(destination, 99.0f);
                std::copy(image.begin(), image.end(), source + offset);
                Floats expected(floats, 99), inPlace = image;
                ClampSlowly(image, expected, rows, rowBytes, least, most);
                ClampSlowly(inPlace, inPlace, rows, rowBytes, least, most);
                ClampFloatPixels(source + offset, destination + offset, rows, rowBytes, least, most);
                ASSERT_EQ(std::memcmp(destination + offset, expected.data(), 4 * floats), 0)
                    << rows << " rows of " << rowBytes << " bytes, seed " << random.Seed();
                ClampFloatPixels(source + offset, source + offset, rows, rowBytes, least, most);
                ASSERT_EQ(std::memcmp(source + offset, inPlace.data(), 4 * floats), 0)
                    << rows << " rows of " << rowBytes << " bytes in place, seed " << random.Seed();
            }
        }
}

TEST(ClampFloatPixels, EveryBodyAgreesWithTheSlowForm) {
    Random random(8);
    Floats image(4096), expected(image.size());
    for (float& x : image) x = MakeFloat(Content::kMixed, random);
    constexpr std::pair<float, float> kLimits[] = {
        {0, 1}, {-0.0f, 0.0f}, {1, 0}, {-kInfinity, 0.5f}, {0.25f, kInfinity}};
    for (const auto& [least, most] : kLimits)
        for (const PK::Target target : TargetsOfThisProcessor(PK::Offer::processor)) {
            for (size_t i = 0; i < image.size(); ++i) expected[i] = ClampInGroup(image[i], least, most);
            Floats clamped(image.size());
            PK::KernelsFor<PK::ClampKernels>(target).clamp(image.data(), clamped.data(), 4096, {least, most});
            EXPECT_EQ(std::memcmp(clamped.data(), expected.data(), 4 * image.size()), 0)
                << PK::TargetName(target) << ", from " << least << " to " << most;
        }
}

} // namespace
