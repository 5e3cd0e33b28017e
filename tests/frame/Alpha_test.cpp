// Alpha of whole images, as a caller sees it: formats, sizes, rows and refusals.

#include "support/FloatEnvironment.h"
#include "support/Random.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/PixelKiln.h>

#include <algorithm>
#include <cstring>
#include <gtest/gtest.h>
#include <limits>
#include <vector>

using namespace PKTest;

namespace {

using Bytes = std::vector<uint8_t>;

constexpr int32_t kWidth = 19, kHeight = 3, kPadding = 5;

struct Layout {
    int32_t sampleBytes, alphaOffset, rowLength, step;

    explicit Layout(PK_PixelFormat format)
        : sampleBytes(PK::BytesPerPixel(format) / 4),
          alphaOffset((format & PK::kOrderMask) == PK::kOrderARGB ? 0 : 3 * sampleBytes),
          rowLength(4 * sampleBytes * kWidth), step(rowLength + kPadding) {}

    size_t Size() const { return static_cast<size_t>(step * kHeight); }
    size_t AlphaAt(int32_t row, int32_t column) const {
        return static_cast<size_t>(row * step + column * 4 * sampleBytes + alphaOffset);
    }
};

/// Calls change(place of the alpha sample) for each pixel.
template <class Change>
void ForEachAlpha(const Layout& layout, Change change) {
    for (int32_t row = 0; row < kHeight; ++row)
        for (int32_t column = 0; column < kWidth; ++column) change(layout.AlphaAt(row, column));
}

Bytes BytesOf(PK_PixelFormat format, float full, float value) {
    Bytes bytes(static_cast<size_t>(PK::BytesPerPixel(format) / 4));
    const auto code = static_cast<uint16_t>(value * full);
    if (bytes.size() == 4)
        std::memcpy(bytes.data(), &value, 4);
    else
        std::memcpy(bytes.data(), &code, bytes.size());
    return bytes;
}

float FullOf(PK_PixelFormat format) {
    return (format & PK::kDepthMask) == PK::kDepth8u ? 255.0f : 32768.0f;
}

bool IsOneOf(PK_PixelFormat format, std::initializer_list<PK_PixelFormat> formats) {
    return std::find(formats.begin(), formats.end(), format) != formats.end();
}

bool CanSetAlpha(PK_PixelFormat format) {
    return IsOneOf(format, {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u,
                            PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_32f,
                            PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_VUYA_4444_32f,
                            PK_PixelFormat_ARGB_4444_32f, PK_PixelFormat_ARGB_4444_32f_Linear});
}

} // namespace

TEST(SetAlphaChannel, SetsTheListedFormatsAndRefusesAllOthers) {
    Random random(71);
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        for (const bool opaque : {false, true}) {
            SCOPED_TRACE(PK_PixelFormatName(format));
            const Layout layout(format);
            Bytes image = random.Bytes(std::max<size_t>(layout.Size(), 64)), expected = image;
            if (!CanSetAlpha(format)) {
                EXPECT_EQ(PK_SetAlphaChannel(1, 1, image.data(), 64, format, opaque), PK_ErrNotSupported);
                EXPECT_EQ(PK_SetAlphaChannel(-1, 1, nullptr, 64, format, opaque), PK_ErrNotSupported);
                EXPECT_EQ(image, expected);
                continue;
            }
            const Bytes alpha = BytesOf(format, FullOf(format), opaque ? 1.0f : 0.0f);
            ForEachAlpha(layout,
                         [&](size_t at) { std::copy(alpha.begin(), alpha.end(), expected.data() + at); });
            uint8_t* last = image.data() + layout.step * (kHeight - 1);
            const bool upwards = random.Below(2) == 0;
            EXPECT_EQ(PK_SetAlphaChannel(kWidth, kHeight, upwards ? last : image.data(),
                                         upwards ? -layout.step : layout.step, format, opaque),
                      PK_Success);
            EXPECT_EQ(image, expected);
        }
    }
}

TEST(SetAlphaChannel, RefusesImpossibleArguments) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
    EXPECT_EQ(PK_SetAlphaChannel(1, 1, nullptr, 4, kBGRA, true), PK_ErrFailed);
    EXPECT_EQ(PK_SetAlphaChannel(-1, 1, pixel, 4, kBGRA, true), PK_ErrFailed);
    EXPECT_EQ(PK_SetAlphaChannel(0x08000000, 1, pixel, 4, kBGRA, true), PK_ErrFailed);
    EXPECT_EQ(PK_SetAlphaChannel(1, -1, pixel, 4, kBGRA, true), PK_ErrFailed);
    EXPECT_EQ(PK_SetAlphaChannel(0, 1, nullptr, 4, kBGRA, true), PK_Success);
    EXPECT_EQ(PK_SetAlphaChannel(1, 0, nullptr, 4, kBGRA, true), PK_Success);
    EXPECT_EQ(PK_SetAlphaChannel(0, -1, pixel, 4, kBGRA, true), PK_ErrFailed);
    EXPECT_EQ(PK_SetAlphaChannel(1, 1, pixel, 4, PK_PixelFormat_YUV_420_MPEG2_FRAME, true),
              PK_ErrNotSupported);
    EXPECT_EQ(pixel[3], 4);
}

