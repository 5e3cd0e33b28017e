// PK_AlphaGain: which samples a gain scales, in which format, and by which rounding.

#include "composite/ReferenceGain.h"
#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Fills.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>

using namespace PKTest;

namespace {

constexpr float kInfinity = std::numeric_limits<float>::infinity();
constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();

using Bytes4 = std::array<uint8_t, 4>;
using Floats4 = std::array<float, 4>;

/// One pixel of a format by a gain, in that format.
template <class Pixel>
Pixel Gained(PK_PixelFormat format, Pixel pixel, float gain) {
    Pixel out = {};
    EXPECT_EQ(PK_AlphaGain(pixel.data(), 0, format, out.data(), 0, format, 1, 1, gain, 4), PK_Success);
    return out;
}

PK_Result Gain(const AlignedPicture& from, AlignedPicture& to, float gain, int32_t quality) {
    return PK_AlphaGain(from.Pixels(), from.RowBytes(), from.format, to.Pixels(), to.RowBytes(), to.format,
                        to.width, to.height, gain, quality);
}

class AlphaGain : public testing::Test {
protected:
    AlphaGain() { PK::SetCapabilities(PK::ReadProcessor()); }

    void ExpectReference(PK_PixelFormat from, PK_PixelFormat to, float gain, int32_t quality) {
        SCOPED_TRACE(testing::Message() << std::hex << "0x" << from << " to 0x" << to << std::dec << ", gain "
                                        << gain << ", quality " << quality << ", seed " << fRandom.Seed());
        AlignedPicture source(from, kWidth, kHeight), destination(to, kWidth, kHeight);
        source.FillOrdinary(fRandom);
        ASSERT_EQ(Gain(source, destination, gain, quality), PK_Success);
        EXPECT_EQ("", destination.DifferenceFrom(ReferenceGain(source, to, gain, quality)));
    }

    PK_PixelFormat DrawFormat() { return PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))]; }

    static constexpr int32_t kWidth = 19, kHeight = 2;
    FlagScope fFlags;
    Random fRandom{4500};
};

} // namespace

TEST_F(AlphaGain, ScalesAlphaAloneOfStraightBytesAndSaturates) {
    AtEveryTarget([] {
        const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
        EXPECT_EQ(Gained(format, Bytes4{10, 200, 255, 100}, 2.0f), (Bytes4{10, 200, 255, 200}));
        EXPECT_EQ(Gained(format, Bytes4{10, 200, 255, 128}, 2.0f), (Bytes4{10, 200, 255, 255}));
        EXPECT_EQ(Gained(format, Bytes4{10, 200, 255, 255}, 2.0f), (Bytes4{10, 200, 255, 255}));
        EXPECT_EQ(Gained(format, Bytes4{0, 1, 2, 0}, 2.0f), (Bytes4{0, 1, 2, 0}));
        EXPECT_EQ(Gained(PK_PixelFormat_VUYA_4444_8u_709, Bytes4{10, 200, 255, 90}, 0.1f),
                  (Bytes4{10, 200, 255, 9}));
    });
}

TEST_F(AlphaGain, RoundsBytesToTheNearestAndTiesToEven) {
    AtEveryTarget([] {
        const PK_PixelFormat format = PK_PixelFormat_BGRP_4444_8u;
        EXPECT_EQ(Gained(format, Bytes4{1, 3, 5, 7}, 0.5f), (Bytes4{0, 2, 2, 4})); // 0.5, 1.5, 2.5, 3.5
        EXPECT_EQ(Gained(format, Bytes4{255, 254, 1, 0}, 1.0f), (Bytes4{255, 254, 1, 0}));
        EXPECT_EQ(Gained(format, Bytes4{100, 127, 128, 255}, 2.0f), (Bytes4{200, 254, 255, 255}));
    });
}

