// PK_CompositeWithBlendMode: the kernels of the modes against the rules written out and against textbook values, and the
// operation around them.

#include "composite/BlendChoice.h"
#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "reference/ReferenceBlend.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdlib>
#include <vector>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kFloats = PK_PixelFormat_BGRA_4444_32f, kBGRA = PK_PixelFormat_BGRA_4444_8u;
constexpr int32_t kModes = 27, kQuality = 4;
using Pixel = std::array<float, 4>;
using Codes = std::vector<uint8_t>;

class BlendBodies : public TargetTest {
protected:
    Random fRandom{1004};
};

class BlendModes : public testing::Test {
protected:
    BlendModes() { PK::SetCapabilities(PK::ReadProcessor()); }

    static Pixel Blended(PK_BlendMode mode, const Pixel& top, const Pixel& back, float opacity = 1) {
        Pixel result;
        EXPECT_EQ(PK_CompositeWithBlendMode(top.data(), 0, kFloats, back.data(), 0, kFloats, result.data(), 0,
                                            kFloats, 1, 1, opacity, mode, kQuality, false),
                  PK_Success);
        return result;
    }
    /// One channel of opaque pixels.
    static float Channel(PK_BlendMode mode, float s, float b) {
        return Blended(mode, {s, 0, 0, 1}, {b, 0, 0, 1})[0];
    }

    FlagScope fFlags;
    Random fRandom{1005};
};

/// Samples in and around 0 to 1, with equal channels and all kinds of alpha.
void FillForBlending(std::vector<float>& row, Random& random) {
    constexpr float kOdd[] = {0,        -0.0f,     1,     0.5f, 1e-7f, 1e-6f,
                              0.99999f, 0.999999f, 8e-6f, 1.5f, -0.5f, 1e-8f};
    for (float& x : row)
        x = random.Below(4) ? static_cast<float>(random.Next()) * 0x1p-32f : kOdd[random.Below(12)];
    for (size_t i = 0; i < row.size(); i += 4) {
        const uint32_t kind = random.Below(8);
        if (kind < 3) row[i + kind] = row[i + (kind + 1) % 3];
        if (kind == 3) row[i] = row[i + 1] = row[i + 2];
        if (random.Below(3) == 0) row[i + 3] = static_cast<float>(random.Below(2));
    }
}

} // namespace

INSTANTIATE_TEST_SUITE_P(Targets, BlendBodies, EveryTarget(), TargetOf);

TEST_P(BlendBodies, FollowTheRulesToTheBit) {
    constexpr int32_t kWidth = 700;
    std::vector<float> top(kWidth * 4), back(top.size()), expected(top.size()), actual(top.size());
    const auto bytes = [](std::vector<float>& row) { return reinterpret_cast<uint8_t*>(row.data()); };
    for (int32_t mode = 0; mode < kModes; ++mode) {
        if (mode == PK_BlendMode_Dissolve) continue;
        const PK::MixKernel kernel = PK::SelectBlendKernel(mode);
        for (const float opacity : {1.0f, 0.4f, 0.0f, 1.5f, -0.5f, 7e-6f})
            for (const int32_t width : {kWidth, 720, 721}) {
                top.resize(static_cast<size_t>(width) * 4);
                back.resize(top.size());
                expected.resize(top.size());
                actual.resize(top.size());
                FillForBlending(top, fRandom);
                FillForBlending(back, fRandom);
                for (size_t i = 0; i < top.size(); i += 4)
                    reference::BlendPixel(mode, &top[i], &back[i], &expected[i], opacity, width);
                kernel(top.data(), back.data(), actual.data(), width, opacity);
                ASSERT_EQ("", FirstDifference(kFloats, 4 * top.size(), bytes(expected), bytes(actual)))
                    << "mode " << mode << ", opacity " << opacity << ", seed " << fRandom.Seed();
            }
    }
}

