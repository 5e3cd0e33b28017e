#pragma once

// What the frame benchmark measures.

#include <PixelKiln/PixelFormat.h>

namespace FrameBench {

/// What a conversion should reach.
enum class Aim {
    Copy,        ///< 0.95 of memcpy
    CopyInCache, ///< none: by rule such a copy goes past the cache, in which memcpy's stays
    ByteMove,    ///< 0.8 of memcpy
    BestPeer,    ///< level with the fastest peer
};

/// What size the frames have. Where memory is what costs, frames of 2160 lines are measured too.
enum class Sizes { HD, HDAndUHD };

struct Work {
    const char* name;
    PK_PixelFormat source;
    PK_PixelFormat destination;
    Aim aim;
    Sizes sizes = Sizes::HD;
};

// clang-format off: one row a work
inline constexpr Work kWorks[] = {
    {"BGRA 8u, copy", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_8u, Aim::CopyInCache},
    {"UYVY 8u, copy", PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u, Aim::CopyInCache},
    {"BGRA 32f, copy", PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_32f, Aim::Copy},

    {"BGRA 8u to ARGB 8u", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_8u, Aim::ByteMove,
     Sizes::HDAndUHD},
    {"UYVY 8u to YUYV 8u", PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_YUYV_422_8u, Aim::ByteMove},
    {"BGRA 15u to ARGB 15u", PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_ARGB_4444_15u, Aim::ByteMove},
    {"BGRA 32f to ARGB 32f", PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_ARGB_4444_32f, Aim::ByteMove},
    {"BGRP 8u to BGRX 8u, opaque", PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRX_4444_8u, Aim::ByteMove},

    {"BGRA 8u to BGRP 8u", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRP_4444_8u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"BGRP 8u to BGRA 8u", PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer,
     Sizes::HDAndUHD},

    {"BGRA 8u to BGRA 32f", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_32f, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"BGRA 32f to BGRA 8u", PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"BGRA 8u to BGRA 15u", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_15u, Aim::BestPeer},
    {"BGRA 15u to BGRA 8u", PK_PixelFormat_BGRA_4444_15u, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer},
    {"BGRP 8u to RGB 10u", PK_PixelFormat_BGRP_4444_8u, PK_PixelFormat_RGB_444_10u, Aim::BestPeer},
    {"BGRX 8u to RGB 10u, by way of 32f", PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_RGB_444_10u,
     Aim::BestPeer},
    {"RGB 10u to BGRX 8u", PK_PixelFormat_RGB_444_10u, PK_PixelFormat_BGRX_4444_8u, Aim::BestPeer},

    {"BGRX 8u to UYVY 8u", PK_PixelFormat_BGRX_4444_8u, PK_PixelFormat_UYVY_422_8u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"BGRA 8u to UYVY 8u, premultiplied on the way", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_UYVY_422_8u,
     Aim::BestPeer},
    {"UYVY 8u to BGRA 8u", PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"BGRA 8u to VUYA 8u", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_VUYA_4444_8u, Aim::BestPeer},
    {"VUYA 8u to BGRA 8u", PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer},
    {"BGRA 32f to VUYA 32f", PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_VUYA_4444_32f, Aim::BestPeer},
    {"VUYA 32f to BGRA 32f", PK_PixelFormat_VUYA_4444_32f, PK_PixelFormat_BGRA_4444_32f, Aim::BestPeer},

    {"UYVY 8u to V210", PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_V210_422_10u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"V210 to UYVY 8u", PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_8u, Aim::BestPeer,
     Sizes::HDAndUHD},
    {"V210 to UYVY 32f", PK_PixelFormat_V210_422_10u, PK_PixelFormat_UYVY_422_32f, Aim::BestPeer},
    {"UYVY 32f to V210", PK_PixelFormat_UYVY_422_32f, PK_PixelFormat_V210_422_10u, Aim::BestPeer},
    {"V210 to BGRA 8u", PK_PixelFormat_V210_422_10u, PK_PixelFormat_BGRA_4444_8u, Aim::BestPeer,
     Sizes::HDAndUHD},

    {"BGRA 8u to linear BGRA 32f", PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_BGRA_4444_32f_Linear,
     Aim::BestPeer},
    {"linear BGRA 32f to BGRA 8u", PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_BGRA_4444_8u,
     Aim::BestPeer},
    {"BGRA 32f to linear BGRA 32f", PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_32f_Linear,
     Aim::BestPeer},
    {"linear BGRA 32f to BGRA 32f", PK_PixelFormat_BGRA_4444_32f_Linear, PK_PixelFormat_BGRA_4444_32f,
     Aim::BestPeer},
};
// clang-format on

} // namespace FrameBench