TEST(InvertAlpha, WritesTheInverseOfTheSourceAndLeavesColour) {
    Random random(72);
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format));
        const Layout layout(format);
        const Bytes source = random.Bytes(std::max<size_t>(layout.Size(), 64));
        Bytes image = random.Bytes(source.size()), expected = image;
        if (!PK::IsPacked4444(format)) {
            EXPECT_EQ(PK_InvertAlpha(source.data(), 64, image.data(), 64, format, 1, 1), PK_ErrBadSrcFormat);
            EXPECT_EQ(image, expected);
            continue;
        }
        Bytes alphas = source;
        ForEachAlpha(layout, [&](size_t at) {
            uint16_t code = 0;
            float value = static_cast<float>(random.Below(100)) * 0.01f;
            if (layout.sampleBytes == 4) {
                std::memcpy(alphas.data() + at, &value, 4);
                value = 1.0f - value;
                std::memcpy(expected.data() + at, &value, 4);
                return;
            }
            std::memcpy(&code, source.data() + at, static_cast<size_t>(layout.sampleBytes));
            code = static_cast<uint16_t>((layout.sampleBytes == 1 ? 255 : 32768) - code);
            std::memcpy(expected.data() + at, &code, static_cast<size_t>(layout.sampleBytes));
        });
        const int32_t last = layout.step * (kHeight - 1);
        EXPECT_EQ(PK_InvertAlpha(alphas.data() + last, -layout.step, image.data() + last, -layout.step,
                                 format, kWidth, kHeight),
                  PK_Success);
        EXPECT_EQ(image, expected);
    }
}

TEST(InvertAlpha, RefusesImpossibleArguments) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
    EXPECT_EQ(PK_InvertAlpha(nullptr, 4, pixel, 4, kBGRA, 1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, nullptr, 4, kBGRA, 1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, pixel, 4, kBGRA, -1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, pixel, 4, kBGRA, INT32_MAX, 1), PK_ErrFailed);
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, pixel, 4, kBGRA, 1, -1), PK_ErrFailed);
    EXPECT_EQ(PK_InvertAlpha(nullptr, 4, nullptr, 4, kBGRA, 0, 1), PK_Success);
    EXPECT_EQ(PK_InvertAlpha(nullptr, 4, nullptr, 4, kBGRA, 1, 0), PK_Success);
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, pixel, 4, 0x44, 1, 1), PK_ErrBadSrcFormat);       // 10 bits
    EXPECT_EQ(PK_InvertAlpha(pixel, 4, pixel, 4, 0x01000004, 1, 1), PK_ErrBadSrcFormat); // a stream
    EXPECT_EQ(pixel[3], 4);
}

TEST(CopyAndSetAlpha, CopiesColourWithOneAlpha) {
    Random random(73);
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format));
        const Layout layout(format);
        const Bytes source = random.Bytes(std::max<size_t>(layout.Size(), 64));
        Bytes image(source.size(), 0x5a), expected = image;
        const bool isARGB = (format & PK::kOrderMask) == PK::kOrderARGB;
        if (!PK::IsPacked4444(format) || (isARGB && (format & PK::kDepthMask) != PK::kDepth8u)) {
            EXPECT_EQ(PK_CopyAndSetAlpha(source.data(), 64, image.data(), 64, format, 1, 1, 0.5f),
                      PK_ErrNotSupported);
            EXPECT_EQ(image, expected);
            continue;
        }
        for (int32_t row = 0; row < kHeight; ++row)
            std::copy_n(source.data() + row * layout.step, layout.rowLength,
                        expected.data() + row * layout.step);
        const uint16_t words = 6554; // 6553.6
        Bytes alpha = BytesOf(format, FullOf(format), 0.2f);
        if (alpha.size() == 2) std::memcpy(alpha.data(), &words, 2);
        Bytes inPlace = source, expectedInPlace = source;
        ForEachAlpha(layout, [&](size_t at) {
            std::copy(alpha.begin(), alpha.end(), expected.data() + at);
            std::copy(alpha.begin(), alpha.end(), expectedInPlace.data() + at);
        });
        const auto copy = [&](const Bytes& from, Bytes& to) {
            return PK_CopyAndSetAlpha(from.data(), layout.step, to.data(), layout.step, format, kWidth,
                                      kHeight, 0.2f);
        };
        EXPECT_EQ(copy(source, image), PK_Success);
        EXPECT_EQ(image, expected);
        EXPECT_EQ(copy(inPlace, inPlace), PK_Success);
        EXPECT_EQ(inPlace, expectedInPlace);
    }
}

