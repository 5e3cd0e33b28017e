// PK_Composite by values worked out by hand, and on all kinds of formats against the rules written out on converted rows.

#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "reference/ReferenceOver.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/GuardedImage.h"
#include "support/RowBuffer.h"
#include "support/Samples.h"
#include "support/Targets.h"
#include "support/Walk.h"

#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kBGRP = PK_PixelFormat_BGRP_4444_8u,
                         kBGRX = PK_PixelFormat_BGRX_4444_8u, kFloats = PK_PixelFormat_BGRA_4444_32f;
constexpr int32_t kQuality = 4;

struct Formats {
    PK_PixelFormat top, back, destination;
};

class Composite : public testing::Test {
protected:
    Composite() { PK::SetCapabilities(PK::ReadProcessor()); }

    /// One pixel over another, in formats of one layout.
    template <class Sample, size_t kCount>
    static std::vector<Sample> OnePixel(const Formats& formats, const Sample (&top)[kCount],
                                        const Sample (&back)[kCount], float opacity) {
        std::vector<Sample> result(kCount);
        EXPECT_EQ(PK_Composite(top, 0, formats.top, back, 0, formats.back, result.data(), 0,
                               formats.destination, 1, 1, opacity, kQuality, false),
                  PK_Success);
        return result;
    }

    FlagScope fFlags;
    Random fRandom{1002};
};

using Codes = std::vector<uint8_t>;
using Rows = std::vector<std::vector<uint8_t>>;

/// What a call works in and by which rule, told anew by the bits of the formats.
struct Choice {
    PK_PixelFormat top, back, destination;
    reference::OverRule rule;
    bool is8u;
};

Choice Choose(const Formats& formats, bool inLinear) {
    const auto isOpaque = [](PK_PixelFormat format) { return (format & 0xc) == 0 || (format & 0xc) == 0xc; };
    const PK_PixelFormat to = formats.destination;
    Choice choice{};
    choice.is8u = (to & 0x1c0) == 0;
    choice.rule = {(to & 0xc) == 4, (to & 1) != 0, isOpaque(formats.top), isOpaque(formats.back)};
    PK_PixelFormat working = to & ~0x1030u;
    if (!choice.is8u) working = (working & ~0x1c0u) | 0x100;
    if (isOpaque(to)) working = (working & ~0xcu) | 8;
    if ((to & 0x30) == 0x10) {
        working = choice.is8u ? 0x809 : 0x909;
        choice.rule = {false, true, true, true};
    }
    choice.top = isOpaque(formats.top) ? (working & ~0xcu) | 0xc : working;
    choice.back = isOpaque(formats.back) ? (working & ~0xcu) | 0xc : working;
    choice.destination = working;
    if (!inLinear) choice.top = choice.back = choice.destination = working & ~2u;
    return choice;
}

size_t RowLength(PK_PixelFormat format, int32_t width) {
    return static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
}

/// A row in a working format: where temporary rows begin, at a multiple of 64 bytes, or so far behind one.
class WorkingRow {
public:
    WorkingRow(PK_PixelFormat format, int32_t width, int offset = 0)
        : fFormat(format), fWidth(width), fRow(RowLength(format, width), {Placement::kAtOffset, offset}) {}

    uint8_t* Data() const { return fRow.Data(); }
    void From(const uint8_t* row, PK_PixelFormat format) const {
        EXPECT_EQ(PK_Convert(row, 0, format, Data(), 0, fFormat, fWidth, 1, kQuality), PK_Success);
    }
    Codes To(PK_PixelFormat format) const {
        Codes row(RowLength(format, fWidth) + 63);
        uint8_t* const aligned = row.data() + (-reinterpret_cast<uintptr_t>(row.data()) & 63);
        EXPECT_EQ(PK_Convert(Data(), 0, fFormat, aligned, 0, format, fWidth, 1, kQuality), PK_Success);
        return {aligned, aligned + RowLength(format, fWidth)};
    }

private:
    PK_PixelFormat fFormat;
    int32_t fWidth;
    RowBuffer fRow;
};