// Infinities and not-a-numbers are computed with, and not passed on to neighbours.
TEST_P(BlendBodies, KeepNotANumbersWithinTheirPixel) {
    for (int32_t mode = 0; mode < kModes; ++mode)
        for (const float odd :
             {std::numeric_limits<float>::quiet_NaN(), std::numeric_limits<float>::infinity()}) {
            std::vector<float> top(37 * 4, 0.5f), back(37 * 4, 0.25f), result(37 * 4);
            top[21] = back[91] = odd;
            PK::SelectBlendKernel(mode)(top.data(), back.data(), result.data(), 37, 0.5f);
            for (size_t i = 0; i < result.size(); ++i)
                if (i / 4 != 21 / 4 && i / 4 != 91 / 4) {
                    ASSERT_TRUE(std::isfinite(result[i])) << "mode " << mode << ", sample " << i;
                }
        }
}

// Hosts may have exceptions unmasked, and greys, clear pixels and black are ordinary.
TEST_P(BlendBodies, DivideByNothing) {
    const std::vector<float> top = {0, 0, 0, 0, 0.5f, 0.5f, 0.5f, 0, 1, 1, 1, 1, 0, 1, 0.5f, 1},
                             back = {0, 0, 0, 0, 0.5f, 0.5f, 0.5f, 0, 0, 0, 0, 1, 1, 1, 0, 1};
    std::vector<float> result(16);
    const uint32_t saved = _mm_getcsr();
    _mm_setcsr(0x1f80 & ~0x0280u); // invalid, division by zero
    for (int32_t mode = 0; mode < kModes; ++mode)
        PK::SelectBlendKernel(mode)(top.data(), back.data(), result.data(), 4, 1);
    const uint32_t flags = _mm_getcsr() & 0x05;
    _mm_setcsr(saved);
    EXPECT_EQ(flags, 0u);
}

// Of opaque pixels, by the formulas as textbooks have them.
TEST_F(BlendModes, SeparableModesByHand) {
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_ColorBurn, 0.5f, 0.8f), 0.6f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_ColorDodge, 0.5f, 0.3f), 0.6f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Darken, 0.5f, 0.3f), 0.3f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Lighten, 0.5f, 0.3f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Difference, 0.5f, 0.75f), 0.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Difference, 3, 0.75f), 2.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Exclusion, 0.5f, 0.25f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_HardLight, 0.25f, 0.5f), 0.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_HardLight, 0.75f, 0.5f), 0.75f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Overlay, 0.5f, 0.25f), 0.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Overlay, 0.5f, 0.75f), 0.75f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_HardMix, 0.25f, 0.5f), 0);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_HardMix, 0.5f, 0.5f), 1);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_LinearBurn, 0.75f, 0.5f), 0.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_LinearDodge, 0.75f, 0.5f), 1.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_LinearLight, 0.25f, 0.25f), -0.25f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Multiply, 0.5f, 0.25f), 0.125f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_PinLight, 0.75f, 0.25f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_PinLight, 0.25f, 0.75f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Screen, 0.5f, 0.25f), 0.625f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_SoftLight, 0.25f, 0.5f), 0.375f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_SoftLight, 0.75f, 0.25f), 0.375f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_VividLight, 0.25f, 0.75f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_VividLight, 0.75f, 0.25f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Subtract, 3, 0.5f), -2.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Divide, 0.5f, 0.25f), 0.5f);
    EXPECT_FLOAT_EQ(Channel(PK_BlendMode_Divide, 0, 0.25f), 0.25f / 1e-7f);
}

// k = 0.25 / 0.625 = 0.4; the blend counts by half, since the back has half its alpha.
TEST_F(BlendModes, AlphaByHand) {
    const Pixel result = Blended(PK_BlendMode_Multiply, {0.5f, 1, 0, 0.5f}, {0.25f, 0.5f, 1, 0.5f}, 0.5f);
    EXPECT_FLOAT_EQ(result[0], 0.25f * 0.6f + (0.125f + 0.5f) * 0.5f * 0.4f);
    EXPECT_FLOAT_EQ(result[1], 0.5f * 0.6f + 0.75f * 0.4f);
    EXPECT_FLOAT_EQ(result[2], 0.6f);
    EXPECT_FLOAT_EQ(result[3], 0.625f);
}

