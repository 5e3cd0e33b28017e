// PK_UnPremultiplyAgainstMatteColor: what is left of each pixel without the share of the matte.

#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Matte.h>

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kBGRP = PK_PixelFormat_BGRP_4444_8u;
using Codes = std::vector<uint8_t>;

class Matte : public testing::Test {
protected:
    Matte() { PK::SetCapabilities(PK::ReadProcessor()); }

    template <class Sample, size_t kCount>
    static std::vector<Sample> Without(PK_PixelFormat format, const Sample (&pixels)[kCount],
                                       const void* matte, PK_PixelFormat matteFormat) {
        std::vector<Sample> result(kCount);
        EXPECT_EQ(PK_UnPremultiplyAgainstMatteColor(pixels, 0, result.data(), 0, format, kCount / 4, 1, matte,
                                                    matteFormat, 4),
                  PK_Success);
        return result;
    }

    FlagScope fFlags;
    Random fRandom{1007};
};

/// One sample without a share.
template <class Sample>
Sample Less(Sample sample, Sample share) {
    return share > sample ? Sample{} : static_cast<Sample>(sample - share);
}

/// A pixel by way of one-pixel conversions.
template <class Sample>
void ExpectedPixel(PK_PixelFormat format, const Sample* pixel, const Sample* matte, Sample full,
                   Sample* result) {
    const size_t alpha = (format & 0x1000) != 0 ? 0 : 3;
    const PK_PixelFormat straight = (format & ~0xcu) | 4, premultiplied = (format & ~0xcu) | 8;
    Sample complement[4], share[4], left[4];
    std::memcpy(complement, matte, sizeof complement);
    complement[alpha] = static_cast<Sample>(full - pixel[alpha]);
    ASSERT_EQ(PK_Convert(complement, 0, straight, share, 0, premultiplied, 1, 1, 4), PK_Success);
    for (size_t i = 0; i < 4; ++i) left[i] = i == alpha ? pixel[i] : Less(pixel[i], share[i]);
    ASSERT_EQ(PK_Convert(left, 0, premultiplied, result, 0, format, 1, 1, 4), PK_Success);
}

template <class Sample>
void Check(PK_PixelFormat format, Sample full, Random& random) {
    const auto width = static_cast<int32_t>(random.Below(40)),
               height = static_cast<int32_t>(1 + random.Below(3));
    const size_t length = static_cast<size_t>(width) * 4 * sizeof(Sample);
    SCOPED_TRACE(testing::Message() << std::hex << format << std::dec << ", " << width << " x " << height
                                    << ", seed " << random.Seed());
    Sample matte[4];
    FillOrdinarySamples(format, reinterpret_cast<uint8_t*>(matte), sizeof matte, random);
    const GuardedImage source({length, height, 4 * sizeof(Sample), random.Below(2) != 0}, random),
        destination({length, height, 0, random.Below(2) != 0}, random);
    std::vector<Codes> expected;
    for (int32_t row = 0; row < height; ++row) {
        FillOrdinarySamples(format, source.Row(row), length, random);
        std::vector<Sample> pixels(static_cast<size_t>(width) * 4), result(pixels.size());
        std::memcpy(pixels.data(), source.Row(row), length);
        for (size_t i = 0; i < pixels.size(); i += 4)
            ASSERT_NO_FATAL_FAILURE(ExpectedPixel(format, &pixels[i], matte, full, &result[i]));
        const auto* bytes = reinterpret_cast<const uint8_t*>(result.data());
        expected.emplace_back(bytes, bytes + length);
    }
    ASSERT_EQ(PK_UnPremultiplyAgainstMatteColor(source.Pixels(), source.RowBytes(), destination.Pixels(),
                                                destination.RowBytes(), format, width, height, matte, format,
                                                4),
              PK_Success);
    destination.ExpectRows(expected);
    Codes inPlace(length * static_cast<size_t>(height)), before;
    for (int32_t row = 0; row < height; ++row)
        std::memcpy(inPlace.data() + static_cast<size_t>(row) * length, source.Row(row), length);
    ASSERT_EQ(PK_UnPremultiplyAgainstMatteColor(inPlace.data(), static_cast<int32_t>(length), inPlace.data(),
                                                static_cast<int32_t>(length), format, width, height, matte,
                                                format, 4),
              PK_Success);
    for (int32_t row = 0; row < height; ++row) {
        const auto* first = inPlace.data() + static_cast<size_t>(row) * length;
        ASSERT_EQ(Codes(first, first + length), expected[static_cast<size_t>(row)]) << "in place";
    }
}

} // namespace

// Half of the matte 100, 200, 40: 127 / 255 of it is 49.8, 99.6, 19.9.
TEST_F(Matte, PremultipliedByHand) {
    const uint8_t matte[4] = {100, 200, 40, 255};
    EXPECT_EQ((Without<uint8_t>(kBGRP, {150, 90, 20, 128, 10, 20, 30, 255, 100, 200, 40, 0}, matte, kBGRA)),
              (Codes{100, 0, 0, 128, 10, 20, 30, 255, 0, 0, 0, 0}));
}

