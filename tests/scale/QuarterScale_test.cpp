// Quarter-resolution scaling: which samples are taken, how many are written, and what stays.

#include "frame/Capabilities.h"
#include "support/FlagScope.h"
#include "support/GuardedImage.h"

#include <PixelKiln/QuarterScale.h>

#include <gtest/gtest.h>

#include <array>
#include <memory>

using namespace PKTest;

namespace {

using Planes = std::array<std::unique_ptr<GuardedImage>, 3>;

/// What a call is given of planes.
struct Arguments {
    const void* source[3];
    void* planes[3];
    int32_t rowBytes[3];

    explicit Arguments(const Planes& image) {
        for (size_t i = 0; i < 3; ++i) {
            source[i] = planes[i] = image[i]->Pixels();
            rowBytes[i] = image[i]->RowBytes();
        }
    }
};

struct Extent {
    size_t width, rows;
};

Planes MakePlanes(Extent luma, Extent chroma, Random& random) {
    Planes planes;
    for (size_t i = 0; i < 3; ++i) {
        const Extent& extent = i == 0 ? luma : chroma;
        const ImageShape shape = {extent.width, static_cast<int32_t>(extent.rows), random.Below(3) * 5,
                                  random.Below(2) != 0};
        planes[i] = std::make_unique<GuardedImage>(shape, random);
    }
    return planes;
}

/// The samples of a row that the two forms write.
size_t WrittenSamples(size_t rowWidth, bool sse2) {
    if (!sse2) return rowWidth / 2;
    const size_t byVectors = (rowWidth >> 5) * 32;
    const size_t byTail = (rowWidth & 31) / 2;
    return std::max(byVectors, byTail);
}

void CheckReduction(size_t width, size_t height, int32_t field, bool sse2, Random& random) {
    SCOPED_TRACE(testing::Message() << width << " x " << height << ", field " << field << ", SSE2 " << sse2
                                    << ", seed " << random.Seed());
    const size_t luma = WrittenSamples(width, sse2), chroma = WrittenSamples(width / 2, sse2);
    // As long as reads may reach: the last row that is taken ends at the guard page.
    const size_t lumaRows = height / 2 == 0 ? 0 : height / 2 * 2 - (field == 1 ? 1 : 0);
    const size_t chromaRows = height / 4 == 0 ? 0 : height / 4 * 2 - 1;
    const Planes source = MakePlanes({2 * luma, lumaRows}, {2 * chroma, chromaRows}, random);
    const Planes destination = MakePlanes({luma + 3, height / 2}, {chroma + 3, height / 4}, random);

    const Arguments from(source), to(destination);
    ASSERT_EQ(PK_QuarterScalePlanar420_8u(from.source, from.rowBytes, to.planes, to.rowBytes,
                                          static_cast<uint32_t>(width), static_cast<uint32_t>(height), field),
              PK_Success);
    for (size_t i = 0; i < 3; ++i) {
        const size_t samples = i == 0 ? luma : chroma, rows = i == 0 ? height / 2 : height / 4;
        const size_t firstRow = i == 0 && field == 2 ? 1 : 0;
        std::vector<std::vector<uint8_t>> expected(rows);
        for (size_t row = 0; row < rows; ++row)
            for (size_t column = 0; column < samples; ++column)
                expected[row].push_back(source[i]->Row(static_cast<int32_t>(2 * row + firstRow))[2 * column]);
        SCOPED_TRACE(testing::Message() << "plane " << i);
        ASSERT_NO_FATAL_FAILURE(destination[i]->ExpectRows(expected));
    }
}

void CheckPacking(size_t width, size_t height, bool yuyv, int32_t field, Random& random) {
    SCOPED_TRACE(testing::Message() << width << " x " << height << ", YUYV " << yuyv << ", field " << field
                                    << ", seed " << random.Seed());
    const size_t pairs = (width + 1) / 2, rows = height / 2;
    const size_t lumaRows = rows == 0 ? 0 : 2 * rows - (field == 2 ? 0 : 1);
    const Planes source = MakePlanes({width, lumaRows}, {pairs, rows}, random);
    const GuardedImage packed(
        {4 * pairs, static_cast<int32_t>(rows), random.Below(2) * 7, random.Below(2) != 0}, random);

    const Arguments from(source);
    ASSERT_EQ(PK_QuarterScalePlanar_8uAndConvertTo422_8u(from.source, from.rowBytes, packed.Pixels(),
                                                         packed.RowBytes(), static_cast<uint32_t>(width),
                                                         static_cast<uint32_t>(height), yuyv, field),
              PK_Success);
    std::vector<std::vector<uint8_t>> expected(rows);
    for (size_t row = 0; row < rows; ++row) {
        const auto place = static_cast<int32_t>(row);
        const uint8_t* luma = source[0]->Row(2 * place + (field == 2 ? 1 : 0));
        for (size_t k = 0; k < pairs; ++k) {
            const uint8_t y0 = luma[2 * k], y1 = 2 * k + 1 < width ? luma[2 * k + 1] : uint8_t{0};
            const uint8_t c1 = source[1]->Row(place)[k], c2 = source[2]->Row(place)[k];
            const std::array<uint8_t, 4> pair =
                yuyv ? std::array<uint8_t, 4>{y0, c1, y1, c2} : std::array<uint8_t, 4>{c1, y0, c2, y1};
            expected[row].insert(expected[row].end(), pair.begin(), pair.end());
        }
    }
    packed.ExpectRows(expected);
}

class QuarterScale : public testing::Test {
protected:
    QuarterScale() { PK::SetCapabilities(PK::ReadProcessor()); }