TEST(CopyAndSetAlpha, RoundsToNearestAndLimits) {
    constexpr float kInfinity = std::numeric_limits<float>::infinity();
    struct {
        float alpha;
        uint8_t code8;
        uint16_t code15;
    } const cases[] = {{0, 0, 0},
                       {1, 255, 32768},
                       {0.5f, 128, 16384}, // 127.5: to even
                       {0.1f, 26, 3277},   // 25.5, a little above in float; 3276.8
                       {0x1p-16f, 0, 0},   // half of a 15-bit code: to even
                       {0x1.8p-15f, 0, 2}, // one and a half
                       {-0.5f, 0, 0},
                       {2, 255, 32768},
                       {kInfinity, 255, 32768},
                       {-kInfinity, 0, 0},
                       {std::numeric_limits<float>::quiet_NaN(), 0, 0}};
    for (const auto& [alpha, code8, code15] : cases) {
        const uint16_t source[4] = {};
        uint8_t bytes[4];
        uint16_t words[4];
        ASSERT_EQ(PK_CopyAndSetAlpha(source, 4, bytes, 4, PK_PixelFormat_BGRA_4444_8u, 1, 1, alpha),
                  PK_Success);
        EXPECT_EQ(bytes[3], code8) << alpha;
        ASSERT_EQ(PK_CopyAndSetAlpha(source, 4, bytes, 4, PK_PixelFormat_PRGB_4444_8u, 1, 1, alpha),
                  PK_Success);
        EXPECT_EQ(bytes[0], code8) << alpha;
        ASSERT_EQ(PK_CopyAndSetAlpha(source, 8, words, 8, PK_PixelFormat_BGRX_4444_15u, 1, 1, alpha),
                  PK_Success);
        EXPECT_EQ(words[3], code15) << alpha;
        float floats[4];
        const float zeros[4] = {};
        ASSERT_EQ(PK_CopyAndSetAlpha(zeros, 16, floats, 16, PK_PixelFormat_VUYA_4444_32f_709, 1, 1, alpha),
                  PK_Success);
        EXPECT_EQ(std::memcmp(&floats[3], &alpha, 4), 0) << alpha;
    }
}

TEST(CopyAndSetAlpha, RoundsAsTheCallerDoes) {
    const uint8_t source[4] = {};
    uint8_t pixel[4];
    struct {
        uint32_t mode;
        uint8_t code;
    } const cases[] = {{kRoundDown, 127}, {kRoundUp, 128}, {kRoundToZero, 127}};
    for (const auto& [mode, code] : cases) {
        const FloatEnvironment environment(mode | kExceptionFlags);
        PK_CopyAndSetAlpha(source, 4, pixel, 4, PK_PixelFormat_BGRA_4444_8u, 1, 1, 0.5f);
        EXPECT_TRUE(environment.IsAsGiven());
        EXPECT_EQ(pixel[3], code);
    }
}

// The product with 255 is denormal too, and above 0.
TEST(CopyAndSetAlpha, DenormalAlphaIsNotNothing) {
    const uint8_t source[4] = {};
    uint8_t pixel[4];
    const FloatEnvironment environment(kRoundUp);
    PK_CopyAndSetAlpha(source, 4, pixel, 4, PK_PixelFormat_BGRA_4444_8u, 1, 1, 1e-45f);
    EXPECT_EQ(pixel[3], 1);
}

TEST(CopyAndSetAlpha, DoesNothingBelowOnePixelAndRefusesNull) {
    uint8_t pixel[4] = {1, 2, 3, 4};
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
    EXPECT_EQ(PK_CopyAndSetAlpha(nullptr, 4, nullptr, 4, kBGRA, 0, 1, 1), PK_Success);
    EXPECT_EQ(PK_CopyAndSetAlpha(pixel, 4, pixel, 4, kBGRA, -1, 1, 1), PK_Success);
    EXPECT_EQ(PK_CopyAndSetAlpha(pixel, 4, pixel, 4, kBGRA, 1, -5, 1), PK_Success);
    EXPECT_EQ(PK_CopyAndSetAlpha(nullptr, 4, pixel, 4, kBGRA, 1, 1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_CopyAndSetAlpha(pixel, 4, nullptr, 4, kBGRA, 1, 1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_CopyAndSetAlpha(pixel, 4, pixel, 4, kBGRA, INT32_MAX, 1, 1), PK_ErrFailed);
    EXPECT_EQ(PK_CopyAndSetAlpha(pixel, 4, pixel, 4, 0x01000004, 1, 1, 1), PK_ErrNotSupported);
    EXPECT_EQ(pixel[3], 4);
}

TEST(Alpha, LeavesTheFloatingPointModeAsItWas) {
    float pixel[4] = {1, 2, 3, 0.3f};
    for (const uint32_t bits : {0u, kRoundUp, kFlushToZero | kDenormalsAreZero}) {
        const FloatEnvironment environment(bits | kExceptionFlags);
        PK_InvertAlpha(pixel, 16, pixel, 16, PK_PixelFormat_BGRA_4444_32f, 1, 1);
        EXPECT_TRUE(environment.IsAsGiven());
        PK_CopyAndSetAlpha(pixel, 16, pixel, 16, PK_PixelFormat_BGRA_4444_8u, 4, 1, 0.3f);
        EXPECT_TRUE(environment.IsAsGiven());
        PK_SetAlphaChannel(1, 1, pixel, 16, PK_PixelFormat_BGRA_4444_32f, true);
        EXPECT_TRUE(environment.IsAsGiven());
    }
}
