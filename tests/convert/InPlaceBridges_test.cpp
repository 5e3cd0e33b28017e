// The bridges that work in their one buffer.

#include "reference/ReferenceBridges.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>

#include <bit>
#include <cmath>
#include <cstring>
#include <functional>
#include <limits>

using namespace PKTest;

namespace {

using InPlace = std::function<PK_Result(void*, int32_t, int32_t, int32_t)>;

const struct {
    const char* name;
    InPlace convert;
    size_t pixelBytes;
    std::function<Bytes(const Bytes&, int)> reference;
} kExact[] = {
    {"offset", PK_Convert_j2k_UYVY_422_32f_Offset_In_Place, 8, ReferenceOffsetUYVY32f},
    {"halve",
     [](void* b, int32_t r, int32_t w, int32_t h) { return PK_Scale16uBufferTo15uSIMD(b, r, w, h, false); },
     8, [](const Bytes& row, int width) { return ReferenceHalve16(row, width, false); }},
    {"swap and halve",
     [](void* b, int32_t r, int32_t w, int32_t h) { return PK_Scale16uBufferTo15uSIMD(b, r, w, h, true); }, 8,
     [](const Bytes& row, int width) { return ReferenceHalve16(row, width, true); }},
};

bool IsNaN(const uint8_t* sample) {
    float value;
    std::memcpy(&value, sample, sizeof value);
    return std::isnan(value);
}

/// Random bytes make NaN, whose bits an addition may change: those become 0.25.
void RemoveNaN(const GuardedImage& image, int32_t height, size_t rowLength) {
    const float quarter = 0.25f;
    for (int32_t row = 0; row < height; ++row)
        for (size_t i = 0; i < rowLength; i += 4)
            if (IsNaN(image.Row(row) + i)) std::memcpy(image.Row(row) + i, &quarter, sizeof quarter);
}

float Sample(const GuardedImage& image, size_t index) {
    float value;
    std::memcpy(&value, image.Pixels() + 4 * index, sizeof value);
    return value;
}

} // namespace

TEST(InPlaceBridges, GiveWhatTheRuleSays) {
    Random random(43);
    for (const auto& bridge : kExact)
        for (int width = 1; width <= 70; ++width) {
            SCOPED_TRACE(testing::Message() << bridge.name << " " << width << ", seed " << random.Seed());
            const int32_t height = 1 + static_cast<int32_t>(random.Below(3));
            const size_t rowLength = bridge.pixelBytes * static_cast<size_t>(width);
            const GuardedImage image(
                {rowLength, height, random.Below(2) * random.Below(40), random.Below(2) == 0}, random);
            AtEveryTarget([&] {
                image.Restore();
                RemoveNaN(image, height, rowLength);
                std::vector<Bytes> expected;
                for (int32_t row = 0; row < height; ++row)
                    expected.push_back(bridge.reference(image.RowContent(row), width));
                ASSERT_EQ(bridge.convert(image.Pixels(), image.RowBytes(), width, height), PK_Success);
                image.ExpectRows(expected);
            });
        }
}

