// Planar 4:2:0 against a slow reference: random pictures of every siting, kind, size and destination, in guarded memory.

#include <PixelKiln/Convert.h>
#include <PixelKiln/Planar.h>

#include "convert/RasterFormats.h"
#include "convert/Streams.h"
#include "frame/Planes.h"
#include "reference/ReferencePlanar420.h"
#include "support/GuardedImage.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <memory>

namespace {

using PKTest::DecodedPicture;
using PKTest::GuardedImage;
using PKTest::PlanarPicture;
using PKTest::Random;

constexpr PK_PixelFormat kPlanarFormats[] = {PK_PixelFormat_YUV_420_MPEG2_FIELD,
                                             PK_PixelFormat_YUV_420_MPEG2_FRAME,
                                             PK_PixelFormat_YUV_420_MPEG2_FIELD_FullRange,
                                             PK_PixelFormat_YUV_420_MPEG2_FRAME_FullRange,
                                             PK_PixelFormat_YUV_420_MPEG2_FIELD_709,
                                             PK_PixelFormat_YUV_420_MPEG2_FRAME_709,
                                             PK_PixelFormat_YUV_420_MPEG4_FIELD,
                                             PK_PixelFormat_YUV_420_MPEG4_FRAME,
                                             PK_PixelFormat_YUV_420_MPEG4_FIELD_709,
                                             PK_PixelFormat_YUV_420_MPEG4_FRAME_709,
                                             PK_PixelFormat_YUV_420_MPEG4_FIELD_FullRange_709};

template <size_t kCount>
PK_PixelFormat Any(const PK_PixelFormat (&formats)[kCount], Random& random) {
    return formats[random.Below(kCount)];
}

/// Any raster format but those of 15 bits, whose rounding goes by the place of a row in memory.
PK_PixelFormat AnyRaster(Random& random) {
    PK_PixelFormat format = 0;
    do format = Any(PK::kRasterFormats, random);
    while (PK::DepthOf(format) == PK::kDepth15u);
    return format;
}

PKTest::ImageShape Shape(uint64_t rowLength, int32_t height, Random& random) {
    return {static_cast<size_t>(rowLength), height, random.Below(2) * random.Below(20), random.Below(2) != 0,
            random.Below(2) ? PKTest::Guard::kAfter : PKTest::Guard::kBefore};
}

/// Random planes that end at guard pages.
class GuardedPlanes {
public:
    GuardedPlanes(PK_PixelFormat format, int32_t width, int32_t height, Random& random)
        : fPicture{format, width, height, {}} {
        for (int i = 0; i < 3; ++i) {
            const int32_t part = i == 0 ? 1 : 2;
            fPlanes[i] = std::make_unique<GuardedImage>(
                Shape(static_cast<uint64_t>(width / part), height / part, random), random);
            fPointers[i] = fPlanes[i]->Pixels();
            fRowBytes[i] = fPlanes[i]->RowBytes();
            fPicture.planes[i] = fPlanes[i]->Rows();
        }
    }

    const PlanarPicture& Picture() const { return fPicture; }

