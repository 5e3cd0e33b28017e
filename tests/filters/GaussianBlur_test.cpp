// PK_GaussianBlur: which pixels are written, by what, and what is refused.

#include "convert/RasterFormats.h"
#include "support/AlignedPicture.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Fills.h>
#include <PixelKiln/GaussianBlur.h>
#include <PixelKiln/Lifecycle.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <limits>

using namespace PKTest;

namespace {

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kBGRP = PK_PixelFormat_BGRP_4444_8u,
                         kFloats = PK_PixelFormat_BGRP_4444_32f, kWords = PK_PixelFormat_BGRA_4444_15u;
constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();
constexpr double kInfinity = std::numeric_limits<double>::infinity();

struct Settings {
    double sigmaX = 2, sigmaY = 2;
    bool repeatEdge = false, linear = false;
    int32_t direction = 3, quality = 4;
};

PK_Result Blur(const AlignedPicture& source, AlignedPicture& out, const Settings& settings = {}) {
    return PK_GaussianBlur(source.Pixels(), source.RowBytes(), source.width, source.height, source.format,
                           out.Pixels(), out.RowBytes(), out.width, out.height, out.format, settings.sigmaX,
                           settings.sigmaY, settings.repeatEdge, settings.linear, settings.direction,
                           settings.quality);
}

template <class Sample>
Sample SampleAt(const AlignedPicture& picture, int32_t x, int32_t y, int channel = 0) {
    Sample sample;
    std::memcpy(&sample,
                picture.Row(y) + (static_cast<size_t>(x) * 4 + static_cast<size_t>(channel)) * sizeof sample,
                sizeof sample);
    return sample;
}

void FillFloats(AlignedPicture& picture, float value) {
    for (int32_t y = 0; y < picture.height; ++y)
        for (size_t i = 0; i < picture.rowLength; i += sizeof value)
            std::memcpy(picture.Row(y) + i, &value, sizeof value);
}

/// The columns or rows that differ from before, as the first and the one behind the last.
struct Range {
    int32_t first, end;
    bool operator==(const Range&) const = default;
};

class GaussianBlur : public testing::Test {
protected:
    GaussianBlur() { PK_Initialize(); }
    ~GaussianBlur() override { PK_Terminate(); }

    /// The part of a destination that a blur of random floats writes.
    struct Written {
        Range columns, rows;
    };
    Written WrittenBy(const Settings& settings, int32_t width, int32_t height, int32_t destWidth,
                      int32_t destHeight) {
        AlignedPicture source(kFloats, width, height), out(kFloats, destWidth, destHeight);
        source.FillOrdinary(fRandom);
        FillFloats(out, 77);
        EXPECT_EQ(Blur(source, out, settings), PK_Success);
        Written written = {{destWidth, 0}, {destHeight, 0}};
        for (int32_t y = 0; y < destHeight; ++y)
            for (int32_t x = 0; x < destWidth; ++x) {
                if (SampleAt<float>(out, x, y) == 77) continue;
                written.columns = {std::min(written.columns.first, x), std::max(written.columns.end, x + 1)};
                written.rows = {std::min(written.rows.first, y), std::max(written.rows.end, y + 1)};
            }
        return written;
    }

    FlagScope fFlags;
    Random fRandom{6102};
};

} // namespace

TEST_F(GaussianBlur, WritesTheRowsAndColumnsOfTheDirectionsThatItBlurs) {
    const auto expect = [&](const Settings& settings, Range columns, Range rows) {
        const Written written = WrittenBy(settings, 6, 5, 13, 11);
        EXPECT_EQ(written.columns, columns);
        EXPECT_EQ(written.rows, rows);
    };
    const Range all = {0, 13}, none = {13, 0};
    expect({.direction = 1}, all, {0, 5});
    expect({.direction = 2}, {0, 6}, {0, 11});
    expect({.direction = 3}, all, {0, 11});
    expect({.sigmaX = 0, .direction = 3}, {0, 6}, {0, 11});
    expect({.sigmaX = kNaN, .direction = 3}, {0, 6}, {0, 11});
    expect({.sigmaY = -1, .direction = 3}, all, {0, 5});
    for (const int32_t direction : {0, 4, -1, INT32_MAX}) expect({.direction = direction}, none, {11, 0});
    expect({.sigmaX = 0, .direction = 1}, none, {11, 0});
    expect({.sigmaY = 0, .direction = 2}, none, {11, 0});
}