/// One row over another by way of the working formats, to a row at `place`.
Codes ExpectedRow(const Formats& formats, const uint8_t* top, const uint8_t* back, const uint8_t* place,
                  int32_t width, float opacity, bool inLinear) {
    const Choice choice = Choose(formats, inLinear);
    const bool isConverted = choice.destination != formats.destination;
    const auto offset = static_cast<int>(isConverted ? 0 : reinterpret_cast<uintptr_t>(place) % 64);
    const WorkingRow s(choice.top, width), b(choice.back, width), result(choice.destination, width, offset);
    s.From(top, formats.top);
    b.From(back, formats.back);
    const auto floats = [](const WorkingRow& row) { return reinterpret_cast<float*>(row.Data()); };
    if (choice.is8u)
        reference::Over8u(choice.rule, PK::sCPUHasSSE2 != 0, s.Data(), b.Data(), result.Data(), width,
                          opacity);
    else
        reference::Over32f(choice.rule, floats(s), floats(b), floats(result), width, opacity);
    return result.To(formats.destination);
}

/// All kinds of alpha, depth, order and family; every other raster format differs from one of them in the matrix only.
constexpr PK_PixelFormat kKinds[] = {
    PK_PixelFormat_BGRA_4444_8u,  PK_PixelFormat_BGRP_4444_8u,         PK_PixelFormat_BGRX_4444_8u,
    PK_PixelFormat_ARGB_4444_8u,  PK_PixelFormat_XRGB_4444_8u,         PK_PixelFormat_VUYA_4444_8u,
    PK_PixelFormat_VUYP_4444_8u,  PK_PixelFormat_VUYX_4444_8u,         PK_PixelFormat_VUYA_4444_8u_709,
    PK_PixelFormat_UYVY_422_8u,   PK_PixelFormat_YUYV_422_8u_709,      PK_PixelFormat_V210_422_10u,
    PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_PRGB_4444_15u,        PK_PixelFormat_BGRX_4444_15u,
    PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRP_4444_32f,        PK_PixelFormat_XRGB_4444_32f,
    PK_PixelFormat_VUYA_4444_32f, PK_PixelFormat_VUYX_4444_32f,        PK_PixelFormat_UYVY_422_32f,
    PK_PixelFormat_RGB_444_10u,   PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_PRGB_4444_32f_Linear,
};

bool IsOpaque(PK_PixelFormat format) {
    return (format & 0xc) == 0 || (format & 0xc) == 0xc;
}

/// A call on guarded images, held to the rules row by row.
void Check(const Formats& formats, int32_t width, int32_t height, float opacity, bool inLinear,
           Random& random) {
    SCOPED_TRACE(testing::Message() << std::hex << formats.top << " over " << formats.back << " to "
                                    << formats.destination << std::dec << ", " << width << " x " << height
                                    << ", opacity " << opacity << ", seed " << random.Seed());
    const auto shape = [&](PK_PixelFormat format) {
        return ImageShape{RowLength(format, width), height, 16 * random.Below(3), random.Below(2) != 0,
                          random.Below(2) ? Guard::kAfter : Guard::kBefore};
    };
    const GuardedImage top(shape(formats.top), random), back(shape(formats.back), random),
        destination(shape(formats.destination), random);
    Rows expected;
    for (int32_t row = 0; row < height; ++row) {
        FillOrdinarySamples(formats.top, top.Row(row), RowLength(formats.top, width), random);
        FillOrdinarySamples(formats.back, back.Row(row), RowLength(formats.back, width), random);
        expected.push_back(ExpectedRow(formats, top.Row(row), back.Row(row), destination.Row(row), width,
                                       opacity, inLinear));
    }
    ASSERT_EQ(PK_Composite(top.Pixels(), top.RowBytes(), formats.top, back.Pixels(), back.RowBytes(),
                           formats.back, destination.Pixels(), destination.RowBytes(), formats.destination,
                           width, height, opacity, kQuality, inLinear),
              PK_Success);
    destination.ExpectRows(expected);
}

} // namespace

