// PK_Convert as its caller sees it: copies, arguments that are refused, the floating-point mode.

#include <PixelKiln/Convert.h>

#include "convert/RasterFormats.h"
#include "support/GuardedImage.h"
#include "support/Random.h"

#include <PixelKiln/Buffers.h>

#include <gtest/gtest.h>

#include <cstring>
#include <vector>
#include <xmmintrin.h>

namespace {

using PKTest::Guard;
using PKTest::GuardedImage;
using PKTest::GuardedRows;
using PKTest::Random;

constexpr int32_t kQuality = 2;
constexpr uint8_t kFill = 0xa5;
constexpr PK_PixelFormat kUnknownStream = 0x0d000821;

/// Copies with these gaps between rows, the sign of a gap being that of the row bytes.
void ExpectCopy(PK_PixelFormat format, int32_t width, int32_t sourceSign, int32_t sourceGap,
                int32_t destinationSign, int32_t destinationGap, Guard guard) {
    constexpr int32_t height = 3;
    Random random(format + static_cast<uint32_t>(width));
    const int32_t length = PK_PixelFormatPackedRowBytes(format, width);
    const auto shape = [=](int32_t sign, int32_t gap) {
        return PKTest::ImageShape{static_cast<size_t>(length), height, static_cast<size_t>(gap), sign < 0,
                                  guard};
    };
    const GuardedImage source(shape(sourceSign, sourceGap), random);
    const GuardedImage destination(shape(destinationSign, destinationGap), random);

    SCOPED_TRACE(testing::Message() << std::hex << format << std::dec << " width " << width << " row bytes "
                                    << source.RowBytes() << " to " << destination.RowBytes() << " seed "
                                    << random.Seed());
    ASSERT_EQ(PK_Convert(source.Pixels(), source.RowBytes(), format, destination.Pixels(),
                         destination.RowBytes(), format, width, height, kQuality),
              PK_Success);
    destination.ExpectRows(source.Rows());
}

TEST(ConvertSameFormat, CopiesThePixelsOfEveryFormatAndNoByteMore) {
    for (const PK_PixelFormat format : PK::kRasterFormats) {
        for (const int32_t width : {1, 2, 3, 5, 6, 7, 13, 64}) {
            for (const Guard guard : {Guard::kBefore, Guard::kAfter}) {
                for (const int32_t sourceSign : {1, -1}) {
                    for (const int32_t destinationSign : {1, -1}) {
                        ExpectCopy(format, width, sourceSign, 0, destinationSign, 0, guard);
                        ExpectCopy(format, width, sourceSign, 16, destinationSign, 16, guard);
                        ExpectCopy(format, width, sourceSign, 0, destinationSign, 5, guard);
                    }
                }
            }
        }
    }
}

TEST(ConvertSameFormat, LeavesThePaddingOfEquallyPaddedRows) {
    std::vector<uint8_t> source(2 * 64, 1);
    std::vector<uint8_t> destination(2 * 64, kFill);
    ASSERT_EQ(PK_Convert(source.data(), 64, PK_PixelFormat_BGRA_4444_8u, destination.data(), 64,
                         PK_PixelFormat_BGRA_4444_8u, 15, 2, kQuality),
              PK_Success);
    for (size_t i = 0; i < destination.size(); ++i) {
        EXPECT_EQ(destination[i], i % 64 < 60 ? 1 : kFill) << i;
    }
}

TEST(ConvertSameFormat, FlipsBetweenRowBytesOfDifferentSign) {
    const uint8_t source[3][4] = {{1, 1, 1, 1}, {2, 2, 2, 2}, {3, 3, 3, 3}};
    uint8_t destination[3][4] = {};
    ASSERT_EQ(PK_Convert(source[2], -4, PK_PixelFormat_BGRA_4444_8u, destination[0], 4,
                         PK_PixelFormat_BGRA_4444_8u, 1, 3, kQuality),
              PK_Success);
    EXPECT_EQ(destination[0][0], 3);
    EXPECT_EQ(destination[1][0], 2);
    EXPECT_EQ(destination[2][0], 1);
}

/// Copies a block that no row bytes describe, and expects exactly this many bytes of it.
void ExpectBlockCopy(PK_PixelFormat format, int32_t rowBytes, int32_t width, int32_t height, size_t bytes) {
    Random random(format);
    for (const Guard guard : {Guard::kBefore, Guard::kAfter}) {
        const GuardedRows source(bytes, guard);
        const GuardedRows destination(bytes, guard);
        random.Fill(source.Bytes(), bytes);
        ASSERT_EQ(PK_Convert(source.Bytes(), rowBytes, format, destination.Bytes(), rowBytes, format, width,
                             height, kQuality),
                  PK_Success);
        EXPECT_EQ(std::memcmp(source.Bytes(), destination.Bytes(), bytes), 0);
    }
}

TEST(ConvertSameFormat, CopiesADVFrameWhateverTheSize) {
    ExpectBlockCopy(PK_PixelFormat_NTSCDV25, 0, 720, 480, 120000);
    ExpectBlockCopy(PK_PixelFormat_PALDV25, 17, 0, 0, 144000);
    ExpectBlockCopy(PK_PixelFormat_PAL_DV100_1080i, 0, -1, -1, 576000);
}

TEST(ConvertSameFormat, CopiesThePlanesOf420) {
    // Rows of Y and of U and V padded to 128 bytes, 32 rows: 128 x 32 and twice 128 x 16.
    ExpectBlockCopy(PK_PixelFormat_YUV_420_MPEG2_FRAME, 0, 16, 16, 8192);
    ExpectBlockCopy(PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709, 0, 720, 480, (768 + 384) * 480);
}

TEST(ConvertSameFormat, CopiesUnknownStreamsByTheirRowBytes) {
    ExpectBlockCopy(kUnknownStream, 1000, 720, 480, 1000);

    uint8_t source[8] = {1, 2, 3, 4, 5, 6, 7, 8};
    uint8_t destination[8] = {};
    const auto copy = [&](int32_t sourceRowBytes, int32_t destinationRowBytes) {
        return PK_Convert(source, sourceRowBytes, kUnknownStream, destination, destinationRowBytes,
                          kUnknownStream, 1, 1, kQuality);
    };
    EXPECT_EQ(copy(8, 7), PK_ErrSizeMismatch);
    EXPECT_EQ(copy(-8, -8), PK_ErrFailed);
    EXPECT_EQ(copy(0, 0), PK_Success);
    EXPECT_EQ(destination[0], 0);
}

/// A call whose arguments all but the named ones are sound; the images are far too small for anything to be
/// done.
struct Call {
    PK_PixelFormat sourceFormat = PK_PixelFormat_BGRA_4444_8u;
    PK_PixelFormat destinationFormat = PK_PixelFormat_BGRP_4444_8u;
    int32_t width = 1;
    int32_t height = 1;
    bool sourceIsNull = false;
    bool destinationIsNull = false;
    int32_t rowBytes = 4;
};

/// The result of a call, which must not have written anything.
PK_Result Refuse(const Call& call) {
    const uint8_t source[4] = {1, 2, 3, 4};
    uint8_t destination[4] = {kFill, kFill, kFill, kFill};
    const PK_Result result =
        PK_Convert(call.sourceIsNull ? nullptr : source, call.rowBytes, call.sourceFormat,
                   call.destinationIsNull ? nullptr : destination, call.rowBytes, call.destinationFormat,
                   call.width, call.height, kQuality);
    for (const uint8_t byte : destination) EXPECT_EQ(byte, kFill);
    return result;
}

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
constexpr PK_PixelFormat kBGRP = PK_PixelFormat_BGRP_4444_8u;

TEST(ConvertArguments, FormatsOutsideTheCatalogueAreRefused) {
    // Nothing, 10-bit YUV in 4:4:4, a reserved bit, linear 8-bit, full-range YUV, a matrix that no format
    // has.
    for (const PK_PixelFormat format :
         {PK_PixelFormat_Invalid, 0x841u, 0x2004u, 0x800004u, 0x6u, 0x5u, 0xc05u}) {
        EXPECT_EQ(Refuse({.sourceFormat = format}), PK_ErrBadSrcFormat) << std::hex << format;
        EXPECT_EQ(Refuse({.destinationFormat = format}), PK_ErrBadDstFormat) << std::hex << format;
        EXPECT_EQ(Refuse({.sourceFormat = format, .destinationFormat = format}), PK_ErrBadSrcFormat);
        EXPECT_EQ(Refuse({.sourceFormat = format, .destinationFormat = PK_PixelFormat_PALDV50}),
                  PK_ErrBadSrcFormat);
        EXPECT_EQ(Refuse({.sourceFormat = PK_PixelFormat_PALDV50, .destinationFormat = format}),
                  PK_ErrBadDstFormat);
        EXPECT_EQ(Refuse({.sourceFormat = format, .height = 0}), PK_ErrBadSrcFormat);
    }
}

TEST(ConvertArguments, EmptyRasterImagesAreDoneAtOnce) {
    for (const PK_PixelFormat destination : {kBGRA, kBGRP}) {
        EXPECT_EQ(Refuse({.destinationFormat = destination, .height = 0}), PK_Success);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .height = -1}), PK_Success);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .width = 0}), PK_Success);
        EXPECT_EQ(Refuse({.destinationFormat = destination,
                          .width = 0,
                          .sourceIsNull = true,
                          .destinationIsNull = true}),
                  PK_Success);
    }
}

