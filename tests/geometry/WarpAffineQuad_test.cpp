// PK_WarpAffineQuad: what it draws, by values worked out by hand, and what it leaves alone.

#include "support/GuardedRows.h"

#include <PixelKiln/QuadWarp.h>

#include <algorithm>
#include <array>
#include <cfenv>
#include <cmath>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <vector>
#include <xmmintrin.h>

using namespace PKTest;

namespace {

using Pixel = std::array<uint8_t, 4>;
using Quad = std::array<double, 8>;

struct Picture {
    Picture(int32_t pictureWidth, int32_t pictureHeight, Pixel fill = {0, 0, 0, 0})
        : width(pictureWidth), height(pictureHeight),
          pixels(static_cast<size_t>(pictureWidth) * static_cast<size_t>(pictureHeight), fill) {}

    Pixel& At(int32_t column, int32_t row) { return pixels[static_cast<size_t>(row * width + column)]; }
    const Pixel& At(int32_t column, int32_t row) const {
        return pixels[static_cast<size_t>(row * width + column)];
    }
    PK_Rect Rect() const { return {0, 0, width, height}; }
    bool operator==(const Picture& other) const = default;

    int32_t width, height;
    std::vector<Pixel> pixels;
};

/// A picture whose pixel (column, row) is {column, row, 7 column + row, 255}.
Picture Chart(int32_t width, int32_t height) {
    Picture picture(width, height);
    for (int32_t row = 0; row < height; ++row)
        for (int32_t column = 0; column < width; ++column)
            picture.At(column, row) = {static_cast<uint8_t>(column), static_cast<uint8_t>(row),
                                       static_cast<uint8_t>(7 * column + row), 255};
    return picture;
}

Quad Box(double left, double top, double right, double bottom) {
    return {left, top, right, top, right, bottom, left, bottom};
}

struct Settings {
    int32_t quality = 3;
    int32_t opacity = 255;
    bool blend = false;
    bool keepSourceAlpha = false;
    PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    int32_t field = 0;
    bool ignoreFields = false;
    bool featherOver = false;
    float feather = 0;
};

PK_Result Warp(const Picture& source, PK_Rect sourceRect, const Quad& sourceQuad, Picture& destination,
               PK_Rect destinationRect, const Quad& destinationQuad, const Settings& settings) {
    return PK_WarpAffineQuad(nullptr, nullptr, source.pixels.data(), 4 * source.width, &sourceRect,
                             sourceQuad.data(), destination.pixels.data(), -4 * destination.width,
                             &destinationRect, destinationQuad.data(), settings.quality, settings.opacity,
                             settings.blend, settings.keepSourceAlpha, settings.format, settings.field,
                             settings.ignoreFields, settings.featherOver, settings.feather);
}

PK_Result Warp(const Picture& source, const Quad& sourceQuad, Picture& destination,
               const Quad& destinationQuad, const Settings& settings) {
    return Warp(source, source.Rect(), sourceQuad, destination, destination.Rect(), destinationQuad,
                settings);
}

/// The pixel that one source pixel leaves of one destination pixel.
Pixel Drawn(Pixel source, Pixel destination, const Settings& settings) {
    const Picture from(3, 3, source);
    Picture to(3, 3, destination);
    EXPECT_EQ(Warp(from, Box(0, 0, 3, 3), to, Box(1, 1, 2, 2), settings), PK_Success);
    EXPECT_EQ(to.At(0, 1), destination);
    EXPECT_EQ(to.At(2, 1), destination);
    EXPECT_EQ(to.At(1, 0), destination);
    EXPECT_EQ(to.At(1, 2), destination);
    return to.At(1, 1);
}

bool Untouched(const Picture& picture, Pixel fill) {
    return std::all_of(picture.pixels.begin(), picture.pixels.end(), [&](Pixel p) { return p == fill; });
}

constexpr Pixel kPaper = {9, 9, 9, 9};
constexpr double kInfinity = std::numeric_limits<double>::infinity();
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

} // namespace

