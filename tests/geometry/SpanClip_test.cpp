// The stretch of a line that lies in a rectangle, and the parts of a row that follow from it.

#include "geometry/SpanClip.h"

#include <cmath>
#include <gtest/gtest.h>
#include <limits>
#include <optional>
#include <utility>

using namespace PK;

namespace {

using Times = std::optional<std::pair<double, double>>;

constexpr PK_Rect kRect = {2, 3, 12, 9};

Times Clip(const PK_Rect& rectangle, PK_Point position, PK_Point step) {
    double t0 = -1, t1 = -2;
    if (!ClipSpanToRect(rectangle, position, step, t0, t1)) return std::nullopt;
    return std::pair(t0, t1);
}

Times Stretch(double t0, double t1) {
    return std::pair(t0, t1);
}

MotionRow RowOf(const PK_Rect& rect, PK_Point at, PK_Point step, int32_t columns) {
    MotionRow row{};
    row.left = rect.left;
    row.top = rect.top;
    row.right = rect.right;
    row.bottom = rect.bottom;
    row.x = at.x;
    row.y = at.y;
    row.stepX = step.x;
    row.stepY = step.y;
    row.columns = columns;
    row.rotated = true;
    return row;
}

void ExpectParts(const MotionRow& row, int32_t margin, MotionParts expected) {
    const MotionParts parts = PartsOfRow(row, margin);
    EXPECT_EQ(parts.first, expected.first);
    EXPECT_EQ(parts.inner, expected.inner);
    EXPECT_EQ(parts.right, expected.right);
    EXPECT_EQ(parts.end, expected.end);
}

} // namespace

TEST(ClipSpanToRect, FindsWhereALineCrossesTheSides) {
    EXPECT_EQ(Clip(kRect, {0, 4}, {0.5f, 0}), Stretch(4, 24));
    EXPECT_EQ(Clip(kRect, {20, 4}, {-2, 0}), Stretch(4, 9));
    EXPECT_EQ(Clip(kRect, {5, 0}, {0, 1}), Stretch(3, 9));
    EXPECT_EQ(Clip(kRect, {5, 10}, {0, -0.5f}), Stretch(2, 14));
    // x is inside from 2 to 12, y from 3 to 9.
    EXPECT_EQ(Clip(kRect, {0, 0}, {1, 1}), Stretch(3, 9));
    EXPECT_EQ(Clip(kRect, {0, 12}, {1, -1}), Stretch(3, 9));
    EXPECT_EQ(Clip(kRect, {14, 12}, {-1, -1}), Stretch(3, 9));
    EXPECT_EQ(Clip(kRect, {4, 5}, {1, 0.25f}), Stretch(-2, 8));
}

TEST(ClipSpanToRect, TellsALineThatPassesBy) {
    EXPECT_EQ(Clip(kRect, {0, 0}, {1, 0}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {1, 5}, {0, 1}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {0, 10}, {1, 1}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {13, 0}, {1, 1}), std::nullopt);
}

TEST(ClipSpanToRect, ALineAlongASideIsOutside) {
    EXPECT_EQ(Clip(kRect, {0, 3}, {1, 0}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {0, 9}, {1, 0}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {2, 0}, {0, 1}), std::nullopt);
    EXPECT_EQ(Clip(kRect, {12, 0}, {0, 1}), std::nullopt);
    EXPECT_NE(Clip(kRect, {0, 3.001f}, {1, 0}), std::nullopt);
    EXPECT_NE(Clip(kRect, {0, 8.999f}, {1, 0}), std::nullopt);
}

TEST(ClipSpanToRect, StepsBelowTheLeastCountAsNone) {
    EXPECT_EQ(Clip(kRect, {5, 0}, {7e-6f, 1}), Stretch(3, 9));
    EXPECT_EQ(Clip(kRect, {0, 4}, {1, -7e-6f}), Stretch(2, 12));
    EXPECT_EQ(Clip(kRect, {1, 0}, {7e-6f, 1}), std::nullopt);
}

TEST(ClipSpanToRect, ALineThatStandsIsInForEverOrNever) {
    constexpr double kInfinity = std::numeric_limits<double>::infinity();
    EXPECT_EQ(Clip(kRect, {5, 5}, {0, 0}), Stretch(-kInfinity, kInfinity));
    EXPECT_EQ(Clip(kRect, {1, 5}, {0, 0}), std::nullopt);
}

TEST(ClipSpanToRect, AnEmptyRectangleHasNothing) {
    EXPECT_EQ(Clip({3, 0, 2, 9}, {0, 4}, {1, 0}), std::nullopt);
    EXPECT_EQ(Clip({0, 5, 9, 4}, {0, 4}, {1, 0}), std::nullopt);
}

TEST(PartsOfRow, KeepsAMarginFromTheEdges) {
    // The outer stretch is -2 to 18, the inner one 2 to 14.
    ExpectParts(RowOf({0, 0, 16, 16}, {-5.5f, 8}, {1, 0}, 100), 2, {3, 8, 19, 24});
    ExpectParts(RowOf({0, 0, 16, 16}, {0.5f, 8}, {1, 0}, 10), 2, {0, 2, 10, 10});
    ExpectParts(RowOf({0, 0, 16, 16}, {4, 8}, {1, 0}, 5), 2, {0, 0, 5, 5});
    // Along the margin nothing is inside.
    ExpectParts(RowOf({0, 0, 16, 16}, {0.5f, 1}, {1, 0}, 10), 2, {0, 10, 10, 10});
}

TEST(PartsOfRow, AnImageOfOnePixelHasEdgesOnly) {
    ExpectParts(RowOf({0, 0, 1, 1}, {-5, 0.5f}, {1, 0}, 10), 2, {3, 8, 8, 8});
}

TEST(PartsOfRow, ARowThatMissesHasNoColumns) {
    ExpectParts(RowOf({0, 0, 16, 16}, {0, 30}, {1, 0}, 7), 2, {7, 7, 7, 7});
    ExpectParts(RowOf({0, 0, 16, 16}, {0, 5}, {1, 0}, 0), 2, {0, 0, 0, 0});
}

TEST(PartsOfRow, AnythingLeavesPartsInTheirOrder) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    const float odd[] = {std::nanf(""), kInfinity, -kInfinity, 3e38f, -3e38f, 1e-40f, 0,
                         -0.0f,         8,         1,          -1,    1e9f};
    const PK_Rect rects[] = {{0, 0, 16, 16}, {0, 0, 1, 1}, {0, 4, 16, 4}, {-4, -4, 20, 20}};
    for (const PK_Rect& rect : rects)
        for (const float x : odd)
            for (const float y : odd)
                for (const float stepX : odd)
                    for (const float stepY : odd) {
                        const MotionParts p = PartsOfRow(RowOf(rect, {x, y}, {stepX, stepY}, 50), 2);
                        ASSERT_TRUE(0 <= p.first && p.first <= p.inner && p.inner <= p.right &&
                                    p.right <= p.end && p.end <= 50)
                            << x << ", " << y << ", " << stepX << ", " << stepY;
                    }
}
