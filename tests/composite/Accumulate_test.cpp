// PK_Accumulate: weighted sums in premultiplied floats, in a stated order, of pictures that stand upright.

#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "frame/DebugSwitches.h"
#include "support/AlignedPicture.h"
#include "support/Allocations.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Accumulate.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <deque>
#include <limits>

using namespace PKTest;

namespace {

constexpr PK_PixelFormat kSumFormat = PK_PixelFormat_BGRP_4444_32f;
constexpr float kInfinity = std::numeric_limits<float>::infinity();

using Floats4 = std::array<float, 4>;

/// What a call is given of its sources.
struct Sources {
    std::vector<const void*> pixels;
    std::vector<int32_t> rowBytes;
    std::vector<PK_PixelFormat> formats;
    std::vector<double> weights;

    void Add(const void* image, int32_t step, PK_PixelFormat format, double weight) {
        pixels.push_back(image);
        rowBytes.push_back(step);
        formats.push_back(format);
        weights.push_back(weight);
    }
    void Add(const AlignedPicture& picture, double weight) {
        Add(picture.Pixels(), picture.RowBytes(), picture.format, weight);
    }
    int32_t Count() const { return static_cast<int32_t>(pixels.size()); }

    PK_Result SumTo(void* destination, int32_t step, PK_PixelFormat format, int32_t width, int32_t height,
                    int32_t quality) const {
        return PK_Accumulate(pixels.data(), rowBytes.data(), formats.data(), weights.data(), Count(),
                             destination, step, format, width, height, quality);
    }
    PK_Result SumTo(AlignedPicture& to, int32_t quality) const {
        return SumTo(to.Pixels(), to.RowBytes(), to.format, to.width, to.height, quality);
    }
};

/// One pixel of the format that is summed in, of pixels in it.
Floats4 SumOf(const std::vector<std::pair<Floats4, double>>& summands) {
    Sources sources;
    for (const auto& [pixel, weight] : summands) sources.Add(pixel.data(), 0, kSumFormat, weight);
    Floats4 sum = {};
    EXPECT_EQ(sources.SumTo(sum.data(), 0, kSumFormat, 1, 1, 4), PK_Success);
    return sum;
}

struct Summand {
    AlignedPicture picture;
    double weight;
};

float SampleOf(const AlignedPicture& picture, int32_t rowFromTop, int32_t sample) {
    float value;
    std::memcpy(&value, picture.RowFromTop(rowFromTop) + 4 * sample, sizeof value);
    return value;
}

/// Row by row from the top, in groups of ten.
AlignedPicture ReferenceSum(const std::vector<Summand>& summands, PK_PixelFormat destination, int32_t width,
                            int32_t height, int32_t quality) {
    const PK_PixelFormat working =
        quality < 5 ? PK_PixelFormat_BGRP_4444_32f : PK_PixelFormat_BGRP_4444_32f_Linear;
    // The working format is stored bottom-up; its rows are told from the top in both.
    std::deque<AlignedPicture> rows;
    for (const Summand& summand : summands) {
        const AlignedPicture& from = summand.picture;
        AlignedPicture& to = rows.emplace_back(working, width, height);
        for (int32_t row = 0; row < height; ++row)
            EXPECT_EQ(PK_Convert(from.RowFromTop(row), 0, from.format, to.RowFromTop(row), 0, working, width,
                                 1, quality),
                      PK_Success);
    }
    AlignedPicture sums(working, width, height), result(destination, width, height);
    for (int32_t row = 0; row < height; ++row) {
        for (int32_t sample = 0; sample < 4 * width; ++sample) {
            float total = 0;
            for (size_t first = 0; first < summands.size(); first += 10) {
                float group = 0;
                for (size_t i = first; i < std::min(first + 10, summands.size()); ++i) {
                    const auto weight = static_cast<float>(summands[i].weight);
                    const float product = weight < 8e-6f ? 0.0f : SampleOf(rows[i], row, sample) * weight;
                    group = i == first ? product : group + product;
                }
                total = first == 0 ? group : total + group;
            }
            std::memcpy(sums.RowFromTop(row) + 4 * sample, &total, sizeof total);
        }
        EXPECT_EQ(PK_Convert(sums.RowFromTop(row), 0, working, result.RowFromTop(row), 0, destination, width,
                             1, quality),
                  PK_Success);
    }
    return result;
}

class Accumulate : public testing::Test {
protected:
    Accumulate() { PK::SetCapabilities(PK::ReadProcessor()); }

