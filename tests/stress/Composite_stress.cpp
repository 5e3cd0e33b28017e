// One image over another, by bands and not, plainly and by blend modes.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/Composite.h>

#include <algorithm>

namespace {

using namespace PKStress;

struct Layers {
    PK_PixelFormat top, back, destination;
    int32_t width = 97, height = 33; // odd: ends of rows take part
};

constexpr Layers kLayers[] = {
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_BGRX_4444_8u},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_15u, PK_PixelFormat_VUYA_4444_8u, 61, 67},
    {PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_32f, 61, 130},
    {PK_PixelFormat_VUYA_4444_32f, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u, 6001,
     2}, // scratch rows of the recycler
};

Call Lay(const Layers& layers, PK_BlendMode mode, PKTest::Random& random) {
    return {RandomImage(layers.destination, layers.width, layers.height, random),
            [layers, mode, top = RandomImage(layers.top, layers.width, layers.height, random),
             back = RandomImage(layers.back, layers.width, layers.height, random)](uint8_t* image) {
                const auto rowBytes = [&](PK_PixelFormat format) {
                    return PK_PixelFormatRowBytes(format, layers.width);
                };
                return PK_CompositeWithBlendMode(top.data(), rowBytes(layers.top), layers.top, back.data(),
                                                 rowBytes(layers.back), layers.back, image,
                                                 rowBytes(layers.destination), layers.destination,
                                                 layers.width, layers.height, 0.6f, mode, 4, false);
            }};
}

std::function<bool()> PrepareComposite() {
    PKTest::Random random(53);
    std::vector<Call> calls;
    for (const Layers& layers : kLayers) calls.push_back(Lay(layers, PK_BlendMode_Normal, random));
    return Repeat(calls);
}

std::function<bool()> PrepareModes() {
    PKTest::Random random(54);
    std::vector<Call> calls;
    PK_BlendMode mode = PK_BlendMode_Color;
    for (const Layers& layers : kLayers)
        for (int i = 0; i < 7; ++i, ++mode)
            if (mode != PK_BlendMode_Dissolve && mode <= PK_BlendMode_Divide)
                calls.push_back(Lay(layers, mode, random));
    return Repeat(calls);
}

const Operation sComposite("composite", PrepareComposite);
const Operation sModes("blend-modes", PrepareModes);

/// What is drawn is another thing each time; that every pixel comes from one image or the other is not.
std::function<bool()> PrepareDissolve() {
    constexpr int32_t kWidth = 50, kHeight = 80;
    return [] {
        constexpr PK_PixelFormat kFormat = PK_PixelFormat_BGRA_4444_32f;
        struct Pixel {
            float b, g, r, a;
        };
        const std::vector<Pixel> top(kWidth * kHeight, {1, 1, 1, 0.5f}), back(top.size());
        std::vector<Pixel> result(top.size());
        if (PK_CompositeWithBlendMode(top.data(), 16 * kWidth, kFormat, back.data(), 16 * kWidth, kFormat,
                                      result.data(), 16 * kWidth, kFormat, kWidth, kHeight, 1,
                                      PK_BlendMode_Dissolve, 4, false) != PK_Success)
            return false;
        return std::ranges::all_of(result, [](const Pixel& pixel) {
            return (pixel.b == 1 && pixel.a == 0.5f) || (pixel.b == 0 && pixel.a == 0);
        });
    };
}

const Operation sDissolve("dissolve-mode", PrepareDissolve);

} // namespace
