// FFmpeg's V210 decoder, then libyuv from its planes to the format that is asked for.

#include "frames/Peer.h"
#include "frames/peers/Planes.h"
#include "frames/peers/V210Codec.h"

#include <libyuv.h>

namespace FrameBench {
namespace {

const uint16_t* Samples(const AVFrame& frame, int plane) {
    return reinterpret_cast<const uint16_t*>(frame.data[plane]);
}

int RowSamples(const AVFrame& frame, int plane) {
    return frame.linesize[plane] / 2;
}

Run ToBGRA(const Image& source, const Image& destination) {
    return [decoder = std::make_shared<V210Decoder>(source), to = FromTop(destination), size = source.size] {
        const AVFrame& frame = decoder->Decode();
        libyuv::I210ToARGB(Samples(frame, 0), RowSamples(frame, 0), Samples(frame, 1), RowSamples(frame, 1),
                           Samples(frame, 2), RowSamples(frame, 2), to.first, to.rowBytes, size.width,
                           size.height);
    };
}

// By way of 8-bit planes, for there is no shorter one.
Run ToUYVY(const Image& source, const Image& destination) {
    const int32_t width = source.size.width, height = source.size.height;
    return [=, decoder = std::make_shared<V210Decoder>(source),
            planes = std::make_shared<Planes>(3, width, height), to = FromTop(destination)] {
        const AVFrame& frame = decoder->Decode();
        libyuv::I210ToI422(Samples(frame, 0), RowSamples(frame, 0), Samples(frame, 1), RowSamples(frame, 1),
                           Samples(frame, 2), RowSamples(frame, 2), planes->Plane(0), width, planes->Plane(1),
                           width, planes->Plane(2), width, width, height);
        libyuv::I422ToUYVY(planes->Plane(0), width, planes->Plane(1), width, planes->Plane(2), width,
                           to.first, to.rowBytes, width, height);
    };
}

const AddPeers add = {
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_8u, "FFmpeg v210 decoder + libyuv I210ToARGB",
     Likeness::Same, ToBGRA},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_8u,
     "FFmpeg v210 decoder + libyuv I210ToI422, I422ToUYVY", Likeness::Same, ToUYVY},
};

} // namespace
} // namespace FrameBench
