// Views of an image: other orders of rows, and fields.

#include "convert/Image.h"

#include "frame/DebugSwitches.h"
#include "frame/Planes.h"
#include "support/FlagScope.h"

#include <gtest/gtest.h>

#include <vector>

namespace PK {
namespace {

constexpr int32_t kStep = 16;

/// The rows of the walk by their place in memory.
template <class View>
std::vector<ptrdiff_t> Rows(const View& view, const uint8_t* memory) {
    std::vector<ptrdiff_t> rows;
    for (int32_t row = 0; row < view.height; ++row) rows.push_back((view.Row(row) - memory) / kStep);
    return rows;
}

using List = std::vector<ptrdiff_t>;

class ImageViews : public testing::Test {
protected:
    SourceImage Of(int32_t height, PK_PixelFormat format = PK_PixelFormat_UYVY_422_8u) const {
        return {fMemory, kStep, format, 4, height};
    }

    uint8_t fMemory[8 * kStep] = {};
};

TEST_F(ImageViews, ReversedAndReversedAgain) {
    const SourceImage reversed = Reversed(Of(3));
    EXPECT_EQ(Rows(reversed, fMemory), (List{2, 1, 0}));
    EXPECT_EQ(Rows(Reversed(reversed), fMemory), (List{0, 1, 2}));
    EXPECT_EQ(reversed.width, 4);
}

TEST_F(ImageViews, FromTopGoesByTheOriginOfTheFormat) {
    EXPECT_EQ(Rows(FromTop(Of(3, PK_PixelFormat_UYVY_422_8u)), fMemory), (List{0, 1, 2}));
    EXPECT_EQ(Rows(FromTop(Of(3, PK_PixelFormat_BGRA_4444_8u)), fMemory), (List{2, 1, 0}));
    PKTest::FlagScope flags;
    sAllOriginsTopLeft = 1;
    EXPECT_EQ(Rows(FromTop(Of(3, PK_PixelFormat_BGRA_4444_8u)), fMemory), (List{0, 1, 2}));
}

TEST_F(ImageViews, FieldsShareTheRowsAndTheFirstHasTheOddOne) {
    EXPECT_EQ(Rows(Field(Of(5), 0), fMemory), (List{0, 1, 2, 3, 4}));
    EXPECT_EQ(Rows(Field(Of(5), 1), fMemory), (List{0, 2, 4}));
    EXPECT_EQ(Rows(Field(Of(5), 2), fMemory), (List{1, 3}));
    EXPECT_EQ(Rows(Field(Of(4), 1), fMemory), (List{0, 2}));
    EXPECT_EQ(Rows(Field(Of(4), 2), fMemory), (List{1, 3}));
    EXPECT_EQ(Rows(Field(Of(1), 1), fMemory), (List{0}));
    EXPECT_EQ(Rows(Field(Of(1), 2), fMemory), (List{}));
}

TEST_F(ImageViews, FieldsOfABottomUpPictureCountFromItsTop) {
    const SourceImage picture = FromTop(Of(4, PK_PixelFormat_BGRA_4444_8u));
    EXPECT_EQ(Rows(Field(picture, 1), fMemory), (List{3, 1}));
    EXPECT_EQ(Rows(Field(picture, 2), fMemory), (List{2, 0}));
}

TEST_F(ImageViews, RowBytesDoubleBeyond32Bits) {
    const SourceImage tall = {fMemory, INT32_MIN, PK_PixelFormat_UYVY_422_8u, 4, 2};
    EXPECT_EQ(Field(tall, 1).rowBytes, ptrdiff_t{INT32_MIN} * 2);
}

TEST_F(ImageViews, PlanesHaveThemToo) {
    const Plane<const uint8_t> plane = {fMemory, kStep, 4, 3};
    EXPECT_EQ(Rows(Field(plane, 2), fMemory), (List{1}));
    EXPECT_EQ(Rows(Reversed(plane), fMemory), (List{2, 1, 0}));
}

} // namespace
} // namespace PK
