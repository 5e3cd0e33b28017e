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
    return [=] { function(from.first, from.rowBytes, to.first, to.rowBytes, kWidth, kHeight); };
}

Run SwapPairs(const Image& source, const Image& destination) {
    return [from = FromTop(source), to = FromTop(destination)] {
        libyuv::SwapUVPlane(from.first, from.rowBytes, to.first, to.rowBytes, kWidth, kHeight);
    };
}

Run ToPlanar(const Image& source, const Image&) {
    return [from = FromTop(source), to = std::make_shared<Planes>(3, kWidth)] {
        libyuv::ARGBToI444(from.first, from.rowBytes, to->Plane(0), kWidth, to->Plane(1), kWidth,
                           to->Plane(2), kWidth, kWidth, kHeight);
    };
}

Run FromPlanar(const Image&, const Image& destination) {
    const auto from = std::make_shared<Planes>(4, kWidth);
    from->Fill<uint8_t>(kWidth, 16, 236);
    return [from, to = FromTop(destination)] {
        libyuv::I444AlphaToARGB(from->Plane(0), kWidth, from->Plane(1), kWidth, from->Plane(2), kWidth,
                                from->Plane(3), kWidth, to.first, to.rowBytes, kWidth, kHeight, 0);
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
