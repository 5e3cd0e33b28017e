// The bundled encoder of DV25 by its own functions.

#include "mc_enc_dv/mc_enc_dv.h"

#include <PixelKiln/PixelKiln.h>

#include "support/GuardedRows.h"
#include "support/Random.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <utility>
#include <vector>

namespace {

using namespace mc_enc_dv;

using Bytes = std::vector<uint8_t>;

TEST(DVEncoder, PixelKindsAreTheirLettersFromTheLowestByteUp) {
    EXPECT_EQ(kYUYV, 0x76597559u); // v Y u Y
    EXPECT_EQ(kUYVY, 0x79567955u);
    EXPECT_EQ(kVUYA, 0x41595556u);
    EXPECT_EQ(kBGRA, 0x41524742u);
}

struct Job {
    int32_t width = 720, height = 480, rowBytes = 0, dstBytes = 120000, flags = kAlways;
    uint32_t fourcc = kYUYV;
};

Bytes Encoded(const uint8_t* pixels, const Job& job) {
    Bytes frame(static_cast<size_t>(job.dstBytes), 0x5a);
    const Handle encoder = Open();
    EXPECT_NE(encoder, nullptr);
    EXPECT_EQ(Encode(encoder, pixels, job.rowBytes, frame.data(), job.dstBytes, job.width, job.height, 0,
                     job.flags, job.fourcc, 0, 0),
              job.dstBytes);
    Close(encoder);
    return frame;
}

/// Smooth colours, which survive the way from four channels to pairs.
Bytes SmoothVUYA(int32_t width, int32_t height) {
    Bytes pixels;
    for (int32_t y = 0; y < height; ++y)
        for (int32_t x = 0; x < width; ++x)
            for (const int32_t value :
                 {100 + 50 * y / height, 90 + 60 * (x / 40) * 40 / width, 40 + 150 * x / width, 255})
                pixels.push_back(static_cast<uint8_t>(value));
    return pixels;
}

Bytes Converted(const Bytes& pixels, PK_PixelFormat from, PK_PixelFormat to, int32_t width, int32_t height) {
    const int32_t rowBytes = PK_PixelFormatPackedRowBytes(to, width);
    Bytes result(static_cast<size_t>(rowBytes) * static_cast<size_t>(height));
    EXPECT_EQ(PK_Convert(pixels.data(), PK_PixelFormatPackedRowBytes(from, width), from, result.data(),
                         rowBytes, to, width, height, 4),
              PK_Success);
    return result;
}

TEST(DVEncoder, AllPixelKindsGiveWhatTheirConversionToPairsGives) {
    constexpr PK_PixelFormat kVUYA8 = PK_PixelFormat_VUYA_4444_8u, kBGRA8 = PK_PixelFormat_BGRA_4444_8u;
    for (const int32_t part : {1, 2}) {
        const int32_t width = 720 / part, height = 480 / part;
        const Bytes vuya = SmoothVUYA(width, height); // stored bottom-up
        for (const PK_PixelFormat format : {kVUYA8, kBGRA8}) {
            const Bytes pixels = Converted(vuya, kVUYA8, format, width, height);
            const Bytes yuyv = Converted(pixels, format, PK_PixelFormat_YUYV_422_8u, width, height);
            const Bytes uyvy = Converted(pixels, format, PK_PixelFormat_UYVY_422_8u, width, height);
            Job job = {.width = width, .height = height, .rowBytes = 2 * width};
            const Bytes frame = Encoded(yuyv.data(), job);
            job.fourcc = kUYVY;
            EXPECT_EQ(Encoded(uyvy.data(), job), frame);
            job = {.width = width,
                   .height = height,
                   .rowBytes = -4 * width,
                   .flags = kAlways | kHasAlpha,
                   .fourcc = format == kVUYA8 ? kVUYA : kBGRA};
            EXPECT_TRUE(Encoded(pixels.data() + 4 * width * (height - 1), job) == frame)
                << PK_PixelFormatName(format) << " " << width;
        }
    }
}

TEST(DVEncoder, AlphaCountsWhereAFlagSaysSo) {
    Bytes pixels = SmoothVUYA(720, 480);
    for (size_t i = 3; i < pixels.size(); i += 4) pixels[i] = 0;
    Job job = {.rowBytes = 2880, .fourcc = kVUYA};
    const Bytes opaque = Encoded(pixels.data(), job);
    job.flags |= kHasAlpha;
    const Bytes transparent = Encoded(pixels.data(), job);
    EXPECT_NE(opaque, transparent);
    Bytes black(120000);
    ASSERT_EQ(PK_FillWithOpaqueBlack(black.data(), 0, 720, 480, PK_PixelFormat_NTSCDV25), PK_Success);
    EXPECT_EQ(transparent, black);
}

TEST(DVEncoder, TellsTheFourFormatsBySizeAndFlag) {
    const Bytes pixels(size_t{1440} * 576, 128);
    Job job = {.rowBytes = 1440};
    const auto header = [&] {
        const Bytes frame = Encoded(pixels.data(), job);
        return std::pair<int, int>(frame[3], frame[4]);
    };
    EXPECT_EQ(header(), std::pair(0x3f, 0xf9));
    job.flags |= kDVCPRO;
    EXPECT_EQ(header(), std::pair(0x3f, 0xf9));
    job.height = 576;
    job.dstBytes = 144000;
    EXPECT_EQ(header(), std::pair(0xbf, 0xf9));
    job.flags = kAlways;
    EXPECT_EQ(header(), std::pair(0xbf, 0xf8));
}

TEST(DVEncoder, RefusesWithoutAWrite) {
    const Bytes pixels(size_t{1440} * 576, 128), untouched(144000, 0x5a);
    Bytes frame = untouched;
    const auto refuses = [&](const Job& job, bool hasPixels = true) {
        return Encode(Open(), hasPixels ? pixels.data() : nullptr, 1440, frame.data(), job.dstBytes,
                      job.width, job.height, 0, job.flags, job.fourcc, 0, 0) == 0 &&
               frame == untouched;
    };
    EXPECT_TRUE(refuses({.height = 481}));
    EXPECT_TRUE(refuses({.width = 360}));
    EXPECT_TRUE(refuses({.height = 240}));
    EXPECT_TRUE(refuses({.dstBytes = 119999}));
    EXPECT_TRUE(refuses({.dstBytes = 144000}));
    EXPECT_TRUE(refuses({.fourcc = FourCC("yuyv")}));
    EXPECT_TRUE(refuses({}, false));
    EXPECT_EQ(Encode(Open(), pixels.data(), 1440, nullptr, 120000, 720, 480, 0, kAlways, kYUYV, 0, 0), 0);
}

TEST(DVEncoder, ReadsNothingBesideSmallPictures) {
    for (const PKTest::Guard guard : {PKTest::Guard::kBefore, PKTest::Guard::kAfter}) {
        const PKTest::GuardedRows pixels(size_t{720} * 288, guard);
        PKTest::Random random(3);
        random.Fill(pixels.Bytes(), pixels.Size());
        Encoded(pixels.Bytes(), {.width = 360, .height = 288, .rowBytes = 720, .dstBytes = 144000});
        Encoded(pixels.Bytes() + 720 * 287,
                {.width = 360, .height = 288, .rowBytes = -720, .dstBytes = 144000});
    }
}

} // namespace
