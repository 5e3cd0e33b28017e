// FFmpeg's swscale, to half of each side. It widens its filters for what gets smaller.

#include "operations/Operation.h"

extern "C" {
#include <libavutil/pixfmt.h>
#include <libswscale/swscale.h>
}

#include <memory>

namespace OperationBench {
namespace {

template <AVPixelFormat kFrom, int32_t kFromRowBytes, int kFlags>
Run Halve(const uint8_t* source, uint8_t* destination) {
    const std::shared_ptr<SwsContext> context(sws_getContext(kWidth, kHeight, kFrom, kWidth / 2, kHeight / 2,
                                                             AV_PIX_FMT_BGRA, kFlags, nullptr, nullptr,
                                                             nullptr),
                                              sws_freeContext);
    return [=] {
        const int fromStep = kFromRowBytes, toStep = kBGRARowBytes / 2;
        sws_scale(context.get(), &source, &fromStep, 0, kHeight, &destination, &toStep);
    };
}

template <int kFlags>
constexpr Prepare HalveBGRA = Halve<AV_PIX_FMT_BGRA, kBGRARowBytes, kFlags>;

const AddPeers add = {
    {"Scaling of BGRP 8u to half the size, quality 2", "swscale area", false, HalveBGRA<SWS_AREA>},
    {"Scaling of BGRA 8u to half the size, quality 2", "swscale area", false, HalveBGRA<SWS_AREA>},
    {"Scaling of BGRA 8u to half the size, quality 3", "swscale bilinear", false, HalveBGRA<SWS_BILINEAR>},
    {"Scaling of BGRA 8u to half the size, quality 5", "swscale bicubic (of codes)", false,
     HalveBGRA<SWS_BICUBIC | SWS_ACCURATE_RND>},
    {"Half size of UYVY 8u to BGRA 8u", "swscale point", false,
     Halve<AV_PIX_FMT_UYVY422, 2 * kWidth, SWS_POINT>},
};

} // namespace
} // namespace OperationBench