    FlagScope fFlags;
    Random fRandom{330};
};

} // namespace

TEST_F(QuarterScale, TheSecondFieldTakesLumaRows1And3AndChromaRow0) {
    const uint8_t luma[4][4] = {{1, 2, 3, 4}, {5, 6, 7, 8}, {9, 10, 11, 12}, {13, 14, 15, 16}};
    const uint8_t u[2][2] = {{21, 22}, {23, 24}}, v[2][2] = {{31, 32}, {33, 34}};
    for (const bool sse2 : {false, true}) {
        PK::sCPUHasSSE2 = sse2;
        uint8_t lumaOut[2][2] = {}, uOut = 0, vOut = 0;
        const void* const source[3] = {luma, u, v};
        const int32_t sourceRowBytes[3] = {4, 2, 2};
        void* const destination[3] = {lumaOut, &uOut, &vOut};
        const int32_t destinationRowBytes[3] = {2, 1, 1};
        ASSERT_EQ(
            PK_QuarterScalePlanar420_8u(source, sourceRowBytes, destination, destinationRowBytes, 4, 4, 2),
            PK_Success);
        EXPECT_EQ(lumaOut[0][0], 5);
        EXPECT_EQ(lumaOut[0][1], 7);
        EXPECT_EQ(lumaOut[1][0], 13);
        EXPECT_EQ(lumaOut[1][1], 15);
        EXPECT_EQ(uOut, 21);
        EXPECT_EQ(vOut, 31);
    }
}

TEST_F(QuarterScale, AWidthOf720FillsWholeVectorsWithSSE2) {
    PK::sCPUHasSSE2 = 1;
    CheckReduction(720, 4, 1, true, fRandom);
    EXPECT_EQ(WrittenSamples(720, true), 704u);
    EXPECT_EQ(WrittenSamples(360, true), 352u);
}

TEST_F(QuarterScale, EveryWidthOfBothForms) {
    for (const bool sse2 : {false, true}) {
        PK::sCPUHasSSE2 = sse2;
        for (size_t width = 0; width <= 260; ++width)
            CheckReduction(width, 4 + fRandom.Below(6), 1 + static_cast<int32_t>(width % 2), sse2, fRandom);
    }
}

TEST_F(QuarterScale, EveryHeightOfBothFields) {
    for (const bool sse2 : {false, true}) {
        PK::sCPUHasSSE2 = sse2;
        for (size_t height = 0; height <= 13; ++height)
            for (const int32_t field : {1, 2}) CheckReduction(70, height, field, sse2, fRandom);
    }
}

TEST_F(QuarterScale, HeightsOf2And3HaveNoChroma) {
    for (const uint32_t height : {2u, 3u}) {
        const uint8_t luma[3][4] = {{1, 2, 3, 4}, {5, 6, 7, 8}, {9, 10, 11, 12}};
        uint8_t out[2] = {};
        const void* const source[3] = {luma, nullptr, nullptr}; // chroma is not looked at
        void* const destination[3] = {out, nullptr, nullptr};
        const int32_t rowBytes[3] = {4, 2, 2};
        ASSERT_EQ(PK_QuarterScalePlanar420_8u(source, rowBytes, destination, rowBytes, 4, height, 1),
                  PK_Success);
        EXPECT_EQ(out[0], 1);
        EXPECT_EQ(out[1], 3);
    }
}

TEST_F(QuarterScale, RefusesOtherFieldsBeforeAllElse) {
    for (const int32_t field : {0, 3, -1, INT32_MIN, INT32_MAX}) {
        EXPECT_EQ(PK_QuarterScalePlanar420_8u(nullptr, nullptr, nullptr, nullptr, UINT32_MAX, 4, field),
                  PK_ErrBadFieldType);
    }
}

