// Frames of DV decoded at full size, held to a decoder that was written from the tables of the standard alone.

#include "dv/DVExpected.h"
#include "support/DVFrameWriter.h"
#include "support/DVFrames.h"
#include "support/Random.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>

namespace {

using namespace PKTest;

bool IsDV25(DVKind kind) {
    return kind <= DVKind::k625of420;
}

PK_PixelFormat NativeOf(DVKind kind) {
    if (IsDV25(kind)) return PK_PixelFormat_VUYX_4444_8u;
    return LayoutOf(kind).isDV100 ? PK_PixelFormat_YUYV_422_8u_709 : PK_PixelFormat_YUYV_422_8u;
}

void ExpectAsReference(DVKind kind, const uint8_t* frame, const std::string& what) {
    SCOPED_TRACE(std::string(LayoutOf(kind).name) + ", " + what);
    const DVPixels expected = DVExpectedPixels(kind, ReferenceDVPicture(kind, frame));
    std::vector<PK_PixelFormat> formats = {NativeOf(kind)};
    if (IsDV25(kind)) formats.push_back(PK_PixelFormat_UYVY_422_8u);
    for (const PK_PixelFormat format : formats) {
        const auto [result, rows] =
            DecodeDV(LayoutOf(kind).format, frame, format, expected.width, expected.height, 4);
        ASSERT_EQ(result, PK_Success);
        EXPECT_EQ(DVDifference(expected, DVPixelsFromMemory(rows, format, expected.width, expected.height),
                               (format & 0x30) != 0, 1),
                  "")
            << PK_PixelFormatName(format);
    }
}
void ExpectAsReference(DVFrameWriter& frame, const std::string& what) {
    ExpectAsReference(frame.Kind(), frame.Bytes(), what);
}

/// Where a block of a macroblock shows in the picture.
bool Shows(DVKind kind, size_t block) {
    const bool isDV50 = kind == DVKind::k525of422 || kind == DVKind::k625of422;
    return !isDV50 || (block != 1 && block != 3);
}

/// What one unit of a level at this place of the scan comes to, about.
double UnitOf(const DVLayout& layout, bool isChroma, const DVBlockBits& block, size_t place, int qno) {
    const bool mode = block.mode && !layout.isDV100;
    const auto [raster, area] = DVScan(mode)[place];
    const auto at = static_cast<size_t>(raster);
    if (layout.isDV100)
        return DV100Step(qno) * std::pow(2, block.classNumber) * DV100Table(layout.is1080, isChroma)[at] / 32;
    return DVFactors(mode)[at] * std::pow(2, DVAreaShift(area, block.classNumber, qno)) / 256;
}

class EachKind : public testing::TestWithParam<DVKind> {
protected:
    DVKind Kind() const { return GetParam(); }
    const DVLayout& Layout() const { return LayoutOf(Kind()); }
    size_t Count() const { return static_cast<size_t>(Layout().BlocksOfMacroblock()); }
};

INSTANTIATE_TEST_SUITE_P(DVAgainstReference, EachKind, testing::ValuesIn(kDVKinds),
                         [](const auto& kind) { return std::string("Of") + LayoutOf(kind.param).name; });

TEST(DVAgainstReference, CodeWordsAreComplete) {
    double share = 0;
    for (const auto& [key, code] : DVCodes()) share += std::pow(2, -std::floor(std::log2(key)));
    EXPECT_EQ(share, 1);
}

TEST(DVAgainstReference, FramesOfEncoders) {
    const std::map<const char*, DVKind> names = {{"dv25_525_411_astronaut", DVKind::k525of411},
                                                 {"dv25_625_411_chelsea", DVKind::k625of411},
                                                 {"dv25_625_420_coffee", DVKind::k625of420},
                                                 {"dv50_525_coffee", DVKind::k525of422},
                                                 {"dv50_625_astronaut", DVKind::k625of422},
                                                 {"dv100_720p60_chelsea", DVKind::k720p60},
                                                 {"dv100_720p60_chelsea_second", DVKind::k720p60},
                                                 {"dv100_720p50_astronaut", DVKind::k720p50},
                                                 {"dv100_1080i60_coffee", DVKind::k1080i60},
                                                 {"dv100_1080i50_astronaut", DVKind::k1080i50},
                                                 {"stress_dv25_525_411", DVKind::k525of411},
                                                 {"stress_dv25_625_420", DVKind::k625of420},
                                                 {"stress_dv50_525", DVKind::k525of422}};
    for (const auto& [name, kind] : names) ExpectAsReference(kind, ReadDVFrame(name).data(), name);
}

/// Each place of the scan with each class, number and mode, in luma and, where its tables differ, in chroma.
TEST_P(EachKind, SingleCoefficients) {
    DVFrameWriter frame(Kind());
    std::map<std::pair<int, bool>, int> taken;
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        std::vector<DVBlockBits> blocks(5 * Count());
        std::vector<int> qno(5);
        for (size_t i = 0; i < blocks.size(); ++i) {
            const size_t macroblock = i / Count();
            qno[macroblock] = (5 * segment + static_cast<int>(macroblock)) % 16;
            if (!Shows(Kind(), i % Count())) continue;
            const bool isChroma = i % Count() >= 4;
            int& n = taken[{qno[macroblock], Layout().isDV100 && isChroma}];
            const int place = 1 + n % 63;
            blocks[i].classNumber = n / 63 % 4;
            blocks[i].mode = !Layout().isDV100 && n / 252 % 2 == 1;
            const double unit =
                UnitOf(Layout(), isChroma, blocks[i], static_cast<size_t>(place), qno[macroblock]);
            const int level = std::clamp(static_cast<int>(420 / unit), 1, 255);
            blocks[i].codes = DVLevelBits(place - 1, n % 5 < 2 ? -level : level);
            ++n;
        }
        frame.Write(segment, blocks, qno);
    }
    for (const auto& [what, n] : taken) EXPECT_GE(n, Layout().isDV100 ? 252 : 504) << what.first;
    ExpectAsReference(frame, "single coefficients");
}

