#include "convert/RasterFormats.h"
#include "geometry/MotionPlacement.h"
#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/PlaceCall.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Motion.h>

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kBGRP = PK_PixelFormat_BGRP_4444_8u,
                         kBGRX = PK_PixelFormat_BGRX_4444_8u, kFloats = PK_PixelFormat_BGRP_4444_32f,
                         kLinear = PK_PixelFormat_BGRP_4444_32f_Linear;

/// The same bytes in every row.
bool AreEqual(const AlignedPicture& a, const AlignedPicture& b) {
    return a.DifferenceFrom(b).empty();
}

AlignedPicture RandomPicture(PK_PixelFormat format, int32_t width, int32_t height, Random& random) {
    AlignedPicture picture(format, width, height);
    picture.FillOrdinary(random);
    return picture;
}

/// Of premultiplied floats, none of them clear: those show no colour.
AlignedPicture VisiblePicture(int32_t width, int32_t height, Random& random) {
    AlignedPicture picture = RandomPicture(kFloats, width, height, random);
    for (int32_t row = 0; row < height; ++row)
        for (int32_t x = 0; x < width; ++x) {
            const float alpha = 0.25f + static_cast<float>(random.Below(768)) / 1024;
            std::memcpy(picture.Row(row) + 16 * x + 12, &alpha, sizeof alpha);
        }
    return picture;
}

TEST(MotionCall, APictureOnItselfIsConverted) {
    Random random(1);
    for (const PK_PixelFormat to : {kBGRA, kBGRX, kFloats, PK_PixelFormat_UYVY_422_8u})
        for (const int32_t quality : {1, 4, 5}) {
            const AlignedPicture source = RandomPicture(kBGRA, 33, 21, random);
            AlignedPicture expected(to, 33, 21), actual(to, 33, 21);
            PlaceCall call;
            call.quality = quality;
            ASSERT_EQ(call(source, actual), PK_Success);
            ASSERT_EQ(PK_Convert(source.Pixels(), source.RowBytes(), kBGRA, expected.Pixels(),
                                 expected.RowBytes(), to, 33, 21, std::min(quality, 4)),
                      PK_Success);
            EXPECT_EQ(actual.DifferenceFrom(expected), "");
        }
}

TEST(MotionCall, AMoveByWholePixelsCopiesThem) {
    Random random(2);
    const AlignedPicture source = RandomPicture(kBGRA, 40, 30, random);
    AlignedPicture destination = RandomPicture(kBGRA, 40, 30, random);
    const AlignedPicture before = destination;
    PlaceCall call;
    call.position = {0.5f + 7.0f / 40, 0.5f - 3.0f / 30}; // right and down
    ASSERT_EQ(call(source, destination), PK_Success);
    for (int32_t row = 0; row < 30; ++row) {
        const size_t kept = row < 3 ? 160 : 28;
        EXPECT_EQ(std::memcmp(destination.RowFromTop(row), before.RowFromTop(row), kept), 0) << row;
        if (row >= 3) {
            EXPECT_EQ(std::memcmp(destination.RowFromTop(row) + 28, source.RowFromTop(row - 3), 160 - 28), 0)
                << row;
        }
    }
}

TEST(MotionCall, NothingIsDrawnOfWhatIsNotThere) {
    Random random(3);
    const AlignedPicture source = RandomPicture(kBGRA, 8, 8, random);
    AlignedPicture destination = RandomPicture(kBGRA, 8, 8, random);
    const AlignedPicture before = destination;
    for (int which = 0; which < 5; ++which) {
        PlaceCall call;
        call.quality = which == 4 ? 99 : 2;
        if (which == 0 || which == 4) call.opacity = 7e-6f;
        if (which == 1) call.scale.x = 0;
        if (which == 2) call.scale.y = -1;
        if (which == 3) call.position = {5, 5};
        EXPECT_EQ(call(source, destination), PK_Success) << which;
        EXPECT_TRUE(AreEqual(destination, before)) << which;
    }
}

