#pragma once

// The row kernels by identity, as the router and the chains name them.

#include "convert/ConversionKernels.h"

namespace PK {

/// One kernel: a formula between two neighbouring formats. The part behind the underscore names the member
/// of a family that has several.
enum class Kernel : uint8_t {
    CopyRow_4444_8u, // also RGB_444_10u: four bytes a pixel
    CopyRow_4444_15u,
    CopyRow_4444_32f,
    CopyRow_422_8u,
    CopyRow_422_32f,
    CopyRow_V210,

    ForceOpaqueRow_BGRA_8u,
    ForceOpaqueRow_ARGB_8u,
    ForceOpaqueRow_BGRA_15u,
    ForceOpaqueRow_ARGB_15u,
    ForceOpaqueRow_BGRA_32f,
    ForceOpaqueRow_ARGB_32f,

    SwapOrderRow_4444_8u,
    SwapOrderRow_4444_15u,
    SwapOrderRow_4444_32f,
    SwapOrderRow_422_8u,
    SwapOrderRow_422_32f,

    PremultiplyRow_BGRA_8u,
    PremultiplyRow_ARGB_8u,
    PremultiplyRow_VUYA_8u,
    PremultiplyRow_BGRA_15u,
    PremultiplyRow_ARGB_15u,
    PremultiplyRow_BGRA_32f, // also VUYA
    PremultiplyRow_ARGB_32f,

    UnpremultiplyRow_BGRA_8u,
    UnpremultiplyRow_ARGB_8u,
    UnpremultiplyRow_VUYA_8u,
    UnpremultiplyRow_BGRA_15u,
    UnpremultiplyRow_ARGB_15u,
    UnpremultiplyRow_BGRA_32f, // also VUYA
    UnpremultiplyRow_ARGB_32f,

    ExpandTo32fRow_RGB_8u, // either order
    ExpandTo32fRow_VUYA_8u,
    ExpandTo32fRow_UYVY_8u,
    ExpandTo32fRow_YUYV_8u,
    ExpandTo32fRow_RGB_15u, // either order

    PackFrom32fRow_RGB_8u, // either order
    PackFrom32fRow_VUYA_8u,
    PackFrom32fRow_UYVY_8u,
    PackFrom32fRow_YUYV_8u,
    PackFrom32fRow_RGB_15u, // either order

    Expand8uTo15uRow,
    Pack15uTo8uRow,

    RGBToYUV601Row,
    RGBToYUV709Row,
    RGBToYUV601Float32Row,
    RGBToYUV709Float32Row,
    RGB32fToYUV601_8uRow,
    RGB32fToYUV709_8uRow,

    YUV601ToRGBRow,
    YUV709ToRGBRow,
    YUV601ToRGB32fRow,
    YUV709ToRGB32fRow,
    YUV601ToRGBFloat32Row,
    YUV709ToRGBFloat32Row,
    VUYX8uToRGB8uRow_601,
    VUYX8uToRGB8uRow_709,
    VUYX8uToRGB32fRow_601,
    VUYX8uToRGB32fRow_709,
    VUYX8uToBGR8uRow_601,
    VUYX8uToBGR8uRow_709,

    YUV601To709Row,
    YUV709To601Row,
    YUV601To709Float32Row,
    YUV709To601Float32Row,
    UYVY601To709Row,
    UYVY709To601Row,
    YUYV601To709Row,
    YUYV709To601Row,

    Downsample444To422Row,
    Downsample444To422Float32Row,
    Upsample422To444Row_UYVY,
    Upsample422To444Row_YUYV,
    Upsample422To444Float32Row_Repeat,
    Upsample422To444Float32Row_Interpolate,

    UYVY601ToBGR8uRow,
    UYVY709ToBGR8uRow,
    YUYV601ToBGR8uRow,
    YUYV709ToBGR8uRow,

    GammaToLinearRow,
    LinearToGammaRow,
    Gamma8uToLinearFloat32Row,
    LinearFloat32ToGamma8uRow,

    BGRA8uToBGRP32fRow,
    VUYA8uToVUYP32fRow,

    UYVY8uToV210Row,
    V210ToUYVY8uRow,
    V210ToVUY8uRow,
    V210709ToVUY601_8uRow,
    V210ToBGR8uRow_601,
    V210ToBGR8uRow_709,
    V210ToUYVY32fRow,
    UYVY32fToV210Row,

    BGR8uToRGB10uRow,
    BGR15uToRGB10uRow,
    BGR32fToRGB10uRow,
    RGB10uToBGR8uRow,
    RGB10uToBGR15uRow,
    RGB10uToBGR32fRow,

    // Fused: each stands for a run of those above, see Fusion.h. The router never names them.
    RGBToUYVY601,
    RGBToUYVY709,
    StraightRGBToUYVY601,
    StraightRGBToUYVY709,
    OpaqueBGRToRGB10,
    StraightBGRToRGB10,

    None, // no kernel; also the count of kernels
};
inline constexpr int kKernelCount = static_cast<int>(Kernel::None);

} // namespace PK
