// FFmpeg's swscale, on floats, which it takes by way of 16 bits, and on large frames. It widens its filters for what gets
// smaller. By default it gives every second pixel's chroma to pairs of the result.

#include "Reducer.h"
#include "Scaler.h"

extern "C" {
#include <libavutil/pixfmt.h>
#include <libswscale/swscale.h>
}

#include <memory>

namespace Scaling {
namespace {

constexpr int kExact = SWS_ACCURATE_RND | SWS_FULL_CHR_H_INP | SWS_FULL_CHR_H_INT;

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

AVPixelFormat FormatOf(PK_PixelFormat format) {
    return format == kPixels ? AV_PIX_FMT_BGRA : format == kPairs ? AV_PIX_FMT_UYVY422 : AV_PIX_FMT_YUV420P;
}

template <int kFlags>
Reduction Reduce(const tool::Frame& source) {
    const std::shared_ptr<SwsContext> context(
        sws_getContext(kLargeWidth, kLargeHeight, FormatOf(source.Format()), kHalfWidth, kHalfHeight,
                       AV_PIX_FMT_BGRA, kFlags, nullptr, nullptr, nullptr),
        sws_freeContext);
    const bool isTurned = source.Format() == kPixels; // as the result is
    return ReductionTo([=, planes = source.Planes()](tool::Frame& result) {
        const uint8_t* from[4] = {};
        int fromSteps[4] = {};
        for (size_t i = 0; i < planes.size(); ++i) {
            from[i] = planes[i].first;
            fromSteps[i] = planes[i].rowBytes;
        }
        uint8_t* const to[4] = {isTurned ? result.Pixels() : result.Row(0)};
        const int steps[4] = {isTurned ? result.RowBytes() : -result.RowBytes()};
        sws_scale(context.get(), from, fromSteps, 0, kLargeHeight, to, steps);
    });
}

const AddScalers add = {{"swscale bicubic", Bicubic}};

const AddReducers addReducers = {
    {kPixels, "swscale area", Reduce<SWS_AREA>},
    {kPixels, "swscale bicubic", Reduce<SWS_BICUBIC>, false},
    {kPixels, "swscale bicubic, exact", Reduce<SWS_BICUBIC | kExact>},
    {kPairs, "swscale area", Reduce<SWS_AREA>, false},
    {kPairs, "swscale bicubic", Reduce<SWS_BICUBIC>, false},
    {kPairs, "swscale bicubic, exact", Reduce<SWS_BICUBIC | kExact>},
    {kPlanes, "swscale area", Reduce<SWS_AREA>, false},
    {kPlanes, "swscale bicubic", Reduce<SWS_BICUBIC>, false},
    {kPlanes, "swscale bicubic, exact", Reduce<SWS_BICUBIC | kExact>},
};

} // namespace
} // namespace Scaling
