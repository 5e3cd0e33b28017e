#include "convert/Fusion.h"

#include "convert/KernelTable.h"

#include <algorithm>

namespace PK {
namespace {

using enum Kernel;

constexpr Kernel kStraight601[] = {RGBToYUV601Row, PremultiplyRow_VUYA_8u, Downsample444To422Row};
constexpr Kernel kStraight709[] = {RGBToYUV709Row, PremultiplyRow_VUYA_8u, Downsample444To422Row};
constexpr Kernel kOpaque601[] = {RGBToYUV601Row, Downsample444To422Row};
constexpr Kernel kOpaque709[] = {RGBToYUV709Row, Downsample444To422Row};
constexpr Kernel kStraightToRGB10[] = {ExpandTo32fRow_RGB_8u, PremultiplyRow_BGRA_32f, BGR32fToRGB10uRow};
constexpr Kernel kOpaqueToRGB10[] = {ExpandTo32fRow_RGB_8u, BGR32fToRGB10uRow};

constexpr Fusion kFusions[] = {
    {StraightRGBToUYVY601, kStraight601},
    {StraightRGBToUYVY709, kStraight709},
    {RGBToUYVY601, kOpaque601},
    {RGBToUYVY709, kOpaque709},
    {StraightBGRToRGB10, kStraightToRGB10},
    {OpaqueBGRToRGB10, kOpaqueToRGB10},
};

} // namespace

std::span<const Fusion> Fusions() noexcept {
    return kFusions;
}

RowKernel ChooseFusedBody(const Kernel* kernels, int32_t count, int32_t& consumed) noexcept {
    const std::span<const Kernel> run(kernels, static_cast<std::size_t>(count));
    for (const Fusion& fusion : kFusions) {
        if (fusion.parts.size() > run.size() ||
            !std::ranges::equal(fusion.parts, run.first(fusion.parts.size())))
            continue;
        if (const RowKernel body = ChooseBody(fusion.fused)) {
            consumed = static_cast<int32_t>(fusion.parts.size());
            return body;
        }
    }
    return nullptr;
}

} // namespace PK
