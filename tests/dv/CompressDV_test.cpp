// The encoders of DV as their callers see them.

#include <PixelKiln/PixelKiln.h>

#include "support/DVSegmentReader.h"
#include "support/GuardedImage.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <algorithm>
#include <cstdlib>
#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <vector>
#include <xmmintrin.h>

namespace {

using PKTest::GuardedRows;
using PKTest::Random;

using Bytes = std::vector<uint8_t>;

struct Stream {
    const char* name;
    PK_PixelFormat format, pixels;
    int32_t width, height, bytes;
};

constexpr Stream kStreams[] = {
    {"NTSCDV25", PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUYV_422_8u, 720, 480, 120000},
    {"PALDV25", PK_PixelFormat_PALDV25, PK_PixelFormat_YUYV_422_8u, 720, 576, 144000},
    {"NTSCDV50", PK_PixelFormat_NTSCDV50, PK_PixelFormat_YUYV_422_8u, 720, 480, 240000},
    {"PALDV50", PK_PixelFormat_PALDV50, PK_PixelFormat_YUYV_422_8u, 720, 576, 288000},
    {"NTSC_720p", PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_YUYV_422_8u_709, 960, 720, 240000},
    {"PAL_720p", PK_PixelFormat_PAL_DV100_720p, PK_PixelFormat_YUYV_422_8u_709, 960, 720, 288000},
    {"NTSC_1080i", PK_PixelFormat_NTSC_DV100_1080i, PK_PixelFormat_YUYV_422_8u_709, 1280, 1080, 480000},
    {"PAL_1080i", PK_PixelFormat_PAL_DV100_1080i, PK_PixelFormat_YUYV_422_8u_709, 1440, 1080, 576000},
};

/// Something with edges, slopes and noise, in pairs of 4:2:2 without gaps between rows.
Bytes Picture(int32_t width, int32_t height, uint32_t noise = 8) {
    Random random(5);
    Bytes bytes;
    for (int32_t y = 0; y < height; ++y)
        for (int32_t x = 0; x < width; ++x) {
            const int32_t shade =
                60 + 100 * x / width + (x / 37 + y / 23) % 2 * 50 + static_cast<int32_t>(random.Below(noise));
            bytes.push_back(static_cast<uint8_t>(shade));
            bytes.push_back(static_cast<uint8_t>(128 + (x % 2 == 0 ? 40 * x / width : -60 * y / height)));
        }
    return bytes;
}

Bytes Encode(const Stream& stream, const Bytes& picture, int32_t quality = 4) {
    Bytes frame(static_cast<size_t>(stream.bytes));
    EXPECT_EQ(PK_Convert(picture.data(), 2 * stream.width, stream.pixels, frame.data(), stream.bytes,
                         stream.format, stream.width, stream.height, quality),
              PK_Success);
    return frame;
}

class CompressDV : public testing::TestWithParam<Stream> {};
INSTANTIATE_TEST_SUITE_P(Streams, CompressDV, testing::ValuesIn(kStreams),
                         [](const auto& test) { return std::string(test.param.name); });

TEST_P(CompressDV, GivesTheSameBytesAtEveryInstructionSetAndInEveryThread) {
    const Stream& stream = GetParam();
    const Bytes picture = Picture(stream.width, stream.height);
    for (const int32_t quality : {0, 5}) {
        const Bytes frame = Encode(stream, picture, quality);
        PKTest::AtEveryTarget([&] { EXPECT_EQ(Encode(stream, picture, quality), frame); });
        std::vector<std::thread> threads;
        for (int i = 0; i < 4; ++i)
            threads.emplace_back([&] { EXPECT_EQ(Encode(stream, picture, quality), frame); });
        for (std::thread& thread : threads) thread.join();
    }
}

TEST_P(CompressDV, GivesTheSameBytesWhateverTheRoundingModeOfTheCaller) {
    const Stream& stream = GetParam();
    const Bytes picture = Picture(stream.width, stream.height);
    const Bytes frame = Encode(stream, picture);
    const uint32_t before = _mm_getcsr();
    for (const unsigned mode : {_MM_ROUND_DOWN, _MM_ROUND_UP, _MM_ROUND_TOWARD_ZERO}) {
        _MM_SET_ROUNDING_MODE(mode);
        const uint32_t set = _mm_getcsr();
        EXPECT_EQ(Encode(stream, picture), frame);
        EXPECT_EQ(_mm_getcsr(), set);
        _mm_setcsr(before);
    }
}

TEST_P(CompressDV, TakesRowsOfEitherDirectionAndNothingBesideThem) {
    const Stream& stream = GetParam();
    const Bytes picture = Picture(stream.width, stream.height);
    const auto rowLength = static_cast<size_t>(2 * stream.width);
    const Bytes expected = Encode(stream, picture);
    for (const PKTest::Guard guard : {PKTest::Guard::kBefore, PKTest::Guard::kAfter})
        for (const bool upwards : {false, true}) {
            Random random(7);
            const PKTest::GuardedImage source({rowLength, stream.height, 48, upwards, guard}, random);
            for (int32_t y = 0; y < stream.height; ++y)
                std::copy_n(picture.begin() + y * static_cast<ptrdiff_t>(rowLength), rowLength,
                            source.Row(y));
            const GuardedRows frame(static_cast<size_t>(stream.bytes), guard);
            EXPECT_EQ(PK_Convert(source.Pixels(), source.RowBytes(), stream.pixels, frame.Bytes(),
                                 stream.bytes, stream.format, stream.width, stream.height, 4),
                      PK_Success);
            EXPECT_TRUE(std::equal(expected.begin(), expected.end(), frame.Bytes()));
        }
}

TEST_P(CompressDV, AnotherFormatGivesWhatItsConversionGives) {
    const Stream& stream = GetParam();
    Random random(9);
    const PK_PixelFormat format = PK_PixelFormat_ARGB_4444_15u;
    const int32_t rowBytes = PK_PixelFormatRowBytes(format, stream.width);
    const Bytes source = random.Bytes(static_cast<size_t>(rowBytes) * static_cast<size_t>(stream.height));
    const bool isDV25 = stream.bytes < 240000;
    const PK_PixelFormat between = isDV25 ? PK_PixelFormat_BGRA_4444_8u : stream.pixels;
    const int32_t betweenRowBytes = PK_PixelFormatRowBytes(between, stream.width);
    Bytes staged(static_cast<size_t>(betweenRowBytes) * static_cast<size_t>(stream.height));
    ASSERT_EQ(PK_Convert(source.data(), rowBytes, format, staged.data(), betweenRowBytes, between,
                         stream.width, stream.height, 4),
              PK_Success);
    Bytes directly(static_cast<size_t>(stream.bytes)), inTwoSteps(directly.size(), 1);
    ASSERT_EQ(PK_Convert(source.data(), rowBytes, format, directly.data(), stream.bytes, stream.format,
                         stream.width, stream.height, 4),
              PK_Success);
    ASSERT_EQ(PK_Convert(staged.data(), betweenRowBytes, between, inTwoSteps.data(), stream.bytes,
                         stream.format, stream.width, stream.height, 4),
              PK_Success);
    EXPECT_EQ(directly, inTwoSteps);
}

/// Of the first segment.
bool HasOneQuantiser(const Bytes& frame) {
    for (int i = 1; i < 5; ++i)
        if (frame[560 + 3 + 80 * static_cast<size_t>(i)] != frame[563]) return false;
    return true;
}

bool HaveOneQuantiser(const Stream& stream, const Bytes& frame) {
    for (size_t at = 0; at < static_cast<size_t>(stream.bytes); at += 12000)
        if (!HasOneQuantiser({frame.begin() + static_cast<ptrdiff_t>(at),
                              frame.begin() + static_cast<ptrdiff_t>(at) + 1000}))
            return false;
    return true;
}

TEST_P(CompressDV, TheQualityChoosesBetweenTwoResults) {
    const Stream& stream = GetParam();
    const Bytes picture = Picture(stream.width, stream.height, 60);
    const int32_t best = stream.bytes < 240000 ? 3 : 5;
    const Bytes plain = Encode(stream, picture, 0), fine = Encode(stream, picture, 5);
    EXPECT_TRUE(HaveOneQuantiser(stream, plain));
    EXPECT_FALSE(HaveOneQuantiser(stream, fine));
    for (int32_t quality = 1; quality < 5; ++quality)
        EXPECT_EQ(Encode(stream, picture, quality), quality < best ? plain : fine) << quality;
}

struct Refusal {
    PK_PixelFormat pixels, format;
    int32_t width, height, bytes;
    PK_Result result;
};

TEST(CompressDVRefusals, LeaveTheDestination) {
    constexpr PK_PixelFormat kYUYV = PK_PixelFormat_YUYV_422_8u, kYUYV709 = PK_PixelFormat_YUYV_422_8u_709;
    constexpr Refusal kRefusals[] = {
        {kYUYV, PK_PixelFormat_NTSCDV25, 720, 576, 120000, PK_ErrSizeMismatch},
        {kYUYV, PK_PixelFormat_PALDV25, 720, 480, 144000, PK_ErrSizeMismatch},
        {kYUYV, PK_PixelFormat_PALDV25, 360, 240, 144000, PK_ErrSizeMismatch},
        {kYUYV, PK_PixelFormat_NTSCDV25, 0, 480, 120000, PK_ErrSizeMismatch},
        {kYUYV, PK_PixelFormat_NTSCDV25, 720, 480, 119999, PK_ErrBadDVDestination},
        {kYUYV, PK_PixelFormat_NTSCDV25, 720, 480, 120001, PK_ErrBadDVDestination},
        {kYUYV, PK_PixelFormat_NTSCDV25, 720, 480, 0, PK_ErrBadDVDestination},
        {kYUYV, PK_PixelFormat_NTSCDV50, 720, 576, 240000, PK_ErrBadDVSourceSize},
        {kYUYV, PK_PixelFormat_PALDV50, 720, 480, 288000, PK_ErrBadDVSourceSize},
        {kYUYV, PK_PixelFormat_PALDV50, 360, 288, 288000, PK_ErrBadDVSourceSize},
        {kYUYV709, PK_PixelFormat_NTSC_DV100_720p, 960, 360, 240000, PK_ErrBadDVSourceSize},
        {kYUYV709, PK_PixelFormat_NTSC_DV100_1080i, 1440, 1080, 480000, PK_ErrBadDVSourceSize},
        {kYUYV709, PK_PixelFormat_PAL_DV100_1080i, 1280, 1080, 576000, PK_ErrBadDVSourceSize},
        {kYUYV709, PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, 575999, PK_ErrBadDVDestination},
        {kYUYV709, PK_PixelFormat_PAL_DV100_1080i, 1280, 1080, 4, PK_ErrBadDVDestination},
        {kYUYV709, PK_PixelFormat_PAL_DV100_1080i, 1440, -1, 576000, PK_ErrFailed},
    };
    const Bytes source(size_t{2} * 1440 * 1080, 90), untouched(576000, 0x5a);
    Bytes frame = untouched;
    for (const Refusal& c : kRefusals) {
        EXPECT_EQ(PK_Convert(source.data(), 2 * c.width, c.pixels, frame.data(), c.bytes, c.format, c.width,
                             c.height, 4),
                  c.result)
            << PK_PixelFormatName(c.format) << " " << c.width << " x " << c.height << " in " << c.bytes;
        EXPECT_EQ(frame, untouched);
    }
}

// DV50 has no count to compare with, and ignores the row bytes of the destination.
TEST(CompressDVRefusals, DV50LooksAtNoByteCount) {
    const Stream& stream = kStreams[2];
    const Bytes picture = Picture(stream.width, stream.height), expected = Encode(stream, picture);
    Bytes frame(expected.size());
    EXPECT_EQ(PK_Convert(picture.data(), 1440, stream.pixels, frame.data(), 17, stream.format, 720, 480, 4),
              PK_Success);
    EXPECT_EQ(frame, expected);
}

struct Call {
    PK_PixelFormat pixels = PK_PixelFormat_YUYV_422_8u_709;
    PK_PixelFormat format = PK_PixelFormat_NTSC_DV100_720p;
    int32_t width = 960, height = 720, bytes = 240000, offset = 0;
    bool hasSource = true, hasDestination = true;
};

struct Outcome {
    PK_Result result;
    Bytes frame;

