// Reductions and copies of planar images.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Buffers.h>
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

std::function<bool()> PrepareQuarterScale() {
    PKTest::Random random(41);
    return Repeat({Reduce(1, random), Reduce(2, random), ReduceToPacked(false, 1, random),
                   ReduceToPacked(true, 2, random)});
}

std::function<bool()> PrepareCopyPlanar() {
    PKTest::Random random(42);
    return Repeat({Copy(kSize, random), Copy(kLarge, random)});
}

const Operation sQuarterScale("quarter-scale", PrepareQuarterScale);
const Operation sCopyPlanar("copy-planar", PrepareCopyPlanar);

} // namespace
