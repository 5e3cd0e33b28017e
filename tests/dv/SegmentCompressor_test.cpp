#include "dv/SegmentCompressor.h"

#include "dv/DV100SegmentCompressor.h"
#include "dv/DVCodeWords.h"
#include "primitives/BlockTransforms.h"
#include "support/DVSegmentReader.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <gtest/gtest.h>

namespace {

using namespace PK;
using PKTest::ReadBlock;
using PKTest::ReadSegment;

using Values = std::array<int16_t, 64>;
using Segment = std::array<uint8_t, 400>;

/// The samples of all blocks of a segment, less 128.
using Picture = std::vector<Values>;

Picture Flat(size_t blocks, int16_t value = 0) {
    Values values;
    values.fill(value);
    return Picture(5 * blocks, values);
}

/// Edges and noise of a contrast that differs from block to block.
Picture Drawn(size_t blocks, int32_t contrast, PKTest::Random& random) {
    Picture picture = Flat(blocks);
    for (Values& values : picture) {
        const auto most = static_cast<int32_t>(random.Below(static_cast<uint32_t>(contrast)) + 1);
        const auto edge = static_cast<int32_t>(random.Below(16));
        const bool areFieldsApart = random.Below(3) == 0;
        for (int32_t i = 0; i < 64; ++i) {
            const int32_t noise = static_cast<int32_t>(random.Below(static_cast<uint32_t>(most))) - most / 2;
            const int32_t side =
                (i % 8 + i / 8 < edge ? most : -most) * (areFieldsApart && i / 8 % 2 != 0 ? -1 : 1);
            values[static_cast<size_t>(i)] = static_cast<int16_t>(std::clamp(noise + side, -128, 127));
        }
    }
    return picture;
}

template <class Compressor>
Segment Compress(Compressor& compressor, const Picture& picture, int32_t sampleBits) {
    const auto blocks = static_cast<int32_t>(picture.size() / 5);
    for (int32_t i = 0; i < 5 * blocks; ++i)
        for (int32_t k = 0; k < 64; ++k)
            compressor.Samples(i / blocks, i % blocks)[k] = static_cast<int16_t>(
                picture[static_cast<size_t>(i)][static_cast<size_t>(k)] * (1 << sampleBits));
    Segment segment;
    segment.fill(0xff);
    for (size_t m = 0; m < 5; ++m) std::fill_n(segment.begin() + 80 * m, 3, static_cast<uint8_t>(0xa0 + m));
    compressor.Compress(segment.data());
    for (size_t m = 0; m < 5; ++m)
        for (size_t i = 0; i < 3; ++i) EXPECT_EQ(segment[80 * m + i], 0xa0 + m) << "an ID has changed";
    return segment;
}

/// What the plain rule makes of a block, told apart from the library: weighted coefficients in the order of the scan.
struct PlainBlock {
    int32_t dc = 0, mode = 0, classNumber = 0;
    std::array<int32_t, 64> coefficients{};
};

/// Weights are 16-bit fractions without a sign.
int16_t Weighted(int16_t value, int16_t weight) {
    return static_cast<int16_t>(std::nearbyint(value * static_cast<uint16_t>(weight) / 65536.0));
}

PlainBlock PlainBlockOf(const Values& samples, int32_t place) {
    Values frame, fields = samples;
    ForwardDCT8x8(samples.data(), frame.data());
    ForwardDCT248(fields.data());
    for (size_t i = 0; i < 64; ++i) {
        frame[i] = Weighted(frame[i], kWeights88[i]);
        fields[i] = Weighted(fields[i], kWeights248[i]);
    }
    PlainBlock block;
    block.mode = std::ranges::count(frame, 0) < std::ranges::count(fields, 0) ? 1 : 0;
    const Values& values = block.mode == 1 ? fields : frame;
    block.dc = values[0];
    int32_t greatest = 0;
    for (size_t i = 1; i < 64; ++i) {
        block.coefficients[i] = values[kScan[block.mode][i]];
        greatest = std::max(greatest, std::abs(block.coefficients[i]));
    }
    if (place < 4)
        block.classNumber = greatest < 36 ? greatest / 12 : 3;
    else if (place == 4)
        block.classNumber = greatest < 24 ? greatest / 12 + 1 : 3;
    else
        block.classNumber = greatest < 12 ? 2 : 3;
    return block;
}

int32_t LevelOf(int32_t coefficient, int32_t shift) {
    return coefficient < 0 ? -(-coefficient >> shift) : coefficient >> shift;
}

std::array<int32_t, 64> LevelsOf(const PlainBlock& block, int32_t qno) {
    std::array<int32_t, 64> levels{};
    for (int32_t i = 1; i < 64; ++i) {
        const int32_t area = i < 6 ? 0 : i < 21 ? 1 : i < 43 ? 2 : 3;
        const uint32_t shifts = kAreaShift[static_cast<size_t>(block.classNumber + 4 * qno)];
        levels[static_cast<size_t>(i)] = LevelOf(block.coefficients[static_cast<size_t>(i)],
                                                 static_cast<int32_t>(shifts >> (8 * area) & 255));
    }
    return levels;
}

int32_t BitsOf(const std::array<int32_t, 64>& levels) {
    int32_t bits = 16, run = 0;
    for (size_t i = 1; i < 64; ++i) {
        const int32_t amplitude = std::abs(levels[i]);
        if (amplitude == 0) {
            ++run;
            continue;
        }
        if (amplitude > 255) return 3040;
        if (amplitude > kRunMaxAmp[static_cast<size_t>(run)] && run > 0) {
            bits += kDVCodeBook.Run(run - 1).length;
            run = 0;
        }
        bits += kVLCLength[static_cast<size_t>(run)][static_cast<size_t>(amplitude)];
        run = 0;
    }
    return bits;
}

int32_t BitsAt(const std::vector<PlainBlock>& blocks, int32_t qno) {
    int32_t bits = 0;
    for (const PlainBlock& block : blocks) bits += BitsOf(LevelsOf(block, qno));
    return bits;
}

int32_t QNOFrom(int32_t last, const std::vector<PlainBlock>& blocks) {
    int32_t q = last;
    if (BitsAt(blocks, q) <= 3040) {
        while (q <= 14 && BitsAt(blocks, q + 1) <= 3040) ++q;
        return q;
    }
    do --q;
    while (q > 0 && BitsAt(blocks, q) > 3040);
    return std::max(q, 0);
}

void ExpectBlock(const ReadBlock& read, const PlainBlock& block, int32_t qno) {
    EXPECT_TRUE(read.hasEnded);
    EXPECT_EQ(read.dc, block.dc);
    EXPECT_EQ(read.mode, block.mode);
    EXPECT_EQ(read.classNumber, block.classNumber);
    EXPECT_EQ(read.levels, LevelsOf(block, qno));
}

class PlainSegments : public PKTest::TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, PlainSegments, PKTest::EveryTarget(), PKTest::TargetOf);

