// Two frames of DV made one: whose rows come out, what the result says of its shape, and what is refused.

#include <PixelKiln/PixelKiln.h>

#include "support/DVFrames.h"
#include "support/GuardedRows.h"
#include "support/Random.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <utility>

namespace {

using Bytes = std::vector<uint8_t>;

constexpr PK_PixelFormat kPictures = PK_PixelFormat_YUYV_422_8u;
constexpr int32_t kQuality = 4;
constexpr size_t kSequence = 12000;

struct Format {
    PK_PixelFormat format;
    int32_t width, height, bytes;

    bool IsHD() const { return width != 720; }
    size_t Count() const { return static_cast<size_t>(bytes); }
    size_t RowLength() const { return 2 * static_cast<size_t>(width); }
};

constexpr Format kFormats[] = {
    {PK_PixelFormat_NTSCDV25, 720, 480, 120000},
    {PK_PixelFormat_PALDV25, 720, 576, 144000},
    {PK_PixelFormat_NTSCDV50, 720, 480, 240000},
    {PK_PixelFormat_PALDV50, 720, 576, 288000},
    {PK_PixelFormat_NTSC_DV100_720p, 960, 720, 240000},
    {PK_PixelFormat_PAL_DV100_720p, 960, 720, 288000},
    {PK_PixelFormat_NTSC_DV100_1080i, 1280, 1080, 480000},
    {PK_PixelFormat_PAL_DV100_1080i, 1440, 1080, 576000},
};
constexpr const Format &kNTSC25 = kFormats[0], &kPAL25 = kFormats[1], &kNTSC720 = kFormats[4];

Bytes Decoded(const Format& format, const Bytes& frame) {
    Bytes picture(format.RowLength() * static_cast<size_t>(format.height));
    EXPECT_EQ(PK_Success, PK_Convert(frame.data(), format.bytes, format.format, picture.data(),
                                     2 * format.width, kPictures, format.width, format.height, kQuality));
    return picture;
}

Bytes Encoded(const Format& format, const Bytes& picture) {
    Bytes frame(format.Count());
    EXPECT_EQ(PK_Success, PK_Convert(picture.data(), 2 * format.width, kPictures, frame.data(), format.bytes,
                                     format.format, format.width, format.height, kQuality));
    return frame;
}

/// A frame of one grey, with a ramp from left to right.
Bytes Grey(const Format& format, int32_t level) {
    Bytes picture(format.RowLength() * static_cast<size_t>(format.height), 128);
    for (size_t i = 0; i < picture.size(); i += 2)
        picture[i] = static_cast<uint8_t>(level + static_cast<int32_t>(i % format.RowLength()) * 20 /
                                                      (2 * format.width));
    return Encoded(format, picture);
}

Bytes Merged(const Format& format, const Bytes& a, const Bytes& b) {
    Bytes frame(format.Count(), 0x5a);
    EXPECT_EQ(PK_Success, PK_MergeDVCPRO(a.data(), b.data(), frame.data(), format.format, kQuality));
    return frame;
}

uint8_t* Pack(Bytes& frame, size_t sequence) {
    return frame.data() + sequence * kSequence + (sequence % 2 == 0 ? 453 : 248);
}

/// Has all packs say this, or leaves the frame without any.
void SetPacks(Bytes& frame, int32_t display, int32_t system) {
    for (size_t sequence = 0; sequence < frame.size() / kSequence; ++sequence) {
        uint8_t* const pack = Pack(frame, sequence);
        pack[0] = display < 0 ? 0xff : 0x61;
        pack[2] = static_cast<uint8_t>((pack[2] & 0xf8) | (display & 7));
        pack[3] = static_cast<uint8_t>((pack[3] & 0xfc) | (system & 3));
    }
}

double LumaDifference(const Format& format, const Bytes& a, const Bytes& b, int32_t row) {
    double sum = 0;
    const size_t first = static_cast<size_t>(row) * format.RowLength();
    for (size_t i = first; i < first + format.RowLength(); i += 2) sum += std::abs(a[i] - b[i]);
    return sum / format.width;
}

TEST(MergeDV, RowsOfOneFieldAreTheFirstFramesAndTheOthersTheSeconds) {
    for (const Format& format : kFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format.format));
        const Bytes a = Grey(format, 60), b = Grey(format, 160);
        const Bytes picture = Decoded(format, Merged(format, a, b));
        const Bytes ofA = Decoded(format, a), ofB = Decoded(format, b);
        for (int32_t row = 0; row < format.height; ++row) {
            const bool isFirsts = (row % 2 == 1) != format.IsHD();
            ASSERT_LT(LumaDifference(format, picture, isFirsts ? ofA : ofB, row), 3) << "row " << row;
        }
    }
}

