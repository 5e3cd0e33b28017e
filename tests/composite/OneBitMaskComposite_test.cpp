// PK_OneBitMaskComposite: every pixel comes from the image that its bit names, converted if need be.

#include "composite/MaskKernels.h"
#include "convert/RasterFormats.h"
#include "frame/Capabilities.h"
#include "frame/PixelFormat.h"
#include "support/FlagScope.h"
#include "support/FloatEnvironment.h"
#include "support/Samples.h"
#include "support/Targets.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/Overlay.h>

#include <gtest/gtest.h>

#include <vector>

using namespace PKTest;

namespace {

bool BitOf(const uint8_t* mask, size_t bit) {
    const uint8_t byte = mask[bit / 8];
    const uint8_t weights[8] = {128, 64, 32, 16, 8, 4, 2, 1};
    return (byte & weights[bit % 8]) != 0;
}

class MaskBodies : public TargetTest {
protected:
    static PK::MaskKernels::Select Kernel(size_t pixelBytes) {
        const auto& kernels = PK::KernelsFor<PK::MaskKernels>(GetParam());
        return pixelBytes == 4 ? kernels.pixels4 : pixelBytes == 8 ? kernels.pixels8 : kernels.pixels16;
    }

    Random fRandom{460};
};

/// Images of one format, tight rows, random samples.
struct Picture {
    PK_PixelFormat format;
    int32_t rowBytes;
    std::vector<uint8_t> bytes;

    Picture(PK_PixelFormat pixelFormat, int32_t width, int32_t height, Random& random)
        : format(pixelFormat), rowBytes(PK_PixelFormatPackedRowBytes(format, width)),
          bytes(static_cast<size_t>(rowBytes * height)) {
        FillOrdinarySamples(format, bytes.data(), bytes.size(), random);
    }
    uint8_t* Row(int32_t row) { return bytes.data() + row * rowBytes; }
};

/// The rows of a picture in another format, each where it was: a conversion of several rows might turn them.
/// Each is converted at a 16-byte boundary, since expansion to 15 bits rounds by where a pixel lies to one.
std::vector<uint8_t> RowsIn(PK_PixelFormat format, Picture& picture, int32_t width, int32_t height) {
    const auto rowBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
    std::vector<uint8_t> rows, scratch(rowBytes + 15);
    uint8_t* const aligned = scratch.data() + (-reinterpret_cast<uintptr_t>(scratch.data()) & 15);
    for (int32_t row = 0; row < height; ++row) {
        EXPECT_EQ(PK_Convert(picture.Row(row), 0, picture.format, aligned, 0, format, width, 1, 4),
                  PK_Success);
        rows.insert(rows.end(), aligned, aligned + rowBytes);
    }
    return rows;
}

bool CanBeDestination(PK_PixelFormat format) {
    return PK_PixelFormatPackedRowBytes(format, 1) == PK_PixelFormatPackedRowBytes(format, 3) / 3;
}

class OneBitMaskComposite : public testing::Test {
protected:
    OneBitMaskComposite() { PK::SetCapabilities(PK::ReadProcessor()); }

    FlagScope fFlags;
    Random fRandom{461};
};

} // namespace

TEST_P(MaskBodies, WorkInPlaceOfEitherRow) {
    const uint8_t mask[9] = {0x5a, 0xff, 0x00, 0x81, 0x7e, 0x33, 0xcc, 0x0f, 0xf0};
    for (const size_t pixelBytes : {4u, 8u, 16u}) {
        const std::vector<uint8_t> first = fRandom.Bytes(61 * pixelBytes),
                                   second = fRandom.Bytes(61 * pixelBytes);
        std::vector<uint8_t> expected(61 * pixelBytes), inFirst = first, inSecond = second;
        for (size_t i = 0; i < expected.size(); ++i)
            expected[i] = BitOf(mask, 5 + i / pixelBytes) ? first[i] : second[i];
        Kernel(pixelBytes)(inFirst.data(), second.data(), inFirst.data(), 61, {mask, 5});
        Kernel(pixelBytes)(first.data(), inSecond.data(), inSecond.data(), 61, {mask, 5});
        EXPECT_EQ(inFirst, expected);
        EXPECT_EQ(inSecond, expected);
    }
}

INSTANTIATE_TEST_SUITE_P(Targets, MaskBodies, EveryTarget(), TargetOf);

