// Scale-and-convert from and to planar 4:2:0: held to the decoder, the encoder and the routes that come after and before.

#include "convert/Planar420.h"
#include "convert/RasterFormats.h"
#include "support/GuardedImage.h"
#include "support/PaddedPicture.h"
#include "support/ScaleByHand.h"
#include "support/Targets.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/ScaleConvert.h>

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <optional>

namespace {

using namespace PKTest;
using PKReference::ScaleNumbers;

constexpr PK_PixelFormat kFrame = PK_PixelFormat_YUV_420_MPEG2_FRAME, kBGRA = PK_PixelFormat_BGRA_4444_8u;

PK_PixelFormat DrawPlanarFormat(Random& random) {
    constexpr uint32_t kBits[] = {0x831, 0x31, 0xa31, 0x231};
    return (9 + random.Below(4)) << PK::kStreamShift | kBits[random.Below(4)];
}

PK_PixelFormat DrawRasterFormat(Random& random) {
    return PK::kRasterFormats[random.Below(static_cast<uint32_t>(std::size(PK::kRasterFormats)))];
}

/// Sizes from which a decoder gives reduced and widened pictures are frequent.
ScaleNumbers DrawCall(Random& random) {
    ScaleNumbers call = {};
    call.srcWidth = static_cast<int32_t>(random.Below(40)) + 1;
    call.srcHeight = static_cast<int32_t>(random.Below(40)) + 1;
    call.dstWidth = static_cast<int32_t>(random.Below(40)) + 1;
    call.dstHeight = static_cast<int32_t>(random.Below(40)) + 1;
    const auto ratio = [&] { return 1 << random.Below(4); };
    switch (random.Below(8)) {
    case 0:
    case 1:
        call.srcWidth = ratio() * call.dstWidth;
        call.srcHeight = ratio() * call.dstHeight;
        break;
    case 2:
        call.srcWidth = call.dstWidth;
        call.srcHeight = 2 * call.dstHeight;
        break;
    case 3:
        call.srcWidth = 32;
        call.dstWidth = 48;
        call.dstHeight = random.Below(2) == 0 ? call.srcHeight : call.srcHeight / 2 + 1;
        break;
    case 4:
        call.srcWidth = 96;
        call.dstWidth = 128;
        call.dstHeight = call.srcHeight;
        break;
    default:
        break;
    }
    call.srcFormat = DrawPlanarFormat(random);
    const uint32_t kind = random.Below(8);
    call.dstFormat = kind == 0   ? call.srcFormat
                     : kind == 1 ? DrawPlanarFormat(random)
                                 : DrawRasterFormat(random);
    call.srcField = static_cast<int32_t>(random.Below(3));
    call.dstField = random.Below(2) == 0 ? call.srcField : static_cast<int32_t>(random.Below(3));
    call.quality = static_cast<int32_t>(random.Below(6));
    call.fieldToRender = random.Below(4) == 0 ? static_cast<int32_t>(random.Below(3)) : 0;
    return call;
}

std::string Words(const ScaleNumbers& call) {
    std::ostringstream words;
    words << call.srcWidth << " x " << call.srcHeight << ' ' << PK_PixelFormatName(call.srcFormat)
          << " field " << call.srcField << " to " << call.dstWidth << " x " << call.dstHeight << ' '
          << PK_PixelFormatName(call.dstFormat) << " field " << call.dstField << ", rendered "
          << call.fieldToRender << ", quality " << call.quality;
    return words.str();
}

/// An image or a block of planes that ends at a page that nobody may touch.
GuardedImage DrawImage(PK_PixelFormat format, int32_t width, int32_t height, Random& random) {
    if (PK::IsStream(format))
        return {{static_cast<size_t>(PK_PixelFormatSize(format, width, height)), 1}, random};
    return {{static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, width)), height, 16 * random.Below(2),
             random.Below(2) != 0},
            random};
}