/// What the rule says, done by hand: but for the shape and what is kept of 720 lines.
Bytes MergedByHand(const Format& format, const Bytes& a, const Bytes& b) {
    const Bytes first = Decoded(format, a);
    Bytes second = Decoded(format, b);
    for (int32_t row = format.IsHD() ? 0 : 1; row < format.height; row += 2) {
        const auto at = static_cast<ptrdiff_t>(row) * static_cast<ptrdiff_t>(format.RowLength());
        std::copy_n(first.begin() + at, format.RowLength(), second.begin() + at);
    }
    return Encoded(format, second);
}

TEST(MergeDV, TheResultIsTheEncodedJoinOfTheDecodedPictures) {
    for (const Format& format : kFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format.format));
        for (const PKTest::DVFrame& frame : PKTest::kDVFrames) {
            if (frame.format != format.format || !frame.isPhotograph) continue;
            Bytes a = PKTest::ReadDVFrame(frame.name);
            SetPacks(a, -1, 0);
            const Bytes b = Grey(format, 100);
            EXPECT_EQ(MergedByHand(format, a, b), Merged(format, a, b)) << frame.name;
        }
    }
}

TEST(MergeDV, BodiesAgree) {
    const Bytes a = PKTest::ReadDVFrame("dv50_625_astronaut"), b = Grey(kFormats[3], 100);
    const Bytes merged = Merged(kFormats[3], a, b);
    PKTest::AtEveryTarget([&] { EXPECT_EQ(merged, Merged(kFormats[3], a, b)); });
}

Bytes MergedByBytes(const Bytes& a, const Bytes& b, int32_t frameBytes) {
    Bytes frame(150000, 0x5a);
    EXPECT_EQ(PK_Success, PK_MergeDV(a.data(), b.data(), frame.data(), frameBytes, kQuality));
    return frame;
}

Bytes Padded(Bytes frame) {
    frame.resize(150000, 0x5a);
    return frame;
}

TEST(MergeDV, AnyCountOfBytesButThatOfNTSCIsPAL) {
    Bytes a = PKTest::ReadDVFrame("dv25_625_420_coffee");
    SetPacks(a, 7, 1);
    const Bytes b = Grey(kPAL25, 100), expected = Padded(Merged(kPAL25, a, b));
    for (const int32_t frameBytes : {144000, 999, 0, -1, 119999, 120001, INT32_MIN})
        EXPECT_EQ(expected, MergedByBytes(a, b, frameBytes)) << frameBytes;
    const Bytes c = PKTest::ReadDVFrame("dv25_525_411_astronaut"), d = Grey(kNTSC25, 100);
    EXPECT_EQ(Padded(Merged(kNTSC25, c, d)), MergedByBytes(c, d, 120000));
}

TEST(MergeDV, TheResultSaysTheShapeOfTheFirstFrame) {
    struct Shape {
        int32_t display, system;       // read
        int32_t display525, system525; // written
        int32_t display625, system625;
    };
    constexpr Shape kShapes[] = {
        {0, 0, 0, 0, 0, 1}, {0, 1, 0, 0, 0, 1}, {1, 0, 1, 0, 1, 0}, {4, 1, 1, 0, 1, 0},
        {2, 0, 2, 0, 7, 1}, {7, 1, 2, 0, 7, 1}, {2, 1, 1, 1, 1, 1}, {6, 1, 6, 1, 6, 1},
    };
    for (const Format* const format : {&kNTSC25, &kFormats[3]}) {
        SCOPED_TRACE(PK_PixelFormatName(format->format));
        Bytes a = Grey(*format, 60), b = Grey(*format, 160), plain = MergedByHand(*format, a, b);
        SetPacks(b, 3, 2);
        for (const Shape& shape : kShapes) {
            SetPacks(a, shape.display, shape.system);
            const bool is625 = format->height == 576;
            Bytes expected = plain;
            SetPacks(expected, is625 ? shape.display625 : shape.display525,
                     is625 ? shape.system625 : shape.system525);
            EXPECT_EQ(expected, Merged(*format, a, b)) << shape.display << ", " << shape.system;
        }
    }
}