TEST(WarpAffineQuad, BilinearCopyOfWholePixelsIsExact) {
    const Picture chart = Chart(21, 5);
    Picture copy(21, 5);
    ASSERT_EQ(Warp(chart, Box(0, 0, 21, 5), copy, Box(0, 0, 21, 5), {}), PK_Success);
    EXPECT_EQ(copy, chart);
    Picture moved(21, 5, kPaper);
    ASSERT_EQ(Warp(chart, Box(2, 1, 12, 4), moved, Box(5, 2, 15, 5), {}), PK_Success);
    for (int32_t row = 0; row < 5; ++row)
        for (int32_t column = 0; column < 21; ++column) {
            const bool inside = column >= 5 && column < 15 && row >= 2;
            EXPECT_EQ(moved.At(column, row), inside ? chart.At(column - 3, row - 1) : kPaper);
        }
}

// u = column + 0.5 is a tie: 0.5 goes to 0, 1.5 and 2.5 to 2, 3.5 to 4, which is limited to 3.
TEST(WarpAffineQuad, NearestCopyOfWholePixelsSamplesTiesToEven) {
    const Picture chart = Chart(4, 4);
    Picture copy(4, 4);
    ASSERT_EQ(Warp(chart, Box(0, 0, 4, 4), copy, Box(0, 0, 4, 4), {.quality = 2}), PK_Success);
    const int32_t sampled[4] = {0, 2, 2, 3};
    for (int32_t row = 0; row < 4; ++row)
        for (int32_t column = 0; column < 4; ++column)
            EXPECT_EQ(copy.At(column, row), chart.At(sampled[column], sampled[row]));
}

// u - 0.5 = 0.75 rounds to column 1 with the fraction -0.25: 100 + (200 - 100) x -0.25, and not a mean of 0
// and 100.
TEST(WarpAffineQuad, BilinearExtrapolatesWhereThePlaceRoundsUp) {
    Picture source(4, 1);
    const uint8_t values[4] = {0, 100, 200, 40};
    for (int32_t i = 0; i < 4; ++i) source.At(i, 0) = {values[i], values[i], values[i], 255};
    const auto sampled = [&](double x) {
        Picture to(1, 1);
        EXPECT_EQ(Warp(source, Box(x, 0, x + 1, 1), to, Box(0, 0, 1, 1), {}), PK_Success);
        return int{to.At(0, 0)[0]};
    };
    EXPECT_EQ(sampled(0.25), 25);  // 0 + 100 x 0.25
    EXPECT_EQ(sampled(0.5), 50);   // the tie goes to column 0
    EXPECT_EQ(sampled(0.75), 75);  // 100 + 100 x -0.25
    EXPECT_EQ(sampled(1.75), 240); // 200 + (40 - 200) x -0.25
    EXPECT_EQ(sampled(1.5), 255);  // the tie goes to column 2: 200 + (40 - 200) x -0.5 = 280
    EXPECT_EQ(sampled(2.5), 120);  // the tie goes to column 2: 200 + (40 - 200) x 0.5
    EXPECT_EQ(sampled(2.75), 40);  // rounds to column 3, which stands for the one behind it too
    EXPECT_EQ(sampled(9), 40);
    EXPECT_EQ(sampled(-9), 0);
}

TEST(WarpAffineQuad, PixelsBelongByTheirCentres) {
    const Picture ink(1, 1, {1, 2, 3, 255});
    const auto covered = [&](double left, double right) {
        Picture to(8, 1, kPaper);
        EXPECT_EQ(Warp(ink, Box(0, 0, 1, 1), to, Box(left, 0, right, 1), {}), PK_Success);
        std::vector<int32_t> columns;
        for (int32_t i = 0; i < 8; ++i)
            if (to.At(i, 0) != kPaper) columns.push_back(i);
        return columns;
    };
    EXPECT_EQ(covered(2, 4), (std::vector<int32_t>{2, 3}));
    EXPECT_EQ(covered(2.5, 4.5), (std::vector<int32_t>{2, 3, 4})); // a centre on the border belongs
    EXPECT_EQ(covered(2.51, 4.49), (std::vector<int32_t>{3}));
    EXPECT_EQ(covered(2.6, 3.4), (std::vector<int32_t>{}));
    EXPECT_EQ(covered(-5, 1.5), (std::vector<int32_t>{0, 1}));
    EXPECT_EQ(covered(6.5, 50), (std::vector<int32_t>{6, 7}));
}