TEST(ConvertArguments, ImpossibleWidthsAndNullPointersAreRefused) {
    for (const PK_PixelFormat destination : {kBGRA, kBGRP}) {
        EXPECT_EQ(Refuse({.destinationFormat = destination, .width = -1}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .width = INT32_MIN}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .width = INT32_MAX / 16 + 1}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .width = INT32_MAX}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .sourceIsNull = true}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = destination, .destinationIsNull = true}), PK_ErrFailed);
    }
    for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV50,
                                        PK_PixelFormat_NTSC_DV100_720p, PK_PixelFormat_YUV_420_MPEG2_FRAME}) {
        EXPECT_EQ(Refuse({.sourceFormat = stream, .destinationFormat = stream, .sourceIsNull = true}),
                  PK_ErrFailed);
        for (const PK_PixelFormat destination : {kBGRA, PK_PixelFormat_PAL_DV100_1080i, kUnknownStream})
            for (const int32_t width : {-1, -720, INT32_MIN})
                EXPECT_EQ(Refuse({.sourceFormat = stream, .destinationFormat = destination, .width = width}),
                          PK_ErrFailed)
                    << PK_PixelFormatName(stream) << " of width " << width;
        EXPECT_EQ(Refuse({.sourceFormat = stream, .destinationIsNull = true}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = stream, .sourceIsNull = true}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = stream, .width = -1}), PK_ErrFailed);
        EXPECT_EQ(Refuse({.destinationFormat = stream, .height = -1}), PK_ErrFailed);
    }
    EXPECT_EQ(Refuse({.sourceFormat = kUnknownStream, .width = -1}), PK_ErrFailed);
    EXPECT_EQ(Refuse({.sourceFormat = PK_PixelFormat_YUV_420_MPEG2_FRAME,
                      .destinationFormat = PK_PixelFormat_YUV_420_MPEG2_FRAME,
                      .width = -1}),
              PK_ErrFailed);
}

