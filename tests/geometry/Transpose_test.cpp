// PK_Transpose and PK_RotateImage: every pixel lands where the rule says, and nothing else is touched.

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Rotate.h>

#include "frame/Capabilities.h"
#include "primitives/TransposeKernels.h"
#include "support/FlagScope.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <functional>
#include <vector>

namespace {

using namespace PKTest;

/// An image of whole pixels whose rows are `step` bytes apart, in memory that ends at guard pages.
struct Pixels {
    int32_t rows, columns, pixelBytes;
    int64_t step;
    GuardedRows memory;

    Pixels(int32_t rowCount, int32_t columnCount, int32_t bytes, int32_t padding, bool upward, Guard guard)
        : rows(rowCount), columns(columnCount), pixelBytes(bytes),
          step((upward ? 1 : -1) * (int64_t{columns} * bytes + padding)),
          memory(static_cast<size_t>(rows ? (rows - 1) * std::abs(step) + int64_t{columns} * bytes : 0),
                 guard) {}

    uint8_t* First() const { return memory.Bytes() + (step < 0 ? (rows - 1) * -step : 0); }
    uint8_t* At(int32_t row, int32_t column) const {
        return First() + row * step + int64_t{column} * pixelBytes;
    }
    bool Same(int32_t row, int32_t column, const Pixels& other, int32_t otherRow, int32_t otherColumn) const {
        return std::equal(At(row, column), At(row, column) + pixelBytes, other.At(otherRow, otherColumn));
    }
    /// The bytes between the rows, which nobody may write.
    bool PaddingIs(uint8_t value) const {
        for (int32_t row = 0; row + 1 < rows; ++row) {
            const uint8_t* lower = std::min(At(row, 0), At(row + 1, 0)) + int64_t{columns} * pixelBytes;
            const uint8_t* upper = std::max(At(row, 0), At(row + 1, 0));
            if (!std::all_of(lower, upper, [value](uint8_t byte) { return byte == value; })) return false;
        }
        return true;
    }
};

using TransposeFunction = std::function<void(const Pixels& source, const Pixels& destination)>;

void ByInterface(const Pixels& source, const Pixels& destination) {
    ASSERT_EQ(PK_Success, PK_Transpose(source.First(), static_cast<int32_t>(source.step), destination.First(),
                                       static_cast<int32_t>(destination.step), source.columns, source.rows,
                                       static_cast<uint8_t>(source.pixelBytes)));
}

class TransposeBodies : public TargetTest {
protected:
    /// The body of the target itself, which the interface does not choose for all.
    void ByBody(const Pixels& source, const Pixels& destination) const {
        const auto& kernels = PK::KernelsFor<PK::TransposeKernels>(GetParam());
        const PK::TransposeArea area = {source.First(),   source.step, destination.First(),
                                        destination.step, source.rows, source.columns};
        switch (source.pixelBytes) {
        case 1:
            return kernels.pixels1(area);
        case 2:
            return kernels.pixels2(area);
        case 4:
            return kernels.pixels4(area);
        case 8:
            return kernels.pixels8(area);
        default:
            return kernels.pixels16(area);
        }
    }

    /// Transposes random pixels in rows of random order and distance, which end or begin at a guard page.
    void Check(const TransposeFunction& transpose, int32_t width, int32_t height, int32_t pixelBytes) {
        const int32_t padding = pixelBytes * static_cast<int32_t>(random.Below(3));
        const bool sourceUpward = random.Below(2) != 0, destinationUpward = random.Below(2) != 0;
        const Guard guard = random.Below(2) != 0 ? Guard::kAfter : Guard::kBefore;
        const Pixels source(height, width, pixelBytes, padding, sourceUpward, guard);
        const Pixels destination(width, height, pixelBytes, 2 * padding, destinationUpward, guard);
        random.Fill(source.memory.Bytes(), source.memory.Size());
        std::fill_n(destination.memory.Bytes(), destination.memory.Size(), uint8_t{0xa5});

        transpose(source, destination);
        for (int32_t row = 0; row < height; ++row)
            for (int32_t column = 0; column < width; ++column)
                ASSERT_TRUE(source.Same(row, column, destination, column, row))
                    << pixelBytes << " bytes, " << width << "x" << height << ", row " << row << ", column "
                    << column << ", seed " << random.Seed();
        ASSERT_TRUE(destination.PaddingIs(0xa5));
    }