TEST(WarpAffineQuad, AlphaOfCopying) {
    for (const int32_t quality : {0, 2, 3, 5}) {
        const Pixel source = {10, 20, 30, 100};
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality}), (Pixel{10, 20, 30, 255}));
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality, .keepSourceAlpha = true}), source);
        // 100 x 51 / 255 = 20, with and without
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality, .opacity = 51}), (Pixel{10, 20, 30, 20}));
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality, .opacity = 51, .keepSourceAlpha = true}),
                  (Pixel{10, 20, 30, 20}));
        EXPECT_EQ(
            Drawn(source, kPaper, {.quality = quality, .opacity = 51, .blend = true, .featherOver = true}),
            source); // neither counts
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality, .opacity = 999}), (Pixel{10, 20, 30, 255}));
        EXPECT_EQ(Drawn(source, kPaper, {.quality = quality, .opacity = -1}), (Pixel{10, 20, 30, 0}));
    }
}

TEST(WarpAffineQuad, BlendsBGRA) {
    for (const int32_t quality : {2, 3}) {
        const Settings blend = {.quality = quality, .blend = true};
        EXPECT_EQ(Drawn({1, 2, 3, 0}, {4, 5, 6, 7}, blend), (Pixel{4, 5, 6, 7}));
        EXPECT_EQ(Drawn({1, 2, 3, 255}, {4, 5, 6, 7}, blend), (Pixel{1, 2, 3, 255}));
        EXPECT_EQ(Drawn({1, 2, 3, 40}, {4, 5, 6, 0}, blend), (Pixel{1, 2, 3, 40}));
        // a 128, d 255: r 255, ws 32640, wd 32385, n 65025
        EXPECT_EQ(Drawn({200, 0, 255, 128}, {100, 255, 1, 255}, blend), (Pixel{150, 127, 128, 255}));
        // a 8, d 16: r 24 - div255(128) = 23, ws 2040, wd 3952, n 5865: 255 x 5992 / 5865 = 260 is limited
        EXPECT_EQ(Drawn({255, 0, 250, 8}, {255, 255, 249, 16}, blend), (Pixel{255, 171, 254, 23}));
        // opacity 128 of alpha 255 is a 128
        const Settings half = {.quality = quality, .opacity = 128, .blend = true};
        EXPECT_EQ(Drawn({200, 0, 255, 255}, {100, 255, 1, 255}, half), (Pixel{150, 127, 128, 255}));
        const Settings none = {.quality = quality, .opacity = 0, .blend = true};
        EXPECT_EQ(Drawn({200, 0, 255, 255}, {100, 255, 1, 0}, none), (Pixel{100, 255, 1, 0}));
    }
}

TEST(WarpAffineQuad, BlendsVUYAAboutItsZeros) {
    const Settings blend = {.blend = true, .format = PK_PixelFormat_VUYA_4444_8u};
    // a 128, d 255: (72 x 32640 - 28 x 32385) / 65025 = 22.2, (-128 x 32640 + 127 x 32385) / 65025 = -1.0004,
    // (219 x 32640 + 84 x 32385) / 65025 = 151.8, truncated
    EXPECT_EQ(Drawn({200, 0, 235, 128}, {100, 255, 100, 255}, blend), (Pixel{150, 127, 167, 255}));
    // a 8, d 16, as for BGRA: 127 x 5992 / 5865 = 129.8 and 239 x 5992 / 5865 = 244.2; -128 becomes -130.8
    EXPECT_EQ(Drawn({255, 0, 255, 8}, {255, 0, 255, 16}, blend), (Pixel{255, 0, 255, 23}));
    EXPECT_EQ(Drawn({128, 128, 0, 8}, {128, 128, 0, 16}, blend), (Pixel{128, 128, 0, 23}));
}

