#include "dv/DIFStructure.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

using namespace PK;

using Bytes = std::vector<uint8_t>;

Bytes StructureOf(const DVFormat& format, int32_t firstChannel = 0) {
    Bytes frame(static_cast<size_t>(format.FrameBytes()), 0x5a);
    WriteDIFStructure(format, firstChannel, frame.data());
    return frame;
}

Bytes Block(const Bytes& frame, int32_t sequence, int32_t block) {
    const auto first = frame.begin() + sequence * 12000 + block * 80;
    return {first, first + 80};
}

/// A block of ones with these bytes at the beginning.
Bytes BlockOf(Bytes beginning) {
    beginning.resize(80, 0xff);
    return beginning;
}

Bytes SubcodeBlock(uint8_t second, uint8_t number, uint8_t half) {
    Bytes block = BlockOf({0x3f, second, number});
    for (uint8_t i = 0; i < 6; ++i) {
        block[3 + 8 * size_t{i}] = half;
        block[4 + 8 * size_t{i}] = static_cast<uint8_t>(0xf0 + 6 * number + i);
    }
    if (number == 0) std::ranges::copy(Bytes{0x13, 0, 0, 0, 0}, block.begin() + 6);
    return block;
}

Bytes VAUXBlock(uint8_t second, uint8_t number, uint8_t type, uint8_t display) {
    Bytes block = BlockOf({0x56, second, number});
    for (const int place : {3, 48})
        std::ranges::copy(Bytes{0x60, 0xff, 0xff, type, 0xff, 0x61, 0x3f, display, 0xfc, 0xff},
                          block.begin() + place);
    return block;
}

struct Case {
    const char* name;
    const DVFormat* format;
    uint8_t dsf, application, type, display;
    int32_t sequences;
};

const Case kCases[] = {
    {"DV25_525", &kDVFormats[0], 0x3f, 1, 0xc0, 0xc8, 10},
    {"DV25_625", &kDVFormats[1], 0xbf, 0, 0xe0, 0xc8, 12},
    {"DVCPRO_625", &kDVCPROPAL25, 0xbf, 1, 0xe0, 0xc8, 12},
    {"DV50_525", &kDVFormats[2], 0x3f, 1, 0xc4, 0xc8, 10},
    {"DV50_625", &kDVFormats[3], 0xbf, 1, 0xe4, 0xc8, 12},
    {"720p60", &kDVFormats[4], 0x3f, 1, 0xd8, 0xca, 10},
    {"720p50", &kDVFormats[5], 0xbf, 1, 0xf8, 0xca, 12},
    {"1080i60", &kDVFormats[6], 0x3f, 1, 0xd4, 0xca, 10},
    {"1080i50", &kDVFormats[7], 0xbf, 1, 0xf4, 0xca, 12},
};

class DIFStructure : public testing::TestWithParam<Case> {};

INSTANTIATE_TEST_SUITE_P(Formats, DIFStructure, testing::ValuesIn(kCases),
                         [](const auto& test) { return std::string(test.param.name); });

/// Every byte of a frame whose first channel is channel `first`.
void ExpectStructure(const Case& c, const Bytes& frame, int32_t first) {
    constexpr uint8_t kChannel[] = {0x07, 0x0f, 0x03, 0x0b};
    for (int32_t channel = 0; channel < c.format->channels; ++channel)
        for (int32_t s = 0; s < c.sequences; ++s) {
            SCOPED_TRACE("channel " + std::to_string(channel) + " sequence " + std::to_string(s));
            const int32_t at = channel * c.sequences + s;
            const auto id = static_cast<uint8_t>(s << 4 | kChannel[first + channel]);
            const auto valid = static_cast<uint8_t>(0x78 | c.application);
            ASSERT_EQ(Block(frame, at, 0),
                      BlockOf({0x1f, id, 0, c.dsf, static_cast<uint8_t>(0xf8 | c.application), valid, valid,
                               valid}));
            const uint8_t half = s < c.sequences / 2 ? 0x8f : 0x0f;
            for (uint8_t i = 0; i < 2; ++i) ASSERT_EQ(Block(frame, at, 1 + i), SubcodeBlock(id, i, half));
            for (uint8_t i = 0; i < 3; ++i)
                ASSERT_EQ(Block(frame, at, 3 + i), VAUXBlock(id, i, c.type, c.display));
            for (int32_t i = 0; i < 144; ++i) {
                const bool isAudio = i % 16 == 0;
                const auto number = static_cast<uint8_t>(isAudio ? i / 16 : i - i / 16 - 1);
                ASSERT_EQ(Block(frame, at, 6 + i),
                          BlockOf({static_cast<uint8_t>(isAudio ? 0x76 : 0x96), id, number}))
                    << "block " << 6 + i;
            }
        }
}

TEST_P(DIFStructure, IsThatOfTheFormat) {
    const Bytes frame = StructureOf(*GetParam().format);
    ASSERT_EQ(frame.size(), static_cast<size_t>(GetParam().format->channels * GetParam().sequences * 12000));
    ExpectStructure(GetParam(), frame, 0);
}

TEST_P(DIFStructure, HasItsPacksWhereReadersLook) {
    const Bytes frame = StructureOf(*GetParam().format);
    for (size_t at = 0; at < frame.size(); at += 24000) {
        EXPECT_EQ(frame[at + 448], 0x60);
        EXPECT_EQ(frame[at + 451], GetParam().type);
        EXPECT_EQ(frame[at + 453], 0x61);
        EXPECT_EQ(frame[at + 455], GetParam().display);
        EXPECT_EQ(frame[at + 12000 + 243], 0x60);
        EXPECT_EQ(frame[at + 12000 + 248], 0x61);
    }
}

TEST(DIFStructure, TheSecondFrameOfAPairHasChannels2And3) {
    for (const Case& c : {kCases[5], kCases[6]}) ExpectStructure(c, StructureOf(*c.format, 2), 2);
}

} // namespace