    PK_PixelFormat DrawFormat() { return PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))]; }

    /// One in eight is left out; 3.1 and 1.7 are no powers of two.
    double DrawWeight() {
        if (fRandom.Below(8) == 0) return fRandom.Below(2) != 0 ? 0.0 : -0.31;
        return static_cast<double>(fRandom.Next()) * 0x1p-32 * (fRandom.Below(2) != 0 ? 0.17 : 3.1);
    }

    std::vector<Summand> Draw(int32_t count, PK_PixelFormat format, int32_t width, int32_t height) {
        std::vector<Summand> summands;
        for (int32_t i = 0; i < count; ++i) {
            summands.push_back(
                {AlignedPicture(format == 0 ? DrawFormat() : format, width, height), DrawWeight()});
            summands.back().picture.FillOrdinary(fRandom);
        }
        return summands;
    }

    void ExpectReference(const std::vector<Summand>& summands, PK_PixelFormat to, int32_t width,
                         int32_t height, int32_t quality) {
        SCOPED_TRACE(testing::Message() << summands.size() << " to 0x" << std::hex << to << std::dec
                                        << ", quality " << quality << ", seed " << fRandom.Seed());
        Sources sources;
        for (const Summand& summand : summands) sources.Add(summand.picture, summand.weight);
        AlignedPicture sum(to, width, height);
        ASSERT_EQ(sources.SumTo(sum, quality), PK_Success);
        EXPECT_EQ("", sum.DifferenceFrom(ReferenceSum(summands, to, width, height, quality)));
    }

    static constexpr PK_PixelFormat kAny = 0;
    FlagScope fFlags;
    Random fRandom{4501};
};

} // namespace

TEST_F(Accumulate, IsTheMeanWhereTheWeightsAddUpToOne) {
    AtEveryTarget([] {
        EXPECT_EQ(SumOf({{{1, 0, 0.5f, 1}, 0.5}, {{0, 0.25f, 1, 0.5f}, 0.5}}),
                  (Floats4{0.5f, 0.125f, 0.75f, 0.75f}));
    });
}

TEST_F(Accumulate, NeitherScalesTheWeightsNorLimitsTheSum) {
    AtEveryTarget([] {
        EXPECT_EQ(SumOf({{{1, 0, -3, 1}, 2.0}, {{1, 0.25f, 1, 1}, 4.0}}), (Floats4{6, 1, -2, 6}));
        EXPECT_EQ(SumOf({{{1, 2, 3, 4}, 0.125}}), (Floats4{0.125f, 0.25f, 0.375f, 0.5f}));
    });
}

TEST_F(Accumulate, LeavesOutWhatWeighsNextToNothing) {
    AtEveryTarget([] {
        const Floats4 awkward = {kInfinity, -kInfinity, std::numeric_limits<float>::quiet_NaN(), 1e30f};
        for (const double weight : {7e-6, 0.0, -0.0, -1.0, -1e300})
            EXPECT_EQ(SumOf({{awkward, weight}, {{1, 2, 3, 4}, 1.0}}), (Floats4{1, 2, 3, 4})) << weight;
        EXPECT_EQ(SumOf({{{1, 2, 3, 4}, 8e-6}})[0], 8e-6f);
        const float zero = SumOf({{awkward, 0.0}, {{-0.0f, 2, 3, 4}, 1.0}})[0];
        EXPECT_FALSE(std::signbit(zero)); // 0 + -0
    });
}

TEST_F(Accumulate, TakesWhatIsNoNumberAsItComes) {
    AtEveryTarget([] {
        const Floats4 sum = SumOf({{{kInfinity, kInfinity, std::numeric_limits<float>::quiet_NaN(), 1}, 0.5},
                                   {{1, -kInfinity, 1, 2}, 0.5}});
        EXPECT_EQ(sum[0], kInfinity);
        EXPECT_TRUE(std::isnan(sum[1]));
        EXPECT_TRUE(std::isnan(sum[2]));
        EXPECT_EQ(sum[3], 1.5f);
    });
}