// B: 10 + 200 x 127 / 255 = 109.61, G: 20 + 49.80, R: 30 + 24.90
TEST_F(Composite, PremultipliedOverOpaqueByHand) {
    EXPECT_EQ((OnePixel<uint8_t>({kBGRP, kBGRX, kBGRP}, {10, 20, 30, 128}, {200, 100, 50, 7}, 1)),
              (Codes{110, 70, 55, 255}));
}

// a = 64 / 255, A = 64 + 128 x (1 - a) = 159.87
TEST_F(Composite, StraightOverStraightByHand) {
    EXPECT_EQ((OnePixel<uint8_t>({kBGRA, kBGRA, kBGRA}, {10, 20, 30, 128}, {200, 100, 50, 128}, 0.5f)),
              (Codes{124, 68, 42, 160}));
}

// (200 - 128) / 2 + 128 - 14, (60 - 128) / 2 + 128, 219 / 2 + 16 = 125.5
TEST_F(Composite, PremultipliedYUVIsMixedAboutItsZeros) {
    const PK_PixelFormat format = PK_PixelFormat_VUYP_4444_8u;
    EXPECT_EQ((OnePixel<uint8_t>({format, format, format}, {200, 60, 235, 255}, {100, 128, 16, 255}, 0.5f)),
              (Codes{150, 94, 126, 255}));
    EXPECT_EQ((OnePixel<uint8_t>({format, format, format}, {200, 60, 235, 255}, {1, 2, 3, 0}, 0.5f)),
              (Codes{164, 94, 126, 128}));
}

// (200 + 100) / 2, (60 + 128) / 2, 125.5
TEST_F(Composite, StraightYUVIsMixedByItsCodes) {
    const PK_PixelFormat format = PK_PixelFormat_VUYA_4444_8u;
    EXPECT_EQ((OnePixel<uint8_t>({format, format, format}, {200, 60, 235, 255}, {100, 128, 16, 255}, 0.5f)),
              (Codes{150, 94, 126, 255}));
}

// a = 0.25, A = 0.625
TEST_F(Composite, StraightFloatsByHandAreNotLimited) {
    const auto result =
        OnePixel<float>({kFloats, kFloats, kFloats}, {0.2f, 0.4f, 0.6f, 0.5f}, {1, 2, -1, 0.5f}, 0.5f);
    EXPECT_FLOAT_EQ(result[0], 0.68f);
    EXPECT_FLOAT_EQ(result[1], 1.36f);
    EXPECT_FLOAT_EQ(result[2], -0.36f);
    EXPECT_FLOAT_EQ(result[3], 0.625f);
}

TEST_F(Composite, WhatIsClearShowsTheOtherAlone) {
    EXPECT_EQ((OnePixel<uint8_t>({kBGRA, kBGRA, kBGRA}, {10, 20, 30, 0}, {200, 100, 50, 128}, 1)),
              (Codes{200, 100, 50, 128}));
    EXPECT_EQ((OnePixel<uint8_t>({kBGRA, kBGRA, kBGRA}, {10, 20, 30, 255}, {200, 100, 50, 128}, 1)),
              (Codes{10, 20, 30, 255}));
    EXPECT_EQ((OnePixel<uint8_t>({kBGRA, kBGRA, kBGRA}, {10, 20, 30, 128}, {200, 100, 50, 0}, 0.5f)),
              (Codes{10, 20, 30, 64}));
    EXPECT_EQ((OnePixel<uint8_t>({kBGRP, kBGRP, kBGRP}, {10, 20, 30, 128}, {200, 100, 50, 0}, 0.5f)),
              (Codes{5, 10, 15, 64}));
}

