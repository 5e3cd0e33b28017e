// Placing where only a part is drawn: blend modes over what is there, pairs and groups cut through, fields of odd crops.

#include "support/AlignedPicture.h"
#include "support/PlaceCall.h"
#include "support/Random.h"

#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

#include <gtest/gtest.h>

#include <cstring>
#include <sys/mman.h>

namespace {

using namespace PKTest;

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kFloats = PK_PixelFormat_BGRP_4444_32f,
                         kUYVY = PK_PixelFormat_UYVY_422_8u, kV210 = PK_PixelFormat_V210_422_10u;

constexpr PK_BlendMode kModes = 27;

AlignedPicture RandomPicture(PK_PixelFormat format, int32_t width, int32_t height, Random& random) {
    AlignedPicture picture(format, width, height);
    picture.FillOrdinary(random);
    return picture;
}

/// Moved right and down by whole pixels.
PlaceCall MovedBy(int32_t columns, int32_t rows, const AlignedPicture& destination) {
    PlaceCall call;
    call.anchor = {0, 1};
    call.position = {static_cast<float>(columns) / static_cast<float>(destination.width),
                     1 - static_cast<float>(rows) / static_cast<float>(destination.height)};
    return call;
}

TEST(MotionOver, EveryModeGoesOverWhatIsThere) {
    Random random(21);
    const AlignedPicture source = RandomPicture(kBGRA, 40, 36, random);
    for (PK_BlendMode mode = 0; mode < kModes; ++mode) {
        if (mode == PK_BlendMode_Dissolve) continue; // draws lots row by row
        AlignedPicture actual = RandomPicture(kBGRA, 40, 36, random), expected = actual;
        PlaceCall call;
        call.opacity = 0.75f;
        ASSERT_EQ(call.Blend(source, actual, mode), PK_Success) << mode;
        ASSERT_EQ(PK_CompositeWithBlendMode(source.Pixels(), source.RowBytes(), kBGRA, expected.Pixels(),
                                            expected.RowBytes(), kBGRA, expected.Pixels(),
                                            expected.RowBytes(), kBGRA, 40, 36, 0.75f, mode, call.quality,
                                            false),
                  PK_Success);
        EXPECT_EQ(actual.DifferenceFrom(expected), "") << mode;
    }
}

TEST(MotionOver, MovedRowsGoOverTheirPlaces) {
    Random random(22);
    const AlignedPicture source = RandomPicture(kBGRA, 20, 40, random);
    AlignedPicture actual = RandomPicture(kBGRA, 64, 64, random), expected = actual; // fractions are exact
    PlaceCall call = MovedBy(7, 9, actual);
    call.opacity = 0.5f;
    ASSERT_EQ(call.Blend(source, actual, PK_BlendMode_Multiply), PK_Success);
    for (int32_t row = 0; row < 40; ++row) {
        uint8_t* const to = expected.RowFromTop(row + 9) + 28;
        ASSERT_EQ(PK_CompositeWithBlendMode(source.RowFromTop(row), 0, kBGRA, to, 0, kBGRA, to, 0, kBGRA, 20,
                                            1, 0.5f, PK_BlendMode_Multiply, call.quality, false),
                  PK_Success);
    }
    EXPECT_EQ(actual.DifferenceFrom(expected), "");
}

TEST(MotionOver, AModeThatThereIsNotIsToldAndChangesNothing) {
    Random random(23);
    const AlignedPicture source = RandomPicture(kBGRA, 8, 8, random);
    AlignedPicture destination = RandomPicture(kBGRA, 8, 8, random);
    const AlignedPicture before = destination;
    for (const PK_BlendMode mode : {-1, 27, 1000}) {
        uint8_t pixel[4] = {};
        const PK_Result expected = PK_CompositeWithBlendMode(pixel, 0, kBGRA, pixel, 0, kBGRA, pixel, 0,
                                                             kBGRA, 1, 1, 1, mode, 2, false);
        ASSERT_NE(expected, PK_Success);
        EXPECT_EQ(PlaceCall().Blend(source, destination, mode), expected);
        PlaceCall sampled = MovedBy(1, 1, destination);
        sampled.scale = {0.5f, 0.7f};
        EXPECT_EQ(sampled.Blend(source, destination, mode), expected);
        EXPECT_EQ(destination.DifferenceFrom(before), "");
    }
}

TEST(MotionOver, LotsAreDrawnAnewByEachCall) {
    Random random(24);
    const AlignedPicture source = RandomPicture(kBGRA, 30, 20, random),
                         back = RandomPicture(kBGRA, 30, 20, random);
    PlaceCall call;
    call.opacity = 0.5f;
    AlignedPicture first = back, second = back;
    ASSERT_EQ(call.Blend(source, first, PK_BlendMode_Dissolve), PK_Success);
    ASSERT_EQ(call.Blend(source, second, PK_BlendMode_Dissolve), PK_Success);
    EXPECT_EQ(first.DifferenceFrom(second), "");
    EXPECT_NE(first.DifferenceFrom(back), "");
}

TEST(MotionFaded, AnOpacityWithoutABackIsAGainOfAlpha) {
    const uint8_t pixel[4] = {10, 20, 30, 200};
    AlignedPicture source(kBGRA, 5, 4), destination(kBGRA, 5, 4);
    for (int32_t row = 0; row < 4; ++row)
        for (int32_t x = 0; x < 5; ++x) std::memcpy(source.Row(row) + 4 * x, pixel, 4);
    for (const int32_t columns : {0, 2}) {
        PlaceCall call = MovedBy(columns, 0, destination);
        call.opacity = 0.5f;
        ASSERT_EQ(call(source, destination), PK_Success);
        const uint8_t faded[4] = {10, 20, 30, 100};
        EXPECT_EQ(std::memcmp(destination.RowFromTop(0) + 4 * columns, faded, 4), 0) << columns;
    }
}

// Pairs: U Y V Y.

TEST(MotionPairs, ASpanThatCutsPairsKeepsThePixelsBeside) {
    Random random(25);
    for (int32_t column = 0; column < 9; ++column)
        for (int32_t width = 1; column + width <= 11; ++width) {
            AlignedPicture destination(kUYVY, 11, 3), source(kBGRA, width, 3);
            for (int32_t row = 0; row < 3; ++row) {
                for (size_t i = 0; i < 24; ++i) destination.Row(row)[i] = i % 2 == 0 ? 128 : 50;
                std::memset(source.Row(row), 255, 4 * static_cast<size_t>(width)); // white
            }
            ASSERT_EQ(MovedBy(column, 0, destination)(source, destination), PK_Success);
            for (int32_t row = 0; row < 3; ++row)
                for (int32_t x = 0; x < 11; ++x) {
                    const bool isDrawn = x >= column && x < column + width;
                    EXPECT_EQ(destination.Row(row)[2 * x + 1], isDrawn ? 235 : 50)
                        << column << ' ' << width << ' ' << x;
                    EXPECT_EQ(destination.Row(row)[2 * x], 128) << "grey and white have no chroma";
                }
        }
}

uint32_t SampleOfV210(const uint8_t* row, int32_t sample) {
    uint32_t word;
    std::memcpy(&word, row + 4 * (sample / 3), 4);
    return word >> (10 * (sample % 3)) & 0x3ff;
}

TEST(MotionPairs, ASpanThatCutsAGroupOfV210KeepsTheSamplesBeside) {
    Random random(26);
    for (int32_t column = 0; column < 17; ++column)
        for (int32_t width = 1; column + width <= 18; ++width) {
            AlignedPicture destination(kV210, 18, 1);
            for (size_t i = 0; i < 48; i += 4) {
                uint32_t word = 0;
                for (int place = 0; place < 3; ++place) word |= (64 + random.Below(800)) << (10 * place);
                std::memcpy(destination.Row(0) + i, &word, 4);
            }
            const AlignedPicture before = destination;
            AlignedPicture source(kBGRA, width, 1);
            std::memset(source.Row(0), 255, 4 * static_cast<size_t>(width));
            ASSERT_EQ(MovedBy(column, 0, destination)(source, destination), PK_Success);
            for (int32_t x = 0; x < 18; ++x) {
                const bool isDrawn = x >= column && x < column + width;
                const uint32_t was = SampleOfV210(before.Row(0), 2 * x + 1),
                               is = SampleOfV210(destination.Row(0), 2 * x + 1);
                EXPECT_EQ(is, isDrawn ? 940U : was) << "luma " << x << " of " << column << ", " << width;
                const int32_t pair = x / 2;
                if (2 * pair + 1 >= column && 2 * pair < column + width)
                    continue; // its chroma is that of both
                for (const int32_t chroma : {4 * pair, 4 * pair + 2})
                    EXPECT_EQ(SampleOfV210(destination.Row(0), chroma), SampleOfV210(before.Row(0), chroma))
                        << pair;
            }
        }
}

// Fields of crops.

/// Every row shows its number.
AlignedPicture Numbered(int32_t width, int32_t height) {
    AlignedPicture picture(kFloats, width, height);
    for (int32_t row = 0; row < height; ++row)
        for (int32_t x = 0; x < width; ++x) {
            const float number[4] = {static_cast<float>(row), 0, 0, 1};
            std::memcpy(picture.RowFromTop(row) + 16 * x, number, 16);
        }
    return picture;
}

float NumberAt(const AlignedPicture& picture, int32_t row, int32_t column) {
    float number;
    std::memcpy(&number, picture.RowFromTop(row) + 16 * column, 4);
    return number;
}

/// What stands in transient memory by chance must not be seen.
void PoisonTransientMemory(float with) {
    AlignedPicture source(kFloats, 40, 40), destination(kFloats, 40, 40);
    for (int32_t row = 0; row < 40; ++row)
        for (int32_t i = 0; i < 160; ++i) std::memcpy(source.Row(row) + 4 * i, &with, 4);
    PlaceCall call;
    call.quality = 3;
    call.scale = {0.5f, 0.5f};
    ASSERT_EQ(call(source, destination), PK_Success);
}

TEST(MotionFields, BlurredFieldsOfAnyCropShowNothingButTheirRows) {
    const AlignedPicture source = Numbered(8, 12);
    for (int32_t top = 0; top < 11; ++top)
        for (int32_t bottom = top + 1; bottom <= 12; ++bottom)
            for (const int32_t field : {1, 2})
                for (const int32_t destinationField : {0, 1, 2})
                    for (const bool smoothEdges : {false, true}) {
                        PlaceCall call;
                        call.sourceField = field;
                        call.destinationField = destinationField;
                        call.crop = PK_Rect{0, top, 8, bottom};
                        call.quality = 3;
                        call.scale = {0.5f, 0.9f};
                        call.smoothEdges = smoothEdges;
                        AlignedPicture first(kFloats, 8, 12), second(kFloats, 8, 12);
                        PoisonTransientMemory(77);
                        const PK_Result result = call(source, first);
                        PoisonTransientMemory(33);
                        ASSERT_EQ(call(source, second), result);
                        ASSERT_EQ(first.DifferenceFrom(second), "") << top << ' ' << bottom << ' ' << field;
                        for (int32_t row = 0; row < 12; ++row)
                            ASSERT_LT(NumberAt(first, row, 4), static_cast<float>(bottom))
                                << top << ' ' << bottom;
                    }
}

/// A field that ends a row early stays where it is.
TEST(MotionFields, TheFieldOfAnOddCropLiesWhereThatOfALongerOneLies) {
    const AlignedPicture source = Numbered(8, 12);
    for (const bool smoothEdges : {false, true}) {
        AlignedPicture shorter(kFloats, 8, 12), longer(kFloats, 8, 12);
        PlaceCall call;
        call.sourceField = 1;
        call.quality = 3;
        call.scale = {1, 0.8f};
        call.smoothEdges = smoothEdges;
        call.crop = PK_Rect{0, 3, 8, 9};
        ASSERT_EQ(call(source, longer), PK_Success);
        call.crop = PK_Rect{0, 3, 8, 8};
        ASSERT_EQ(call(source, shorter), PK_Success);
        for (const int32_t row : {3, 4}) // above the edge of the shorter one
            EXPECT_NEAR(NumberAt(shorter, row, 4), NumberAt(longer, row, 4), 0.1) << row;
    }
}

/// Address space of which only what is touched becomes memory.
class SparseMemory {
public:
    explicit SparseMemory(size_t bytes)
        : fBytes(bytes), fMapped(mmap(nullptr, bytes, PROT_READ | PROT_WRITE,
                                      MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0)) {}
    ~SparseMemory() {
        if (IsThere()) munmap(fMapped, fBytes);
    }
    SparseMemory(const SparseMemory&) = delete;
    SparseMemory& operator=(const SparseMemory&) = delete;

