// What decoders give and encoders take, by format and size.

#include "convert/Streams.h"

#include "primitives/CapabilityFlags.h"
#include "support/FlagScope.h"

#include <PixelKiln/PixelFormat.h>

#include <gtest/gtest.h>

namespace PK {

bool operator==(const DecodeTarget& a, const DecodeTarget& b) {
    return a.format == b.format && a.width == b.width && a.height == b.height;
}

void PrintTo(const DecodeTarget& target, std::ostream* stream) {
    *stream << std::hex << target.format << std::dec << " " << target.width << " x " << target.height;
}

namespace {

struct Picture {
    PK_PixelFormat stream;
    DecodeTarget native;
    PK_PixelFormat reduced;
};

constexpr Picture kPictures[] = {
    {PK_PixelFormat_NTSCDV50, {PK_PixelFormat_YUYV_422_8u, 720, 480}, PK_PixelFormat_VUYA_4444_8u},
    {PK_PixelFormat_PALDV50, {PK_PixelFormat_YUYV_422_8u, 720, 576}, PK_PixelFormat_VUYA_4444_8u},
    {PK_PixelFormat_NTSC_DV100_720p,
     {PK_PixelFormat_YUYV_422_8u_709, 960, 720},
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_PAL_DV100_720p,
     {PK_PixelFormat_YUYV_422_8u_709, 960, 720},
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_NTSC_DV100_1080i,
     {PK_PixelFormat_YUYV_422_8u_709, 1280, 1080},
     PK_PixelFormat_VUYA_4444_8u_709},
    {PK_PixelFormat_PAL_DV100_1080i,
     {PK_PixelFormat_YUYV_422_8u_709, 1440, 1080},
     PK_PixelFormat_VUYA_4444_8u_709},
};

/// The answer for a wanted size; what the caller wants of formats plays no part.
DecodeTarget Choose(const Picture& picture, int32_t width, int32_t height, int32_t quality) {
    DecodeTarget target{};
    const DecodeTarget stream = {picture.stream, picture.native.width, picture.native.height};
    EXPECT_EQ(ChooseDecodeTarget(stream, {PK_PixelFormat_BGRA_4444_8u, width, height}, quality, target),
              PK_Success);
    return target;
}

/// What DV25 is decoded to for a wish.
DecodeTarget ChooseDV25(PK_PixelFormat stream, const DecodeTarget& wanted, int32_t quality) {
    DecodeTarget target{};
    const int32_t height = stream == PK_PixelFormat_NTSCDV25 ? 480 : 576;
    EXPECT_EQ(ChooseDecodeTarget({stream, 720, height}, wanted, quality, target), PK_Success);
    return target;
}

TEST(Streams, DV25DecodesToTheSmallestSizeAboveTheWantedOne) {
    constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u;
    struct Wish {
        int32_t width, height, quality;
        int32_t givenWidth, givenNTSC; // height; that of PAL is 6/5 of it
    };
    // Heights of wishes are those of NTSC.
    constexpr Wish kWishes[] = {
        {720, 480, 0, 720, 480}, {720, 240, 0, 720, 240}, {720, 235, 5, 720, 240}, {1, 1, 3, 720, 240},
        {1, 245, 3, 720, 480},   {360, 240, 2, 720, 240}, {359, 240, 2, 720, 240}, {359, 235, 2, 360, 240},
        {360, 1, 0, 720, 240},   {90, 60, 2, 90, 60},     {91, 60, 2, 180, 120},   {90, 65, 0, 180, 120},
        {180, 120, 2, 180, 120}, {181, 120, 2, 360, 240}, {180, 125, 2, 360, 240}, {100, 300, 2, 720, 480},
        {1, 1, 2, 90, 60},
    };
    for (const Wish& wish : kWishes)
        for (const bool isPAL : {false, true}) {
            const auto ofSystem = [&](int32_t height) { return isPAL ? height * 6 / 5 : height; };
            const DecodeTarget expected = {kBGRA, wish.givenWidth, ofSystem(wish.givenNTSC)};
            EXPECT_EQ(ChooseDV25(isPAL ? PK_PixelFormat_PALDV25 : PK_PixelFormat_NTSCDV25,
                                 {kBGRA, wish.width, ofSystem(wish.height)}, wish.quality),
                      expected)
                << wish.width << " x " << wish.height << ", quality " << wish.quality;
        }
}

TEST(Streams, DV25DecodesToEightBits) {
    constexpr PK_PixelFormat kFormats[][2] = {
        {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
        {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRP_4444_8u},
        {PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_BGRX_4444_8u},
        {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYA_4444_8u},
        {PK_PixelFormat_VUYP_4444_8u, PK_PixelFormat_VUYP_4444_8u},
        {PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYX_4444_8u},
        {PK_PixelFormat_VUYA_4444_8u_709, PK_PixelFormat_VUYX_4444_8u},
        {PK_PixelFormat_VUYP_4444_32f, PK_PixelFormat_VUYX_4444_8u},
        {PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_VUYX_4444_8u},
        {PK_PixelFormat_ARGB_4444_8u, PK_PixelFormat_BGRX_4444_8u},
        {PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRX_4444_8u},
        {PK_PixelFormat_YUYV_422_8u, PK_PixelFormat_UYVY_422_8u},
        {PK_PixelFormat_UYVY_422_8u_709, PK_PixelFormat_UYVY_422_8u},
        {PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_8u},
        {PK_PixelFormat_RGB_444_10u, PK_PixelFormat_UYVY_422_8u},
    };
    for (const auto& [wanted, given] : kFormats)
        EXPECT_EQ(given, ChooseDV25(PK_PixelFormat_PALDV25, {wanted, 720, 576}, 2).format)
            << std::hex << wanted;
}

TEST(Streams, DVDecodesToItsNativeFormatAtFullSize) {
    for (const Picture& picture : kPictures) {
        const auto& [format, width, height] = picture.native;
        EXPECT_EQ(Choose(picture, width, height, 0), picture.native);
        EXPECT_EQ(Choose(picture, width, height, 5), picture.native);
        EXPECT_EQ(Choose(picture, 2 * width, 2 * height, 2), picture.native);
        EXPECT_EQ(Choose(picture, width - 1, height, 2), picture.native);
        EXPECT_EQ(Choose(picture, width, height - 1, 2), picture.native);
    }
}

TEST(Streams, DVDecodesOneFieldForFullWidthAndHalfHeight) {
    for (const Picture& picture : kPictures) {
        const auto& [format, width, height] = picture.native;
        const DecodeTarget field = {format, width, height / 2};
        EXPECT_EQ(Choose(picture, width, height / 2, 0), field);
        EXPECT_EQ(Choose(picture, width, height / 2, 5), field);
    }
}

TEST(Streams, DVDecodesReducedWhereHalfTheSizeIsEnough) {
    for (const Picture& picture : kPictures) {
        const auto& [format, width, height] = picture.native;
        const DecodeTarget reduced = {picture.reduced, width / 2, height / 2};
        EXPECT_EQ(Choose(picture, width / 2, height / 2, 5), reduced);
        EXPECT_EQ(Choose(picture, 1, 1, 5), reduced);
        EXPECT_EQ(Choose(picture, width / 2 + 1, height / 2, 3), picture.native);
        EXPECT_EQ(Choose(picture, width / 2, height / 2 + 1, 3), picture.native);
    }
}

TEST(Streams, DVDecodesReducedForAnySmallerSizeAtLowQuality) {
    for (const Picture& picture : kPictures) {
        const auto& [format, width, height] = picture.native;
        const DecodeTarget reduced = {picture.reduced, width / 2, height / 2};
        EXPECT_EQ(Choose(picture, width - 1, height - 1, 2), reduced);
        EXPECT_EQ(Choose(picture, width - 1, height - 1, 3), picture.native);
    }
}

DecodeTarget ChoosePlanar(const DecodeTarget& stream, const DecodeTarget& wanted, int32_t quality) {
    DecodeTarget target{};
    EXPECT_EQ(ChooseDecodeTarget(stream, wanted, quality, target), PK_Success);
    return target;
}

/// The size chosen for a picture of 1440 x 1080, or another.
std::pair<int32_t, int32_t> PlanarSize(int32_t width, int32_t height, int32_t quality, int32_t ofWidth = 1440,
                                       int32_t ofHeight = 1080) {
    const DecodeTarget target = ChoosePlanar({PK_PixelFormat_YUV_420_MPEG2_FIELD, ofWidth, ofHeight},
                                             {PK_PixelFormat_BGRA_4444_8u, width, height}, quality);
    return {target.width, target.height};
}

using Size = std::pair<int32_t, int32_t>;

TEST(Streams, PlanarDecodesWiderWhereItsRowsCanGrow) {
    const PKTest::FlagScope flags;
    sCPUHasSSE2 = true;
    EXPECT_EQ(PlanarSize(1920, 1080, 5), Size(1920, 1080)) << "4/3 of a multiple of 96";
    EXPECT_EQ(PlanarSize(1920, 540, 5), Size(1920, 540));
    EXPECT_EQ(PlanarSize(2160, 1080, 5), Size(2160, 1080)) << "3/2 of a multiple of 16";
    EXPECT_EQ(PlanarSize(1920, 720, 5, 1280, 720), Size(1920, 720));
    EXPECT_EQ(PlanarSize(1920, 1079, 5), Size(1440, 1080));
    EXPECT_EQ(PlanarSize(960, 480, 5, 720, 480), Size(720, 480)) << "no multiple of 96";
    sCPUHasSSE2 = false;
    EXPECT_EQ(PlanarSize(1920, 1080, 5), Size(1440, 1080));
}

TEST(Streams, PlanarDecodesOneFieldForFullWidthAndHalfHeight) {
    for (const int32_t quality : {0, 5}) EXPECT_EQ(PlanarSize(1440, 540, quality), Size(1440, 540));
}

TEST(Streams, PlanarDecodesReducedAtLowQualityAlone) {
    EXPECT_EQ(PlanarSize(720, 540, 2), Size(720, 540));
    EXPECT_EQ(PlanarSize(180, 270, 2), Size(180, 270)) << "an eighth and a quarter";
    EXPECT_EQ(PlanarSize(1440, 270, 2), Size(1440, 270)) << "all columns";
    EXPECT_EQ(PlanarSize(720, 360, 2), Size(720, 540)) << "a third is no even number";
    EXPECT_EQ(PlanarSize(90, 270, 2), Size(720, 540)) << "a sixteenth is not offered";
    EXPECT_EQ(PlanarSize(721, 540, 2), Size(1440, 540));
    EXPECT_EQ(PlanarSize(720, 541, 2), Size(1440, 1080));
    EXPECT_EQ(PlanarSize(720, 540, 3), Size(1440, 1080));
    EXPECT_EQ(PlanarSize(10, 4, 2, 41, 16), Size(41, 16)) << "an odd width";
    EXPECT_EQ(PlanarSize(20, 0, 2, 40, 16), Size(20, 8));
}

TEST(Streams, PlanarDecodesToOpaquePixelsOfTheMatrixThatIsWanted) {
    const auto format = [](PK_PixelFormat stream, PK_PixelFormat wanted) {
        return ChoosePlanar({stream, 16, 16}, {wanted, 16, 16}, 2).format;
    };
    const PK_PixelFormat of601 = PK_PixelFormat_YUV_420_MPEG2_FRAME,
                         of709 = PK_PixelFormat_YUV_420_MPEG4_FIELD_709;
    EXPECT_EQ(format(of601, PK_PixelFormat_UYVY_422_8u_709), PK_PixelFormat_VUYX_4444_8u_709);
    EXPECT_EQ(format(of709, PK_PixelFormat_VUYA_4444_8u), PK_PixelFormat_VUYX_4444_8u);
    EXPECT_EQ(format(of601, PK_PixelFormat_BGRA_4444_8u), PK_PixelFormat_VUYX_4444_8u);
    EXPECT_EQ(format(of709, PK_PixelFormat_BGRA_4444_8u), PK_PixelFormat_VUYX_4444_8u_709);
    EXPECT_EQ(format(of709, PK_PixelFormat_V210_422_10u), PK_PixelFormat_VUYX_4444_8u_709) << "ten bits";
    EXPECT_EQ(format(PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange_709, PK_PixelFormat_VUYA_4444_8u),
              PK_PixelFormat_BGRX_4444_8u);
}

TEST(Streams, NoDecodeTargetForWhatIsNoStream) {
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_Invalid, 0x0d000821u}) {
        DecodeTarget target = {1, 2, 3};
        EXPECT_EQ(ChooseDecodeTarget({format, 720, 480}, {PK_PixelFormat_BGRA_4444_8u, 720, 480}, 2, target),
                  PK_ErrBadSrcFormat);
        EXPECT_EQ(target, (DecodeTarget{1, 2, 3}));
    }
}

PK_PixelFormat EncodeSource(PK_PixelFormat source, PK_PixelFormat stream) {
    PK_PixelFormat format = PK_PixelFormat_Invalid;
    EXPECT_EQ(ChooseEncodeSource(source, stream, 2, format), PK_Success);
    return format;
}

TEST(Streams, DV25EncodesFromTheEightBitFormOfItsSource) {
    for (const PK_PixelFormat stream : {PK_PixelFormat_NTSCDV25, PK_PixelFormat_PALDV25}) {
        EXPECT_EQ(EncodeSource(PK_PixelFormat_XRGB_4444_15u, stream), PK_PixelFormat_BGRA_4444_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_RGB_444_10u, stream), PK_PixelFormat_BGRA_4444_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_VUYP_4444_32f_709, stream), PK_PixelFormat_VUYA_4444_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_UYVY_422_32f, stream), PK_PixelFormat_UYVY_422_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_V210_422_10u, stream), PK_PixelFormat_UYVY_422_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_YUYV_422_8u_709, stream), PK_PixelFormat_YUYV_422_8u);
    }
}