TEST_P(PlainSegments, HaveTheFinestQuantiserThatTheSearchFinds) {
    PKTest::Random random(81);
    SegmentCompressor compressor(kPlainDVPolicy, false);
    int32_t last = 0, movedOn = 0, inFields = 0;
    for (const int32_t contrast : {2, 9, 40, 17, 200, 30, 60, 5, 120, 25}) {
        const Picture picture = Drawn(6, contrast, random);
        const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
        std::vector<PlainBlock> blocks;
        for (size_t i = 0; i < picture.size(); ++i)
            blocks.push_back(PlainBlockOf(picture[i], static_cast<int32_t>(i % 6)));
        last = QNOFrom(last, blocks);
        SCOPED_TRACE("contrast " + std::to_string(contrast));
        for (const int32_t qno : read.qno) EXPECT_EQ(qno, last);
        for (const int32_t status : read.status) EXPECT_EQ(status, 0);
        if (BitsAt(blocks, last) > 3040) continue;
        for (size_t i = 0; i < blocks.size(); ++i) {
            ExpectBlock(read.blocks[i], blocks[i], last);
            movedOn += read.blocks[i].bits > 112 ? 1 : 0;
            inFields += blocks[i].mode;
        }
    }
    EXPECT_GT(movedOn, 10) << "no block has used room of others";
    EXPECT_GT(inFields, 10);
}

TEST_P(PlainSegments, FlatOnesReachTheFinestQuantiserFromAnywhere) {
    PKTest::Random random(82);
    for (const int32_t contrast : {1, 60, 250}) {
        SegmentCompressor compressor(kPlainDVPolicy, false);
        Compress(compressor, Drawn(6, contrast, random), 0);
        const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, Flat(6, 5), 0).data(), 6);
        for (const int32_t qno : read.qno) EXPECT_EQ(qno, 15);
        for (const ReadBlock& block : read.blocks) {
            EXPECT_EQ(block.dc, 10);
            EXPECT_EQ(block.bits, 16u);
            EXPECT_TRUE(block.hasEnded);
        }
    }
}

