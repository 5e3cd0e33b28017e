// The bridges from three planes of 10-bit words.

#include "reference/ReferenceBridges.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <PixelKiln/CodecBridges.h>

#include <cstring>
#include <functional>

using namespace PKTest;

namespace {

using Convert =
    std::function<PK_Result(const void* const*, const int32_t*, int32_t, int32_t, void*, int32_t)>;

/// Planes of random words of 10 bits, each with padding and a direction of its own.
class PlanarImage {
public:
    PlanarImage(int width, int32_t height, Random& random)
        : fWidth(width), fLuma(Shape(width, height, random), random),
          fU(Shape((width + 1) / 2, height, random), random),
          fV(Shape((width + 1) / 2, height, random), random) {
        for (int32_t row = 0; row < height; ++row) {
            KeepTenBits(fLuma.Row(row), width);
            KeepTenBits(fU.Row(row), (width + 1) / 2);
            KeepTenBits(fV.Row(row), (width + 1) / 2);
        }
    }

    PlanarRow Row(int32_t row) const {
        return {Words(fLuma.Row(row), fWidth), Words(fU.Row(row), (fWidth + 1) / 2),
                Words(fV.Row(row), (fWidth + 1) / 2)};
    }

    PK_Result Run(const Convert& convert, int32_t height, const GuardedImage& destination) const {
        const void* const planes[3] = {fLuma.Pixels(), fU.Pixels(), fV.Pixels()};
        const int32_t rowBytes[3] = {fLuma.RowBytes(), fU.RowBytes(), fV.RowBytes()};
        return convert(planes, rowBytes, fWidth, height, destination.Pixels(), destination.RowBytes());
    }

private:
    static ImageShape Shape(int samples, int32_t height, Random& random) {
        return {2 * static_cast<size_t>(samples), height, random.Below(2) * random.Below(20),
                random.Below(2) == 0};
    }
    static void KeepTenBits(uint8_t* row, int samples) {
        for (int i = 0; i < samples; ++i) row[2 * i + 1] &= 3;
    }
    static std::vector<uint32_t> Words(const uint8_t* row, int samples) {
        std::vector<uint32_t> words;
        for (int i = 0; i < samples; ++i)
            words.push_back(row[2 * i] | static_cast<uint32_t>(row[2 * i + 1]) << 8);
        return words;
    }

    int fWidth;
    GuardedImage fLuma, fU, fV;
};

size_t V210Bytes(int width) {
    return static_cast<size_t>((width + 5) / 6) * 16;
}

using Rows = std::vector<Bytes>;

Rows ExpectedSame(const PlanarImage& image, int width, int32_t height) {
    Rows rows;
    for (int32_t row = 0; row < height; ++row) rows.push_back(ReferencePlanarToV210(image.Row(row), width));
    return rows;
}

Rows ExpectedTwice(const PlanarImage& image, int width, int32_t height) {
    Rows rows;
    for (int32_t row = 0; row < height; ++row) {
        const PlanarRow next = image.Row(std::min(row + 1, height - 1));
        rows.push_back(ReferencePlanarToV210(image.Row(row), width));
        rows.push_back(ReferencePlanarToV210(ReferenceAverage(image.Row(row), next), width));
    }
    return rows;
}

Rows ExpectedQuarter(const PlanarImage& image, int width, int32_t height) {
    Rows rows;
    for (int32_t row = 0; row + 1 < height; row += 2)
        rows.push_back(ReferencePlanarToV210(ReferenceEverySecond(image.Row(row), width), width / 2));
    return rows;
}

template <int32_t kFirstRow>
Rows ExpectedVUYX(const PlanarImage& image, int width, int32_t height) {
    Rows rows;
    for (int32_t row = height / 2; row-- > 0;)
        rows.push_back(ReferencePlanarToVUYX(image.Row(row + kFirstRow), width));
    return rows;
}

template <int32_t kField>
PK_Result ToVUYX(const void* const planes[3], const int32_t planeRowBytes[3], int32_t width, int32_t height,
                 void* destination, int32_t destinationRowBytes) {
    return PK_ConvertW210toQuarterResVUYX_8u(planes, planeRowBytes, width, height, destination,
                                             destinationRowBytes, kField);
}

const struct {
    const char* name;
    Convert convert;
    Rows (*expected)(const PlanarImage& image, int width, int32_t height);
    size_t (*rowLength)(int width);
    int32_t (*rows)(int32_t height);
} kBridges[] = {
    {"V210", PK_ConvertW210toV210, ExpectedSame, V210Bytes, [](int32_t height) { return height; }},
    {"twice", PK_TempConvertW210toV210ToReplacePanasonicLTDebayering, ExpectedTwice, V210Bytes,
     [](int32_t height) { return 2 * height; }},
    {"quarter", PK_QuarterScaleConvertW210toV210, ExpectedQuarter,
     [](int width) { return V210Bytes(width / 2); }, [](int32_t height) { return height / 2; }},
    {"VUYX frame", ToVUYX<0>, ExpectedVUYX<0>, [](int width) { return static_cast<size_t>(width / 2) * 4; },
     [](int32_t height) { return height / 2; }},
    {"VUYX field 1", ToVUYX<1>, ExpectedVUYX<0>, [](int width) { return static_cast<size_t>(width / 2) * 4; },
     [](int32_t height) { return height / 2; }},
    {"VUYX field 2", ToVUYX<2>, ExpectedVUYX<1>, [](int width) { return static_cast<size_t>(width / 2) * 4; },
     [](int32_t height) { return height / 2; }},
};

} // namespace