TEST(InPlaceBridges, SucceedWithoutWorkAndRefuseWhatTheyCannotKnow) {
    float pixels[8] = {};
    std::vector<InPlace> all = {PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place};
    for (const auto& bridge : kExact) all.push_back(bridge.convert);
    for (const InPlace& convert : all) {
        EXPECT_EQ(convert(nullptr, 16, 1, 0), PK_Success);
        EXPECT_EQ(convert(nullptr, 16, 1, -1), PK_Success);
        EXPECT_EQ(convert(nullptr, 16, 0, 1), PK_Success);
        EXPECT_EQ(convert(nullptr, 16, 1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(pixels, 16, -1, 1), PK_ErrFailed);
        EXPECT_EQ(convert(pixels, 16, INT32_MAX, 1), PK_ErrFailed);
    }
}

TEST(UYVYOffset, MovesChromaAndKeepsTheBitsOfLuma) {
    float samples[8] = {0.5f, -0.0f, 1.0f, 0.25f, 0.0f, 7.0f, 0.75f, 9.0f};
    ASSERT_EQ(PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(samples, 32, 3, 1), PK_Success);
    const float expected[8] = {0.0f, -0.0f, 0.5f, 0.25f, -0.5f, 7.0f, 0.75f, 9.0f};
    EXPECT_EQ(std::memcmp(samples, expected, sizeof samples), 0) << "the third pixel has U and Y alone";
}

TEST(Scale16uTo15u, IsTheTruncatedAndTheRoundedRuleForAllCodes) {
    std::vector<uint16_t> codes(65536);
    for (uint32_t c = 0; c < 65536; ++c) codes[c] = static_cast<uint16_t>(c);
    ASSERT_EQ(PK_Scale16uBufferTo15uSIMD(codes.data(), 131072, 16384, 1, false), PK_Success);
    for (uint32_t c = 0; c < 65536; ++c) {
        ASSERT_EQ(codes[c], ((c << 15) | 0x7fff) / 65535) << c;
        ASSERT_EQ(codes[c], std::lrint(static_cast<float>(c) * 0.50000304f)) << c;
    }
}

TEST(Scale16uTo15u, ExchangesBytesBeforeItScales) {
    uint16_t pixel[4] = {0xff00, 0x00ff, 0xffff, 0x0200};
    ASSERT_EQ(PK_Scale16uBufferTo15uSIMD(pixel, 8, 1, 1, true), PK_Success);
    EXPECT_EQ(pixel[0], 128);
    EXPECT_EQ(pixel[1], 32640);
    EXPECT_EQ(pixel[2], 32768);
    EXPECT_EQ(pixel[3], 1);
}

TEST(ZYXToBGR, GivesTheWhiteOfEqualEnergy) {
    float pixels[8] = {1, 1, 1, 0.125f, -1, -1, -1, 5};
    ASSERT_EQ(PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(pixels, 32, 2, 1), PK_Success);
    // 0.9088427, 0.9483008 and 1.2047843 to the power 0.41666666
    const float expected[8] = {0.9609563f,  0.9781247f,  1.0807176f,  0.125f,
                               -0.9609563f, -0.9781247f, -1.0807176f, 5};
    for (size_t i = 0; i < 8; ++i) EXPECT_NEAR(pixels[i], expected[i], 2e-7f) << i;
}

TEST(ZYXToBGR, IsTheMatrixBetweenTwoSignedPowers) {
    Random random(44);
    for (int width = 1; width <= 40; ++width) {
        SCOPED_TRACE(testing::Message() << width << ", seed " << random.Seed());
        const size_t samples = 4 * static_cast<size_t>(width);
        const GuardedImage image({4 * samples, 1, 0, false}, random);
        std::vector<float> before;
        for (size_t i = 0; i < samples; ++i)
            before.push_back(static_cast<float>(static_cast<int32_t>(random.Next())) * 0x1p-30f); // -2 to 2
        Bytes plain;
        AtEveryTarget([&] {
            std::memcpy(image.Pixels(), before.data(), 4 * samples);
            ASSERT_EQ(
                PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(image.Pixels(), image.RowBytes(), width, 1),
                PK_Success);
            if (plain.empty()) plain = image.RowContent(0);
            ASSERT_EQ(plain, image.RowContent(0)) << "all bodies agree to the bit";
        });
        for (size_t i = 0; i < samples; i += 4) {
            const LinearBGR linear = ReferenceLinearBGR(&before[i]);
            for (size_t c = 0; c < 3; ++c) {
                const long double result = Sample(image, i + c);
                const long double back = std::copysign(std::pow(std::abs(result), 1 / 0.41666666L), result);
                ASSERT_NEAR(static_cast<double>(back), static_cast<double>(linear.values[c]),
                            static_cast<double>(linear.terms[c]) * 5e-7);
            }
            ASSERT_EQ(Sample(image, i + 3), before[i + 3]);
        }
    }
}

// 2e-15 to the power 2.6 is 5.8e-39, which is denormal.
TEST(ZYXToBGR, KeepsDenormalIntermediates) {
    AtEveryTarget([] {
        float pixels[4] = {2e-15f, 2e-15f, 2e-15f, 1};
        const FloatEnvironment environment(0);
        ASSERT_EQ(PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(pixels, 16, 1, 1), PK_Success);
        EXPECT_NEAR(pixels[0], 1.145e-16, 1e-19);
        EXPECT_NEAR(pixels[1], 1.165e-16, 1e-19);
        EXPECT_NEAR(pixels[2], 1.288e-16, 1e-19);
    });
}

TEST(ZYXToBGR, AllBodiesAgreeOnSmallNumbersInEveryMode) {
    Random random(46);
    constexpr size_t kSamples = 4 * 1001;
    std::vector<float> before;
    for (size_t i = 0; i < kSamples; ++i) { // below 2^-27, three in ten denormal
        const uint32_t exponent = random.Below(10) < 3 ? 0 : 1 + random.Below(99);
        before.push_back(std::bit_cast<float>((random.Next() & 0x807fffff) | exponent << 23));
    }
    for (const uint32_t mode : {0u, kRoundUp, kFlushToZero, kDenormalsAreZero}) {
        SCOPED_TRACE(testing::Message() << "mode " << mode << ", seed " << random.Seed());
        std::vector<uint32_t> plain;
        AtEveryTarget([&] {
            std::vector<float> pixels = before;
            {
                const FloatEnvironment environment(mode);
                ASSERT_EQ(PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(pixels.data(), 0, 1001, 1),
                          PK_Success);
            }
            std::vector<uint32_t> bits(kSamples);
            std::memcpy(bits.data(), pixels.data(), 4 * kSamples);
            if (plain.empty()) plain = bits;
            ASSERT_EQ(plain, bits);
        });
    }
}

TEST(ZYXToBGR, SurvivesAnyFloatAndLeavesTheFloatingPointMode) {
    Random random(45);
    const GuardedImage image({16 * 1001, 1, 0, false}, random);
    const FloatEnvironment environment(kExceptionFlags);
    ASSERT_EQ(PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(image.Pixels(), image.RowBytes(), 1001, 1),
              PK_Success);
    ASSERT_EQ(PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(image.Pixels(), image.RowBytes(), 2002, 1),
              PK_Success);
    EXPECT_TRUE(environment.IsAsGiven());
    float infinite[4] = {0, std::numeric_limits<float>::infinity(), 0, 1};
    ASSERT_EQ(PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(infinite, 16, 1, 1), PK_Success);
    EXPECT_EQ(infinite[0], -std::numeric_limits<float>::infinity());
    EXPECT_EQ(infinite[1], std::numeric_limits<float>::infinity());
}