TEST_F(GaussianBlur, WithoutSigmasCopiesToTheMiddle) {
    for (const Settings& settings :
         {Settings{0, 0}, Settings{-2, kNaN}, Settings{.sigmaX = 0, .sigmaY = 0, .direction = 0}}) {
        AlignedPicture source(kBGRA, 4, 3), out(kBGRA, 7, 6);
        source.FillOrdinary(fRandom);
        out.FillOrdinary(fRandom);
        ASSERT_EQ(Blur(source, out, settings), PK_Success);
        for (int32_t y = 0; y < 6; ++y)
            for (int32_t x = 0; x < 7; ++x) {
                const bool isInside =
                    x >= 1 && x < 5 && y >= 1 && y < 4; // (7 - 4) / 2 and (6 - 3) / 2, truncated
                for (int channel = 0; channel < 4; ++channel)
                    ASSERT_EQ(SampleAt<uint8_t>(out, x, y, channel),
                              isInside ? SampleAt<uint8_t>(source, x - 1, y - 1, channel) : 0)
                        << x << ' ' << y;
            }
    }
}

TEST_F(GaussianBlur, BlursRowsInTheOrderOfMemory) {
    AlignedPicture source(kBGRA, 2, 3), out(PK_PixelFormat_VUYA_4444_8u, 2, 3);
    for (int32_t y = 0; y < 3; ++y) std::memset(source.Row(y), 60 * y, 8);
    for (int32_t y = 0; y < 3; ++y) source.Row(y)[3] = source.Row(y)[7] = 255;
    ASSERT_EQ(Blur(source, out, {.sigmaX = 1, .sigmaY = 0, .repeatEdge = true}), PK_Success);
    for (int32_t y = 1; y < 3; ++y) EXPECT_GT(out.Row(y)[2], out.Row(y - 1)[2]);
}

// The gains of both passes add up to 1; near repeated edges their presets of a half each are not quite the passes' own.
TEST_F(GaussianBlur, AFlatImageWithRepeatedEdgesStaysFlat) {
    constexpr int32_t kSide = 180, kFar = 60;
    for (const double sigma : {1.0, 3.0, 10.0}) {
        AlignedPicture source(kFloats, kSide, kSide), out(kFloats, kSide + 6, kSide + 6);
        FillFloats(source, 0.6f);
        ASSERT_EQ(Blur(source, out, {.sigmaX = sigma, .sigmaY = sigma, .repeatEdge = true}), PK_Success);
        for (int32_t y = 0; y < out.height; ++y)
            for (int32_t x = 0; x < out.width; ++x) {
                const bool isFar = std::min({x, y, out.width - 1 - x, out.height - 1 - y}) > kFar;
                ASSERT_NEAR(SampleAt<float>(out, x, y), 0.6f, isFar ? 1e-4 : 0.3) << x << ' ' << y;
            }
    }
}

TEST_F(GaussianBlur, WithoutRepeatedEdgesFadesToTransparentBlack) {
    constexpr int32_t kSide = 60;
    AlignedPicture source(kBGRP, kSide, kSide), out(kBGRP, kSide, kSide);
    PK_FillWithOpaqueWhite(source.Pixels(), source.RowBytes(), kSide, kSide, kBGRP);
    ASSERT_EQ(Blur(source, out, {.sigmaX = 4, .sigmaY = 4}), PK_Success);
    EXPECT_EQ(SampleAt<uint8_t>(out, kSide / 2, kSide / 2), 255);
    for (const int channel : {0, 3}) {
        for (int32_t i = 1; i < 8; ++i) {
            const auto at = [&](int32_t place) {
                return int{SampleAt<uint8_t>(out, place, kSide / 2, channel)};
            };
            EXPECT_GT(at(i), at(i - 1));
            EXPECT_GT(at(kSide - 1 - i), at(kSide - i));
            EXPECT_NEAR(at(i), at(kSide - 1 - i), 1);
        }
        EXPECT_NEAR(SampleAt<uint8_t>(out, 0, kSide / 2, channel), 128, 16);
        EXPECT_NEAR(SampleAt<uint8_t>(out, 0, 0, channel), 64, 24);
    }
}

