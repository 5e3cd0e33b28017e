// Where macroblocks lie: places worked out by hand, and that all of them make up the picture.

#include "dv/DVPlacement.h"

#include <gtest/gtest.h>

#include <vector>

namespace PK {
namespace {

std::vector<DVFormat> AllFormats() {
    std::vector<DVFormat> formats(std::begin(kDVFormats), std::end(kDVFormats));
    formats.push_back(kDVCPROPAL25);
    return formats;
}

/// Counts how often each sample of luma is in a macroblock.
class Coverage {
public:
    explicit Coverage(const DVFormat& format)
        : fWidth(format.width), fCounts(size_t(format.width) * size_t(format.height)) {}

    void Add(const DVPlace& place) {
        const bool isWide = place.shape == DVShape::k411 || place.shape == DVShape::kHDSideBySide;
        const bool isFlat = isWide || place.shape == DVShape::k422;
        for (int y = place.y; y < place.y + (isFlat ? 8 : 16); ++y)
            for (int x = place.x; x < place.x + (isWide ? 32 : 16); ++x) {
                const size_t at = size_t(y) * size_t(fWidth) + size_t(x);
                ASSERT_LT(x, fWidth);
                ASSERT_LT(at, fCounts.size());
                ++fCounts[at];
            }
    }

    bool IsWhole() const {
        for (const uint8_t count : fCounts)
            if (count != 1) return false;
        return true;
    }

private:
    int fWidth;
    std::vector<uint8_t> fCounts;
};

TEST(DVPlacement, MacroblocksCoverThePictureOnce) {
    for (const DVFormat& format : AllFormats())
        for (int first = 0; first <= (format.isProgressive ? 2 : 0); first += 2) {
            SCOPED_TRACE(testing::Message() << std::hex << format.stream << ", from channel " << first);
            Coverage coverage(format);
            for (int channel = 0; channel < format.channels; ++channel)
                for (int sequence = 0; sequence < format.Sequences(); ++sequence)
                    for (int segment = 0; segment < kSegmentsOfSequence; ++segment) {
                        DVPlace places[kMacroblocksOfSegment];
                        if (!PlaceSegment(format, first + channel, sequence, segment, places)) continue;
                        for (const DVPlace& place : places) ASSERT_NO_FATAL_FAILURE(coverage.Add(place));
                    }
            EXPECT_TRUE(coverage.IsWhole());
        }
}

struct Known {
    PK_PixelFormat stream;
    bool isDVCPRO;
    int channel, sequence, segment, macroblock;
    int x, y;
    DVShape shape;
};

TEST(DVPlacement, PlacesWorkedOutByHand) {
    using enum DVShape;
    const Known kKnown[] = {
        {PK_PixelFormat_NTSCDV25, false, 0, 0, 0, 0, 288, 96, k411},
        {PK_PixelFormat_NTSCDV25, false, 0, 0, 0, 1, 128, 312, k411}, // within a column of super blocks
        {PK_PixelFormat_NTSCDV25, false, 0, 0, 8, 3, 32, 24, k411},   // upward in the second column
        {PK_PixelFormat_NTSCDV25, false, 0, 0, 24, 4, 704, 192, k411Stacked},
        {PK_PixelFormat_NTSCDV25, false, 0, 9, 26, 4, 704, 176, k411Stacked},
        {PK_PixelFormat_PALDV25, false, 0, 11, 26, 0, 416, 80, k420},
        {PK_PixelFormat_PALDV25, true, 0, 11, 0, 0, 288, 48, k411},
        {PK_PixelFormat_NTSCDV50, false, 1, 3, 4, 2, 448, 80, k422},
        {PK_PixelFormat_NTSC_DV100_720p, false, 0, 0, 0, 0, 384, 144, kHD},
        {PK_PixelFormat_NTSC_DV100_1080i, false, 0, 0, 0, 0, 576, 256, kHD},
        {PK_PixelFormat_PAL_DV100_1080i, false, 0, 11, 0, 0, 0, 0, kHD},
        {PK_PixelFormat_PAL_DV100_1080i, false, 0, 11, 9, 3, 0, 1072, kHDSideBySide},
    };
    for (const Known& known : kKnown) {
        const DVFormat& format = known.isDVCPRO ? kDVCPROPAL25 : *FindDVFormat(known.stream);
        DVPlace places[kMacroblocksOfSegment];
        ASSERT_TRUE(PlaceSegment(format, known.channel, known.sequence, known.segment, places));
        const DVPlace& place = places[known.macroblock];
        EXPECT_EQ(known.x, place.x) << std::hex << known.stream;
        EXPECT_EQ(known.y, place.y) << std::hex << known.stream;
        EXPECT_EQ(known.shape, place.shape) << std::hex << known.stream;
    }
}

TEST(DVPlacement, SequencesWithoutPicture) {
    DVPlace places[kMacroblocksOfSegment];
    const DVFormat& p720 = *FindDVFormat(PK_PixelFormat_PAL_DV100_720p);
    const DVFormat& i1080 = *FindDVFormat(PK_PixelFormat_PAL_DV100_1080i);
    EXPECT_TRUE(PlaceSegment(p720, 1, 9, 26, places));
    EXPECT_FALSE(PlaceSegment(p720, 0, 10, 0, places));
    EXPECT_FALSE(PlaceSegment(p720, 3, 11, 26, places));
    EXPECT_TRUE(PlaceSegment(i1080, 0, 11, 0, places));
    EXPECT_FALSE(PlaceSegment(i1080, 1, 11, 0, places));
    EXPECT_FALSE(PlaceSegment(i1080, 3, 11, 26, places));
}

TEST(DVPlacement, SegmentsStepOverAudio) {
    EXPECT_EQ(80 * 7, SegmentOffset(0));
    EXPECT_EQ(80 * 17, SegmentOffset(2));
    EXPECT_EQ(80 * 23, SegmentOffset(3)); // 22 is of audio
    EXPECT_EQ(kSequenceBytes - kSegmentBytes, SegmentOffset(26));
}

TEST(DVPlacement, FramesHaveTheirBytes) {
    const int expected[] = {120000, 144000, 240000, 288000, 240000, 288000, 480000, 576000};
    for (size_t i = 0; i < std::size(kDVFormats); ++i) {
        EXPECT_EQ(expected[i], kDVFormats[i].FrameBytes());
        EXPECT_EQ(expected[i], PK_PixelFormatSize(kDVFormats[i].stream, 0, 0));
    }
}

} // namespace
} // namespace PK