TEST(Streams, DV50AndDV100EncodeFromTheirNativeFormat) {
    for (const Picture& picture : kPictures) {
        EXPECT_EQ(EncodeSource(PK_PixelFormat_BGRA_4444_8u, picture.stream), picture.native.format);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_UYVY_422_8u, picture.stream), picture.native.format);
    }
}

TEST(Streams, PlanarEncodesFromAnyRasterFormatInVideoRange) {
    for (const PK_PixelFormat stream :
         {PK_PixelFormat_YUV_420_MPEG2_FRAME, PK_PixelFormat_YUV_420_MPEG4_FIELD_709}) {
        EXPECT_EQ(EncodeSource(PK_PixelFormat_PRGB_4444_15u, stream), PK_PixelFormat_PRGB_4444_15u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_V210_422_10u, stream), PK_PixelFormat_V210_422_10u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_NTSCDV25, stream), PK_PixelFormat_VUYX_4444_8u);
    }
}

TEST(Streams, PlanarFullRangeEncodesFromRGB) {
    for (const PK_PixelFormat stream :
         {PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange, PK_PixelFormat_YUV_420_MPEG4_FRAME_FullRange_709}) {
        EXPECT_EQ(EncodeSource(PK_PixelFormat_UYVY_422_8u, stream), PK_PixelFormat_BGRX_4444_8u);
        EXPECT_EQ(EncodeSource(PK_PixelFormat_PALDV50, stream), PK_PixelFormat_BGRX_4444_8u);
    }
}

TEST(Streams, NoEncodeSourceForWhatIsNoStream) {
    for (const PK_PixelFormat format : {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_Invalid, 0x0d000821u}) {
        PK_PixelFormat source = 0x77;
        EXPECT_EQ(ChooseEncodeSource(PK_PixelFormat_BGRA_4444_8u, format, 2, source), PK_ErrNotSupported);
        EXPECT_EQ(source, 0x77u);
    }
}

TEST(Streams, UnknownKindsHaveNoCodec) {
    uint8_t bytes[64] = {};
    const PK_PixelFormat unknown = 0x0d000821;
    EXPECT_EQ(DecodeStream({bytes, 0, unknown, 8, 1}, 0, {bytes, 32, PK_PixelFormat_BGRA_4444_8u, 8, 1}, 2),
              PK_ErrNotSupported);
    EXPECT_EQ(EncodeStream({bytes, 32, PK_PixelFormat_BGRA_4444_8u, 8, 1}, {bytes, 0, unknown, 8, 1}, 2),
              PK_ErrNotSupported);
}

} // namespace

} // namespace PK
