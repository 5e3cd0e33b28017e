// Images scaled and converted by every route, through buffers of the recycler.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/ScaleConvert.h>

namespace {

using namespace PKStress;

struct Scaling {
    PK_PixelFormat source, destination;
    int32_t sourceWidth, sourceHeight, width, height, quality;
    int32_t sourceField = 0, destinationField = 0;
};

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kUYVY = PK_PixelFormat_UYVY_422_8u,
                         kV210 = PK_PixelFormat_V210_422_10u, kPlanes = PK_PixelFormat_YUV_420_MPEG2_FRAME;

constexpr Scaling kScalings[] = {
    {kUYVY, kBGRA, 61, 30, 61, 30, 2},                           // converted
    {kUYVY, PK_PixelFormat_VUYP_4444_8u, 122, 60, 61, 30, 2},    // halved
    {kV210, kBGRA, 122, 60, 61, 30, 1, 1},                       // halved and converted
    {PK_PixelFormat_UYVY_422_32f, kBGRA, 40000, 4, 20000, 2, 2}, // through rows of the recycler
    {kPlanes, kPlanes, 131, 44, 131, 22, 2, 2, 2},               // a field of planes
    {kBGRA, kUYVY, 61, 60, 50, 25, 2, 2},                        // one field, moved
    {kUYVY, kBGRA, 61, 30, 50, 70, 4},                           // converted before
    {kUYVY, kV210, 61, 70, 61, 70, 3, 1, 2},                     // to another field order
    {kPlanes, kBGRA, 62, 70, 50, 40, 4},                         // decoded before
    {kBGRA, kPlanes, 61, 70, 50, 40, 2},                         // encoded behind
    {kBGRA, kBGRA, 61, 70, 50, 40, 5},                           // in light
};

Call Scale(const Scaling& job, PKTest::Random& random) {
    return {RandomImage(job.destination, job.width, job.height, random),
            [=, source = RandomImage(job.source, job.sourceWidth, job.sourceHeight, random)](uint8_t* image) {
                return PK_ScaleConvert(source.data(), PK_PixelFormatRowBytes(job.source, job.sourceWidth),
                                       job.sourceWidth, job.sourceHeight, job.source, job.sourceField, image,
                                       PK_PixelFormatRowBytes(job.destination, job.width), job.width,
                                       job.height, job.destination, job.destinationField, job.quality);
            }};
}

std::function<bool()> PrepareScaleConvert() {
    PKTest::Random random(71);
    std::vector<Call> calls;
    for (const Scaling& scaling : kScalings) calls.push_back(Scale(scaling, random));
    return Repeat(calls);
}

std::function<bool()> PrepareScaleConvertPlanar() {
    constexpr int32_t kWidth = 62, kHeight = 40;
    PKTest::Random random(73);
    return Repeat({{RandomImage(kBGRA, kWidth, kHeight, random),
                    [y = random.Bytes(kWidth * kHeight), u = random.Bytes(kWidth * kHeight / 4),
                     v = random.Bytes(kWidth * kHeight / 4)](uint8_t* image) {
                        const void* const planes[3] = {y.data(), u.data(), v.data()};
                        const int32_t rowBytes[3] = {kWidth, kWidth / 2, kWidth / 2};
                        return PK_ScaleConvertPlanar(planes, rowBytes, kWidth, kHeight, kPlanes, 0, image,
                                                     PK_PixelFormatRowBytes(kBGRA, kWidth), kWidth, kHeight,
                                                     kBGRA, 0, 2);
                    }}});
}

std::function<bool()> PrepareScaleConvertOneField() {
    constexpr int32_t kWidth = 61, kHeight = 70;
    PKTest::Random random(72);
    std::vector<Call> calls;
    for (const int32_t field : {1, 2})
        calls.push_back({RandomImage(kBGRA, kWidth, kHeight, random),
                         [=, source = RandomImage(kUYVY, kWidth, kHeight, random)](uint8_t* image) {
                             return PK_ScaleConvertOneField(
                                 source.data(), PK_PixelFormatRowBytes(kUYVY, kWidth), kWidth, kHeight, kUYVY,
                                 1, image, PK_PixelFormatRowBytes(kBGRA, kWidth), kWidth, kHeight, kBGRA, 2,
                                 4, field);
                         }});
    return Repeat(calls);
}

const Operation sScaleConvert("scale-convert", PrepareScaleConvert);
const Operation sScaleConvertPlanar("scale-convert-planar", PrepareScaleConvertPlanar);
const Operation sScaleConvertOneField("scale-convert-one-field", PrepareScaleConvertOneField);

} // namespace
