// What becomes of DV frames that are no good, of sizes that no decoder makes, and of bytes around a frame and its picture.

#include "dv/DVExpected.h"
#include "support/DVFrameWriter.h"
#include "support/DVFrames.h"
#include "support/GuardedImage.h"

#include <PixelKiln/ScaleConvert.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>

namespace {

using namespace PKTest;
using Bytes = std::vector<uint8_t>;

constexpr PK_PixelFormat kVUYX = PK_PixelFormat_VUYX_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u;

PK_PixelFormat NativeOf(const DVLayout& layout) {
    if (layout.channels == 1) return kUYVY;
    return layout.isDV100 ? PK_PixelFormat_YUYV_422_8u_709 : PK_PixelFormat_YUYV_422_8u;
}

DVDecoded Native(const DVLayout& layout, const uint8_t* frame) {
    return DecodeDV(layout.format, frame, NativeOf(layout), layout.width, layout.height, 2);
}

/// AP1 to AP3 are all 0 or all 1, APT is one of them too.
TEST(DVRefusals, HeaderOfDV25) {
    for (const DVKind kind : {DVKind::k525of411, DVKind::k625of420}) {
        DVFrameWriter frame(kind);
        const DVLayout& layout = frame.Layout();
        for (int code = 0; code < 8 * 8 * 8 * 8; ++code) {
            const int apt = code & 7, ap1 = code >> 3 & 7, ap2 = code >> 6 & 7, ap3 = code >> 9;
            const bool isGood = apt < 2 && ap1 < 2 && ap1 == ap2 && ap2 == ap3;
            if (!isGood && code % 3 != 0) continue;
            const int values[4] = {apt, ap1, ap2, ap3};
            for (int i = 0; i < 4; ++i) // the bits above mean nothing here
                frame.Bytes()[4 + i] = static_cast<uint8_t>(code * 8 | values[i]);
            EXPECT_EQ(DecodeDV(layout.format, frame.Bytes(), kVUYX, 90, layout.height / 8, 0).result,
                      isGood ? PK_Success : PK_ErrBadDVFormat)
                << apt << ap1 << ap2 << ap3;
        }
        for (const int quality : {0, 5})
            EXPECT_EQ(DecodeDV(layout.format, frame.Bytes(), kUYVY, 720, layout.height, quality).result,
                      PK_ErrBadDVFormat);
    }
}

/// APT tells 4:1:1 from 4:2:0, whatever AP1 to AP3 are.
TEST(DVRefusals, APTTellsTheLayout) {
    for (const auto& [name, kind] :
         {std::pair{"dv25_625_411_chelsea", DVKind::k625of411}, {"dv25_625_420_coffee", DVKind::k625of420}}) {
        Bytes frame = ReadDVFrame(name);
        const Bytes before = Native(LayoutOf(kind), frame.data()).rows;
        for (size_t i = 5; i < 8; ++i) frame[i] ^= 1;
        EXPECT_EQ(Native(LayoutOf(kind), frame.data()).rows == before, true) << name;
    }
}

/// Blocks are found by their place: nothing but the header and the video blocks behind their first three bytes counts.
TEST(DVRefusals, IdentificationsMayBeWrong) {
    Random random(9);
    for (const DVKind kind : kDVKinds) {
        const DVLayout& layout = LayoutOf(kind);
        DVFrameWriter frame(kind);
        for (int i = 0; i < frame.SegmentCount(); ++i)
            for (int macroblock = 0; macroblock < 5; ++macroblock) {
                frame.Segment(i)[80 * macroblock + 4] = static_cast<uint8_t>(random.Next());
                frame.Segment(i)[80 * macroblock + 3] |=
                    static_cast<uint8_t>(random.Below(16) << 4); // error status
            }
        const auto before = Native(layout, frame.Bytes());
        ASSERT_EQ(before.result, PK_Success);
        for (int block = 0; block < layout.Bytes() / 80; ++block) {
            const int inSequence = block % 150;
            const bool isVideo = inSequence >= 7 && (inSequence - 6) % 16 != 0;
            const size_t from = block == 0 ? 8 : 0, end = isVideo ? 3 : 80;
            for (size_t i = from; i < end; ++i)
                frame.Bytes()[80 * static_cast<size_t>(block) + i] = static_cast<uint8_t>(random.Next());
        }
        frame.Bytes()[3] ^= 0x80;
        const auto after = Native(layout, frame.Bytes());
        EXPECT_EQ(after.result, PK_Success);
        EXPECT_EQ(after.rows == before.rows, true) << layout.name;
        if (layout.channels == 1) continue;
        for (size_t i = 4; i < 8; ++i) frame.Bytes()[i] = static_cast<uint8_t>(random.Next());
        EXPECT_EQ(Native(layout, frame.Bytes()).rows == before.rows, true) << layout.name << ", header";
    }
}

TEST(DVRefusals, SizesThatTheDecoderDoesNotChoose) {
    struct Case {
        DVKind kind;
        int width, height, quality;
        bool isGood;
    };
    const Case cases[] = {
        {DVKind::k525of411, 720, 480, 0, true},  {DVKind::k525of411, 720, 240, 5, true},
        {DVKind::k525of411, 720, 240, 0, true},  {DVKind::k525of411, 360, 240, 0, false},
        {DVKind::k525of411, 360, 240, 3, false}, {DVKind::k525of411, 180, 120, 2, true},
        {DVKind::k525of411, 180, 120, 3, false}, {DVKind::k525of411, 90, 60, 2, true},
        {DVKind::k525of411, 90, 60, 3, false},   {DVKind::k525of411, 720, 576, 2, false},
        {DVKind::k525of411, 720, 120, 2, false}, {DVKind::k525of411, 90, 59, 2, false},
        {DVKind::k525of411, 719, 480, 2, false}, {DVKind::k625of420, 720, 576, 0, true},
        {DVKind::k625of420, 720, 480, 0, false}, {DVKind::k625of420, 720, 288, 4, true},
        {DVKind::k625of420, 180, 144, 2, true},  {DVKind::k625of420, 90, 72, 2, true},
        {DVKind::k625of420, 90, 60, 2, false},   {DVKind::k525of422, 720, 480, 0, true},
        {DVKind::k525of422, 720, 240, 0, true},  {DVKind::k525of422, 360, 240, 5, true},
        {DVKind::k525of422, 180, 120, 0, false}, {DVKind::k525of422, 360, 480, 0, false},
        {DVKind::k525of422, 720, 576, 0, false}, {DVKind::k625of422, 360, 288, 0, true},
        {DVKind::k625of422, 720, 240, 0, false}, {DVKind::k720p60, 960, 720, 0, true},
        {DVKind::k720p60, 960, 360, 0, true},    {DVKind::k720p60, 480, 360, 5, true},
        {DVKind::k720p60, 1280, 720, 5, false},  {DVKind::k720p50, 960, 720, 5, true},
        {DVKind::k1080i60, 1280, 1080, 5, true}, {DVKind::k1080i60, 1440, 1080, 5, false},
        {DVKind::k1080i60, 640, 540, 0, true},   {DVKind::k1080i60, 1280, 540, 0, true},
        {DVKind::k1080i50, 1440, 1080, 5, true}, {DVKind::k1080i50, 1280, 1080, 5, false},
        {DVKind::k1080i50, 720, 540, 0, true},   {DVKind::k1080i50, 1440, 540, 0, true},
    };
    for (const auto& [kind, width, height, quality, isGood] : cases) {
        DVFrameWriter frame(kind);
        for (const PK_PixelFormat format :
             {kUYVY, PK_PixelFormat_YUYV_422_8u_709, kVUYX, PK_PixelFormat_VUYA_4444_8u_709,
              PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_32f})
            EXPECT_EQ(DecodeDV(LayoutOf(kind).format, frame.Bytes(), format, width, height, quality).result,
                      isGood ? PK_Success : PK_ErrSizeMismatch)
                << LayoutOf(kind).name << " " << width << " x " << height << " " << quality << " "
                << PK_PixelFormatName(format);
    }
}

TEST(DVRefusals, NullPointers) {
    DVFrameWriter frame(DVKind::k525of411);
    Bytes pixels(720 * 480 * 4);
    EXPECT_EQ(PK_Convert(nullptr, 0, PK_PixelFormat_NTSCDV25, pixels.data(), 2880, kVUYX, 720, 480, 2),
              PK_ErrFailed);
    EXPECT_EQ(PK_Convert(frame.Bytes(), 0, PK_PixelFormat_NTSCDV25, nullptr, 2880, kVUYX, 720, 480, 2),
              PK_ErrFailed);
    EXPECT_EQ(PK_Convert(frame.Bytes(), 0, PK_PixelFormat_NTSCDV25, pixels.data(), 2880, kVUYX, -720, 480, 2),
              PK_ErrFailed);
}

/// A frame between inaccessible pages, at any alignment, into an image between such, in either direction.
TEST(DVRefusals, NothingBesideFrameAndPicture) {
    Random random(4);
    for (const DVKind kind : kDVKinds) {
        const DVLayout& layout = LayoutOf(kind);
        SCOPED_TRACE(layout.name);
        DVFrameWriter good(kind);
        for (int i = 0; i < good.SegmentCount(); ++i)
            for (int at = 0; at < 400; ++at)
                if (at % 80 >= 3) good.Segment(i)[at] = static_cast<uint8_t>(random.Next());
        const auto bytes = static_cast<size_t>(layout.Bytes());
        std::vector<std::array<int, 2>> sizes = {{layout.width, layout.height},
                                                 {layout.width, layout.height / 2}};
        if (layout.channels == 1) {
            sizes.push_back({180, layout.height / 4});
            sizes.push_back({90, layout.height / 8});
        } else {
            sizes.push_back({layout.width / 2, layout.height / 2});
        }
        for (const Guard guard : {Guard::kBefore, Guard::kAfter}) {
            const GuardedRows frame(bytes, guard);
            std::memcpy(frame.Bytes(), good.Bytes(), bytes);
            for (const auto [width, height] : sizes)
                for (const PK_PixelFormat format : {NativeOf(layout), kVUYX, PK_PixelFormat_VUYA_4444_8u_709,
                                                    PK_PixelFormat_BGRX_4444_8u}) {
                    const auto rowBytes = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width));
                    const Bytes expected =
                        DecodeDV(layout.format, good.Bytes(), format, width, height, 2).rows;
                    std::vector<Bytes> rows;
                    for (size_t at = 0; at < expected.size(); at += rowBytes)
                        rows.emplace_back(expected.begin() + static_cast<ptrdiff_t>(at),
                                          expected.begin() + static_cast<ptrdiff_t>(at + rowBytes));
                    for (const bool upwards : {false, true}) {
                        const GuardedImage image(
                            {rowBytes, height, upwards ? size_t{13} : size_t{0}, upwards, guard}, random);
                        ASSERT_EQ(PK_Convert(frame.Bytes(), -5, layout.format, image.Pixels(),
                                             image.RowBytes(), format, width, height, 2),
                                  PK_Success);
                        image.ExpectRows(rows);
                    }
                }
        }
    }
}