TEST(MotionCall, ChecksItsArgumentsInOrder) {
    Random random(4);
    const AlignedPicture source = RandomPicture(kBGRA, 8, 6, random);
    AlignedPicture destination(kBGRA, 8, 6);
    for (const PK_Rect& bad :
         {PK_Rect{0, 0, 9, 6}, {0, 0, 8, 7}, {-1, 0, 8, 6}, {0, -1, 8, 6}, {4, 0, 4, 6}, {0, 5, 8, 5}}) {
        PlaceCall call;
        call.crop = bad;
        EXPECT_EQ(call(source, destination), PK_ErrBadRect);
    }
    PlaceCall call;
    call.crop = PK_Rect{0, 0, 8, 6};
    EXPECT_EQ(call(source, destination), PK_Success);
    call.softness = -0.01;
    EXPECT_EQ(call(source, destination), PK_ErrBadMotionParameter);
    call.softness = 1.01;
    EXPECT_EQ(call(source, destination), PK_ErrBadMotionParameter);
    call.opacity = 0;
    EXPECT_EQ(call(source, destination), PK_ErrBadMotionParameter) << "before the opacity is looked at";

    const AlignedPicture pairs(PK_PixelFormat_UYVY_422_8u, 8, 6), three(PK_PixelFormat_RGB_444_10u, 8, 6);
    EXPECT_EQ(PlaceCall()(pairs, destination), PK_ErrBadSrcFormat);
    EXPECT_EQ(PlaceCall()(three, destination), PK_ErrBadSrcFormat);
    PlaceCall highest;
    highest.quality = 5;
    EXPECT_EQ(highest(source, destination), PK_Success) << "unscaled";
    highest.scale = {1, 1.0001f};
    EXPECT_EQ(highest(source, destination), PK_ErrBadSrcFormat);
    EXPECT_EQ(PK_Motion(source.Pixels(), 0, 8, 6, kBGRA, 0, nullptr, destination.Pixels(), 0, 8, 6,
                        PK_PixelFormat_NTSCDV25, 0, 1, 1, {}, {}, {1, 1}, 0, 1, false, 0, false, 0, 2, false),
              PK_ErrBadDstFormat);
    EXPECT_EQ(PK_Motion(nullptr, 32, 8, 6, kBGRA, 0, nullptr, destination.Pixels(), 32, 8, 6, kBGRA, 0, 1, 1,
                        {}, {}, {1, 1}, 0, 1, false, 0, false, 0, 2, false),
              PK_ErrFailed);
}

TEST(MotionCall, HalfATurnMirrorsBothWays) {
    Random random(5);
    const AlignedPicture source = VisiblePicture(16, 12, random);
    AlignedPicture destination(kFloats, 16, 12);
    PlaceCall call;
    call.rotation = 180;
    ASSERT_EQ(call(source, destination), PK_Success);
    for (int32_t row = 0; row < 12; ++row)
        for (int32_t x = 0; x < 16; ++x)
            for (int channel = 0; channel < 4; ++channel) {
                float expected, actual;
                std::memcpy(&expected, source.RowFromTop(11 - row) + 16 * (15 - x) + 4 * channel, 4);
                std::memcpy(&actual, destination.RowFromTop(row) + 16 * x + 4 * channel, 4);
                ASSERT_NEAR(actual, expected, 1e-4) << row << ' ' << x;
            }
}

TEST(MotionCall, AFieldWritesItsRowsAlone) {
    Random random(6);
    const AlignedPicture source = RandomPicture(kBGRA, 24, 20, random);
    for (const int32_t field : {1, 2}) {
        AlignedPicture destination = RandomPicture(kBGRA, 24, 20, random);
        const AlignedPicture before = destination;
        PlaceCall call;
        call.destinationField = 1;
        call.renderField = field;
        call.scale = {1.3f, 1.2f};
        ASSERT_EQ(call(source, destination), PK_Success);
        for (int32_t row = 0; row < 20; ++row)
            EXPECT_EQ(std::memcmp(destination.RowFromTop(row), before.RowFromTop(row), 96) != 0,
                      row % 2 == (field == 1 ? 0 : 1))
                << field << ' ' << row;
    }
}

// Bilinear sampling from the definitions, in double precision, of premultiplied floats.
class Reference {
public:
    Reference(const AlignedPicture& source, const PlaceCall& call, int32_t width, int32_t height)
        : fSource(source), fCall(call), fWidth(width), fHeight(height) {}

    /// The pixel of the destination, and whether the source reaches it.
    bool At(int32_t column, int32_t row, double (&pixel)[4]) const {
        const double angle = fCall.rotation * M_PI / 180, c = std::cos(angle), s = std::sin(angle);
        const double x = column + 0.5 - fWidth * double{fCall.position.x};
        const double y = row + 0.5 - fHeight * (1 - double{fCall.position.y});
        const double u = (c * x + s * y) / fCall.scale.x + fSource.width * double{fCall.anchor.x} - 0.5;
        const double v =
            (c * y - s * x) / fCall.scale.y + fSource.height * (1 - double{fCall.anchor.y}) - 0.5;
        std::fill_n(pixel, 4, 0.0);
        const double i = std::floor(u), j = std::floor(v), fx = u - i, fy = v - j;
        for (int corner = 0; corner < 4; ++corner) {
            const double w = (corner % 2 ? fx : 1 - fx) * (corner / 2 ? fy : 1 - fy);
            Add(static_cast<int32_t>(i) + corner % 2, static_cast<int32_t>(j) + corner / 2, w, pixel);
        }
        return i >= -1 && j >= -1 && i < fSource.width && j < fSource.height;
    }

private:
    void Add(int32_t column, int32_t row, double weight, double (&pixel)[4]) const {
        if (column < 0 || row < 0 || column >= fSource.width || row >= fSource.height) return;
        float sample[4];
        std::memcpy(sample, fSource.RowFromTop(row) + 16 * column, 16);
        for (int channel = 0; channel < 4; ++channel) pixel[channel] += weight * double{sample[channel]};
    }

