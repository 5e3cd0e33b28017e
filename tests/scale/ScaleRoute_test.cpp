// Which way a scale-and-convert call takes: examples in the caller's words, and all kinds of calls by a restatement of the
// rules.

#include "convert/RasterFormats.h"
#include "frame/DebugSwitches.h"
#include "reference/ReferenceScaleRoute.h"
#include "scale/HalfSize.h"
#include "scale/MotionPlan.h"
#include "support/Walk.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

using namespace PK;
using PKReference::ScaleNumbers;
using PKReference::ScaleTelling;

constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u,
                         kLinear = PK_PixelFormat_BGRP_4444_32f_Linear,
                         kPlanes = PK_PixelFormat_YUV_420_MPEG2_FRAME, kDV = PK_PixelFormat_NTSCDV50;

TEST(ScaleRoute, EqualSizesAreConverted) {
    for (const auto& [from, to] : {std::pair{0, 0}, {0, 1}, {0, 2}, {1, 1}, {2, 2}, {3, 0}})
        for (const int32_t quality : {0, 2, 3, 5})
            EXPECT_EQ(ChooseScaleRoute({{kUYVY, 64, 48, from}, {kBGRA, 64, 48, to}, 0, quality}),
                      ScaleRoute::Conversion)
                << from << to;
    for (const auto& [from, to] : {std::pair{1, 0}, {2, 0}, {1, 2}, {2, 1}, {1, 3}})
        EXPECT_EQ(ChooseScaleRoute({{kUYVY, 64, 48, from}, {kBGRA, 64, 48, to}, 0, 2}), ScaleRoute::Motion)
            << from << to;
    EXPECT_EQ(ChooseScaleRoute({{kUYVY, 64, 48, 0}, {kBGRA, 64, 48, 1}, 1, 2}), ScaleRoute::Motion)
        << "a field that is rendered alone";
    EXPECT_EQ(ChooseScaleRoute({{kDV, 64, 48, 0}, {kBGRA, 64, 48, 0}, 0, 2}), ScaleRoute::Conversion);
}

TEST(ScaleRoute, HalfSizesDropRowsBelowQualityThree) {
    const auto route = [](PK_PixelFormat from, PK_PixelFormat to, int32_t quality, int32_t toField = 0,
                          int32_t renderField = 0) {
        return ChooseScaleRoute({{from, 720, 486, 1}, {to, 360, 243, toField}, renderField, quality});
    };
    for (const int32_t quality : {-1, 0, 1, 2}) EXPECT_EQ(route(kUYVY, kBGRA, quality), ScaleRoute::HalfSize);
    for (const int32_t quality : {3, 4, 5}) EXPECT_EQ(route(kUYVY, kBGRA, quality), ScaleRoute::Motion);
    EXPECT_EQ(route(PK_PixelFormat_V210_422_10u, kBGRA, 2), ScaleRoute::HalfSize);
    EXPECT_EQ(route(kBGRA, kBGRA, 2), ScaleRoute::OneField);
    EXPECT_EQ(route(kUYVY, kUYVY, 2), ScaleRoute::OneField);
    EXPECT_EQ(route(kUYVY, PK_PixelFormat_RGB_444_10u, 2), ScaleRoute::OneField);
    EXPECT_EQ(route(kUYVY, kBGRA, 2, 1), ScaleRoute::Motion);
    EXPECT_EQ(route(kUYVY, kBGRA, 2, 3), ScaleRoute::OneField) << "no field, but not 0 either";
    EXPECT_EQ(route(kUYVY, kBGRA, 2, 0, 1), ScaleRoute::Motion);
    EXPECT_EQ(ChooseScaleRoute({{kUYVY, 722, 486, 0}, {kBGRA, 360, 243, 0}, 0, 2}), ScaleRoute::Motion);
}