    Random random{54};
};

TEST_P(TransposeBodies, EveryPixelChangesItsRowForItsColumn) {
    for (const int32_t pixelBytes : {1, 2, 4, 8, 16})
        for (int round = 0; round < 150; ++round) {
            const uint32_t limit = round < 100 ? 40 : 150;
            const auto width = static_cast<int32_t>(random.Below(limit));
            const auto height = static_cast<int32_t>(random.Below(limit));
            ASSERT_NO_FATAL_FAILURE(Check(ByInterface, width, height, pixelBytes));
        }
}

TEST_P(TransposeBodies, EveryWidthAndHeightThatFillsTilesOrDoesNot) {
    const auto byBody = [this](const Pixels& source, const Pixels& destination) {
        ByBody(source, destination);
    };
    for (const int32_t pixelBytes : {1, 2, 4, 8, 16})
        for (int32_t size = 0; size <= 70; ++size) {
            const auto other = static_cast<int32_t>(random.Below(140));
            ASSERT_NO_FATAL_FAILURE(Check(byBody, size, other, pixelBytes));
            ASSERT_NO_FATAL_FAILURE(Check(byBody, other, size, pixelBytes));
            ASSERT_NO_FATAL_FAILURE(Check(byBody, size, size, pixelBytes));
        }
}

TEST_P(TransposeBodies, QuarterTurnsLandWhereTheRuleSays) {
    for (const int32_t degrees : {90, 180, 270, -90, -180, -270})
        for (int round = 0; round < 100; ++round) {
            const auto width = static_cast<int32_t>(1 + random.Below(70));
            const auto height = static_cast<int32_t>(1 + random.Below(70));
            const bool half = degrees % 180 == 0;
            const Pixels source(height, width, 4, 4, random.Below(2) != 0, Guard::kAfter);
            const Pixels destination(half ? height : width, half ? width : height, 4, 8, random.Below(2) != 0,
                                     Guard::kAfter);
            random.Fill(source.memory.Bytes(), source.memory.Size());
            std::fill_n(destination.memory.Bytes(), destination.memory.Size(), uint8_t{0xa5});

            ASSERT_EQ(PK_Success, PK_RotateImage(source.First(), static_cast<int32_t>(source.step),
                                                 destination.First(), static_cast<int32_t>(destination.step),
                                                 width, height, PK_PixelFormat_BGRA_4444_8u, degrees));
            for (int32_t r = 0; r < destination.rows; ++r)
                for (int32_t c = 0; c < destination.columns; ++c) {
                    int32_t row = height - 1 - r, column = width - 1 - c; // 180
                    if (degrees == 90 || degrees == -270) row = height - 1 - c, column = r;
                    if (degrees == 270 || degrees == -90) row = c, column = width - 1 - r;
                    ASSERT_TRUE(destination.Same(r, c, source, row, column))
                        << degrees << " degrees, " << width << "x" << height << ", row " << r << ", column "
                        << c;
                }
            ASSERT_TRUE(destination.PaddingIs(0xa5));
        }
}

INSTANTIATE_TEST_SUITE_P(Targets, TransposeBodies, EveryTarget(), TargetOf);

TEST(Transpose, TwiceIsTheImageItself) {
    const FlagScope flags;
    PK::DetectProcessor();
    Random random(7);
    for (const int32_t pixelBytes : {1, 2, 4, 8, 16}) {
        constexpr int32_t width = 63, height = 130;
        const std::vector<uint8_t> image = random.Bytes(static_cast<size_t>(width * height * pixelBytes));
        std::vector<uint8_t> turned(image.size()), back(image.size());
        const auto bytes = static_cast<uint8_t>(pixelBytes);
        PK_Transpose(image.data(), width * pixelBytes, turned.data(), height * pixelBytes, width, height,
                     bytes);
        PK_Transpose(turned.data(), height * pixelBytes, back.data(), width * pixelBytes, height, width,
                     bytes);
        EXPECT_EQ(image, back);
    }
}

TEST(Transpose, OnlyTheVectorFormKeepsStepsThatAreNoWholePixels) {
    const FlagScope flags;
    PK::DetectProcessor();
    std::array<uint8_t, 64> source{}, destination{};
    for (size_t i = 0; i < source.size(); ++i) source[i] = static_cast<uint8_t>(i);
    // Two rows of one pixel, 7 bytes apart.
    ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 7, destination.data(), 8, 1, 2, 4));
    EXPECT_EQ(7, destination[4]);
    PK_SetDebugFlag(3, 0);
    ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 7, destination.data(), 8, 1, 2, 4));
    EXPECT_EQ(4, destination[4]);
}