TEST(W210, GivesWhatTheRuleSays) {
    Random random(47);
    for (const auto& bridge : kBridges)
        for (int width = 1; width <= 131; ++width) {
            const int32_t height = 1 + static_cast<int32_t>(random.Below(5));
            SCOPED_TRACE(testing::Message()
                         << bridge.name << " " << width << " x " << height << ", seed " << random.Seed());
            const PlanarImage image(width, height, random);
            const GuardedImage destination({bridge.rowLength(width), bridge.rows(height),
                                            random.Below(2) * random.Below(40), random.Below(2) == 0},
                                           random);
            const Rows expected = bridge.expected(image, width, height);
            AtEveryTarget([&] {
                destination.Restore();
                ASSERT_EQ(image.Run(bridge.convert, height, destination), PK_Success);
                destination.ExpectRows(expected);
            });
            if (HasFatalFailure()) return;
        }
}

TEST(W210, FormsAGroup) {
    const uint16_t y[6] = {1, 2, 3, 4, 5, 6}, u[3] = {11, 12, 13}, v[3] = {21, 22, 23};
    const void* const planes[3] = {y, u, v};
    const int32_t rowBytes[3] = {12, 6, 6};
    uint32_t group[4] = {};
    ASSERT_EQ(PK_ConvertW210toV210(planes, rowBytes, 6, 1, group, 16), PK_Success);
    EXPECT_EQ(group[0], 11u | 1u << 10 | 21u << 20);
    EXPECT_EQ(group[1], 2u | 12u << 10 | 3u << 20);
    EXPECT_EQ(group[2], 22u | 4u << 10 | 13u << 20);
    EXPECT_EQ(group[3], 5u | 23u << 10 | 6u << 20);
}

TEST(W210, WritesAPartialGroupUpToTheEndOfTheRow) {
    const uint16_t y[7] = {0, 0, 0, 0, 0, 0, 7}, u[4] = {0, 0, 0, 17}, v[4] = {0, 0, 0, 27};
    const void* const planes[3] = {y, u, v};
    const int32_t rowBytes[3] = {14, 8, 8};
    const uint32_t full[4] = {17u | 7u << 10 | 27u << 20, 7u | 17u << 10 | 7u << 20,
                              27u | 7u << 10 | 17u << 20, 7u | 27u << 10 | 7u << 20};
    for (const int32_t end : {0, 15, 16, 20, 26, 31, 32, 64}) {
        for (const int32_t sign : {1, -1}) {
            SCOPED_TRACE(testing::Message() << end * sign);
            uint8_t row[40];
            std::fill(row, row + 40, uint8_t{0xa5});
            ASSERT_EQ(PK_ConvertW210toV210(planes, rowBytes, 7, 1, row, sign * end), PK_Success);
            uint8_t expected[40];
            std::fill(expected, expected + 40, uint8_t{0xa5});
            std::memset(expected, 0, 16);
            std::memcpy(expected + 16, full, static_cast<size_t>(std::clamp(end - 16, 0, 16)));
            EXPECT_TRUE(std::equal(row, row + 40, expected));
        }
    }
}