TEST_F(AlphaGain, RoundsByTheModeOfTheCaller) {
    AtEveryTarget([] {
        const FloatEnvironment environment(kRoundDown | kExceptionFlags);
        EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_8u, Bytes4{1, 3, 5, 255}, 0.9f), (Bytes4{0, 2, 4, 229}));
        EXPECT_TRUE(environment.IsAsGiven());
    });
}

TEST_F(AlphaGain, ScalesAllBytesThatHoldTheirAlphaThoughItTellNothing) {
    AtEveryTarget([] {
        for (const PK_PixelFormat format : {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u})
            EXPECT_EQ(Gained(format, Bytes4{10, 100, 200, 255}, 0.25f), (Bytes4{2, 25, 50, 64}));
    });
}

// V and U about 128, Y about 16: (10 - 128) / 4 + 128 = 98.5, (255 - 128) / 4 + 128 = 159.75, (235 - 16) / 4 + 16 = 70.75.
TEST_F(AlphaGain, ScalesBytesOfVUYAboutTheirZeros) {
    AtEveryTarget([] {
        for (const PK_PixelFormat format :
             {PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYP_4444_8u_709}) {
            EXPECT_EQ(Gained(format, Bytes4{10, 255, 235, 100}, 0.25f), (Bytes4{98, 160, 71, 25}));
            EXPECT_EQ(Gained(format, Bytes4{128, 128, 16, 255}, 0.1f), (Bytes4{128, 128, 16, 26})); // 25.5
            EXPECT_EQ(Gained(format, Bytes4{0, 255, 0, 200}, 3.0f), (Bytes4{0, 255, 0, 255}));
        }
    });
}

TEST_F(AlphaGain, ScalesFloatsWithoutLimit) {
    AtEveryTarget([] {
        const Floats4 pixel = {0.25f, -3.0f, 7.5f, 0.5f};
        EXPECT_EQ(Gained(PK_PixelFormat_BGRA_4444_32f, pixel, 4.0f), (Floats4{0.25f, -3.0f, 7.5f, 2.0f}));
        EXPECT_EQ(Gained(PK_PixelFormat_VUYA_4444_32f, pixel, 4.0f), (Floats4{0.25f, -3.0f, 7.5f, 2.0f}));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_32f, pixel, 4.0f), (Floats4{1.0f, -12.0f, 30.0f, 2.0f}));
        EXPECT_EQ(Gained(PK_PixelFormat_VUYX_4444_32f, pixel, 4.0f), (Floats4{1.0f, -12.0f, 30.0f, 2.0f}));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRX_4444_32f_Linear, pixel, 0.1f),
                  (Floats4{0.25f * 0.1f, -3.0f * 0.1f, 7.5f * 0.1f, 0.5f * 0.1f}));
    });
}

TEST_F(AlphaGain, ScalesAllOfFloatsInReversedOrderThoughTheirAlphaIsStraight) {
    const Floats4 pixel = {0.5f, 0.25f, -3.0f, 7.5f}; // alpha first
    EXPECT_EQ(Gained(PK_PixelFormat_ARGB_4444_32f, pixel, 4.0f), (Floats4{2.0f, 1.0f, -12.0f, 30.0f}));
}

TEST_F(AlphaGain, ScalesAlphaAloneOfBytesInReversedOrder) {
    EXPECT_EQ(Gained(PK_PixelFormat_ARGB_4444_8u, Bytes4{100, 10, 20, 30}, 0.5f), (Bytes4{50, 10, 20, 30}));
    // Opaque, the alpha is lost on the way back: what is left is the colour over black.
    EXPECT_EQ(Gained(PK_PixelFormat_XRGB_4444_8u, Bytes4{255, 100, 200, 30}, 0.5f),
              (Bytes4{255, 50, 100, 15}));
}