TEST(ScaleRoute, AnOddHeightHasNoFieldOfItsOwn) {
    EXPECT_EQ(ChooseScaleRoute({{kBGRA, 64, 49, 1}, {kBGRA, 64, 24, 0}, 0, 2}), ScaleRoute::Motion);
    const ScaleCall even = {{kBGRA, 64, 48, 1}, {kBGRA, 64, 24, 0}, 0, 2};
    EXPECT_EQ(ChooseScaleRoute(even), ScaleRoute::OneField);
    const ScaleCall rest = AfterOneField(even);
    EXPECT_EQ(rest.source.height, 24);
    EXPECT_EQ(rest.source.field, 0);
    EXPECT_EQ(ChooseScaleRoute(rest), ScaleRoute::Conversion);
    EXPECT_EQ(ChooseScaleRoute({{kBGRA, 64, 48, 1}, {kBGRA, 64, 25, 0}, 0, 2}), ScaleRoute::Motion)
        << "more than half of the rows";
}

TEST(ScaleRoute, MotionTakesAFieldAtAnyQuality) {
    for (const int32_t quality : {3, 4, 5}) {
        const ScaleCall call = {{kBGRA, 64, 48, 2}, {kBGRA, 64, 24, 0}, 0, quality};
        ASSERT_EQ(ChooseScaleRoute(call), ScaleRoute::Motion);
        const MotionPlan plan = PlanMotion(call);
        EXPECT_TRUE(plan.takesField);
        EXPECT_EQ(plan.scale.x, 1);
        EXPECT_EQ(plan.scale.y, 1);
        EXPECT_EQ(plan.format, quality == 5 ? kLinear : kBGRA);
    }
    const MotionPlan interlaced = PlanMotion({{kBGRA, 64, 48, 2}, {kBGRA, 64, 24, 1}, 0, 4});
    EXPECT_FALSE(interlaced.takesField);
    EXPECT_EQ(interlaced.scale.y, 0.5f);
}

TEST(ScaleRoute, WhatMotionDoesNotTakeIsConvertedBefore) {
    const auto format = [](PK_PixelFormat from, PK_PixelFormat to, int32_t quality, bool scales = true) {
        const MotionPlan plan =
            PlanMotion({{from, 64, 48, scales ? 0 : 1}, {to, scales ? 50 : 64, 48, 0}, 0, quality});
        EXPECT_EQ(plan.convertsSource, plan.format != from);
        EXPECT_EQ(plan.rendersToBuffer, IsStream(to));
        return plan.format;
    };
    EXPECT_EQ(format(kBGRA, kUYVY, 2), kBGRA);
    EXPECT_EQ(format(PK_PixelFormat_ARGB_4444_15u, kUYVY, 4), PK_PixelFormat_ARGB_4444_15u);
    EXPECT_EQ(format(kUYVY, kBGRA, 4), kBGRA) << "the destination's, if motion takes it";
    EXPECT_EQ(format(kUYVY, kUYVY, 2), PK_PixelFormat_VUYX_4444_8u);
    EXPECT_EQ(format(kUYVY, kUYVY, 3), PK_PixelFormat_VUYX_4444_32f);
    EXPECT_EQ(format(PK_PixelFormat_YUYV_422_8u_709, kUYVY, 3), PK_PixelFormat_VUYX_4444_32f_709);
    EXPECT_EQ(format(PK_PixelFormat_V210_422_10u_709, kUYVY, 1), PK_PixelFormat_VUYX_4444_8u_709);
    EXPECT_EQ(format(PK_PixelFormat_RGB_444_10u, kUYVY, 1), PK_PixelFormat_BGRX_4444_8u);
    EXPECT_EQ(format(PK_PixelFormat_RGB_444_10u, kPlanes, 4), PK_PixelFormat_BGRX_4444_32f);
    EXPECT_EQ(format(kBGRA, kBGRA, 5), kLinear) << "light is scaled";
    EXPECT_EQ(format(kUYVY, kPlanes, 5), kLinear);
    EXPECT_EQ(format(kLinear, kBGRA, 5), kLinear);
    EXPECT_EQ(format(kBGRA, kUYVY, 5, false), kBGRA) << "nothing is scaled";
    EXPECT_EQ(format(kUYVY, kUYVY, 5, false), PK_PixelFormat_VUYX_4444_32f);
}