    bool operator==(const Outcome&) const = default;
};

constexpr size_t kRoom = 576000;

Outcome WithOffset(const Call& call) {
    Outcome outcome = {0, Bytes(kRoom, 0x5a)};
    const Bytes picture = Picture(std::max(call.width, 0), std::max(call.height, 0));
    outcome.result = PK_CompressDV100720pWithChannelOffset(
        call.hasSource ? picture.data() : nullptr, 2 * call.width, call.pixels, call.width, call.height,
        call.hasDestination ? outcome.frame.data() : nullptr, call.bytes, call.offset, call.format, 4);
    return outcome;
}

TEST(CompressDV100WithChannelOffset, OnlyTwoMakesTheSecondFrameOfAPair) {
    const Outcome first = WithOffset({}), second = WithOffset({.offset = 2});
    EXPECT_EQ(first.result, PK_Success);
    EXPECT_EQ(first.frame[1] & 4, 4);
    EXPECT_EQ(second.result, PK_Success);
    EXPECT_EQ(second.frame[1] & 4, 0);
    EXPECT_EQ(second.frame[120001], 0x0b);
    for (const int32_t offset : {1, 3, -2, 4}) EXPECT_EQ(WithOffset({.offset = offset}), first) << offset;

    const Stream& stream = kStreams[4];
    const Bytes converted = Encode(stream, Picture(960, 720));
    EXPECT_TRUE(std::equal(converted.begin(), converted.end(), first.frame.begin()));
    EXPECT_NE(Bytes(first.frame.begin() + 560, first.frame.begin() + 960),
              Bytes(second.frame.begin() + 560, second.frame.begin() + 960))
        << "their macroblocks lie elsewhere";
}

TEST(CompressDV100WithChannelOffset, OtherLinesHaveNone) {
    Call call = {.format = PK_PixelFormat_NTSC_DV100_1080i, .width = 1280, .height = 1080, .bytes = 480000};
    const Outcome without = WithOffset(call);
    EXPECT_EQ(without.result, PK_Success);
    call.offset = 2;
    EXPECT_EQ(WithOffset(call), without);
}

TEST(CompressDV100WithChannelOffset, Refuses) {
    const auto expect = [](const Call& call, PK_Result result) {
        EXPECT_EQ(WithOffset(call), (Outcome{result, Bytes(kRoom, 0x5a)}));
    };
    expect({.bytes = 239999}, PK_ErrBadDVDestination);
    expect({.width = 958}, PK_ErrBadDVSourceSize);
    expect({.height = 360}, PK_ErrBadDVSourceSize);
    expect({.pixels = PK_PixelFormat_YUYV_422_8u, .format = PK_PixelFormat_NTSCDV50}, PK_ErrBadDstFormat);
    expect({.pixels = PK_PixelFormat_YUYV_422_8u, .format = PK_PixelFormat_NTSCDV25}, PK_ErrBadDstFormat);
    expect({.format = PK_PixelFormat_BGRA_4444_8u}, PK_ErrNotSupported);
    expect({.format = 0x0d000821}, PK_ErrNotSupported);
    expect({.pixels = PK_PixelFormat_Invalid}, PK_ErrBadSrcFormat);
    expect({.hasSource = false}, PK_ErrFailed);
    expect({.hasDestination = false}, PK_ErrFailed);
    expect({.width = -960}, PK_ErrFailed);
}

} // namespace
