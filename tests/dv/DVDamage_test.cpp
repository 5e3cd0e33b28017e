// What is left of a frame of DV when some of its bytes are wrong: all but the macroblocks of their segments.

#include "dv/DVDecode.h"

#include "support/DVFrames.h"
#include "support/GuardedRows.h"
#include "support/Random.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <span>
#include <vector>

namespace PK {
namespace {

using PKTest::Random;
using Bytes = std::vector<uint8_t>;

constexpr int32_t kSegmentsAtOnce = 3;

const DVFormat& FormatOf(const PKTest::DVFrame& frame, const Bytes& bytes) {
    const bool is411 = frame.format == PK_PixelFormat_PALDV25 && (bytes[4] & 7) == 1;
    return is411 ? kDVCPROPAL25 : *FindDVFormat(frame.format);
}

struct View {
    DVSize size;
    int32_t field;
};
constexpr View kViews[] = {{DVSize::Full, 0}, {DVSize::Full, 1},    {DVSize::Full, 2},
                           {DVSize::Half, 0}, {DVSize::Quarter, 0}, {DVSize::Eighth, 0}};

/// Those that there are for a format: the two smallest of DV25 alone.
std::span<const View> ViewsOf(const DVFormat& format) {
    const bool isDV25 = format.channels == 1;
    return std::span(kViews).first(isDV25 ? 6 : 4);
}

/// The planes in memory that held one byte everywhere.
Bytes Decoded(const uint8_t* frame, const DecodedPicture& picture, uint8_t before) {
    Bytes block(DVPlanesBytes(picture), before);
    DecodeDVToPlanes(frame, picture, DVPlanesIn(block.data(), picture));
    return block;
}

struct Segment {
    int32_t channel, sequence, number;