// 2^24 + 1 + 1 rounds to 2^24 twice over from the left; the second ten add up before they meet the first.
TEST_F(Accumulate, AddsTenByTenFromTheFirstToTheLast) {
    AtEveryTarget([] {
        std::vector<std::pair<Floats4, double>> summands(12, {{1, 1, 1, 1}, 1.0});
        summands[0].first[0] = 0x1p24f;  // + 9 x 1 stays; + (1 + 1) is exact
        summands[9].first[1] = 0x1p24f;  // 9 + 2^24 rounds to 2^24 + 8, + 2 is exact
        summands[10].first[2] = 0x1p24f; // 10 + (2^24 + 1)
        const Floats4 sum = SumOf(summands);
        EXPECT_EQ(sum[0], 0x1p24f + 2);
        EXPECT_EQ(sum[1], 0x1p24f + 10);
        EXPECT_EQ(sum[2], 0x1p24f + 10);
        EXPECT_EQ(sum[3], 12.0f);
    });
}

TEST_F(Accumulate, SumsPremultipliedColours) {
    // A quarter of a red of alpha 127, three quarters of an opaque blue. Premultiplied, blue is 0.75 x 255 and red
    // 0.25 x 127; straight, they are divided by an alpha of 223 of 255.
    const uint8_t red[4] = {0, 0, 255, 127}, blue[4] = {255, 0, 0, 255};
    Sources sources;
    sources.Add(red, 0, PK_PixelFormat_BGRA_4444_8u, 0.25);
    sources.Add(blue, 0, PK_PixelFormat_BGRA_4444_8u, 0.75);
    uint8_t sum[4];
    ASSERT_EQ(sources.SumTo(sum, 0, PK_PixelFormat_BGRP_4444_8u, 1, 1, 4), PK_Success);
    EXPECT_EQ(std::vector<uint8_t>(sum, sum + 4), (std::vector<uint8_t>{191, 0, 32, 223}));
    ASSERT_EQ(sources.SumTo(sum, 0, PK_PixelFormat_BGRA_4444_8u, 1, 1, 4), PK_Success);
    EXPECT_EQ(std::vector<uint8_t>(sum, sum + 4), (std::vector<uint8_t>{219, 0, 36, 223}));
}

// Of black and white, half in linear light is 0.5^0.41666666 = 0.7492 in code: 191 of 255.
TEST_F(Accumulate, SumsInLinearLightAtTheBestQuality) {
    const uint8_t black[4] = {0, 0, 0, 255}, white[4] = {255, 255, 255, 255};
    Sources sources;
    sources.Add(black, 0, PK_PixelFormat_BGRA_4444_8u, 0.5);
    sources.Add(white, 0, PK_PixelFormat_BGRA_4444_8u, 0.5);
    for (const auto& [quality, mean] : {std::pair{4, 128}, {5, 191}, {6, 191}, {-1, 128}}) {
        uint8_t sum[4] = {};
        ASSERT_EQ(sources.SumTo(sum, 0, PK_PixelFormat_BGRX_4444_8u, 1, 1, quality), PK_Success);
        EXPECT_EQ(sum[0], mean) << quality;
        EXPECT_EQ(sum[2], mean) << quality;
    }
}

TEST_F(Accumulate, KeepsEveryPictureUpright) {
    const uint8_t topDown[2][4] = {{128, 235, 128, 235}, {128, 16, 128, 16}}; // white above black
    const uint8_t bottomUp[2][8] = {{0, 0, 0, 255, 0, 0, 0, 255}, {255, 255, 255, 255, 255, 255, 255, 255}};
    Sources sources;
    sources.Add(topDown, 4, PK_PixelFormat_UYVY_422_8u, 0.5);
    sources.Add(bottomUp, 8, PK_PixelFormat_BGRA_4444_8u, 0.5);
    uint8_t packed[2][8] = {}, pairs[2][4] = {};
    ASSERT_EQ(sources.SumTo(packed, 8, PK_PixelFormat_BGRX_4444_8u, 2, 2, 4), PK_Success);
    EXPECT_EQ(packed[0][0], 0);
    EXPECT_EQ(packed[1][0], 255);
    ASSERT_EQ(sources.SumTo(pairs, 4, PK_PixelFormat_UYVY_422_8u, 2, 2, 4), PK_Success);
    EXPECT_EQ(pairs[0][1], 235);
    EXPECT_EQ(pairs[1][1], 16);

    PK::sAllOriginsTopLeft = 1; // white above black meets black above white
    ASSERT_EQ(sources.SumTo(packed, 8, PK_PixelFormat_BGRX_4444_8u, 2, 2, 4), PK_Success);
    EXPECT_NEAR(packed[0][0], 128, 1);
    EXPECT_NEAR(packed[1][0], 128, 1);
}