TEST_P(PlainSegments, ThatDoNotFitTakeTheCoarsestQuantiserAndLoseTheirLastBits) {
    PKTest::Random random(83);
    Picture noise = Flat(6);
    for (Values& values : noise)
        for (int16_t& value : values)
            value = static_cast<int16_t>(static_cast<int32_t>(random.Below(256)) - 128);
    SegmentCompressor compressor(kPlainDVPolicy, false);
    const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, noise, 0).data(), 6);
    size_t bits = 0;
    int32_t ended = 0;
    for (size_t i = 0; i < noise.size(); ++i) {
        const PlainBlock block = PlainBlockOf(noise[i], static_cast<int32_t>(i % 6));
        const ReadBlock& is = read.blocks[i];
        EXPECT_EQ(is.dc, block.dc);
        const auto levels = LevelsOf(block, 0);
        // As far as a block goes, its levels are right; then they are 0.
        const auto last =
            std::find_if(is.levels.rbegin(), is.levels.rend(), [](int32_t x) { return x != 0; });
        const auto length = static_cast<size_t>(is.levels.rend() - last);
        EXPECT_TRUE(std::equal(is.levels.begin(), is.levels.begin() + length, levels.begin()));
        ended += is.hasEnded ? 1 : 0;
        bits += is.bits;
    }
    for (const int32_t qno : read.qno) EXPECT_EQ(qno, 0);
    EXPECT_LT(ended, 5);
    EXPECT_GT(bits, 3040u - 30 * 16) << "there was room for more words";
    EXPECT_LE(bits, 3040u);
}

TEST_P(PlainSegments, DC) {
    Picture picture = Flat(6);
    for (size_t i = 0; i < 30; ++i) picture[i].fill(static_cast<int16_t>(-128 + 9 * i - (i > 28 ? 6 : 0)));
    SegmentCompressor compressor(kPlainDVPolicy, false);
    const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
    for (size_t i = 0; i < 30; ++i) EXPECT_EQ(read.blocks[i].dc, 2 * picture[i][0]);
}

TEST_P(PlainSegments, TheDummiesOfDV50) {
    PKTest::Random random(84);
    const Picture picture = Drawn(6, 60, random);
    SegmentCompressor compressor(kPlainDVPolicy, true);
    const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
    for (size_t m = 0; m < 5; ++m)
        for (size_t i = 0; i < 6; ++i) {
            const ReadBlock& block = read.blocks[6 * m + i];
            if (i == 1 || i == 3) {
                EXPECT_EQ(block.dc, -256);
                EXPECT_EQ(block.mode, 0);
                EXPECT_EQ(block.classNumber, 0);
                EXPECT_EQ(block.bits, 16u);
            } else {
                ExpectBlock(block, PlainBlockOf(picture[6 * m + i], static_cast<int32_t>(i)), read.qno[m]);
            }
        }
}

class BestSegments : public PKTest::TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, BestSegments, PKTest::EveryTarget(), PKTest::TargetOf);

/// Weighted coefficients without any rounding, in the order of the scan.
std::array<double, 64> ExactCoefficients(const Values& samples, int32_t mode) {
    const auto c = [](int32_t k) { return k == 0 ? std::sqrt(0.125) : 0.5; };
    const auto cosine = [](int32_t k, int32_t i, int32_t length) {
        return std::cos(M_PI * k * (2 * i + 1) / (2 * length));
    };
    std::array<double, 64> result{};
    for (int32_t place = 0; place < 64; ++place) {
        const int32_t raster = kScan[mode][static_cast<size_t>(place)], h = raster % 8, v = raster / 8;
        double sum = 0;
        for (int32_t x = 0; x < 8; ++x)
            for (int32_t z = 0; z < (mode == 0 ? 8 : 4); ++z) {
                const auto at = [&](int32_t y) { return samples[static_cast<size_t>(8 * y + x)]; };
                const double value = mode == 0 ? at(z)
                                     : v < 4   ? at(2 * z) + at(2 * z + 1)
                                               : at(2 * z) - at(2 * z + 1);
                sum += value * cosine(h, x, 8) * cosine(mode == 0 ? v : v % 4, z, mode == 0 ? 8 : 4);
            }
        const double weight = place == 0 ? 0.25 : WeightProduct(mode, raster) / 2;
        result[static_cast<size_t>(place)] = sum * c(h) * c(mode == 0 ? v : v % 4) * weight;
    }
    return result;
}

int32_t StepOf(int32_t place, int32_t classNumber, int32_t qno) {
    const int32_t area = place < 6 ? 0 : place < 21 ? 1 : place < 43 ? 2 : 3;
    return 1 << (kAreaShift[static_cast<size_t>(classNumber + 4 * qno)] >> (8 * area) & 255);
}