    bool IsThere() const { return fMapped != MAP_FAILED; }
    uint8_t* Bytes() const { return static_cast<uint8_t*>(fMapped); }

private:
    size_t fBytes;
    void* fMapped;
};

TEST(MotionFields, ABlurOfFieldsReadsRowsFarApart) {
    constexpr int64_t kRowBytes = 1'200'001'024;
    const SparseMemory memory(7 * kRowBytes + 128);
    if (!memory.IsThere()) GTEST_SKIP() << "no address space";
    const AlignedPicture near = Numbered(8, 8);
    AlignedPicture expected(kFloats, 8, 8), actual(kFloats, 8, 8);
    PlaceCall call;
    call.sourceField = 1;
    call.destinationField = 2;
    call.quality = 3;
    call.scale = {0.6f, 0.6f};
    ASSERT_EQ(call(near, expected), PK_Success);
    for (const bool isDownwards : {false, true}) {
        uint8_t* const first = memory.Bytes() + (isDownwards ? 7 * kRowBytes : 0);
        const int64_t rowBytes = isDownwards ? -kRowBytes : kRowBytes;
        for (int32_t row = 0; row < 8; ++row) std::memcpy(first + row * rowBytes, near.Row(row), 128);
        ASSERT_EQ(call.FromMemory(first, static_cast<int32_t>(rowBytes), near, actual), PK_Success);
        EXPECT_EQ(actual.DifferenceFrom(expected), "");
    }
}

} // namespace