TEST_F(Accumulate, TakesAnyNumberOfSources) {
    AtEveryTarget([&] {
        for (int32_t count = 0; count <= 33; ++count)
            ExpectReference(Draw(count, kSumFormat, 7, 2), kSumFormat, 7, 2, 4);
        ExpectReference(Draw(200, kSumFormat, 3, 1), kSumFormat, 3, 1, 4);
    });
}

TEST_F(Accumulate, TakesEveryFormatToEveryFormat) {
    for (const PK_PixelFormat to : PK::kRasterFormats)
        for (const PK_PixelFormat from : PK::kRasterFormats)
            for (const int32_t quality : {4, 5}) ExpectReference(Draw(2, from, 9, 2), to, 9, 2, quality);
}

TEST_F(Accumulate, MixesFormatsAtEveryTarget) {
    AtEveryTarget([&] {
        for (const PK_PixelFormat to : PK::kRasterFormats) {
            const auto count = static_cast<int32_t>(1 + fRandom.Below(24));
            ExpectReference(Draw(count, kAny, 19, 3), to, 19, 3, static_cast<int32_t>(fRandom.Below(6)));
        }
    });
}

TEST_F(Accumulate, OfNothingIsTransparentBlack) {
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        AlignedPicture sum(format, 12, 2);
        sum.FillOrdinary(fRandom);
        ASSERT_EQ(PK_Accumulate(nullptr, nullptr, nullptr, nullptr, 0, sum.Pixels(), sum.RowBytes(), format,
                                12, 2, 4),
                  PK_Success);
        EXPECT_EQ("", sum.DifferenceFrom(RowsIn(format, AlignedPicture(kSumFormat, 12, 2), 4)))
            << std::hex << format;
    }
}

TEST_F(Accumulate, WritesIntoAnyOfItsSources) {
    for (const PK_PixelFormat format :
         {kSumFormat, PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_ARGB_4444_15u})
        for (const int32_t count : {1, 2, 10, 11, 25})
            for (int32_t place = 0; place < count; place += 8) {
                SCOPED_TRACE(testing::Message() << std::hex << format << std::dec << ", " << place << " of "
                                                << count << ", seed " << fRandom.Seed());
                std::vector<Summand> summands = Draw(count, format, 13, 3);
                const AlignedPicture expected = ReferenceSum(summands, format, 13, 3, 4);
                Sources sources;
                for (const Summand& summand : summands) sources.Add(summand.picture, summand.weight);
                AlignedPicture& own = summands[static_cast<size_t>(place)].picture;
                ASSERT_EQ(sources.SumTo(own, 4), PK_Success);
                EXPECT_EQ("", own.DifferenceFrom(expected));
            }
}

TEST_F(Accumulate, TouchesItsRowsAlone) {
    AtEveryTarget([&] {
        for (int round = 0; round < 60; ++round) {
            const auto width = static_cast<int32_t>(1 + fRandom.Below(70)),
                       height = static_cast<int32_t>(1 + fRandom.Below(4)),
                       count = static_cast<int32_t>(1 + fRandom.Below(13));
            SCOPED_TRACE(testing::Message()
                         << count << " of " << width << " x " << height << ", seed " << fRandom.Seed());
            const auto draw = [&](PK_PixelFormat format) {
                const auto length = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
                return ImageShape{length, height, fRandom.Below(3) * 5, fRandom.Below(2) != 0,
                                  fRandom.Below(2) != 0 ? Guard::kAfter : Guard::kBefore};
            };
            std::deque<GuardedImage> images;
            std::vector<std::vector<std::vector<uint8_t>>> before;
            Sources sources;
            for (int32_t i = 0; i < count; ++i) {
                const PK_PixelFormat format = DrawFormat();
                const GuardedImage& image = images.emplace_back(draw(format), fRandom);
                before.push_back(image.Rows());
                sources.Add(image.Pixels(), image.RowBytes(), format, DrawWeight());
            }
            const PK_PixelFormat to = DrawFormat();
            const GuardedImage destination(draw(to), fRandom);
            ASSERT_EQ(sources.SumTo(destination.Pixels(), destination.RowBytes(), to, width, height,
                                    static_cast<int32_t>(fRandom.Below(6))),
                      PK_Success);
            for (size_t i = 0; i < images.size(); ++i) images[i].ExpectRows(before[i]);
            destination.ExpectRows(destination.Rows()); // the padding is as it was
        }
    });
}