TEST(MergeDV, PacksThatSayNothingLeaveTheEncodersOwn) {
    Bytes a = Grey(kNTSC25, 60), b = Grey(kNTSC25, 160);
    const Bytes plain = MergedByHand(kNTSC25, a, b);
    SetPacks(b, 1, 0);
    SetPacks(a, -1, 0);
    EXPECT_EQ(plain, Merged(kNTSC25, a, b));
    SetPacks(a, 5, 0);
    EXPECT_EQ(plain, Merged(kNTSC25, a, b));
}

TEST(MergeDV, MostPacksDecide) {
    Bytes a = Grey(kNTSC25, 60);
    SetPacks(a, 1, 0);
    for (size_t sequence = 0; sequence < 5; ++sequence) Pack(a, sequence)[2] = 0xca; // 16:9
    Bytes merged = Merged(kNTSC25, a, a);
    for (size_t sequence = 0; sequence < 10; ++sequence) EXPECT_EQ(1, Pack(merged, sequence)[2] & 7);
    Pack(a, 5)[2] = 0xca;
    merged = Merged(kNTSC25, a, a);
    for (size_t sequence = 0; sequence < 10; ++sequence) EXPECT_EQ(2, Pack(merged, sequence)[2] & 7);
}

TEST(MergeDV, TheEighthByteOfTheSecondFrameOf720LinesIsKept) {
    for (const Format& format : kFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format.format));
        Bytes a = Grey(format, 60), b = a;
        a[8] = 0x21;
        b[8] = 0x43;
        EXPECT_EQ(format.height == 720 ? 0x43 : 0xff, Merged(format, a, b)[8]);
    }
}

TEST(MergeDV, ASecondFrameOfAPairIsReadAndTheResultIsAFirstOne) {
    const Bytes a = PKTest::ReadDVFrame("dv100_720p60_chelsea"),
                b = PKTest::ReadDVFrame("dv100_720p60_chelsea_second");
    const Bytes merged = Merged(kNTSC720, a, b);
    EXPECT_EQ(4, merged[1] & 4);
    const Bytes picture = Decoded(kNTSC720, merged), ofA = Decoded(kNTSC720, a), ofB = Decoded(kNTSC720, b);
    double differenceA = 0, differenceB = 0;
    for (int32_t row = 0; row < 720; row += 2) {
        differenceA += LumaDifference(kNTSC720, picture, ofA, row) / 360;
        differenceB += LumaDifference(kNTSC720, picture, ofB, row + 1) / 360;
    }
    EXPECT_LT(differenceA, 3);
    EXPECT_LT(differenceB, 3);
}

TEST(MergeDV, FramesOf411In625LinesGiveOneOf420) {
    const Bytes a = PKTest::ReadDVFrame("dv25_625_411_chelsea");
    ASSERT_EQ(1, a[4] & 7);
    const Bytes merged = Merged(kPAL25, a, a);
    for (size_t byte = 4; byte < 8; ++byte) EXPECT_EQ(0, merged[byte] & 7);
}

TEST(MergeDV, TheResultMayLieOverTheFrames) {
    for (const Format* const format : {&kNTSC25, &kFormats[3], &kNTSC720}) {
        SCOPED_TRACE(PK_PixelFormatName(format->format));
        Bytes a = Grey(*format, 60), b = Grey(*format, 160);
        b[8] = 0x43;
        const Bytes expected = Merged(*format, a, b), twice = Merged(*format, a, a);
        Bytes block = a;
        EXPECT_EQ(PK_Success, PK_MergeDVCPRO(block.data(), b.data(), block.data(), format->format, kQuality));
        EXPECT_EQ(expected, block);
        block = b;
        EXPECT_EQ(PK_Success, PK_MergeDVCPRO(a.data(), block.data(), block.data(), format->format, kQuality));
        EXPECT_EQ(expected, block);
        block = a;
        EXPECT_EQ(PK_Success,
                  PK_MergeDVCPRO(block.data(), block.data(), block.data(), format->format, kQuality));
        EXPECT_EQ(twice, block);
        block = a;
        block.insert(block.begin(), 12345, 0);
        EXPECT_EQ(PK_Success,
                  PK_MergeDVCPRO(block.data() + 12345, b.data(), block.data(), format->format, kQuality));
        EXPECT_TRUE(std::equal(expected.begin(), expected.end(), block.begin()));
    }
}

