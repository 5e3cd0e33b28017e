// Images placed in others, on the calling thread and in bands, by every way to sample and to draw.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Motion.h>

namespace {

using namespace PKStress;

struct Placing {
    PK_PixelFormat source, destination;
    int32_t width, height, quality; ///< of the destination; the source has half the rows more
    PK_Point scale;
    double rotation = 0;
    int32_t sourceField = 0, destinationField = 0;
    bool composite = false;
};

constexpr PK_PixelFormat kBGRA = PK_PixelFormat_BGRA_4444_8u, kLinear = PK_PixelFormat_BGRP_4444_32f_Linear;

constexpr Placing kPlacings[] = {
    {kBGRA, kBGRA, 61, 30, 2, {1, 1}},
    {kBGRA, PK_PixelFormat_UYVY_422_8u, 61, 70, 2, {1.3f, 0.8f}, 0, 0, 0, true},
    {kBGRA, kBGRA, 61, 70, 4, {0.7f, 0.8f}, 17}, // blurred first
    {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_V210_422_10u, 70, 66, 3, {1.2f, 0.6f}, 0, 1, 2, true},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_BGRA_4444_32f, 50, 40, 1, {1.4f, 1.1f}, -100, 2, 0},
    {kLinear, kBGRA, 50, 70, 5, {0.6f, 1.4f}},
    {kLinear, PK_PixelFormat_RGB_444_10u, 50, 70, 5, {1.1f, 1.4f}, 12, 1, 1, true}, // made progressive first
    {kBGRA, kBGRA, 7001, 40, 2, {1, 0.9f}, 0, 0, 0, true},                          // rows of the recycler
};

Call Place(const Placing& job, PKTest::Random& random) {
    const int32_t height = job.height + job.height / 2;
    return {RandomImage(job.destination, job.width, job.height, random),
            [=, source = RandomImage(job.source, job.width, height, random)](uint8_t* image) {
                return PK_Motion(source.data(), PK_PixelFormatRowBytes(job.source, job.width), job.width,
                                 height, job.source, job.sourceField, nullptr, image,
                                 PK_PixelFormatRowBytes(job.destination, job.width), job.width, job.height,
                                 job.destination, job.destinationField, 10, 11, {0.47f, 0.52f}, {0.5f, 0.5f},
                                 job.scale, job.rotation, 0.8f, job.composite, 0, true, 0, job.quality,
                                 false);
            }};
}

std::function<bool()> PrepareMotion() {
    PKTest::Random random(67);
    std::vector<Call> calls;
    for (const Placing& placing : kPlacings) calls.push_back(Place(placing, random));
    return Repeat(calls);
}

Call PlaceByMode(PK_BlendMode mode, PKTest::Random& random) {
    constexpr int32_t kWidth = 61, kHeight = 70;
    return {RandomImage(kBGRA, kWidth, kHeight, random),
            [=, source = RandomImage(kBGRA, kWidth, kHeight, random)](uint8_t* image) {
                return PK_MotionWithBlendMode(source.data(), 4 * kWidth, kWidth, kHeight, kBGRA, 0, nullptr,
                                              image, 4 * kWidth, kWidth, kHeight, kBGRA, 0, 1, 1,
                                              {0.47f, 0.52f}, {0.5f, 0.5f}, {1.1f, 0.9f}, 25, 0.8f, 0.5,
                                              false, 0, mode, 4, false);
            }};
}

std::function<bool()> PrepareModes() {
    PKTest::Random random(68);
    std::vector<Call> calls;
    for (const PK_BlendMode mode : {PK_BlendMode_Multiply, PK_BlendMode_Screen, PK_BlendMode_Hue})
        calls.push_back(PlaceByMode(mode, random));
    return Repeat(calls);
}

const Operation sMotion("motion", PrepareMotion);
const Operation sModes("motion-modes", PrepareModes);

} // namespace
