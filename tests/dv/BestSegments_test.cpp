#include "dv/DV100SegmentCompressor.h"
#include "support/DVSegmentReader.h"
#include "support/DVSegments.h"
#include "support/Targets.h"

#include <cmath>
#include <string>

namespace {

using namespace PK;
using namespace PKTest;

class BestSegments : public TargetTest {};
INSTANTIATE_TEST_SUITE_P(Targets, BestSegments, EveryTarget(), TargetOf);

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
    Random random(85);
    SegmentCompressor compressor(kBestDVPolicy, false);
    int32_t severalQuantisers = 0;
    for (const int32_t contrast : {2, 9, 40, 17, 200, 30, 60, 5, 120, 25}) {
        const Picture picture = Drawn(6, contrast, random);
        const ReadSegment read =
            ReadDVSegment(Compress(compressor, picture, kBestDVPolicy.sampleBits).data(), 6);
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
    const ReadSegment read = ReadDVSegment(Compress(compressor, picture, kBestDVPolicy.sampleBits).data(), 6);
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
    Random random(86);
    for (const size_t blocks : {6, 8}) {
        Picture noise = Flat(blocks);
        for (Values& values : noise)
            for (int16_t& value : values) value = static_cast<int16_t>(random.Below(2) != 0 ? 127 : -128);
        SegmentCompressor compressor(kBestDVPolicy, false);
        DV100SegmentCompressor hd(kBestDVPolicy, true);
        const Segment segment = blocks == 8 ? Compress(hd, noise, 3) : Compress(compressor, noise, 3);
        for (const ReadBlock& block : ReadDVSegment(segment.data(), static_cast<int32_t>(blocks)).blocks)
            EXPECT_TRUE(block.hasEnded);
    }
}

} // namespace
