// Every route of scale-and-convert held to the calls that it is made of, over random sizes, formats, fields and qualities.

#include "convert/RasterFormats.h"
#include "frame/DebugSwitches.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"
#include "support/PaddedPicture.h"
#include "support/ScaleByHand.h"

#include <gtest/gtest.h>

#include <map>
#include <string>

namespace {

using namespace PKTest;
using PKReference::ScaleNumbers;

constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kBGRA = PK_PixelFormat_BGRA_4444_8u;

/// A call of random sizes and settings, among which those that lead to the shorter routes are frequent.
ScaleNumbers DrawCall(Random& random) {
    const auto format = [&] {
        return PK::kRasterFormats[random.Below(static_cast<uint32_t>(std::size(PK::kRasterFormats)))];
    };
    const auto size = [&] { return static_cast<int32_t>(random.Below(random.Below(8) == 0 ? 80 : 23)) + 1; };
    const auto field = [&] { return static_cast<int32_t>(random.Below(4)); };
    ScaleNumbers call = {};
    call.srcFormat = format();
    call.dstFormat = random.Below(6) == 0 ? call.srcFormat : format();
    call.dstWidth = size();
    call.dstHeight = size();
    call.srcWidth = size();
    call.srcHeight = size();
    if (const uint32_t kind = random.Below(8); kind < 5) {
        call.srcWidth = kind == 1 || kind == 2 ? 2 * call.dstWidth : call.dstWidth;
        call.srcHeight = kind == 0 ? call.dstHeight : 2 * call.dstHeight + (kind == 4 ? 2 : 0);
    }
    call.srcField = field();
    call.dstField = random.Below(2) == 0 ? 0 : field();
    call.quality = static_cast<int32_t>(random.Below(6));
    call.fieldToRender = random.Below(4) == 0 ? static_cast<int32_t>(random.Below(3)) : 0;
    if (random.Below(8) == 0) {
        const auto isPairs = [&] { return (call.srcFormat & PK::kStructureMask) == PK::kStructure422; };
        while (!isPairs()) call.srcFormat = format();
        call.srcWidth = 2 * call.dstWidth;
        call.srcHeight = 2 * call.dstHeight;
        call.dstField = call.fieldToRender = 0;
        call.quality = static_cast<int32_t>(random.Below(3));
    }
    return call;
}

/// Motion has no field of a single row to blur.
PK_Result ResultOfDrawn(const ScaleNumbers& call, PK_Result result) {
    const bool lacksField = call.srcHeight == 1 && call.srcField != 0 && call.quality >= 3;
    return lacksField && result == PK_ErrOutOfMemory ? PK_ErrOutOfMemory : PK_Success;
}

TEST(ScaleConvert, IsMadeOfWhatTheRulesTell) {
    Random random(3);
    std::map<std::string, int> routes;
    for (int i = 0; i < 6000; ++i) {
        const ScaleNumbers call = DrawCall(random);
        const std::string told = PKReference::TellScale(call, {}, false).Text();
        ++routes[told.substr(0, told.find(','))];
        SCOPED_TRACE(testing::Message()
                     << "seed " << random.Seed() << ", call " << i << ", " << call.srcWidth << " x "
                     << call.srcHeight << ' ' << std::hex << call.srcFormat << " field " << call.srcField
                     << " to " << std::dec << call.dstWidth << " x " << call.dstHeight << ' ' << std::hex
                     << call.dstFormat << " field " << call.dstField << ", rendered " << call.fieldToRender
                     << ", quality " << call.quality << ": " << told);
        const PaddedPicture source(call.srcFormat, call.srcWidth, call.srcHeight, random);
        PaddedPicture actual(call.dstFormat, call.dstWidth, call.dstHeight, random), expected = actual;
        const auto memory = [&](PaddedPicture& to) {
            return ScaleMemory{source.Row(0), source.RowBytes(), to.Row(0), to.RowBytes()};
        };
        const PK_Result result = ScaleByHand(call, memory(expected));
        ASSERT_EQ(CallScale(call, memory(actual)), result);
        ASSERT_EQ(result, ResultOfDrawn(call, result));
        ASSERT_TRUE(actual.HasMemoryOf(expected));
    }
    for (const char* const route : {"conversion", "half size", "one field", "motion"})
        EXPECT_GT(routes[route], 100) << route;
}

TEST(ScaleConvert, HoldsToTheRulesWhateverTheOrigin) {
    const FlagScope flags;
    PK::sAllOriginsTopLeft = 1;
    Random random(4);
    for (int i = 0; i < 400; ++i) {
        const ScaleNumbers call = DrawCall(random);
        const PaddedPicture source(call.srcFormat, call.srcWidth, call.srcHeight, random);
        PaddedPicture actual(call.dstFormat, call.dstWidth, call.dstHeight, random), expected = actual;
        ASSERT_EQ(ScaleByHand(call, {source.Row(0), source.RowBytes(), expected.Row(0), expected.RowBytes()}),
                  CallScale(call, {source.Row(0), source.RowBytes(), actual.Row(0), actual.RowBytes()}));
        ASSERT_TRUE(actual.HasMemoryOf(expected)) << i << ", seed " << random.Seed();
    }
}

/// Rows of either direction that end, or begin, at a page that nobody may touch.
TEST(ScaleConvert, TouchesRowsOnly) {
    Random random(5);
    for (int i = 0; i < 3000; ++i) {
        const ScaleNumbers call = DrawCall(random);
        const auto image = [&](uint32_t format, int32_t width, int32_t height) {
            return GuardedImage({static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)), height,
                                 16 * random.Below(2), random.Below(2) != 0,
                                 random.Below(2) != 0 ? Guard::kAfter : Guard::kBefore},
                                random);
        };
        const GuardedImage source = image(call.srcFormat, call.srcWidth, call.srcHeight);
        const auto before = source.Rows();
        const GuardedImage destination = image(call.dstFormat, call.dstWidth, call.dstHeight);
        const PK_Result result = CallScale(
            call, {source.Pixels(), source.RowBytes(), destination.Pixels(), destination.RowBytes()});
        ASSERT_EQ(result, ResultOfDrawn(call, result));
        ASSERT_NO_FATAL_FAILURE(source.ExpectRows(before));
        ASSERT_NO_FATAL_FAILURE(destination.ExpectRows(destination.Rows())) << "padding";
    }
}

/// Wider than rows on the stack go.
TEST(ScaleConvert, HalvesWideRows) {
    constexpr int32_t kWide = 40000;
    Random random(6);
    for (const PK_PixelFormat from : {kUYVY, PK_PixelFormat_UYVY_422_32f}) {
        const ScaleNumbers call = {2 * kWide, 4, from, 1, kWide, 2, kBGRA, 0, 2, 0};
        const PaddedPicture source(from, call.srcWidth, call.srcHeight, random);
        PaddedPicture actual(kBGRA, kWide, 2, random), expected = actual;
        ASSERT_EQ(CallScale(call, {source.Row(0), source.RowBytes(), actual.Row(0), actual.RowBytes()}),
                  PK_Success);
        ASSERT_EQ(ScaleByHand(call, {source.Row(0), source.RowBytes(), expected.Row(0), expected.RowBytes()}),
                  PK_Success);
        EXPECT_TRUE(actual.HasMemoryOf(expected));
    }
}

} // namespace