// Over a clear back the blend of whole colours has its full weight, where that of channels leaves the top.
TEST_F(BlendModes, WholeColoursKeepTheirWeightOverAClearBack) {
    const Pixel top = {0.2f, 0.4f, 0.6f, 1}, back = {0.5f, 0.5f, 0.5f, 0};
    EXPECT_FLOAT_EQ(Blended(PK_BlendMode_Difference, top, back)[0], 0.2f);
    EXPECT_FLOAT_EQ(Blended(PK_BlendMode_Luminosity, top, back)[0],
                    0.3f * 0.6f + 0.59f * 0.4f + 0.11f * 0.2f);
}

// Grey has no colour to give, and a colour on grey has its own.
TEST_F(BlendModes, WholeColoursByHand) {
    const Pixel grey = {0.5f, 0.5f, 0.5f, 1}, red = {0, 0, 0.5f, 1};
    const auto expectNear = [](const Pixel& actual, const Pixel& expected) {
        for (size_t i = 0; i < 4; ++i) EXPECT_NEAR(actual[i], expected[i], 1e-6f) << i;
    };
    expectNear(Blended(PK_BlendMode_Color, grey, red), {0.15f, 0.15f, 0.15f, 1});
    expectNear(Blended(PK_BlendMode_Saturation, grey, red), {0.15f, 0.15f, 0.15f, 1});
    expectNear(Blended(PK_BlendMode_Luminosity, grey, red), {0.35f, 0.35f, 0.85f, 1});
    expectNear(Blended(PK_BlendMode_Color, red, grey), {0.35f, 0.35f, 0.85f, 1});
    expectNear(Blended(PK_BlendMode_Hue, red, grey), {0.5f, 0.5f, 0.5f, 1});
}

TEST_F(BlendModes, ClearOverClearIsClear) {
    const Pixel top = {0.2f, 0.4f, 0.6f, 0}, back = {0.7f, 0.8f, 0.9f, 0};
    for (int32_t mode = 0; mode < kModes; ++mode) {
        if (mode == PK_BlendMode_Normal) continue;
        const bool copies = mode == PK_BlendMode_DarkerColor || mode == PK_BlendMode_LighterColor ||
                            mode == PK_BlendMode_Dissolve;
        EXPECT_EQ(Blended(mode, top, back), copies ? back : Pixel{}) << mode;
    }
}

// The back is of less luma by BT.709, of more by BT.601.
TEST_F(BlendModes, TheLumaOfWidthsUpTo720IsThatOf601) {
    const Pixel top = {0, 0.45f, 0.3f, 1}, back = {0, 0.3f, 0.6f, 1}; // 0.386, 0.342 and 0.354, 0.356
    for (const int32_t width : {719, 720, 721}) {
        const bool topIsDarker = width <= 720;
        std::vector<Pixel> tops(static_cast<size_t>(width), top), backs(tops.size(), back),
            result(tops.size());
        const auto blend = [&](PK_BlendMode mode) {
            EXPECT_EQ(PK_CompositeWithBlendMode(tops.data(), 0, kFloats, backs.data(), 0, kFloats,
                                                result.data(), 0, kFloats, width, 1, 1, mode, kQuality,
                                                false),
                      PK_Success);
            return result[5];
        };
        EXPECT_EQ(blend(PK_BlendMode_DarkerColor), topIsDarker ? top : back) << width;
        EXPECT_EQ(blend(PK_BlendMode_LighterColor), topIsDarker ? back : top) << width;
    }
    EXPECT_EQ(Blended(PK_BlendMode_DarkerColor, {0.1f, 0.1f, 0.1f, 1}, {0.1f, 0.1f, 0.1f, 1})[0], 0.1f);
}