// Of fours that do not agree, a clear pixel of the back has no colour to show; alone it keeps what it has.
TEST_F(Composite, StaleColourShowsInNoMixedFour) {
    if (PK::BestTarget() == PK::Target::plain) GTEST_SKIP() << "goes by single pixels";
    alignas(16) const uint8_t top[20] = {9, 9, 9, 0, 0, 0, 0, 255, 9, 9, 9, 0, 0, 0, 0, 255, 9, 9, 9, 0};
    alignas(16) const uint8_t back[20] = {7, 7, 7, 0, 7, 7, 7, 0, 7, 7, 7, 255, 7, 7, 7, 0, 7, 7, 7, 0};
    alignas(16) uint8_t result[20];
    ASSERT_EQ(PK_Composite(top, 0, kBGRP, back, 0, kBGRP, result, 0, kBGRP, 5, 1, 1, kQuality, false),
              PK_Success);
    EXPECT_EQ(Codes(result, result + 20),
              (Codes{0, 0, 0, 0, 0, 0, 0, 255, 7, 7, 7, 255, 0, 0, 0, 255, 7, 7, 7, 0}));
}

TEST_F(Composite, BelowTheThresholdTheBackIsConverted) {
    const uint8_t top[4] = {0, 0, 0, 255}, back[4] = {200, 100, 50, 128};
    for (const float opacity : {0.000007f, 0.0f, -1.0f}) {
        uint8_t result[4] = {}, expected[4] = {};
        ASSERT_EQ(PK_Convert(back, 0, kBGRA, expected, 0, kBGRP, 1, 1, kQuality), PK_Success);
        ASSERT_EQ(
            PK_Composite(top, 0, kBGRA, back, 0, kBGRA, result, 0, kBGRP, 1, 1, opacity, kQuality, false),
            PK_Success);
        EXPECT_EQ(Codes(result, result + 4), Codes(expected, expected + 4)) << opacity;
    }
    const auto mixed = OnePixel<float>({kFloats, kFloats, kFloats}, {0, 0, 0, 1}, {1, 1, 1, 1}, 0.000009f);
    EXPECT_LT(mixed[0], 1);
}

TEST_F(Composite, AnOpaqueTopAtFullOpacityIsConverted) {
    Random random(1003);
    const GuardedImage top({64, 3}, random), back({64, 3}, random), destination({32, 3}, random);
    const PK_PixelFormat to = PK_PixelFormat_UYVY_422_8u; // top-down, which a conversion turns
    Codes expected(96);
    ASSERT_EQ(PK_Convert(top.Pixels(), 64, kBGRX, expected.data(), 32, to, 16, 3, kQuality), PK_Success);
    for (const float opacity : {1.0f, 0.9999925f, 3.0f}) {
        ASSERT_EQ(PK_Composite(top.Pixels(), 64, kBGRX, back.Pixels(), 64, kBGRA, destination.Pixels(), 32,
                               to, 16, 3, opacity, kQuality, false),
                  PK_Success);
        EXPECT_EQ(Codes(destination.Pixels(), destination.Pixels() + 96), expected) << opacity;
    }
}

TEST_F(Composite, FullOpacityShowsTheBackThroughATopWithAlpha) {
    for (const PK_PixelFormat top : {kBGRA, kBGRP})
        EXPECT_EQ((OnePixel<uint8_t>({top, kBGRX, kBGRX}, {0, 0, 0, 0}, {200, 100, 50, 3}, 1)),
                  (Codes{200, 100, 50, 255}));
}

TEST_F(Composite, AllKindsOfFormatsFollowTheRules) {
    Walk walk;
    for (const PK_PixelFormat top : kKinds)
        for (const PK_PixelFormat back : kKinds)
            for (const PK_PixelFormat destination : kKinds) {
                if (walk.LeavesOut()) continue;
                constexpr float kOpacities[] = {1, 0.5f, 0.3f, 0.000009f};
                const float opacity =
                    kOpacities[fRandom.Below(IsOpaque(top) ? 3 : 4) + (IsOpaque(top) ? 1 : 0)];
                Check({top, back, destination}, 1 + static_cast<int32_t>(fRandom.Below(22)), 2, opacity,
                      fRandom.Below(2) != 0, fRandom);
                if (HasFatalFailure()) return;
            }
}