    PK_Result Decode(const GuardedImage& image, int32_t width, int32_t height, PK_PixelFormat format,
                     int32_t field, int32_t quality) const {
        return PK::DecompressYUV_420_8u(fPointers, fRowBytes, fPicture.width, fPicture.height,
                                        fPicture.format, image.Pixels(), image.RowBytes(), width, height,
                                        format, field, quality);
    }

private:
    PlanarPicture fPicture;
    std::unique_ptr<GuardedImage> fPlanes[3];
    const void* fPointers[3];
    int32_t fRowBytes[3];
};

/// Rows of one format in another, each by itself.
PKTest::Samples Converted(const DecodedPicture& picture, int32_t width, PK_PixelFormat to, int32_t quality) {
    if (picture.format == to) return picture.rows;
    PKTest::Samples rows;
    for (const auto& row : picture.rows) {
        rows.emplace_back(PK::BytesOfRow(to, width));
        EXPECT_EQ(PK_Convert(row.data(), 0, picture.format, rows.back().data(), 0, to, width, 1, quality),
                  PK_Success);
    }
    return rows;
}

struct DecodeCall {
    int32_t width, height;
    PK_PixelFormat format;
    int32_t field, quality;
};

void ExpectDecoded(const GuardedPlanes& planes, const DecodeCall& call, const DecodedPicture& expected,
                   Random& random) {
    const PlanarPicture& picture = planes.Picture();
    SCOPED_TRACE(testing::Message() << PK_PixelFormatName(picture.format) << " " << picture.width << " x "
                                    << picture.height << " to " << PK_PixelFormatName(call.format) << " "
                                    << std::hex << call.format << std::dec << " " << call.width << " x "
                                    << call.height << " field " << call.field << " quality " << call.quality
                                    << " seed " << random.Seed());
    const GuardedImage image(Shape(PK::BytesOfRow(call.format, call.width), call.height, random), random);
    ASSERT_EQ(planes.Decode(image, call.width, call.height, call.format, call.field, call.quality),
              PK_Success);
    image.ExpectRows(Converted(expected, call.width, call.format, call.quality));
}

int32_t Between(int32_t least, int32_t most, Random& random) {
    return least + static_cast<int32_t>(random.Below(static_cast<uint32_t>(most - least + 1)));
}

/// One in three is what the planes come to without a conversion.
PK_PixelFormat AnyDestination(PK_PixelFormat source, Random& random) {
    if (random.Below(3) != 0) return AnyRaster(random);
    const uint32_t matrix = source & PK::kMatrixMask;
    return (random.Below(2) ? PK_PixelFormat_VUYX_4444_8u : PK_PixelFormat_UYVY_422_8u) | matrix;
}

class Planar420Sweep : public PKTest::TargetTest {
protected:
    static constexpr int kTrials = 400;
};

TEST_P(Planar420Sweep, FullAndHalfHeights) {
    Random random(4201);
    for (int i = 0; i < kTrials && !HasFatalFailure(); ++i) {
        const GuardedPlanes planes(Any(kPlanarFormats, random),
                                   Between(1, random.Below(3) ? 20 : 300, random), Between(1, 14, random),
                                   random);
        const PlanarPicture& picture = planes.Picture();
        const bool isHalf = random.Below(2) != 0 && picture.height > 1;
        const DecodeCall call = {picture.width, isHalf ? picture.height / 2 : picture.height,
                                 AnyDestination(picture.format, random), Between(0, 2, random),
                                 Between(0, 5, random)};
        ExpectDecoded(planes, call, ReferenceFullWidth(picture, call.height, call.format, call.field),
                      random);
    }
}

TEST_P(Planar420Sweep, QuartersAndOtherRatios) {
    Random random(4202);
    for (int i = 0; i < kTrials && !HasFatalFailure(); ++i) {
        const int32_t columns = 1 << random.Below(4), rows = 2 * Between(1, 4, random);
        const bool isQuarter = columns == 2 && rows == 2;
        const int32_t width = Between(1, random.Below(3) ? 20 : 150, random), height = Between(1, 4, random);
        const int32_t odd = isQuarter ? Between(0, 1, random) : 0; // what is left over
        const GuardedPlanes planes(Any(kPlanarFormats, random), width * columns + odd, height * rows + odd,
                                   random);
        if (columns == 1 && rows == 2) continue; // half the height
        const DecodeCall call = {width, height, AnyDestination(planes.Picture().format, random),
                                 Between(0, 2, random), Between(0, isQuarter ? 5 : 2, random)};
        ExpectDecoded(planes, call, ReferenceDecimated(planes.Picture(), columns, rows), random);
    }
}

TEST_P(Planar420Sweep, WiderRows) {
    if (GetParam() == PK::Target::plain) GTEST_SKIP() << "offered from SSE2 on";
    Random random(4203);
    for (int i = 0; i < kTrials && !HasFatalFailure(); ++i) {
        const bool byThirds = random.Below(2) != 0;
        const int32_t width = byThirds ? 96 * Between(1, 3, random) : 16 * Between(1, 12, random);
        const GuardedPlanes planes(Any(kPlanarFormats, random), width, Between(2, 11, random), random);
        const PlanarPicture& picture = planes.Picture();
        const DecodeCall call = {byThirds ? width / 3 * 4 : width / 2 * 3,
                                 random.Below(2) ? picture.height : picture.height / 2, AnyRaster(random),
                                 Between(0, 2, random), Between(0, 5, random)};
        ExpectDecoded(planes, call,
                      ReferenceWidened(picture, call.width, call.height, call.format, call.field), random);
    }
}

/// A block of planes, and bytes beside its samples that must stay.
class PlanarBlock {
public:
    PlanarBlock(PK_PixelFormat format, int32_t width, int32_t height, Random& random)
        : fBytes(static_cast<size_t>(PK_PixelFormatSize(format, width, height)), PKTest::Guard::kAfter),
          fPlanes(PK::PlanesInBlock(fBytes.Bytes(), format, width, height)) {
        random.Fill(fBytes.Bytes(), fBytes.Size());
        fExpected.assign(fBytes.Bytes(), fBytes.Bytes() + fBytes.Size());
    }

    uint8_t* Bytes() const { return fBytes.Bytes(); }