TEST_P(BestSegments, AreWithinAStepOfTheirPictureAndFit) {
    PKTest::Random random(85);
    SegmentCompressor compressor(kBestDVPolicy, false);
    int32_t severalQuantisers = 0;
    for (const int32_t contrast : {2, 9, 40, 17, 200, 30, 60, 5, 120, 25}) {
        const Picture picture = Drawn(6, contrast, random);
        const ReadSegment read =
            PKTest::ReadDVSegment(Compress(compressor, picture, kBestDVPolicy.sampleBits).data(), 6);
        SCOPED_TRACE("contrast " + std::to_string(contrast));
        severalQuantisers +=
            *std::ranges::max_element(read.qno) != *std::ranges::min_element(read.qno) ? 1 : 0;
        for (size_t i = 0; i < picture.size(); ++i) {
            const ReadBlock& block = read.blocks[i];
            ASSERT_TRUE(block.hasEnded);
            if (block.classNumber == 3 && read.qno[i / 6] <= 2) continue; // small levels may be left out
            EXPECT_EQ(block.classNumber, 2);
            const auto exact = ExactCoefficients(picture[i], block.mode);
            EXPECT_NEAR(block.dc, exact[0], 0.51);
            for (int32_t k = 1; k < 64; ++k) {
                const int32_t step = StepOf(k, 2, read.qno[i / 6]);
                const double inSteps = std::abs(exact[static_cast<size_t>(k)]) / step;
                EXPECT_NEAR(std::abs(block.levels[static_cast<size_t>(k)]), std::floor(inSteps + 1.0 / 3),
                            std::abs(inSteps + 1.0 / 3 - std::round(inSteps + 1.0 / 3)) < 0.07 ? 1 : 0)
                    << inSteps;
            }
        }
    }
    EXPECT_GT(severalQuantisers, 3);
}

TEST_P(BestSegments, HalveLevelsThatWouldPass255) {
    Picture picture = Flat(6);
    for (int32_t i = 0; i < 64; ++i) picture[7][static_cast<size_t>(i)] = i % 8 < 4 ? 127 : -128;
    SegmentCompressor compressor(kBestDVPolicy, false);
    const ReadSegment read =
        PKTest::ReadDVSegment(Compress(compressor, picture, kBestDVPolicy.sampleBits).data(), 6);
    const ReadBlock& block = read.blocks[7];
    EXPECT_EQ(read.qno[1], 15);
    EXPECT_EQ(block.classNumber, 3);
    const double exact = ExactCoefficients(picture[7], 0)[1];
    EXPECT_GT(exact, 255);
    EXPECT_NEAR(block.levels[1], exact / 2, 0.7);
    for (size_t i = 0; i < 30; ++i) {
        EXPECT_EQ(read.blocks[i].classNumber, i == 7 ? 3 : 2) << i;
    }
}

TEST_P(BestSegments, OfNoiseEnd) {
    PKTest::Random random(86);
    for (const size_t blocks : {6, 8}) {
        Picture noise = Flat(blocks);
        for (Values& values : noise)
            for (int16_t& value : values) value = static_cast<int16_t>(random.Below(2) != 0 ? 127 : -128);
        SegmentCompressor compressor(kBestDVPolicy, false);
        DV100SegmentCompressor hd(kBestDVPolicy, true);
        const Segment segment = blocks == 8 ? Compress(hd, noise, 3) : Compress(compressor, noise, 3);
        for (const ReadBlock& block :
             PKTest::ReadDVSegment(segment.data(), static_cast<int32_t>(blocks)).blocks)
            EXPECT_TRUE(block.hasEnded);
    }
}

class HDSegments : public PKTest::TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, HDSegments, PKTest::EveryTarget(), PKTest::TargetOf);

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
    PKTest::Random random(87);
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
                for (const auto& block : blocks) bits += BitsOf(DividedBy(block, kDV100QNO[which].step));
                return bits <= 3040;
            };
            if (fits(row)) {
                while (row > 0 && fits(row - 1)) --row;
            } else {
                do ++row;
                while (row < 30 && !fits(row));
            }
            SCOPED_TRACE("contrast " + std::to_string(contrast) + " row " + std::to_string(row));
            const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, picture, 0).data(), 8);
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
    const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, picture, 0).data(), 8);
    EXPECT_EQ(read.qno[1], 8) << "the row of step 8";
    EXPECT_EQ(read.blocks[9].levels[1], 231);
}

TEST_P(HDSegments, TellMacroblocksOfFields) {
    DV100SegmentCompressor compressor(kBestDVPolicy, false);
    compressor.SetIsOfFields(3, true);
    const ReadSegment read = PKTest::ReadDVSegment(Compress(compressor, Flat(8), 3).data(), 8);
    for (size_t i = 0; i < 40; ++i) EXPECT_EQ(read.blocks[i].mode, i % 8 != 0 || i == 24 ? 1 : 0) << i;
}

} // namespace
