// libyuv. Its names give a pixel as a little-endian word: its "ARGB" is BGRA in memory, its "BGRA" is ARGB.

#include "frames/Peer.h"
#include "frames/peers/Planes.h"

#include <libyuv.h>

namespace FrameBench {
namespace {

using Function = int (*)(const uint8_t*, int, uint8_t*, int, int, int);

// A function from one interleaved image to another, both read from the top of the picture.
template <Function function>
Run Interleaved(const Image& source, const Image& destination) {
    const Rows from = FromTop(source);
    const Rows to = FromTop(destination);
    return [=, size = source.size] {
        function(from.first, from.rowBytes, to.first, to.rowBytes, size.width, size.height);
    };
}

Run SwapPairs(const Image& source, const Image& destination) {
    return [from = FromTop(source), to = FromTop(destination), size = source.size] {
        libyuv::SwapUVPlane(from.first, from.rowBytes, to.first, to.rowBytes, size.width, size.height);
    };
}

Run ToPlanar(const Image& source, const Image&) {
    const int32_t width = source.size.width, height = source.size.height;
    return [=, from = FromTop(source), to = std::make_shared<Planes>(3, width, height)] {
        libyuv::ARGBToI444(from.first, from.rowBytes, to->Plane(0), width, to->Plane(1), width, to->Plane(2),
                           width, width, height);
    };
}

Run FromPlanar(const Image&, const Image& destination) {
    const int32_t width = destination.size.width, height = destination.size.height;
    const auto from = std::make_shared<Planes>(4, width, height);
    from->Fill<uint8_t>(width, 16, 236);
    return [=, to = FromTop(destination)] {
        libyuv::I444AlphaToARGB(from->Plane(0), width, from->Plane(1), width, from->Plane(2), width,
                                from->Plane(3), width, to.first, to.rowBytes, width, height, 0);
    };
}

const AddPeers add = {
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_8u, "libyuv ARGBToBGRA", Likeness::Same,
     Interleaved<libyuv::ARGBToBGRA>},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_YUYV_422_8u, "libyuv SwapUVPlane", Likeness::Same, SwapPairs},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, "libyuv ARGBAttenuate", Likeness::Same,
     Interleaved<libyuv::ARGBAttenuate>},
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRA_4444_8u, "libyuv ARGBUnattenuate", Likeness::Same,
     Interleaved<libyuv::ARGBUnattenuate>},
    {PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_RGB_444_10u, "libyuv ARGBToAR30 (other bit order)",
     Likeness::OtherLayout, Interleaved<libyuv::ARGBToAR30>},
    {PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_RGB_444_10u, "libyuv ARGBToAR30 (other bit order)",
     Likeness::OtherLayout, Interleaved<libyuv::ARGBToAR30>},
    {PK_PixelFormat_RGB_444_10u, PK_PixelFormat_BGRX_4444_8u, "libyuv AR30ToARGB (other bit order)",
     Likeness::OtherLayout, Interleaved<libyuv::AR30ToARGB>},
    {PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_UYVY_422_8u, "libyuv ARGBToUYVY", Likeness::Same,
     Interleaved<libyuv::ARGBToUYVY>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u, "libyuv ARGBToUYVY (alpha ignored)",
     Likeness::Part, Interleaved<libyuv::ARGBToUYVY>},
    {PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u, "libyuv UYVYToARGB", Likeness::Same,
     Interleaved<libyuv::UYVYToARGB>},
    {PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u, "libyuv ARGBToI444 (planar, no alpha)",
     Likeness::OtherLayout, ToPlanar},
    {PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRA_4444_8u, "libyuv I444AlphaToARGB (planar)",
     Likeness::OtherLayout, FromPlanar},
};

} // namespace
} // namespace FrameBench
