// PK_CopyPlanar_8u copies the samples of three planes and nothing between them.

#include "support/GuardedImage.h"

#include <PixelKiln/Planar.h>

#include <gtest/gtest.h>

using namespace PKTest;

namespace {

void CheckCopy(int32_t width, int32_t height, Random& random, bool tight) {
    SCOPED_TRACE(testing::Message() << width << " x " << height << ", tight " << tight << ", seed "
                                    << random.Seed());
    const auto make = [&](int part) {
        const size_t padding = tight ? 0 : random.Below(9);
        return GuardedImage(
            {static_cast<size_t>(width / part), height / part, padding, !tight && random.Below(2) != 0},
            random);
    };
    const GuardedImage from[3] = {make(1), make(2), make(2)}, to[3] = {make(1), make(2), make(2)};
    const void* const source[3] = {from[0].Pixels(), from[1].Pixels(), from[2].Pixels()};
    void* const destination[3] = {to[0].Pixels(), to[1].Pixels(), to[2].Pixels()};
    const int32_t sourceRowBytes[3] = {from[0].RowBytes(), from[1].RowBytes(), from[2].RowBytes()};
    const int32_t destinationRowBytes[3] = {to[0].RowBytes(), to[1].RowBytes(), to[2].RowBytes()};

    ASSERT_EQ(PK_CopyPlanar_8u(source, sourceRowBytes, destination, destinationRowBytes, width, height),
              PK_Success);
    for (int i = 0; i < 3; ++i) {
        SCOPED_TRACE(testing::Message() << "plane " << i);
        to[i].ExpectRows(from[i].Rows());
    }
}

} // namespace

TEST(CopyPlanar, CopiesEverySmallSize) {
    Random random(3301);
    for (int32_t width = 0; width <= 40; ++width)
        for (int32_t height = 0; height <= 9; ++height)
            for (const bool tight : {false, true}) CheckCopy(width, height, random, tight);
}

TEST(CopyPlanar, CopiesFramesThatAreStreamedPastTheCache) {
    Random random(3302);
    CheckCopy(1283, 723, random, true); // odd: whole rows of half the size, and nothing behind them
    CheckCopy(1280, 720, random, true);
    CheckCopy(1280, 720, random, false);
}

TEST(CopyPlanar, RefusesNegativeSizesAndNullPlanes) {
    uint8_t bytes[128] = {};
    const void* source[3] = {bytes, bytes, bytes};
    void* destination[3] = {bytes + 64, bytes + 64, bytes + 64};
    const int32_t rowBytes[3] = {4, 2, 2};
    const auto copy = [&](int32_t width, int32_t height) {
        return PK_CopyPlanar_8u(source, rowBytes, destination, rowBytes, width, height);
    };
    bytes[0] = 1;
    EXPECT_EQ(copy(-1, 4), PK_ErrFailed);
    EXPECT_EQ(copy(4, -1), PK_ErrFailed);
    EXPECT_EQ(copy(0, INT32_MIN), PK_ErrFailed);
    EXPECT_EQ(PK_CopyPlanar_8u(nullptr, rowBytes, destination, rowBytes, 4, 4), PK_ErrFailed);
    EXPECT_EQ(PK_CopyPlanar_8u(source, nullptr, destination, rowBytes, 4, 4), PK_ErrFailed);
    EXPECT_EQ(PK_CopyPlanar_8u(source, rowBytes, nullptr, rowBytes, 4, 4), PK_ErrFailed);
    EXPECT_EQ(PK_CopyPlanar_8u(source, rowBytes, destination, nullptr, 4, 4), PK_ErrFailed);
    for (int i = 0; i < 3; ++i) {
        source[i] = nullptr;
        EXPECT_EQ(copy(4, 4), PK_ErrFailed);
        EXPECT_EQ(copy(4, 0), PK_Success);
        EXPECT_EQ(copy(4, 1), i == 0 ? PK_ErrFailed : PK_Success) << "one row has no chroma";
        bytes[64] = 0; // that copied luma
        source[i] = bytes;
        destination[i] = nullptr;
        EXPECT_EQ(copy(4, 4), PK_ErrFailed);
        destination[i] = bytes + 64;
        ASSERT_EQ(bytes[64], 0) << "a refusal wrote";
    }
}