TEST_F(OneBitMaskComposite, OffsetCountsFromTheTopBitAndOnlyItsLowThreeBitsCount) {
    const uint32_t first[5] = {1, 2, 3, 4, 5}, second[5] = {11, 12, 13, 14, 15};
    const uint8_t mask[1] = {0xe0 | 0x16}; // 111 1 0110: the low five are 1 0 1 1 0
    for (const uint8_t offset : std::initializer_list<uint8_t>{3, 11, 251}) {
        uint32_t out[5] = {};
        ASSERT_EQ(PK_OneBitMaskComposite(first, 20, PK_PixelFormat_BGRA_4444_8u, second, 20,
                                         PK_PixelFormat_BGRA_4444_8u, mask, 1, offset, out, 20,
                                         PK_PixelFormat_BGRA_4444_8u, 5, 1, 4),
                  PK_Success);
        EXPECT_EQ(std::vector<uint32_t>(out, out + 5), (std::vector<uint32_t>{1, 12, 3, 4, 15})) << +offset;
    }
    uint32_t out[5] = {};
    ASSERT_EQ(PK_OneBitMaskComposite(first, 20, PK_PixelFormat_BGRA_4444_8u, second, 20,
                                     PK_PixelFormat_BGRA_4444_8u, mask, 1, 8, out, 20,
                                     PK_PixelFormat_BGRA_4444_8u, 5, 1, 4),
              PK_Success);
    EXPECT_EQ(std::vector<uint32_t>(out, out + 5), (std::vector<uint32_t>{1, 2, 3, 4, 15})); // 1 1 1 1 0
}

TEST_F(OneBitMaskComposite, StepsAllFourImagesByTheirRowBytes) {
    const uint32_t first[3][2] = {{1, 0}, {2, 0}, {3, 0}}, second[3][1] = {{11}, {12}, {13}};
    const uint8_t mask[5] = {0x80, 0xff, 0x00, 0xff, 0x80}; // rows at 0, 2 and 4
    uint32_t out[3] = {};
    const auto composite = [&](const uint8_t* firstMaskRow, int32_t maskRowBytes) {
        return PK_OneBitMaskComposite(first, 8, PK_PixelFormat_BGRA_4444_8u, second[2], -4,
                                      PK_PixelFormat_BGRA_4444_8u, firstMaskRow, maskRowBytes, 0, out, 4,
                                      PK_PixelFormat_BGRA_4444_8u, 1, 3, 4);
    };
    ASSERT_EQ(composite(mask, 2), PK_Success);
    EXPECT_EQ(std::vector<uint32_t>(out, out + 3), (std::vector<uint32_t>{1, 12, 3}));
    const uint8_t other[3] = {0x00, 0x00, 0x80};
    ASSERT_EQ(composite(other + 2, -1), PK_Success);
    EXPECT_EQ(std::vector<uint32_t>(out, out + 3), (std::vector<uint32_t>{1, 12, 11}));
}

TEST_F(OneBitMaskComposite, ConvertsEveryFormatAndPairsRowsInMemory) {
    constexpr int32_t kWidth = 19, kHeight = 3;
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        if (!CanBeDestination(format)) continue;
        for (const PK_PixelFormat other : PK::kRasterFormats) {
            SCOPED_TRACE(testing::Message() << std::hex << "0x" << other << " to 0x" << format << std::dec
                                            << ", seed " << fRandom.Seed());
            const PK_PixelFormat mixed = PK::kRasterFormats[fRandom.Below(std::size(PK::kRasterFormats))];
            Picture first(other, kWidth, kHeight, fRandom), second(mixed, kWidth, kHeight, fRandom);
            if (fRandom.Below(2) != 0) std::swap(first, second);
            const std::vector<uint8_t> mask = fRandom.Bytes(3 * kHeight);
            const std::vector<uint8_t> firstRows = RowsIn(format, first, kWidth, kHeight);
            const std::vector<uint8_t> secondRows = RowsIn(format, second, kWidth, kHeight);

            const size_t pixelBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, 1));
            std::vector<uint8_t> out(firstRows.size());
            const auto rowBytes = static_cast<int32_t>(pixelBytes) * kWidth;
            ASSERT_EQ(PK_OneBitMaskComposite(first.bytes.data(), first.rowBytes, first.format,
                                             second.bytes.data(), second.rowBytes, second.format, mask.data(),
                                             3, 5, out.data(), rowBytes, format, kWidth, kHeight, 4),
                      PK_Success);
            for (size_t i = 0; i < out.size(); ++i) {
                const size_t pixel = i / pixelBytes, row = pixel / kWidth, column = pixel % kWidth;
                const bool isSet = BitOf(mask.data() + 3 * row, 5 + column);
                ASSERT_EQ(out[i], (isSet ? firstRows : secondRows)[i])
                    << "row " << row << ", column " << column;
            }
        }
    }
}