TEST_F(AlphaGain, LeavesWhatHasNoAlphaAsItIs) {
    EXPECT_EQ(Gained(PK_PixelFormat_UYVY_422_8u, Bytes4{90, 50, 150, 200}, 0.5f)[1], 50);
    AlignedPicture source(PK_PixelFormat_V210_422_10u, 12, 1),
        destination(PK_PixelFormat_V210_422_10u, 12, 1);
    source.FillOrdinary(fRandom);
    for (const int32_t quality : {2, 3}) {
        AlignedPicture unscaled(source.format, 12, 1);
        ASSERT_EQ(Gain(source, destination, 0.3f, quality), PK_Success);
        ASSERT_EQ(Gain(source, unscaled, 1.0f, quality), PK_Success);
        EXPECT_EQ("", destination.DifferenceFrom(unscaled));
    }
}

TEST_F(AlphaGain, FollowsTheTableFromEveryFormatToEveryFormat) {
    for (const PK_PixelFormat to : PK::kRasterFormats)
        for (const PK_PixelFormat from : PK::kRasterFormats)
            for (const int32_t quality : {2, 3}) ExpectReference(from, to, 0.71f, quality);
}

TEST_F(AlphaGain, FollowsTheTableAtEveryTargetAndGain) {
    AtEveryTarget([&] {
        for (const PK_PixelFormat to : PK::kRasterFormats)
            for (const float gain : {8e-6f, 0.37f, 1.0f, 1.9f, 300.0f}) {
                ExpectReference(to, to, gain, 5);
                ExpectReference(DrawFormat(), to, gain, static_cast<int32_t>(fRandom.Below(6)));
            }
    });
}

TEST_F(AlphaGain, BelowTheThresholdIsTransparentBlack) {
    for (const float gain : {7e-6f, 0.0f, -0.0f, -1.0f, -kInfinity}) {
        EXPECT_EQ(Gained(PK_PixelFormat_BGRA_4444_8u, Bytes4{1, 2, 3, 4}, gain), (Bytes4{0, 0, 0, 0}));
        EXPECT_EQ(Gained(PK_PixelFormat_VUYA_4444_8u, Bytes4{1, 2, 3, 4}, gain), (Bytes4{128, 128, 16, 0}));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_32f, Floats4{1, kNaN, 3, 4}, gain), (Floats4{0, 0, 0, 0}));
    }
    EXPECT_EQ(Gained(PK_PixelFormat_BGRA_4444_8u, Bytes4{1, 2, 3, 4}, 8e-6f), (Bytes4{1, 2, 3, 0}));
    EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_32f, Floats4{1, 2, 3, 4}, 8e-6f),
              (Floats4{8e-6f, 2 * 8e-6f, 3 * 8e-6f, 4 * 8e-6f}));
}

TEST_F(AlphaGain, BelowTheThresholdIsAFillWithItsResults) {
    uint8_t pixels[64];
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        uint8_t expected[64];
        std::fill_n(pixels, sizeof pixels, uint8_t{0x5a});
        std::fill_n(expected, sizeof expected, uint8_t{0x5a});
        const PK_Result result = PK_FillWithTransparentBlack(expected, 32, 2, 2, format);
        EXPECT_EQ(PK_AlphaGain(nullptr, 0, PK_PixelFormat_UYVY_422_8u, pixels, 32, format, 2, 2, 0, 4),
                  result)
            << std::hex << format;
        EXPECT_TRUE(std::ranges::equal(pixels, expected)) << std::hex << format;
    }
    const PK_PixelFormat fine = PK_PixelFormat_BGRA_4444_8u;
    EXPECT_EQ(PK_AlphaGain(pixels, 0, fine, pixels, 32, PK_PixelFormat_BGRX_4444_8u, 1, 1, 0, 4),
              PK_ErrBadDstFormat);
    EXPECT_EQ(PK_AlphaGain(pixels, 0, fine, nullptr, 32, fine, 1, 1, 0, 4), PK_ErrFailed);
    EXPECT_EQ(PK_AlphaGain(nullptr, 0, fine, nullptr, 32, fine, 0, 1, 0, 4), PK_Success);
    EXPECT_EQ(PK_AlphaGain(nullptr, 0, PK_PixelFormat_NTSCDV25, pixels, 32, fine, 1, 1, 0, 4),
              PK_ErrBadSrcFormat);
}

