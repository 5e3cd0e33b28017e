// Mixes of two images, converted or not.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/CrossDissolve.h>

namespace {

using namespace PKStress;

struct Dissolve {
    PK_PixelFormat first, second, destination;
    int32_t width = 97, height = 33; // odd: ends of rows take part
};

constexpr Dissolve kDissolves[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_ARGB_4444_15u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_YUYV_422_8u_709},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRP_4444_32f, 17001,
     2}, // scratch rows of the recycler
};

Call Mix(const Dissolve& dissolve, PKTest::Random& random) {
    return {RandomImage(dissolve.destination, dissolve.width, dissolve.height, random),
            [dissolve, first = RandomImage(dissolve.first, dissolve.width, dissolve.height, random),
             second = RandomImage(dissolve.second, dissolve.width, dissolve.height, random)](uint8_t* image) {
                const auto rowBytes = [&](PK_PixelFormat format) {
                    return PK_PixelFormatRowBytes(format, dissolve.width);
                };
                return PK_CrossDissolve(first.data(), rowBytes(dissolve.first), dissolve.first, second.data(),
                                        rowBytes(dissolve.second), dissolve.second, image,
                                        rowBytes(dissolve.destination), dissolve.destination, dissolve.width,
                                        dissolve.height, 0.3f, 4);
            }};
}

std::function<bool()> Prepare() {
    PKTest::Random random(61);
    std::vector<Call> calls;
    for (const Dissolve& dissolve : kDissolves) calls.push_back(Mix(dissolve, random));
    return Repeat(calls);
}

const Operation sDissolve("dissolve", Prepare);

} // namespace