TEST_F(Accumulate, SumsRowsTooLongForTheStack) {
    ExpectReference(Draw(12, PK_PixelFormat_V210_422_10u, 16400, 1), PK_PixelFormat_BGRA_4444_15u, 16400, 1,
                    4);
}

// 1e-38 x 0.5 is denormal.
TEST_F(Accumulate, SumsInTheFloatingPointModeOfTheCaller) {
    AtEveryTarget([] {
        for (const uint32_t mode : {0u, kFlushToZero}) {
            const FloatEnvironment environment(mode | kExceptionFlags);
            const Floats4 sum = SumOf({{{1e-38f, 1, 2, 3}, 0.5}});
            EXPECT_TRUE(environment.IsAsGiven());
            EXPECT_EQ(sum[0], mode == 0 ? 0.5e-38f : 0.0f);
        }
        const FloatEnvironment environment(kRoundUp | kExceptionFlags);
        EXPECT_EQ(SumOf({{{0x1p24f, 0, 0, 0}, 1.0}, {{1, 0, 0, 0}, 1.0}})[0], 0x1p24f + 2);
        EXPECT_TRUE(environment.IsAsGiven());
    });
}

TEST_F(Accumulate, AllocatesNothingForShortRows) {
    const std::vector<Summand> summands = Draw(5, PK_PixelFormat_BGRA_4444_8u, 1920, 1);
    Sources sources;
    for (const Summand& summand : summands) sources.Add(summand.picture, summand.weight);
    AlignedPicture sum(PK_PixelFormat_BGRA_4444_8u, 1920, 1);
    const int before = AllocationCount();
    ASSERT_EQ(sources.SumTo(sum, 4), PK_Success);
    EXPECT_EQ(AllocationCount(), before);
}

TEST_F(Accumulate, RefusesFormatsTheDestinationFirst) {
    uint8_t pixels[64] = {};
    const auto sum = [&](PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat destination) {
        Sources sources;
        sources.Add(pixels, 16, first, 0.5);
        sources.Add(pixels, 16, second, 0.0);
        return sources.SumTo(pixels, 16, destination, 1, 1, 4);
    };
    const PK_PixelFormat fine = PK_PixelFormat_BGRA_4444_8u;
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0x0d000004}, PK_PixelFormat{0x804}, PK_PixelFormat{0xffffffff}}) {
        EXPECT_EQ(sum(format, fine, fine), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(sum(fine, format, fine), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(sum(format, format, format), PK_ErrBadDstFormat) << std::hex << format;
    }
}

TEST_F(Accumulate, RefusesCountsSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
    const void* images[2] = {pixels, pixels};
    const int32_t rowBytes[2] = {16, 16};
    const PK_PixelFormat formats[2] = {format, format};
    const double weights[2] = {0.5, 0.0};
    const auto sum = [&](int32_t count, int32_t width, int32_t height, void* destination) {
        return PK_Accumulate(images, rowBytes, formats, weights, count, destination, 16, format, width,
                             height, 4);
    };
    EXPECT_EQ(sum(2, 1, 1, pixels), PK_Success);
    EXPECT_EQ(sum(-1, 1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(sum(INT32_MIN, 0, 0, nullptr), PK_ErrFailed);
    EXPECT_EQ(sum(2, -1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(sum(2, 1, -1, pixels), PK_ErrFailed);
    EXPECT_EQ(sum(2, INT32_MAX / 16 + 1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(sum(2, 1, 1, nullptr), PK_ErrFailed);
    EXPECT_EQ(sum(2, 0, 1, nullptr), PK_Success);
    EXPECT_EQ(sum(2, 1, 0, nullptr), PK_Success);
    images[1] = nullptr; // of the source that is left out
    EXPECT_EQ(sum(2, 1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(sum(2, 0, 1, pixels), PK_Success);
    EXPECT_EQ(sum(1, 1, 1, pixels), PK_Success);
    images[1] = pixels;
    for (int null = 0; null < 4; ++null) {
        const auto without = [&](int32_t width) {
            return PK_Accumulate(null == 0 ? nullptr : images, null == 1 ? nullptr : rowBytes,
                                 null == 2 ? nullptr : formats, null == 3 ? nullptr : weights, 2, pixels, 16,
                                 format, width, 1, 4);
        };
        EXPECT_EQ(without(1), PK_ErrFailed) << null;
        EXPECT_EQ(without(0), PK_Success) << null;
    }
}