TEST_F(AlphaGain, TakesWhatIsNoNumberAsItComes) {
    AtEveryTarget([] {
        EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_8u, Bytes4{1, 2, 3, 4}, kNaN), (Bytes4{0, 0, 0, 0}));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRP_4444_8u, Bytes4{1, 0, 3, 255}, kInfinity),
                  (Bytes4{255, 0, 255, 255}));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRA_4444_8u, Bytes4{1, 2, 3, 4}, kNaN), (Bytes4{1, 2, 3, 0}));
        const Floats4 scaled = Gained(PK_PixelFormat_BGRP_4444_32f, Floats4{kNaN, kInfinity, -1, 2}, 0.5f);
        EXPECT_TRUE(std::isnan(scaled[0]));
        EXPECT_EQ(scaled[1], kInfinity);
        EXPECT_EQ(scaled[2], -0.5f);
        EXPECT_EQ(scaled[3], 1.0f);
        EXPECT_TRUE(std::isnan(Gained(PK_PixelFormat_BGRA_4444_32f, Floats4{1, 2, 3, 4}, kNaN)[3]));
        EXPECT_EQ(Gained(PK_PixelFormat_BGRA_4444_32f, Floats4{1, 2, 3, 4}, kNaN)[2], 3.0f);
    });
}

// 1e-38 x 0.5 is denormal.
TEST_F(AlphaGain, ScalesInTheFloatingPointModeOfTheCaller) {
    AtEveryTarget([] {
        for (const uint32_t mode : {0u, kFlushToZero}) {
            const FloatEnvironment environment(mode | kExceptionFlags);
            const Floats4 scaled = Gained(PK_PixelFormat_BGRP_4444_32f, Floats4{1e-38f, 1, 2, 3}, 0.5f);
            EXPECT_TRUE(environment.IsAsGiven());
            EXPECT_EQ(scaled[0], mode == 0 ? 0.5e-38f : 0.0f);
        }
    });
}

TEST_F(AlphaGain, LeavesTheBitsOfColoursThatAreNotScaled) {
    AtEveryTarget([] {
        const std::array<uint32_t, 4> pixel = {0x7fa12345, 0x80000000, 0x00000001, 0x3f800000};
        std::array<uint32_t, 4> out = {};
        const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_32f;
        ASSERT_EQ(PK_AlphaGain(pixel.data(), 0, format, out.data(), 0, format, 1, 1, 0.5f, 4), PK_Success);
        EXPECT_EQ(out, (std::array<uint32_t, 4>{0x7fa12345, 0x80000000, 0x00000001, 0x3f000000}));
    });
}

TEST_F(AlphaGain, PairsRowsInMemoryWhateverTheirOrigin) {
    const uint8_t rows[2][4] = {{90, 50, 150, 60}, {90, 100, 150, 110}}; // UYVY, the top row first
    uint8_t out[2][8];
    ASSERT_EQ(
        PK_AlphaGain(rows, 4, PK_PixelFormat_UYVY_422_8u, out, 8, PK_PixelFormat_VUYA_4444_8u, 2, 2, 0.5f, 4),
        PK_Success);
    EXPECT_EQ(out[0][2], 50); // the bottom row of the destination
    EXPECT_EQ(out[1][2], 100);
    EXPECT_EQ(out[1][3], 128); // 127.5
}

TEST_F(AlphaGain, WorksInPlace) {
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        SCOPED_TRACE(testing::Message() << std::hex << format << ", seed " << fRandom.Seed());
        AlignedPicture picture(format, 37, 3);
        picture.FillOrdinary(fRandom);
        AlignedPicture expected(format, 37, 3);
        ASSERT_EQ(Gain(picture, expected, 0.6f, 4), PK_Success);
        ASSERT_EQ(Gain(picture, picture, 0.6f, 4), PK_Success);
        EXPECT_EQ("", picture.DifferenceFrom(expected));
    }
}

