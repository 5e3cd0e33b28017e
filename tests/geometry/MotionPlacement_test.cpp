#include "geometry/MotionPlacement.h"

#include "geometry/MotionBlur.h"
#include "geometry/MotionFields.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace {

using namespace PK;

constexpr float kInfinity = std::numeric_limits<float>::infinity(),
                kNaN = std::numeric_limits<float>::quiet_NaN();

/// 40 x 20 in the middle of 100 x 60.
MotionGeometry Middle() {
    return {40, 20, 100, 60, 1, 1, {0.5f, 0.5f}, {0.5f, 0.5f}, {1, 1}, 0};
}

void ExpectRect(const PK_Rect& expected, const PK_Rect& actual) {
    EXPECT_EQ(expected.left, actual.left);
    EXPECT_EQ(expected.top, actual.top);
    EXPECT_EQ(expected.right, actual.right);
    EXPECT_EQ(expected.bottom, actual.bottom);
}

constexpr PK_Rect kWhole = {0, 0, 40, 20};

TEST(MotionPlacement, PutsTheAnchorOnThePosition) {
    MotionGeometry geometry = Middle();
    geometry.anchor = {0.25f, 0.5f};
    geometry.position = {0.1f, 0.9f};
    geometry.scale = {3, 0.5f};
    geometry.rotation = 77;
    const PK_Point place = MotionPlacement(geometry).ToDestination(10, 10);
    EXPECT_FLOAT_EQ(place.x, 10);
    EXPECT_FLOAT_EQ(place.y, 54);
}

TEST(MotionPlacement, MovesWholePixelsToThemselves) {
    const MotionPlacement placement(Middle());
    ExpectRect({30, 20, 70, 40}, placement.Reach(kWhole, 0, 0));
    ExpectRect({26, 16, 74, 44}, placement.Reach(kWhole, 4, 4));
    const PK_Point place = placement.ToSource(30, 20);
    EXPECT_EQ(place.x, 0.5f);
    EXPECT_EQ(place.y, 0.5f);
}

TEST(MotionPlacement, TurnsClockwiseInSquarePixels) {
    MotionGeometry geometry = Middle();
    geometry.rotation = 90;
    const PK_Point right = MotionPlacement(geometry).ToDestination(40, 10); // the middle of the right edge
    EXPECT_NEAR(right.x, 50, 1e-4);
    EXPECT_NEAR(right.y, 50, 1e-4);
    geometry.aspectNum = 2; // twice as wide as high
    const PK_Point wide = MotionPlacement(geometry).ToDestination(40, 10);
    EXPECT_NEAR(wide.x, 50, 1e-4);
    EXPECT_NEAR(wide.y, 70, 1e-4);
    const PK_Point bottom = MotionPlacement(geometry).ToDestination(20, 20);
    EXPECT_NEAR(bottom.x, 45, 1e-4);
    EXPECT_NEAR(bottom.y, 30, 1e-4);
}

TEST(MotionPlacement, GoesBackWhereItCameFrom) {
    MotionGeometry geometry = Middle();
    geometry.rotation = 33;
    geometry.aspectNum = 10;
    geometry.aspectDen = 11;
    geometry.scale = {1.7f, 0.6f};
    const MotionPlacement placement(geometry);
    for (int32_t column = 0; column < 100; column += 9)
        for (int32_t row = 0; row < 60; row += 7) {
            const PK_Point source = placement.ToSource(column, row);
            const PK_Point back = placement.ToDestination(source.x, source.y);
            EXPECT_NEAR(back.x, static_cast<float>(column) + 0.5f, 1e-3);
            EXPECT_NEAR(back.y, static_cast<float>(row) + 0.5f, 1e-3);
        }
}

TEST(MotionPlacement, ATwentiethOfADegreeIsTheLeastRotation) {
    MotionGeometry geometry = Middle();
    for (const auto& [degrees, isRotated] : {std::pair{0.0, false},
                                             {0.04, false},
                                             {-0.04, false},
                                             {0.06, true},
                                             {180.0, true},
                                             {360.0, false},
                                             {359.9, true}}) {
        geometry.rotation = degrees;
        EXPECT_EQ(MotionPlacement(geometry).IsRotated(), isRotated) << degrees;
    }
}

