// NV12 surfaces to planes: which bytes are taken, from which rows, and what stays.

#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/Planar.h>

#include <gtest/gtest.h>

#include <array>
#include <memory>

using namespace PKTest;

namespace {

using Convert = decltype(&PK_ConvertNV12toYV12_SSE4<0>);
using Planes = std::array<std::unique_ptr<GuardedImage>, 3>;

constexpr Convert kMembers[] = {PK_ConvertNV12toYV12_SSE4<0>, PK_ConvertNV12toYV12_SSE4<1>};

/// As many rows of the source as `rows` rows of member 0 or 1 reach.
int32_t RowsReached(int32_t rows, int member) {
    return rows == 0 ? 0 : rows + member * (rows - 1);
}

std::unique_ptr<GuardedImage> MakeImage(int32_t rowLength, int32_t rows, Random& random) {
    const Guard guard = random.Below(2) ? Guard::kAfter : Guard::kBefore;
    const ImageShape shape = {static_cast<size_t>(rowLength), rows, random.Below(3) * 37,
                              random.Below(2) != 0, guard};
    return std::make_unique<GuardedImage>(shape, random);
}

void CheckSurface(int member, int32_t width, int32_t height, Random& random) {
    SCOPED_TRACE(testing::Message() << "member " << member << ", " << width << " x " << height << ", seed "
                                    << random.Seed());
    const int32_t pairs = width / 2, pairRows = height / 2;
    const auto luma = MakeImage(width, RowsReached(height, member), random);
    const auto chroma = MakeImage(2 * pairs, RowsReached(pairRows, member), random);
    const Planes planes = {MakeImage(width, height, random), MakeImage(pairs, pairRows, random),
                           MakeImage(pairs, pairRows, random)};
    void* const pointers[3] = {planes[0]->Pixels(), planes[1]->Pixels(), planes[2]->Pixels()};
    const int32_t rowBytes[3] = {planes[0]->RowBytes(), planes[1]->RowBytes(), planes[2]->RowBytes()};

    kMembers[member](luma->Pixels(), luma->RowBytes(), chroma->Pixels(), chroma->RowBytes(), pointers,
                     rowBytes, width, height);

    std::vector<std::vector<uint8_t>> y, first(static_cast<size_t>(pairRows)), second = first;
    for (int32_t row = 0; row < height; ++row) y.push_back(luma->RowContent(row * (1 + member)));
    for (int32_t row = 0; row < pairRows; ++row)
        for (int32_t k = 0; k < pairs; ++k) {
            const uint8_t* const pair = chroma->Row(row * (1 + member)) + 2 * k;
            first[static_cast<size_t>(row)].push_back(pair[0]);
            second[static_cast<size_t>(row)].push_back(pair[1]);
        }
    ASSERT_NO_FATAL_FAILURE(planes[0]->ExpectRows(y));
    ASSERT_NO_FATAL_FAILURE(planes[1]->ExpectRows(first));
    ASSERT_NO_FATAL_FAILURE(planes[2]->ExpectRows(second));
}

/// Planes of one surface of 4 x 4 pixels, all bytes of which are told apart.
struct SmallSurface {
    uint8_t luma[4][4] = {{1, 2, 3, 4}, {5, 6, 7, 8}, {9, 10, 11, 12}, {13, 14, 15, 16}};
    uint8_t chroma[2][4] = {{21, 31, 22, 32}, {23, 33, 24, 34}};
    uint8_t y[16] = {}, first[4] = {}, second[4] = {};
    const void *lumaPlane = luma, *chromaPlane = chroma;
    void* planes[3] = {y, first, second};
    int32_t rowBytes[3] = {4, 2, 2};

    void Take(int member, int32_t width, int32_t height) {
        kMembers[member](lumaPlane, 4, chromaPlane, 4, planes, rowBytes, width, height);
    }
    void ExpectUntouched() const {
        for (const uint8_t byte : y) ASSERT_EQ(byte, 0);
        for (const uint8_t byte : first) ASSERT_EQ(byte, 0);
        for (const uint8_t byte : second) ASSERT_EQ(byte, 0);
    }
};

template <size_t kCount>
std::vector<int> Values(const uint8_t (&bytes)[kCount]) {
    return {bytes, bytes + kCount};
}

} // namespace

TEST(ConvertNV12toYV12, TheFirstByteOfEachPairGoesToTheSecondPlane) {
    AtEveryTarget([] {
        SmallSurface surface;
        surface.Take(0, 4, 4);
        EXPECT_EQ(Values(surface.y),
                  (std::vector<int>{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}));
        EXPECT_EQ(Values(surface.first), (std::vector<int>{21, 22, 23, 24}));
        EXPECT_EQ(Values(surface.second), (std::vector<int>{31, 32, 33, 34}));
    });
}