TEST_F(BlendModes, NormalIsTheCompositeOfItsOwnFormats) {
    const Codes top = fRandom.Bytes(4 * 33), back = fRandom.Bytes(4 * 33);
    for (const bool inLinear : {false, true}) {
        Codes normal(top.size()), composite(top.size());
        ASSERT_EQ(PK_CompositeWithBlendMode(top.data(), 0, kBGRA, back.data(), 0, kBGRA, normal.data(), 0,
                                            kBGRA, 33, 1, 0.4f, PK_BlendMode_Normal, kQuality, inLinear),
                  PK_Success);
        ASSERT_EQ(PK_Composite(top.data(), 0, kBGRA, back.data(), 0, kBGRA, composite.data(), 0, kBGRA, 33, 1,
                               0.4f, kQuality, inLinear),
                  PK_Success);
        EXPECT_EQ(normal, composite);
    }
}

TEST_F(BlendModes, EveryFormatGoesByWayOfFloats) {
    for (int32_t mode = 0; mode < kModes; ++mode) {
        if (mode == PK_BlendMode_Dissolve || mode == PK_BlendMode_Normal) continue;
        for (const PK_PixelFormat format : PK::kRasterFormats) {
            const auto draw = [&] {
                return PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))];
            };
            const PK_PixelFormat formats[3] = {format, draw(), draw()};
            const auto width = static_cast<int32_t>(1 + fRandom.Below(20));
            const auto length = [&](PK_PixelFormat f) {
                return static_cast<size_t>(PK_PixelFormatPackedRowBytes(f, width));
            };
            SCOPED_TRACE(testing::Message() << "mode " << mode << std::hex << ", formats " << formats[0]
                                            << ' ' << formats[1] << ' ' << formats[2]);
            const GuardedImage top({length(formats[0]), 1}, fRandom), back({length(formats[1]), 1}, fRandom),
                destination({length(formats[2]), 2, 8, true}, fRandom);
            FillOrdinarySamples(formats[0], top.Pixels(), length(formats[0]), fRandom);
            FillOrdinarySamples(formats[1], back.Pixels(), length(formats[1]), fRandom);
            std::vector<float> s(static_cast<size_t>(width) * 4 + 16), b(s.size()), d(s.size());
            const auto aligned = [](auto& row) {
                return reinterpret_cast<float*>((reinterpret_cast<uintptr_t>(row.data()) + 63) &
                                                ~uintptr_t{63});
            };
            ASSERT_EQ(PK_Convert(top.Pixels(), 0, formats[0], aligned(s), 0, kFloats, width, 1, kQuality),
                      PK_Success);
            ASSERT_EQ(PK_Convert(back.Pixels(), 0, formats[1], aligned(b), 0, kFloats, width, 1, kQuality),
                      PK_Success);
            const float opacity = static_cast<float>(fRandom.Below(5)) / 4;
            for (int32_t x = 0; x < width; ++x)
                reference::BlendPixel(mode, aligned(s) + 4 * x, aligned(b) + 4 * x, aligned(d) + 4 * x,
                                      opacity, width);
            RowBuffer expected(length(formats[2]), {Placement::kAtOffset, 0});
            ASSERT_EQ(PK_Convert(aligned(d), 0, kFloats, expected.Data(), 0, formats[2], width, 1, kQuality),
                      PK_Success);
            RowBuffer actual(length(formats[2]), {Placement::kAtOffset, 0});
            ASSERT_EQ(PK_CompositeWithBlendMode(top.Pixels(), 0, formats[0], back.Pixels(), 0, formats[1],
                                                actual.Data(), 0, formats[2], width, 1, opacity, mode,
                                                kQuality, false),
                      PK_Success);
            ASSERT_EQ("", FirstDifference(formats[2], length(formats[2]), expected.Data(), actual.Data()));
            ASSERT_TRUE(actual.MarginsIntact());
        }
    }
}