/// Each code word with either sign, and a level behind it that falls out of place if the word is misread.
TEST_P(EachKind, EveryCodeWord) {
    std::vector<std::string> words;
    for (const auto& [key, code] : DVCodes()) {
        if (code.is == DVCode::Is::kEnd || code.run > 61) continue;
        std::string bits;
        for (unsigned rest = key; rest > 1; rest >>= 1) bits.insert(0, rest % 2 == 1 ? "1" : "0");
        for (int sign = 0; sign < (code.is == DVCode::Is::kLevel ? 2 : 1); ++sign)
            words.push_back(bits + (code.is == DVCode::Is::kZeros ? "" : sign == 1 ? "1" : "0"));
    }
    std::sort(words.begin(), words.end());
    DVFrameWriter frame(Kind());
    size_t next = 0;
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        std::vector<DVBlockBits> blocks(5 * Count());
        const int qno = segment % 3 == 0 ? 15 : segment % 3 == 1 ? 8 : 1;
        for (size_t i = 0; i < blocks.size(); ++i) {
            if (!Shows(Kind(), i % Count())) continue;
            blocks[i].classNumber = segment % 2;
            blocks[i].codes = words[next++ % words.size()] + DVLevelBits(0, segment % 4 < 2 ? 22 : -19);
        }
        frame.Write(segment, blocks, std::vector<int>(5, qno));
    }
    EXPECT_GE(next, words.size());
    ExpectAsReference(frame, "code words");
}