TEST(WarpAffineQuad, OtherFormatsAreReplacedButNotMixed) {
    const Settings blend = {.blend = true, .format = PK_PixelFormat_BGRX_4444_8u};
    EXPECT_EQ(Drawn({1, 2, 3, 255}, {4, 5, 6, 7}, blend), (Pixel{1, 2, 3, 255}));
    EXPECT_EQ(Drawn({1, 2, 3, 9}, {4, 5, 6, 0}, blend), (Pixel{1, 2, 3, 9}));
    EXPECT_EQ(Drawn({1, 2, 3, 9}, {4, 5, 6, 7}, blend), (Pixel{4, 5, 6, 7}));
}

TEST(WarpAffineQuad, FieldsWriteTheirRowsOnly) {
    const Picture ink(4, 40, {1, 2, 3, 255});
    for (const int32_t field : {0, 1, 2, 3, -1}) {
        Picture to(4, 40, kPaper);
        ASSERT_EQ(Warp(ink, Box(0, 0, 4, 40), to, Box(0, 10, 4, 21), {.field = field}), PK_Success);
        for (int32_t row = 0; row < 40; ++row) {
            const bool inField = field == 0 || (field == 1 && row % 2 == 0) || (field == 2 && row % 2 == 1);
            EXPECT_EQ(to.At(2, row) != kPaper, row >= 10 && row < 21 && inField) << field << " " << row;
        }
    }
}

// Rows of the chart hold their number in the second byte.
TEST(WarpAffineQuad, FieldsReadTheirRowsOnly) {
    const Picture chart = Chart(3, 8);
    const auto rows = [&](PK_Rect rect, Settings settings) {
        std::vector<int> result;
        for (int32_t row = 0; row < 8; ++row) {
            Picture to(1, 2);
            const Quad from = Box(0, row, 1, row + 1);
            const int32_t written = settings.field == 2 ? 1 : 0;
            EXPECT_EQ(Warp(chart, rect, from, to, to.Rect(), Box(0, written, 1, written + 1), settings),
                      PK_Success);
            result.push_back(to.At(0, written)[1]);
        }
        return result;
    };
    const PK_Rect all = {0, 0, 3, 8};
    EXPECT_EQ(rows(all, {.field = 1, .ignoreFields = true}), (std::vector<int>{0, 1, 2, 3, 4, 5, 6, 7}));
    // y / 2: 0.5 goes to 0, with 0 + 2 x 0.5 = 1; 1.5 to 2, with row 4 + 2 x -0.5 = 3; 3.5 to 4, which is row 8
    // and becomes the last even row, 6
    EXPECT_EQ(rows(all, {.field = 1}), (std::vector<int>{0, 1, 2, 3, 4, 5, 6, 6}));
    // y / 2 + 0.5: 0.5 goes to 0, row -1, which is raised to row 0, with row 1 below: 0.5, which goes to 0;
    // 3.5 goes to 4, row 7, with nothing below
    EXPECT_EQ(rows(all, {.field = 2}), (std::vector<int>{0, 1, 2, 3, 4, 5, 7, 7}));
    // y 3 in a rectangle that ends with row 5: 1.5 goes to 2, row 4, with nothing below; and one that ends
    // with row 4 with nothing below row 3
    EXPECT_EQ(rows({0, 0, 3, 6}, {.field = 1}), (std::vector<int>{0, 1, 2, 4, 4, 4, 4, 4}));
    EXPECT_EQ(rows({0, 0, 3, 5}, {.field = 2}), (std::vector<int>{0, 1, 3, 3, 3, 3, 3, 3}));
    // y 3: 1.5 goes to row 4; nothing above row 3 is read
    EXPECT_EQ(rows({0, 3, 3, 8}, {.field = 1}), (std::vector<int>{3, 3, 3, 3, 4, 5, 6, 6}));
    // of a rectangle of one row no other is read, whatever the field
    EXPECT_EQ(rows({0, 2, 3, 3}, {.field = 2}), (std::vector<int>{2, 2, 2, 2, 2, 2, 2, 2}));
    EXPECT_EQ(rows({0, 3, 3, 4}, {.field = 1}), (std::vector<int>{3, 3, 3, 3, 3, 3, 3, 3}));
}

