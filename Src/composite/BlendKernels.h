#pragma once

// Rows of one image over another by a blend mode, in straight BGRA_4444_32f.

#include "primitives/KernelShapes.h"

namespace PK {

/// By the names of the modes. The constant is the opacity, as it is given. Dissolve, which draws numbers, is no kernel.
struct BlendKernels {
    using Blend = TwoRowKernelWith<float>;
    Blend color, colorBurn, colorDodge, darken, darkerColor, difference, exclusion, hardLight, hardMix, hue,
        lighten, lighterColor, linearBurn, linearDodge, linearLight, luminosity, multiply, normal, overlay,
        pinLight, saturation, screen, softLight, vividLight, subtract, divide;

    static constexpr const char* kFamily = "Blend";
    static constexpr Offer kOffer = Offer::flags;
    template <Target>
    static const BlendKernels& For();
};

/// Rows of more pixels than this are compared by the luma of BT.709 in darkerColor and lighterColor, others by that of
/// BT.601.
inline constexpr int32_t kWidestRowOf601 = 720;

} // namespace PK