/// Blocks of very different lengths, as many as fill the segment or a bit more: bits travel within the macroblock and
/// through the segment.
TEST_P(EachKind, BitsTravel) {
    Random random(31);
    DVFrameWriter frame(Kind());
    int travelling = 0;
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        std::vector<DVBlockBits> blocks(5 * Count());
        const size_t wanted = 2200 + random.Below(1000);
        size_t bits = 16 * blocks.size();
        std::vector<int> places(blocks.size());
        const size_t favoured = random.Below(static_cast<uint32_t>(blocks.size()));
        for (int tries = 0; bits < wanted && tries < 2000; ++tries) {
            const size_t i = random.Below(3) == 0 ? random.Below(static_cast<uint32_t>(blocks.size()))
                                                  : (favoured + random.Below(4)) % blocks.size();
            const int run = static_cast<int>(random.Below(4) == 0 ? random.Below(6) : 0);
            if (places[i] + run + 1 > 63) continue;
            places[i] += run + 1;
            const int amplitude = 1 + static_cast<int>(random.Below(random.Below(8) == 0 ? 60 : 4));
            const std::string code = DVLevelBits(run, random.Below(2) == 0 ? amplitude : -amplitude);
            blocks[i].codes += code;
            bits += code.size();
        }
        for (DVBlockBits& block : blocks) {
            block.dc = static_cast<int>(random.Below(200)) - 100;
            block.mode = random.Below(2) == 1;
            block.classNumber = static_cast<int>(random.Below(3));
        }
        size_t ofFavoured = 0;
        for (size_t i = 0; i < Count(); ++i)
            ofFavoured += blocks[favoured / Count() * Count() + i].codes.size() + 16;
        travelling += ofFavoured > 608;
        frame.Write(segment, blocks, {3, 9, 12, 15, 7});
    }
    EXPECT_GT(travelling, frame.SegmentCount() / 2);
    ExpectAsReference(frame, "seed " + std::to_string(random.Seed()));
}

TEST_P(EachKind, Garbage) {
    Random random(77);
    DVFrameWriter frame(Kind());
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        uint8_t* const bytes = frame.Segment(segment);
        for (int i = 0; i < 400; ++i)
            if (i % 80 >= 3) bytes[i] = static_cast<uint8_t>(random.Next());
    }
    ExpectAsReference(frame, "seed " + std::to_string(random.Seed()));
}

/// Bits of a good picture flipped here and there.
TEST_P(EachKind, Damage) {
    Random random(78);
    DVFrameWriter frame(Kind());
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        std::vector<DVBlockBits> blocks(5 * Count());
        for (DVBlockBits& block : blocks) {
            block.dc = static_cast<int>(random.Below(300)) - 150;
            for (uint32_t codes = random.Below(14); codes > 0; --codes)
                block.codes +=
                    DVLevelBits(static_cast<int>(random.Below(3)), 1 + static_cast<int>(random.Below(5)));
        }
        frame.Write(segment, blocks, {11, 12, 13, 14, 15});
        for (uint32_t flips = random.Below(4); flips > 0; --flips) {
            const uint32_t bit = random.Below(8 * 400);
            if (bit / 8 % 80 >= 3) frame.Segment(segment)[bit / 8] ^= static_cast<uint8_t>(1u << bit % 8);
        }
    }
    ExpectAsReference(frame, "seed " + std::to_string(random.Seed()));
}

/// DC alone, in every block another: what lies in the wrong place shows.
TEST_P(EachKind, Places) {
    Random random(5);
    DVFrameWriter frame(Kind());
    for (int segment = 0; segment < frame.SegmentCount(); ++segment) {
        std::vector<DVBlockBits> blocks(5 * Count());
        for (DVBlockBits& block : blocks) block.dc = static_cast<int>(random.Below(512)) - 256;
        if (Layout().isDV100) // of fields, each second one
            for (size_t i = 0; i < blocks.size(); i += Count()) {
                const bool isHalfRow =
                    PlaceOf(Kind(), segment / 27 / Layout().sequences, segment / 27 % Layout().sequences,
                            segment % 27, static_cast<int>(i / Count()))
                        .shape == DVShape::kHalfRow;
                blocks[i].mode = !isHalfRow && random.Below(2) == 1;
            }
        frame.Write(segment, blocks, std::vector<int>(5, 15));
    }
    ExpectAsReference(frame, "places");
    if (!Layout().isDV100 || Layout().is1080) return;
    for (int block = 0; block < Layout().Bytes() / 80; ++block) frame.Bytes()[80 * block + 1] &= 0xfb;
    ExpectAsReference(frame, "second of a pair");
}

} // namespace
