// Fields, sizes and origins of pixel formats.

#include "frame/PixelFormat.h"

#include "support/FlagScope.h"

#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>
#include <limits>

namespace {

constexpr int32_t kLargest = std::numeric_limits<int32_t>::max();

struct SizeCase {
    PK_PixelFormat format;
    int32_t width;
    int32_t rowBytes;
    int32_t packedRowBytes;
};

// Counted by hand.
constexpr SizeCase kSizes[] = {
    {0x805, 0, 0, 0},
    {0x805, 1, 64, 4},
    {0x805, 16, 64, 64},
    {0x805, 17, 128, 68},
    {0x805, 1920, 7680, 7680},
    {0x4, 719, 2880, 2876},
    {0x84, 1, 64, 8},
    {0x84, 9, 128, 72},
    {0x104, 1, 64, 16},
    {0x104, 5, 128, 80},
    {0x10a, 1920, 30720, 30720},
    {0x811, 0, 0, 0},
    {0x811, 1, 16, 4},
    {0x811, 7, 16, 16},
    {0x811, 8, 16, 16},
    {0x811, 9, 32, 20},
    {0x1a11, 1279, 2560, 2560},
    {0x911, 1, 16, 16},
    {0x911, 3, 32, 32},
    {0x911, 1920, 15360, 15360},
    {0x851, 0, 0, 0},
    {0x851, 1, 128, 16},
    {0x851, 6, 128, 16},
    {0x851, 7, 128, 32},
    {0x851, 48, 128, 128},
    {0x851, 49, 256, 144},
    {0xa51, 1920, 5120, 5120},
    {0x40, 1, 64, 4},
    {0x40, 17, 128, 68},
    // Numbers without a name go by their bits.
    {0x0, 33, 0, 0},      // but Invalid, which has no size
    {0x801, 33, 128, 66}, //
    {0x100, 1, 64, 8},    // float without alpha
    {0x100, 9, 128, 72},  //
    {0x80, 9, 128, 72},   // 15-bit without alpha
    {0x44, 17, 128, 68},  // 10-bit RGB with alpha
    {0x841, 100, 0, 0},   // 10-bit YUV but V210
    {0x845, 100, 0, 0},   //
    {0xc0, 100, 0, 0},    // unknown depths
    {0x144, 100, 0, 0},   //
    {0x1c4, 100, 0, 0},   //
    {0x50, 3, 16, 16},    // 10-bit RGB 4:2:2
    {0x50, 7, 32, 32},    //
    {0x90, 3, 32, 32},    // 15-bit 4:2:2
    {0xd0, 3, 0, 32},     // unknown depth 4:2:2
    {0x1851, 7, 0, 32},   // V210 in YUYV order is not V210
    {0x20, 33, 128, 68},  // DV structure without a stream
    {0x824, 33, 128, 68}, // its alpha kind does not count
    {0x124, 9, 128, 80},  //
    // Streams have no rows, and packed rows go by their bits.
    {0x01000821, 720, 0, 1440},
    {0x09000831, 719, 0, 1440},
    {0x01000004, 16, 0, 64},
    {0x01000851, 7, 0, 32},
};

} // namespace

TEST(PixelFormat, PredicatesReadTheFields) {
    using namespace PK;
    EXPECT_TRUE(IsYUV(0x805));
    EXPECT_FALSE(IsYUV(0x4));

    for (const PK_PixelFormat packed : {0x805u, 0x4u, 0x8u, 0xcu, 0x84u, 0x106u, 0x1108u})
        EXPECT_TRUE(IsPacked4444(packed)) << packed;
    for (const PK_PixelFormat other : {0x0u, 0x40u, 0x811u, 0x851u, 0x814u, 0x01000821u, 0x09000831u})
        EXPECT_FALSE(IsPacked4444(other)) << other;

    EXPECT_TRUE(Is422(0x811));
    EXPECT_TRUE(Is422(0x851));
    EXPECT_FALSE(Is422(0x805));
    EXPECT_FALSE(Is422(0x821));
    EXPECT_FALSE(Is422(0x831));

    EXPECT_TRUE(IsStream(0x01000000));
    EXPECT_TRUE(IsStream(0xff000000));
    EXPECT_FALSE(IsStream(0x00ffffff));

    for (const PK_PixelFormat planar : {0x09000831u, 0x0a000031u, 0x0b000a31u, 0x0c000231u})
        EXPECT_TRUE(Is420Planar(planar)) << planar;
    for (const PK_PixelFormat other : {0x08000831u, 0x0d000831u, 0x09000830u, 0x09000821u, 0x00000831u})
        EXPECT_FALSE(Is420Planar(other)) << other;

    EXPECT_TRUE(IsV210(0x851));
    EXPECT_TRUE(IsV210(0xa51));
    for (const PK_PixelFormat other : {0x51u, 0xc51u, 0x1851u, 0x811u, 0x01000851u})
        EXPECT_FALSE(IsV210(other)) << other;

    EXPECT_TRUE(HasNoAlphaMeaning(0x0));
    EXPECT_TRUE(HasNoAlphaMeaning(0xc));
    EXPECT_TRUE(HasNoAlphaMeaning(0x811));
    EXPECT_FALSE(HasNoAlphaMeaning(0x4));
    EXPECT_FALSE(HasNoAlphaMeaning(0x8));
}

TEST(PixelFormat, RowsAreCountedAndPadded) {
    for (const SizeCase& row : kSizes) {
        SCOPED_TRACE(testing::Message()
                     << std::hex << "0x" << row.format << std::dec << " width " << row.width);
        EXPECT_EQ(PK_PixelFormatRowBytes(row.format, row.width), row.rowBytes);
        EXPECT_EQ(PK_PixelFormatPackedRowBytes(row.format, row.width), row.packedRowBytes);
        if (PK::IsStream(row.format)) continue;
        EXPECT_EQ(PK_PixelFormatSize(row.format, row.width, 1), row.rowBytes);
        EXPECT_EQ(PK_PixelFormatSize(row.format, row.width, 3), int64_t{3} * row.rowBytes);
    }
}