    /// Rows without samples are left out.
    void Expect(const PlanarPicture& picture) {
        for (size_t i = 0; i < 3; ++i)
            for (size_t row = 0; row < picture.planes[i].size(); ++row)
                std::ranges::copy(picture.planes[i][row],
                                  fExpected.data() + (fPlanes[i].Row(static_cast<int32_t>(row)) - Bytes()));
        const auto [right, wrong] = std::mismatch(fExpected.begin(), fExpected.end(), Bytes());
        if (right != fExpected.end())
            FAIL() << "byte " << right - fExpected.begin() << " is " << int{*wrong} << ", expected "
                   << int{*right};
    }

    /// As the planes hold them.
    PlanarPicture Picture(PK_PixelFormat format) const {
        PlanarPicture picture = {format, fPlanes[0].width, fPlanes[0].height, {}};
        for (size_t i = 0; i < 3; ++i)
            for (int32_t row = 0; row < fPlanes[i].height; ++row)
                picture.planes[i].emplace_back(fPlanes[i].Row(row), fPlanes[i].Row(row) + fPlanes[i].width);
        return picture;
    }

private:
    PKTest::GuardedRows fBytes;
    PK::DestinationPlanes fPlanes;
    std::vector<uint8_t> fExpected;
};

/// Rows of an image from the top of the picture.
PKTest::Samples FromTop(PKTest::Samples rows, PK_PixelFormat format) {
    if (PK_IsOriginBottomLeft(format)) std::ranges::reverse(rows);
    return rows;
}

TEST_P(Planar420Sweep, Encoding) {
    Random random(4204);
    for (int i = 0; i < kTrials && !HasFatalFailure(); ++i) {
        const PK_PixelFormat to = Any(kPlanarFormats, random), from = AnyRaster(random);
        const int32_t width = Between(1, random.Below(3) ? 20 : 300, random), height = Between(1, 14, random);
        const int32_t quality = Between(0, 5, random);
        const GuardedImage image(Shape(PK::BytesOfRow(from, width), height, random), random);
        PlanarBlock block(to, width, height, random);
        SCOPED_TRACE(testing::Message() << PK_PixelFormatName(from) << " to " << PK_PixelFormatName(to) << " "
                                        << width << " x " << height << " seed " << random.Seed());
        ASSERT_EQ(
            PK_Convert(image.Pixels(), image.RowBytes(), from, block.Bytes(), 0, to, width, height, quality),
            PK_Success);
        DecodedPicture source = {from, FromTop(image.Rows(), from)};
        if ((to & PK::kRangeMask) == PK::kRangeFull) {
            source.rows = Converted(source, width, PK_PixelFormat_BGRX_4444_8u, quality);
            source.format = PK_PixelFormat_BGRX_4444_8u;
        }
        const PK_PixelFormat working = PK_PixelFormat_VUYP_4444_8u | (to & PK::kMatrixMask);
        block.Expect(PKTest::ReferenceEncoded(Converted(source, width, working, quality), to, width));
    }
}

/// PK_Convert decodes to the format that ChooseDecodeTarget names, and goes on from there.
TEST_P(Planar420Sweep, ConversionOfABlock) {
    Random random(4205);
    for (int i = 0; i < kTrials && !HasFatalFailure(); ++i) {
        const PK_PixelFormat from = Any(kPlanarFormats, random), to = AnyRaster(random);
        const int32_t width = Between(1, 40, random), height = Between(1, 14, random);
        const int32_t quality = Between(0, 5, random);
        const PlanarBlock block(from, width, height, random);
        const GuardedImage image(Shape(PK::BytesOfRow(to, width), height, random), random);
        SCOPED_TRACE(testing::Message() << PK_PixelFormatName(from) << " to " << PK_PixelFormatName(to) << " "
                                        << width << " x " << height << " seed " << random.Seed());
        ASSERT_EQ(
            PK_Convert(block.Bytes(), 0, from, image.Pixels(), image.RowBytes(), to, width, height, quality),
            PK_Success);
        PK::DecodeTarget target{};
        ASSERT_EQ(PK::ChooseDecodeTarget({from, width, height}, {to, width, height}, quality, target),
                  PK_Success);
        DecodedPicture decoded = ReferenceFullWidth(block.Picture(from), height, target.format, 0);
        decoded.rows = Converted(decoded, width, target.format, quality);
        decoded.format = target.format;
        image.ExpectRows(FromTop(Converted(decoded, width, to, quality), to));
    }
}

INSTANTIATE_TEST_SUITE_P(Targets, Planar420Sweep, PKTest::EveryTarget(), PKTest::TargetOf);

} // namespace