/// Damage of one segment shows in its five macroblocks alone; and in them, always in the same way.
TEST(DVRefusals, DamageStaysInItsSegment) {
    Random random(6);
    for (const DVKind kind : kDVKinds) {
        const DVLayout& layout = LayoutOf(kind);
        if (layout.channels == 1) continue; // chroma is interpolated across
        DVFrameWriter frame(kind);
        for (int i = 0; i < frame.SegmentCount(); ++i) {
            std::vector<DVBlockBits> blocks(static_cast<size_t>(5 * layout.BlocksOfMacroblock()));
            for (DVBlockBits& block : blocks) block.dc = static_cast<int>(random.Below(512)) - 256;
            frame.Write(i, blocks, std::vector<int>(5, 15));
        }
        const auto native = NativeOf(layout);
        const auto pixels = [&] {
            return DVPixelsFromMemory(Native(layout, frame.Bytes()).rows, native, layout.width,
                                      layout.height);
        };
        const DVPixels before = pixels();
        for (int trial = 0; trial < 4; ++trial) {
            const int hit = static_cast<int>(random.Below(static_cast<uint32_t>(frame.SegmentCount())));
            uint8_t* const segment = frame.Segment(hit);
            const Bytes good(segment, segment + 400);
            for (size_t i = 0; i < 400; ++i)
                if (i % 80 >= 3) segment[i] = static_cast<uint8_t>(random.Next());
            const DVPixels after = pixels();
            EXPECT_EQ(DVDifference(after, pixels(), false, 0), "");
            std::copy(good.begin(), good.end(), segment);
            for (int y = 0; y < layout.height; ++y)
                for (int x = 0; x < layout.width; ++x) {
                    if (after.At(x, y) == before.At(x, y)) continue;
                    bool isInside = false;
                    for (int macroblock = 0; macroblock < 5; ++macroblock) {
                        const DVPlace place = PlaceOf(kind, hit / 27 / layout.sequences,
                                                      hit / 27 % layout.sequences, hit % 27, macroblock);
                        const int width = place.shape == DVShape::kHalfRow ? 32 : 16,
                                  height = place.shape == DVShape::kHD ? 16 : 8;
                        isInside |= place.shape != DVShape::kUnused && x >= place.x && x < place.x + width &&
                                    y >= place.y && y < place.y + height;
                    }
                    ASSERT_TRUE(isInside) << layout.name << " " << x << ", " << y << ", segment " << hit;
                }
        }
    }
}

} // namespace