TEST_F(OneBitMaskComposite, ConvertsRowsTooLongForTheStack) {
    constexpr int32_t kWidth = 16400;
    Picture first(PK_PixelFormat_UYVY_422_8u, kWidth, 1, fRandom),
        second(PK_PixelFormat_BGRA_4444_8u, kWidth, 1, fRandom);
    const std::vector<uint8_t> mask = fRandom.Bytes(kWidth / 8);
    const PK_PixelFormat format = PK_PixelFormat_VUYP_4444_32f_709;
    const std::vector<uint8_t> firstRow = RowsIn(format, first, kWidth, 1),
                               secondRow = RowsIn(format, second, kWidth, 1);
    std::vector<uint8_t> out(firstRow.size());
    ASSERT_EQ(PK_OneBitMaskComposite(first.bytes.data(), 0, first.format, second.bytes.data(), 0,
                                     second.format, mask.data(), 0, 0, out.data(), 0, format, kWidth, 1, 4),
              PK_Success);
    for (size_t i = 0; i < out.size(); ++i)
        ASSERT_EQ(out[i], (BitOf(mask.data(), i / 16) ? firstRow : secondRow)[i]) << i;
}

// 0.5 x 1e-38 = 5e-39 is denormal.
TEST_F(OneBitMaskComposite, ConvertsInTheFloatingPointModeOfTheCaller) {
    const float first[4] = {1e-38f, 0.25f, 0.3f, 0.5f}, second[4] = {};
    const uint8_t mask = 0x80;
    for (const uint32_t mode : {0u, kFlushToZero}) {
        float out[4] = {};
        const FloatEnvironment environment(mode | kExceptionFlags);
        ASSERT_EQ(PK_OneBitMaskComposite(first, 16, PK_PixelFormat_BGRA_4444_32f, second, 16,
                                         PK_PixelFormat_BGRP_4444_32f, &mask, 1, 0, out, 16,
                                         PK_PixelFormat_BGRP_4444_32f, 1, 1, 4),
                  PK_Success);
        EXPECT_TRUE(environment.IsAsGiven());
        EXPECT_EQ(out[0], mode == 0 ? 0.5e-38f : 0.0f);
        EXPECT_EQ(out[1], 0.125f);
    }
}

TEST_F(OneBitMaskComposite, RefusesFormats) {
    uint8_t pixels[64] = {}, mask = 0;
    const auto composite = [&](PK_PixelFormat first, PK_PixelFormat second, PK_PixelFormat destination) {
        return PK_OneBitMaskComposite(pixels, 16, first, pixels, 16, second, &mask, 1, 0, pixels, 16,
                                      destination, 1, 1, 4);
    };
    const PK_PixelFormat fine = PK_PixelFormat_BGRA_4444_8u;
    int32_t destinations = 0;
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        const PK_Result expected = CanBeDestination(format) ? PK_Success : PK_ErrBadDstFormat;
        EXPECT_EQ(composite(fine, fine, format), expected) << std::hex << format;
        destinations += expected == PK_Success;
    }
    EXPECT_EQ(destinations, 37); // 47 but the eight of 4:2:2 and V210's two
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_NTSCDV25, PK_PixelFormat_YUV_420_MPEG2_FRAME,
          PK_PixelFormat{0xffffffff}, PK_PixelFormat{0x100}}) {
        EXPECT_EQ(composite(format, fine, fine), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(composite(fine, format, fine), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(composite(format, format, format), PK_ErrBadDstFormat) << std::hex << format;
    }
}

TEST_F(OneBitMaskComposite, RefusesSizesAndNullPointersAndDoesNothingForNoPixels) {
    uint8_t pixels[64] = {}, bits = 0;
    const uint8_t* mask = &bits;
    void *first = pixels, *second = pixels, *destination = pixels;
    const auto composite = [&](int32_t width, int32_t height) {
        const PK_PixelFormat format = PK_PixelFormat_BGRA_4444_8u;
        return PK_OneBitMaskComposite(first, 8, format, second, 8, format, mask, 1, 0, destination, 8, format,
                                      width, height, 4);
    };
    EXPECT_EQ(composite(-1, 1), PK_ErrFailed);
    EXPECT_EQ(composite(1, -1), PK_ErrFailed);
    EXPECT_EQ(composite(0, INT32_MIN), PK_ErrFailed);
    EXPECT_EQ(composite(INT32_MAX / 16 + 1, 1), PK_ErrFailed);
    for (void** pointer : {&first, &second, &destination}) {
        *pointer = nullptr;
        EXPECT_EQ(composite(1, 1), PK_ErrFailed);
        EXPECT_EQ(composite(0, 1), PK_Success);
        EXPECT_EQ(composite(1, 0), PK_Success);
        *pointer = pixels;
    }
    mask = nullptr;
    EXPECT_EQ(composite(1, 1), PK_ErrFailed);
    EXPECT_EQ(composite(0, 0), PK_Success);
}
