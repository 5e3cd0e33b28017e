// FFmpeg's swscale, by its fastest flags. It runs on the calling thread.

#include "frames/Peer.h"
#include "frames/peers/Planes.h"

extern "C" {
#include <libavutil/pixfmt.h>
#include <libswscale/swscale.h>
}

#include <array>

namespace FrameBench {
namespace {

struct Picture {
    Size size;
    std::array<uint8_t*, 4> planes;
    std::array<int, 4> rowBytes;
};

Picture Interleaved(const Image& image) {
    const Rows rows = FromTop(image);
    return {image.size, {rows.first}, {rows.rowBytes}};
}

Picture Planar(const Planes& planes, Size size) {
    return {size,
            {planes.Plane(0), planes.Plane(1), planes.Plane(2), planes.Plane(3)},
            {size.width, size.width, size.width, size.width}};
}

Run Scale(const Picture& from, AVPixelFormat source, const Picture& to, AVPixelFormat destination) {
    const auto [width, height] = from.size;
    const std::shared_ptr<SwsContext> context(sws_getContext(width, height, source, width, height,
                                                             destination, SWS_FAST_BILINEAR, nullptr, nullptr,
                                                             nullptr),
                                              sws_freeContext);
    return [=] {
        sws_scale(context.get(), from.planes.data(), from.rowBytes.data(), 0, from.size.height,
                  to.planes.data(), to.rowBytes.data());
    };
}

template <AVPixelFormat kSource, AVPixelFormat kDestination>
Run BetweenInterleaved(const Image& source, const Image& destination) {
    return Scale(Interleaved(source), kSource, Interleaved(destination), kDestination);
}

Run ToPlanar(const Image& source, const Image&) {
    const Size size = source.size;
    const auto planes = std::make_shared<Planes>(4, size.width, size.height);
    const Run run = Scale(Interleaved(source), AV_PIX_FMT_BGRA, Planar(*planes, size), AV_PIX_FMT_YUVA444P);
    return [planes, run] { run(); };
}

Run FromPlanar(const Image&, const Image& destination) {
    const Size size = destination.size;
    const auto planes = std::make_shared<Planes>(4, size.width, size.height);
    planes->Fill<uint8_t>(size.width, 16, 236);
    const Run run =
        Scale(Planar(*planes, size), AV_PIX_FMT_YUVA444P, Interleaved(destination), AV_PIX_FMT_BGRA);
    return [planes, run] { run(); };
}

const AddPeers add = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_8u, "swscale", Likeness::Same,
     BetweenInterleaved<AV_PIX_FMT_BGRA, AV_PIX_FMT_ARGB>},
    {PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_UYVY_422_8u, "swscale", Likeness::Same,
     BetweenInterleaved<AV_PIX_FMT_BGR0, AV_PIX_FMT_UYVY422>},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u, "swscale", Likeness::Same,
     BetweenInterleaved<AV_PIX_FMT_UYVY422, AV_PIX_FMT_BGRA>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u, "swscale (planar)", Likeness::OtherLayout,
     ToPlanar},
    {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRA_4444_8u, "swscale (planar)", Likeness::OtherLayout,
     FromPlanar},
};

} // namespace
} // namespace FrameBench