TEST(WarpAffineQuad, FeatherRampsFromTheRimToTheInset) {
    const Picture ink(40, 40, {200, 100, 50, 255});
    const Quad box = Box(4, 4, 36, 36);
    // The corners move by 10 along the diagonal: 10 / sqrt(2) = 7.07 inward on each side.
    Picture soft(40, 40, {0, 0, 0, 0});
    ASSERT_EQ(Warp(ink, Box(0, 0, 32, 32), soft, box, {.feather = 10}), PK_Success);
    EXPECT_EQ(soft.At(3, 20)[3], 0);
    for (int32_t column = 4; column < 11; ++column)
        EXPECT_NEAR(soft.At(column, 20)[3], (column + 0.5 - 4) / 7.0711 * 255, 0.6) << column;
    for (int32_t column = 11; column < 29; ++column) EXPECT_EQ(soft.At(column, 20)[3], 255) << column;
    EXPECT_NEAR(soft.At(35, 20)[3], 0.5 / 7.0711 * 255, 0.6);
    EXPECT_EQ(soft.At(36, 20)[3], 0);

    // Below quality 3 the rim is left out.
    Picture small(40, 40, kPaper);
    ASSERT_EQ(Warp(ink, Box(0, 0, 32, 32), small, box, {.quality = 2, .feather = 10}), PK_Success);
    for (int32_t column = 0; column < 40; ++column)
        EXPECT_EQ(small.At(column, 20) != kPaper, column >= 11 && column < 29) << column;

    // Over the destination: colours fade, alpha becomes the source's.
    Picture over(40, 40, {100, 100, 100, 7});
    ASSERT_EQ(Warp(ink, Box(0, 0, 32, 32), over, box, {.featherOver = true, .feather = 10}), PK_Success);
    EXPECT_EQ(over.At(4, 20), (Pixel{107, 100, 96, 255})); // e 18: (100 x 237 + 200 x 18) / 255 = 107.06
    EXPECT_EQ(over.At(20, 20), (Pixel{200, 100, 50, 255}));
    EXPECT_EQ(over.At(3, 20), (Pixel{100, 100, 100, 7}));
}

TEST(WarpAffineQuad, FeatherOfNothingOrLessHasNoRim) {
    const Picture chart = Chart(30, 30);
    Picture plain(30, 30, kPaper);
    ASSERT_EQ(Warp(chart, Box(0, 0, 30, 30), plain, Box(3, 3, 26, 22), {}), PK_Success);
    for (const float feather : {-0.0f, -5.0f, -INFINITY, NAN}) {
        Picture same(30, 30, kPaper);
        ASSERT_EQ(Warp(chart, Box(0, 0, 30, 30), same, Box(3, 3, 26, 22), {.feather = feather}), PK_Success);
        EXPECT_EQ(same, plain) << feather;
    }
}