/// Motion has no field of a single row to blur.
bool MayLackField(const ScaleNumbers& call) {
    return call.srcField != 0 && call.quality >= 3;
}

TEST(ScaleConvertStreams, PlanesAreDecodedAndThenLikeAnyImage) {
    Random random(11);
    std::map<PK_Result, int> results;
    for (int i = 0; i < 4000; ++i) {
        const ScaleNumbers call = DrawCall(random);
        SCOPED_TRACE(testing::Message() << "seed " << random.Seed() << ", call " << i << ", " << Words(call));
        const GuardedImage source = DrawImage(call.srcFormat, call.srcWidth, call.srcHeight, random);
        const auto before = source.Rows();
        const GuardedImage destination = DrawImage(call.dstFormat, call.dstWidth, call.dstHeight, random);
        const ScaleMemory memory = {source.Pixels(), source.RowBytes(), destination.Pixels(),
                                    destination.RowBytes()};
        const PK_Result expected = ScaleByHand(call, memory);
        const auto rows = destination.Rows();
        destination.Restore();
        ++results[expected];
        ASSERT_EQ(CallScale(call, memory), expected);
        ASSERT_NO_FATAL_FAILURE(destination.ExpectRows(rows));
        ASSERT_NO_FATAL_FAILURE(source.ExpectRows(before));
        if (!MayLackField(call)) {
            ASSERT_EQ(expected, PK_Success);
        }
    }
    EXPECT_GT(results[PK_Success], 3900);
}

/// Planes apart, of either direction and with padding; and one at guard pages.
struct PlanesApart {
    PlanesApart(int32_t width, int32_t height, Random& random) {
        for (size_t i = 0; i < 3; ++i) {
            const int32_t columns = i == 0 ? width : width / 2, rows = i == 0 ? height : height / 2;
            images[i] = std::make_unique<GuardedImage>(ImageShape{static_cast<size_t>(columns),
                                                                  columns == 0 ? 0 : rows,
                                                                  random.Below(3) * 5, random.Below(2) != 0},
                                                       random);
            pointers[i] = images[i]->Pixels();
            rowBytes[i] = images[i]->RowBytes();
        }
    }

    std::unique_ptr<GuardedImage> images[3];
    const void* pointers[3];
    int32_t rowBytes[3];
};

/// The same of calls that the library has besides.
PK_Result ScalePlanesByHand(const ScaleNumbers& call, const PlanesApart& planes, const GuardedImage& to) {
    const auto source = PK::PlanesOf<const uint8_t>(planes.pointers, planes.rowBytes, call.srcWidth,
                                                    call.srcHeight, PK::Chroma::k420);
    const PK::DecodeTarget target =
        PK::ChoosePlanarTarget({call.srcFormat, call.srcWidth, call.srcHeight},
                               {call.dstFormat, call.dstWidth, call.dstHeight}, call.quality);
    const auto decode = [&](uint8_t* pixels, int32_t rowBytes) {
        const PK::DestinationImage image = {pixels, rowBytes, target.format, target.width, target.height};
        return PK::DecodePlanar420(source, call.srcFormat, PK::FromTop(image), call.srcField, call.quality);
    };
    if (target.format == call.dstFormat && target.width == call.dstWidth && target.height == call.dstHeight)
        return decode(to.Pixels(), to.RowBytes());
    const int32_t rowBytes = PK_PixelFormatRowBytes(target.format, target.width);
    std::vector<uint8_t> buffer(static_cast<size_t>(rowBytes) * static_cast<size_t>(target.height));
    if (const PK_Result result = decode(buffer.data(), rowBytes)) return result;
    return PK_ScaleConvert(buffer.data(), rowBytes, target.width, target.height, target.format,
                           target.height < call.srcHeight ? 0 : call.srcField, to.Pixels(), to.RowBytes(),
                           call.dstWidth, call.dstHeight, call.dstFormat, call.dstField, call.quality);
}

