// Chroma resampling between 4:4:4 and 4:2:2, alone and in one pass with the matrix to BGR: the filter and its edges, both
// roundings of the average.

#include "support/KernelRows.h"
#include "support/Random.h"
#include "support/Walk.h"

namespace {

using namespace PKTest;
using enum PK::Kernel;
using PK::Kernel;

uint8_t Byte(size_t value) {
    return static_cast<uint8_t>(value);
}

/// The samples of each pair of pixels in the order of YUYV.
template <class Sample>
std::vector<Sample> LumaFirst(std::vector<Sample> uyvy) {
    for (size_t i = 0; i < uyvy.size(); i += 2) std::swap(uyvy[i], uyvy[i + 1]);
    return uyvy;
}

TEST(Downsample444To422Row, FiltersChromaAndKeepsLuma) {
    // U: (300 + 50 + 2) >> 2, (50 + 14 + 255 + 2) >> 2; V: (30 + 20 + 2) >> 2, (20 + 62 + 41 + 2) >> 2
    const Bytes vuya = {10, 100, 16, 0, 20, 50, 17, 1, 31, 7, 18, 2, 41, 255, 19, 3};
    ExpectRow(Downsample444To422Row, 4, vuya, Bytes{88, 16, 13, 17, 80, 18, 31, 19});
    ExpectRow(Downsample444To422Row, 2, vuya, Bytes{88, 16, 13, 17});
    // A lone pixel keeps its chroma and repeats its luma.
    ExpectRow(Downsample444To422Row, 1, vuya, Bytes{100, 16, 10, 16});
    ExpectRow(Downsample444To422Row, 3, vuya, Bytes{88, 16, 13, 17, 7, 18, 31, 18});
}

TEST(Downsample444To422Row, FiltersAllTriplesOfCodes) {
    // Each triple takes the last three of four pixels, in V from the left and in U from the right.
    Bytes source(65536 * 16);
    Walk walk;
    for (size_t centre = 0; centre < 256; ++centre) {
        if (walk.LeavesOut()) continue;
        for (size_t i = 0; i < 65536; ++i) {
            const uint8_t left = Byte(i >> 8), right = Byte(i), c = Byte(centre);
            const uint8_t pixels[] = {left, right, 3, 9, c, c, 4, 9, right, left, 5, 9};
            std::copy(std::begin(pixels), std::end(pixels), &source[i * 16 + 4]);
        }
        ASSERT_NO_FATAL_FAILURE(ExpectReference(Downsample444To422Row, source));
    }
}

TEST(Downsample444To422Float32Row, LeavesALoneLumaAtZero) {
    const Floats vuya = {0, 4, 1, 9, 1, 8, 2, 9, 0.5f, -4, 3, 9, 0.25f, 0, 4, 9};
    ExpectRow(Downsample444To422Float32Row, 4, vuya, Floats{5, 1, 0.25f, 2, 0, 3, 0.5625f, 4});
    ExpectRow(Downsample444To422Float32Row, 3, vuya, Floats{5, 1, 0.25f, 2, -4, 3, 0.5f, 0});
    ExpectRow(Downsample444To422Float32Row, 1, vuya, Floats{4, 1, 0, 0});
}

TEST(Upsample422To444Row, AveragesForTheOddPixel) {
    // The plain form and SSE2 truncate the average, the vector form rounds it up.
    const Bytes uyvy = {100, 16, 50, 17, 103, 18, 41, 19}, yuyv = LumaFirst(uyvy);
    for (const auto rule : {Rule::kPlain, Rule::kVector}) {
        const uint8_t up = rule == Rule::kVector ? 1 : 0;
        const Bytes row = {50, 100, 16, 255, Byte(45u + up), Byte(101u + up), 17, 255, 41, 103, 18, 255,
                           41, 103, 19, 255};
        for (const auto& [kernel, source] :
             {std::pair(Upsample422To444Row_UYVY, uyvy), {Upsample422To444Row_YUYV, yuyv}}) {
            ExpectRow(kernel, 4, source, row, rule);
            ExpectRow(kernel, 3, source, Bytes(row.begin(), row.begin() + 12), rule);
            // alone, the first pair repeats its chroma
            ExpectRow(kernel, 2, source, Bytes{50, 100, 16, 255, 50, 100, 17, 255}, rule);
            ExpectRow(kernel, 1, source, Bytes{50, 100, 16, 255}, rule);
        }
    }
}

TEST(Upsample422To444Row, AveragesAllPairsOfCodes) {
    // Pairs of pairs: the first has every chroma, the second too, and luma of its own in every place.
    Bytes uyvy;
    for (size_t i = 0; i < 65536; ++i) {
        const uint8_t a = Byte(i >> 8), b = Byte(i);
        uyvy.insert(uyvy.end(), {a, Byte(i % 251), b, Byte(i % 241), b, 7, a, 8});
    }
    ExpectReference(Upsample422To444Row_UYVY, uyvy);
    ExpectReference(Upsample422To444Row_YUYV, LumaFirst(uyvy));
}

TEST(Upsample422To444Float32Row, RepeatsChromaAtLowQuality) {
    const Floats uyvy = {0.25f, 0.5f, -0.125f, 0.75f, -0.5f, -0.0f, 0.375f, 2};
    const Floats row = {-0.125f, 0.25f, 0.5f,  1, -0.125f, 0.25f, 0.75f, 1,
                        0.375f,  -0.5f, -0.0f, 1, 0.375f,  -0.5f, 2,     1};
    for (const int32_t width : {1, 3, 4})
        ExpectRow(Upsample422To444Float32Row_Repeat, width, uyvy,
                  Floats(row.begin(), row.begin() + 4 * width));
}

TEST(Upsample422To444Float32Row, InterpolatesOverFourPairs) {
    // U is 0, 16, 32, 96; V is its negative
    const Floats uyvy = {0, 1, 0, 2, 16, 3, -16, 4, 32, 5, -32, 6, 96, 7, -96, 8};
    const Floats odd = {(9 * 16.0f - 0 - 32) / 16, (9 * 48.0f - 0 - 96) / 16, (9 * 128.0f - 16 - 96) / 16,
                        (9 * 192.0f - 32 - 96) / 16};
    const Kernel kernel = Upsample422To444Float32Row_Interpolate;
    ExpectRow(kernel, 8, uyvy,
              Floats{-0.0f, 0,  1, 1, -odd[0], odd[0], 2, 1, -16, 16, 3, 1, -odd[1], odd[1], 4, 1,
                     -32,   32, 5, 1, -odd[2], odd[2], 6, 1, -96, 96, 7, 1, -odd[3], odd[3], 8, 1});
    ExpectRow(kernel, 2, Floats{3, 1, -5, 2}, Floats{-5, 3, 1, 1, -5, 3, 2, 1});
    ExpectRow(kernel, 1, Floats{3, 1, -5, 2}, Floats{-5, 3, 1, 1});
}

TEST(YUV422ToBGR8uRow, ConvertsBlackWhiteAndRed) {
    // B 75.68 - 76.65, G 75.68 + 14.89 - 91.05, R 75.68 + 178.76
    const Bytes colours601 = {0, 0, 0, 255, 0, 0, 0, 255, 0, 0, 254, 255, 0, 0, 254, 255};
    const Bytes uyvy601 = {128, 16, 128, 16, 90, 81, 240, 81}, uyvy709 = {102, 63, 240, 63};
    const Bytes second601(colours601.begin() + 8, colours601.end()), red709 = {0, 1, 255, 255};
    const Bytes uyvyRed601(uyvy601.begin() + 4, uyvy601.end());
    ExpectRow(UYVY601ToBGR8uRow, 2, uyvyRed601, second601);
    ExpectRow(YUYV601ToBGR8uRow, 2, LumaFirst(uyvyRed601), second601);
    ExpectRow(UYVY709ToBGR8uRow, 1, uyvy709, red709);
    ExpectRow(YUYV709ToBGR8uRow, 1, LumaFirst(uyvy709), red709);
    ExpectRow(UYVY601ToBGR8uRow, 2, Bytes{128, 16, 128, 235}, Bytes{0, 0, 0, 255, 255, 255, 255, 255});
    ExpectRow(YUYV709ToBGR8uRow, 2, Bytes{16, 128, 235, 128}, Bytes{0, 0, 0, 255, 255, 255, 255, 255});
}

TEST(YUV422ToBGR8uRow, TheAverageIsRoundedToEightBitsBeforeTheMatrix) {
    // R of the odd pixel: the average of V 128 and 131 is 129 (1.6) or 130 (3.2)
    const Bytes uyvy = {128, 16, 128, 16, 128, 16, 131, 16};
    for (const auto rule : {Rule::kPlain, Rule::kVector}) {
        const uint8_t red = rule == Rule::kVector ? 3 : 2;
        const Bytes row = {0, 0, 0, 255, 0, 0, red, 255, 0, 0, 5, 255};
        ExpectRow(UYVY601ToBGR8uRow, 3, uyvy, row, rule);
        ExpectRow(YUYV601ToBGR8uRow, 3, LumaFirst(uyvy), row, rule);
    }
}

TEST(YUV422ToBGR8uRow, AllCodes) {
    Bytes uyvy(65536 * 4);
    Walk walk;
    for (size_t luma = 0; luma < 256; luma += 2) {
        if (walk.LeavesOut()) continue;
        for (size_t i = 0; i < 65536; ++i) {
            const uint8_t pair[4] = {Byte(i), Byte(luma), Byte(i >> 8), Byte(luma + 1)};
            std::copy(std::begin(pair), std::end(pair), &uyvy[4 * i]);
        }
        const Bytes yuyv = LumaFirst(uyvy);
        for (const Kernel kernel : {UYVY601ToBGR8uRow, UYVY709ToBGR8uRow})
            ASSERT_NO_FATAL_FAILURE(ExpectReference(kernel, uyvy));
        for (const Kernel kernel : {YUYV601ToBGR8uRow, YUYV709ToBGR8uRow})
            ASSERT_NO_FATAL_FAILURE(ExpectReference(kernel, yuyv));
    }
}

} // namespace
