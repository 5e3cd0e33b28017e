// 8-bit 4:2:2 to BGR in one pass: the numbers of resampling followed by the matrix.

#include "convert/KernelBodies.h"
#include "support/Random.h"

namespace {

using PK::Kernel;
using PK::RowKernel;
using PK::Target;
using namespace PKTest;

using Bytes = std::vector<uint8_t>;

struct Parts {
    Kernel whole, upsample, matrix;
};

constexpr Parts kParts[] = {
    {Kernel::UYVY601ToBGR8uRow, Kernel::Upsample422To444Row_UYVY, Kernel::YUV601ToRGBRow},
    {Kernel::UYVY709ToBGR8uRow, Kernel::Upsample422To444Row_UYVY, Kernel::YUV709ToRGBRow},
    {Kernel::YUYV601ToBGR8uRow, Kernel::Upsample422To444Row_YUYV, Kernel::YUV601ToRGBRow},
    {Kernel::YUYV709ToBGR8uRow, Kernel::Upsample422To444Row_YUYV, Kernel::YUV709ToRGBRow},
};

void CheckAgainstParts(const Parts& parts, const Bytes& source, int32_t width) {
    ForEachBody(parts.whole, [&](Target target, RowKernel body) {
        const size_t bytes = static_cast<size_t>(width) * 4;
        Bytes row(bytes);
        PK::Body(parts.upsample, target)(source.data(), row.data(), width);
        PK::Body(parts.matrix, target)(row.data(), row.data(), width);
        ASSERT_TRUE(RunRow<uint8_t>(body, source, width, bytes) == row) << "width " << width;
    });
}

TEST(YUV422ToBGR8uRow, ConvertsBlackWhiteAndRed) {
    ForEachBody(Kernel::UYVY601ToBGR8uRow, [](Target, RowKernel body) {
        const Bytes uyvy = {128, 16, 128, 235, 90, 81, 240, 81};
        const Bytes row = RunRow<uint8_t>(body, uyvy, 4, 16);
        EXPECT_EQ(Bytes(row.begin(), row.begin() + 4), (Bytes{0, 0, 0, 255}));
        // B 75.68 - 76.65, G 75.68 + 14.89 - 91.05, R 75.68 + 178.76
        EXPECT_EQ(Bytes(row.begin() + 8, row.end()), (Bytes{0, 0, 254, 255, 0, 0, 254, 255}));
    });
    ForEachBody(Kernel::YUYV709ToBGR8uRow, [](Target, RowKernel body) {
        EXPECT_EQ(RunRow<uint8_t>(body, Bytes{16, 128, 235, 128}, 2, 8),
                  (Bytes{0, 0, 0, 255, 255, 255, 255, 255}));
    });
}

TEST(YUV422ToBGR8uRow, TheAverageIsRoundedToEightBitsBeforeTheMatrix) {
    ForEachBody(Kernel::UYVY601ToBGR8uRow, [](Target target, RowKernel body) {
        const Bytes uyvy = {128, 116, 128, 116, 129, 116, 128, 116};
        const Bytes row = RunRow<uint8_t>(body, uyvy, 4, 16);
        // 116.438 with U at 128, 118.455 with U at 129
        EXPECT_EQ(row[4], target >= Target::ssse3 ? 118 : 116);
        EXPECT_EQ(row[0], 116);
        EXPECT_EQ(row[8], 118);
    });
}

TEST(YUV422ToBGR8uRow, GivesWhatItsPartsGiveAtAnyWidth) {
    Random random(5);
    for (const Parts& parts : kParts)
        for (int32_t width = 0; width <= 70; ++width)
            ASSERT_NO_FATAL_FAILURE(
                CheckAgainstParts(parts, random.Bytes(static_cast<size_t>((width + 1) / 2 * 4)), width));
}

TEST(YUV422ToBGR8uRow, GivesWhatItsPartsGiveForAllCodes) {
    Bytes source(65536 * 4);
    for (const Parts& parts : kParts) {
        const bool lumaFirst = parts.upsample == Kernel::Upsample422To444Row_YUYV;
        for (int luma = 0; luma < 256; luma += 2) {
            for (size_t i = 0; i < 65536; ++i) {
                const int pair[4] = {int(i & 255), luma, int(i >> 8), luma + 1};
                for (size_t j = 0; j < 4; ++j)
                    source[i * 4 + (lumaFirst ? j ^ 1 : j)] = static_cast<uint8_t>(pair[j]);
            }
            ASSERT_NO_FATAL_FAILURE(CheckAgainstParts(parts, source, 131072));
        }
    }
}

} // namespace
