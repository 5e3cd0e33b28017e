// The register in the order of the kernels, and the choice of a body by capability.

#include "convert/KernelTable.h"

#include "convert/CopyRow.h"

#include <PixelKiln/PixelFormat.h>

#include <array>
#include <cstddef>

namespace PK {
namespace {

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

// clang-format off: one row a kernel
constexpr KernelInfo kRegister[] = {
    {Kernel::CopyRow_4444_8u, "CopyRow", kBGRA8, kBGRA8},
    {Kernel::CopyRow_4444_15u, "CopyRow", kBGRA15, kBGRA15},
    {Kernel::CopyRow_4444_32f, "CopyRow", kBGRA32f, kBGRA32f},
    {Kernel::CopyRow_422_8u, "CopyRow", kUYVY8, kUYVY8},
    {Kernel::CopyRow_422_32f, "CopyRow", kUYVY32f, kUYVY32f},
    {Kernel::CopyRow_V210, "CopyRow", kV210, kV210},
    {Kernel::ForceOpaqueRow_BGRA_8u, "ForceOpaqueRow", kBGRA8, kBGRX8},
    {Kernel::ForceOpaqueRow_ARGB_8u, "ForceOpaqueRow", kARGB8, kXRGB8},
    {Kernel::ForceOpaqueRow_BGRA_15u, "ForceOpaqueRow", kBGRA15, kBGRX15},
    {Kernel::ForceOpaqueRow_ARGB_15u, "ForceOpaqueRow", kARGB15, kXRGB15},
    {Kernel::ForceOpaqueRow_BGRA_32f, "ForceOpaqueRow", kBGRA32f, kBGRX32f},
    {Kernel::ForceOpaqueRow_ARGB_32f, "ForceOpaqueRow", kARGB32f, kXRGB32f},
    {Kernel::SwapOrderRow_4444_8u, "SwapOrderRow", kBGRA8, kARGB8},
    {Kernel::SwapOrderRow_4444_15u, "SwapOrderRow", kBGRA15, kARGB15},
    {Kernel::SwapOrderRow_4444_32f, "SwapOrderRow", kBGRA32f, kARGB32f},
    {Kernel::SwapOrderRow_422_8u, "SwapOrderRow", kUYVY8, kYUYV8},
    {Kernel::SwapOrderRow_422_32f, "SwapOrderRow", kUYVY32f, kYUYV32f},
    {Kernel::PremultiplyRow_BGRA_8u, "PremultiplyRow", kBGRA8, kBGRP8},
    {Kernel::PremultiplyRow_ARGB_8u, "PremultiplyRow", kARGB8, kPRGB8},
    {Kernel::PremultiplyRow_VUYA_8u, "PremultiplyRow", kVUYA8, kVUYP8},
    {Kernel::PremultiplyRow_BGRA_15u, "PremultiplyRow", kBGRA15, kBGRP15},
    {Kernel::PremultiplyRow_ARGB_15u, "PremultiplyRow", kARGB15, kPRGB15},
    {Kernel::PremultiplyRow_BGRA_32f, "PremultiplyRow", kBGRA32f, kBGRP32f},
    {Kernel::PremultiplyRow_ARGB_32f, "PremultiplyRow", kARGB32f, kPRGB32f},
    {Kernel::UnpremultiplyRow_BGRA_8u, "UnpremultiplyRow", kBGRP8, kBGRA8},
    {Kernel::UnpremultiplyRow_ARGB_8u, "UnpremultiplyRow", kPRGB8, kARGB8},
    {Kernel::UnpremultiplyRow_VUYA_8u, "UnpremultiplyRow", kVUYP8, kVUYA8},
    {Kernel::UnpremultiplyRow_BGRA_15u, "UnpremultiplyRow", kBGRP15, kBGRA15},
    {Kernel::UnpremultiplyRow_ARGB_15u, "UnpremultiplyRow", kPRGB15, kARGB15},
    {Kernel::UnpremultiplyRow_BGRA_32f, "UnpremultiplyRow", kBGRP32f, kBGRA32f},
    {Kernel::UnpremultiplyRow_ARGB_32f, "UnpremultiplyRow", kPRGB32f, kARGB32f},
    {Kernel::ExpandTo32fRow_RGB_8u, "ExpandTo32fRow", kBGRA8, kBGRA32f},
    {Kernel::ExpandTo32fRow_VUYA_8u, "ExpandTo32fRow", kVUYA8, kVUYA32f},
    {Kernel::ExpandTo32fRow_UYVY_8u, "ExpandTo32fRow", kUYVY8, kUYVY32f},
    {Kernel::ExpandTo32fRow_YUYV_8u, "ExpandTo32fRow", kYUYV8, kYUYV32f},
    {Kernel::ExpandTo32fRow_RGB_15u, "ExpandTo32fRow", kBGRA15, kBGRA32f},
    {Kernel::PackFrom32fRow_RGB_8u, "PackFrom32fRow", kBGRA32f, kBGRA8},
    {Kernel::PackFrom32fRow_VUYA_8u, "PackFrom32fRow", kVUYA32f, kVUYA8},
    {Kernel::PackFrom32fRow_UYVY_8u, "PackFrom32fRow", kUYVY32f, kUYVY8},
    {Kernel::PackFrom32fRow_YUYV_8u, "PackFrom32fRow", kYUYV32f, kYUYV8},
    {Kernel::PackFrom32fRow_RGB_15u, "PackFrom32fRow", kBGRA32f, kBGRA15},
    {Kernel::Expand8uTo15uRow, "Expand8uTo15uRow", kBGRA8, kBGRA15, Agreement::Declared},
    {Kernel::Pack15uTo8uRow, "Pack15uTo8uRow", kBGRA15, kBGRA8},
    {Kernel::RGBToYUV601Row, "RGBToYUV601Row", kBGRA8, kVUYA8},
    {Kernel::RGBToYUV709Row, "RGBToYUV709Row", kBGRA8, kVUYA8_709},
    {Kernel::RGBToYUV601Float32Row, "RGBToYUV601Float32Row", kBGRA32f, kVUYA32f},
    {Kernel::RGBToYUV709Float32Row, "RGBToYUV709Float32Row", kBGRA32f, kVUYA32f_709},
    {Kernel::RGB32fToYUV601_8uRow, "RGB32fToYUV601_8uRow", kBGRA32f, kVUYA8},
    {Kernel::RGB32fToYUV709_8uRow, "RGB32fToYUV709_8uRow", kBGRA32f, kVUYA8_709},
    {Kernel::YUV601ToRGBRow, "YUV601ToRGBRow", kVUYA8, kBGRA8},
    {Kernel::YUV709ToRGBRow, "YUV709ToRGBRow", kVUYA8_709, kBGRA8},
    {Kernel::YUV601ToRGB32fRow, "YUV601ToRGB32fRow", kVUYA8, kBGRA32f},
    {Kernel::YUV709ToRGB32fRow, "YUV709ToRGB32fRow", kVUYA8_709, kBGRA32f},
    {Kernel::YUV601ToRGBFloat32Row, "YUV601ToRGBFloat32Row", kVUYA32f, kBGRA32f},
    {Kernel::YUV709ToRGBFloat32Row, "YUV709ToRGBFloat32Row", kVUYA32f_709, kBGRA32f},
    {Kernel::VUYX8uToRGB8uRow_601, "VUYX8uToRGB8uRow", kVUYX8, kBGRX8},
    {Kernel::VUYX8uToRGB8uRow_709, "VUYX8uToRGB8uRow", kVUYX8_709, kBGRX8},
    {Kernel::VUYX8uToRGB32fRow_601, "VUYX8uToRGB32fRow", kVUYX8, kBGRX32f},
    {Kernel::VUYX8uToRGB32fRow_709, "VUYX8uToRGB32fRow", kVUYX8_709, kBGRX32f},
    {Kernel::VUYX8uToBGR8uRow_601, "VUYX8uToBGR8uRow", kVUYX8, kBGRX8},
    {Kernel::VUYX8uToBGR8uRow_709, "VUYX8uToBGR8uRow", kVUYX8_709, kBGRX8},
    {Kernel::YUV601To709Row, "YUV601To709Row", kVUYA8, kVUYA8_709},
    {Kernel::YUV709To601Row, "YUV709To601Row", kVUYA8_709, kVUYA8},
    {Kernel::YUV601To709Float32Row, "YUV601To709Float32Row", kVUYA32f, kVUYA32f_709},
    {Kernel::YUV709To601Float32Row, "YUV709To601Float32Row", kVUYA32f_709, kVUYA32f},
    {Kernel::UYVY601To709Row, "UYVY601To709Row", kUYVY8, kUYVY8_709},
    {Kernel::UYVY709To601Row, "UYVY709To601Row", kUYVY8_709, kUYVY8},
    {Kernel::YUYV601To709Row, "YUYV601To709Row", kYUYV8, kYUYV8_709},
    {Kernel::YUYV709To601Row, "YUYV709To601Row", kYUYV8_709, kYUYV8},
    {Kernel::Downsample444To422Row, "Downsample444To422Row", kVUYP8, kUYVY8},
    {Kernel::Downsample444To422Float32Row, "Downsample444To422Float32Row", kVUYP32f, kUYVY32f},
    {Kernel::Upsample422To444Row_UYVY, "Upsample422To444Row", kUYVY8, kVUYX8, Agreement::Declared},
    {Kernel::Upsample422To444Row_YUYV, "Upsample422To444Row", kYUYV8, kVUYX8, Agreement::Declared},
    {Kernel::Upsample422To444Float32Row_Repeat, "Upsample422To444Float32Row", kUYVY32f, kVUYA32f},
    {Kernel::Upsample422To444Float32Row_Interpolate, "Upsample422To444Float32Row", kUYVY32f, kVUYA32f},
    {Kernel::UYVY601ToBGR8uRow, "UYVY601ToBGR8uRow", kUYVY8, kBGRX8, Agreement::Declared},
    {Kernel::UYVY709ToBGR8uRow, "UYVY709ToBGR8uRow", kUYVY8_709, kBGRX8, Agreement::Declared},
    {Kernel::YUYV601ToBGR8uRow, "YUYV601ToBGR8uRow", kYUYV8, kBGRX8, Agreement::Declared},
    {Kernel::YUYV709ToBGR8uRow, "YUYV709ToBGR8uRow", kYUYV8_709, kBGRX8, Agreement::Declared},
    {Kernel::GammaToLinearRow, "GammaToLinearRow", kBGRA32f, kBGRA32fLinear},
    {Kernel::LinearToGammaRow, "LinearToGammaRow", kBGRA32fLinear, kBGRA32f},
    {Kernel::Gamma8uToLinearFloat32Row, "Gamma8uToLinearFloat32Row", kBGRA8, kBGRA32fLinear},
    {Kernel::LinearFloat32ToGamma8uRow, "LinearFloat32ToGamma8uRow", kBGRA32fLinear, kBGRA8},
    {Kernel::BGRA8uToBGRP32fRow, "BGRA8uToBGRP32fRow", kBGRA8, kBGRP32f},
    {Kernel::VUYA8uToVUYP32fRow, "VUYA8uToVUYP32fRow", kVUYA8, kVUYP32f},
    {Kernel::UYVY8uToV210Row, "UYVY8uToV210Row", kUYVY8, kV210},
    {Kernel::V210ToUYVY8uRow, "V210ToUYVY8uRow", kV210, kUYVY8},
    {Kernel::V210ToVUY8uRow, "V210ToVUY8uRow", kV210, kVUYX8},
    {Kernel::V210709ToVUY601_8uRow, "V210709ToVUY601_8uRow", kV210_709, kVUYX8},
    {Kernel::V210ToBGR8uRow_601, "V210ToBGR8uRow", kV210, kBGRX8},
    {Kernel::V210ToBGR8uRow_709, "V210ToBGR8uRow", kV210_709, kBGRX8},
    {Kernel::V210ToUYVY32fRow, "V210ToUYVY32fRow", kV210, kUYVY32f},
    {Kernel::UYVY32fToV210Row, "UYVY32fToV210Row", kUYVY32f, kV210},
    {Kernel::BGR8uToRGB10uRow, "BGR8uToRGB10uRow", kBGRX8, kRGB10},
    {Kernel::BGR15uToRGB10uRow, "BGR15uToRGB10uRow", kBGRX15, kRGB10},
    {Kernel::BGR32fToRGB10uRow, "BGR32fToRGB10uRow", kBGRX32f, kRGB10},
    {Kernel::RGB10uToBGR8uRow, "RGB10uToBGR8uRow", kRGB10, kBGRX8},
    {Kernel::RGB10uToBGR15uRow, "RGB10uToBGR15uRow", kRGB10, kBGRX15},
    {Kernel::RGB10uToBGR32fRow, "RGB10uToBGR32fRow", kRGB10, kBGRX32f},
    {Kernel::RGBToUYVY601, "RGBToYUV601Row + Downsample444To422Row", kBGRX8, kUYVY8},
    {Kernel::RGBToUYVY709, "RGBToYUV709Row + Downsample444To422Row", kBGRX8, kUYVY8_709},
    {Kernel::StraightRGBToUYVY601, "RGBToYUV601Row + PremultiplyRow + Downsample444To422Row", kBGRA8, kUYVY8},
    {Kernel::StraightRGBToUYVY709, "RGBToYUV709Row + PremultiplyRow + Downsample444To422Row", kBGRA8,
     kUYVY8_709},
    {Kernel::OpaqueBGRToRGB10, "ExpandTo32fRow + BGR32fToRGB10uRow", kBGRX8, kRGB10},
    {Kernel::StraightBGRToRGB10, "ExpandTo32fRow + PremultiplyRow + BGR32fToRGB10uRow", kBGRA8, kRGB10},
};
// clang-format on

constexpr bool IsInOrder() {
    for (int i = 0; i < kKernelCount; ++i)
        if (kRegister[i].kernel != static_cast<Kernel>(i)) return false;
    return true;
}
static_assert(std::size(kRegister) == kKernelCount && IsInOrder(),
              "the register has one row a kernel, in order");

using BodyTable = std::array<std::array<RowKernel, kTargetCount>, kKernelCount>;

template <Target kTarget>
void Enter(BodyTable& table) {
    for (const KernelBodies& bodies :
         {OrderBodies<kTarget>(), PremultiplyBodies<kTarget>(), DepthBodies<kTarget>(),
          RGBToYUVBodies<kTarget>(), YUVToRGBBodies<kTarget>(), YUVToYUVBodies<kTarget>(),
          ChromaBodies<kTarget>(), YUV422ToBGRBodies<kTarget>(), TransferBodies<kTarget>(),
          V210Bodies<kTarget>(), RGB10Bodies<kTarget>(), FusedBodies<kTarget>()})
        for (int32_t i = 0; i < bodies.count; ++i)
            table[static_cast<std::size_t>(bodies.first[i].kernel)][static_cast<std::size_t>(kTarget)] =
                bodies.first[i].run;
}

BodyTable MakeBodyTable() {
    BodyTable table{};
    Enter<Target::plain>(table);
    Enter<Target::sse2>(table);
    Enter<Target::ssse3>(table);
    Enter<Target::sse41>(table);
    Enter<Target::avx2>(table);
    Enter<Target::avx512>(table);
    for (const KernelBody& copy : kCopyBodies)
        table[static_cast<std::size_t>(copy.kernel)][static_cast<std::size_t>(Target::plain)] = copy.run;
    return table;
}

} // namespace

const KernelInfo& Info(Kernel kernel) noexcept {
    return kRegister[static_cast<std::size_t>(kernel)];
}

RowKernel Body(Kernel kernel, Target target) noexcept {
    static const BodyTable table = MakeBodyTable();
    return table[static_cast<std::size_t>(kernel)][static_cast<std::size_t>(target)];
}

bool ChooseTarget(Kernel kernel, Target& target) noexcept {
    if (kernel == Kernel::None) return false;
    for (int i = kTargetCount - 1; i >= 0; --i) {
        target = static_cast<Target>(i);
        if (IsEnabled(target) && Body(kernel, target)) return true;
    }
    return false;
}

RowKernel ChooseBody(Kernel kernel) noexcept {
    Target target;
    return ChooseTarget(kernel, target) ? Body(kernel, target) : nullptr;
}

} // namespace PK