TEST(ConvertArguments, PlanesWithoutPlacesIn32BitsAreRefused) {
    const PK_PixelFormat planes = PK_PixelFormat_YUV_420_MPEG2_FRAME;
    for (const PK_PixelFormat other : {kBGRA, PK_PixelFormat_YUV_420_MPEG2_FRAME_709}) {
        EXPECT_EQ(
            Refuse({.sourceFormat = planes, .destinationFormat = other, .width = 64, .height = 1 << 24}),
            PK_ErrFailed);
        EXPECT_EQ(
            Refuse({.sourceFormat = other, .destinationFormat = planes, .width = 64, .height = 1 << 24}),
            PK_ErrFailed);
    }
}

TEST(ConvertArguments, RowBytesOfTheLowestValueAreNegatedSafely) {
    // One row: the row bytes are negated for the way from the bottom up, but lead nowhere.
    const uint8_t source[4] = {1, 2, 3, 4};
    uint8_t destination[4] = {};
    EXPECT_EQ(PK_Convert(source, INT32_MIN, kBGRA, destination, INT32_MIN, kBGRA, 1, 1, kQuality),
              PK_Success);
    EXPECT_EQ(std::memcmp(source, destination, 4), 0);
}

TEST(ConvertStreams, ASizeThatTheDecoderDoesNotGiveIsAMismatch) {
    EXPECT_EQ(Refuse({.sourceFormat = PK_PixelFormat_NTSCDV50, .width = 719, .height = 480}),
              PK_ErrSizeMismatch);
    EXPECT_EQ(Refuse({.sourceFormat = PK_PixelFormat_NTSC_DV100_1080i, .width = 1920, .height = 1080}),
              PK_ErrSizeMismatch);
    EXPECT_EQ(Refuse({.sourceFormat = PK_PixelFormat_PALDV50,
                      .destinationFormat = PK_PixelFormat_NTSCDV50,
                      .width = 720,
                      .height = 480}),
              PK_ErrSizeMismatch);
}