// A dot in the middle spreads alike to all four sides.
TEST_F(GaussianBlur, SpreadsADotIntoTheMargin) {
    for (const PK_PixelFormat format : {kBGRP, kFloats}) {
        AlignedPicture source(format, 5, 5), out(format, 25, 25);
        PK_FillWithOpaqueWhite(source.Pixels(), source.RowBytes(), 5, 5, format);
        ASSERT_EQ(Blur(source, out, {.sigmaX = 3, .sigmaY = 3}), PK_Success);
        for (int32_t i = 0; i <= 12; ++i) {
            const auto at = [&](int32_t x, int32_t y) {
                return format == kFloats ? SampleAt<float>(out, x, y) * 255
                                         : static_cast<float>(SampleAt<uint8_t>(out, x, y));
            };
            EXPECT_NEAR(at(12, 12 + i), at(12, 12 - i), 2.5f) << i;
            EXPECT_NEAR(at(12, 12 + i), at(12 + i, 12), 1) << i;
            if (i > 0) {
                EXPECT_LE(at(12 + i, 12), at(11 + i, 12) + 1) << i;
            }
        }
    }
}

TEST_F(GaussianBlur, BlursLightWhereItIsAskedTo) {
    AlignedPicture source(kBGRA, 40, 1), codes(kBGRA, 40, 1), light(kBGRA, 40, 1);
    for (int32_t x = 0; x < 40; ++x) {
        const uint8_t grey = x < 20 ? 0 : 255;
        const uint8_t pixel[4] = {grey, grey, grey, 255};
        std::memcpy(source.Row(0) + 4 * x, pixel, 4);
    }
    ASSERT_EQ(Blur(source, codes, {.sigmaX = 3, .sigmaY = 0, .repeatEdge = true}), PK_Success);
    ASSERT_EQ(Blur(source, light, {.sigmaX = 3, .sigmaY = 0, .repeatEdge = true, .linear = true}),
              PK_Success);
    for (int32_t x = 17; x < 23; ++x)
        EXPECT_GT(SampleAt<uint8_t>(light, x, 0), SampleAt<uint8_t>(codes, x, 0) + 15) << x;
}

TEST_F(GaussianBlur, GivesInPlaceWhatItGivesBeside) {
    for (const PK_PixelFormat format : {kBGRA, PK_PixelFormat_PRGB_4444_8u, kWords, kFloats,
                                        PK_PixelFormat_VUYP_4444_32f, PK_PixelFormat_BGRP_4444_32f_Linear})
        for (const bool linear : {false, true})
            for (const int32_t direction : {1, 2, 3})
                for (const int32_t height : {20, 70}) {
                    AlignedPicture image(format, 37, height);
                    image.FillOrdinary(fRandom);
                    AlignedPicture out = image;
                    const Settings settings = {.linear = linear, .direction = direction};
                    ASSERT_EQ(Blur(image, out, settings), PK_Success);
                    ASSERT_EQ(PK_GaussianBlur(image.Pixels(), image.RowBytes(), 37, height, format,
                                              image.Pixels(), image.RowBytes(), 37, height, format, 2, 2,
                                              false, linear, direction, 4),
                              PK_Success);
                    ASSERT_EQ("", image.DifferenceFrom(out)) << std::hex << format << ' ' << direction;
                }
}

TEST_F(GaussianBlur, TouchesNothingButPixels) {
    for (const PK_PixelFormat format : {kBGRA, kWords, kFloats, PK_PixelFormat_VUYA_4444_8u_709})
        for (const int32_t direction : {1, 2, 3})
            for (int round = 0; round < 12; ++round) {
                const auto draw = [&](uint32_t count) { return static_cast<int32_t>(fRandom.Below(count)); };
                const int32_t width = 1 + draw(50), height = 1 + draw(50);
                const int32_t destWidth = width + draw(9), destHeight = height + draw(9);
                const auto length = [&](int32_t pixels) {
                    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, pixels));
                };
                const Guard guard = draw(2) != 0 ? Guard::kBefore : Guard::kAfter;
                const GuardedImage source({length(width), height, fRandom.Below(9), draw(2) != 0, guard},
                                          fRandom);
                const GuardedImage out({length(destWidth), destHeight, fRandom.Below(9), draw(2) != 0, guard},
                                       fRandom);
                const auto before = source.Rows();
                auto rows = out.Rows();
                ASSERT_EQ(PK_GaussianBlur(source.Pixels(), source.RowBytes(), width, height, format,
                                          out.Pixels(), out.RowBytes(), destWidth, destHeight, format, 1.5,
                                          2.5, draw(2) != 0, false, direction, 4),
                          PK_Success);
                const int32_t writtenRows = direction == 1 ? height : destHeight;
                const size_t written = length(direction == 2 ? width : destWidth);
                for (int32_t row = 0; row < writtenRows; ++row) {
                    const std::vector<uint8_t> content = out.RowContent(row);
                    std::copy_n(content.begin(), written, rows[static_cast<size_t>(row)].begin());
                }
                out.ExpectRows(rows);
                source.ExpectRows(before);
            }
}

