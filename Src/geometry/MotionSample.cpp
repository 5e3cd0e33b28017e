#include "geometry/MotionSample.h"

#include "frame/PixelFormat.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

constexpr int32_t kHighQuality = 5;

/// YUV has kernels of its own in 8 bits only: floats have their zeros at 0, and the catalogue has no other YUV.
MotionLayout LayoutOf(PK_PixelFormat format) {
    const bool isReversed = IsOrderReversed(format);
    switch (DepthOf(format)) {
    case kDepth8u:
        if (IsYUV(format) && !isReversed) return kMotionYUV8;
        return isReversed ? kMotionRGB8AlphaFirst : kMotionRGB8;
    case kDepth15u:
        return isReversed ? kMotion15AlphaFirst : kMotion15;
    default:
        return isReversed ? kMotionFloatsAlphaFirst : kMotionFloats;
    }
}

} // namespace

SampleMotionRow ChooseMotionSampler(PK_PixelFormat format, int32_t quality) noexcept {
    const MotionLayout layout = LayoutOf(format);
    const bool isFloat = layout == kMotionFloats || layout == kMotionFloatsAlphaFirst;
    const bool isPremultiplied = AlphaOf(format) == kAlphaPremultiplied;
    if (quality == kHighQuality && isPremultiplied && isFloat && !IsYUV(format)) {
        const MotionResampleKernels& kernels = Best<MotionResampleKernels>();
        return IsOrderReversed(format) ? kernels.alphaFirst : kernels.alphaLast;
    }
    const MotionSampleKernels& kernels = Best<MotionSampleKernels>();
    return AlphaOf(format) == kAlphaStraight ? kernels.straight[layout] : kernels.premultiplied[layout];
}

std::optional<LineScale> MotionLineScale(PK_PixelFormat format) noexcept {
    constexpr float kByte = 1.0f / 255, kChroma = 1.0f / 224, kLuma = 1.0f / 219;
    switch (LayoutOf(format)) {
    case kMotionRGB8:
    case kMotionRGB8AlphaFirst:
        return LineScale{{0, 0, 0, 0}, {kByte, kByte, kByte, kByte}};
    case kMotionYUV8:
        return LineScale{{128, 128, 16, 0}, {kChroma, kChroma, kLuma, kByte}};
    case kMotion15:
    case kMotion15AlphaFirst:
        return LineScale{{0, 0, 0, 0}, {0x1p-15f, 0x1p-15f, 0x1p-15f, 0x1p-15f}};
    default:
        return std::nullopt;
    }
}

void ScaleMotionLine(const LineScale& scale, float* pixels, int32_t count) noexcept {
    Best<MotionSampleKernels>().scaleLine(pixels, pixels, count, scale);
}

} // namespace PK