TEST(WarpAffineQuad, TrianglesAndCrossedQuads) {
    const Picture ink(2, 2, {1, 2, 3, 255});
    const auto covered = [&](const Quad& quad, float feather) {
        Picture to(16, 16, {0, 0, 0, 0});
        EXPECT_EQ(Warp(ink, Box(0, 0, 2, 2), to, quad, {.feather = feather}), PK_Success);
        return std::count_if(to.pixels.begin(), to.pixels.end(), [](Pixel p) { return p != Pixel{}; });
    };
    // Row r holds the columns whose centre is at or left of 16 - (r + 0.5): 16 - r of them.
    EXPECT_EQ(covered({0, 0, 16, 0, 0, 16, 0, 16}, 0), 136);
    EXPECT_EQ(covered({0, 0, 0, 0, 16, 0, 0, 16}, 0), 136);
    EXPECT_GT(covered({0, 0, 16, 0, 0, 16, 0, 16}, 2), 60);
    EXPECT_EQ(covered({3, 3, 3, 3, 3, 3, 3, 3}, 0), 0);
    // Two triangles that meet at (8, 8), their borders through centres: 16 + 14 + ... + 2, twice
    EXPECT_EQ(covered({0, 0, 16, 0, 0, 16, 16, 16}, 0), 144);
    // the other way over: left and right
    EXPECT_EQ(covered({0, 0, 16, 16, 16, 0, 0, 16}, 0), 144);
}

TEST(WarpAffineQuad, DrawsOnlyInsideTheDestinationRectangle) {
    const Picture ink(2, 2, {1, 2, 3, 255});
    Picture to(12, 12, kPaper);
    const PK_Rect clip = {3, 2, 9, 10};
    ASSERT_EQ(Warp(ink, ink.Rect(), Box(0, 0, 2, 2), to, clip, Box(-100, -100, 100, 100), {}), PK_Success);
    for (int32_t row = 0; row < 12; ++row)
        for (int32_t column = 0; column < 12; ++column)
            EXPECT_EQ(to.At(column, row) != kPaper, column >= 3 && column < 9 && row >= 2 && row < 10);

    Picture outside(12, 12, kPaper);
    for (const Quad& quad : {Box(-9, 0, -1, 9), Box(13, 0, 20, 9), Box(0, -9, 9, -1), Box(0, 12, 9, 40)})
        ASSERT_EQ(Warp(ink, Box(0, 0, 2, 2), outside, quad, {.feather = 1}), PK_Success);
    EXPECT_TRUE(Untouched(outside, kPaper));
}

TEST(WarpAffineQuad, EmptyAndInvertedRectanglesDrawNothing) {
    const Picture ink(4, 4, {1, 2, 3, 255});
    Picture to(4, 4, kPaper);
    constexpr PK_Rect kEmpty[] = {{0, 0, 0, 4},
                                  {0, 0, 4, 0},
                                  {3, 0, 1, 4},
                                  {0, 3, 4, 1},
                                  {INT32_MAX, INT32_MAX, INT32_MIN, INT32_MIN},
                                  {0, 0, INT32_MIN, INT32_MIN}};
    for (const PK_Rect& empty : kEmpty) {
        EXPECT_EQ(Warp(ink, empty, Box(0, 0, 4, 4), to, to.Rect(), Box(0, 0, 4, 4), {}), PK_Success);
        EXPECT_EQ(Warp(ink, ink.Rect(), Box(0, 0, 4, 4), to, empty, Box(0, 0, 4, 4), {}), PK_Success);
    }
    EXPECT_TRUE(Untouched(to, kPaper));
}