    const AlignedPicture& fSource;
    const PlaceCall& fCall;
    int32_t fWidth, fHeight;
};

TEST(MotionCall, SamplesBetweenFourPixels) {
    Random random(7);
    for (int round = 0; round < 40; ++round) {
        const AlignedPicture source = VisiblePicture(static_cast<int32_t>(1 + random.Below(40)),
                                                     static_cast<int32_t>(1 + random.Below(40)), random);
        const auto width = static_cast<int32_t>(1 + random.Below(60)),
                   height = static_cast<int32_t>(1 + random.Below(60));
        AlignedPicture destination(kFloats, width, height);
        const auto fraction = [&] { return static_cast<float>(random.Below(1000)) / 1000; };
        PlaceCall call;
        call.smoothEdges = true;
        call.position = {fraction(), fraction()};
        call.anchor = {fraction(), fraction()};
        call.scale = {0.4f + 2 * fraction(), 0.4f + 2 * fraction()};
        call.rotation = 360 * static_cast<double>(fraction());
        ASSERT_EQ(call(source, destination), PK_Success);
        const Reference reference(source, call, width, height);
        const PK::MotionPlacement placement({source.width,
                                             source.height,
                                             width,
                                             height,
                                             1,
                                             1,
                                             {call.position.x, 1 - call.position.y},
                                             {call.anchor.x, 1 - call.anchor.y},
                                             call.scale,
                                             call.rotation});
        const PK_Rect box =
            placement.Reach({0, 0, source.width, source.height}, 0, 0); // beside it nothing is drawn
        for (int32_t row = box.top; row < box.bottom; ++row)
            for (int32_t column = box.left; column < box.right; ++column) {
                double expected[4];
                float actual[4];
                reference.At(column, row, expected);
                std::memcpy(actual, destination.RowFromTop(row) + 16 * column, 16);
                for (int channel = 0; channel < 4; ++channel)
                    ASSERT_NEAR(actual[channel], expected[channel], 2e-3)
                        << "seed " << random.Seed() << ", round " << round << ", column " << column
                        << ", row " << row;
            }
    }
}

TEST(MotionCall, OddNumbersReturnAtOnceAndWriteNothingBeside) {
    Random random(8);
    const AlignedPicture source = RandomPicture(kBGRP, 20, 20, random);
    constexpr float kOdd[] = {std::numeric_limits<float>::quiet_NaN(),
                              std::numeric_limits<float>::infinity(),
                              1e30f,
                              -1e30f,
                              1e-5f,
                              1e9f};
    for (const float odd : kOdd)
        for (int which = 0; which < 6; ++which)
            for (const int32_t quality : {2, 4}) {
                AlignedPicture destination(kBGRP, 20, 20);
                PlaceCall call;
                call.quality = quality;
                if (which == 0) call.position.x = odd;
                if (which == 1) call.anchor.y = odd;
                if (which == 2) call.scale.x = odd;
                if (which == 3) call.scale.y = odd;
                if (which == 4) call.rotation = static_cast<double>(odd);
                if (which == 5) call.position = call.anchor = {odd, odd};
                const PK_Result result = call(source, destination);
                EXPECT_TRUE(result == PK_Success || result == PK_ErrOutOfMemory) << result;
            }
}

TEST(MotionCall, LeavesTheFloatingPointModeOfTheCaller) {
    Random random(9);
    const AlignedPicture source = RandomPicture(kLinear, 40, 40, random);
    AlignedPicture destination(kBGRA, 50, 50);
    for (const int32_t quality : {2, 4, 5}) {
        const FloatEnvironment environment(kRoundDown | kExceptionFlags);
        PlaceCall call;
        call.quality = quality;
        call.scale = {0.7f, 1.4f};
        call.rotation = 12;
        EXPECT_EQ(call(source, destination), PK_Success);
        EXPECT_TRUE(environment.IsAsGiven());
    }
}

} // namespace