// Every result is finite for finite sigmas up to some hundreds; beyond, the call ends and keeps to its pixels.
TEST_F(GaussianBlur, EndsWithAnySigma) {
    for (const double sigma : {1e-310, 1e-9, 0.01, 700.0, 1e5, 1e9, 1e300, kInfinity})
        for (const PK_PixelFormat format : {kBGRA, kFloats}) {
            AlignedPicture source(format, 40, 35), out(format, 41, 38);
            source.FillOrdinary(fRandom);
            EXPECT_EQ(Blur(source, out, {.sigmaX = sigma, .sigmaY = sigma, .repeatEdge = true}), PK_Success);
            if (sigma > 0.02 || sigma < 1e-300 || format != kFloats) continue;
            // So little of a blur that the samples stay: at 2 behind (38 - 35 + 1) / 2 rows, at 1 of the columns.
            for (int32_t y = 0; y < 35; ++y)
                for (int32_t x = 0; x < 40; ++x)
                    EXPECT_EQ(SampleAt<float>(out, x + 1, y + 2), SampleAt<float>(source, x, y));
        }
}

TEST_F(GaussianBlur, SamplesThatAreNoNumbersStayInTheirRow) {
    AlignedPicture source(kFloats, 20, 3), out(kFloats, 20, 3);
    FillFloats(source, 0.5f);
    const float bad = std::numeric_limits<float>::infinity();
    std::memcpy(source.Row(1) + 16 * 10, &bad, sizeof bad);
    ASSERT_EQ(Blur(source, out, {.sigmaX = 2, .sigmaY = 0}), PK_Success);
    for (int32_t x = 0; x < 20; ++x) {
        EXPECT_FALSE(std::isfinite(SampleAt<float>(out, x, 1, 0))) << x;
        EXPECT_TRUE(std::isfinite(SampleAt<float>(out, x, 1, 1))) << x;
        EXPECT_TRUE(std::isfinite(SampleAt<float>(out, x, 0))) << x;
        EXPECT_TRUE(std::isfinite(SampleAt<float>(out, x, 2))) << x;
    }
}

TEST_F(GaussianBlur, FlushesDenormalsAndLeavesTheModeOfTheCaller) {
    for (const uint32_t bits :
         {kExceptionFlags, kRoundDown | kExceptionFlags, kDenormalsAreZero | kExceptionFlags})
        for (const int32_t height : {2, 40}) {
            AlignedPicture source(kFloats, 200, height), out(kFloats, 200, height);
            for (int32_t y = 0; y < height; ++y) {
                const float one = 1;
                std::memcpy(source.Row(y), &one, sizeof one);
            }
            const FloatEnvironment environment(bits);
            ASSERT_EQ(Blur(source, out, {.sigmaX = 1, .sigmaY = 0}), PK_Success);
            EXPECT_TRUE(environment.IsAsGiven());
            bool hasZero = false;
            for (int32_t x = 0; x < 200; ++x) {
                const float sample = SampleAt<float>(out, x, 0);
                EXPECT_NE(std::fpclassify(sample), FP_SUBNORMAL) << x;
                hasZero |= sample == 0;
            }
            EXPECT_TRUE(hasZero);
            EXPECT_EQ(Blur(source, out, {.sigmaX = 0, .sigmaY = 0}), PK_Success);
            AlignedPicture small(kFloats, 1, 1);
            EXPECT_EQ(Blur(source, small), PK_ErrBadWidth);
            EXPECT_TRUE(environment.IsAsGiven());
        }
}