TEST_F(QuarterScale, RefusesNullPlanesAndSizesOutOfRange) {
    uint8_t bytes[256] = {};
    const void* source[3] = {bytes, bytes, bytes};
    void* destination[3] = {bytes + 128, bytes + 128, bytes + 128};
    const int32_t rowBytes[3] = {8, 4, 4};
    const auto reduce = [&](uint32_t width, uint32_t height) {
        return PK_QuarterScalePlanar420_8u(source, rowBytes, destination, rowBytes, width, height, 1);
    };
    EXPECT_EQ(reduce(0x80000000u, 4), PK_ErrFailed);
    EXPECT_EQ(reduce(8, UINT32_MAX), PK_ErrFailed);
    for (size_t i = 0; i < 3; ++i) {
        source[i] = nullptr;
        EXPECT_EQ(reduce(8, 4), PK_ErrFailed);
        EXPECT_EQ(reduce(0, 4), PK_Success);
        EXPECT_EQ(reduce(8, 0), PK_Success);
        source[i] = bytes;
        destination[i] = nullptr;
        EXPECT_EQ(reduce(8, 4), PK_ErrFailed);
        destination[i] = bytes + 128;
    }
    EXPECT_EQ(PK_QuarterScalePlanar420_8u(nullptr, rowBytes, destination, rowBytes, 8, 4, 1), PK_ErrFailed);
    EXPECT_EQ(PK_QuarterScalePlanar420_8u(source, nullptr, destination, rowBytes, 8, 4, 1), PK_ErrFailed);
    EXPECT_EQ(PK_QuarterScalePlanar420_8u(source, rowBytes, nullptr, rowBytes, 8, 4, 1), PK_ErrFailed);
    EXPECT_EQ(PK_QuarterScalePlanar420_8u(source, rowBytes, destination, nullptr, 8, 4, 1), PK_ErrFailed);
    for (const uint8_t byte : bytes) ASSERT_EQ(byte, 0) << "a refusal wrote";
}

TEST_F(QuarterScale, PacksAPairAndThePartOfAPair) {
    const uint8_t luma[2][3] = {{1, 2, 3}, {4, 5, 6}};
    const uint8_t u[2] = {20, 21}, v[2] = {30, 31};
    const void* const source[3] = {luma, u, v};
    const int32_t rowBytes[3] = {3, 2, 2};
    using Packed = std::array<uint8_t, 8>;
    const auto pack = [&](uint32_t width, bool yuyv, int32_t field) {
        Packed packed;
        packed.fill(99);
        EXPECT_EQ(PK_QuarterScalePlanar_8uAndConvertTo422_8u(source, rowBytes, packed.data(), 8, width, 2,
                                                             yuyv, field),
                  PK_Success);
        return packed;
    };
    EXPECT_EQ(pack(2, true, 1), (Packed{1, 20, 2, 30, 99, 99, 99, 99}));
    EXPECT_EQ(pack(2, false, 1), (Packed{20, 1, 30, 2, 99, 99, 99, 99}));
    EXPECT_EQ(pack(3, true, 2), (Packed{4, 20, 5, 30, 6, 21, 0, 31}));
    EXPECT_EQ(pack(3, false, 2), (Packed{20, 4, 30, 5, 21, 6, 31, 0}));
    EXPECT_EQ(pack(1, true, 1), (Packed{1, 20, 0, 30, 99, 99, 99, 99}));
    for (const int32_t field : {0, -2, 3}) EXPECT_EQ(pack(3, true, field), pack(3, true, 1)) << field;
}

TEST_F(QuarterScale, PacksEverySizeInBothOrdersAndForms) {
    for (const bool sse2 : {false, true}) {
        PK::sCPUHasSSE2 = sse2;
        for (size_t width = 0; width <= 140; ++width)
            for (const bool yuyv : {false, true})
                CheckPacking(width, fRandom.Below(8), yuyv, static_cast<int32_t>(fRandom.Below(4)), fRandom);
    }
}

TEST_F(QuarterScale, PackingRefusesNullPlanesAndSizesOutOfRange) {
    uint8_t bytes[64] = {};
    const void* source[3] = {bytes, bytes, bytes};
    const int32_t rowBytes[3] = {4, 2, 2};
    const auto pack = [&](void* destination, uint32_t width, uint32_t height) {
        return PK_QuarterScalePlanar_8uAndConvertTo422_8u(source, rowBytes, destination, 8, width, height,
                                                          true, 1);
    };
    EXPECT_EQ(pack(bytes, 0x80000000u, 2), PK_ErrFailed);
    EXPECT_EQ(pack(bytes, 4, 0x80000000u), PK_ErrFailed);
    EXPECT_EQ(pack(nullptr, 4, 2), PK_ErrFailed);
    EXPECT_EQ(pack(nullptr, 0, 2), PK_Success);
    EXPECT_EQ(pack(nullptr, 4, 1), PK_Success);
    for (const void*& plane : source) {
        plane = nullptr;
        EXPECT_EQ(pack(bytes, 4, 2), PK_ErrFailed);
        plane = bytes;
    }
    EXPECT_EQ(PK_QuarterScalePlanar_8uAndConvertTo422_8u(nullptr, rowBytes, bytes, 8, 4, 2, true, 1),
              PK_ErrFailed);
    EXPECT_EQ(PK_QuarterScalePlanar_8uAndConvertTo422_8u(source, nullptr, bytes, 8, 4, 2, true, 1),
              PK_ErrFailed);
    for (const uint8_t byte : bytes) ASSERT_EQ(byte, 0) << "a refusal wrote";
}