TEST_F(Composite, RandomSizesAtEveryTarget) {
    AtEveryTarget([&] {
        for (int round = 0; round < 150; ++round) {
            const auto draw = [&] {
                return PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))];
            };
            Check({draw(), draw(), draw()}, static_cast<int32_t>(fRandom.Below(50)),
                  static_cast<int32_t>(fRandom.Below(5)),
                  0.01f + 0.9f * static_cast<float>(fRandom.Below(100)) / 100, fRandom.Below(2) != 0,
                  fRandom);
            if (HasFatalFailure()) return;
        }
    });
}

// With widths of whole fours the rows begin where temporary ones would, and no alpha is written before or behind.
TEST_F(Composite, OpaqueImagesAreMixedWhereTheyLie) {
    constexpr PK_PixelFormat kVUYP = PK_PixelFormat_VUYP_4444_8u, kVUYX = PK_PixelFormat_VUYX_4444_8u;
    AtEveryTarget([&] {
        for (const Formats& formats :
             {Formats{kBGRP, kBGRX, kBGRX}, Formats{kBGRX, kBGRX, kBGRX}, Formats{kBGRX, kBGRP, kBGRX},
              Formats{kVUYP, kVUYX, kVUYX}, Formats{kBGRP, kVUYX, kBGRX}})
            for (const int32_t width : {4, 8, 12, 16, 20, 33, 64, 68}) {
                Check(formats, width, 3, 0.3f, false, fRandom);
                Check(formats, width, 3, IsOpaque(formats.top) ? 0.9f : 1, false, fRandom);
                if (HasFatalFailure()) return;
            }
    });
}

// 64 rows stay on the calling thread, 65 make bands of 16, 16, 16 and 17.
TEST_F(Composite, TallImagesAreCutIntoBands) {
    for (const int32_t height : {63, 64, 65, 66, 131})
        for (const Formats& formats :
             {Formats{kBGRP, kBGRX, kBGRX},
              Formats{PK_PixelFormat_UYVY_422_8u, kFloats, PK_PixelFormat_V210_422_10u}})
            Check(formats, 33, height, 0.7f, false, fRandom);
}

TEST_F(Composite, WideRowsTakeMemoryBeyondTheStack) {
    Check({PK_PixelFormat_V210_422_10u, kBGRA, PK_PixelFormat_ARGB_4444_15u}, 17003, 2, 0.4f, false, fRandom);
}

TEST_F(Composite, TheDestinationMayBeTopOrBack) {
    for (const PK_PixelFormat format :
         {kBGRA, kBGRX, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_ARGB_4444_15u, kFloats})
        for (const auto& [width, height] : {std::pair{38, 3}, {38, 70}, {40, 3}, {40, 70}}) {
            const size_t length = RowLength(format, width);
            const auto rowBytes = static_cast<int32_t>(length);
            Codes top(length * static_cast<size_t>(height)), back(top.size()), apart(top.size());
            FillOrdinarySamples(format, top.data(), top.size(), fRandom);
            FillOrdinarySamples(format, back.data(), back.size(), fRandom);
            const auto composite = [&, columns = width, rows = height](const Codes& s, const Codes& b,
                                                                       Codes& destination) {
                return PK_Composite(s.data(), rowBytes, format, b.data(), rowBytes, format,
                                    destination.data(), rowBytes, format, columns, rows, 0.6f, kQuality,
                                    false);
            };
            ASSERT_EQ(composite(top, back, apart), PK_Success);
            Codes inTop = top, inBack = back;
            ASSERT_EQ(composite(inTop, back, inTop), PK_Success);
            ASSERT_EQ(composite(top, inBack, inBack), PK_Success);
            EXPECT_EQ(inTop, apart) << std::hex << format;
            EXPECT_EQ(inBack, apart) << std::hex << format;
        }
}

