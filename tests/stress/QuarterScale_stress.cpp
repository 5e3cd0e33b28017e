// Reductions and copies of planar images, and planes of surfaces.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Convert.h>
#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>

namespace {

using namespace PKStress;

constexpr PK_PixelFormat kFormat = PK_PixelFormat_YUV_420_MPEG4_FRAME;

struct Size {
    int32_t width, height;
};

constexpr Size kSize = {131, 22};    // odd: ends of rows take part
constexpr Size kLarge = {1024, 512}; // planes without padding; luma goes past the cache

/// The planes of an image that lies in one block.
struct Planes {
    Planes(uint8_t* block, Size size) {
        PK_GetPlanarBuffers(block, kFormat, size.width, size.height, first, rowBytes);
    }
    Planes(const std::vector<uint8_t>& block, Size size) : Planes(const_cast<uint8_t*>(block.data()), size) {}

    void* first[3];
    int32_t rowBytes[3];
};

std::vector<uint8_t> RandomPlanes(Size size, PKTest::Random& random) {
    return RandomImage(kFormat, size.width, size.height, random);
}

Call Copy(Size size, PKTest::Random& random) {
    return {RandomPlanes(size, random), [size, source = RandomPlanes(size, random)](uint8_t* image) {
                const Planes from(source, size), to(image, size);
                return PK_CopyPlanar_8u(from.first, from.rowBytes, to.first, to.rowBytes, size.width,
                                        size.height);
            }};
}

Call Reduce(int32_t field, PKTest::Random& random) {
    static constexpr Size kSource = {2 * kSize.width,
                                     kSize.height}; // the width counts samples that are written
    return {RandomPlanes(kSize, random), [field, source = RandomPlanes(kSource, random)](uint8_t* image) {
                const Planes from(source, kSource), to(image, kSize);
                return PK_QuarterScalePlanar420_8u(from.first, from.rowBytes, to.first, to.rowBytes,
                                                   kSize.width, kSize.height, field);
            }};
}

Call ReduceToPacked(bool yuyvOrder, int32_t field, PKTest::Random& random) {
    constexpr int32_t kRowBytes = (kSize.width + 1) / 2 * 4;
    return {random.Bytes(kRowBytes * kSize.height / 2),
            [yuyvOrder, field, source = RandomPlanes(kSize, random)](uint8_t* image) {
                const Planes from(source, kSize);
                return PK_QuarterScalePlanar_8uAndConvertTo422_8u(
                    from.first, from.rowBytes, image, kRowBytes, kSize.width, kSize.height, yuyvOrder, field);
            }};
}

/// Of a surface with luma and pairs in rows of one length, in bands.
template <int kMember>
Call PartSurface(PKTest::Random& random) {
    static constexpr Size kPicture = {262, 131};
    static constexpr size_t kLuma = size_t{262} * 131 * (1 + kMember);
    return {RandomPlanes(kPicture, random), [surface = random.Bytes(2 * kLuma)](uint8_t* image) {
                const Planes to(image, kPicture);
                PK_ConvertNV12toYV12_SSE4<kMember>(surface.data(), kPicture.width, surface.data() + kLuma,
                                                   kPicture.width, to.first, to.rowBytes, kPicture.width,
                                                   kPicture.height);
                return PK_Success;
            }};
}

/// To pixels of four bytes, at half the height or all of it.
Call Decode(PK_PixelFormat format, int32_t field, PKTest::Random& random) {
    return {RandomImage(PK_PixelFormat_BGRA_4444_8u, kSize.width, kSize.height, random),
            [format, field, source = RandomPlanes(kSize, random)](uint8_t* image) {
                const Planes from(source, kSize);
                return PK::DecompressYUV_420_8u(from.first, from.rowBytes, kSize.width, kSize.height, kFormat,
                                                image, PK_PixelFormatRowBytes(format, kSize.width),
                                                kSize.width, field == 0 ? kSize.height : kSize.height / 2,
                                                format, field, 4);
            }};
}

/// A block to pixels, and pixels to a block.
Call ConvertBlock(PK_PixelFormat from, PK_PixelFormat to, PKTest::Random& random) {
    return {RandomImage(to, kSize.width, kSize.height, random),
            [from, to, source = RandomImage(from, kSize.width, kSize.height, random)](uint8_t* image) {
                return PK_Convert(source.data(), PK_PixelFormatRowBytes(from, kSize.width), from, image,
                                  PK_PixelFormatRowBytes(to, kSize.width), to, kSize.width, kSize.height, 4);
            }};
}

std::function<bool()> PrepareDecoding() {
    PKTest::Random random(44);
    return Repeat({Decode(PK_PixelFormat_VUYX_4444_8u, 0, random),
                   Decode(PK_PixelFormat_UYVY_422_8u, 2, random),
                   ConvertBlock(kFormat, PK_PixelFormat_BGRA_4444_8u, random),
                   ConvertBlock(PK_PixelFormat_V210_422_10u, kFormat, random)});
}

std::function<bool()> PrepareQuarterScale() {
    PKTest::Random random(41);
    return Repeat({Reduce(1, random), Reduce(2, random), ReduceToPacked(false, 1, random),
                   ReduceToPacked(true, 2, random)});
}

std::function<bool()> PrepareCopyPlanar() {
    PKTest::Random random(42);
    return Repeat({Copy(kSize, random), Copy(kLarge, random)});
}

std::function<bool()> PrepareSurfaces() {
    PKTest::Random random(43);
    return Repeat({PartSurface<0>(random), PartSurface<1>(random)});
}

const Operation sQuarterScale("quarter-scale", PrepareQuarterScale);
const Operation sCopyPlanar("copy-planar", PrepareCopyPlanar);
const Operation sDecoding("planar-4:2:0", PrepareDecoding);
const Operation sSurfaces("nv12-to-planes", PrepareSurfaces);

} // namespace
