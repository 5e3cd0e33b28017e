// What a frame says of the shape of its picture, and what it is made to say.

#include "dvcalls/CDVFrame.h"

#include "support/Random.h"

#include <gtest/gtest.h>

#include <array>
#include <vector>

namespace {

using PK::CDVFrame;
using PK::DVAspect;

constexpr size_t kSequence = 12000;

size_t PackPlace(size_t sequence) {
    return sequence * kSequence + (sequence % 2 == 0 ? 453 : 248);
}

/// A frame whose sequences have a pack each, or none where the display is negative.
struct Frame {
    Frame(size_t sequences, bool is625) : bytes(sequences * kSequence) {
        PKTest::Random random(7);
        for (uint8_t& byte : bytes) byte = static_cast<uint8_t>(random.Below(256) & 0x9e); // never 0x61
        bytes[3] = is625 ? 0xbf : 0x3f;
    }

    void SetPack(size_t sequence, int32_t system, int32_t display, uint8_t others = 0) {
        uint8_t* const pack = &bytes[PackPlace(sequence)];
        pack[0] = 0x61;
        pack[2] = static_cast<uint8_t>((others & 0xf8) | display);
        pack[3] = static_cast<uint8_t>((others & 0xfc) | system);
    }

    int32_t Size() const { return static_cast<int32_t>(bytes.size()); }
    int32_t Vote() const { return static_cast<int32_t>(CDVFrame(bytes.data(), Size()).VoteOnAspect()); }

