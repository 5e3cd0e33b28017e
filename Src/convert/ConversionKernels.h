#pragma once

// The bodies of the row kernels, one structure a kernel source, with the names of enum Kernel. Kernel sources include
// this header, so it holds nothing that the compiler could emit once per instruction set.

#include "primitives/KernelShapes.h"

namespace PK {

struct OrderKernels {
    RowKernel ForceOpaqueRow_BGRA_8u, ForceOpaqueRow_ARGB_8u, ForceOpaqueRow_BGRA_15u,
        ForceOpaqueRow_ARGB_15u, ForceOpaqueRow_BGRA_32f, ForceOpaqueRow_ARGB_32f;
    RowKernel SwapOrderRow_4444_8u, SwapOrderRow_4444_15u, SwapOrderRow_4444_32f, SwapOrderRow_422_8u,
        SwapOrderRow_422_32f;

    static constexpr const char* kFamily = "Order";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const OrderKernels& For(); // Order.kernels.cpp
};

struct PremultiplyKernels {
    RowKernel PremultiplyRow_BGRA_8u, PremultiplyRow_ARGB_8u, PremultiplyRow_VUYA_8u, PremultiplyRow_BGRA_15u,
        PremultiplyRow_ARGB_15u, PremultiplyRow_BGRA_32f, PremultiplyRow_ARGB_32f;
    RowKernel UnpremultiplyRow_BGRA_8u, UnpremultiplyRow_ARGB_8u, UnpremultiplyRow_VUYA_8u,
        UnpremultiplyRow_BGRA_15u, UnpremultiplyRow_ARGB_15u, UnpremultiplyRow_BGRA_32f,
        UnpremultiplyRow_ARGB_32f;
    RowKernel BGRA8uToBGRP32fRow;
    RowKernel VUYA8uToVUYP32fRow;

    static constexpr const char* kFamily = "Premultiply";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const PremultiplyKernels& For(); // Premultiply.kernels.cpp
};

struct DepthKernels {
    RowKernel ExpandTo32fRow_RGB_8u, ExpandTo32fRow_VUYA_8u, ExpandTo32fRow_UYVY_8u, ExpandTo32fRow_YUYV_8u,
        ExpandTo32fRow_RGB_15u;
    RowKernel PackFrom32fRow_RGB_8u, PackFrom32fRow_VUYA_8u, PackFrom32fRow_UYVY_8u, PackFrom32fRow_YUYV_8u,
        PackFrom32fRow_RGB_15u;
    RowKernel Expand8uTo15uRow;
    RowKernel Pack15uTo8uRow;

    static constexpr const char* kFamily = "Depth";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const DepthKernels& For(); // Depth.kernels.cpp
};

struct RGBToYUVKernels {
    RowKernel RGBToYUV601Row;
    RowKernel RGBToYUV709Row;
    RowKernel RGBToYUV601Float32Row;
    RowKernel RGBToYUV709Float32Row;
    RowKernel RGB32fToYUV601_8uRow;
    RowKernel RGB32fToYUV709_8uRow;

    static constexpr const char* kFamily = "RGBToYUV";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const RGBToYUVKernels& For(); // RGBToYUV.kernels.cpp
};

struct YUVToRGBKernels {
    RowKernel YUV601ToRGBRow;
    RowKernel YUV709ToRGBRow;
    RowKernel YUV601ToRGB32fRow;
    RowKernel YUV709ToRGB32fRow;
    RowKernel YUV601ToRGBFloat32Row;
    RowKernel YUV709ToRGBFloat32Row;
    RowKernel VUYX8uToRGB8uRow_601, VUYX8uToRGB8uRow_709;
    RowKernel VUYX8uToRGB32fRow_601, VUYX8uToRGB32fRow_709;
    RowKernel VUYX8uToBGR8uRow_601, VUYX8uToBGR8uRow_709;

    static constexpr const char* kFamily = "YUVToRGB";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const YUVToRGBKernels& For(); // YUVToRGB.kernels.cpp
};

struct YUVToYUVKernels {
    RowKernel YUV601To709Row;
    RowKernel YUV709To601Row;
    RowKernel YUV601To709Float32Row;
    RowKernel YUV709To601Float32Row;
    RowKernel UYVY601To709Row;
    RowKernel UYVY709To601Row;
    RowKernel YUYV601To709Row;
    RowKernel YUYV709To601Row;

    static constexpr const char* kFamily = "YUVToYUV";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const YUVToYUVKernels& For(); // YUVToYUV.kernels.cpp
};

struct ChromaKernels {
    RowKernel Downsample444To422Row;
    RowKernel Downsample444To422Float32Row;
    RowKernel Upsample422To444Row_UYVY, Upsample422To444Row_YUYV;
    RowKernel Upsample422To444Float32Row_Repeat, Upsample422To444Float32Row_Interpolate;

    static constexpr const char* kFamily = "Chroma";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const ChromaKernels& For(); // Chroma.kernels.cpp
};

struct YUV422ToBGRKernels {
    RowKernel UYVY601ToBGR8uRow;
    RowKernel UYVY709ToBGR8uRow;
    RowKernel YUYV601ToBGR8uRow;
    RowKernel YUYV709ToBGR8uRow;

    static constexpr const char* kFamily = "YUV422ToBGR";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const YUV422ToBGRKernels& For(); // YUV422ToBGR.kernels.cpp
};

struct TransferKernels {
    RowKernel GammaToLinearRow;
    RowKernel LinearToGammaRow;
    RowKernel Gamma8uToLinearFloat32Row;
    RowKernel LinearFloat32ToGamma8uRow;

    static constexpr const char* kFamily = "Transfer";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const TransferKernels& For(); // Transfer.kernels.cpp
};

struct V210Kernels {
    RowKernel UYVY8uToV210Row;
    RowKernel V210ToUYVY8uRow;
    RowKernel V210ToVUY8uRow;
    RowKernel V210709ToVUY601_8uRow;
    RowKernel V210ToBGR8uRow_601, V210ToBGR8uRow_709;
    RowKernel V210ToUYVY32fRow;
    RowKernel UYVY32fToV210Row;

    static constexpr const char* kFamily = "V210";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const V210Kernels& For(); // V210.kernels.cpp
};

struct RGB10Kernels {
    RowKernel BGR8uToRGB10uRow;
    RowKernel BGR15uToRGB10uRow;
    RowKernel BGR32fToRGB10uRow;
    RowKernel RGB10uToBGR8uRow;
    RowKernel RGB10uToBGR15uRow;
    RowKernel RGB10uToBGR32fRow;
    RowKernel OpaqueBGRToRGB10;
    RowKernel StraightBGRToRGB10;

    static constexpr const char* kFamily = "RGB10";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const RGB10Kernels& For(); // RGB10.kernels.cpp
};

struct FusedKernels {
    RowKernel RGBToUYVY601;
    RowKernel RGBToUYVY709;
    RowKernel StraightRGBToUYVY601;
    RowKernel StraightRGBToUYVY709;

    static constexpr const char* kFamily = "Fused";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const FusedKernels& For(); // Fused.kernels.cpp
};

} // namespace PK
