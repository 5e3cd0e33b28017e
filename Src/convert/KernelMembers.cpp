#include "convert/KernelMembers.h"

#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

namespace PK {

namespace {

using enum Kernel;

struct DepthMembers {
    Kernel at8u, at15u, at32f;
};

Kernel AtDepth(PK_PixelFormat format, const DepthMembers& members) {
    switch (DepthOf(format)) {
    case kDepth8u:
        return members.at8u;
    case kDepth15u:
        return members.at15u;
    case kDepth32f:
        return members.at32f;
    default:
        return None;
    }
}

/// For the four-channel layouts: alpha at the end of a pixel, or at its beginning.
Kernel AtDepthInOrder(PK_PixelFormat format, const DepthMembers& alphaLast, const DepthMembers& alphaFirst) {
    if (!IsPacked4444(format)) return None;
    return AtDepth(format, IsOrderReversed(format) ? alphaFirst : alphaLast);
}

Kernel In422Order(PK_PixelFormat format, Kernel uyvy, Kernel yuyv) {
    return IsOrderReversed(format) ? yuyv : uyvy;
}

Kernel InMatrix(PK_PixelFormat format, Kernel matrix601, Kernel matrix709) {
    return IsMatrix601(format) ? matrix601 : matrix709;
}

} // namespace

Kernel CopyMember(PK_PixelFormat format) {
    if (format == PK_PixelFormat_RGB_444_10u) return CopyRow_4444_8u;
    if (IsV210(format)) return CopyRow_V210;
    if (IsPacked4444(format)) return AtDepth(format, {CopyRow_4444_8u, CopyRow_4444_15u, CopyRow_4444_32f});
    if (Is422(format)) return AtDepth(format, {CopyRow_422_8u, None, CopyRow_422_32f});
    return None;
}

Kernel ForceOpaqueMember(PK_PixelFormat format) {
    return AtDepthInOrder(format, {ForceOpaqueRow_BGRA_8u, ForceOpaqueRow_BGRA_15u, ForceOpaqueRow_BGRA_32f},
                          {ForceOpaqueRow_ARGB_8u, ForceOpaqueRow_ARGB_15u, ForceOpaqueRow_ARGB_32f});
}

Kernel SwapOrderMember(PK_PixelFormat format) {
    if (Is422(format)) return AtDepth(format, {SwapOrderRow_422_8u, None, SwapOrderRow_422_32f});
    if (!IsPacked4444(format)) return None;
    return AtDepth(format, {SwapOrderRow_4444_8u, SwapOrderRow_4444_15u, SwapOrderRow_4444_32f});
}

Kernel PremultiplyMember(PK_PixelFormat format) {
    const Kernel alphaLast8u = IsYUV(format) ? PremultiplyRow_VUYA_8u : PremultiplyRow_BGRA_8u;
    return AtDepthInOrder(format, {alphaLast8u, PremultiplyRow_BGRA_15u, PremultiplyRow_BGRA_32f},
                          {PremultiplyRow_ARGB_8u, PremultiplyRow_ARGB_15u, PremultiplyRow_ARGB_32f});
}

Kernel UnpremultiplyMember(PK_PixelFormat format) {
    const Kernel alphaLast8u = IsYUV(format) ? UnpremultiplyRow_VUYA_8u : UnpremultiplyRow_BGRA_8u;
    return AtDepthInOrder(format, {alphaLast8u, UnpremultiplyRow_BGRA_15u, UnpremultiplyRow_BGRA_32f},
                          {UnpremultiplyRow_ARGB_8u, UnpremultiplyRow_ARGB_15u, UnpremultiplyRow_ARGB_32f});
}

Kernel ExpandTo32fMember(PK_PixelFormat format) {
    if (Is422(format)) {
        return AtDepth(format,
                       {In422Order(format, ExpandTo32fRow_UYVY_8u, ExpandTo32fRow_YUYV_8u), None, None});
    }
    if (!IsPacked4444(format)) return None;
    if (IsYUV(format)) return AtDepth(format, {ExpandTo32fRow_VUYA_8u, None, None});
    return AtDepth(format, {ExpandTo32fRow_RGB_8u, ExpandTo32fRow_RGB_15u, None});
}

Kernel PackFrom32fMember(PK_PixelFormat format) {
    if (Is422(format)) {
        return AtDepth(format,
                       {In422Order(format, PackFrom32fRow_UYVY_8u, PackFrom32fRow_YUYV_8u), None, None});
    }
    if (!IsPacked4444(format)) return None;
    if (IsYUV(format)) return AtDepth(format, {PackFrom32fRow_VUYA_8u, None, None});
    return AtDepth(format, {PackFrom32fRow_RGB_8u, PackFrom32fRow_RGB_15u, None});
}

Kernel YUVToRGBMember(PK_PixelFormat format) {
    return InMatrix(format, YUV601ToRGBRow, YUV709ToRGBRow);
}

Kernel YUVToRGBFloat32Member(PK_PixelFormat format) {
    return InMatrix(format, YUV601ToRGBFloat32Row, YUV709ToRGBFloat32Row);
}

Kernel RGBToYUVMember(PK_PixelFormat destination) {
    return InMatrix(destination, RGBToYUV601Row, RGBToYUV709Row);
}

Kernel RGBToYUVFloat32Member(PK_PixelFormat destination) {
    return InMatrix(destination, RGBToYUV601Float32Row, RGBToYUV709Float32Row);
}

Kernel ChangeMatrixFloat32Member(PK_PixelFormat format) {
    return InMatrix(format, YUV601To709Float32Row, YUV709To601Float32Row);
}

Kernel Upsample422To444Member(PK_PixelFormat format, int32_t quality) {
    if (!Is422(format)) return None;
    return AtDepth(format, {In422Order(format, Upsample422To444Row_UYVY, Upsample422To444Row_YUYV), None,
                            AtQuality(Upsample422To444Float32Row_Repeat, quality)});
}

Kernel AtQuality(Kernel kernel, int32_t quality) {
    const bool interpolates = quality > kHighestRepeatingQuality;
    return kernel == Upsample422To444Float32Row_Repeat && interpolates
               ? Upsample422To444Float32Row_Interpolate
               : kernel;
}

} // namespace PK