// Bands and rows alike, in place as well.
TEST_F(BlendModes, TallImagesAndPlacesOfTheDestinationChangeNothing) {
    constexpr int32_t kWidth = 31;
    for (const int32_t height : {1, 64, 65, 130})
        for (const PK_PixelFormat format : {kFloats, kBGRA, PK_PixelFormat_UYVY_422_8u}) {
            const auto rowBytes = PK_PixelFormatPackedRowBytes(format, kWidth);
            const auto bytes = static_cast<size_t>(rowBytes) * static_cast<size_t>(height);
            Codes top(bytes), back(bytes), whole(bytes), rows(bytes);
            FillOrdinarySamples(format, top.data(), bytes, fRandom);
            FillOrdinarySamples(format, back.data(), bytes, fRandom);
            const auto blend = [&](const uint8_t* s, const uint8_t* b, uint8_t* d, int32_t count) {
                return PK_CompositeWithBlendMode(s, rowBytes, format, b, rowBytes, format, d, rowBytes,
                                                 format, kWidth, count, 0.7f, PK_BlendMode_SoftLight,
                                                 kQuality, false);
            };
            ASSERT_EQ(blend(top.data(), back.data(), whole.data(), height), PK_Success);
            for (int32_t row = 0; row < height; ++row)
                ASSERT_EQ(blend(&top[static_cast<size_t>(row * rowBytes)],
                                &back[static_cast<size_t>(row * rowBytes)],
                                &rows[static_cast<size_t>(row * rowBytes)], 1),
                          PK_Success);
            EXPECT_EQ(whole, rows);
            Codes inTop = top, inBack = back;
            ASSERT_EQ(blend(inTop.data(), back.data(), inTop.data(), height), PK_Success);
            ASSERT_EQ(blend(top.data(), inBack.data(), inBack.data(), height), PK_Success);
            EXPECT_EQ(inTop, whole);
            EXPECT_EQ(inBack, whole);
        }
}

TEST_F(BlendModes, DissolveDrawsTheSequenceOfTheRuntime) {
    constexpr int32_t kWidth = 400, kHeight = 3;
    std::vector<Pixel> top(kWidth * kHeight), back(top.size()), expected, result(top.size());
    for (size_t i = 0; i < top.size(); ++i) {
        const float x = static_cast<float>(i);
        top[i] = {x, 0, 0, i % 7 == 0 ? 0.0f : static_cast<float>(fRandom.Next()) * 0x1p-32f};
        back[i] = {-x, 0, 0, 0.5f};
    }
    top[5][3] = -0.5f;
    const auto draw = [&] {
        expected.clear();
        for (size_t i = 0; i < top.size(); ++i) {
            const float a = top[i][3] * 0.6f;
            const auto t = static_cast<int32_t>(static_cast<double>(a) * 32767.0);
            const bool topShows = std::abs(a) >= 8e-6f && (t < 0 || (std::rand() & 32767) <= t);
            expected.push_back(topShows ? top[i] : back[i]);
        }
    };
    const auto dissolve = [&](int32_t firstRow, int32_t rows) {
        constexpr int32_t kRowBytes = 16 * kWidth;
        return PK_CompositeWithBlendMode(&top[static_cast<size_t>(firstRow * kWidth)], kRowBytes, kFloats,
                                         &back[static_cast<size_t>(firstRow * kWidth)], kRowBytes, kFloats,
                                         &result[static_cast<size_t>(firstRow * kWidth)], kRowBytes, kFloats,
                                         kWidth, rows, 0.6f, PK_BlendMode_Dissolve, kQuality, false);
    };
    std::srand(1);
    draw();
    std::srand(99); // is begun anew
    ASSERT_EQ(dissolve(0, kHeight), PK_Success);
    EXPECT_EQ(result, expected);

    std::srand(4711); // of single rows the caller's sequence goes on
    draw();
    std::srand(4711);
    for (int32_t row = 0; row < kHeight; ++row) ASSERT_EQ(dissolve(row, 1), PK_Success);
    EXPECT_EQ(result, expected);
}