TEST(MotionPlacement, ReachEndsWithTheDestination) {
    MotionGeometry geometry = Middle();
    geometry.scale = {10, 10};
    ExpectRect({0, 0, 100, 60}, MotionPlacement(geometry).Reach(kWhole, 0, 0));
    geometry.scale = {1, 1};
    geometry.position = {-1, 0.5f};
    ExpectRect({}, MotionPlacement(geometry).Reach(kWhole, 0, 0));
    geometry.position = {0.995f, 0.5f};
    ExpectRect({79, 20, 100, 40}, MotionPlacement(geometry).Reach(kWhole, 0, 0));
}

TEST(MotionPlacement, NumbersThatAreNoneReachNothing) {
    for (const float odd : {kNaN, kInfinity, -kInfinity, 3e38f, -3e38f})
        for (const int which : {0, 1, 2, 3}) {
            MotionGeometry geometry = Middle();
            if (which == 0) geometry.position.x = odd;
            if (which == 1) geometry.anchor.y = odd;
            if (which == 2) geometry.rotation = static_cast<double>(odd);
            if (which == 3) geometry.scale.y = std::abs(odd);
            const PK_Rect reach = MotionPlacement(geometry).Reach(kWhole, 0, 0);
            EXPECT_GE(reach.left, 0);
            EXPECT_GE(reach.top, 0);
            EXPECT_LE(reach.right, 100);
            EXPECT_LE(reach.bottom, 60);
        }
    MotionGeometry geometry = Middle();
    geometry.aspectDen = 0;
    geometry.rotation = 10;
    ExpectRect({}, MotionPlacement(geometry).Reach(kWhole, 0, 0));
}

TEST(MotionBlur, GoesByTheScaleFromQuality3) {
    MotionGeometry geometry = Middle();
    geometry.scale = {0.5f, 2};
    const MotionPlacement placement(geometry);
    EXPECT_FALSE(ChooseMotionBlur(placement, 0, 0, 0, 2).IsAny());
    const MotionBlur blur = ChooseMotionBlur(placement, 0, 0, 0, 3);
    EXPECT_EQ(blur.x, 0.5);
    EXPECT_EQ(blur.y, 0);
    EXPECT_FALSE(ChooseMotionBlur(MotionPlacement(Middle()), 0, 0, 0, 4).IsAny()) << "0.25 is none";
}

TEST(MotionBlur, GoesAcrossTheRowsOfFields) {
    const MotionPlacement placement(Middle());
    EXPECT_FALSE(ChooseMotionBlur(placement, 0, 0, 1, 4).IsAny());
    const MotionBlur blur = ChooseMotionBlur(placement, 0.5, 0, 2, 4);
    EXPECT_EQ(blur.x, 0.375);
    EXPECT_EQ(blur.y, 0.5625);
    EXPECT_EQ(ChooseMotionBlur(placement, 0.5, 1, 2, 4).y, 0.375) << "fields to fields";
}

// o for the passes 0, 1 and 2, and whether the line is the same.
TEST(MotionFields, FollowTheOrderOfBothImages) {
    struct Row {
        int32_t source, destination, offsets[3];
        bool sameLines[3];
    };
    constexpr Row kTable[] = {
        {1, 0, {0, 0, 0}, {true, true, true}},  {2, 0, {1, 1, 1}, {false, false, false}},
        {1, 1, {1, 0, 1}, {true, true, false}}, {1, 2, {0, 1, 0}, {true, false, true}},
        {2, 1, {0, 1, 0}, {true, false, true}}, {2, 2, {1, 0, 1}, {true, true, false}},
    };
    for (const Row& row : kTable)
        for (int32_t pass = 0; pass < 3; ++pass) {
            const FieldOfSource field = ChooseFieldOfSource(row.source, row.destination, pass);
            EXPECT_EQ(field.firstRow, row.offsets[pass]) << row.source << row.destination << pass;
            EXPECT_EQ(field.isSameLine, row.sameLines[pass]) << row.source << row.destination << pass;
            EXPECT_EQ(field.RowFrom(6), 6 + row.offsets[pass]);
            EXPECT_EQ(field.RowFrom(7), 8 - row.offsets[pass]);
        }
}

} // namespace
