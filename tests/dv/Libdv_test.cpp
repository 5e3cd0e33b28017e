// libdv's reading of DV25 as a second opinion on ours. It rounds more often on its way, and its chroma goes another.

#include <PixelKiln/PixelKiln.h>

#include "support/DVFrames.h"

#include <gtest/gtest.h>
#include <libdv/dv.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <vector>

namespace {

constexpr int32_t kWidth = 720, kRowBytes = 2 * kWidth;

std::vector<uint8_t> AsLibdvReads(const std::vector<uint8_t>& frame, int32_t height) {
    constexpr int kNoClamp = 0;
    const std::unique_ptr<dv_decoder_t, decltype(&dv_decoder_free)> decoder(
        dv_decoder_new(0, kNoClamp, kNoClamp), dv_decoder_free);
    decoder->quality = DV_QUALITY_BEST;
    std::vector<uint8_t> yuyv(static_cast<size_t>(kRowBytes * height));
    uint8_t* pixels[3] = {yuyv.data(), nullptr, nullptr};
    int pitches[3] = {kRowBytes, 0, 0};
    EXPECT_GE(dv_parse_header(decoder.get(), frame.data()), 0);
    dv_decode_full_frame(decoder.get(), frame.data(), e_dv_color_yuv, pixels, pitches);
    return yuyv;
}

std::vector<uint8_t> AsWeRead(const std::vector<uint8_t>& frame, PK_PixelFormat stream, int32_t height) {
    std::vector<uint8_t> uyvy(static_cast<size_t>(kRowBytes * height));
    EXPECT_EQ(PK_Success, PK_Convert(frame.data(), 0, stream, uyvy.data(), kRowBytes,
                                     PK_PixelFormat_UYVY_422_8u, kWidth, height, 2));
    return uyvy;
}

/// Of luma, which stands on even bytes there and on odd ones here.
int32_t FarthestLuma(const std::vector<uint8_t>& yuyv, const std::vector<uint8_t>& uyvy) {
    int32_t farthest = 0;
    for (size_t i = 0; i < yuyv.size(); i += 2)
        farthest = std::max(farthest, std::abs(yuyv[i] - uyvy[i + 1]));
    return farthest;
}

constexpr int32_t kFarthest = 4;

TEST(Libdv, ReadsStoredFramesAsWeDo) {
    for (const auto& [name, stream, width, height, isPhotograph] : PKTest::kDVFrames) {
        // It takes 4:1:1 of 625 lines for another format.
        const bool isKnown =
            (stream == PK_PixelFormat_NTSCDV25 || stream == PK_PixelFormat_PALDV25) && isPhotograph;
        if (!isKnown || std::string(name) == "dv25_625_411_chelsea") continue;
        const std::vector<uint8_t> frame = PKTest::ReadDVFrame(name);
        EXPECT_LE(FarthestLuma(AsLibdvReads(frame, height), AsWeRead(frame, stream, height)), kFarthest)
            << name;
    }
}

TEST(Libdv, ReadsOurFramesAsWeDo) {
    for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25})
        for (const int32_t quality : {1, 5}) {
            const int32_t height = stream == PK_PixelFormat_NTSCDV25 ? 480 : 576;
            const auto [name, from] = stream == PK_PixelFormat_NTSCDV25
                                          ? std::pair("dv50_525_coffee", PK_PixelFormat_NTSCDV50)
                                          : std::pair("dv50_625_astronaut", PK_PixelFormat_PALDV50);
            const std::vector<uint8_t> picture = AsWeRead(PKTest::ReadDVFrame(name), from, height);
            std::vector<uint8_t> frame(static_cast<size_t>(PK_PixelFormatSize(stream, 0, 0)));
            ASSERT_EQ(PK_Success,
                      PK_Convert(picture.data(), kRowBytes, PK_PixelFormat_UYVY_422_8u, frame.data(),
                                 static_cast<int32_t>(frame.size()), stream, kWidth, height, quality));
            EXPECT_LE(FarthestLuma(AsLibdvReads(frame, height), AsWeRead(frame, stream, height)), kFarthest)
                << height << " lines, quality " << quality;
        }
}

} // namespace