TEST_F(AlphaGain, TouchesItsRowsAlone) {
    AtEveryTarget([&] {
        for (int round = 0; round < 100; ++round) {
            const PK_PixelFormat from = DrawFormat(), to = fRandom.Below(2) != 0 ? from : DrawFormat();
            const auto width = static_cast<int32_t>(1 + fRandom.Below(70)),
                       height = static_cast<int32_t>(1 + fRandom.Below(4));
            SCOPED_TRACE(testing::Message() << std::hex << "0x" << from << " to 0x" << to << std::dec << ", "
                                            << width << " x " << height << ", seed " << fRandom.Seed());
            const auto draw = [&](PK_PixelFormat format) {
                const auto length = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
                return ImageShape{length, height, fRandom.Below(3) * 5, fRandom.Below(2) != 0,
                                  fRandom.Below(2) != 0 ? Guard::kAfter : Guard::kBefore};
            };
            GuardedImage source(draw(from), fRandom), destination(draw(to), fRandom);
            const auto before = source.Rows();
            ASSERT_EQ(PK_AlphaGain(source.Pixels(), source.RowBytes(), from, destination.Pixels(),
                                   destination.RowBytes(), to, width, height, 0.6f, 4),
                      PK_Success);
            source.ExpectRows(before);
            destination.ExpectRows(destination.Rows()); // the padding is as it was
        }
    });
}

TEST_F(AlphaGain, ConvertsRowsTooLongForTheStack) {
    constexpr int32_t kLong = 16400;
    AlignedPicture source(PK_PixelFormat_V210_422_10u, kLong, 1),
        destination(PK_PixelFormat_ARGB_4444_32f, kLong, 1);
    source.FillOrdinary(fRandom);
    ASSERT_EQ(Gain(source, destination, 0.4f, 4), PK_Success);
    EXPECT_EQ("", destination.DifferenceFrom(ReferenceGain(source, destination.format, 0.4f, 4)));
}

TEST_F(AlphaGain, RefusesFormats) {
    uint8_t pixels[64] = {};
    const auto gain = [&](PK_PixelFormat source, PK_PixelFormat destination) {
        return PK_AlphaGain(pixels, 16, source, pixels, 16, destination, 1, 1, 1.0f, 4);
    };
    const PK_PixelFormat fine = PK_PixelFormat_BGRA_4444_8u;
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0x0d000004}, PK_PixelFormat{0x804}, PK_PixelFormat{0xffffffff}}) {
        EXPECT_EQ(gain(format, fine), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(gain(fine, format), PK_ErrBadDstFormat) << std::hex << format;
        EXPECT_EQ(gain(format, format), PK_ErrBadSrcFormat) << std::hex << format;
    }
}

TEST_F(AlphaGain, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    const auto gain = [&](const void* source, void* destination, int32_t width, int32_t height) {
        return PK_AlphaGain(source, 16, format, destination, 16, format, width, height, 0.5f, 4);
    };
    EXPECT_EQ(gain(pixels, pixels, -1, 1), PK_ErrFailed);
    EXPECT_EQ(gain(pixels, pixels, 1, -1), PK_ErrFailed);
    EXPECT_EQ(gain(pixels, pixels, INT32_MAX / 16 + 1, 1), PK_ErrFailed);
    EXPECT_EQ(gain(nullptr, pixels, 1, 1), PK_ErrFailed);
    EXPECT_EQ(gain(pixels, nullptr, 1, 1), PK_ErrFailed);
    EXPECT_EQ(gain(nullptr, nullptr, 0, 1), PK_Success);
    EXPECT_EQ(gain(nullptr, nullptr, 1, 0), PK_Success);
}
