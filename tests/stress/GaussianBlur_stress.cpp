// Gaussian blurs along rows and columns, on the calling thread and in bands.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/GaussianBlur.h>

namespace {

using namespace PKStress;

struct Blurring {
    PK_PixelFormat source, destination;
    int32_t width, height, direction;
    bool linear = false;
};

constexpr Blurring kBlurrings[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, 97, 61, 3},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u, 61, 31, 3},
    {PK_PixelFormat_BGRP_4444_32f, PK_PixelFormat_BGRP_4444_32f, 40, 70, 2},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_BGRA_4444_32f, 70, 40, 1, true},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, 1300, 70,
     3}, // lines of the recycler, in bands
};

Call Blur(const Blurring& job, PKTest::Random& random) {
    constexpr int32_t kMore = 5;
    const int32_t width = job.width + kMore, height = job.height + kMore;
    return {RandomImage(job.destination, width, height, random),
            [=, source = RandomImage(job.source, job.width, job.height, random)](uint8_t* image) {
                return PK_GaussianBlur(source.data(), PK_PixelFormatRowBytes(job.source, job.width),
                                       job.width, job.height, job.source, image,
                                       PK_PixelFormatRowBytes(job.destination, width), width, height,
                                       job.destination, 2.5, 7, true, job.linear, job.direction, 4);
            }};
}

std::function<bool()> PrepareGaussianBlur() {
    PKTest::Random random(61);
    std::vector<Call> calls;
    for (const Blurring& blurring : kBlurrings) calls.push_back(Blur(blurring, random));
    return Repeat(calls);
}

const Operation sGaussianBlur("gaussian-blur", PrepareGaussianBlur);

} // namespace