TEST(W210, AveragesTheRowsBetweenAndRoundsDown) {
    const uint16_t y[12] = {100, 0, 0, 0, 0, 0, 101, 0, 0, 0, 0, 0}, chroma[6] = {512, 0, 0, 515, 0, 0};
    const void* const planes[3] = {y, chroma, chroma};
    const int32_t rowBytes[3] = {12, 6, 6};
    uint32_t rows[16] = {};
    ASSERT_EQ(PK_TempConvertW210toV210ToReplacePanasonicLTDebayering(planes, rowBytes, 6, 2, rows, 16),
              PK_Success);
    EXPECT_EQ(rows[0], 512u | 100u << 10 | 512u << 20);
    EXPECT_EQ(rows[4], 513u | 100u << 10 | 513u << 20);
    EXPECT_EQ(rows[8], 515u | 101u << 10 | 515u << 20);
    EXPECT_EQ(rows[12], rows[8]) << "the last row averages with itself";
}

TEST(W210, FieldTwoOfTwoRowsIsTheSecondRow) {
    const uint16_t y[4] = {1000, 1000, 401, 406}, u[2] = {9, 404}, v[2] = {9, 1023};
    const void* const planes[3] = {y, u, v};
    const int32_t rowBytes[3] = {4, 2, 2};
    uint8_t pixel[4] = {};
    ASSERT_EQ(PK_ConvertW210toQuarterResVUYX_8u(planes, rowBytes, 2, 2, pixel, 4, 2), PK_Success);
    const uint8_t expected[4] = {255, 101, 100, 255};
    EXPECT_TRUE(std::equal(expected, expected + 4, pixel));
}

TEST(W210, EveryFieldButTheSecondBeginsAtTheFirstRow) {
    const uint16_t y[4] = {401, 406, 1000, 1000}, u[2] = {404, 9}, v[2] = {1023, 9};
    const void* const planes[3] = {y, u, v};
    const int32_t rowBytes[3] = {4, 2, 2};
    const uint8_t first[4] = {255, 101, 100, 255};
    for (const int32_t field : {INT32_MIN, -2, -1, 0, 1, 3, 4, 6, 0x10002, INT32_MAX}) {
        uint8_t pixel[4] = {};
        ASSERT_EQ(PK_ConvertW210toQuarterResVUYX_8u(planes, rowBytes, 2, 2, pixel, 4, field), PK_Success);
        EXPECT_TRUE(std::equal(first, first + 4, pixel)) << field;
    }
}

TEST(W210, SucceedsWithoutWorkAndRefusesWhatItCannotKnow) {
    uint16_t words[64] = {};
    const void* const planes[3] = {words, words, words};
    const int32_t rowBytes[3] = {16, 16, 16};
    for (const auto& bridge : kBridges) {
        SCOPED_TRACE(bridge.name);
        EXPECT_EQ(bridge.convert(nullptr, nullptr, 6, 0, nullptr, 16), PK_Success);
        EXPECT_EQ(bridge.convert(nullptr, nullptr, 6, -3, nullptr, 16), PK_Success);
        EXPECT_EQ(bridge.convert(nullptr, nullptr, 0, 6, nullptr, 16), PK_Success);
        EXPECT_EQ(bridge.convert(nullptr, rowBytes, 6, 2, words, 16), PK_ErrFailed);
        EXPECT_EQ(bridge.convert(planes, nullptr, 6, 2, words, 16), PK_ErrFailed);
        EXPECT_EQ(bridge.convert(planes, rowBytes, 6, 2, nullptr, 16), PK_ErrFailed);
        EXPECT_EQ(bridge.convert(planes, rowBytes, -6, 2, words, 16), PK_ErrFailed);
        EXPECT_EQ(bridge.convert(planes, rowBytes, INT32_MAX, 2, words, 16), PK_ErrFailed);
        for (size_t missing = 0; missing < 3; ++missing) {
            const void* some[3] = {words, words, words};
            some[missing] = nullptr;
            EXPECT_EQ(bridge.convert(some, rowBytes, 6, 2, words, 16), PK_ErrFailed);
        }
    }
}