    size_t Offset(const DVFormat& format) const {
        return static_cast<size_t>(channel * format.Sequences() + sequence) * kSequenceBytes +
               static_cast<size_t>(SegmentOffset(number));
    }
};

Segment Draw(const DVFormat& format, Random& random) {
    return {static_cast<int32_t>(random.Below(static_cast<uint32_t>(format.channels))),
            static_cast<int32_t>(random.Below(static_cast<uint32_t>(format.Sequences()))),
            static_cast<int32_t>(random.Below(kSegmentsOfSequence))};
}

/// Bits flipped, all bytes anything, blocks exchanged, a run of one byte.
void Damage(uint8_t* segment, Random& random) {
    switch (random.Below(4)) {
    case 0:
        for (uint32_t flips = 1 + random.Below(20); flips != 0; --flips)
            segment[random.Below(kSegmentBytes)] ^= static_cast<uint8_t>(1U << random.Below(8));
        return;
    case 1:
        return random.Fill(segment, kSegmentBytes);
    case 2:
        std::swap_ranges(segment, segment + kDIFBlockBytes,
                         segment + ptrdiff_t{kDIFBlockBytes} * (1 + random.Below(4)));
        return;
    default: {
        const uint32_t first = random.Below(kSegmentBytes);
        std::memset(segment + first, static_cast<int>(random.Below(256)),
                    random.Below(kSegmentBytes - first) + 1);
    }
    }
}

/// Width and height of a macroblock in luma samples; those of chroma are as many as the planes have fewer.
void SizeOf(DVShape shape, int32_t& width, int32_t& height) {
    width = shape == DVShape::k411 || shape == DVShape::kHDSideBySide ? 32 : 16;
    height = shape == DVShape::k411 || shape == DVShape::k422 || shape == DVShape::kHDSideBySide ? 8 : 16;
}

/// Gives the samples of a segment's macroblocks the values that they have in another decoding.
void CopyMacroblocks(const Segment& segment, bool isSecondOfPair, const DecodedPicture& picture, Bytes& from,
                     Bytes& to) {
    DVPlace places[kMacroblocksOfSegment];
    const int32_t channel = segment.channel + (isSecondOfPair ? 2 : 0);
    if (!PlaceSegment(picture.format, channel, segment.sequence, segment.number, places)) return;
    const DestinationPlanes source = DVPlanesIn(from.data(), picture),
                            target = DVPlanesIn(to.data(), picture);
    for (const DVPlace& place : places) {
        int32_t width = 0, height = 0;
        SizeOf(place.shape, width, height);
        for (size_t plane = 0; plane < 3; ++plane) {
            const auto& samples = target[plane];
            // From the picture to samples: what is begun counts whole.
            const auto column = [&](int32_t x) {
                return (x * samples.width + picture.format.width - 1) / picture.format.width;
            };
            const auto row = [&](int32_t y) {
                return (y * samples.height + picture.format.height - 1) / picture.format.height;
            };
            const int32_t left = place.x * samples.width / picture.format.width;
            const int32_t top = place.y * samples.height / picture.format.height;
            for (int32_t y = top; y < row(place.y + height); ++y)
                std::copy_n(source[plane].Row(y) + left, column(place.x + width) - left,
                            samples.Row(y) + left);
        }
    }
}

TEST(DVDamage, ASegmentChangesNothingOutsideItsMacroblocks) {
    Random random(71);
    for (const PKTest::DVFrame& known : PKTest::kDVFrames) {
        const Bytes good = PKTest::ReadDVFrame(known.name);
        const DVFormat& format = FormatOf(known, good);
        const bool isSecondOfPair = format.isProgressive && (good[1] & 4) == 0;
        for (const View& view : ViewsOf(format)) {
            const DecodedPicture picture = {format, view.size, view.field};
            const Bytes whole = Decoded(good.data(), picture, 0x55);
            for (int32_t round = 0; round < 6; ++round) {
                Bytes bad = good;
                Segment segments[kSegmentsAtOnce];
                for (Segment& segment : segments) {
                    segment = Draw(format, random);
                    Damage(&bad[segment.Offset(format)], random);
                }
                Bytes damaged = Decoded(bad.data(), picture, 0x55), repaired = damaged, source = whole;
                for (const Segment& segment : segments)
                    CopyMacroblocks(segment, isSecondOfPair, picture, source, repaired);
                ASSERT_EQ(whole, repaired) << known.name << ", size " << static_cast<int>(view.size)
                                           << ", field " << view.field << ", seed " << random.Seed();
            }
        }
    }
}

/// Leaves a stack full of noise behind, where locals of the next call will lie.
[[gnu::noinline]] void SoilStack(Random& random) {
    volatile uint8_t soil[16384];
    for (volatile uint8_t& byte : soil) byte = static_cast<uint8_t>(random.Next());
}

/// Random bytes but for the first block, so that all formats and both pairs come about.
Bytes Garbage(const DVFormat& format, Random& random) {
    Bytes frame = random.Bytes(static_cast<size_t>(format.FrameBytes()));
    frame[1] = static_cast<uint8_t>(random.Below(2) * 4);
    return frame;
}

TEST(DVDamage, NothingDependsOnWhatMemoryHeld) {
    Random random(72);
    for (const DVFormat& format : kDVFormats)
        for (const View& view : ViewsOf(format)) {
            const DecodedPicture picture = {format, view.size, view.field};
            const Bytes frame = Garbage(format, random);
            SoilStack(random);
            const Bytes once = Decoded(frame.data(), picture, 0x00);
            SoilStack(random);
            EXPECT_EQ(once, Decoded(frame.data(), picture, 0xff))
                << PK_PixelFormatName(format.stream) << ", seed " << random.Seed();
        }
}

TEST(DVDamage, AnyBytesAreReadWithinTheFrame) {
    Random random(73);
    for (const DVFormat& format : kDVFormats)
        for (const View& view : ViewsOf(format))
            for (const PKTest::Guard guard : {PKTest::Guard::kBefore, PKTest::Guard::kAfter}) {
                const DecodedPicture picture = {format, view.size, view.field};
                const Bytes garbage = Garbage(format, random);
                const PKTest::GuardedRows frame(garbage.size(), guard), planes(DVPlanesBytes(picture), guard);
                std::copy(garbage.begin(), garbage.end(), frame.Bytes());
                DecodeDVToPlanes(frame.Bytes(), picture, DVPlanesIn(planes.Bytes(), picture));
                EXPECT_TRUE(std::equal(garbage.begin(), garbage.end(), frame.Bytes()));
            }
}

TEST(DVDamage, IDsAreNotLookedAt) {
    Random random(74);
    for (const PKTest::DVFrame& known : PKTest::kDVFrames) {
        const Bytes good = PKTest::ReadDVFrame(known.name);
        const DecodedPicture picture = {FormatOf(known, good), DVSize::Full, 0};
        Bytes bad = good;
        for (size_t block = 1; block < bad.size() / kDIFBlockBytes; ++block)
            random.Fill(&bad[block * kDIFBlockBytes], 3);
        EXPECT_EQ(Decoded(good.data(), picture, 0), Decoded(bad.data(), picture, 0)) << known.name;
    }
}

} // namespace
} // namespace PK