TEST(MergeDV, FramesEndAtTheirLastByte) {
    for (const Format& format : kFormats) {
        SCOPED_TRACE(PK_PixelFormatName(format.format));
        const Bytes a = Grey(format, 60), expected = Merged(format, a, a);
        const PKTest::GuardedRows source(a.size(), PKTest::Guard::kAfter),
            result(a.size(), PKTest::Guard::kAfter);
        std::copy(a.begin(), a.end(), source.Bytes());
        EXPECT_EQ(PK_Success,
                  PK_MergeDVCPRO(source.Bytes(), source.Bytes(), result.Bytes(), format.format, kQuality));
        EXPECT_TRUE(std::equal(expected.begin(), expected.end(), result.Bytes()));
    }
}

/// Calls that return this and write nothing.
void ExpectRefusal(PK_Result expected, const std::function<PK_Result(void* dst)>& call) {
    Bytes dst(576000, 0x5a);
    const Bytes before = dst;
    EXPECT_EQ(expected, call(dst.data()));
    EXPECT_EQ(before, dst);
}

TEST(MergeDV, OtherFormatsAreRefusedFirst) {
    const Bytes frame(576000);
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_YUV_420_MPEG2_FRAME, 0x01000820u,
          0x01000a21u, 0x09000821u, 0x00000821u, 0xff000821u}) {
        ExpectRefusal(PK_ErrBadSrcFormat, [&](void* dst) {
            return PK_MergeDVCPRO(frame.data(), frame.data(), dst, format, kQuality);
        });
        EXPECT_EQ(PK_ErrBadSrcFormat, PK_MergeDVCPRO(nullptr, nullptr, nullptr, format, kQuality));
    }
}

TEST(MergeDV, NullPointersAreRefused) {
    for (const Format& format : kFormats) {
        const Bytes frame = Grey(format, 60);
        for (const auto& [a, b] :
             {std::pair<const void*, const void*>{nullptr, frame.data()}, {frame.data(), nullptr}})
            ExpectRefusal(PK_ErrFailed, [&, first = a, second = b](void* dst) {
                return PK_MergeDVCPRO(first, second, dst, format.format, kQuality);
            });
        EXPECT_EQ(PK_ErrFailed, PK_MergeDVCPRO(frame.data(), frame.data(), nullptr, format.format, kQuality));
    }
    for (const int32_t frameBytes : {120000, 144000, 5}) {
        const Bytes frame(144000);
        ExpectRefusal(PK_ErrFailed,
                      [&](void* dst) { return PK_MergeDV(nullptr, frame.data(), dst, frameBytes, 4); });
        ExpectRefusal(PK_ErrFailed,
                      [&](void* dst) { return PK_MergeDV(frame.data(), nullptr, dst, frameBytes, 4); });
        EXPECT_EQ(PK_ErrFailed, PK_MergeDV(frame.data(), frame.data(), nullptr, frameBytes, 4));
    }
}

TEST(MergeDV, AFrameOfDV25WithoutItsHeaderIsRefused) {
    for (const Format* const format : {&kNTSC25, &kPAL25}) {
        const Bytes good = Grey(*format, 60);
        Bytes bad = good;
        bad[5] ^= 1; // AP1 is not as the others
        for (const auto& [a, b] : {std::pair<const Bytes*, const Bytes*>{&good, &bad}, {&bad, &good}})
            ExpectRefusal(PK_ErrBadDVFormat, [&, first = a, second = b](void* dst) {
                return PK_MergeDVCPRO(first->data(), second->data(), dst, format->format, kQuality);
            });
    }
}

} // namespace
