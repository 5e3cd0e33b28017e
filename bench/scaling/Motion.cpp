// PK_Motion, on pixels of floats.

#include "Scaler.h"

#include "Failure.h"
#include "Frame.h"

namespace Scaling {
namespace {

tool::Frame ToPixels(const Grey& grey, PK_PixelFormat format) {
    tool::Frame frame(format, grey.width, grey.height);
    for (int32_t y = 0; y < grey.height; ++y) {
        auto* to = reinterpret_cast<float*>(frame.Row(y));
        for (int32_t x = 0; x < grey.width; ++x, to += 4) {
            to[0] = to[1] = to[2] = grey.Row(y)[x];
            to[3] = 1;
        }
    }
    return frame;
}

/// The highest quality takes the numbers as light, and no other format; what they mean changes nothing.
template <int32_t kQuality>
Grey Scale(const Grey& from, int32_t width, int32_t height) {
    const PK_PixelFormat format =
        kQuality == 5 ? PK_PixelFormat_BGRP_4444_32f_Linear : PK_PixelFormat_BGRP_4444_32f;
    const tool::Frame source = ToPixels(from, format);
    tool::Frame result(format, width, height);
    constexpr PK_Point kMiddle = {0.5f, 0.5f};
    const PK_Point scale = {static_cast<float>(width) / static_cast<float>(from.width),
                            static_cast<float>(height) / static_cast<float>(from.height)};
    tool::Require(PK_Motion(source.Pixels(), source.RowBytes(), source.Width(), source.Height(), format, 0,
                            nullptr, result.Pixels(), result.RowBytes(), width, height, format, 0, 1, 1,
                            kMiddle, kMiddle, scale, 0, 1, false, 0, false, 0, kQuality, false),
                  "scale", source);
    Grey grey(width, height);
    for (int32_t y = 0; y < height; ++y)
        for (int32_t x = 0; x < width; ++x)
            grey.Row(y)[x] = reinterpret_cast<const float*>(result.Row(y))[4 * x];
    return grey;
}

const AddScalers add = {
    {"PixelKiln, quality 2", Scale<2>},
    {"PixelKiln, quality 3", Scale<3>, false}, // draws what 4 draws
    {"PixelKiln, quality 4", Scale<4>},
    {"PixelKiln, quality 5", Scale<5>},
};

} // namespace
} // namespace Scaling
