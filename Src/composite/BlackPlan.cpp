#include "composite/BlackPlan.h"

#include "frame/PixelFormat.h"
#include "primitives/Dispatch.h"

#include <PixelKiln/PixelFormat.h>

#include <algorithm>
#include <iterator>

namespace PK {
namespace {

constexpr PK_PixelFormat kServed[] = {
    PK_PixelFormat_BGRA_4444_8u,  PK_PixelFormat_ARGB_4444_8u,  PK_PixelFormat_VUYA_4444_8u,
    PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_ARGB_4444_32f, PK_PixelFormat_VUYA_4444_32f,
};
/// At full opacity only: callers know it so.
constexpr PK_PixelFormat kServed709[] = {PK_PixelFormat_VUYA_4444_8u_709, PK_PixelFormat_VUYA_4444_32f_709};

template <size_t kCount>
bool IsAmong(const PK_PixelFormat (&formats)[kCount], PK_PixelFormat format) {
    return std::ranges::find(formats, format) != std::end(formats);
}

PK_PixelFormat WorkingFormat(PK_PixelFormat destination, bool isAtFullOpacity, int32_t quality) {
    const auto byQuality = [quality](PK_PixelFormat floats, PK_PixelFormat codes) {
        return quality >= 3 ? floats : codes;
    };
    if (IsAmong(kServed, destination)) return destination;
    if (isAtFullOpacity && IsAmong(kServed709, destination)) return destination;
    if (!IsYUV(destination)) return byQuality(PK_PixelFormat_BGRA_4444_32f, PK_PixelFormat_BGRA_4444_8u);
    if (isAtFullOpacity && (destination & kMatrixMask) == kMatrix709)
        return byQuality(PK_PixelFormat_VUYA_4444_32f_709, PK_PixelFormat_VUYA_4444_8u_709);
    return byQuality(PK_PixelFormat_VUYA_4444_32f, PK_PixelFormat_VUYA_4444_8u);
}

BlackKernels::OverBlack KernelFor(PK_PixelFormat working) {
    const BlackKernels& kernels = Best<BlackKernels>();
    const bool alphaFirst = IsOrderReversed(working);
    if (DepthOf(working) == kDepth32f) return alphaFirst ? kernels.floatsAlphaFirst : kernels.floats;
    if (IsYUV(working)) return kernels.yuv8u;
    return alphaFirst ? kernels.rgb8uAlphaFirst : kernels.rgb8u;
}

} // namespace

bool BlackPlan::Build(PK_PixelFormat source, PK_PixelFormat destination, bool isAtFullOpacity,
                      int32_t quality) {
    working = WorkingFormat(destination, isAtFullOpacity, quality);
    overBlack = KernelFor(working);
    return in.Build(source, working, quality) && out.Build(working, destination, quality);
}

} // namespace PK