TEST(PixelFormat, RowBytesWrapIn32Bits) {
    EXPECT_EQ(PK_PixelFormatRowBytes(0x104, 0x08000000), std::numeric_limits<int32_t>::min()); // 2^31
    EXPECT_EQ(PK_PixelFormatRowBytes(0x104, 0x10000001), 64);                                  // 2^32 + 16
    EXPECT_EQ(PK_PixelFormatRowBytes(0x4, kLargest), 0);     // 2^33 - 4 is -4, padded 0
    EXPECT_EQ(PK_PixelFormatRowBytes(0x811, -9), -16);       // -18, padded towards plus
    EXPECT_EQ(PK_PixelFormatRowBytes(0x4, -17), -64);        // -68
    EXPECT_EQ(PK_PixelFormatRowBytes(0x851, -1), 128 - 128); // (-1 + 5) / 6 is 0
    // 2^31 - 1 + 5 wraps to -2147483644; a sixth is -357913940; times 16 wraps to -1431655744; 127 more, cut
    // to a multiple of 128, is -1431655680
    EXPECT_EQ(PK_PixelFormatRowBytes(0x851, kLargest), -1431655680);
    EXPECT_EQ(PK_PixelFormatPackedRowBytes(0x851, kLargest), -1431655744);
    EXPECT_EQ(PK_PixelFormatPackedRowBytes(0x104, 0x08000000), std::numeric_limits<int32_t>::min());
    EXPECT_EQ(PK_PixelFormatPackedRowBytes(0x811, kLargest), 0); // -2^31 / 2 x 4 is -2^32
}

TEST(PixelFormat, RasterSizesWrapIn32BitsAndAreSignExtended) {
    EXPECT_EQ(PK_PixelFormatSize(0x4, 16384, 32767), 2147418112);
    EXPECT_EQ(PK_PixelFormatSize(0x4, 16384, 32768), -2147483648LL);
    EXPECT_EQ(PK_PixelFormatSize(0x4, 16384, 65536), 0);
    EXPECT_EQ(PK_PixelFormatSize(0x4, 16384, 65537), 65536);
    EXPECT_EQ(PK_PixelFormatSize(0x4, 16, -2), -128);
}

TEST(PixelFormat, DVFramesHaveTheirSizeWhateverTheArguments) {
    constexpr int64_t kFrameBytes[] = {120000, 144000, 240000, 288000, 480000, 576000, 240000, 288000};
    for (uint32_t kind = 1; kind <= 8; ++kind) {
        for (const int32_t size : {0, 1, 720, kLargest, -1})
            EXPECT_EQ(PK_PixelFormatSize(kind << 24 | 0x821, size, size), kFrameBytes[kind - 1]) << kind;
    }
}

TEST(PixelFormat, PlanarSizesAreTheSumOfThePlanes) {
    for (uint32_t kind = 9; kind <= 12; ++kind) {
        const PK_PixelFormat format = kind << 24 | 0x831;
        EXPECT_EQ(PK_PixelFormatSize(format, 0, 32), 0);
        EXPECT_EQ(PK_PixelFormatSize(format, 1, 1), 128 * 32); // no chroma: half of width 1 is 0
        EXPECT_EQ(PK_PixelFormatSize(format, 2, 1), 256 * 32);
        EXPECT_EQ(PK_PixelFormatSize(format, 720, 480), (768 + 384) * 480);
        EXPECT_EQ(PK_PixelFormatSize(format, 1920, 1080), (1920 + 1024) * 1088);
        EXPECT_EQ(PK_PixelFormatSize(format, 65536, 65536), int64_t{98304} * 65536);
        EXPECT_EQ(PK_PixelFormatSize(format, kLargest, 32), 128LL * (16777216 + 8388608) * 32);
    }
    for (const uint32_t kind : {13u, 14u, 128u, 255u})
        EXPECT_EQ(PK_PixelFormatSize(kind << 24 | 0x831, 64, 64), 0);
}

TEST(PixelFormat, OriginGoesByTheLayout) {
    for (const PK_PixelFormat bottomUp : {0x4u, 0x8cu, 0x106u, 0x805u, 0x905u, 0x1104u}) {
        EXPECT_FALSE(PK_IsOriginTopLeft(bottomUp)) << bottomUp;
        EXPECT_TRUE(PK_IsOriginBottomLeft(bottomUp)) << bottomUp;
    }
    for (const PK_PixelFormat topDown : {0x811u, 0x851u, 0x40u, 0x911u, 0x01000821u, 0x09000831u, 0x0u}) {
        EXPECT_TRUE(PK_IsOriginTopLeft(topDown)) << topDown;
        EXPECT_FALSE(PK_IsOriginBottomLeft(topDown)) << topDown;
    }
}

TEST(PixelFormat, SwitchTenPutsEveryOriginAtTheTop) {
    const PKTest::FlagScope flags;
    ASSERT_EQ(PK_SetDebugFlag(10, 1), PK_Success);
    for (const PK_PixelFormat format : {0x4u, 0x805u, 0x811u, 0x01000821u}) {
        EXPECT_TRUE(PK_IsOriginTopLeft(format)) << format;
        EXPECT_FALSE(PK_IsOriginBottomLeft(format)) << format;
    }
    ASSERT_EQ(PK_SetDebugFlag(10, 0), PK_Success);
    EXPECT_FALSE(PK_IsOriginTopLeft(0x4));
}
