// The register in the order of the kernels, and the choice of a body by capability.

#include "convert/KernelTable.h"

#include "convert/CopyRow.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <cstddef>
#include <iterator>

namespace PK {
namespace {

using enum Kernel;

constexpr PK_PixelFormat kBGRA8 = PK_PixelFormat_BGRA_4444_8u;
constexpr PK_PixelFormat kBGRA15 = PK_PixelFormat_BGRA_4444_15u;
constexpr PK_PixelFormat kBGRA32f = PK_PixelFormat_BGRA_4444_32f;
constexpr PK_PixelFormat kUYVY8 = PK_PixelFormat_UYVY_422_8u;
constexpr PK_PixelFormat kUYVY32f = PK_PixelFormat_UYVY_422_32f;
constexpr PK_PixelFormat kV210 = PK_PixelFormat_V210_422_10u;
constexpr PK_PixelFormat kBGRX8 = PK_PixelFormat_BGRX_4444_8u;
constexpr PK_PixelFormat kARGB8 = PK_PixelFormat_ARGB_4444_8u;
constexpr PK_PixelFormat kXRGB8 = PK_PixelFormat_XRGB_4444_8u;
constexpr PK_PixelFormat kBGRX15 = PK_PixelFormat_BGRX_4444_15u;
constexpr PK_PixelFormat kARGB15 = PK_PixelFormat_ARGB_4444_15u;
constexpr PK_PixelFormat kXRGB15 = PK_PixelFormat_XRGB_4444_15u;
constexpr PK_PixelFormat kBGRX32f = PK_PixelFormat_BGRX_4444_32f;
constexpr PK_PixelFormat kARGB32f = PK_PixelFormat_ARGB_4444_32f;
constexpr PK_PixelFormat kXRGB32f = PK_PixelFormat_XRGB_4444_32f;
constexpr PK_PixelFormat kYUYV8 = PK_PixelFormat_YUYV_422_8u;
constexpr PK_PixelFormat kYUYV32f = PK_PixelFormat_YUYV_422_32f;
constexpr PK_PixelFormat kBGRP8 = PK_PixelFormat_BGRP_4444_8u;
constexpr PK_PixelFormat kPRGB8 = PK_PixelFormat_PRGB_4444_8u;
constexpr PK_PixelFormat kVUYA8 = PK_PixelFormat_VUYA_4444_8u;
constexpr PK_PixelFormat kVUYP8 = PK_PixelFormat_VUYP_4444_8u;
constexpr PK_PixelFormat kBGRP15 = PK_PixelFormat_BGRP_4444_15u;
constexpr PK_PixelFormat kPRGB15 = PK_PixelFormat_PRGB_4444_15u;
constexpr PK_PixelFormat kBGRP32f = PK_PixelFormat_BGRP_4444_32f;
constexpr PK_PixelFormat kPRGB32f = PK_PixelFormat_PRGB_4444_32f;
constexpr PK_PixelFormat kVUYA32f = PK_PixelFormat_VUYA_4444_32f;
constexpr PK_PixelFormat kVUYA8_709 = PK_PixelFormat_VUYA_4444_8u_709;
constexpr PK_PixelFormat kVUYA32f_709 = PK_PixelFormat_VUYA_4444_32f_709;
constexpr PK_PixelFormat kVUYX8 = PK_PixelFormat_VUYX_4444_8u;
constexpr PK_PixelFormat kVUYX8_709 = PK_PixelFormat_VUYX_4444_8u_709;
constexpr PK_PixelFormat kUYVY8_709 = PK_PixelFormat_UYVY_422_8u_709;
constexpr PK_PixelFormat kYUYV8_709 = PK_PixelFormat_YUYV_422_8u_709;
constexpr PK_PixelFormat kVUYP32f = PK_PixelFormat_VUYP_4444_32f;
constexpr PK_PixelFormat kBGRA32fLinear = PK_PixelFormat_BGRA_4444_32f_Linear;
constexpr PK_PixelFormat kV210_709 = PK_PixelFormat_V210_422_10u_709;
constexpr PK_PixelFormat kRGB10 = PK_PixelFormat_RGB_444_10u;

struct ConversionRow {
    Kernel kernel;
    KernelRow row;
};

consteval Samples SamplesOf(PK_PixelFormat format) {
    switch (DepthOf(format)) {
    case kDepth8u:
        return Samples::Bytes;
    case kDepth15u:
        return Samples::Words;
    case kDepth32f:
        return Samples::Floats;
    default:
        return Samples::Bits;
    }
}

consteval Operand PixelsOf(PK_PixelFormat format) {
    const RowUnit unit = UnitOfRow(format);
    return {SamplesOf(format), unit.bytes, unit.pixels, format};
}

template <auto kMember>
consteval ConversionRow Row(Kernel kernel, const char* name, PK_PixelFormat source,
                            PK_PixelFormat destination, Agreement agreement = {}, PlaceRule place = {}) {
    return {kernel, Entry<kMember>(name, {PixelsOf(source), PixelsOf(destination)}, agreement, place)};
}

// clang-format off: one row a kernel
constexpr ConversionRow kRegister[] = {
    Row<&CopyKernels::CopyRow_4444_8u>(CopyRow_4444_8u, "CopyRow", kBGRA8, kBGRA8),
    Row<&CopyKernels::CopyRow_4444_15u>(CopyRow_4444_15u, "CopyRow", kBGRA15, kBGRA15),
    Row<&CopyKernels::CopyRow_4444_32f>(CopyRow_4444_32f, "CopyRow", kBGRA32f, kBGRA32f),
    Row<&CopyKernels::CopyRow_422_8u>(CopyRow_422_8u, "CopyRow", kUYVY8, kUYVY8),
    Row<&CopyKernels::CopyRow_422_32f>(CopyRow_422_32f, "CopyRow", kUYVY32f, kUYVY32f),
    Row<&CopyKernels::CopyRow_V210>(CopyRow_V210, "CopyRow", kV210, kV210),
    Row<&OrderKernels::ForceOpaqueRow_BGRA_8u>(ForceOpaqueRow_BGRA_8u, "ForceOpaqueRow", kBGRA8, kBGRX8),
    Row<&OrderKernels::ForceOpaqueRow_ARGB_8u>(ForceOpaqueRow_ARGB_8u, "ForceOpaqueRow", kARGB8, kXRGB8),
    Row<&OrderKernels::ForceOpaqueRow_BGRA_15u>(ForceOpaqueRow_BGRA_15u, "ForceOpaqueRow", kBGRA15, kBGRX15),
    Row<&OrderKernels::ForceOpaqueRow_ARGB_15u>(ForceOpaqueRow_ARGB_15u, "ForceOpaqueRow", kARGB15, kXRGB15),
    Row<&OrderKernels::ForceOpaqueRow_BGRA_32f>(ForceOpaqueRow_BGRA_32f, "ForceOpaqueRow", kBGRA32f,
                                                kBGRX32f),
    Row<&OrderKernels::ForceOpaqueRow_ARGB_32f>(ForceOpaqueRow_ARGB_32f, "ForceOpaqueRow", kARGB32f,
                                                kXRGB32f),
    Row<&OrderKernels::SwapOrderRow_4444_8u>(SwapOrderRow_4444_8u, "SwapOrderRow", kBGRA8, kARGB8),
    Row<&OrderKernels::SwapOrderRow_4444_15u>(SwapOrderRow_4444_15u, "SwapOrderRow", kBGRA15, kARGB15),
    Row<&OrderKernels::SwapOrderRow_4444_32f>(SwapOrderRow_4444_32f, "SwapOrderRow", kBGRA32f, kARGB32f),
    Row<&OrderKernels::SwapOrderRow_422_8u>(SwapOrderRow_422_8u, "SwapOrderRow", kUYVY8, kYUYV8),
    Row<&OrderKernels::SwapOrderRow_422_32f>(SwapOrderRow_422_32f, "SwapOrderRow", kUYVY32f, kYUYV32f),
    Row<&PremultiplyKernels::PremultiplyRow_BGRA_8u>(PremultiplyRow_BGRA_8u, "PremultiplyRow", kBGRA8,
                                                     kBGRP8),
    Row<&PremultiplyKernels::PremultiplyRow_ARGB_8u>(PremultiplyRow_ARGB_8u, "PremultiplyRow", kARGB8,
                                                     kPRGB8),
    Row<&PremultiplyKernels::PremultiplyRow_VUYA_8u>(PremultiplyRow_VUYA_8u, "PremultiplyRow", kVUYA8,
                                                     kVUYP8),
    Row<&PremultiplyKernels::PremultiplyRow_BGRA_15u>(PremultiplyRow_BGRA_15u, "PremultiplyRow", kBGRA15,
                                                      kBGRP15),
    Row<&PremultiplyKernels::PremultiplyRow_ARGB_15u>(PremultiplyRow_ARGB_15u, "PremultiplyRow", kARGB15,
                                                      kPRGB15),
    Row<&PremultiplyKernels::PremultiplyRow_BGRA_32f>(PremultiplyRow_BGRA_32f, "PremultiplyRow", kBGRA32f,
                                                      kBGRP32f),
    Row<&PremultiplyKernels::PremultiplyRow_ARGB_32f>(PremultiplyRow_ARGB_32f, "PremultiplyRow", kARGB32f,
                                                      kPRGB32f),
    Row<&PremultiplyKernels::UnpremultiplyRow_BGRA_8u>(UnpremultiplyRow_BGRA_8u, "UnpremultiplyRow", kBGRP8,
                                                       kBGRA8),
    Row<&PremultiplyKernels::UnpremultiplyRow_ARGB_8u>(UnpremultiplyRow_ARGB_8u, "UnpremultiplyRow", kPRGB8,
                                                       kARGB8),
    Row<&PremultiplyKernels::UnpremultiplyRow_VUYA_8u>(UnpremultiplyRow_VUYA_8u, "UnpremultiplyRow", kVUYP8,
                                                       kVUYA8),
    Row<&PremultiplyKernels::UnpremultiplyRow_BGRA_15u>(UnpremultiplyRow_BGRA_15u, "UnpremultiplyRow",
                                                        kBGRP15, kBGRA15),
    Row<&PremultiplyKernels::UnpremultiplyRow_ARGB_15u>(UnpremultiplyRow_ARGB_15u, "UnpremultiplyRow",
                                                        kPRGB15, kARGB15),
    Row<&PremultiplyKernels::UnpremultiplyRow_BGRA_32f>(UnpremultiplyRow_BGRA_32f, "UnpremultiplyRow",
                                                        kBGRP32f, kBGRA32f),
    Row<&PremultiplyKernels::UnpremultiplyRow_ARGB_32f>(UnpremultiplyRow_ARGB_32f, "UnpremultiplyRow",
                                                        kPRGB32f, kARGB32f),
    Row<&DepthKernels::ExpandTo32fRow_RGB_8u>(ExpandTo32fRow_RGB_8u, "ExpandTo32fRow", kBGRA8, kBGRA32f),
    Row<&DepthKernels::ExpandTo32fRow_VUYA_8u>(ExpandTo32fRow_VUYA_8u, "ExpandTo32fRow", kVUYA8, kVUYA32f),
    Row<&DepthKernels::ExpandTo32fRow_UYVY_8u>(ExpandTo32fRow_UYVY_8u, "ExpandTo32fRow", kUYVY8, kUYVY32f),
    Row<&DepthKernels::ExpandTo32fRow_YUYV_8u>(ExpandTo32fRow_YUYV_8u, "ExpandTo32fRow", kYUYV8, kYUYV32f),
    Row<&DepthKernels::ExpandTo32fRow_RGB_15u>(ExpandTo32fRow_RGB_15u, "ExpandTo32fRow", kBGRA15, kBGRA32f),
    Row<&DepthKernels::PackFrom32fRow_RGB_8u>(PackFrom32fRow_RGB_8u, "PackFrom32fRow", kBGRA32f, kBGRA8),
    Row<&DepthKernels::PackFrom32fRow_VUYA_8u>(PackFrom32fRow_VUYA_8u, "PackFrom32fRow", kVUYA32f, kVUYA8),
    Row<&DepthKernels::PackFrom32fRow_UYVY_8u>(PackFrom32fRow_UYVY_8u, "PackFrom32fRow", kUYVY32f, kUYVY8),
    Row<&DepthKernels::PackFrom32fRow_YUYV_8u>(PackFrom32fRow_YUYV_8u, "PackFrom32fRow", kYUYV32f, kYUYV8),
    Row<&DepthKernels::PackFrom32fRow_RGB_15u>(PackFrom32fRow_RGB_15u, "PackFrom32fRow", kBGRA32f, kBGRA15),
    Row<&DepthKernels::Expand8uTo15uRow>(Expand8uTo15uRow, "Expand8uTo15uRow", kBGRA8, kBGRA15,
                                         DeclaredFrom(Target::sse2), {.headAlignment = 16}),
    Row<&DepthKernels::Pack15uTo8uRow>(Pack15uTo8uRow, "Pack15uTo8uRow", kBGRA15, kBGRA8),
    Row<&RGBToYUVKernels::RGBToYUV601Row>(RGBToYUV601Row, "RGBToYUV601Row", kBGRA8, kVUYA8),
    Row<&RGBToYUVKernels::RGBToYUV709Row>(RGBToYUV709Row, "RGBToYUV709Row", kBGRA8, kVUYA8_709),
    Row<&RGBToYUVKernels::RGBToYUV601Float32Row>(RGBToYUV601Float32Row, "RGBToYUV601Float32Row", kBGRA32f,
                                                 kVUYA32f),
    Row<&RGBToYUVKernels::RGBToYUV709Float32Row>(RGBToYUV709Float32Row, "RGBToYUV709Float32Row", kBGRA32f,
                                                 kVUYA32f_709),
    Row<&RGBToYUVKernels::RGB32fToYUV601_8uRow>(RGB32fToYUV601_8uRow, "RGB32fToYUV601_8uRow", kBGRA32f,
                                                kVUYA8),
    Row<&RGBToYUVKernels::RGB32fToYUV709_8uRow>(RGB32fToYUV709_8uRow, "RGB32fToYUV709_8uRow", kBGRA32f,
                                                kVUYA8_709),
    Row<&YUVToRGBKernels::YUV601ToRGBRow>(YUV601ToRGBRow, "YUV601ToRGBRow", kVUYA8, kBGRA8),
    Row<&YUVToRGBKernels::YUV709ToRGBRow>(YUV709ToRGBRow, "YUV709ToRGBRow", kVUYA8_709, kBGRA8),
    Row<&YUVToRGBKernels::YUV601ToRGB32fRow>(YUV601ToRGB32fRow, "YUV601ToRGB32fRow", kVUYA8, kBGRA32f),
    Row<&YUVToRGBKernels::YUV709ToRGB32fRow>(YUV709ToRGB32fRow, "YUV709ToRGB32fRow", kVUYA8_709, kBGRA32f),
    Row<&YUVToRGBKernels::YUV601ToRGBFloat32Row>(YUV601ToRGBFloat32Row, "YUV601ToRGBFloat32Row", kVUYA32f,
                                                 kBGRA32f),
    Row<&YUVToRGBKernels::YUV709ToRGBFloat32Row>(YUV709ToRGBFloat32Row, "YUV709ToRGBFloat32Row", kVUYA32f_709,
                                                 kBGRA32f),
    Row<&YUVToRGBKernels::VUYX8uToRGB8uRow_601>(VUYX8uToRGB8uRow_601, "VUYX8uToRGB8uRow", kVUYX8, kBGRX8),
    Row<&YUVToRGBKernels::VUYX8uToRGB8uRow_709>(VUYX8uToRGB8uRow_709, "VUYX8uToRGB8uRow", kVUYX8_709, kBGRX8),
    Row<&YUVToRGBKernels::VUYX8uToRGB32fRow_601>(VUYX8uToRGB32fRow_601, "VUYX8uToRGB32fRow", kVUYX8,
                                                 kBGRX32f),
    Row<&YUVToRGBKernels::VUYX8uToRGB32fRow_709>(VUYX8uToRGB32fRow_709, "VUYX8uToRGB32fRow", kVUYX8_709,
                                                 kBGRX32f),
    Row<&YUVToRGBKernels::VUYX8uToBGR8uRow_601>(VUYX8uToBGR8uRow_601, "VUYX8uToBGR8uRow", kVUYX8, kBGRX8),
    Row<&YUVToRGBKernels::VUYX8uToBGR8uRow_709>(VUYX8uToBGR8uRow_709, "VUYX8uToBGR8uRow", kVUYX8_709, kBGRX8),
    Row<&YUVToYUVKernels::YUV601To709Row>(YUV601To709Row, "YUV601To709Row", kVUYA8, kVUYA8_709),
    Row<&YUVToYUVKernels::YUV709To601Row>(YUV709To601Row, "YUV709To601Row", kVUYA8_709, kVUYA8),
    Row<&YUVToYUVKernels::YUV601To709Float32Row>(YUV601To709Float32Row, "YUV601To709Float32Row", kVUYA32f,
                                                 kVUYA32f_709),
    Row<&YUVToYUVKernels::YUV709To601Float32Row>(YUV709To601Float32Row, "YUV709To601Float32Row", kVUYA32f_709,
                                                 kVUYA32f),
    Row<&YUVToYUVKernels::UYVY601To709Row>(UYVY601To709Row, "UYVY601To709Row", kUYVY8, kUYVY8_709),
    Row<&YUVToYUVKernels::UYVY709To601Row>(UYVY709To601Row, "UYVY709To601Row", kUYVY8_709, kUYVY8),
    Row<&YUVToYUVKernels::YUYV601To709Row>(YUYV601To709Row, "YUYV601To709Row", kYUYV8, kYUYV8_709),
    Row<&YUVToYUVKernels::YUYV709To601Row>(YUYV709To601Row, "YUYV709To601Row", kYUYV8_709, kYUYV8),
    Row<&ChromaKernels::Downsample444To422Row>(Downsample444To422Row, "Downsample444To422Row", kVUYP8,
                                               kUYVY8),
    Row<&ChromaKernels::Downsample444To422Float32Row>(Downsample444To422Float32Row,
                                                      "Downsample444To422Float32Row", kVUYP32f, kUYVY32f),
    Row<&ChromaKernels::Upsample422To444Row_UYVY>(Upsample422To444Row_UYVY, "Upsample422To444Row", kUYVY8,
                                                  kVUYX8, DeclaredFrom(Target::ssse3)),
    Row<&ChromaKernels::Upsample422To444Row_YUYV>(Upsample422To444Row_YUYV, "Upsample422To444Row", kYUYV8,
                                                  kVUYX8, DeclaredFrom(Target::ssse3)),
    Row<&ChromaKernels::Upsample422To444Float32Row_Repeat>(Upsample422To444Float32Row_Repeat,
                                                           "Upsample422To444Float32Row", kUYVY32f, kVUYA32f),
    Row<&ChromaKernels::Upsample422To444Float32Row_Interpolate>(
        Upsample422To444Float32Row_Interpolate, "Upsample422To444Float32Row", kUYVY32f, kVUYA32f),
    Row<&YUV422ToBGRKernels::UYVY601ToBGR8uRow>(UYVY601ToBGR8uRow, "UYVY601ToBGR8uRow", kUYVY8, kBGRX8,
                                                DeclaredFrom(Target::ssse3)),
    Row<&YUV422ToBGRKernels::UYVY709ToBGR8uRow>(UYVY709ToBGR8uRow, "UYVY709ToBGR8uRow", kUYVY8_709, kBGRX8,
                                                DeclaredFrom(Target::ssse3)),
    Row<&YUV422ToBGRKernels::YUYV601ToBGR8uRow>(YUYV601ToBGR8uRow, "YUYV601ToBGR8uRow", kYUYV8, kBGRX8,
                                                DeclaredFrom(Target::ssse3)),
    Row<&YUV422ToBGRKernels::YUYV709ToBGR8uRow>(YUYV709ToBGR8uRow, "YUYV709ToBGR8uRow", kYUYV8_709, kBGRX8,
                                                DeclaredFrom(Target::ssse3)),
    Row<&TransferKernels::GammaToLinearRow>(GammaToLinearRow, "GammaToLinearRow", kBGRA32f, kBGRA32fLinear),
    Row<&TransferKernels::LinearToGammaRow>(LinearToGammaRow, "LinearToGammaRow", kBGRA32fLinear, kBGRA32f),
    Row<&TransferKernels::Gamma8uToLinearFloat32Row>(Gamma8uToLinearFloat32Row, "Gamma8uToLinearFloat32Row",
                                                     kBGRA8, kBGRA32fLinear),
    Row<&TransferKernels::LinearFloat32ToGamma8uRow>(LinearFloat32ToGamma8uRow, "LinearFloat32ToGamma8uRow",
                                                     kBGRA32fLinear, kBGRA8),
    Row<&PremultiplyKernels::BGRA8uToBGRP32fRow>(BGRA8uToBGRP32fRow, "BGRA8uToBGRP32fRow", kBGRA8, kBGRP32f),
    Row<&PremultiplyKernels::VUYA8uToVUYP32fRow>(VUYA8uToVUYP32fRow, "VUYA8uToVUYP32fRow", kVUYA8, kVUYP32f),
    Row<&V210Kernels::UYVY8uToV210Row>(UYVY8uToV210Row, "UYVY8uToV210Row", kUYVY8, kV210),
    Row<&V210Kernels::V210ToUYVY8uRow>(V210ToUYVY8uRow, "V210ToUYVY8uRow", kV210, kUYVY8),
    Row<&V210Kernels::V210ToVUY8uRow>(V210ToVUY8uRow, "V210ToVUY8uRow", kV210, kVUYX8),
    Row<&V210Kernels::V210709ToVUY601_8uRow>(V210709ToVUY601_8uRow, "V210709ToVUY601_8uRow", kV210_709,
                                             kVUYX8),
    Row<&V210Kernels::V210ToBGR8uRow_601>(V210ToBGR8uRow_601, "V210ToBGR8uRow", kV210, kBGRX8),
    Row<&V210Kernels::V210ToBGR8uRow_709>(V210ToBGR8uRow_709, "V210ToBGR8uRow", kV210_709, kBGRX8),
    Row<&V210Kernels::V210ToUYVY32fRow>(V210ToUYVY32fRow, "V210ToUYVY32fRow", kV210, kUYVY32f),
    Row<&V210Kernels::UYVY32fToV210Row>(UYVY32fToV210Row, "UYVY32fToV210Row", kUYVY32f, kV210),
    Row<&RGB10Kernels::BGR8uToRGB10uRow>(BGR8uToRGB10uRow, "BGR8uToRGB10uRow", kBGRX8, kRGB10),
    Row<&RGB10Kernels::BGR15uToRGB10uRow>(BGR15uToRGB10uRow, "BGR15uToRGB10uRow", kBGRX15, kRGB10),
    Row<&RGB10Kernels::BGR32fToRGB10uRow>(BGR32fToRGB10uRow, "BGR32fToRGB10uRow", kBGRX32f, kRGB10),
    Row<&RGB10Kernels::RGB10uToBGR8uRow>(RGB10uToBGR8uRow, "RGB10uToBGR8uRow", kRGB10, kBGRX8),
    Row<&RGB10Kernels::RGB10uToBGR15uRow>(RGB10uToBGR15uRow, "RGB10uToBGR15uRow", kRGB10, kBGRX15),
    Row<&RGB10Kernels::RGB10uToBGR32fRow>(RGB10uToBGR32fRow, "RGB10uToBGR32fRow", kRGB10, kBGRX32f),
    Row<&FusedKernels::RGBToUYVY601>(RGBToUYVY601, "RGBToYUV601Row + Downsample444To422Row", kBGRX8, kUYVY8),
    Row<&FusedKernels::RGBToUYVY709>(RGBToUYVY709, "RGBToYUV709Row + Downsample444To422Row", kBGRX8,
                                     kUYVY8_709),
    Row<&FusedKernels::StraightRGBToUYVY601>(
        StraightRGBToUYVY601, "RGBToYUV601Row + PremultiplyRow + Downsample444To422Row", kBGRA8, kUYVY8),
    Row<&FusedKernels::StraightRGBToUYVY709>(
        StraightRGBToUYVY709, "RGBToYUV709Row + PremultiplyRow + Downsample444To422Row", kBGRA8, kUYVY8_709),
    Row<&RGB10Kernels::OpaqueBGRToRGB10>(OpaqueBGRToRGB10, "ExpandTo32fRow + BGR32fToRGB10uRow", kBGRX8,
                                         kRGB10),
    Row<&RGB10Kernels::StraightBGRToRGB10>(
        StraightBGRToRGB10, "ExpandTo32fRow + PremultiplyRow + BGR32fToRGB10uRow", kBGRA8, kRGB10),
};
// clang-format on

constexpr bool IsInOrder() {
    for (int i = 0; i < kKernelCount; ++i)
        if (kRegister[i].kernel != static_cast<Kernel>(i)) return false;
    return true;
}
static_assert(std::size(kRegister) == kKernelCount && IsInOrder(),
              "the register has one row a kernel, in order");

} // namespace

const KernelRow& Info(Kernel kernel) noexcept {
    return kRegister[static_cast<std::size_t>(kernel)].row;
}

RowKernel Body(Kernel kernel, Target target) noexcept {
    return reinterpret_cast<RowKernel>(Info(kernel).body(target));
}

bool ChooseTarget(Kernel kernel, Target& target) noexcept {
    if (kernel == Kernel::None) return false;
    for (std::size_t i = std::size(kFlagTargets); i > 0; --i) {
        target = kFlagTargets[i - 1];
        if (IsEnabled(target) && Body(kernel, target)) return true;
    }
    return false;
}

RowKernel ChooseBody(Kernel kernel) noexcept {
    Target target;
    return ChooseTarget(kernel, target) ? Body(kernel, target) : nullptr;
}

} // namespace PK