TEST(WarpAffineQuad, RefusesInTheDocumentedOrder) {
    uint8_t pixel[4] = {1, 2, 3, 4}, out[4] = {5, 6, 7, 8};
    const PK_Rect rect = {0, 0, 1, 1};
    const Quad quad = Box(0, 0, 1, 1);
    const auto warp = [&](const void* source, int32_t sourceStep, const PK_Rect* sourceRect,
                          const double* from, void* destination, int32_t destinationStep,
                          const PK_Rect* destinationRect, const double* to) {
        return PK_WarpAffineQuad(nullptr, nullptr, source, sourceStep, sourceRect, from, destination,
                                 destinationStep, destinationRect, to, 3, 255, false, false,
                                 PK_PixelFormat_BGRA_4444_8u, 0, false, false, 0);
    };
    const double* q = quad.data();
    EXPECT_EQ(warp(nullptr, 0, nullptr, nullptr, nullptr, 0, nullptr, nullptr), PK_ErrNullDestination);
    EXPECT_EQ(warp(nullptr, 0, nullptr, nullptr, out, 0, nullptr, nullptr), PK_ErrNullSource);
    EXPECT_EQ(warp(pixel, 0, &rect, q, out, 4, &rect, q), PK_ErrFailed);
    EXPECT_EQ(warp(pixel, 4, &rect, q, out, 0, &rect, q), PK_ErrFailed);
    EXPECT_EQ(warp(pixel, 4, nullptr, q, out, 4, &rect, q), PK_ErrFailed);
    EXPECT_EQ(warp(pixel, 4, &rect, nullptr, out, 4, &rect, q), PK_ErrFailed);
    EXPECT_EQ(warp(pixel, 4, &rect, q, out, 4, nullptr, q), PK_ErrFailed);
    EXPECT_EQ(warp(pixel, 4, &rect, q, out, 4, &rect, nullptr), PK_ErrFailed);
    EXPECT_EQ(out[0], 5);
    EXPECT_EQ(warp(pixel, INT32_MIN, &rect, q, out, INT32_MIN, &rect, q), PK_Success);
    EXPECT_EQ(out[0], 1);
}

TEST(WarpAffineQuad, QuadsThatAreNotFiniteDrawNothing) {
    const Picture ink(4, 4, {1, 2, 3, 255});
    for (const double bad : {kInfinity, -kInfinity, kNaN, 1e300}) { // beyond single precision too
        for (size_t i = 0; i < 8; ++i) {
            Picture to(4, 4, kPaper);
            Quad quad = Box(0, 0, 4, 4);
            quad[i] = bad;
            EXPECT_EQ(Warp(ink, Box(0, 0, 4, 4), to, quad, {.feather = 1}), PK_Success);
            EXPECT_EQ(Warp(ink, quad, to, Box(0, 0, 4, 4), {}), PK_Success);
            EXPECT_TRUE(Untouched(to, kPaper));
        }
    }
}

TEST(WarpAffineQuad, HugeQuadsStayInside) {
    constexpr double kHuge[] = {-3.4e38, -1e20, -3e9, -16777217, 0, 2, 16777217, 3e9, 1e20, 3.4e38};
    const GuardedRows source(4 * 4 * 4, Guard::kAfter);
    const GuardedRows destination(4 * 4 * 4, Guard::kBefore);
    const PK_Rect rect = {0, 0, 4, 4};
    uint32_t state = 1;
    const auto draw = [&] {
        return kHuge[((state = state * 1664525 + 1013904223) >> 16 & 0xffff) % std::size(kHuge)];
    };
    for (int32_t i = 0; i < 4000; ++i) {
        Quad from, to;
        std::generate(from.begin(), from.end(), draw);
        std::generate(to.begin(), to.end(), draw);
        const float feathers[] = {0, 1, 1e30f, INFINITY};
        ASSERT_EQ(PK_WarpAffineQuad(nullptr, nullptr, source.Bytes(), 16, &rect, from.data(),
                                    destination.Bytes(), 16, &rect, to.data(), 2 + i % 2, 200, i % 3 == 0,
                                    false, PK_PixelFormat_BGRA_4444_8u, i % 7 % 3, false, i % 5 == 0,
                                    feathers[i % 4]),
                  PK_Success);
    }
}