// 0.5 in linear light is 0.735 encoded, and mixed with black by half it is 0.5 of one or the other.
TEST_F(Composite, LinearLightIsForThoseWhoAskForIt) {
    const PK_PixelFormat linear = PK_PixelFormat_BGRA_4444_32f_Linear;
    const float top[4] = {1, 1, 1, 1}, back[4] = {0, 0, 0, 1};
    float inLinear[4], encoded[4];
    ASSERT_EQ(PK_Composite(top, 0, linear, back, 0, linear, inLinear, 0, linear, 1, 1, 0.5f, kQuality, true),
              PK_Success);
    ASSERT_EQ(PK_Composite(top, 0, linear, back, 0, linear, encoded, 0, linear, 1, 1, 0.5f, kQuality, false),
              PK_Success);
    EXPECT_EQ(inLinear[0], 0.5f);
    EXPECT_NEAR(encoded[0], std::pow(0.5, 2.4), 1e-6);
}

TEST_F(Composite, LeavesTheFloatingPointModeOfTheCaller) {
    for (const uint32_t mode : {0u, kRoundDown, kRoundUp | kFlushToZero, kRoundToZero | kDenormalsAreZero}) {
        const FloatEnvironment environment(mode | kExceptionFlags);
        OnePixel<float>({kFloats, kFloats, kFloats}, {1e-30f, 0.4f, 0.6f, 0.5f}, {1e-38f, 2, -1, 0.5f}, 0.5f);
        OnePixel<float>({kFloats, kFloats, kFloats}, {1, 1, 1, 1}, {0, 0, 0, 0}, 0);
        EXPECT_TRUE(environment.IsAsGiven());
    }
}

TEST_F(Composite, RefusesFormatsBeforeAnythingElse) {
    const auto composite = [](const Formats& formats, float opacity) {
        return PK_Composite(nullptr, 16, formats.top, nullptr, 16, formats.back, nullptr, 16,
                            formats.destination, -1, 1, opacity, kQuality, false);
    };
    for (const float opacity : {0.0f, 0.5f, 1.0f})
        for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME}) {
            EXPECT_EQ(composite({stream, kBGRA, kBGRA}, opacity), PK_ErrBadSrcFormat);
            EXPECT_EQ(composite({kBGRA, stream, stream}, opacity), PK_ErrBadSrcFormat);
            EXPECT_EQ(composite({kBGRA, kBGRA, stream}, opacity), PK_ErrBadDstFormat);
        }
    for (const PK_PixelFormat unknown :
         {PK_PixelFormat_Invalid, PK_PixelFormat{0x100}, PK_PixelFormat{0xfff}}) {
        EXPECT_EQ(composite({unknown, kBGRA, unknown}, 0.5f), PK_ErrBadSrcFormat);
        EXPECT_EQ(composite({kBGRA, unknown, kBGRA}, 0.5f), PK_ErrBadSrcFormat);
        EXPECT_EQ(composite({kBGRA, kBGRA, unknown}, 0.5f), PK_ErrBadDstFormat);
    }
}

TEST_F(Composite, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {};
    const void *top = pixels, *back = pixels;
    void* destination = pixels;
    const auto composite = [&](int32_t width, int32_t height) {
        return PK_Composite(top, 8, kBGRA, back, 8, kBGRA, destination, 8, kBGRA, width, height, 0.5f,
                            kQuality, false);
    };
    EXPECT_EQ(composite(-1, 1), PK_ErrFailed);
    EXPECT_EQ(composite(-1, 0), PK_Success);
    EXPECT_EQ(composite(1, -1), PK_Success);
    EXPECT_EQ(composite(INT32_MAX / 16 + 1, 1), PK_ErrFailed);
    const auto withNull = [&](auto& pointer) {
        const auto saved = pointer;
        pointer = nullptr;
        EXPECT_EQ(composite(1, 1), PK_ErrFailed);
        EXPECT_EQ(composite(0, 1), PK_Success);
        EXPECT_EQ(composite(1, 0), PK_Success);
        pointer = saved;
    };
    withNull(top);
    withNull(back);
    withNull(destination);
}