TEST_F(GaussianBlur, RefusesInOrder) {
    uint8_t pixels[1024] = {};
    struct Call {
        int32_t width = 2, height = 2;
        PK_PixelFormat from = kBGRA;
        int32_t destWidth = 2, destHeight = 2;
        PK_PixelFormat to = kBGRA;
    };
    const auto blur = [&](const Call& call) {
        return PK_GaussianBlur(pixels, 32, call.width, call.height, call.from, pixels + 512, 32,
                               call.destWidth, call.destHeight, call.to, 1, 1, false, false, 3, 4);
    };
    constexpr PK_PixelFormat kUYVY = PK_PixelFormat_UYVY_422_8u, kRGB = PK_PixelFormat_RGB_444_10u;
    EXPECT_EQ(blur({}), PK_Success);
    EXPECT_EQ(blur({.width = 3, .height = 3, .from = kUYVY, .to = kUYVY}), PK_ErrBadWidth);
    EXPECT_EQ(blur({.height = 3, .from = kUYVY, .to = kUYVY}), PK_ErrBadHeight);
    EXPECT_EQ(blur({.from = kUYVY, .to = kUYVY}), PK_ErrBadSrcFormat);
    EXPECT_EQ(blur({.to = kUYVY}), PK_ErrBadDstFormat);
    EXPECT_EQ(blur({.to = kRGB}), PK_ErrBadDstFormat);
    EXPECT_EQ(blur({.from = kRGB}), PK_ErrBadSrcFormat);
    EXPECT_EQ(blur({.from = kFloats, .to = kUYVY}), PK_ErrBadDstFormat); // before the depths
    EXPECT_EQ(blur({.to = kFloats}), PK_ErrBadSrcFormat);
    EXPECT_EQ(blur({.from = kFloats}), PK_ErrBadSrcFormat);
    EXPECT_EQ(blur({.from = kWords, .to = kFloats}), PK_Success);
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0xffffffff}, PK_PixelFormat{0x1c4}, PK_PixelFormat{0x01000004}}) {
        EXPECT_EQ(blur({.from = format}), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(blur({.to = format}), PK_ErrBadDstFormat) << std::hex << format;
    }
    EXPECT_EQ(blur({.width = -3, .destWidth = -2}), PK_ErrFailed);
    EXPECT_EQ(blur({.width = -3}), PK_ErrFailed);
    EXPECT_EQ(blur({.height = -1}), PK_ErrFailed);
    EXPECT_EQ(blur({.width = -3, .to = kFloats}), PK_ErrBadSrcFormat); // formats before sizes
    EXPECT_EQ(blur({.destWidth = INT32_MAX / 16 + 1}), PK_ErrFailed);
    EXPECT_EQ(blur({.destHeight = INT32_MAX / 16 + 1}), PK_ErrFailed);
}

TEST_F(GaussianBlur, TakesFourChannelsOnly) {
    uint8_t pixels[256] = {};
    int32_t taken = 0;
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        const bool hasFour = (format & 0x30) == 0 && (format & 0xc) != 0;
        EXPECT_EQ(PK_GaussianBlur(pixels, 16, 1, 1, format, pixels + 128, 16, 1, 1, format, 1, 1, false,
                                  false, 3, 4),
                  hasFour ? PK_Success : PK_ErrBadSrcFormat)
            << std::hex << format;
        taken += hasFour;
    }
    EXPECT_EQ(taken, 36);
}

TEST_F(GaussianBlur, WantsPointersWhereThereArePixels) {
    AlignedPicture source(kBGRA, 2, 2), out(kBGRA, 4, 4);
    out.FillOrdinary(fRandom);
    const AlignedPicture before = out;
    for (const double sigma : {0.0, 1.0}) {
        const auto blur = [&](const void* from, int32_t width, int32_t height, void* to, int32_t destWidth,
                              int32_t destHeight) {
            return PK_GaussianBlur(from, source.RowBytes(), width, height, kBGRA, to, out.RowBytes(),
                                   destWidth, destHeight, kBGRA, sigma, sigma, false, false, 3, 4);
        };
        EXPECT_EQ(blur(nullptr, 2, 2, out.Pixels(), 4, 4), PK_ErrFailed);
        EXPECT_EQ(blur(source.Pixels(), 2, 2, nullptr, 4, 4), PK_ErrFailed);
        EXPECT_EQ(blur(nullptr, 0, 0, nullptr, 4, 4), PK_ErrFailed);
        EXPECT_EQ(blur(nullptr, 0, 0, nullptr, 4, 0), PK_Success);
        EXPECT_EQ(blur(nullptr, 0, 0, nullptr, 0, 4), PK_Success);
        EXPECT_EQ("", out.DifferenceFrom(before));
    }
    // Of a source without pixels there is nothing to blur; without blur it is amid transparent black.
    EXPECT_EQ(PK_GaussianBlur(nullptr, 0, 0, 2, kBGRA, out.Pixels(), out.RowBytes(), 4, 4, kBGRA, 1, 1, true,
                              false, 3, 4),
              PK_Success);
    EXPECT_EQ("", out.DifferenceFrom(before));
    EXPECT_EQ(PK_GaussianBlur(nullptr, 0, 2, 0, kBGRA, out.Pixels(), out.RowBytes(), 4, 4, kBGRA, 0, 0, true,
                              false, 3, 4),
              PK_Success);
    EXPECT_EQ("", out.DifferenceFrom(AlignedPicture(kBGRA, 4, 4)));
}