TEST(ConvertNV12toYV12, AFieldIsEveryOtherRowOfLumaAndOfChroma) {
    // 4 x 8, of which the field has 4 luma rows and 2 chroma rows.
    const uint8_t luma[8][4] = {{1, 2, 3, 4},    {91}, {5, 6, 7, 8},     {92},
                                {9, 10, 11, 12}, {93}, {13, 14, 15, 16}, {94}};
    const uint8_t chroma[4][4] = {{21, 31, 22, 32}, {95, 95, 95, 95}, {23, 33, 24, 34}, {96, 96, 96, 96}};
    AtEveryTarget([&] {
        SmallSurface field;
        PK_ConvertNV12toYV12_SSE4<1>(luma, 4, chroma, 4, field.planes, field.rowBytes, 4, 4);
        EXPECT_EQ(Values(field.y), (std::vector<int>{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}));
        EXPECT_EQ(Values(field.first), (std::vector<int>{21, 22, 23, 24}));
        EXPECT_EQ(Values(field.second), (std::vector<int>{31, 32, 33, 34}));

        // The other field begins a row further down.
        PK_ConvertNV12toYV12_SSE4<1>(luma[1], 4, chroma[1], 4, field.planes, field.rowBytes, 1, 4);
        EXPECT_EQ(Values(field.y),
                  (std::vector<int>{91, 2, 3, 4, 92, 6, 7, 8, 93, 10, 11, 12, 94, 14, 15, 16}));
        PK_ConvertNV12toYV12_SSE4<1>(luma[1], 4, chroma[1], 4, field.planes, field.rowBytes, 4, 4);
        EXPECT_EQ(Values(field.first), (std::vector<int>{95, 95, 96, 96}));
        EXPECT_EQ(Values(field.second), (std::vector<int>{95, 95, 96, 96}));
    });
}

TEST(ConvertNV12toYV12, OddSizesLeaveTheLastColumnAndRowWithoutChroma) {
    SmallSurface surface;
    surface.Take(0, 3, 3);
    EXPECT_EQ(Values(surface.y), (std::vector<int>{1, 2, 3, 0, 5, 6, 7, 0, 9, 10, 11, 0, 0, 0, 0, 0}));
    EXPECT_EQ(Values(surface.first), (std::vector<int>{21, 0, 0, 0}));
    EXPECT_EQ(Values(surface.second), (std::vector<int>{31, 0, 0, 0}));
}

TEST(ConvertNV12toYV12, TakesAnyWidthAtEveryTarget) {
    AtEveryTarget([] {
        Random random(2301);
        for (int32_t width = 0; width <= 260; ++width)
            CheckSurface(static_cast<int>(random.Below(2)), width, static_cast<int32_t>(random.Below(6)),
                         random);
    });
}

TEST(ConvertNV12toYV12, TakesHeightsAroundTheBordersOfBands) {
    Random random(2302);
    for (const int member : {0, 1})
        for (const int32_t height : {0, 1, 2, 3, 31, 32, 33, 63, 64, 65, 97})
            for (const int32_t width : {1, 2, 3, 70, 131}) CheckSurface(member, width, height, random);
}

// Beyond 16384 bytes a chroma row is parted in stripes.
TEST(ConvertNV12toYV12, TakesRowsOfSeveralStripes) {
    AtEveryTarget([] {
        Random random(2303);
        for (const int32_t width : {16383, 16384, 16385, 16386, 16500, 40003})
            CheckSurface(static_cast<int>(random.Below(2)), width, 35, random);
    });
}

TEST(ConvertNV12toYV12, TakesRandomSizes) {
    Random random(2304);
    for (int i = 0; i < 200; ++i)
        CheckSurface(static_cast<int>(random.Below(2)), static_cast<int32_t>(random.Below(900)),
                     static_cast<int32_t>(random.Below(150)), random);
}

TEST(ConvertNV12toYV12, SizesWithoutPixelsTouchNothing) {
    for (const int member : {0, 1})
        for (const auto& [width, height] :
             {std::pair{0, 4}, {4, 0}, {-1, 4}, {4, -1}, {INT32_MIN, 4}, {4, INT32_MIN}}) {
            SmallSurface surface;
            surface.Take(member, width, height);
            surface.ExpectUntouched();
            kMembers[member](nullptr, 0, nullptr, 0, nullptr, nullptr, width, height);
        }
}

TEST(ConvertNV12toYV12, ANullWhereThereAreSamplesLeavesAllPlanes) {
    for (const int member : {0, 1}) {
        for (size_t i = 0; i < 3; ++i) {
            SmallSurface surface;
            surface.planes[i] = nullptr;
            surface.Take(member, 4, 2);
            surface.ExpectUntouched();
        }
        SmallSurface surface;
        surface.lumaPlane = nullptr;
        surface.Take(member, 4, 2);
        surface.lumaPlane = surface.luma;
        surface.chromaPlane = nullptr;
        surface.Take(member, 4, 2);
        kMembers[member](surface.luma, 4, surface.chroma, 4, nullptr, surface.rowBytes, 4, 2);
        kMembers[member](surface.luma, 4, surface.chroma, 4, surface.planes, nullptr, 4, 2);
        surface.ExpectUntouched();
    }
}

TEST(ConvertNV12toYV12, ChromaMayBeNullWhereThereIsNone) {
    for (const auto& [width, height] : {std::pair{4, 1}, {1, 2}}) {
        SmallSurface surface;
        surface.chromaPlane = surface.planes[1] = surface.planes[2] = nullptr;
        surface.Take(0, width, height);
        EXPECT_EQ(surface.y[0], 1);
        EXPECT_EQ(surface.y[(height - 1) * 4 + width - 1], surface.luma[height - 1][width - 1]);
    }
}
