// FFmpeg's V210 codec by itself: only between V210 and planes, which is less than we do.

#include "frames/Peer.h"
#include "frames/peers/V210Codec.h"

namespace FrameBench {
namespace {

Run Decode(const Image& source, const Image&) {
    return [decoder = std::make_shared<V210Decoder>(source)] { decoder->Decode(); };
}

template <AVPixelFormat kFormat>
Run Encode(const Image& source, const Image&) {
    return [encoder = std::make_shared<V210Encoder>(kFormat, source.size)] { encoder->Encode(); };
}

const AddPeers add = {
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u, "FFmpeg v210 encoder (from 8-bit planes)",
     Likeness::Part, Encode<AV_PIX_FMT_YUV422P>},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_8u, "FFmpeg v210 decoder (to 10-bit planes)",
     Likeness::Part, Decode},
    {PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_32f, "FFmpeg v210 decoder (to 10-bit planes)",
     Likeness::Part, Decode},
    {PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_V210_422_10u, "FFmpeg v210 encoder (from 10-bit planes)",
     Likeness::Part, Encode<AV_PIX_FMT_YUV422P10>},
};

} // namespace
} // namespace FrameBench
