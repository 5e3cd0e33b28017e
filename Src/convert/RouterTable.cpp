// The table by source format, its rows tried from the top. A row without a next format leads straight to the
// destination. Where no row fits, the router's fallback rules take over.

#include "convert/RouterTable.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>

namespace PK {

namespace {

using enum Kernel;

// Kinds of destination.
constexpr FormatTest kAny{0, 0};
constexpr FormatTest kAt8u{kDepthMask, kDepth8u};
constexpr FormatTest kAt15u{kDepthMask, kDepth15u};
constexpr FormatTest kWithoutAlpha{kAlphaMask, kAlphaNone};
constexpr FormatTest kMeaninglessAlpha{kAlphaMask, kAlphaMeaningless};
constexpr FormatTest kStraight{kAlphaMask, kAlphaStraight};
constexpr FormatTest kRGB{kModelMask, kModelRGB};
constexpr FormatTest kRGBAt8u{kModelMask | kDepthMask, kModelRGB | kDepth8u};
constexpr FormatTest kPremultipliedRGBAt8u{kModelMask | kDepthMask | kAlphaMask,
                                           kModelRGB | kDepth8u | kAlphaPremultiplied};
constexpr FormatTest kYUV{kModelMask, kModelYUV};
constexpr FormatTest kYUVAt8u{kModelMask | kDepthMask, kModelYUV | kDepth8u};
constexpr FormatTest kYUV601{kModelMask | kMatrixMask, kModelYUV | kMatrix601};
constexpr FormatTest kYUV709{kModelMask | kMatrixMask, kModelYUV | kMatrix709};
constexpr FormatTest kYUV601At8u{kModelMask | kMatrixMask | kDepthMask, kModelYUV | kMatrix601 | kDepth8u};
constexpr FormatTest kYUV709At8u{kModelMask | kMatrixMask | kDepthMask, kModelYUV | kMatrix709 | kDepth8u};
constexpr FormatTest k422{kStructureMask, kStructure422};
constexpr FormatTest k422In601{kStructureMask | kMatrixMask, kStructure422 | kMatrix601};
constexpr FormatTest k422In709{kStructureMask | kMatrixMask, kStructure422 | kMatrix709};
constexpr FormatTest k422In601At8u{kStructureMask | kMatrixMask | kDepthMask,
                                   kStructure422 | kMatrix601 | kDepth8u};
constexpr FormatTest k422InYUYVOrder{kStructureMask | kOrderMask, kStructure422 | kOrderARGB};

// Four-channel formats without their alpha kind.
constexpr PK_PixelFormat kBGR8u = kModelRGB | kDepth8u;
constexpr PK_PixelFormat kBGR15u = kModelRGB | kDepth15u;
constexpr PK_PixelFormat kBGR32f = kModelRGB | kDepth32f;
constexpr PK_PixelFormat kVUY8u601 = kModelYUV | kDepth8u | kMatrix601 | kRangeVideo;
constexpr PK_PixelFormat kVUY8u709 = kModelYUV | kDepth8u | kMatrix709 | kRangeVideo;

// Those formats with any alpha kind, as destination.
constexpr FormatTest kAnyBGR8u{~kAlphaMask, kBGR8u};
constexpr FormatTest kAnyVUY8u{~kAlphaMask, kVUY8u601};
constexpr FormatTest kAnyVUY8u709{~kAlphaMask, kVUY8u709};

constexpr RouterRow kFrom_VUYA_4444_8u[] = {
    {PK_PixelFormat_VUYA_4444_8u_709, YUV601To709Row},
    {PK_PixelFormat_VUYP_4444_32f, VUYA8uToVUYP32fRow},
    {k422, PremultiplyRow_VUYA_8u, PK_PixelFormat_VUYP_4444_8u},
    {kYUV709At8u, YUV601To709Row, PK_PixelFormat_VUYA_4444_8u_709},
    {kRGBAt8u, YUV601ToRGBRow, PK_PixelFormat_BGRA_4444_8u},
    {kRGB, YUV601ToRGB32fRow, PK_PixelFormat_BGRA_4444_32f},
};

constexpr RouterRow kFrom_VUYP_4444_8u[] = {
    {PK_PixelFormat_VUYP_4444_8u_709, YUV601To709Row},
    {k422, Downsample444To422Row, PK_PixelFormat_UYVY_422_8u},
    {kRGBAt8u, YUV601ToRGBRow, PK_PixelFormat_BGRP_4444_8u},
    {kRGB, YUV601ToRGB32fRow, PK_PixelFormat_BGRP_4444_32f},
};

constexpr RouterRow kFrom_VUYX_4444_8u[] = {
    {k422In601, Downsample444To422Row, PK_PixelFormat_UYVY_422_8u},
    {k422In709, YUV601To709Row, PK_PixelFormat_VUYP_4444_8u_709},
    {kYUV709, YUV601To709Row, NextFormat::WithAlpha(kVUY8u709)},
    {kRGBAt8u, VUYX8uToRGB8uRow_601, NextFormat::WithAlpha(kBGR8u)},
    {kRGB, VUYX8uToRGB32fRow_601, NextFormat::WithAlpha(kBGR32f)},
};

constexpr RouterRow kFrom_VUYA_4444_8u_709[] = {
    {PK_PixelFormat_VUYA_4444_8u, YUV709To601Row},
    {PK_PixelFormat_VUYP_4444_32f_709, VUYA8uToVUYP32fRow},
    {k422, PremultiplyRow_VUYA_8u, PK_PixelFormat_VUYP_4444_8u_709},
    {kYUV601At8u, YUV709To601Row, PK_PixelFormat_VUYA_4444_8u},
    {kRGBAt8u, YUV709ToRGBRow, PK_PixelFormat_BGRA_4444_8u},
    {kRGB, YUV709ToRGB32fRow, PK_PixelFormat_BGRA_4444_32f},
};

constexpr RouterRow kFrom_VUYP_4444_8u_709[] = {
    {PK_PixelFormat_VUYP_4444_8u, YUV709To601Row},
    {k422, Downsample444To422Row, PK_PixelFormat_UYVY_422_8u_709},
    {kRGBAt8u, YUV709ToRGBRow, PK_PixelFormat_BGRP_4444_8u},
    {kRGB, YUV709ToRGB32fRow, PK_PixelFormat_BGRP_4444_32f},
};

constexpr RouterRow kFrom_VUYX_4444_8u_709[] = {
    {k422In709, Downsample444To422Row, PK_PixelFormat_UYVY_422_8u_709},
    {k422In601, YUV709To601Row, PK_PixelFormat_VUYP_4444_8u},
    {kYUV601, YUV709To601Row, NextFormat::WithAlpha(kVUY8u601)},
    {kRGBAt8u, VUYX8uToRGB8uRow_709, NextFormat::WithAlpha(kBGR8u)},
    {kRGB, VUYX8uToRGB32fRow_709, NextFormat::WithAlpha(kBGR32f)},
};

constexpr RouterRow kFrom_VUYA_4444_32f[] = {
    {PK_PixelFormat_VUYA_4444_32f_709, YUV601To709Float32Row},
    {PK_PixelFormat_BGRA_4444_32f, YUV601ToRGBFloat32Row},
    {k422, PremultiplyRow_BGRA_32f, PK_PixelFormat_VUYP_4444_32f},
};

constexpr RouterRow kFrom_VUYP_4444_32f[] = {
    {PK_PixelFormat_VUYP_4444_32f_709, YUV601To709Float32Row},
    {PK_PixelFormat_BGRP_4444_32f, YUV601ToRGBFloat32Row},
    {PK_PixelFormat_UYVY_422_32f, Downsample444To422Float32Row},
    {k422In601At8u, PackFrom32fRow_VUYA_8u, PK_PixelFormat_VUYP_4444_8u},
};

constexpr RouterRow kFrom_VUYA_4444_32f_709[] = {
    {PK_PixelFormat_VUYA_4444_32f, YUV709To601Float32Row},
    {PK_PixelFormat_BGRA_4444_32f, YUV709ToRGBFloat32Row},
};

constexpr RouterRow kFrom_VUYP_4444_32f_709[] = {
    {PK_PixelFormat_VUYP_4444_32f, YUV709To601Float32Row},
    {PK_PixelFormat_BGRP_4444_32f, YUV709ToRGBFloat32Row},
    {PK_PixelFormat_UYVY_422_32f_709, Downsample444To422Float32Row},
};

constexpr RouterRow kFrom_BGRA_4444_8u[] = {
    {PK_PixelFormat_VUYA_4444_8u, RGBToYUV601Row},
    {PK_PixelFormat_VUYA_4444_8u_709, RGBToYUV709Row},
    {PK_PixelFormat_BGRA_4444_32f_Linear, Gamma8uToLinearFloat32Row},
    {PK_PixelFormat_ARGB_4444_15u, Expand8uTo15uRow, PK_PixelFormat_BGRA_4444_15u},
    {PK_PixelFormat_BGRA_4444_15u, Expand8uTo15uRow},
    {PK_PixelFormat_BGRP_4444_32f, BGRA8uToBGRP32fRow},
    {kPremultipliedRGBAt8u, PremultiplyRow_BGRA_8u, PK_PixelFormat_BGRP_4444_8u},
    {kRGBAt8u, PremultiplyRow_BGRA_8u, PK_PixelFormat_BGRX_4444_8u},
    {kYUV601At8u, RGBToYUV601Row, PK_PixelFormat_VUYA_4444_8u},
    {kYUVAt8u, RGBToYUV709Row, PK_PixelFormat_VUYA_4444_8u_709},
    {kYUV, ExpandTo32fRow_RGB_8u, PK_PixelFormat_BGRA_4444_32f},
};

constexpr RouterRow kFrom_BGRP_4444_8u[] = {
    {PK_PixelFormat_VUYP_4444_8u, RGBToYUV601Row},
    {PK_PixelFormat_VUYP_4444_8u_709, RGBToYUV709Row},
    {PK_PixelFormat_RGB_444_10u, BGR8uToRGB10uRow},
    {kStraight, UnpremultiplyRow_BGRA_8u, PK_PixelFormat_BGRA_4444_8u},
    {kWithoutAlpha, ForceOpaqueRow_BGRA_8u, PK_PixelFormat_BGRX_4444_8u},
    {kMeaninglessAlpha, ForceOpaqueRow_BGRA_8u, PK_PixelFormat_BGRX_4444_8u},
};

constexpr RouterRow kFrom_BGRA_4444_32f[] = {
    {PK_PixelFormat_VUYA_4444_32f, RGBToYUV601Float32Row},
    {PK_PixelFormat_VUYA_4444_32f_709, RGBToYUV709Float32Row},
    {PK_PixelFormat_BGRA_4444_32f_Linear, GammaToLinearRow},
    {PK_PixelFormat_BGRA_4444_15u, PackFrom32fRow_RGB_15u},
    {PK_PixelFormat_VUYA_4444_8u, RGB32fToYUV601_8uRow},
    {PK_PixelFormat_VUYA_4444_8u_709, RGB32fToYUV709_8uRow},
};

constexpr RouterRow kFrom_BGRP_4444_32f[] = {
    {PK_PixelFormat_RGB_444_10u, BGR32fToRGB10uRow},
    {PK_PixelFormat_VUYP_4444_32f, RGBToYUV601Float32Row},
    {PK_PixelFormat_VUYP_4444_32f_709, RGBToYUV709Float32Row},
};

constexpr RouterRow kFrom_UYVY_422_8u[] = {
    {kAnyBGR8u, UYVY601ToBGR8uRow},
    {kAnyVUY8u, Upsample422To444Row_UYVY},
    {PK_PixelFormat_V210_422_10u, UYVY8uToV210Row},
    {kYUV709, UYVY601To709Row, PK_PixelFormat_UYVY_422_8u_709},
    {k422, SwapOrderRow_422_8u, PK_PixelFormat_YUYV_422_8u},
    {kAny, Upsample422To444Row_UYVY, NextFormat::WithAlpha(kVUY8u601)},
};

constexpr RouterRow kFrom_UYVY_422_8u_709[] = {
    {kAnyBGR8u, UYVY709ToBGR8uRow},
    {kAnyVUY8u709, Upsample422To444Row_UYVY},
    {PK_PixelFormat_V210_422_10u_709, UYVY8uToV210Row},
    {PK_PixelFormat_UYVY_422_8u, UYVY709To601Row},
    {kYUV601, UYVY709To601Row, PK_PixelFormat_UYVY_422_8u},
    {k422InYUYVOrder, SwapOrderRow_422_8u, PK_PixelFormat_YUYV_422_8u_709},
};

constexpr RouterRow kFrom_YUYV_422_8u[] = {
    {kAnyBGR8u, YUYV601ToBGR8uRow},
    {PK_PixelFormat_YUYV_422_8u_709, YUYV601To709Row},
    {kAnyVUY8u, Upsample422To444Row_YUYV},
};

constexpr RouterRow kFrom_YUYV_422_8u_709[] = {
    {kAnyBGR8u, YUYV709ToBGR8uRow},
    {PK_PixelFormat_YUYV_422_8u, YUYV709To601Row},
    {kAnyVUY8u709, Upsample422To444Row_YUYV},
};

constexpr RouterRow kFrom_UYVY_422_32f[] = {
    {PK_PixelFormat_VUYA_4444_32f, Upsample422To444Float32Row_Repeat},
    {PK_PixelFormat_VUYP_4444_32f, Upsample422To444Float32Row_Repeat},
};

constexpr RouterRow kFrom_UYVY_422_32f_709[] = {
    {PK_PixelFormat_VUYA_4444_32f_709, Upsample422To444Float32Row_Repeat},
    {PK_PixelFormat_VUYP_4444_32f_709, Upsample422To444Float32Row_Repeat},
};

constexpr RouterRow kFrom_V210_422_10u[] = {
    {kAnyBGR8u, V210ToBGR8uRow_601},
    {kAnyVUY8u, V210ToVUY8uRow},
    {PK_PixelFormat_UYVY_422_8u, V210ToUYVY8uRow},
};

constexpr RouterRow kFrom_V210_422_10u_709[] = {
    {kAnyBGR8u, V210ToBGR8uRow_709},
    {kAnyVUY8u709, V210ToVUY8uRow},
    {kAnyVUY8u, V210709ToVUY601_8uRow},
    {PK_PixelFormat_UYVY_422_8u, V210ToUYVY8uRow, PK_PixelFormat_UYVY_422_8u_709},
    {PK_PixelFormat_UYVY_422_8u_709, V210ToUYVY8uRow},
};

constexpr RouterRow kFrom_BGRA_4444_15u[] = {
    {kAt8u, Pack15uTo8uRow, PK_PixelFormat_BGRA_4444_8u},
    // The kernel of the other direction: deliberate, results on this way rely on it.
    {PK_PixelFormat_RGB_444_10u, UnpremultiplyRow_BGRA_15u, PK_PixelFormat_BGRP_4444_15u},
    {kAny, ExpandTo32fRow_RGB_15u, PK_PixelFormat_BGRA_4444_32f},
};

constexpr RouterRow kFrom_BGRP_4444_15u[] = {
    {kAt8u, Pack15uTo8uRow, PK_PixelFormat_BGRP_4444_8u},
    {PK_PixelFormat_RGB_444_10u, BGR15uToRGB10uRow},
    {kAny, ExpandTo32fRow_RGB_15u, PK_PixelFormat_BGRP_4444_32f},
};

constexpr RouterRow kFrom_BGRX_4444_15u[] = {
    {kAt8u, Pack15uTo8uRow, PK_PixelFormat_BGRX_4444_8u},
    {PK_PixelFormat_RGB_444_10u, BGR15uToRGB10uRow},
    {kAny, ExpandTo32fRow_RGB_15u, PK_PixelFormat_BGRX_4444_32f},
};

constexpr RouterRow kFrom_ARGB_4444_15u[] = {
    {kAny, SwapOrderRow_4444_15u, PK_PixelFormat_BGRA_4444_15u},
};

constexpr RouterRow kFrom_RGB_444_10u[] = {
    {kAt8u, RGB10uToBGR8uRow, NextFormat::WithAlpha(kBGR8u)},
    {kAt15u, RGB10uToBGR15uRow, NextFormat::WithAlpha(kBGR15u)},
    {kAny, RGB10uToBGR32fRow, NextFormat::WithAlpha(kBGR32f)},
};

constexpr RouterRow kFrom_BGRA_4444_32f_Linear[] = {
    {PK_PixelFormat_BGRA_4444_32f, LinearToGammaRow},
    {PK_PixelFormat_BGRA_4444_8u, LinearFloat32ToGamma8uRow},
};

constexpr RouterSource kTable[] = {
    {PK_PixelFormat_VUYA_4444_8u, kFrom_VUYA_4444_8u},
    {PK_PixelFormat_VUYP_4444_8u, kFrom_VUYP_4444_8u},
    {PK_PixelFormat_VUYX_4444_8u, kFrom_VUYX_4444_8u},
    {PK_PixelFormat_VUYA_4444_8u_709, kFrom_VUYA_4444_8u_709},
    {PK_PixelFormat_VUYP_4444_8u_709, kFrom_VUYP_4444_8u_709},
    {PK_PixelFormat_VUYX_4444_8u_709, kFrom_VUYX_4444_8u_709},
    {PK_PixelFormat_VUYA_4444_32f, kFrom_VUYA_4444_32f},
    {PK_PixelFormat_VUYP_4444_32f, kFrom_VUYP_4444_32f},
    {PK_PixelFormat_VUYA_4444_32f_709, kFrom_VUYA_4444_32f_709},
    {PK_PixelFormat_VUYP_4444_32f_709, kFrom_VUYP_4444_32f_709},
    {PK_PixelFormat_BGRA_4444_8u, kFrom_BGRA_4444_8u},
    {PK_PixelFormat_BGRP_4444_8u, kFrom_BGRP_4444_8u},
    {PK_PixelFormat_BGRA_4444_32f, kFrom_BGRA_4444_32f},
    {PK_PixelFormat_BGRP_4444_32f, kFrom_BGRP_4444_32f},
    {PK_PixelFormat_UYVY_422_8u, kFrom_UYVY_422_8u},
    {PK_PixelFormat_UYVY_422_8u_709, kFrom_UYVY_422_8u_709},
    {PK_PixelFormat_YUYV_422_8u, kFrom_YUYV_422_8u},
    {PK_PixelFormat_YUYV_422_8u_709, kFrom_YUYV_422_8u_709},
    {PK_PixelFormat_UYVY_422_32f, kFrom_UYVY_422_32f},
    {PK_PixelFormat_UYVY_422_32f_709, kFrom_UYVY_422_32f_709},
    {PK_PixelFormat_V210_422_10u, kFrom_V210_422_10u},
    {PK_PixelFormat_V210_422_10u_709, kFrom_V210_422_10u_709},
    {PK_PixelFormat_BGRA_4444_15u, kFrom_BGRA_4444_15u},
    {PK_PixelFormat_BGRP_4444_15u, kFrom_BGRP_4444_15u},
    {PK_PixelFormat_BGRX_4444_15u, kFrom_BGRX_4444_15u},
    {PK_PixelFormat_ARGB_4444_15u, kFrom_ARGB_4444_15u},
    {PK_PixelFormat_RGB_444_10u, kFrom_RGB_444_10u},
    {PK_PixelFormat_BGRA_4444_32f_Linear, kFrom_BGRA_4444_32f_Linear},
};

} // namespace

std::span<const RouterSource> RouterTable() {
    return kTable;
}

const RouterRow* FindRouterRow(PK_PixelFormat source, PK_PixelFormat destination) {
    const auto entry = std::ranges::find(kTable, source, &RouterSource::source);
    if (entry == std::end(kTable)) return nullptr;

    const auto row = std::ranges::find_if(entry->rows, [destination](const RouterRow& candidate) {
        return candidate.destination(destination);
    });
    return row != entry->rows.end() ? &*row : nullptr;
}

} // namespace PK
