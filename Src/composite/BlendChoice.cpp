#include "composite/BlendChoice.h"

#include "composite/BlendKernels.h"
#include "composite/DissolveRow.h"
#include "primitives/Dispatch.h"

namespace PK {
namespace {

using Member = BlendKernels::Blend BlendKernels::*;
using K = BlendKernels;

/// By the numbers of the modes; none for the one that is no kernel.
constexpr Member kMembers[] = {
    &K::color,        &K::colorBurn,  &K::colorDodge,  &K::darken,      &K::darkerColor, &K::difference,
    nullptr,          &K::exclusion,  &K::hardLight,   &K::hardMix,     &K::hue,         &K::lighten,
    &K::lighterColor, &K::linearBurn, &K::linearDodge, &K::linearLight, &K::luminosity,  &K::multiply,
    &K::normal,       &K::overlay,    &K::pinLight,    &K::saturation,  &K::screen,      &K::softLight,
    &K::vividLight,   &K::subtract,   &K::divide,
};
static_assert(kMembers[PK_BlendMode_Multiply] == &K::multiply);
static_assert(std::size(kMembers) == PK_BlendMode_Divide + 1);

} // namespace

MixKernel SelectBlendKernel(PK_BlendMode mode) {
    if (mode < 0 || mode > PK_BlendMode_Divide) return nullptr;
    if (mode == PK_BlendMode_Dissolve) return DissolveRow;
    return Best<BlendKernels>().*kMembers[mode];
}

} // namespace PK