    std::vector<uint8_t> bytes;
};

// By the low bits of the fourth byte of a pack, then by those of the third; -1 counts nothing.
constexpr int32_t kMeanings[4][8] = {{0, 1, 2, -1, -1, -1, -1, -1},
                                     {0, 3, 3, 1, 1, 1, 4, 2},
                                     {-1, -1, -1, -1, -1, -1, -1, -1},
                                     {-1, -1, -1, -1, -1, -1, -1, -1}};

TEST(CDVFrame, EachPackMeansOneAspectWhateverItsOtherBits) {
    for (int32_t system = 0; system < 4; ++system)
        for (int32_t display = 0; display < 8; ++display)
            for (const size_t sequence : {0, 1, 8, 9})
                for (const int32_t others : {0x00, 0xfc, 0xa8, 0x54}) {
                    Frame frame(10, false);
                    frame.SetPack(sequence, system, display, static_cast<uint8_t>(others));
                    EXPECT_EQ(kMeanings[system][display], frame.Vote())
                        << system << ", " << display << " in sequence " << sequence;
                }
}

TEST(CDVFrame, NoPackIsNoVote) {
    EXPECT_EQ(-1, Frame(10, false).Vote());
    Frame frame(12, true);
    for (size_t sequence = 0; sequence < 12; ++sequence) { // at the places of the other sequences
        frame.bytes[sequence * kSequence + (sequence % 2 == 0 ? 248 : 453)] = 0x61;
        frame.bytes[PackPlace(sequence)] = 0x60;
    }
    EXPECT_EQ(-1, frame.Vote());
}

/// So many sequences for each aspect of the list, in its order.
Frame Divided(const std::array<size_t, 5>& counts) {
    constexpr int32_t kFields[5][2] = {{0, 0}, {0, 1}, {0, 2}, {1, 1}, {1, 6}}; // system, display
    Frame frame(24, true);
    size_t sequence = 0;
    for (size_t aspect = 0; aspect < 5; ++aspect)
        for (size_t i = 0; i < counts[aspect]; ++i, ++sequence)
            frame.SetPack(sequence, kFields[aspect][0], kFields[aspect][1]);
    return frame;
}

TEST(CDVFrame, TheLargestCountWins) {
    EXPECT_EQ(0, Divided({9, 8, 3, 2, 1}).Vote());
    EXPECT_EQ(1, Divided({4, 5, 4, 4, 4}).Vote());
    EXPECT_EQ(2, Divided({0, 1, 2, 1, 0}).Vote());
    EXPECT_EQ(3, Divided({4, 4, 4, 5, 4}).Vote());
    EXPECT_EQ(4, Divided({0, 0, 0, 0, 1}).Vote());
}

TEST(CDVFrame, OfEqualCountsTheFirstOfTheListWins) {
    EXPECT_EQ(1, Divided({0, 5, 5, 0, 0}).Vote());
    EXPECT_EQ(0, Divided({2, 2, 2, 2, 2}).Vote());
    EXPECT_EQ(3, Divided({1, 2, 0, 8, 8}).Vote());
    EXPECT_EQ(0, Divided({12, 0, 0, 0, 12}).Vote());
}

TEST(CDVFrame, MeaningsOfBothSystemsAddUp) {
    Frame frame(10, false);
    frame.SetPack(0, 0, 0);
    frame.SetPack(1, 0, 0);
    frame.SetPack(2, 0, 1);
    frame.SetPack(3, 1, 3);
    frame.SetPack(4, 1, 5);
    EXPECT_EQ(1, frame.Vote());
}

TEST(CDVFrame, ItsSizeTellsTheSequences) {
    const std::vector<uint8_t> ntsc(4, 0x3f), pal(4, 0xbf);
    EXPECT_EQ(10, CDVFrame(ntsc.data()).SequenceCount());
    EXPECT_EQ(12, CDVFrame(pal.data()).SequenceCount());
    EXPECT_EQ(12, CDVFrame(pal.data(), 0).SequenceCount());
    EXPECT_EQ(1, CDVFrame(pal.data(), 12000).SequenceCount());
    EXPECT_EQ(40, CDVFrame(pal.data(), 480000).SequenceCount());
    EXPECT_EQ(1, CDVFrame(pal.data(), 23999).SequenceCount());
    EXPECT_EQ(0, CDVFrame(pal.data(), 11999).SequenceCount());
    EXPECT_EQ(0, CDVFrame(pal.data(), -1).SequenceCount());
}

TEST(CDVFrame, OnlySequencesOfTheFrameVote) {
    Frame frame(12, true);
    frame.SetPack(9, 0, 1);
    frame.SetPack(10, 0, 2);
    frame.SetPack(11, 0, 2);
    EXPECT_EQ(2, frame.Vote());
    EXPECT_EQ(DVAspect::kLetterbox16x9, CDVFrame(frame.bytes.data(), 120000).VoteOnAspect());
    EXPECT_EQ(DVAspect::k16x9, CDVFrame(frame.bytes.data()).VoteOnAspect());
    frame.bytes[3] = 0x3f;
    EXPECT_EQ(DVAspect::kLetterbox16x9, CDVFrame(frame.bytes.data()).VoteOnAspect());
}

struct Written {
    int32_t display, system;
};
constexpr Written kWritten525[5] = {{0, 0}, {1, 0}, {2, 0}, {1, 1}, {6, 1}};
constexpr Written kWritten625[5] = {{0, 1}, {1, 0}, {7, 1}, {1, 1}, {6, 1}};

TEST(CDVFrame, AnAspectGoesIntoEveryPackAndNowhereElse) {
    for (const bool is625 : {false, true})
        for (int32_t aspect = 0; aspect < 5; ++aspect) {
            const Written written = (is625 ? kWritten625 : kWritten525)[aspect];
            Frame frame(is625 ? 24 : 20, is625);
            const size_t sequences = frame.bytes.size() / kSequence;
            for (size_t sequence = 0; sequence < sequences; ++sequence)
                if (sequence % 5 != 3) frame.SetPack(sequence, 2, 5, sequence % 3 == 0 ? 0xfc : 0x54);
            Frame expected = frame;
            for (size_t sequence = 0; sequence < sequences; ++sequence)
                if (sequence % 5 != 3)
                    expected.SetPack(sequence, written.system, written.display,
                                     sequence % 3 == 0 ? 0xfc : 0x54);
            CDVFrame::WriteAspect(frame.bytes.data(), frame.Size(), static_cast<DVAspect>(aspect));
            EXPECT_EQ(expected.bytes, frame.bytes) << aspect << (is625 ? " in 625 lines" : " in 525 lines");
        }
}

TEST(CDVFrame, WhatIsWrittenIsReadAgain) {
    for (const bool is625 : {false, true})
        for (int32_t aspect = 0; aspect < 5; ++aspect) {
            Frame frame(10, is625);
            for (size_t sequence = 0; sequence < 10; ++sequence) frame.SetPack(sequence, 3, 3);
            CDVFrame::WriteAspect(frame.bytes.data(), frame.Size(), static_cast<DVAspect>(aspect));
            EXPECT_EQ(aspect, frame.Vote());
        }
}

TEST(CDVFrame, NoAspectChangesNothing) {
    Frame frame(10, false);
    frame.SetPack(4, 3, 7);
    const std::vector<uint8_t> before = frame.bytes;
    CDVFrame::WriteAspect(frame.bytes.data(), frame.Size(), DVAspect::kNone);
    EXPECT_EQ(before, frame.bytes);
}

} // namespace
