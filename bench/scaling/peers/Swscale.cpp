// FFmpeg's swscale, on floats, which it takes by way of 16 bits.

#include "Scaler.h"

extern "C" {
#include <libavutil/pixfmt.h>
#include <libswscale/swscale.h>
}

#include <memory>

namespace Scaling {
namespace {

Grey Bicubic(const Grey& from, int32_t width, int32_t height) {
    const std::unique_ptr<SwsContext, void (*)(SwsContext*)> context(
        sws_getContext(from.width, from.height, AV_PIX_FMT_GRAYF32, width, height, AV_PIX_FMT_GRAYF32,
                       SWS_BICUBIC | SWS_ACCURATE_RND, nullptr, nullptr, nullptr),
        sws_freeContext);
    Grey to(width, height);
    const auto* const source = reinterpret_cast<const uint8_t*>(from.Row(0));
    auto* const destination = reinterpret_cast<uint8_t*>(to.Row(0));
    const int sourceStep = 4 * from.width, step = 4 * width;
    sws_scale(context.get(), &source, &sourceStep, 0, from.height, &destination, &step);
    return to;
}

const AddScalers add = {{"swscale bicubic", Bicubic}};

} // namespace
} // namespace Scaling
