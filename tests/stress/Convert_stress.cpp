// Conversions between formats whose chains have little in common.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Convert.h>

namespace {

using namespace PKStress;

struct Conversion {
    PK_PixelFormat source, destination;
    int32_t width = 97, height = 21; // odd: ends of rows take part
};

constexpr Conversion kConversions[] = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_15u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_32f_Linear},
    {PK_PixelFormat_YUYV_422_8u_709, PK_PixelFormat_RGB_444_10u},
    {PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_V210_422_10u_709},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_V210_422_10u, 17001, 3}, // scratch rows of the recycler
};

std::function<bool()> PrepareConvert() {
    PKTest::Random random(11);
    std::vector<Call> calls;
    for (const Conversion& pair : kConversions)
        calls.push_back(
            {RandomImage(pair.destination, pair.width, pair.height, random),
             [pair, source = RandomImage(pair.source, pair.width, pair.height, random)](uint8_t* image) {
                 return PK_Convert(source.data(), PK_PixelFormatRowBytes(pair.source, pair.width),
                                   pair.source, image, PK_PixelFormatRowBytes(pair.destination, pair.width),
                                   pair.destination, pair.width, pair.height, 4);
             }});
    return Repeat(calls);
}

const Operation sConvert("convert", PrepareConvert);

} // namespace