TEST(ScaleRoute, FieldsOfPlanesAreCopied) {
    const auto route = [](int32_t height, int32_t half, int32_t from, int32_t to, int32_t quality) {
        return ChooseScaleRoute({{kPlanes, 64, height, from}, {kPlanes, 64, half, to}, 0, quality});
    };
    EXPECT_EQ(route(48, 24, 1, 1, 2), ScaleRoute::FieldOfPlanes);
    EXPECT_EQ(route(48, 24, 0, 0, 0), ScaleRoute::FieldOfPlanes);
    EXPECT_EQ(route(49, 24, 2, 2, 2), ScaleRoute::FieldOfPlanes);
    EXPECT_NE(route(48, 24, 1, 0, 2), ScaleRoute::FieldOfPlanes);
    EXPECT_NE(route(48, 24, 1, 1, 3), ScaleRoute::FieldOfPlanes);
    EXPECT_NE(route(48, 25, 1, 1, 2), ScaleRoute::FieldOfPlanes);
    EXPECT_NE(route(48, 24, 1, 0, 2), ScaleRoute::OneField) << "a stream has no rows to leave out";
}

TEST(ScaleRoute, DVIsDecodedToWhatSuits) {
    const auto route = [](int32_t height, PK_PixelFormat to, int32_t from, int32_t field, int32_t rendered) {
        return ChooseScaleRoute({{kDV, 720, 480, from}, {to, 720, height, field}, rendered, 2});
    };
    constexpr PK_PixelFormat kYUYV = PK_PixelFormat_YUYV_422_8u; // that of the decoder
    EXPECT_EQ(route(240, kYUYV, 1, 0, 0), ScaleRoute::StraightDecoding) << "one field";
    EXPECT_EQ(route(240, kYUYV, 0, 0, 0), ScaleRoute::StraightDecoding);
    EXPECT_EQ(route(240, kYUYV, 2, 1, 0), ScaleRoute::Decoding);
    EXPECT_EQ(route(240, kYUYV, 1, 0, 1), ScaleRoute::Decoding);
    EXPECT_EQ(route(240, kBGRA, 1, 0, 0), ScaleRoute::Decoding);
    EXPECT_EQ(route(480, kYUYV, 1, 0, 0), ScaleRoute::Decoding) << "both fields, of which one is wanted";

    const ScaleCall call = {{kDV, 720, 480, 1}, {kBGRA, 720, 240, 0}, 0, 2};
    const DecodeTarget target = DecodeTargetOf(call);
    EXPECT_EQ(target.height, 240);
    EXPECT_EQ(AfterDecoding(call, target).source.field, 0);
    EXPECT_EQ(AfterDecoding(call, {kYUYV, 720, 480}).source.field, 1);
}

/// What this library makes of a call, in the words of the restatement.
ScaleTelling Tell(const ScaleNumbers& numbers) {
    const ScaleCall call = {{numbers.srcFormat, numbers.srcWidth, numbers.srcHeight, numbers.srcField},
                            {numbers.dstFormat, numbers.dstWidth, numbers.dstHeight, numbers.dstField},
                            numbers.fieldToRender,
                            numbers.quality};
    const ScaleRoute route = ChooseScaleRoute(call);
    const auto next = [&](const ScaleCall& rest) {
        ScaleNumbers following = numbers;
        following.srcFormat = rest.source.format;
        following.srcWidth = rest.source.width;
        following.srcHeight = rest.source.height;
        following.srcField = rest.source.field;
        return following;
    };
    ScaleTelling told;
    told.route = NameOf(route);
    if (route == ScaleRoute::HalfSize) {
        const Halving halving = HalvingOf(numbers.srcFormat);
        told.rowFunction = halving.kernelName;
        told.rowFormat = halving.format;
        told.firstRow = numbers.srcHeight - (numbers.srcField == 1 ? 2 : 1); // held to images elsewhere
        told.secondRow = told.firstRow - 2;
    } else if (route == ScaleRoute::OneField) {
        told.rowsSkipped = FieldBeginsAtSecondRow(numbers.srcFormat, numbers.srcField) ? 1 : 0;
        told.next = next(AfterOneField(call));
    } else if (route == ScaleRoute::Decoding) {
        told.next = next(AfterDecoding(call, DecodeTargetOf(call)));
    } else if (route == ScaleRoute::Motion) {
        const MotionPlan plan = PlanMotion(call);
        if (plan.convertsSource) told.sourceBuffer = plan.format;
        if (plan.rendersToBuffer) told.destinationBuffer = plan.format;
        told.takesField = plan.takesField;
        told.rowsSkipped = plan.takesField && numbers.srcField == 1 ? 1 : 0;
        told.scaleX = plan.scale.x;
        told.scaleY = plan.scale.y;
    }
    return told;
}