TEST(ScaleConvertStreams, PlanesApartAreDecodedStraightOrOnTheWay) {
    Random random(12);
    for (int i = 0; i < 3000; ++i) {
        ScaleNumbers call = DrawCall(random);
        if (PK::IsStream(call.dstFormat)) call.dstFormat = DrawRasterFormat(random);
        SCOPED_TRACE(testing::Message() << "seed " << random.Seed() << ", call " << i << ", " << Words(call));
        const PlanesApart planes(call.srcWidth, call.srcHeight, random);
        const GuardedImage destination = DrawImage(call.dstFormat, call.dstWidth, call.dstHeight, random);
        const PK_Result expected = ScalePlanesByHand(call, planes, destination);
        const auto rows = destination.Rows();
        destination.Restore();
        ASSERT_EQ(PK_ScaleConvertPlanar(planes.pointers, planes.rowBytes, call.srcWidth, call.srcHeight,
                                        call.srcFormat, call.srcField, destination.Pixels(),
                                        destination.RowBytes(), call.dstWidth, call.dstHeight, call.dstFormat,
                                        call.dstField, call.quality),
                  expected);
        ASSERT_NO_FATAL_FAILURE(destination.ExpectRows(rows));
        if (!MayLackField(call)) {
            ASSERT_EQ(expected, PK_Success);
        }
    }
}

/// A block of planes of one size, and its luma.
struct Block {
    Block(int32_t columns, int32_t rows, uint8_t byte)
        : width(columns), height(rows),
          bytes(static_cast<size_t>(PK_PixelFormatSize(kFrame, columns, rows)), byte) {}

    uint8_t Luma(int32_t x, int32_t y) const {
        return bytes[static_cast<size_t>(y * ((width + 127) & ~127) + x)];
    }

    int32_t width, height;
    std::vector<uint8_t> bytes;
};

TEST(ScaleConvertStreams, RowsOfAFieldThatIsNotRenderedBecomeBlack) {
    const std::vector<uint8_t> white(4 * 64 * 48, 255);
    for (const int32_t field : {1, 2}) {
        Block block(64, 48, 99);
        ASSERT_EQ(PK_ScaleConvertOneField(white.data(), 256, 64, 48, kBGRA, 0, block.bytes.data(), 0, 64, 48,
                                          kFrame, 1, 2, field),
                  PK_Success);
        for (int32_t y = 0; y < 48; ++y) EXPECT_EQ(block.Luma(5, y), y % 2 == field - 1 ? 235 : 16) << y;
    }
}

TEST(ScaleConvertStreams, WhatMotionLeavesOutBecomesBlack) {
    constexpr int32_t kWide = 300000; // two of these are a scale below 8e-6
    const std::vector<uint8_t> white(4 * kWide, 255);
    Block block(2, 2, 99);
    ASSERT_EQ(PK_ScaleConvert(white.data(), 4 * kWide, kWide, 1, kBGRA, 0, block.bytes.data(), 0, 2, 2,
                              kFrame, 0, 2),
              PK_Success);
    for (const int32_t y : {0, 1})
        for (const int32_t x : {0, 1}) EXPECT_EQ(block.Luma(x, y), 16);
}

TEST(ScaleConvertStreams, HalfAFrameIsTakenWithoutFilters) {
    Block block(1920, 1080, 0);
    Random random(13);
    random.Fill(block.bytes.data(), block.bytes.size());
    std::vector<uint8_t> picture(4 * 960 * 540);
    ASSERT_EQ(PK_ScaleConvert(block.bytes.data(), 0, 1920, 1080, kFrame, 0, picture.data(), 4 * 960, 960, 540,
                              PK_PixelFormat_VUYX_4444_8u, 0, 2),
              PK_Success);
    for (int32_t y = 0; y < 540; ++y)
        for (int32_t x = 0; x < 960; ++x)
            ASSERT_EQ(picture[static_cast<size_t>(4 * ((539 - y) * 960 + x) + 2)], block.Luma(2 * x, 2 * y));
}

} // namespace
