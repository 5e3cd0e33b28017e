// The planes of an image and how many samples each has.

#include "frame/Planes.h"

#include <gtest/gtest.h>

namespace PK {
namespace {

struct Size {
    int32_t width, height;
};

Size ChromaOf(int32_t width, int32_t height, Chroma chroma) {
    const void* const none[3] = {};
    const int32_t rowBytes[3] = {};
    const auto [y, u, v] = PlanesOf<const uint8_t>(none, rowBytes, width, height, chroma);
    EXPECT_EQ(y.width, width);
    EXPECT_EQ(y.height, height);
    EXPECT_EQ(u.width, v.width);
    EXPECT_EQ(u.height, v.height);
    return {u.width, u.height};
}

TEST(Planes, ChromaOf420IsHalfBothWaysRoundedDown) {
    for (const auto& [size, chroma] : {std::pair<Size, Size>{{8, 6}, {4, 3}},
                                       {{7, 5}, {3, 2}},
                                       {{1, 1}, {0, 0}},
                                       {{INT32_MAX, INT32_MAX}, {0x3fffffff, 0x3fffffff}}}) {
        const Size got = ChromaOf(size.width, size.height, Chroma::k420);
        EXPECT_EQ(got.width, chroma.width);
        EXPECT_EQ(got.height, chroma.height);
    }
}

TEST(Planes, ChromaOf422IsHalfTheWidthRoundedUp) {
    for (const auto& [size, chroma] : {std::pair<Size, Size>{{8, 6}, {4, 6}},
                                       {{7, 5}, {4, 5}},
                                       {{1, 1}, {1, 1}},
                                       {{INT32_MAX, 1}, {0x40000000, 1}}}) {
        const Size got = ChromaOf(size.width, size.height, Chroma::k422);
        EXPECT_EQ(got.width, chroma.width);
        EXPECT_EQ(got.height, chroma.height);
    }
}

TEST(Planes, AreEmptyWithoutRowsOrColumns) {
    EXPECT_TRUE((Plane<uint8_t>{nullptr, 0, 0, 4}.IsEmpty()));
    EXPECT_TRUE((Plane<uint8_t>{nullptr, 0, 4, 0}.IsEmpty()));
    EXPECT_FALSE((Plane<uint8_t>{nullptr, 0, 1, 1}.IsEmpty()));
}

TEST(Planes, KeepPointersAndStepsOfTheCaller) {
    uint8_t samples[301] = {};
    void* const pointers[3] = {samples, samples + 1, samples + 2};
    const int32_t rowBytes[3] = {100, -50, INT32_MIN};
    const auto planes = PlanesOf<uint8_t>(pointers, rowBytes, 4, 4, Chroma::k420);
    for (size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(planes[i].pixels, pointers[i]);
        EXPECT_EQ(planes[i].rowBytes, rowBytes[i]);
    }
    EXPECT_EQ(planes[0].Row(3), samples + 300);
}

TEST(Planes, InABlockLieWhereTheCatalogueSays) {
    constexpr PK_PixelFormat format = PK_PixelFormat_YUV_420_MPEG2_FRAME;
    uint8_t block[1] = {};
    void* pointers[3];
    int32_t rowBytes[3];
    ASSERT_EQ(PK_GetPlanarBuffers(block, format, 131, 33, pointers, rowBytes), PK_Success);
    const auto planes = PlanesInBlock(block, format, 131, 33);
    for (size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(planes[i].pixels, pointers[i]);
        EXPECT_EQ(planes[i].rowBytes, rowBytes[i]);
    }
    EXPECT_EQ(planes[2].width, 65);
    EXPECT_EQ(planes[2].height, 16);
}

} // namespace
} // namespace PK
