#include "dv/DV100SegmentCompressor.h"

#include "primitives/BlockTransforms.h"
#include "support/DVSegmentReader.h"
#include "support/DVSegments.h"
#include "support/Targets.h"

#include <string>

namespace {

using namespace PK;
using namespace PKTest;

class HDSegments : public TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, HDSegments, EveryTarget(), TargetOf);

/// Coefficients in the order of the scan, by the table of the block.
std::array<int32_t, 64> HDCoefficients(const Values& samples, int32_t place, bool is720p) {
    Values values;
    ForwardDCT8x8(samples.data(), values.data());
    const DVFactors& table = kDV100Weights[(is720p ? 2 : 0) + (place < 4 ? 0 : 1)];
    std::array<int32_t, 64> result{};
    for (size_t i = 1; i < 64; ++i) {
        const size_t raster = kScan[0][i];
        result[i] = 32 * values[raster] / table[raster];
    }
    return result;
}

std::array<int32_t, 64> DividedBy(std::array<int32_t, 64> coefficients, int32_t step) {
    for (int32_t& value : coefficients) value /= step;
    return coefficients;
}

TEST_P(HDSegments, TakeTheSmallestRowThatFits) {
    Random random(87);
    for (const bool is720p : {false, true}) {
        DV100SegmentCompressor compressor(kPlainDVPolicy, is720p);
        int32_t row = 6;
        for (const int32_t contrast : {9, 2, 40, 17, 200, 60, 5, 120, 25}) {
            const Picture picture = Drawn(8, contrast, random);
            std::vector<std::array<int32_t, 64>> blocks;
            for (size_t i = 0; i < picture.size(); ++i)
                blocks.push_back(HDCoefficients(picture[i], static_cast<int32_t>(i % 8), is720p));
            const auto fits = [&](int32_t which) {
                int32_t bits = 0;
                for (const auto& block : blocks)
                    bits += BitsOfLevels(DividedBy(block, kDV100QNO[which].step));
                return bits <= 3040;
            };
            if (fits(row)) {
                while (row > 0 && fits(row - 1)) --row;
            } else {
                do ++row;
                while (row < 30 && !fits(row));
            }
            SCOPED_TRACE("contrast " + std::to_string(contrast) + " row " + std::to_string(row));
            const ReadSegment read = ReadDVSegment(Compress(compressor, picture, 0).data(), 8);
            for (const int32_t qno : read.qno) EXPECT_EQ(qno, kDV100QNO[row].qno);
            for (size_t i = 0; i < blocks.size(); ++i) {
                const ReadBlock& block = read.blocks[i];
                EXPECT_TRUE(block.hasEnded);
                EXPECT_EQ(block.classNumber, kDV100QNO[row].classNumber);
                EXPECT_EQ(block.mode, i % 8 == 0 ? 0 : 1);
                EXPECT_EQ(block.levels, DividedBy(blocks[i], kDV100QNO[row].step)) << i;
            }
        }
    }
}

/// A level above 255 costs a whole segment: the step must grow, though there is room.
TEST_P(HDSegments, NoLevelPasses255) {
    Picture picture = Flat(8);
    for (int32_t i = 0; i < 64; ++i) picture[9][static_cast<size_t>(i)] = i % 8 < 4 ? 127 : -128;
    const int32_t level = HDCoefficients(picture[9], 1, false)[1];
    ASSERT_EQ(level, 1848) << "32 x 924 / 16";
    DV100SegmentCompressor compressor(kPlainDVPolicy, false);
    const ReadSegment read = ReadDVSegment(Compress(compressor, picture, 0).data(), 8);
    EXPECT_EQ(read.qno[1], 8) << "the row of step 8";
    EXPECT_EQ(read.blocks[9].levels[1], 231);
}

TEST_P(HDSegments, TellMacroblocksOfFields) {
    DV100SegmentCompressor compressor(kBestDVPolicy, false);
    compressor.SetIsOfFields(3, true);
    const ReadSegment read = ReadDVSegment(Compress(compressor, Flat(8), 3).data(), 8);
    for (size_t i = 0; i < 40; ++i) EXPECT_EQ(read.blocks[i].mode, i % 8 != 0 || i == 24 ? 1 : 0) << i;
}

} // namespace