// The caller may promise more than there is: only what the quad asks for is touched, also by the lanes of a
// group that have no pixel.
TEST(WarpAffineQuad, RectanglesMayReachToTheLimitsOfTheirNumbers) {
    const Picture chart = Chart(20, 4);
    const GuardedRows guarded(4 * chart.pixels.size(), Guard::kAfter);
    std::memcpy(guarded.Bytes(), chart.pixels.data(), guarded.Size());
    constexpr PK_Rect kAll = {INT32_MIN, INT32_MIN, INT32_MAX, INT32_MAX};
    for (const int32_t quality : {2, 3}) {
        const Quad from = Box(2.25, 0.75, 18.9, 3), to = Box(1, 1, 18, 3);
        Picture expected(20, 4, kPaper), unclipped(20, 4, kPaper), actual(20, 4, kPaper);
        ASSERT_EQ(Warp(chart, from, expected, to, {.quality = quality}), PK_Success);
        ASSERT_EQ(Warp(chart, chart.Rect(), from, unclipped, kAll, to, {.quality = quality}), PK_Success);
        EXPECT_EQ(unclipped, expected);
        const PK_Rect rect = actual.Rect();
        ASSERT_EQ(PK_WarpAffineQuad(nullptr, nullptr, guarded.Bytes(), 80, &kAll, from.data(),
                                    actual.pixels.data(), 80, &rect, to.data(), quality, 255, false, false,
                                    PK_PixelFormat_BGRA_4444_8u, 0, false, false, 0),
                  PK_Success);
        EXPECT_EQ(actual, expected);
    }
}

// Two thousand million rows without a pixel to draw: a walk along them would take a minute each time.
TEST(WarpAffineQuad, RowsWithoutPixelsTakeNoTime) {
    const Picture ink(1, 1, {1, 2, 3, 255});
    constexpr double kTop = INT32_MIN, kBottom = INT32_MAX;
    constexpr PK_Rect kRect = {0, 0, 8, INT32_MAX};
    const Quad quads[] = {
        Box(-3000, kTop, -2000, kBottom),                     // beside the rectangle
        Box(1e9, kTop, 2e9, kBottom),                         // on the other side
        Box(2.6, kTop, 3.4, kBottom),                         // between two centres
        {3, kTop, 3, kTop, 3, kBottom, 3, kBottom},           // of no width
        {-1e9, kTop, -1e9, kTop, -1, kBottom, -2e9, kBottom}, // coming nearer
        {-9, kTop, -1e9, kBottom, -100, 0, -99, kTop},        // crossing itself
        {4, -1e9, 1e9, kBottom, 4, -9e8, -1e9, kBottom},      // an arm on either side
    };
    for (const Quad& quad : quads)
        for (const float feather : {0.0f, 0.125f})
            for (const int32_t field : {0, 1, 2}) {
                Picture to(8, 1, kPaper);
                EXPECT_EQ(Warp(ink, ink.Rect(), Box(0, 0, 1, 1), to, kRect, quad,
                               {.field = field, .feather = feather}),
                          PK_Success);
                EXPECT_TRUE(Untouched(to, kPaper));
            }
    // A field that there is not has no row to draw.
    Picture to(8, 1, kPaper);
    EXPECT_EQ(Warp(ink, ink.Rect(), Box(0, 0, 1, 1), to, kRect, Box(0, kTop, 8, kBottom), {.field = -1}),
              PK_Success);
    EXPECT_TRUE(Untouched(to, kPaper));
}

TEST(WarpAffineQuad, RoundsByTheModeOfTheCallerAndLeavesIt) {
    const Picture chart = Chart(4, 4);
    const int mode = std::fegetround();
    ASSERT_EQ(std::fesetround(FE_DOWNWARD), 0);
    const uint32_t before = _mm_getcsr() & ~0x3fu;
    Picture copy(4, 4);
    const PK_Result result = Warp(chart, Box(0, 0, 4, 4), copy, Box(0, 0, 4, 4), {.quality = 2});
    const uint32_t after = _mm_getcsr() & ~0x3fu;
    std::fesetround(mode);
    ASSERT_EQ(result, PK_Success);
    EXPECT_EQ(after, before);
    EXPECT_EQ(copy, chart); // column + 0.5 goes down to the column
}