std::vector<PK_PixelFormat> AllFormats() {
    std::vector<PK_PixelFormat> formats(std::begin(kRasterFormats), std::end(kRasterFormats));
    for (uint32_t kind = 1; kind <= kStreamLast420; ++kind)
        for (const uint32_t bits : {0x821u, 0xa21u, 0x831u, 0x31u, 0xa31u, 0x231u})
            if ((bits & kStructureMask) == (kind <= kStreamLastDV ? kStructureDV : kStructure420))
                formats.push_back(kind << kStreamShift | bits);
    return formats;
}

struct Sizes {
    int32_t srcWidth, srcHeight, dstWidth, dstHeight;
};

TEST(ScaleRoute, FollowsTheRulesForAllFormatsSizesFieldsAndQualities) {
    constexpr Sizes kSizes[] = {{720, 480, 720, 480}, {720, 480, 360, 240},    {720, 480, 720, 240},
                                {720, 481, 720, 240}, {720, 480, 360, 200},    {720, 480, 360, 241},
                                {722, 480, 360, 240}, {1440, 1080, 1920, 540}, {2, 2, 1, 1},
                                {1, 1, 3, 3},         {720, 576, 180, 72},     {360, 240, 720, 480}};
    const std::vector<PK_PixelFormat> formats = AllFormats();
    int64_t calls = 0;
    PKTest::Walk walk;
    for (size_t pair = 0; pair < formats.size() * formats.size(); ++pair) {
        if (walk.LeavesOut()) continue;
        for (const Sizes& size : kSizes)
            for (int32_t fields = 0; fields < 4 * 4 * 3; ++fields)
                for (const int32_t quality : {0, 2, 3, 5}) {
                    const ScaleNumbers numbers = {
                        size.srcWidth, size.srcHeight, formats[pair / formats.size()], fields % 4,
                        size.dstWidth, size.dstHeight, formats[pair % formats.size()], fields / 4 % 4,
                        quality,       fields / 16};
                    DecodeTarget target = {numbers.dstFormat, size.dstWidth, size.dstHeight};
                    ChooseDecodeTarget({numbers.srcFormat, size.srcWidth, size.srcHeight}, target, quality,
                                       target);
                    const ScaleTelling expected =
                        PKReference::TellScale(numbers, {target.format, target.width, target.height}, false);
                    const ScaleTelling actual = Tell(numbers);
                    ++calls;
                    if (actual == expected) continue;
                    FAIL() << std::hex << numbers.srcFormat << " to " << numbers.dstFormat << std::dec << ", "
                           << size.srcWidth << " x " << size.srcHeight << " field " << numbers.srcField
                           << " to " << size.dstWidth << " x " << size.dstHeight << " field "
                           << numbers.dstField << ", rendered " << numbers.fieldToRender << ", quality "
                           << quality << ":\n expected " << expected.Text() << "\n actual   "
                           << actual.Text();
                }
    }
    EXPECT_GT(calls, 1000);
}

} // namespace