// (150 - 50) x 255 / 128 = 199.2
TEST_F(Matte, StraightColourIsUnpremultiplied) {
    const uint8_t matte[4] = {100, 200, 40, 255};
    EXPECT_EQ((Without<uint8_t>(kBGRA, {150, 90, 20, 128, 10, 20, 30, 255}, matte, kBGRA)),
              (Codes{199, 0, 0, 128, 10, 20, 30, 255}));
}

TEST_F(Matte, BlackLeavesPremultipliedPixelsAndOpaqueOnes) {
    const uint8_t black[4] = {0, 0, 0, 255};
    EXPECT_EQ((Without<uint8_t>(kBGRP, {50, 60, 70, 128, 1, 2, 3, 0}, black, kBGRA)),
              (Codes{50, 60, 70, 128, 1, 2, 3, 0}));
    EXPECT_EQ((Without<uint8_t>(kBGRA, {50, 60, 70, 255}, black, kBGRA)), (Codes{50, 60, 70, 255}));
}

TEST_F(Matte, FullAlphaOf15BitsHasNoShare) {
    const uint16_t matte[4] = {32768, 32768, 32768, 32768};
    EXPECT_EQ((Without<uint16_t>(PK_PixelFormat_BGRP_4444_15u, {5, 600, 7000, 32768}, matte,
                                 PK_PixelFormat_BGRA_4444_15u)),
              (std::vector<uint16_t>{5, 600, 7000, 32768}));
}

TEST_F(Matte, TheColourMayHaveAnotherFormat) {
    const uint8_t uyvy[4] = {128, 235, 128, 235}; // white
    EXPECT_EQ((Without<uint8_t>(kBGRP, {200, 100, 255, 155}, uyvy, PK_PixelFormat_UYVY_422_8u)),
              (Codes{100, 0, 155, 155}));
}

TEST_F(Matte, EveryFormatAtEveryTarget) {
    AtEveryTarget([&] {
        for (const PK_PixelFormat alpha : {4u, 8u})
            for (const PK_PixelFormat order : {0u, 0x1000u})
                for (int round = 0; round < 8; ++round) {
                    ASSERT_NO_FATAL_FAILURE(Check<uint8_t>(alpha | order, 255, fRandom));
                    ASSERT_NO_FATAL_FAILURE(Check<uint16_t>(alpha | order | 0x80, 32768, fRandom));
                    ASSERT_NO_FATAL_FAILURE(Check<float>(alpha | order | 0x100, 1, fRandom));
                    ASSERT_NO_FATAL_FAILURE(Check<float>(alpha | order | 0x102, 1, fRandom));
                }
    });
}

TEST_F(Matte, RefusesFormats) {
    uint8_t pixels[64] = {};
    int32_t served = 0;
    const auto result = [&](PK_PixelFormat format, PK_PixelFormat matte) {
        return PK_UnPremultiplyAgainstMatteColor(pixels, 16, pixels, 16, format, 1, 1, pixels + 32, matte, 4);
    };
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        const bool isServed = (format & 0x31) == 0 && ((format & 0xc) == 4 || (format & 0xc) == 8);
        EXPECT_EQ(result(format, kBGRA), isServed ? PK_Success : PK_ErrBadSrcFormat) << std::hex << format;
        served += isServed;
    }
    EXPECT_EQ(served, 16); // two alphas and two orders at 8u, 15u, 32f and in linear light
    for (const PK_PixelFormat format :
         {PK_PixelFormat_NTSCDV25, PK_PixelFormat_Invalid, PK_PixelFormat{0xffffffff}}) {
        EXPECT_EQ(result(format, kBGRA), PK_ErrBadSrcFormat);
        EXPECT_NE(result(kBGRA, format), PK_Success);
    }
}

TEST_F(Matte, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    const auto result = [&](const void* source, void* destination, int32_t width, int32_t height,
                            const void* matte) {
        return PK_UnPremultiplyAgainstMatteColor(source, 8, destination, 8, kBGRA, width, height, matte,
                                                 kBGRA, 4);
    };
    EXPECT_EQ(result(pixels, pixels, -1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(result(nullptr, pixels, 1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(result(pixels, nullptr, 1, 1, pixels), PK_ErrFailed);
    EXPECT_EQ(result(pixels, pixels, 1, 1, nullptr), PK_ErrFailed);
    EXPECT_EQ(result(nullptr, nullptr, 0, 1, pixels), PK_Success);
    EXPECT_EQ(result(nullptr, nullptr, 1, 0, pixels), PK_Success);
    EXPECT_EQ(result(pixels, pixels, 1, -1, pixels), PK_ErrFailed);
}
