// Fields rebuilt in place and beside, by both methods.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Deinterlace.h>

namespace {

using namespace PKStress;

struct Rebuilding {
    PK_PixelFormat source, destination;
    int32_t width = 97, height = 33; // odd: ends of rows take part
};

constexpr Rebuilding kRebuildings[] = {
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRP_4444_8u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_V210_422_10u},
    {PK_PixelFormat_PRGB_4444_15u, PK_PixelFormat_BGRA_4444_8u},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_VUYP_4444_32f, 17001, 4}, // scratch rows of the recycler
};

Call Beside(const Rebuilding& rebuilding, int32_t quality, PKTest::Random& random) {
    return {RandomImage(rebuilding.destination, rebuilding.width, rebuilding.height, random),
            [=, source = RandomImage(rebuilding.source, rebuilding.width, rebuilding.height, random)](
                uint8_t* image) {
                const auto rowBytes = [&](PK_PixelFormat format) {
                    return PK_PixelFormatRowBytes(format, rebuilding.width);
                };
                return PK_DeinterlaceCopy(source.data(), rowBytes(rebuilding.source), rebuilding.source,
                                          image, rowBytes(rebuilding.destination), rebuilding.destination,
                                          rebuilding.width, rebuilding.height, 1, quality);
            }};
}

Call InPlace(const Rebuilding& rebuilding, int32_t quality, PKTest::Random& random) {
    return {RandomImage(rebuilding.source, rebuilding.width, rebuilding.height, random), [=](uint8_t* image) {
                return PK_Deinterlace(image, PK_PixelFormatRowBytes(rebuilding.source, rebuilding.width),
                                      rebuilding.source, rebuilding.width, rebuilding.height, 0, quality);
            }};
}

std::function<bool()> Prepare() {
    PKTest::Random random(63);
    std::vector<Call> calls;
    for (const Rebuilding& rebuilding : kRebuildings)
        for (const int32_t quality : {3, 4}) {
            calls.push_back(Beside(rebuilding, quality, random));
            calls.push_back(InPlace(rebuilding, quality, random));
        }
    return Repeat(calls);
}

const Operation sDeinterlace("deinterlace", Prepare);

} // namespace