// Memory for rows beyond the stack is laid out by the same numbers.
TEST_F(BlendModes, DissolveOfWideRowsBeginsTheSequenceBehindItsMemory) {
    constexpr int32_t kWidth = 17000;
    const Codes top(4 * kWidth * 2, 128), back(top.size(), 0);
    Codes result(top.size()), expected(top.size());
    ASSERT_EQ(PK_CompositeWithBlendMode(top.data(), 4 * kWidth, kBGRA, back.data(), 4 * kWidth, kBGRA,
                                        result.data(), 4 * kWidth, kBGRA, kWidth, 2, 1, PK_BlendMode_Dissolve,
                                        kQuality, false),
              PK_Success);
    std::srand(1);
    const auto odds = static_cast<int32_t>(128.0f / 255 * 32767.0);
    for (size_t i = 0; i < expected.size(); i += 4)
        if ((std::rand() & 32767) <= odds) std::fill_n(&expected[i], 4, uint8_t{128});
    EXPECT_EQ(result, expected);
}

TEST_F(BlendModes, DissolveAtFullAlphaAndOpacityIsTheTop) {
    const Pixel top = {0.25f, 0.5f, 0.75f, 1}, back = {};
    for (int i = 0; i < 100; ++i) ASSERT_EQ(Blended(PK_BlendMode_Dissolve, top, back), top);
}

TEST_F(BlendModes, UnknownModesTouchNothing) {
    Codes image(64, 5);
    const Codes before = image;
    for (const PK_BlendMode mode : {27, -1, INT32_MAX, INT32_MIN}) {
        EXPECT_EQ(PK_CompositeWithBlendMode(image.data(), 8, kBGRA, image.data(), 8, kBGRA, image.data(), 8,
                                            kBGRA, 2, 2, 1, mode, kQuality, false),
                  PK_ErrNotSupported);
        EXPECT_EQ(PK_CompositeWithBlendMode(nullptr, 8, PK_PixelFormat_NTSCDV25, nullptr, 8, kBGRA, nullptr,
                                            8, kBGRA, 2, 2, 1, mode, kQuality, false),
                  PK_ErrBadSrcFormat);
    }
    EXPECT_EQ(image, before);
}

TEST_F(BlendModes, RefusesFormatsSizesAndNullPointers) {
    uint8_t pixels[256] = {};
    const auto blend = [&](PK_PixelFormat top, PK_PixelFormat back, PK_PixelFormat to, int32_t width,
                           void* image) {
        return PK_CompositeWithBlendMode(pixels, 16, top, pixels, 16, back, image, 16, to, width, 1, 1,
                                         PK_BlendMode_Screen, kQuality, false);
    };
    for (const PK_PixelFormat bad : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
                                     PK_PixelFormat_Invalid, PK_PixelFormat{0x100}}) {
        EXPECT_EQ(blend(bad, kBGRA, kBGRA, 1, pixels), PK_ErrBadSrcFormat);
        EXPECT_EQ(blend(kBGRA, bad, kBGRA, 1, pixels), PK_ErrBadSrcFormat);
        EXPECT_EQ(blend(kBGRA, kBGRA, bad, 1, pixels), PK_ErrBadDstFormat);
    }
    EXPECT_EQ(blend(kBGRA, kBGRA, kBGRA, -1, pixels), PK_ErrFailed);
    EXPECT_EQ(blend(kBGRA, kBGRA, kBGRA, 1, nullptr), PK_ErrFailed);
    EXPECT_EQ(blend(kBGRA, kBGRA, kBGRA, 0, nullptr), PK_Success);
}

TEST_F(BlendModes, LeaveTheFloatingPointModeOfTheCaller) {
    const FloatEnvironment environment(kRoundUp | kExceptionFlags);
    for (int32_t mode = 0; mode < kModes; ++mode)
        Blended(mode, {0.1f, 0.2f, 0.3f, 0.4f}, {0.5f, 0.6f, 0.7f, 0.8f});
    EXPECT_TRUE(environment.IsAsGiven());
}
