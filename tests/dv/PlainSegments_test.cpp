#include "dv/SegmentCompressor.h"

#include "primitives/BlockTransforms.h"
#include "support/DVSegmentReader.h"
#include "support/DVSegments.h"
#include "support/Targets.h"

#include <cmath>
#include <string>

namespace {

using namespace PK;
using namespace PKTest;

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

int32_t BitsAt(const std::vector<PlainBlock>& blocks, int32_t qno) {
    int32_t bits = 0;
    for (const PlainBlock& block : blocks) bits += BitsOfLevels(LevelsOf(block, qno));
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

class PlainSegments : public TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, PlainSegments, EveryTarget(), TargetOf);

TEST_P(PlainSegments, HaveTheFinestQuantiserThatTheSearchFinds) {
    Random random(81);
    SegmentCompressor compressor(kPlainDVPolicy, false);
    int32_t last = 0, movedOn = 0, inFields = 0;
    for (const int32_t contrast : {2, 9, 40, 17, 200, 30, 60, 5, 120, 25}) {
        const Picture picture = Drawn(6, contrast, random);
        const ReadSegment read = ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
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
    Random random(82);
    for (const int32_t contrast : {1, 60, 250}) {
        SegmentCompressor compressor(kPlainDVPolicy, false);
        Compress(compressor, Drawn(6, contrast, random), 0);
        const ReadSegment read = ReadDVSegment(Compress(compressor, Flat(6, 5), 0).data(), 6);
        for (const int32_t qno : read.qno) EXPECT_EQ(qno, 15);
        for (const ReadBlock& block : read.blocks) {
            EXPECT_EQ(block.dc, 10);
            EXPECT_EQ(block.bits, 16u);
            EXPECT_TRUE(block.hasEnded);
        }
    }
}

TEST_P(PlainSegments, ThatDoNotFitTakeTheCoarsestQuantiserAndLoseTheirLastBits) {
    Random random(83);
    Picture noise = Flat(6);
    for (Values& values : noise)
        for (int16_t& value : values)
            value = static_cast<int16_t>(static_cast<int32_t>(random.Below(256)) - 128);
    SegmentCompressor compressor(kPlainDVPolicy, false);
    const ReadSegment read = ReadDVSegment(Compress(compressor, noise, 0).data(), 6);
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
    const ReadSegment read = ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
    for (size_t i = 0; i < 30; ++i) EXPECT_EQ(read.blocks[i].dc, 2 * picture[i][0]);
}

TEST_P(PlainSegments, TheDummiesOfDV50) {
    Random random(84);
    const Picture picture = Drawn(6, 60, random);
    SegmentCompressor compressor(kPlainDVPolicy, true);
    const ReadSegment read = ReadDVSegment(Compress(compressor, picture, 0).data(), 6);
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

} // namespace