TEST(ConvertStreams, UnknownKindsAreNotSupported) {
    EXPECT_EQ(Refuse({.sourceFormat = kUnknownStream}), PK_ErrNotSupported);
    EXPECT_EQ(Refuse({.destinationFormat = kUnknownStream}), PK_ErrNotSupported);
    EXPECT_EQ(Refuse({.sourceFormat = kUnknownStream, .destinationFormat = 0xff000004u}), PK_ErrNotSupported);
}

/// Sets MXCSR for the length of a scope.
class MXCSR {
public:
    explicit MXCSR(uint32_t value) : fSaved(_mm_getcsr()) { _mm_setcsr(value); }
    ~MXCSR() { _mm_setcsr(fSaved); }
    MXCSR(const MXCSR&) = delete;
    MXCSR& operator=(const MXCSR&) = delete;

private:
    uint32_t fSaved;
};

constexpr uint32_t kAllMasked = 0x1f80;
constexpr uint32_t kRoundUp = _MM_ROUND_UP;

/// MXCSR as the call leaves it.
uint32_t MXCSRAfter(uint32_t before, const Call& call) {
    const MXCSR scope(before);
    Refuse(call);
    return _mm_getcsr();
}

TEST(ConvertMode, MXCSRIsRestoredOnEveryPath) {
    const Call calls[] = {
        {.destinationFormat = kBGRA, .height = 0},
        {.height = 0},
        {.sourceIsNull = true},
        {.width = -1},
        {.sourceFormat = PK_PixelFormat_Invalid},
        {.destinationFormat = PK_PixelFormat_Invalid},
        {.sourceFormat = kUnknownStream},
        {.destinationFormat = kUnknownStream},
        {.sourceFormat = PK_PixelFormat_NTSCDV50, .width = 719},
        {.sourceFormat = kUnknownStream, .destinationFormat = kUnknownStream, .rowBytes = -1},
    };
    for (const uint32_t before : {kAllMasked, kAllMasked | kRoundUp, kAllMasked | 0x8040u}) {
        for (const Call& call : calls) EXPECT_EQ(MXCSRAfter(before, call), before);
    }
}

TEST(ConvertMode, MXCSRIsRestoredAfterPixelsWereConverted) {
    const float source[4] = {0.1f, 0.2f, 0.3f, 0.7f};
    float destination[4];
    const uint32_t before = kAllMasked | kRoundUp;
    const MXCSR scope(before);
    const PK_Result result = PK_Convert(source, 16, PK_PixelFormat_BGRA_4444_32f, destination, 16,
                                        PK_PixelFormat_BGRP_4444_32f, 1, 1, kQuality);
    EXPECT_EQ(_mm_getcsr(), before);
    EXPECT_EQ(result, PK_Success);
}

TEST(ConvertMode, DenormalResultsBecomeZero) {
    const float source[4] = {1e-30f, -1e-30f, 1.0f, 1e-10f};
    float destination[4];
    const MXCSR scope(kAllMasked);
    ASSERT_EQ(PK_Convert(source, 16, PK_PixelFormat_BGRA_4444_32f, destination, 16,
                         PK_PixelFormat_BGRP_4444_32f, 1, 1, kQuality),
              PK_Success);
    EXPECT_EQ(destination[0], 0.0f);
    EXPECT_EQ(destination[1], 0.0f);
    EXPECT_EQ(destination[2], 1e-10f);
    EXPECT_EQ(destination[3], 1e-10f);
}

} // namespace