TEST(Transpose, PixelsOfTwoBytesAreAlwaysWholeStepsApart) {
    const FlagScope flags;
    PK::DetectProcessor();
    constexpr int32_t width = 8, height = 64; // whole tiles of any body
    constexpr size_t bytes = height * (2 * width + 1);
    std::array<uint8_t, bytes> source{}, destination{};
    for (size_t i = 0; i < source.size(); ++i) source[i] = static_cast<uint8_t>(i);
    for (const int32_t sse2 : {1, 0}) {
        PK_SetDebugFlag(3, sse2);
        destination.fill(0);
        ASSERT_EQ(PK_Success, PK_Transpose(source.data(), 2 * width + 1, destination.data(), 2 * height + 1,
                                           width, height, 2));
        for (int32_t row = 0; row < height; ++row)
            for (int32_t column = 0; column < width; ++column)
                ASSERT_EQ(source[static_cast<size_t>(2 * (row * width + column))],
                          destination[static_cast<size_t>(2 * (column * height + row))])
                    << "SSE2 " << sse2 << ", row " << row << ", column " << column;
    }
}

TEST(Transpose, RefusesWhatItCannotMove) {
    const FlagScope flags;
    uint8_t pixel[16] = {}, out[16] = {1};
    for (const int32_t sse2 : {0, 1}) {
        PK_SetDebugFlag(3, sse2);
        for (const int bytes : {0, 3, 5, 12, 17, 32, 255})
            EXPECT_EQ(PK_ErrBadSrcFormat,
                      PK_Transpose(pixel, 16, out, 16, 1, 1, static_cast<uint8_t>(bytes)));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, out, 16, -1, 1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, out, 16, 1, -1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(nullptr, 16, out, 16, 1, 1, 4));
        EXPECT_EQ(PK_ErrFailed, PK_Transpose(pixel, 16, nullptr, 16, 1, 1, 4));
        EXPECT_EQ(PK_Success, PK_Transpose(nullptr, 16, nullptr, 16, 0, 5, 4));
    }
    EXPECT_EQ(1, out[0]);
}

TEST(RotateImage, RefusesOtherFormatsAndAngles) {
    uint8_t pixel[16] = {}, out[16] = {1};
    for (const PK_PixelFormat format :
         {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_UYVY_422_8u,
          PK_PixelFormat_RGB_444_10u, PK_PixelFormat(0)})
        EXPECT_EQ(PK_ErrBadSrcFormat, PK_RotateImage(pixel, 16, out, 16, 1, 1, format, 90));
    for (const int32_t degrees : {0, 45, 89, 360, -360, 450, INT32_MIN, INT32_MAX})
        EXPECT_EQ(PK_ErrFailed,
                  PK_RotateImage(pixel, 16, out, 16, 1, 1, PK_PixelFormat_VUYP_4444_8u_709, degrees));
    EXPECT_EQ(PK_Success, PK_RotateImage(nullptr, 0, nullptr, 0, 0, 9, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(PK_Success, PK_RotateImage(nullptr, 0, nullptr, 0, 9, -1, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(PK_ErrFailed, PK_RotateImage(nullptr, 4, out, 4, 1, 1, PK_PixelFormat_BGRA_4444_8u, 90));
    EXPECT_EQ(1, out[0]);
}

} // namespace
